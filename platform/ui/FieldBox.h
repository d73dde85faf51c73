#pragma once

#include "platform/ui/Controls.h"

#include <memory>

namespace platform {

/// The box that an alert draws round a text field; a tap anywhere in it is a tap on the field.
class FieldBox : public View {
public:
    explicit FieldBox(const std::shared_ptr<TextField>& field);

    /// What the field needs, at least a finger's height.
    double height() const;

protected:
    void layoutSubviews() override;
    void draw(Canvas& canvas) override;

private:
    std::shared_ptr<TextField> field_;
};

/// For what must not stand in the way of a panel that has no width yet.
LayoutConstraint::Pointer yielding(const LayoutConstraint::Pointer& constraint);

} // namespace platform
