#pragma once

#include "platform/ui/Image.h"

#include <QByteArray>
#include <QColor>
#include <QImage>

#include <cstdint>
#include <optional>

class QPainter;

namespace platform {

/// Pixels, or a drawing that is rendered at the size and resolution at which it is shown.
struct Image::Data {
    QImage pixels;
    /// An SVG; empty for pixels.
    QByteArray drawing;
    Size size;
    double scale = 1;
    std::optional<QColor> tint;
    /// It points along the reading direction (an arrow), so it is mirrored with it.
    bool followsDirection = false;
    /// Of the shape, whatever its tint: the key of its renderings in the pixmap cache.
    std::uint64_t identity = nextIdentity();

    static std::uint64_t nextIdentity();
    /// The picture filling `pixelSize`, tinted, not mirrored.
    QImage rendered(QSize pixelSize) const;
};

} // namespace platform
