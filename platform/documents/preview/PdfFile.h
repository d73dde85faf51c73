#pragma once

#include "platform/base/Result.h"
#include "platform/base/Url.h"

#include <QImage>
#include <QSizeF>

#include <memory>
#include <string>
#include <vector>

class QPdfDocument;

namespace platform {

/// An open PDF. Made, used and destroyed on one queue.
class PdfFile {
public:
    PdfFile();
    ~PdfFile();

    Failure open(const Url& file, const std::string& path);
    std::size_t pageCount() const;
    /// Of so many pages from that one on (fewer at the end), in points. A page costs a tenth of a
    /// millisecond and 3 KB until the document goes.
    std::vector<QSizeF> pageSizes(std::size_t from, std::size_t count) const;
    /// The page on white, that many pixels wide.
    QImage render(int page, int width) const;
    /// The same of its top alone, so many pixels high at most.
    QImage renderTop(int page, int width, int height) const;

private:
    /// How many pixels high the page is; 0 for one without a size.
    int heightOf(int page, int width) const;

    std::unique_ptr<QPdfDocument> document_;
};

} // namespace platform
