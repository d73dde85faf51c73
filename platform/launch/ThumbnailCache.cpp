#include "platform/launch/ThumbnailCache.h"

#include "platform/base/Runtime.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"
#include "platform/launch/ThumbnailMarks.h"

#include <QCryptographicHash>

#include <algorithm>
#include <cerrno>
#include <ranges>
#include <sys/stat.h>

namespace platform {
namespace {

/// Pictures that this program could not make. The number rises when it learns to make more.
constexpr std::string_view failureFolder = "fail/tavrin-1";
/// Twice the pixels of the largest picture, unpacked.
constexpr std::uint64_t longestFile = 2ULL * 1024 * 1024 * 4;
constexpr std::uint32_t privateFile = 0600;
constexpr mode_t privateFolder = 0700;

std::string_view folderName(ThumbnailSize size) {
    switch (size) {
    case ThumbnailSize::normal:
        return "normal";
    case ThumbnailSize::large:
        return "large";
    case ThumbnailSize::xLarge:
        return "x-large";
    case ThumbnailSize::xxLarge:
        return "xx-large";
    }
    return "normal";
}

int makePrivateFolder(const std::string& path) {
    return ::mkdir(path.c_str(), privateFolder) == 0 || errno == EEXIST ? 0 : errno;
}

/// Makes `root` and each folder of `below` in it for the user alone.
Failure makeFolders(const std::string& root, std::string_view below) {
    if (const Failure failure = FileManager::createDirectory(Url::file(folderOf(root), true), true))
        return failure;
    int number = makePrivateFolder(root);
    for (std::size_t end = 0; number == 0 && end < below.size();) {
        end = std::min(below.find('/', end + 1), below.size());
        number = makePrivateFolder(root + '/' + std::string(below.substr(0, end)));
    }
    return number == 0 ? std::nullopt : Failure(writeError(number, root));
}

} // namespace

ThumbnailSize thumbnailSizeFor(int pixels) {
    for (const ThumbnailSize size : thumbnailSizes)
        if (static_cast<int>(size) >= pixels)
            return size;
    return thumbnailSizes.back();
}

ThumbnailCache::ThumbnailCache(std::string_view cacheFolder)
    : root_(std::string(cacheFolder) + "/thumbnails") {
}

ThumbnailCache ThumbnailCache::current() {
    return ThumbnailCache(Runtime::current().folders.cache);
}

std::string ThumbnailCache::uriOf(const Url& document) {
    // What the desk's programs keep unescaped; another spelling would be another picture.
    return "file://" + percentEncoded(document.path(), "/!$&'()*+,=:@");
}

std::string ThumbnailCache::dateOf(Date modified) {
    return std::to_string(modified.wholeSeconds());
}

bool ThumbnailCache::contains(const Url& document) const {
    return document.path().starts_with(root_ + '/');
}

std::string ThumbnailCache::pathOf(const Url& document, std::string_view folder) const {
    const QByteArray name = QCryptographicHash::hash(QByteArray::fromStdString(uriOf(document)),
                                                     QCryptographicHash::Md5)
                                .toHex();
    return root_ + '/' + std::string(folder) + '/' + name.toStdString() + ".png";
}

std::optional<Bytes> ThumbnailCache::read(const Url& document, Date modified,
                                          std::string_view folder, int longestEdge) const {
    Result<Bytes> png = FileManager::contents(Url::file(pathOf(document, folder)), longestFile);
    if (!png)
        return std::nullopt;
    const std::optional<ThumbnailMarks> marks = readThumbnailMarks(*png);
    if (!marks || marks->uri != uriOf(document) || marks->date != dateOf(modified))
        return std::nullopt;
    if (std::min(marks->width, marks->height) <= 0 ||
        std::max(marks->width, marks->height) > longestEdge)
        return std::nullopt;
    return *std::move(png);
}

std::optional<Bytes> ThumbnailCache::find(const Url& document, Date modified,
                                          ThumbnailSize size) const {
    return read(document, modified, folderName(size), static_cast<int>(size));
}

std::optional<Bytes> ThumbnailCache::findLargest(const Url& document, Date modified) const {
    for (const ThumbnailSize size : std::views::reverse(thumbnailSizes))
        if (std::optional<Bytes> png = find(document, modified, size))
            return png;
    return std::nullopt;
}

bool ThumbnailCache::knowsFailure(const Url& document, Date modified) const {
    return read(document, modified, failureFolder, 1).has_value();
}

Failure ThumbnailCache::write(const Url& document, std::string_view folder,
                              const Bytes& png) const {
    if (const Failure failure = makeFolders(root_, folder))
        return failure;
    return FileManager::writeAtomically(Url::file(pathOf(document, folder)),
                                        {reinterpret_cast<const char*>(png.data()), png.size()},
                                        privateFile, Durable::no);
}

Failure ThumbnailCache::store(const Url& document, ThumbnailSize size, const Bytes& png) const {
    return write(document, folderName(size), png);
}

Failure ThumbnailCache::storeFailure(const Url& document, const Bytes& png) const {
    return write(document, failureFolder, png);
}

} // namespace platform
