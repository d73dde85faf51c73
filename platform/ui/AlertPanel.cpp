#include "platform/ui/AlertPanel.h"

#include "platform/ui/Direction.h"
#include "platform/ui/FieldBox.h"
#include "platform/ui/Theme.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ButtonImpl.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr double sideMargin = 16;
constexpr double headerTop = 20;
constexpr double headerBottom = 20;
constexpr double titleMessageGap = 4;
constexpr double sheetHeaderMargin = 14;
constexpr double fieldGap = 8;
constexpr double rowHeight = 48;
constexpr double sheetRowHeight = 52;

std::shared_ptr<Label> makeLabel(const std::string& text, TextStyle style, Color color) {
    auto label = std::make_shared<Label>();
    label->setFont(Font::preferred(style));
    label->setTextColor(color);
    label->setTextAlignment(TextAlignment::center);
    label->setNumberOfLines(0);
    label->setText(text);
    return label;
}

} // namespace

/// Everything that scrolls: header, fields, area, actions.
class AlertPanel::Body : public View {
public:
    Body(const AlertPanelParts& parts, const Choose& choose, std::function<void()> resized)
        : sheet_(parts.isSheet), resized_(std::move(resized)) {
        addHeader(parts);
        for (const auto& field : parts.fields) {
            boxes_.push_back(std::make_shared<FieldBox>(field));
            addSubview(boxes_.back());
        }
        if (parts.area)
            addArea(parts.area);
        for (const auto& action : parts.actions)
            addAction(action, parts, choose);
    }
    ~Body() override {
        for (const Row& row : rows_)
            row.action->setChangeHandler({});
    }

    /// Places everything for that width and answers the height.
    double arrange(double width) {
        width_ = width;
        double y = arrangeArea(arrangeFields(arrangeHeader()));
        if (y > 0 && !rows_.empty())
            y += bottomMargin();
        height_ = rowsFitSideBySide() ? arrangeRow(y) : arrangeColumn(y);
        return height_;
    }

    void focus(const AlertAction::Pointer& action) const {
        for (const Row& row : rows_)
            if (QWidget* const widget = widgetOf(*row.button); widget && row.action == action)
                widget->setFocus(Qt::OtherFocusReason);
    }

protected:
    void layoutSubviews() override {
        // A field or the area found its size: the panel has to grow or shrink with it.
        const double former = height_;
        if (width_ > 0 && arrange(width_) != former)
            resized_();
    }

private:
    struct Row {
        AlertAction::Pointer action;
        std::shared_ptr<Button> button;
        std::shared_ptr<View> line;
    };

    void addHeader(const AlertPanelParts& parts) {
        if (!parts.title.empty())
            title_ = makeLabel(parts.title, sheet_ ? TextStyle::footnote : TextStyle::headline,
                               sheet_ ? Theme::secondaryText : Theme::text);
        if (!parts.message.empty())
            message_ = makeLabel(parts.message, TextStyle::footnote,
                                 title_ || sheet_ ? Theme::secondaryText : Theme::text);
        for (const auto& label : {title_, message_})
            if (label)
                addSubview(label);
    }

    void addArea(const std::shared_ptr<View>& area) {
        area_ = area;
        addSubview(area);
        if (!area->isLaidOutByConstraints())
            return;
        // The solver finds its height at the width that the panel has.
        using enum LayoutAttribute;
        areaTop_ = LayoutConstraint::equal(*area, top, *this, top);
        LayoutConstraint::activate(
            {areaTop_, LayoutConstraint::equal(*area, leading, *this, leading),
             yielding(LayoutConstraint::equal(*area, trailing, *this, trailing))});
    }

    void addAction(const AlertAction::Pointer& action, const AlertPanelParts& parts,
                   const Choose& choose) {
        Row row{action, std::make_shared<Button>(ButtonType::system), std::make_shared<View>()};
        ButtonImpl& face = implOf(*row.button);
        face.isRow = true;
        face.wraps = true;
        const bool strong = sheet_ ? action == parts.escapeAction
                                   : action == parts.defaultAction && parts.actions.size() > 1;
        row.button->setTitle(action->title());
        row.button->setTitleFont(Font::preferred(strong ? TextStyle::headline : TextStyle::body));
        if (action->style() == ActionStyle::destructive)
            row.button->setTitleColor(Theme::destructive);
        row.button->setEnabled(action->isEnabled());
        row.button->addAction(ControlEvent::touchUpInside, [choose, action] { choose(action); });
        action->setChangeHandler([weak = std::weak_ptr(row.button), raw = action.get()] {
            if (const auto button = weak.lock())
                button->setEnabled(raw->isEnabled());
        });
        row.line->setBackgroundColor(Theme::hairline);
        addSubview(row.button);
        addSubview(row.line);
        rows_.push_back(std::move(row));
    }

