#pragma once

#include "platform/documents/preview/PreviewWorker.h"

#include <QImage>

#include <string>
#include <string_view>

namespace platform {

/// How a document of some kind becomes a picture. Blocks; not for the main thread.
struct ThumbnailDrawing {
    DocumentForm form = DocumentForm::file;
    /// A picture of about `edge` pixels on its longest side; an error for a document of which there
    /// is none. `path` may be read for as long as that takes.
    Result<QImage> (*draw)(const Url& file, const std::string& path, int edge, PreviewToken& token);
};

/// None for types without pictures.
const ThumbnailDrawing* thumbnailDrawingFor(std::string_view typeIdentifier);

/// The first lines of a text, on paper.
Result<QImage> drawFirstLines(const Url& file, const std::string& path, int edge,
                              PreviewToken& token);
/// The top of a text with structure, as its preview shows it; of a long one its first lines.
Result<QImage> drawMarkdownTop(const Url& file, const std::string& path, int edge,
                               PreviewToken& token);
Result<QImage> drawHtmlTop(const Url& file, const std::string& path, int edge, PreviewToken& token);

} // namespace platform
