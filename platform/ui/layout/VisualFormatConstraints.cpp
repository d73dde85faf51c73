#include "platform/base/Format.h"
#include "platform/ui/layout/ConstraintImpl.h"
#include "platform/ui/layout/VisualFormatParser.h"

#include <optional>

namespace platform {

namespace {

/// Turns what was read into constraints; the first fault ends it.
class Builder {
public:
    Builder(std::string_view text, const ParsedFormat& format, const ItemByName& itemNamed)
        : text_(text), format_(format), itemNamed_(itemNamed) {}
    Result<std::vector<LayoutConstraint::Pointer>> build();

private:
    bool findItems();
    LayoutItem* find(const std::string& name, std::size_t place);
    bool addSizes(std::size_t index);
    void addGap(const ParsedFormat::Gap& gap, LayoutItem& later, bool fromSuperview,
                LayoutItem& earlier, bool toSuperview);
    void add(LayoutItem& first, LayoutAttribute attribute, LayoutItem* second,
             LayoutAttribute secondAttribute, const ParsedFormat::Predicate& predicate);

    bool isHorizontal() const { return format_.axis == Axis::horizontal; }
    LayoutAttribute start() const {
        return isHorizontal() ? LayoutAttribute::leading : LayoutAttribute::top;
    }
    LayoutAttribute end() const {
        return isHorizontal() ? LayoutAttribute::trailing : LayoutAttribute::bottom;
    }
    LayoutAttribute size() const {
        return isHorizontal() ? LayoutAttribute::width : LayoutAttribute::height;
    }

    std::string_view text_;
    const ParsedFormat& format_;
    const ItemByName& itemNamed_;
    std::vector<LayoutItem*> items_;
    std::vector<LayoutConstraint::Pointer> constraints_;
    std::optional<Error> fault_;
};

Result<std::vector<LayoutConstraint::Pointer>> Builder::build() {
    if (!findItems())
        return *fault_;
    auto gap = format_.gaps.begin();
    if (format_.startsAtSuperview)
        addGap(*gap++, *items_.front(), true, *items_.front()->layoutParent(), false);
    for (std::size_t i = 0; i < items_.size(); ++i) {
        if (i > 0)
            addGap(*gap++, *items_[i], false, *items_[i - 1], false);
        if (!addSizes(i))
            return *fault_;
    }
    if (format_.endsAtSuperview)
        addGap(*gap, *items_.back()->layoutParent(), false, *items_.back(), true);
    return std::move(constraints_);
}

bool Builder::findItems() {
    for (const auto& view : format_.views)
        if (LayoutItem* const item = find(view.name, view.place))
            items_.push_back(item);
        else
            return false;
    const auto needsParent = [&](std::size_t index) {
        if (!items_[index]->layoutParent())
            fault_ = visualFormatError(
                text_, format_.views[index].place,
                platform::format("the view “%@” has no superview", format_.views[index].name));
        return !fault_;
    };
    return (!format_.startsAtSuperview || needsParent(0)) &&
           (!format_.endsAtSuperview || needsParent(items_.size() - 1));
}

LayoutItem* Builder::find(const std::string& name, std::size_t place) {
    LayoutItem* const item = itemNamed_(name);
    if (!item)
        fault_ = visualFormatError(text_, place, platform::format("there is no view “%@”", name));
    return item;
}

bool Builder::addSizes(std::size_t index) {
    for (const auto& predicate : format_.views[index].sizes) {
        LayoutItem* other = nullptr;
        if (!predicate.view.empty() && !(other = find(predicate.view, predicate.place)))
            return false;
        add(*items_[index], size(), other, other ? size() : LayoutAttribute::none, predicate);
    }
    return true;
}

/// The space from `earlier` to `later`; a superview is met at its inner side.
void Builder::addGap(const ParsedFormat::Gap& gap, LayoutItem& later, bool fromSuperview,
                     LayoutItem& earlier, bool toSuperview) {
    for (const auto& predicate : gap)
        add(later, toSuperview ? end() : start(), &earlier, fromSuperview ? start() : end(),
            predicate);
}

void Builder::add(LayoutItem& first, LayoutAttribute attribute, LayoutItem* second,
                  LayoutAttribute secondAttribute, const ParsedFormat::Predicate& predicate) {
    constraints_.push_back(LayoutConstraint::Impl::make(
        first, attribute, predicate.relation, second, secondAttribute, 1, predicate.number));
    constraints_.back()->setPriority(predicate.priority);
}

} // namespace

Result<std::vector<LayoutConstraint::Pointer>> constraintsForFormat(std::string_view format,
                                                                    const ItemByName& itemNamed) {
    const Result<ParsedFormat> parsed = parseVisualFormat(format);
    if (!parsed)
        return parsed.error();
    return Builder(format, *parsed, itemNamed).build();
}

} // namespace platform
