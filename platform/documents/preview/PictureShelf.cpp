#include "platform/documents/preview/PictureShelf.h"

#include "platform/documents/preview/PictureFile.h"
#include "platform/files/FileDescriptor.h"

#include <QBuffer>
#include <QFile>
#include <QUrl>

#include <fcntl.h>
#include <sys/stat.h>

namespace platform {
namespace {

/// Of a picture's file beside the text.
constexpr off_t longestPicture = 16LL * 1024 * 1024;
/// Of all pictures of a text together; 64 MB. None needs more than twice a wide column.
constexpr double mostPixelsTogether = 16e6;
constexpr double mostPixelsEach = 2e6;
/// Each is decoded, however small it is drawn.
constexpr qsizetype mostPictures = 200;

QImage written(const QString& address) {
    const qsizetype comma = address.indexOf(u',');
    if (comma < 0 || !QStringView(address).first(comma).endsWith(QLatin1StringView("base64")))
        return {};
    QByteArray bytes = QByteArray::fromBase64(address.sliced(comma + 1).toLatin1());
    QBuffer buffer(&bytes);
    return buffer.open(QIODevice::ReadOnly) ? readPixels(buffer, mostPixelsEach) : QImage();
}

} // namespace

std::optional<InlinePicture> PictureShelf::find(const QString& address) {
    if (const auto known = known_.constFind(address); known != known_.constEnd())
        return *known;
    std::optional<InlinePicture> found;
    if (known_.size() < mostPictures && !token_.isCancelled())
        found = read(address);
    known_.insert(address, found);
    return found;
}

std::optional<InlinePicture> PictureShelf::read(const QString& address) {
    QImage image = address.startsWith(QLatin1StringView("data:image/"), Qt::CaseInsensitive)
                       ? written(address)
                       : beside(address);
    const double pixels = static_cast<double>(image.width()) * image.height();
    if (image.isNull() || pixels + pixels_ > mostPixelsTogether)
        return std::nullopt;
    pixels_ += pixels;
    const QString name = QStringLiteral("picture-%1").arg(images_.size());
    const QSize size = image.size();
    images_.insert(name, std::move(image));
    return InlinePicture{name, size};
}

/// A plain file of the folder itself: no link to elsewhere, no pipe, no device.
QImage PictureShelf::beside(const QString& address) const {
    const QUrl url(address);
    QString name = url.path(QUrl::FullyDecoded);
    if (name.startsWith(QLatin1StringView("./")))
        name.remove(0, 2);
    if (!url.isRelative() || !url.host().isEmpty() || name.isEmpty() || name.contains(u'/') ||
        name.contains(QChar(0)))
        return {};
    const std::string path = folder_ + name.toStdString();
    const FileDescriptor file(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK));
    struct stat status {};
    if (!file || ::fstat(file.get(), &status) != 0 || !S_ISREG(status.st_mode) ||
        status.st_size > longestPicture)
        return {};
    QFile content;
    if (!content.open(file.get(), QIODevice::ReadOnly))
        return {};
    return readPixels(content, mostPixelsEach);
}

} // namespace platform
