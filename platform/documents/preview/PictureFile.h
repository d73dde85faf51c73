#pragma once

#include "platform/base/Result.h"
#include "platform/base/Url.h"

#include <QImage>
#include <QSize>

#include <optional>
#include <string>

class QIODevice;

namespace platform {

class PreviewToken;

/// The pixels of a picture, upright.
struct Picture {
    QImage image;
    /// As the file says it, upright; the image may have fewer pixels, one of lines also more.
    QSize fullSize;
};

/// Reads a still picture, or the first of a moving one; within Work. More pixels than `mostPixels`
/// are never held: a larger picture is read smaller. One that would take unreasonable time or
/// memory to read is an error that says so.
Result<Picture> readPicture(const Url& file, const std::string& path, double mostPixels,
                            PreviewToken& token);
/// The same with fewer pixels, but no fewer than fill `view`, where a picture can be read so in a
/// fraction of the time; none where it cannot, for whatever reason.
std::optional<Picture> readCoarsePicture(const std::string& path, QSize view);
/// The same of pixels alone, from an open device; never reads another file. None when it is no
/// such picture.
QImage readPixels(QIODevice& device, double mostPixels);

/// "… is too large to be shown here."
Error tooLargeDocument(const Url& file);

} // namespace platform
