#pragma once

#include "platform/documents/list/RowStyle.h"
#include "platform/documents/model/RowModel.h"

#include <cstddef>

namespace platform {

/// Where rows lie in the whole height of a list, in points from its top. Containers, which come
/// first, are higher than the others. Doubles hold whole points far beyond any folder.
class RowSpans {
public:
    /// After every change of the rows, of the style or of what stands above the first row.
    void update(const RowModel& model, const RowStyle& style, double header);

    double total() const { return top(count_); }
    double top(std::size_t index) const;
    double height(std::size_t index) const { return index < high_ ? highHeight_ : height_; }
    /// The row that covers `y`; the first or last one beyond them. There must be rows.
    std::size_t indexAt(double y) const;
    /// One past the last row that begins above `y`.
    std::size_t endAbove(double y) const;

private:
    std::size_t count_ = 0;
    std::size_t high_ = 0;
    double highHeight_ = 0;
    double height_ = 0;
    double header_ = 0;
};

} // namespace platform
