// Draws the picture of lines and areas (SVG, packed or not) that is its standard input, with so
// many pixels as its argument says at most, and writes it to its standard output as DrawnPicture.h
// has it. A program of its own, because a short text may ask for more drawing than a life is long
// for, and nothing but the end of its process ends that.

#include "platform/documents/preview/ChildLimits.h"
#include "platform/documents/preview/DrawnPicture.h"

#include <QFile>
#include <QGuiApplication>
#include <QImage>
#include <QPainter>
#include <QSvgRenderer>

#include <algorithm>
#include <array>
#include <cerrno>
#include <cmath>
#include <cstdlib>
#include <unistd.h>
#define ZLIB_CONST // it does not write to what it reads
#include <zlib.h>

namespace {

using platform::DrawnHead;

/// Drawn once, at most that many times as large as the file says: no view enlarges further.
constexpr double largestScale = 8;
/// Longer texts are maps and plans whose tree alone takes half a gigabyte.
constexpr qint64 longestText = 64LL * 1024 * 1024;
constexpr std::size_t mostMemory = 2048UL << 20;
/// Seconds of work; the largest honest drawings take five.
constexpr unsigned mostWork = 15;

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

void write(const void* bytes, std::size_t size) {
    const char* at = static_cast<const char*>(bytes);
    while (size > 0) {
        const ssize_t done = ::write(STDOUT_FILENO, at, size);
        if (done < 0 && errno != EINTR)
            ::_exit(1); // nobody listens any more
        at += std::max<ssize_t>(done, 0);
        size -= static_cast<std::size_t>(std::max<ssize_t>(done, 0));
    }
}

[[noreturn]] void end(const DrawnHead& head, const QImage& image = {}) {
    write(&head, sizeof head);
    const auto row = static_cast<std::size_t>(head.width) * 4;
    for (int y = 0; y < image.height(); ++y)
        write(image.constScanLine(y), row);
    // The end of the process frees it faster than a drawing's tree.
    ::_exit(0);
}

[[noreturn]] void draw(QSvgRenderer& renderer, double mostPixels) {
    const QSizeF size = sizeOf(renderer);
    const double scale =
        std::min({largestScale, platform::longestDrawnEdge / std::max(size.width(), size.height()),
                  std::sqrt(mostPixels / (size.width() * size.height()))});
    const QSize pixels = (size * scale).toSize().expandedTo({1, 1});
    QImage image(pixels, QImage::Format_ARGB32_Premultiplied);
    if (image.isNull())
        end({DrawnHead::State::tooLarge});
    image.fill(Qt::transparent);
    QPainter painter(&image);
    painter.setRenderHint(QPainter::Antialiasing);
    renderer.render(&painter, QRectF(QPointF(), pixels));
    painter.end();
    const QSize full = size.toSize();
    end({DrawnHead::State::drawn, full.width(), full.height(), pixels.width(), pixels.height()},
        image);
}

} // namespace

int main(int argc, char** argv) {
    platform::limitThisProcess(mostMemory, mostWork);
    const double wanted = argc > 1 ? std::atof(argv[1]) : platform::mostDrawnPixels;
    const QGuiApplication application(argc, argv); // whoever draws letters needs one
    QFile content;
    if (!content.open(STDIN_FILENO, QIODevice::ReadOnly))
        end({DrawnHead::State::damaged});
    const QByteArray text = textOf(content);
    if (text.isEmpty())
        end({DrawnHead::State::tooLarge});
    QSvgRenderer renderer;
    if (!renderer.load(withoutOtherFiles(text)))
        end({DrawnHead::State::damaged});
    draw(renderer, std::clamp(wanted, 1.0, platform::mostDrawnPixels));
}
