#pragma once

#include "platform/ui/Controls.h"
#include "platform/ui/FieldBox.h"
#include "platform/ui/ScrollBox.h"

#include <functional>
#include <memory>
#include <string_view>
#include <vector>

namespace tavrin {

/// A page of texts, fields and buttons, one below the other in a column of readable width, that
/// scrolls where it is higher than the screen. What is hidden takes no room.
class FormView : public platform::View {
public:
    enum class Look { primary, plain, destructive };

    FormView();

    std::shared_ptr<platform::Label> addText(platform::TextStyle style, platform::Color color,
                                             double gapAbove);
    /// The caption above the field is also what a screen reader calls it.
    std::shared_ptr<platform::TextField> addField(std::string_view caption);
    std::shared_ptr<platform::Button> addButton(std::string_view title, Look look,
                                                std::function<void()> action);
    /// Shows or hides a field with its caption.
    void setFieldHidden(const platform::TextField& field, bool hidden);

protected:
    void layoutSubviews() override;

private:
    class Body;
    struct Line {
        std::shared_ptr<platform::View> view;
        std::shared_ptr<platform::Label> caption;
        std::shared_ptr<platform::TextField> field;
        std::shared_ptr<platform::FieldBox> box;
        double gapAbove = 0;
    };
    void add(Line line);
    double place(const Line& line, platform::Rect room) const;
    void layOut();

    std::shared_ptr<Body> body_;
    std::shared_ptr<platform::ScrollBox> scroll_;
    std::vector<Line> lines_;
    bool layingOut_ = false;
};

} // namespace tavrin
