#include "preview/FileInfoCell.h"

#include "platform/ui/Application.h"
#include "platform/ui/Theme.h"
#include "platform/ui/VisualFormat.h"

namespace tavrin {
namespace {

using platform::Axis;
using platform::layoutRequired;
using platform::TextAlignment;

} // namespace

platform::Font FileInfoCell::font() {
    return platform::Font::preferred(platform::TextStyle::subheadline);
}

FileInfoCell::FileInfoCell(std::string_view name, std::string_view value, int maxLines)
    : nameLabel_(std::make_shared<platform::Label>()),
      valueLabel_(std::make_shared<platform::Label>()) {
    setLaidOutByConstraints(true);
    nameLabel_->setTextColor(platform::Theme::secondaryText);
    nameLabel_->setFont(font());
    nameLabel_->setText(name);
    // The names lean toward the values.
    nameLabel_->setTextAlignment(platform::Application::shared().isRightToLeft()
                                     ? TextAlignment::left
                                     : TextAlignment::right);
    nameLabel_->setContentHuggingPriority(251, Axis::horizontal);
    nameLabel_->setContentHuggingPriority(layoutRequired, Axis::vertical);
    nameLabel_->setCompressionResistancePriority(layoutRequired, Axis::vertical);

    valueLabel_->setTextColor(platform::Color::black);
    valueLabel_->setFont(font());
    valueLabel_->setText(value);
    valueLabel_->setNumberOfLines(maxLines);
    valueLabel_->setContentHuggingPriority(250, Axis::horizontal);
    valueLabel_->setContentHuggingPriority(layoutRequired, Axis::vertical);
    valueLabel_->setCompressionResistancePriority(250, Axis::horizontal);
    valueLabel_->setCompressionResistancePriority(layoutRequired, Axis::vertical);

    std::vector<platform::LayoutConstraint::Pointer> constraints;
    const platform::NamedViews views = {{"_nameLabel", nameLabel_.get()},
                                        {"_valueLabel", valueLabel_.get()}};
    for (const auto& label : {nameLabel_, valueLabel_}) {
        label->setLaidOutByConstraints(true);
        addSubview(label);
    }
    for (const char* line :
         {"H:|[_nameLabel]-10-[_valueLabel]|", "V:|[_nameLabel]", "V:|[_valueLabel]|"})
        if (auto made = platform::constraintsWithVisualFormat(line, views))
            constraints.insert(constraints.end(), made->begin(), made->end());
    platform::LayoutConstraint::activate(constraints);
}

} // namespace tavrin
