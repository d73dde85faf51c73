#include "platform/documents/list/ListView.h"

#include "platform/documents/list/ListWidget.h"
#include "platform/ui/Direction.h"
#include "platform/ui/qt/Bridge.h"

namespace platform {

ListView::ListView(std::shared_ptr<RowModel> model, ListClient& client)
    : page_(std::make_shared<StatusPage>()), anchor_(std::make_shared<View>()) {
    auto widget = std::make_unique<ListWidget>(std::move(model), client);
    widget_ = widget.get();
    rows_ = std::make_shared<WidgetView>(std::move(widget));
    anchor_->setUserInteractionEnabled(false);
    page_->setHidden(true);
    addSubview(rows_);
    addSubview(page_);
    addSubview(anchor_);
}

ListView::~ListView() = default;

void ListView::setHeader(std::shared_ptr<View> header, double height) {
    if (header_)
        header_->removeFromSuperview();
    header_ = std::move(header);
    headerHeight_ = header_ ? height : 0;
    if (header_)
        insertSubview(header_, 1);
    widget_->setHeaderHeight(headerHeight_);
    setNeedsLayout();
}

void ListView::setShowsPlaceholders(bool shown) {
    widget_->setShowsPlaceholders(shown);
}

void ListView::setPage(const std::optional<StatusPage::Content>& content,
                       std::function<void()> action) {
    page_->setHidden(!content);
    if (content)
        page_->setContent(*content, std::move(action));
}

const StatusPage* ListView::page() const {
    return page_->isHidden() ? nullptr : page_.get();
}

std::shared_ptr<View> ListView::anchorAt(Rect rect) {
    anchor_->setFrame(rect);
    return anchor_;
}

void ListView::didScroll() {
    if (!header_)
        return;
    const double y = -widget_->state().scrolling.offset();
    header_->setHidden(y + headerHeight_ <= 0);
    header_->setFrame({0, y, bounds().width, headerHeight_});
}

void ListView::takeFocus() {
    widget_->setFocus(Qt::OtherFocusReason);
}

void ListView::leaveClient() {
    // The end of the program takes widgets before the screens that own them.
    if (!widgetOf(*rows_))
        return;
    widget_->state().leaveClient();
    widget_->setChangeHandlers({}, {});
}

void ListView::layoutSubviews() {
    const Rect all = bounds();
    rows_->setFrame(all);
    const double below = header_ && !header_->isHidden() ? headerHeight_ : 0;
    page_->setFrame({0, below, all.width, all.height - below});
    didScroll();
}

} // namespace platform
