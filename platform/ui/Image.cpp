#include "platform/ui/Image.h"

#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ImageData.h"
#include "platform/ui/qt/Settings.h"
#include "resources/Resources.h"

#include <QBuffer>
#include <QFile>
#include <QImageReader>
#include <QPainter>
#include <QPixmapCache>
#include <QSvgRenderer>

#include <atomic>
#include <cmath>
#include <map>

namespace platform {
namespace {

/// Larger pictures are drawn without keeping the rendering.
constexpr int cachedEdge = 256;

std::shared_ptr<Image::Data> loadDrawing(const QString& name) {
    initializeResources();
    QFile file(QStringLiteral(":/icons/%1.svg").arg(name));
    if (!file.open(QIODevice::ReadOnly))
        return nullptr;
    auto data = std::make_shared<Image::Data>();
    data->drawing = file.readAll();
    const QSizeF size = QSvgRenderer(data->drawing).defaultSize();
    data->size = {size.width(), size.height()};
    return data;
}

struct SystemDrawing {
    const char* name;
    bool followsDirection = false;
};

SystemDrawing drawingOf(SystemImage which) {
    switch (which) {
    case SystemImage::organize:
        return {"organize", true};
    case SystemImage::trash:
        return {"trash"};
    case SystemImage::action:
        return {"action"};
    case SystemImage::back:
        return {"back", true};
    case SystemImage::chevron:
        return {"chevron", true};
    case SystemImage::more:
        return {"more"};
    case SystemImage::cloudDownload:
        return {"cloud-download"};
    case SystemImage::checkmark:
        return {"checkmark"};
    case SystemImage::search:
        return {"search"};
    case SystemImage::folder:
        return {"folder"};
    case SystemImage::warning:
        return {"warning"};
    }
    return {"more"};
}

} // namespace

std::uint64_t Image::Data::nextIdentity() {
    static std::atomic<std::uint64_t> last{0};
    return ++last;
}

QImage Image::Data::rendered(QSize pixelSize) const {
    QImage result(pixelSize, QImage::Format_ARGB32_Premultiplied);
    result.fill(Qt::transparent);
    QPainter painter(&result);
    painter.setRenderHints(QPainter::Antialiasing | QPainter::SmoothPixmapTransform);
    const QRectF all{QPointF(), QSizeF(pixelSize)};
    if (drawing.isEmpty())
        painter.drawImage(all, pixels, QRectF(pixels.rect()));
    else
        QSvgRenderer(drawing).render(&painter, all);
    if (tint) {
        painter.setCompositionMode(QPainter::CompositionMode_SourceIn);
        painter.fillRect(all, *tint);
    }
    painter.end();
    return result;
}

Image Image::named(std::string_view name) {
    static std::map<std::string, Image, std::less<>> loaded;
    const auto found = loaded.find(name);
    if (found != loaded.end())
        return found->second;
    return loaded.emplace(name, Image(loadDrawing(toQt(name)))).first->second;
}

Image Image::system(SystemImage which) {
    static std::map<SystemImage, Image> loaded;
    Image& image = loaded[which];
    if (image.empty()) {
        const SystemDrawing drawing = drawingOf(which);
        const auto data = loadDrawing(QLatin1String("ui-") + QLatin1String(drawing.name));
        if (data)
            data->followsDirection = drawing.followsDirection;
        image = Image(data);
    }
    return image;
}

Image Image::decoded(const Bytes& encoded) {
    QByteArray bytes(reinterpret_cast<const char*>(encoded.data()),
                     static_cast<qsizetype>(encoded.size()));
    QBuffer buffer(&bytes);
    QImageReader reader(&buffer);
    reader.setAutoTransform(true);
    return imageOf(reader.read());
}

Size Image::size() const {
    return data_ ? data_->size : Size{};
}

double Image::scale() const {
    return data_ ? data_->scale : 1;
}

Image Image::tinted(Color color) const {
    if (!data_)
        return {};
    auto copy = std::make_shared<Data>(*data_);
    copy->tint = toQt(color);
    return Image(std::move(copy));
}

Image imageOf(QImage pixels, double scale) {
    if (pixels.isNull())
        return {};
    auto data = std::make_shared<Image::Data>();
    data->size = {pixels.width() / scale, pixels.height() / scale};
    data->scale = scale;
    data->pixels = std::move(pixels);
    return Image(std::move(data));
}

QImage toQt(const Image& image, Size points, double scale) {
    const QSize pixelSize(static_cast<int>(std::lround(points.width * scale)),
                          static_cast<int>(std::lround(points.height * scale)));
    if (image.empty() || pixelSize.isEmpty())
        return {};
    QImage result = image.data()->rendered(pixelSize);
    result.setDevicePixelRatio(scale);
    return result;
}

void paintImage(QPainter& painter, const Image& image, const QRectF& target) {
    if (image.empty() || target.isEmpty())
        return;
    const Image::Data& data = *image.data();
    const double ratio = std::abs(painter.deviceTransform().m11());
    const QSize pixelSize(std::max(1, static_cast<int>(std::lround(target.width() * ratio))),
                          std::max(1, static_cast<int>(std::lround(target.height() * ratio))));
    QPixmap pixmap;
    const bool keep = pixelSize.width() <= cachedEdge && pixelSize.height() <= cachedEdge;
    const QString key = QStringLiteral("platform:%1:%2:%3:%4")
                            .arg(data.identity)
                            .arg(data.tint ? data.tint->name(QColor::HexArgb) : QString())
                            .arg(pixelSize.width())
                            .arg(pixelSize.height());
    if (!keep || !QPixmapCache::find(key, &pixmap)) {
        pixmap = QPixmap::fromImage(data.rendered(pixelSize));
        if (keep)
            QPixmapCache::insert(key, pixmap);
    }
    painter.save();
    painter.setRenderHint(QPainter::SmoothPixmapTransform);
    if (data.followsDirection && isRightToLeft()) {
        painter.translate(target.center());
        painter.scale(-1, 1);
        painter.translate(-target.center());
    }
    painter.drawPixmap(target, pixmap, QRectF(pixmap.rect()));
    painter.restore();
}

} // namespace platform
