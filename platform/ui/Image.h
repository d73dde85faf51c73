#pragma once

#include "platform/base/Value.h"
#include "platform/ui/Color.h"
#include "platform/ui/Geometry.h"

#include <memory>
#include <string_view>

namespace platform {

/// Images of bar buttons and rows that the toolkit supplies.
enum class SystemImage {
    organize,
    trash,
    action,
    back,
    chevron,
    more,
    cloudDownload,
    checkmark,
    search,
    folder,
    warning
};

/// A picture: immutable, cheap to copy. An empty one draws nothing.
class Image {
public:
    struct Data; // the toolkit's own picture

    Image() = default;
    explicit Image(std::shared_ptr<const Data> data) : data_(std::move(data)) {}

    /// A picture built into the program, by name ("Cloudload"); empty when there is none.
    static Image named(std::string_view name);
    static Image system(SystemImage which);
    /// Decodes a PNG, JPEG or another known format; empty when that fails.
    static Image decoded(const Bytes& encoded);

    bool empty() const { return data_ == nullptr; }
    /// In points.
    Size size() const;
    /// Pixels a point.
    double scale() const;
    /// The same shape filled with one colour.
    Image tinted(Color color) const;

    const std::shared_ptr<const Data>& data() const { return data_; }
    bool operator==(const Image& other) const { return data_ == other.data_; }

private:
    std::shared_ptr<const Data> data_;
};

} // namespace platform