    double headerMargin() const { return sheet_ ? sheetHeaderMargin : headerTop; }
    double bottomMargin() const {
        if (sheet_)
            return sheetHeaderMargin;
        return boxes_.empty() && !showsArea() ? headerBottom : sideMargin;
    }
    bool showsArea() const { return area_ && !area_->isHidden(); }
    double leastRowHeight() const { return sheet_ ? sheetRowHeight : rowHeight; }

    double arrangeHeader() {
        if (!title_ && !message_)
            return 0;
        double y = headerMargin();
        const double width = width_ - 2 * sideMargin;
        for (const auto& label : {title_, message_}) {
            if (!label)
                continue;
            const double height = label->intrinsicHeightForWidth(width);
            label->setFrame({sideMargin, y, width, height});
            y += height + (label == title_ && message_ ? titleMessageGap : 0);
        }
        return y;
    }

    double arrangeFields(double y) {
        for (const auto& box : boxes_) {
            y += y > 0 && box == boxes_.front() ? sideMargin : fieldGap;
            box->setFrame({sideMargin, y, width_ - 2 * sideMargin, box->height()});
            y += box->height();
        }
        return y;
    }

    double arrangeArea(double y) {
        if (!showsArea())
            return y;
        y += y > 0 ? fieldGap : 0;
        if (areaTop_)
            areaTop_->setConstant(y);
        else
            area_->setFrame({0, y, width_, area_->frame().height});
        return y + area_->frame().height;
    }

    bool rowsFitSideBySide() const {
        if (sheet_ || rows_.size() != 2)
            return false;
        return std::ranges::all_of(rows_, [this](const Row& row) {
            return row.button->intrinsicContentSize().width <= width_ / 2;
        });
    }

    double lineWidth() const { return window() ? 1 / window()->screenScale() : 1; }

    double arrangeRow(double y) {
        const double line = lineWidth();
        const double half = std::floor(width_ / 2);
        double height = leastRowHeight();
        for (const Row& row : rows_)
            height = std::max(height, row.button->intrinsicHeightForWidth(half));
        // The way out stands first, wherever it was added.
        const bool swapped = rows_[1].action->style() == ActionStyle::cancel;
        const Row& first = rows_[swapped ? 1 : 0];
        const Row& second = rows_[swapped ? 0 : 1];
        first.line->setFrame({0, y, width_, line});
        second.line->setFrame(mirrored({half, y, line, height}, width_));
        first.button->setFrame(mirrored({0, y, half, height}, width_));
        second.button->setFrame(mirrored({half, y, width_ - half, height}, width_));
        const bool rightToLeft = readingSign() < 0;
        round(first, false, rightToLeft ? RowCorners::bottomRight : RowCorners::bottomLeft);
        round(second, false, rightToLeft ? RowCorners::bottomLeft : RowCorners::bottomRight);
        return y + height;
    }

    double arrangeColumn(double y) {
        const bool startsPanel = y == 0;
        // The way out stands last, wherever it was added.
        std::vector<const Row*> order;
        for (const Row& row : rows_)
            order.push_back(&row);
        std::ranges::stable_partition(
            order, [](const Row* row) { return row->action->style() != ActionStyle::cancel; });
        for (const Row* row : order) {
            const double height =
                std::max(leastRowHeight(), row->button->intrinsicHeightForWidth(width_));
            const bool isFirst = row == order.front() && startsPanel;
            row->line->setHidden(isFirst);
            row->line->setFrame({0, y, width_, lineWidth()});
            row->button->setFrame({0, y, width_, height});
            round(*row, isFirst,
                  row == order.back() ? RowCorners::bottomLeft | RowCorners::bottomRight
                                      : RowCorners::none);
            y += height;
        }
        return y;
    }

    static void round(const Row& row, bool top, RowCorners bottom) {
        implOf(*row.button).rowCorners =
            (top ? RowCorners::topLeft | RowCorners::topRight : RowCorners::none) | bottom;
    }

    bool sheet_;
    std::function<void()> resized_;
    double width_ = 0;
    double height_ = 0;
    std::shared_ptr<Label> title_;
    std::shared_ptr<Label> message_;
    std::vector<std::shared_ptr<FieldBox>> boxes_;
    std::shared_ptr<View> area_;
    LayoutConstraint::Pointer areaTop_;
    std::vector<Row> rows_;
};

AlertPanel::AlertPanel(const AlertPanelParts& parts, const Choose& choose,
                       std::function<void()> resized)
    : body_(std::make_shared<Body>(parts, choose, std::move(resized))),
      scroll_(std::make_shared<ScrollBox>(body_)) {
    addSubview(scroll_);
}

AlertPanel::~AlertPanel() = default;

double AlertPanel::heightForWidth(double width) {
    const double height = std::ceil(body_->arrange(width));
    scroll_->setContentHeight(height);
    return height;
}

void AlertPanel::focusAction(const AlertAction::Pointer& action) const {
    body_->focus(action);
}

void AlertPanel::layoutSubviews() {
    scroll_->setFrame(bounds());
}

} // namespace platform
