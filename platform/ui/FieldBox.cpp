#include "platform/ui/FieldBox.h"

#include "platform/ui/Canvas.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/TextFieldImpl.h"
#include "platform/ui/qt/ViewImpl.h"

#include <algorithm>

namespace platform {
namespace {

constexpr double fieldInset = 12;
constexpr double fieldPadding = 16;

} // namespace

FieldBox::FieldBox(const std::shared_ptr<TextField>& field) : field_(field) {
    implOf(*field).bordered = false;
    implOf(*field).applyFont();
    field->setLaidOutByConstraints(true);
    addSubview(field);
    addTapHandler([weak = std::weak_ptr(field)] {
        if (const auto target = weak.lock())
            target->becomeFirstResponder();
    });
    // The field itself is what the keyboard and the screen reader know.
    impl().role = QAccessible::Client;
    if (QWidget* const widget = impl().widget) {
        widget->setFocusPolicy(Qt::NoFocus);
        widget->setCursor(Qt::IBeamCursor);
    }
    using enum LayoutAttribute;
    LayoutConstraint::activate(
        {LayoutConstraint::equal(*field, leading, *this, leading, fieldInset),
         yielding(LayoutConstraint::equal(*field, trailing, *this, trailing, -fieldInset / 2)),
         LayoutConstraint::equal(*field, centerY, *this, centerY)});
}

double FieldBox::height() const {
    return std::max(Theme::minimumTarget, field_->frame().height + fieldPadding);
}

void FieldBox::layoutSubviews() {
    if (View* const body = superview())
        body->setNeedsLayout();
}

void FieldBox::draw(Canvas& canvas) {
    const double line = field_->isFirstResponder() ? 2 : 1;
    Path outline;
    outline.addRoundedRect(bounds().inset(line / 2, line / 2), Theme::buttonCorner);
    canvas.stroke(outline, field_->isFirstResponder() ? Theme::accent : Theme::hairline, line);
}

LayoutConstraint::Pointer yielding(const LayoutConstraint::Pointer& constraint) {
    constraint->setPriority(layoutRequired - 1);
    return constraint;
}

} // namespace platform
