#include "platform/documents/preview/PreviewView.h"

#include "platform/base/Text.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"

#include <algorithm>

namespace platform {
namespace {

constexpr Color ground = Color::hex(0xEEF0F4);
constexpr double corner = 10;
constexpr double edge = 12;
constexpr double zoomStep = 1.4;
constexpr double smallGap = 6;

std::shared_ptr<View> makeGround(Color color) {
    auto view = std::make_shared<View>();
    view->setBackgroundColor(color);
    view->setCornerRadius(corner);
    return view;
}

} // namespace

PreviewView::PreviewView()
    : page_(std::make_shared<CenteredColumn>()),
      picture_(std::make_shared<ImageView>()),
      title_(page_->addText(TextStyle::headline, Theme::text, 0)),
      facts_(page_->addText(TextStyle::subheadline, Theme::secondaryText, smallGap)),
      message_(page_->addText(TextStyle::subheadline, Theme::text, edge)),
      open_(std::make_shared<Button>(ButtonType::system)),
      loading_(std::make_shared<Label>()),
      placeGround_(makeGround(Theme::text.withAlpha(0.72))),
      place_(std::make_shared<Label>()),
      zoomGround_(makeGround(Theme::hairline)),
      zoomFace_(makeGround(Theme::page)),
      larger_(std::make_shared<Button>(ButtonType::system)),
      smaller_(std::make_shared<Button>(ButtonType::system)) {
    setBackgroundColor(ground);
    page_->setBackgroundColor(Theme::page);
    page_->setPicture(picture_);
    picture_->setContentMode(ContentMode::aspectFit);
    open_->setTitle(localized("Open With…"));
    open_->addAction(ControlEvent::touchUpInside, [this] {
        if (const auto open = openElsewhere_)
            open(open_);
    });
    page_->addControl(open_, edge);
    loading_->setText(localized("Loading…"));
    loading_->setTextColor(Theme::secondaryText);
    loading_->setTextAlignment(TextAlignment::center);
    place_->setFont(Font::preferred(TextStyle::footnote));
    place_->setTextAlignment(TextAlignment::center);
    larger_->setTitle("+");
    larger_->setAccessibleName(localized("Zoom in"));
    larger_->addAction(ControlEvent::touchUpInside, [this] {
        if (zoom_)
            zoom_(zoomStep);
    });
    smaller_->setTitle("−");
    smaller_->setAccessibleName(localized("Zoom out"));
    smaller_->addAction(ControlEvent::touchUpInside, [this] {
        if (zoom_)
            zoom_(1 / zoomStep);
    });
    place_->setTextColor(Color::white);
    for (const auto& button : {larger_, smaller_})
        button->setTitleFont(Font::withSize(TextStyle::body, 24));
    placeGround_->addSubview(place_);
    zoomFace_->addSubview(larger_);
    zoomFace_->addSubview(smaller_);
    zoomGround_->addSubview(zoomFace_);
    for (const std::shared_ptr<View>& each :
         std::initializer_list<std::shared_ptr<View>>{loading_, placeGround_, zoomGround_, page_})
        addSubview(each);
    placeGround_->setUserInteractionEnabled(false);
    placeGround_->setHidden(true);
    zoomGround_->setHidden(true);
    page_->setHidden(true);
    loading_->setHidden(true);
}

void PreviewView::setDocument(std::shared_ptr<View> document) {
    if (document_)
        document_->removeFromSuperview();
    document_ = std::move(document);
    if (!document_)
        return;
    insertSubview(document_, 0);
    document_->setHidden(true);
    document_->setFrame(bounds()); // it may ask before the next layout how large it is
    setNeedsLayout();
}

void PreviewView::setZoom(std::function<void(double)> zoom) {
    zoom_ = std::move(zoom);
    zoomGround_->setHidden(!zoom_);
}

void PreviewView::setPlace(const std::string& place) {
    place_->setText(place);
    placeGround_->setHidden(place.empty());
    setNeedsLayout();
}

void PreviewView::showPage(const Page& page) {
    picture_->setImage(page.picture);
    title_->setText(page.title);
    facts_->setText(page.facts);
    facts_->setHidden(page.facts.empty());
    message_->setText(page.message);
    message_->setHidden(page.message.empty());
    openElsewhere_ = page.open;
    open_->setHidden(!openElsewhere_);
    page_->setHidden(false);
    page_->setNeedsLayout();
    loading_->setHidden(true);
    setZoom({});
    setPlace({});
    if (document_)
        document_->setHidden(true);
}

void PreviewView::showDocument() {
    page_->setHidden(true);
    loading_->setHidden(true);
    if (document_)
        document_->setHidden(false);
}

void PreviewView::showLoading() {
    page_->setHidden(true);
    loading_->setHidden(false);
}

std::string PreviewView::pageText() const {
    return title_->text() + '\n' + facts_->text() + '\n' + message_->text();
}

void PreviewView::layoutSubviews() {
    const Rect all = bounds();
    if (document_)
        document_->setFrame(all);
    page_->setFrame(all);
    loading_->setFrame(all);
    const Size text = place_->intrinsicContentSize();
    const double width = text.width + 2 * edge;
    const double height = text.height + 2 * smallGap;
    placeGround_->setFrame({(all.width - width) / 2, edge, width, height});
    place_->setFrame(placeGround_->bounds());
    const double button = Theme::minimumTarget;
    zoomGround_->setFrame(mirrored({all.width - edge - button - 2,
                                    all.height - edge - 2 * button - 2, button + 2, 2 * button + 2},
                                   all.width));
    zoomFace_->setCornerRadius(corner - 1);
    zoomFace_->setFrame(zoomGround_->bounds().inset(1, 1));
    larger_->setFrame({0, 0, button, button});
    smaller_->setFrame({0, button, button, button});
}

} // namespace platform
