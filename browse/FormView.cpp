#include "browse/FormView.h"

#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"

#include <algorithm>
#include <cmath>

namespace tavrin {
namespace {

using platform::Color;
using platform::Label;
using platform::Rect;
using platform::Theme;

constexpr double widestForm = 440;
constexpr double formEdge = 24;
constexpr double captionGap = 4;
constexpr double fieldGap = 16;
constexpr double buttonGap = 12;
constexpr Color plainFill = Color::hex(0xF1F3F7);

std::shared_ptr<Label> wrappingLabel(platform::TextStyle style, Color color) {
    auto label = std::make_shared<Label>();
    label->setFont(platform::Font::preferred(style));
    label->setTextColor(color);
    label->setNumberOfLines(0);
    label->setLineBreak(platform::LineBreak::wrap);
    return label;
}

} // namespace

/// What scrolls. A change of one line moves those below it.
class FormView::Body : public platform::View {
public:
    explicit Body(FormView& form) : form_(form) {}

protected:
    void layoutSubviews() override { form_.layOut(); }
    void subviewDidChange(platform::View& child) override {
        platform::View::subviewDidChange(child);
        form_.setNeedsLayout();
        setNeedsLayout();
    }

private:
    FormView& form_; // owns it
};

FormView::FormView()
    : body_(std::make_shared<Body>(*this)), scroll_(std::make_shared<platform::ScrollBox>(body_)) {
    setBackgroundColor(Theme::page);
    addSubview(scroll_);
}

void FormView::add(Line line) {
    for (const std::shared_ptr<platform::View>& view :
         {std::static_pointer_cast<platform::View>(line.caption), line.view})
        if (view)
            body_->addSubview(view);
    lines_.push_back(std::move(line));
}

std::shared_ptr<Label> FormView::addText(platform::TextStyle style, Color color, double gapAbove) {
    auto label = wrappingLabel(style, color);
    add({label, nullptr, nullptr, nullptr, gapAbove});
    return label;
}

std::shared_ptr<platform::TextField> FormView::addField(std::string_view caption) {
    auto label = wrappingLabel(platform::TextStyle::footnote, Theme::secondaryText);
    label->setText(caption);
    auto field = std::make_shared<platform::TextField>();
    field->setAccessibleName(caption);
    field->setFont(platform::Font::preferred(platform::TextStyle::body));
    field->setCapitalization(platform::Capitalization::none);
    field->setAutocorrection(false);
    auto box = std::make_shared<platform::FieldBox>(field);
    add({box, label, field, box, fieldGap});
    return field;
}

std::shared_ptr<platform::Button> FormView::addButton(std::string_view title, Look look,
                                                      std::function<void()> action) {
    auto button = std::make_shared<platform::Button>(platform::ButtonType::system);
    button->setTitle(title);
    button->setTitleWraps(true);
    button->setCornerRadius(Theme::buttonCorner);
    button->setBackgroundColor(look == Look::primary ? Theme::accent : plainFill);
    if (look != Look::plain)
        button->setTitleColor(look == Look::primary ? Color::white : Theme::destructive);
    button->addAction(platform::ControlEvent::touchUpInside, std::move(action));
    add({button, nullptr, nullptr, nullptr, buttonGap});
    return button;
}

void FormView::setFieldHidden(const platform::TextField& field, bool hidden) {
    for (const Line& line : lines_)
        if (line.field.get() == &field) {
            line.caption->setHidden(hidden);
            line.box->setHidden(hidden);
        }
}

double FormView::place(const Line& line, Rect room) const {
    double y = room.y;
    if (line.caption) {
        const double height = line.caption->intrinsicHeightForWidth(room.width);
        line.caption->setFrame({room.x, y, room.width, height});
        y += height + captionGap;
    }
    double height = line.box ? line.box->height() : line.view->intrinsicHeightForWidth(room.width);
    if (!line.box && std::dynamic_pointer_cast<platform::Button>(line.view))
        height = std::max(Theme::minimumTarget, height);
    line.view->setFrame({room.x, y, room.width, height});
    return y + height;
}

void FormView::layOut() {
    if (layingOut_)
        return;
    layingOut_ = true;
    const platform::Size size = scroll_->bounds().size();
    const double width =
        std::max(0.0, std::min(widestForm, size.width - 2 * platform::pageMargin()));
    const double left = std::floor((size.width - width) / 2);
    double y = formEdge;
    bool first = true;
    for (const Line& line : lines_) {
        if (line.view->isHidden())
            continue;
        y = place(line, {left, y + (first ? 0 : line.gapAbove), width, 0});
        first = false;
    }
    scroll_->setContentHeight(std::max(y + formEdge, size.height));
    layingOut_ = false;
}

void FormView::layoutSubviews() {
    scroll_->setFrame(bounds());
    layOut();
}

} // namespace tavrin
