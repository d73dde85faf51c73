#include "platform/documents/CenteredColumn.h"

#include "platform/ui/Theme.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double pictureEdge = 96;
constexpr double pictureGap = 16;
constexpr double widestColumn = 440;
constexpr double edge = 12;
constexpr double boxPadding = 14;
constexpr double smallestScale = 0.55;
constexpr double scaleStep = 0.1;
/// Of the free room, what stands above: a little less than half looks like the middle.
constexpr double shareAbove = 0.44;

} // namespace

void CenteredColumn::setPicture(std::shared_ptr<View> picture) {
    picture_ = std::move(picture);
    addSubview(picture_);
}

std::shared_ptr<Label> CenteredColumn::makeLabel(TextStyle style, Color color) const {
    auto label = std::make_shared<Label>();
    label->setFont(Font::preferred(style));
    label->setTextColor(color);
    label->setTextAlignment(TextAlignment::center);
    label->setNumberOfLines(0);
    label->setLineBreak(LineBreak::wrap);
    return label;
}

std::shared_ptr<Label> CenteredColumn::addText(TextStyle style, Color color, double gapAbove) {
    auto label = makeLabel(style, color);
    addSubview(label);
    lines_.push_back({label, label, style, gapAbove, 0});
    return label;
}

void CenteredColumn::addControl(std::shared_ptr<View> control, double gapAbove) {
    addSubview(control);
    lines_.push_back({std::move(control), nullptr, TextStyle::body, gapAbove, 0});
}

std::shared_ptr<Label> CenteredColumn::addBox(Color ground, double gapAbove) {
    auto box = std::make_shared<View>();
    box->setBackgroundColor(ground);
    box->setCornerRadius(Theme::buttonCorner);
    auto label = makeLabel(TextStyle::subheadline, Theme::text);
    box->addSubview(label);
    addSubview(box);
    lines_.push_back({box, label, TextStyle::subheadline, gapAbove, boxPadding});
    return label;
}

double CenteredColumn::heightOf(const Line& line, double width, double scale) const {
    if (!line.label)
        return std::max(Theme::minimumTarget, line.view->intrinsicContentSize().height);
    measure_->setText(line.label->text());
    measure_->setFont(Font::preferred(line.style).scaled(scale));
    return measure_->intrinsicHeightForWidth(width - 2 * line.padding) + 2 * line.padding;
}

double CenteredColumn::columnHeight(double width, double scale) const {
    double height = 0;
    for (const Line& line : lines_)
        if (!line.view->isHidden())
            height += line.gapAbove + heightOf(line, width, scale);
    return height;
}

void CenteredColumn::placeLine(const Line& line, Rect frame) const {
    if (!line.label) {
        const double width = std::clamp(line.view->intrinsicContentSize().width,
                                        2 * Theme::minimumTarget, frame.width);
        frame = {frame.midX() - width / 2, frame.y, width, frame.height};
    }
    line.view->setFrame(frame);
    if (line.padding > 0)
        line.label->setFrame(line.view->bounds().inset(line.padding, line.padding));
}

void CenteredColumn::layoutSubviews() {
    const Size size = bounds().size();
    const double width = std::min(widestColumn, size.width - 2 * Theme::tabletMargin);
    const double room = size.height - 2 * edge;
    double scale = 1;
    double height = columnHeight(width, scale);
    const bool drawn = picture_ && pictureEdge + pictureGap + height <= room;
    while (height > room && scale > smallestScale) {
        scale -= scaleStep;
        height = columnHeight(width, scale);
    }
    if (drawn)
        height += pictureEdge + pictureGap;
    double y = edge + std::max(0.0, std::floor((room - height) * shareAbove));
    if (picture_) {
        picture_->setHidden(!drawn);
        if (drawn)
            picture_->setFrame(
                {std::floor((size.width - pictureEdge) / 2), y, pictureEdge, pictureEdge});
        y += drawn ? pictureEdge + pictureGap : 0;
    }
    const double left = std::floor((size.width - width) / 2);
    for (const Line& line : lines_) {
        if (line.view->isHidden())
            continue;
        y += line.gapAbove;
        if (line.label)
            line.label->setFont(Font::preferred(line.style).scaled(scale));
        const double lineHeight = heightOf(line, width, scale);
        placeLine(line, {left, y, width, lineHeight});
        y += lineHeight;
    }
}

} // namespace platform
