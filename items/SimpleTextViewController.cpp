#include "items/SimpleTextViewController.h"

#include "platform/ui/Theme.h"

namespace tavrin {

using platform::Axis;
using platform::LayoutAttribute;
using platform::LayoutConstraint;

namespace {

constexpr int mostLines = 5;

} // namespace

platform::Font SimpleTextViewController::messageLabelFont() {
    return platform::Font::preferred(platform::TextStyle::footnote);
}

double SimpleTextViewController::_labelHorizontalInsets() {
    return 16;
}

void SimpleTextViewController::viewDidLoad() {
    ViewController::viewDidLoad();
    messageLabel_->setNumberOfLines(mostLines);
    messageLabel_->setLineBreak(platform::LineBreak::wrap);
    messageLabel_->setFont(messageLabelFont());
    messageLabel_->setTextColor(platform::Theme::destructive);
    messageLabel_->setLaidOutByConstraints(true);

    platform::View& area = *view();
    area.setLaidOutByConstraints(true);
    for (const Axis axis : {Axis::horizontal, Axis::vertical})
        area.setContentHuggingPriority(platform::layoutRequired, axis);
    area.addSubview(messageLabel_);
    const double inset = _labelHorizontalInsets();
    LayoutConstraint::activate(
        {LayoutConstraint::equal(*messageLabel_, LayoutAttribute::top, area, LayoutAttribute::top),
         LayoutConstraint::equal(*messageLabel_, LayoutAttribute::height, area,
                                 LayoutAttribute::height),
         LayoutConstraint::equal(*messageLabel_, LayoutAttribute::leading, area,
                                 LayoutAttribute::leading, inset),
         LayoutConstraint::equal(*messageLabel_, LayoutAttribute::trailing, area,
                                 LayoutAttribute::trailing, -inset)});
}

} // namespace tavrin
