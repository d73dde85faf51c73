#include "platform/documents/preview/PdfFile.h"

#include "platform/base/Text.h"
#include "platform/documents/preview/PreviewWorker.h"

#include <QPdfDocument>
#include <QPdfDocumentRenderOptions>
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

/// In place: what is not covered becomes white, and nothing shines through any more.
QImage onWhite(QImage drawn) {
    if (drawn.format() != QImage::Format_ARGB32)
        drawn = std::move(drawn).convertToFormat(QImage::Format_ARGB32);
    for (int y = 0; y < drawn.height(); ++y) {
        auto* const line = reinterpret_cast<QRgb*>(drawn.scanLine(y));
        for (int x = 0; x < drawn.width(); ++x) {
            const QRgb pixel = line[x];
            const int alpha = qAlpha(pixel);
            if (alpha == 0) {
                line[x] = 0xFFFFFFFF;
            } else if (alpha != 255) {
                const int paper = 255 * (255 - alpha) + 127;
                line[x] =
                    qRgb((qRed(pixel) * alpha + paper) / 255, (qGreen(pixel) * alpha + paper) / 255,
                         (qBlue(pixel) * alpha + paper) / 255);
            }
        }
    }
    drawn.reinterpretAsFormat(QImage::Format_RGB32);
    return drawn;
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

int PdfFile::heightOf(int page, int width) const {
    const QSizeF size = document_->pagePointSize(page);
    if (size.isEmpty() || width <= 0)
        return 0;
    return std::max(1, static_cast<int>(std::lround(width * size.height() / size.width())));
}

QImage PdfFile::render(int page, int width) const {
    const int height = heightOf(page, width);
    return height > 0 ? onWhite(document_->render(page, QSize(width, height))) : QImage();
}

QImage PdfFile::renderTop(int page, int width, int height) const {
    const int whole = heightOf(page, width);
    if (height >= whole)
        return render(page, width);
    QPdfDocumentRenderOptions options;
    options.setScaledSize({width, whole});
    // It counts from the first pixel to the last: one more is one for one.
    options.setScaledClipRect({0, 0, width + 1, height + 1});
    return onWhite(document_->render(page, QSize(width, height), options));
}

} // namespace platform
