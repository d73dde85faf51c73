#include "platform/documents/thumbnails/ThumbnailMaking.h"

#include "platform/documents/preview/PdfFile.h"
#include "platform/documents/preview/PictureFile.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/files/FileManager.h"
#include "platform/launch/ThumbnailCache.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/qt/Bridge.h"

#include <QBuffer>
#include <QImageReader>
#include <QImageWriter>
#include <QPainter>

#include <algorithm>
#include <array>
#include <chrono>
#include <cmath>

namespace platform {
namespace {

/// A file that changes again within the second in which it changed keeps its date there, so its
/// picture is kept only when that second is over.
constexpr double settledAfter = 2;
/// Of 100: packing harder takes longer than the disk saves.
constexpr int quickPacking = 70;

using Draw = Result<QImage> (*)(const Url& file, const std::string& path, int edge,
                                PreviewToken& token);

Result<QImage> drawPicture(const Url& file, const std::string& path, int edge,
                           PreviewToken& token) {
    Result<Picture> picture = readPicture(file, path, static_cast<double>(edge) * edge, token);
    if (!picture)
        return picture.error();
    return std::move(picture->image);
}

Result<QImage> drawFirstPage(const Url& file, const std::string& path, int edge,
                             PreviewToken& /*token*/) {
    PdfFile document;
    if (const Failure failure = document.open(file, path))
        return *failure;
    const QSizeF fitting = document.pageSizes(0, 1).front().scaled(edge, edge, Qt::KeepAspectRatio);
    QImage page = document.render(0, std::max(1, static_cast<int>(std::lround(fitting.width()))));
    if (page.isNull())
        return damagedDocument(file);
    return page;
}

bool isReadablePicture(std::string_view typeIdentifier) {
    if (!TypeRegistry::conformsTo(typeIdentifier, types::image))
        return false;
    static const QList<QByteArray> readable = QImageReader::supportedMimeTypes();
    const std::string mime = TypeRegistry::mimeTypeForIdentifier(typeIdentifier);
    return readable.contains(QByteArray::fromStdString(mime));
}

/// None for types without pictures.
Draw drawingOf(std::string_view typeIdentifier) {
    if (TypeRegistry::conformsTo(typeIdentifier, types::pdf))
        return &drawFirstPage;
    return isReadablePicture(typeIdentifier) ? &drawPicture : nullptr;
}

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

MadeThumbnail drawAnew(const ThumbnailCache& cache, const ThumbnailRequest& request, Draw draw,
                       PreviewToken& token) {
    const ThumbnailSize size = thumbnailSizeFor(request.pixels);
    const int edge = static_cast<int>(size);
    QImage image;
    Failure undrawable;
    bool unchanged = false;
    const Failure failure = readDocument(request.url, token, [&](const std::string& path) {
        Result<QImage> drawn = draw(request.url, path, edge, token);
        if (drawn)
            image = fitted(*drawn, edge);
        else
            undrawable = drawn.error();
        unchanged = isUnchanged(request);
        return Failure();
    });
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
    return drawingOf(typeIdentifier) != nullptr;
}

MadeThumbnail makeThumbnail(const ThumbnailCache& cache, const ThumbnailRequest& request,
                            PreviewToken& token) {
    const Draw draw = drawingOf(request.typeIdentifier);
    if (!draw || cache.contains(request.url))
        return {{}, true};
    if (request.promised)
        return {fitted(fromBefore(cache, request), request.pixels), true};
    if (QImage image = fromCache(cache, request); !image.isNull())
        return {fitted(image, request.pixels), true};
    if (cache.knowsFailure(request.url, request.modified))
        return {{}, true};
    return drawAnew(cache, request, draw, token);
}

} // namespace platform
