#pragma once

#include <cstdint>
#include <string>

class QImage;

namespace pelmora {

/// A landscape: sky, hills one behind the other, water. The same seed gives the same picture.
QImage landscape(unsigned seed, int width, int height);
/// A sheet of coloured figures, for variety among thumbnails.
QImage pattern(unsigned seed, int width, int height);

std::string pngBytes(const QImage& image);
std::string jpegBytes(const QImage& image);
/// A PNG of exactly `size` bytes, which must be more than the plain one needs: a text chunk that
/// no viewer shows fills it up.
std::string pngOfSize(const QImage& image, std::uint64_t size);
/// A drawing of a floor plan.
std::string floorPlanSvg();

} // namespace pelmora
