#include "platform/documents/list/RowSpans.h"

#include <algorithm>
#include <cmath>

namespace platform {

void RowSpans::update(const RowModel& model, const RowStyle& style, double header) {
    count_ = model.count();
    highHeight_ = style.containerHeight;
    height_ = style.rowHeight;
    header_ = header;
    high_ = 0;
    while (high_ < count_ && model.entryAt(high_).kind == EntryKind::container)
        ++high_;
}

double RowSpans::top(std::size_t index) const {
    const double high = static_cast<double>(std::min(index, high_));
    const double low = index > high_ ? static_cast<double>(index - high_) : 0;
    return header_ + high * highHeight_ + low * height_;
}

std::size_t RowSpans::indexAt(double y) const {
    const double highEnd = top(high_);
    const double rows = y < highEnd ? (y - header_) / highHeight_
                                    : static_cast<double>(high_) + (y - highEnd) / height_;
    if (rows <= 0)
        return 0;
    return std::min(count_ - 1, static_cast<std::size_t>(rows));
}

std::size_t RowSpans::endAbove(double y) const {
    if (count_ == 0 || y <= header_)
        return 0;
    const std::size_t index = indexAt(y);
    return top(index) < y ? index + 1 : index;
}

} // namespace platform
