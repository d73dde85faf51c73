#include "platform/documents/thumbnails/ThumbnailMaking.h"

#include "platform/documents/thumbnails/ThumbnailDrawing.h"
#include "platform/files/FileManager.h"
#include "platform/launch/ThumbnailCache.h"
#include "platform/ui/qt/Bridge.h"

#include <QBuffer>
#include <QImageWriter>
#include <QPainter>

#include <algorithm>
#include <array>
#include <chrono>

namespace platform {
namespace {

/// A file that changes again within the second in which it changed keeps its date there, so its
/// picture is kept only when that second is over.
constexpr double settledAfter = 2;
/// Of 100: packing harder takes longer than the disk saves.
constexpr int quickPacking = 70;

QImage fitted(const QImage& image, int edge) {
    if (image.isNull() || std::max(image.width(), image.height()) <= edge)
        return image;
    return image.scaled(image.size().scaled(edge, edge, Qt::KeepAspectRatio).expandedTo({1, 1}),
                        Qt::IgnoreAspectRatio, Qt::SmoothTransformation);
}

QImage decoded(const Bytes& png) {
    return QImage::fromData(QByteArrayView(reinterpret_cast<const char*>(png.data()),
                                           static_cast<qsizetype>(png.size())),
                            "PNG");
}

QImage fromCache(const ThumbnailCache& cache, const ThumbnailRequest& request) {
    for (const ThumbnailSize size : thumbnailSizes) {
        if (size < thumbnailSizeFor(request.pixels))
            continue;
        if (const auto png = cache.find(request.url, request.modified, size))
            if (QImage image = decoded(*png); !image.isNull())
                return image;
    }
    return {};
}

/// What can be had of a document that is not here.
QImage fromBefore(const ThumbnailCache& cache, const ThumbnailRequest& request) {
    if (QImage image = fromCache(cache, request); !image.isNull())
        return image;
    const auto png = cache.findLargest(request.url, request.modified);
    return png ? decoded(*png) : QImage();
}

/// With the document's marks, and without what the document's own picture said of itself.
Bytes encoded(const QImage& image, const ThumbnailRequest& request) {
    QImage plain(image.size(),
                 image.hasAlphaChannel() ? QImage::Format_ARGB32 : QImage::Format_RGB32);
    plain.fill(Qt::transparent);
    QPainter painter(&plain);
    painter.setCompositionMode(QPainter::CompositionMode_Source);
    painter.drawImage(0, 0, image);
    painter.end();
    plain.setText(toQt(thumbnailUriKey), toQt(ThumbnailCache::uriOf(request.url)));
    plain.setText(toQt(thumbnailDateKey), toQt(ThumbnailCache::dateOf(request.modified)));
    QBuffer buffer;
    buffer.open(QIODevice::WriteOnly);
    QImageWriter writer(&buffer, "png");
    writer.setQuality(quickPacking);
    if (!writer.write(plain))
        return {};
    const auto* const begin = reinterpret_cast<const std::byte*>(buffer.data().constData());
    return {begin, begin + buffer.size()};
}

bool isUnchanged(const ThumbnailRequest& request) {
    const auto attributes = FileManager::attributes(request.url.path(), FollowLinks::yes);
    return attributes && attributes->modified == request.modified;
}

bool isSettled(Date modified) {
    const auto now = std::chrono::system_clock::now().time_since_epoch();
    const Date today{std::chrono::duration_cast<std::chrono::nanoseconds>(now).count()};
    const double age = today.secondsSince(modified);
    return age < 0 || age >= settledAfter;
}

/// A cache that cannot be written to (a full disk) costs time, not pictures.
void keep(const ThumbnailCache& cache, const ThumbnailRequest& request, ThumbnailSize size,
          const QImage& image) {
    if (const Bytes png = encoded(image, request); !png.empty())
        (void)cache.store(request.url, size, png);
}

void keepFailure(const ThumbnailCache& cache, const ThumbnailRequest& request) {
    QImage nothing(1, 1, QImage::Format_ARGB32);
    nothing.fill(Qt::transparent);
    (void)cache.storeFailure(request.url, encoded(nothing, request));
}

MadeThumbnail drawAnew(const ThumbnailCache& cache, const ThumbnailRequest& request,
                       const ThumbnailDrawing& drawing, PreviewToken& token) {
    const ThumbnailSize size = thumbnailSizeFor(request.pixels);
    const int edge = static_cast<int>(size);
    QImage image;
    Failure undrawable;
    bool unchanged = false;
    const auto draw = [&](const std::string& path) {
        Result<QImage> drawn = drawing.draw(request.url, path, edge, token);
        if (drawn)
            image = fitted(*drawn, edge);
        else
            undrawable = drawn.error();
        unchanged = isUnchanged(request);
        return Failure();
    };
    const Failure failure = readDocument(request.url, token, draw, drawing.form);
    // What could not even be read, or is another document by now, is looked at again another time;
    // and a drawing that nobody waited for has not failed.
    if (failure || !unchanged || (undrawable && token.isCancelled()))
        return {};
    if (isSettled(request.modified)) {
        if (undrawable)
            keepFailure(cache, request);
        else if (!image.isNull())
            keep(cache, request, size, image);
    }
    return {fitted(image, request.pixels), undrawable || !image.isNull()};
}

} // namespace

bool makesThumbnails(std::string_view typeIdentifier) {
    return thumbnailDrawingFor(typeIdentifier) != nullptr;
}

MadeThumbnail makeThumbnail(const ThumbnailCache& cache, const ThumbnailRequest& request,
                            PreviewToken& token) {
    const ThumbnailDrawing* const drawing = thumbnailDrawingFor(request.typeIdentifier);
    if (!drawing || cache.contains(request.url))
        return {{}, true};
    if (request.promised)
        return {fitted(fromBefore(cache, request), request.pixels), true};
    if (QImage image = fromCache(cache, request); !image.isNull())
        return {fitted(image, request.pixels), true};
    if (cache.knowsFailure(request.url, request.modified))
        return {{}, true};
    return drawAnew(cache, request, *drawing, token);
}

} // namespace platform
