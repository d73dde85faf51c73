#include "platform/documents/preview/VectorPicture.h"

#include "platform/documents/preview/PreviewWorker.h"

#include <QFile>
#include <QPainter>
#include <QSvgRenderer>

#include <algorithm>
#include <array>
#include <chrono>
#include <cmath>
#define ZLIB_CONST // it does not write to what it reads
#include <zlib.h>

namespace platform {
namespace {

/// Drawn once, at most that many times as large as the file says: no view enlarges further.
constexpr double largestScale = 8;
/// 32 MB; four times the pixels of a large screen.
constexpr double mostDrawnPixels = 8e6;
/// The painter's own limit of coordinates.
constexpr double longestEdge = 32'000;
/// Longer texts are maps and plans whose tree alone takes half a gigabyte.
constexpr qint64 longestText = 64LL * 1024 * 1024;
/// The drawing is looked at between bands: nobody waits longer for a picture.
constexpr int bands = 4;
constexpr std::chrono::seconds longestDrawing{15};

/// Empty when it is not whole, or unpacks to more than a text may have.
QByteArray unpacked(const QByteArray& packed) {
    constexpr int gzipWindow = 15 + 16;
    z_stream stream{};
    if (::inflateInit2(&stream, gzipWindow) != Z_OK)
        return {};
    stream.next_in = reinterpret_cast<const Bytef*>(packed.constData());
    stream.avail_in = static_cast<uInt>(packed.size());
    QByteArray text;
    std::array<char, 64UL * 1024> piece;
    int state = Z_OK;
    while (state == Z_OK && text.size() <= longestText) {
        stream.next_out = reinterpret_cast<Bytef*>(piece.data());
        stream.avail_out = static_cast<uInt>(piece.size());
        state = ::inflate(&stream, Z_NO_FLUSH);
        text.append(piece.data(), static_cast<qsizetype>(piece.size() - stream.avail_out));
    }
    ::inflateEnd(&stream);
    return state == Z_STREAM_END && text.size() <= longestText ? text : QByteArray();
}

QByteArray textOf(QFile& content) {
    content.seek(0);
    QByteArray bytes = content.read(longestText + 1);
    if (bytes.startsWith("\x1F\x8B"))
        return unpacked(bytes);
    return bytes.size() > longestText ? QByteArray() : bytes;
}

/// A picture within the picture would be read from wherever its address says: what is not in the
/// text itself stays out.
QByteArray withoutOtherFiles(const QByteArray& text) {
    QByteArray own;
    own.reserve(text.size());
    qsizetype copied = 0;
    for (qsizetype tag = text.indexOf("image"); tag >= 0; tag = text.indexOf("image", tag + 1)) {
        // No value of an attribute may hold this sign.
        const qsizetype end = text.indexOf('<', tag);
        for (qsizetype at = text.indexOf("href", tag); at >= 0 && (end < 0 || at < end);
             at = text.indexOf("href", at + 1)) {
            qsizetype value = at + 4;
            while (value < text.size() && QByteArrayView("= \t\r\n\"'").contains(text[value]))
                ++value;
            if (value <= copied || QByteArrayView(text).sliced(value).startsWith("data:"))
                continue;
            own.append(QByteArrayView(text).sliced(copied, value - copied)).append("data:,");
            copied = value;
        }
    }
    return own.append(QByteArrayView(text).sliced(copied));
}

/// By its own measures; 1 in either direction at least.
QSizeF sizeOf(const QSvgRenderer& renderer) {
    const QSizeF size = renderer.defaultSize();
    return {std::max(1.0, size.width()), std::max(1.0, size.height())};
}

/// Empty when it took too long or nobody wants it any more.
QImage draw(QSvgRenderer& renderer, QSize pixels, const PreviewToken& token) {
    const auto end = std::chrono::steady_clock::now() + longestDrawing;
    QImage image(pixels, QImage::Format_ARGB32_Premultiplied);
    image.fill(Qt::transparent);
    const int step = std::max(1, pixels.height() / bands);
    for (int top = 0; top < pixels.height(); top += step) {
        if (token.isCancelled() || std::chrono::steady_clock::now() > end)
            return {};
        const int height = std::min(step, pixels.height() - top);
        QImage band(image.scanLine(top), pixels.width(), height, image.bytesPerLine(),
                    image.format());
        QPainter painter(&band);
        painter.setRenderHint(QPainter::Antialiasing);
        renderer.render(&painter, QRectF(0, -top, pixels.width(), pixels.height()));
    }
    return image;
}

} // namespace

Result<Picture> drawVectorPicture(const Url& file, QFile& content, const PreviewToken& token) {
    const QByteArray text = textOf(content);
    if (text.isEmpty())
        return tooLargeDocument(file);
    QSvgRenderer renderer;
    if (token.isCancelled() || !renderer.load(withoutOtherFiles(text)))
        return damagedDocument(file);
    const QSizeF size = sizeOf(renderer);
    const double scale =
        std::min({largestScale, longestEdge / std::max(size.width(), size.height()),
                  std::sqrt(mostDrawnPixels / (size.width() * size.height()))});
    const QSize pixels = (size * scale).toSize().expandedTo({1, 1});
    QImage image = draw(renderer, pixels, token);
    if (image.isNull())
        return tooLargeDocument(file);
    return Picture{std::move(image), size.toSize()};
}

} // namespace platform
