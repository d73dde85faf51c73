#include "platform/documents/preview/PictureFile.h"

#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/VectorPicture.h"

#include <QFile>
#include <QImageReader>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// Even to read one smaller, all of its pixels are decoded: these take about 15 seconds. The
/// largest that a camera or a scanner makes have half as many.
constexpr double mostDecodedPixels = 400e6;

/// A picture is read at an eighth of its width at least.
constexpr int mostParts = 8;
/// Smaller ones are read in less than 30 milliseconds as they are.
constexpr double fewestParted = 4e6;

double pixelsOf(QSize size) {
    return static_cast<double>(size.width()) * size.height();
}

bool isVectorFormat(const QByteArray& format) {
    return format == "svg" || format == "svgz";
}

/// Empty where the file does not fit into the limits; the reader then says why.
QImage readSmaller(QImageReader& reader, QSize size, double mostPixels) {
    const double pixels = pixelsOf(size);
    if (pixels > mostPixels) {
        const QSize smaller = size * std::sqrt(mostPixels / pixels);
        reader.setScaledSize(smaller.expandedTo({1, 1}));
    }
    return reader.read();
}

/// The content says what it is: a picture with a wrong extension still is one.
void setUp(QImageReader& reader) {
    reader.setDecideFormatFromContent(true);
    reader.setAutoTransform(true);
}

/// What the decoder refuses for the memory that it would take counts as too large, not as damaged.
bool isTooLarge(QSize size) {
    constexpr double mostBytesAPixel = 8;
    const double limit = QImageReader::allocationLimit() * 1024.0 * 1024.0;
    return pixelsOf(size) > mostDecodedPixels || pixelsOf(size) * mostBytesAPixel > limit;
}

} // namespace

Error tooLargeDocument(const Url& file) {
    return makeErrorWithText(ErrorCode::unsupportedOperation,
                             localizedFormat("“%1$@” is too large to be shown here.",
                                             displayName(file.lastPathComponent())));
}

Result<Picture> readPicture(const Url& file, const std::string& path, double mostPixels,
                            PreviewToken& token) {
    QFile content(QString::fromStdString(path));
    if (!content.open(QIODevice::ReadOnly))
        return damagedDocument(file, content.errorString().toStdString());
    QImageReader reader(&content);
    setUp(reader);
    if (isVectorFormat(reader.format()))
        return drawVectorPicture(file, content, mostPixels, token);
    QSize size = reader.size();
    if (pixelsOf(size) > mostDecodedPixels)
        return tooLargeDocument(file);
    QImage image = readSmaller(reader, size, mostPixels);
    if (image.isNull())
        return isTooLarge(size) ? tooLargeDocument(file)
                                : damagedDocument(file, reader.errorString().toStdString());
    if (reader.transformation().testFlag(QImageIOHandler::TransformationRotate90))
        size.transpose();
    if (size.isEmpty())
        size = image.size();
    return Picture{std::move(image), size};
}

std::optional<Picture> readCoarsePicture(const std::string& path, QSize view) {
    QImageReader reader(QString::fromStdString(path));
    setUp(reader);
    if (view.isEmpty() || reader.format() != "jpeg")
        return std::nullopt;
    const QSize stored = reader.size();
    const bool turned = reader.transformation().testFlag(QImageIOHandler::TransformationRotate90);
    const QSize upright = turned ? stored.transposed() : stored;
    const QSize seen = upright.scaled(view, Qt::KeepAspectRatio);
    // The decoder leaves out every second, fourth or eighth pixel at next to no cost.
    int parts = mostParts;
    while (parts > 1 && upright.width() < seen.width() * parts)
        parts /= 2;
    if (parts == 1 || pixelsOf(stored) < fewestParted || pixelsOf(stored) > mostDecodedPixels)
        return std::nullopt;
    reader.setScaledSize(
        {(stored.width() + parts - 1) / parts, (stored.height() + parts - 1) / parts});
    QImage image = reader.read();
    if (image.isNull())
        return std::nullopt;
    return Picture{std::move(image), upright};
}

QImage readPixels(QIODevice& device, double mostPixels) {
    QImageReader reader(&device);
    setUp(reader);
    const QSize size = reader.size();
    if (isVectorFormat(reader.format()) || size.isEmpty() || pixelsOf(size) > mostDecodedPixels)
        return {};
    return readSmaller(reader, size, mostPixels);
}

} // namespace platform
