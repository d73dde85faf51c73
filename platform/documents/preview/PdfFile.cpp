#include "platform/documents/preview/PdfFile.h"

#include "platform/base/Text.h"
#include "platform/documents/preview/PreviewWorker.h"

#include <QPainter>
#include <QPdfDocument>
#include <QString>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// Pages of one wrong number would take the memory of all others.
constexpr double largestPagePoints = 14400;

Error protectedDocument() {
    return makeErrorWithText(ErrorCode::unsupportedOperation,
                             localized("This document is protected by a password. It can be read "
                                       "in an application that asks for it."));
}

} // namespace

PdfFile::PdfFile() : document_(std::make_unique<QPdfDocument>()) {
}
PdfFile::~PdfFile() = default;

Failure PdfFile::open(const Url& file, const std::string& path) {
    switch (document_->load(QString::fromStdString(path))) {
    case QPdfDocument::Error::None:
        break;
    case QPdfDocument::Error::IncorrectPassword:
    case QPdfDocument::Error::UnsupportedSecurityScheme:
        return protectedDocument();
    default:
        return damagedDocument(file);
    }
    if (document_->pageCount() == 0)
        return damagedDocument(file);
    return std::nullopt;
}

std::size_t PdfFile::pageCount() const {
    return static_cast<std::size_t>(document_->pageCount());
}

std::vector<QSizeF> PdfFile::pageSizes(std::size_t from, std::size_t count) const {
    std::vector<QSizeF> sizes;
    const std::size_t end = std::min(pageCount(), from + count);
    for (std::size_t page = from; page < end; ++page) {
        const QSizeF size = document_->pagePointSize(static_cast<int>(page));
        sizes.push_back(size.isEmpty() ? QSizeF(595, 842)
                                       : size.boundedTo({largestPagePoints, largestPagePoints}));
    }
    return sizes;
}

QImage PdfFile::render(int page, int width) const {
    const QSizeF size = document_->pagePointSize(page);
    if (size.isEmpty() || width <= 0)
        return {};
    const int height =
        std::max(1, static_cast<int>(std::lround(width * size.height() / size.width())));
    const QImage drawn = document_->render(page, QSize(width, height));
    if (drawn.isNull())
        return {};
    QImage paper(drawn.size(), QImage::Format_RGB32);
    paper.fill(Qt::white);
    QPainter(&paper).drawImage(0, 0, drawn);
    return paper;
}

} // namespace platform
