#include "platform/launch/ThumbnailMarks.h"

#include "platform/launch/ThumbnailCache.h"

#include <QByteArray>

#include <cstdint>

namespace platform {
namespace {

constexpr std::string_view signature = "\x89PNG\r\n\x1A\n";
/// Length, type and check sum of a chunk.
constexpr std::size_t chunkFrame = 12;
/// More of a text than an address of the longest path could take, and a bound for what a hostile
/// one unpacks to.
constexpr std::size_t longestText = 16 * 1024;

std::uint32_t numberAt(std::string_view bytes, std::size_t offset) {
    std::uint32_t number = 0;
    for (std::size_t i = 0; i < 4; ++i)
        number = number << 8U | static_cast<unsigned char>(bytes[offset + i]);
    return number;
}

/// A packed text is a zlib stream, which Qt wants with its length (a hint) before it.
std::string unpacked(std::string_view stream) {
    QByteArray framed("\0\0\x10\0", 4);
    framed.append(stream.data(), static_cast<qsizetype>(stream.size()));
    return qUncompress(framed).toStdString();
}

void readText(std::string_view chunk, bool packed, ThumbnailMarks& marks) {
    const std::size_t end = chunk.find('\0');
    if (end == std::string_view::npos || chunk.size() > longestText)
        return;
    const std::string_view key = chunk.substr(0, end);
    std::string* const target = key == thumbnailUriKey    ? &marks.uri
                                : key == thumbnailDateKey ? &marks.date
                                                          : nullptr;
    if (!target)
        return;
    const std::string_view rest = chunk.substr(end + 1);
    if (!packed)
        *target = rest;
    else if (rest.starts_with('\0')) // the one method that there is
        *target = unpacked(rest.substr(1));
}

} // namespace

std::optional<ThumbnailMarks> readThumbnailMarks(const Bytes& png) {
    std::string_view rest(reinterpret_cast<const char*>(png.data()), png.size());
    if (!rest.starts_with(signature))
        return std::nullopt;
    rest.remove_prefix(signature.size());
    ThumbnailMarks marks;
    while (rest.size() >= chunkFrame) {
        const std::size_t length = numberAt(rest, 0);
        if (length > rest.size() - chunkFrame)
            return std::nullopt;
        const std::string_view type = rest.substr(4, 4);
        const std::string_view content = rest.substr(8, length);
        if (type == "IEND")
            return marks;
        if (type == "IHDR" && length >= 8) {
            marks.width = static_cast<int>(numberAt(content, 0) & INT32_MAX);
            marks.height = static_cast<int>(numberAt(content, 4) & INT32_MAX);
        } else if (type == "tEXt" || type == "zTXt") {
            readText(content, type == "zTXt", marks);
        }
        rest.remove_prefix(length + chunkFrame);
    }
    return std::nullopt;
}

} // namespace platform
