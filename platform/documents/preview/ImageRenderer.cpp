#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/PictureFile.h"
#include "platform/documents/preview/PreviewKinds.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/ZoomWidget.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/qt/Bridge.h"

#include <QImageReader>
#include <QPainter>

#include <optional>
#include <vector>

namespace platform {
namespace {

/// A picture with more pixels is read smaller: that many take 128 MB, and no screen has more.
constexpr double mostPicturePixels = 32e6;
constexpr int smallestLevel = 512;

/// The picture and its halves, quarters and so on: drawing from the nearest one is fast and smooth.
struct Pyramid {
    /// As the file has it, after turning it upright.
    QSize fullSize;
    std::vector<QImage> levels;
};

Pyramid buildPyramid(QImage image, QSize fullSize) {
    Pyramid pyramid{fullSize, {}};
    const bool opaque = !image.hasAlphaChannel();
    pyramid.levels.push_back(std::move(image).convertToFormat(
        opaque ? QImage::Format_RGB32 : QImage::Format_ARGB32_Premultiplied));
    while (std::max(pyramid.levels.back().width(), pyramid.levels.back().height()) >
           2 * smallestLevel) {
        const QImage& last = pyramid.levels.back();
        pyramid.levels.push_back(last.scaled(std::max(1, last.width() / 2),
                                             std::max(1, last.height() / 2), Qt::IgnoreAspectRatio,
                                             Qt::SmoothTransformation));
    }
    return pyramid;
}

class PictureContent final : public ZoomContent {
public:
    void set(Pyramid pyramid) { pyramid_ = std::move(pyramid); }
    bool isEmpty() const { return pyramid_.levels.empty(); }

    QSizeF contentSize() const override { return pyramid_.fullSize; }

    void paintContent(QPainter& painter, const QRectF& visible, double zoom) override {
        if (pyramid_.levels.empty())
            return;
        const double pixels = zoom * painter.device()->devicePixelRatioF();
        const QImage* level = &pyramid_.levels.front();
        for (const QImage& each : pyramid_.levels)
            if (each.width() >= pyramid_.fullSize.width() * pixels)
                level = &each;
        const double scale = level->width() / static_cast<double>(pyramid_.fullSize.width());
        const QRectF part(visible.topLeft() * scale, visible.size() * scale);
        // Single pixels of a much enlarged picture are what one wants to see.
        painter.setRenderHint(QPainter::SmoothPixmapTransform, pixels < 4);
        painter.drawImage(visible, *level, part);
    }

private:
    Pyramid pyramid_;
};

class ImageRenderer final : public PreviewRenderer {
public:
    ImageRenderer(MainQueue& main, PreviewReports reports)
        : main_(main), reports_(std::move(reports)), worker_(main) {
        auto content = std::make_unique<PictureContent>();
        content_ = content.get();
        auto widget = std::make_unique<ZoomWidget>(
            std::move(content), ZoomWidget::Settings{{ZoomPlace::Fit::whole, 0, 8}, true});
        widget_ = widget.get();
        view_ = std::make_shared<WidgetView>(std::move(widget));
    }

    std::shared_ptr<View> view() override { return view_; }

    void load(const Url& file) override {
        file_ = file;
        view_->setAccessibleName(
            localizedFormat("Picture “%1$@”", displayName(file.lastPathComponent())));
        read();
    }

    void reload() override { read(); }

    std::optional<std::function<void(double)>> zoom() override {
        return [this](double factor) { widget_->zoomBy(factor); };
    }

private:
    void read() {
        worker_.cancel();
        const QSize view = widget_->size() * widget_->devicePixelRatioF();
        worker_.run([this, &main = main_, file = file_, view](PreviewToken& token) -> Job {
            const auto pyramid = std::make_shared<Pyramid>();
            bool isShown = false;
            const Failure failure = readDocument(file, token, [&](const std::string& path) {
                // All that fits into the view can be seen before all that there is has been read.
                if (const auto coarse = readCoarsePicture(path, view)) {
                    const Pyramid first{coarse->fullSize, {coarse->image}};
                    token.deliver(main, [this, first] { take(first, false, {}); });
                    isShown = true;
                }
                return decode(file, path, token, *pyramid);
            });
            return
                [this, pyramid, isShown, failure] { take(std::move(*pyramid), isShown, failure); };
        });
    }

    static Failure decode(const Url& file, const std::string& path, PreviewToken& token,
                          Pyramid& into) {
        Result<Picture> picture = readPicture(file, path, mostPicturePixels, token);
        if (!picture)
            return picture.error();
        into = buildPyramid(std::move(picture->image), picture->fullSize);
        return std::nullopt;
    }

    void take(Pyramid pyramid, bool isShown, const Failure& failure) {
        if (failure) {
            reports_.failed(*failure);
            return;
        }
        content_->set(std::move(pyramid));
        widget_->contentChanged();
        if (!isShown)
            reports_.shown();
    }

    MainQueue& main_;
    PreviewReports reports_;
    Url file_;
    PictureContent* content_ = nullptr;
    ZoomWidget* widget_ = nullptr;
    std::shared_ptr<View> view_;
    PreviewWorker worker_;
};

bool readsType(std::string_view identifier) {
    if (!TypeRegistry::conformsTo(identifier, types::image))
        return false;
    const std::string mime = TypeRegistry::mimeTypeForIdentifier(identifier);
    return QImageReader::supportedMimeTypes().contains(QByteArray::fromStdString(mime));
}

} // namespace

const PreviewKind imagePreview{
    &readsType, [](MainQueue& main, PreviewReports reports) -> std::unique_ptr<PreviewRenderer> {
        return std::make_unique<ImageRenderer>(main, std::move(reports));
    }};

} // namespace platform
