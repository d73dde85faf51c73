#include "platform/documents/list/SearchPill.h"

#include "platform/base/Text.h"
#include "platform/documents/list/RowStyle.h"
#include "platform/ui/Controls.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"

#include <algorithm>

namespace platform {
namespace {

constexpr Color pillFill = Color::hex(0xEEF0F4);
constexpr double pillCorner = 10;
constexpr double above = 8;
constexpr double below = 4;
constexpr double padding = 10;

double glassEdge() {
    return std::min(32.0, Font::preferred(TextStyle::body).pointSize() * 1.2);
}

double pillHeight() {
    return std::max(Theme::minimumTarget, Font::preferred(TextStyle::body).lineHeight() + 14);
}

} // namespace

SearchPill::SearchPill(std::function<void()> tapped) : pill_(std::make_shared<View>()) {
    pill_->setBackgroundColor(pillFill);
    pill_->setCornerRadius(pillCorner);
    pill_->addTapHandler(std::move(tapped));
    pill_->setAccessibleName(localized("Search"));
    pill_->setDebugName("Search");
    const auto glass = std::make_shared<ImageView>();
    glass->setImage(Image::system(SystemImage::search).tinted(Theme::secondaryText));
    glass->setContentMode(ContentMode::aspectFit);
    const auto label = std::make_shared<Label>();
    label->setText(localized("Search"));
    label->setTextColor(Theme::secondaryText);
    glass_ = glass;
    label_ = label;
    for (const auto& child : {glass_, label_}) {
        child->setUserInteractionEnabled(false);
        pill_->addSubview(child);
    }
    addSubview(pill_);
}

double SearchPill::heightWithMargins() {
    return above + pillHeight() + below;
}

void SearchPill::setUsable(bool usable) {
    pill_->setUserInteractionEnabled(usable);
    pill_->setAlpha(usable ? 1 : Theme::disabledAlpha);
}

void SearchPill::layoutSubviews() {
    const double margin = RowStyle::current().margin;
    const double width = bounds().width - 2 * margin;
    const double height = pillHeight();
    pill_->setFrame({margin, above, width, height});
    const double edge = glassEdge();
    glass_->setFrame(mirrored({padding, (height - edge) / 2, edge, edge}, width));
    const double start = padding + edge + padding * 0.6;
    label_->setFrame(mirrored({start, 0, width - start - padding, height}, width));
}

} // namespace platform
