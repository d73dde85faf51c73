#include "platform/documents/targets/TargetPage.h"

#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double padding = 10;
constexpr double pictureGap = 8;

double pictureEdge() {
    return std::round(Font::preferred(TextStyle::footnote).lineHeight() * 1.1);
}

std::shared_ptr<Label> makeText(Color color, int lines) {
    auto label = std::make_shared<Label>();
    label->setFont(Font::preferred(TextStyle::footnote));
    label->setTextColor(color);
    label->setNumberOfLines(lines);
    label->setLineBreak(lines == 1 ? LineBreak::elideMiddle : LineBreak::wrap);
    return label;
}

double textWidth(double width) {
    return std::max(0.0, width - 2 * pageMargin() - pictureEdge() - pictureGap);
}

} // namespace

TargetPage::TargetPage(const std::string& moved, std::shared_ptr<ListView> list)
    : list_(std::move(list)),
      movedText_(makeText(Theme::secondaryText, 1)),
      reasonText_(makeText(Theme::text, 0)) {
    setBackgroundColor(Theme::page);
    addSubview(list_);
    moved_ = addStrip(SystemImage::organize, Theme::secondaryText, movedText_);
    reason_ = addStrip(SystemImage::warning, Theme::secondaryText, reasonText_);
    movedText_->setText(moved);
    reason_.ground->setHidden(true);
}

TargetPage::Strip TargetPage::addStrip(SystemImage picture, Color color,
                                       const std::shared_ptr<Label>& text) {
    Strip strip{std::make_shared<View>(), std::make_shared<ImageView>(), std::make_shared<View>()};
    strip.ground->setBackgroundColor(Theme::bar);
    strip.picture->setImage(Image::system(picture).tinted(color));
    strip.picture->setContentMode(ContentMode::aspectFit);
    strip.line->setBackgroundColor(Theme::hairline);
    strip.ground->addSubview(strip.picture);
    strip.ground->addSubview(text);
    strip.ground->addSubview(strip.line);
    addSubview(strip.ground);
    return strip;
}

void TargetPage::setReason(const std::string& reason) {
    if (reason == reasonText_->text())
        return;
    reasonText_->setText(reason);
    reason_.ground->setHidden(reason.empty());
    setNeedsLayout();
}

double TargetPage::heightOf(const Label& text, double width) const {
    const double height = text.numberOfLines() == 1
                              ? text.font().lineHeight()
                              : text.intrinsicHeightForWidth(textWidth(width));
    return std::ceil(height) + 2 * padding;
}

void TargetPage::placeStrip(const Strip& strip, Label& text, Rect frame, double lineY) const {
    strip.ground->setFrame(frame);
    const double edge = pictureEdge();
    const double margin = pageMargin();
    const Rect picture{margin, std::round((frame.height - edge) / 2), edge, edge};
    const Rect beside{margin + edge + pictureGap, padding, textWidth(frame.width),
                      frame.height - 2 * padding};
    strip.picture->setFrame(mirrored(picture, frame.width));
    text.setFrame(mirrored(beside, frame.width));
    strip.line->setFrame({0, lineY, frame.width, 1});
}

void TargetPage::layoutSubviews() {
    const Rect all = bounds();
    const double top = heightOf(*movedText_, all.width);
    const double bottom = reason().empty() ? 0 : heightOf(*reasonText_, all.width);
    placeStrip(moved_, *movedText_, {0, 0, all.width, top}, top - 1);
    if (bottom > 0)
        placeStrip(reason_, *reasonText_, {0, all.height - bottom, all.width, bottom}, 0);
    list_->setFrame({0, top, all.width, std::max(0.0, all.height - top - bottom)});
}

} // namespace platform
