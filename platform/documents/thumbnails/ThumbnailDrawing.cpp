#include "platform/documents/thumbnails/ThumbnailDrawing.h"

#include "platform/documents/preview/PdfFile.h"
#include "platform/documents/preview/PictureFile.h"
#include "platform/documents/preview/SyntaxLanguage.h"
#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"
#include "platform/launch/TypeRegistry.h"

#include <QFile>
#include <QImageReader>

#include <algorithm>
#include <cmath>
#include <fcntl.h>
#include <vector>

namespace platform {
namespace {

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

/// Folders at the top of a package that are looked into for its picture.
constexpr std::size_t mostFolders = 64;

/// A picture that the program that wrote the package put into it, for others to show: by its name.
bool isPackagePicture(const std::string& name) {
    const std::string lower = QString::fromStdString(name).toLower().toStdString();
    return (lower.starts_with("thumbnail.") || lower.starts_with("preview.")) &&
           isReadablePicture(TypeRegistry::identifierForFileName(lower));
}

/// A plain file of the package itself: no link to elsewhere, no pipe.
QImage readPart(const std::string& path, int edge) {
    const FileDescriptor file(::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK));
    QFile content;
    if (!file || !content.open(file.get(), QIODevice::ReadOnly))
        return {};
    return readPixels(content, static_cast<double>(edge) * edge);
}

/// In the folder itself; puts the folders in it into `inner`.
QImage pictureIn(const std::string& folder, int edge, std::vector<std::string>& inner) {
    const auto entries = FileManager::entries(folder);
    if (!entries)
        return {};
    for (const DirectoryEntry& entry : *entries) {
        const std::string path = folder + '/' + entry.name;
        if (entry.kind == FileKind::directory && inner.size() < mostFolders)
            inner.push_back(path);
        if (entry.kind != FileKind::file || !isPackagePicture(entry.name))
            continue;
        if (QImage image = readPart(path, edge); !image.isNull())
            return image;
    }
    return {};
}

Result<QImage> drawPackage(const Url& file, const std::string& path, int edge,
                           PreviewToken& token) {
    std::vector<std::string> folders;
    QImage image = pictureIn(path, edge, folders);
    std::sort(folders.begin(), folders.end());
    std::vector<std::string> deeper;
    for (const std::string& folder : folders) {
        if (!image.isNull() || token.isCancelled())
            break;
        image = pictureIn(folder, edge, deeper);
    }
    if (image.isNull())
        return makeError(ErrorCode::noSuchItem, file.lastPathComponent());
    return image;
}

constexpr ThumbnailDrawing pdfDrawing{DocumentForm::file, &drawFirstPage};
constexpr ThumbnailDrawing pictureDrawing{DocumentForm::file, &drawPicture};
constexpr ThumbnailDrawing packageDrawing{DocumentForm::package, &drawPackage};
constexpr ThumbnailDrawing markdownDrawing{DocumentForm::file, &drawMarkdownTop};
constexpr ThumbnailDrawing htmlDrawing{DocumentForm::file, &drawHtmlTop};
constexpr ThumbnailDrawing textDrawing{DocumentForm::file, &drawFirstLines};

} // namespace

const ThumbnailDrawing* thumbnailDrawingFor(std::string_view typeIdentifier) {
    const auto is = [typeIdentifier](std::string_view type) {
        return TypeRegistry::conformsTo(typeIdentifier, type);
    };
    if (is(types::package))
        return &packageDrawing;
    if (is(types::pdf))
        return &pdfDrawing;
    if (isReadablePicture(typeIdentifier))
        return &pictureDrawing;
    if (is(types::markdown))
        return &markdownDrawing;
    if (is(types::html))
        return &htmlDrawing;
    return is(types::text) || syntaxLanguageFor(typeIdentifier) ? &textDrawing : nullptr;
}

} // namespace platform
