#include "platform/documents/preview/RichDocument.h"

#include "platform/documents/preview/CleanHtml.h"
#include "platform/documents/preview/MarkdownText.h"
#include "platform/documents/preview/PageMetrics.h"
#include "platform/documents/preview/PictureShelf.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/RichStyle.h"
#include "platform/documents/preview/TextFile.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QAbstractTextDocumentLayout>
#include <QEventLoop>
#include <QPainter>
#include <QStringDecoder>
#include <QTextBlock>
#include <QTextDocument>
#include <QTextFrame>
#include <QTextTable>
#include <QUrl>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// A longer text takes seconds to lay out anew in another width; its source is shown instead.
constexpr std::uint64_t longestSource = 1024ULL * 1024;
/// About 85 letters: longer lines are hard to follow.
constexpr double widestTextColumn = 720;
constexpr double narrowestTextColumn = 120;
constexpr double sideMargin = Theme::phoneMargin;
constexpr double pageEdge = 20;

/// Loads nothing. An empty answer for a picture would let the toolkit look for a file of its name.
class SealedDocument final : public QTextDocument {
protected:
    QVariant loadResource(int type, const QUrl& /*name*/) override {
        if (type != ImageResource)
            return {};
        QImage nothing(1, 1, QImage::Format_ARGB32_Premultiplied);
        nothing.fill(Qt::transparent);
        return nothing;
    }
};

QString decoded(const TextFile& file, RichFormat format) {
    const std::string bytes =
        file.read(file.start(), static_cast<std::size_t>(file.size() - file.start()));
    const QByteArrayView view(bytes.data(), static_cast<qsizetype>(bytes.size()));
    constexpr qsizetype head = 1024;
    if (format == RichFormat::html && file.start() == 0 &&
        view.first(std::min(head, view.size())).toByteArray().toLower().contains("charset")) {
        QStringDecoder decoder = QStringDecoder::decoderForHtml(view);
        if (decoder.isValid())
            return decoder(view);
    }
    return file.decodeWhole(bytes);
}

std::string folderOf(const std::string& path) {
    return path.substr(0, path.rfind('/') + 1);
}

/// No picture is wider than the column.
void fitPictures(QTextDocument& document, double width) {
    QTextCursor cursor(&document);
    for (QTextBlock block = document.begin(); block.isValid(); block = block.next())
        for (auto at = block.begin(); !at.atEnd(); ++at) {
            const QTextFragment fragment = at.fragment();
            QTextImageFormat format = fragment.charFormat().toImageFormat();
            if (!format.isValid() || format.width() <= width)
                continue;
            format.setHeight(std::max(1.0, format.height() * width / format.width()));
            format.setWidth(width);
            cursor.setPosition(fragment.position());
            cursor.setPosition(fragment.position() + fragment.length(), QTextCursor::KeepAnchor);
            cursor.setCharFormat(format);
        }
}

/// Where in its block one is, as a share of the block's height.
struct Spot {
    int position = 0;
    double share = 0;
};

Spot spotAt(const QTextDocument& document, double y) {
    const int position = document.documentLayout()->hitTest({1, y}, Qt::FuzzyHit);
    const QTextBlock block = document.findBlock(std::max(0, position));
    const QRectF box = document.documentLayout()->blockBoundingRect(block);
    const double share = box.height() > 0 ? (y - box.top()) / box.height() : 0;
    // A little beyond it on either side is the gap to the next.
    return {block.position(), std::clamp(share, -1.0, 2.0)};
}

double topOf(const QTextDocument& document, const Spot& spot) {
    const QRectF box =
        document.documentLayout()->blockBoundingRect(document.findBlock(spot.position));
    return box.top() + box.height() * spot.share;
}

} // namespace

RichDocument::RichDocument() : loop_(std::make_unique<QEventLoop>()) {
}

RichDocument::~RichDocument() = default;

Result<bool> RichDocument::read(const Url& file, const std::string& path, RichFormat format,
                                PreviewToken& token) {
    read_ = false;
    const Result<TextFile> text = TextFile::open(file, path);
    if (!text)
        return text.error();
    if (text->size() > longestSource)
        return false;
    QString html = decoded(*text, format);
    if (format == RichFormat::markdown) {
        const auto made = htmlOfMarkdown(html.toStdString(), [&] { return token.isCancelled(); });
        if (!made)
            return false;
        html = QString::fromStdString(*made);
    }
    PictureShelf shelf(folderOf(path), token);
    auto clean = cleanHtml(html, [&](const QString& address) { return shelf.find(address); });
    if (!clean)
        return false;
    html_ = std::move(*clean);
    pictures_ = shelf.take();
    read_ = true;
    return true;
}

double RichDocument::columnWidth() const {
    return std::clamp(std::floor(shape_.viewWidth - 2 * sideMargin), narrowestTextColumn, widestTextColumn);
}

QPointF RichDocument::corner() const {
    return {std::max(sideMargin, std::floor((shape_.viewWidth - columnWidth()) / 2)), pageEdge};
}

double RichDocument::layOut(const Shape& shape, double top) {
    const bool scrolled = document_ && top > pageEdge;
    const Spot spot = scrolled ? spotAt(*document_, top - pageEdge) : Spot();
    shape_ = shape;
    document_ = std::make_unique<SealedDocument>();
    document_->setUndoRedoEnabled(false);
    document_->setDocumentMargin(0);
    QFont font = toQt(Font::preferred(TextStyle::subheadline));
    font.setPixelSize(std::max(6, richLetterSize(TextStyle::subheadline, shape.scale)));
    document_->setDefaultFont(font);
    document_->setDefaultStyleSheet(richStyleSheet(shape.scale));
    for (auto picture = pictures_.begin(); picture != pictures_.end(); ++picture)
        document_->addResource(QTextDocument::ImageResource, QUrl(picture.key()), picture.value());
    document_->setHtml(html_);
    fitPictures(*document_, columnWidth());
    document_->setTextWidth(columnWidth());
    document_->documentLayout()->documentSize(); // lays out to the end
    return scrolled ? topOf(*document_, spot) + pageEdge : top;
}

QSizeF RichDocument::pageSize() const {
    // A wide table reaches beyond the column.
    const QSizeF size = document_->documentLayout()->documentSize();
    return {std::max(shape_.viewWidth, std::ceil(corner().x() + size.width())),
            std::ceil(pageEdge + size.height() + pageMetrics::edgeBelow)};
}

QString RichDocument::plainText() const {
    return document_ ? document_->toPlainText() : QString();
}

QImage RichDocument::draw(double top, double height, int width) const {
    const double scale = width / pageSize().width();
    QImage image(width, std::max(1, static_cast<int>(std::lround(height * scale))),
                 QImage::Format_RGB32);
    image.fill(toQt(Theme::page));
    QPainter painter(&image);
    painter.scale(scale, scale);
    painter.translate(corner() - QPointF(0, top));
    QAbstractTextDocumentLayout::PaintContext context;
    context.palette.setColor(QPalette::Text, toQt(Theme::text));
    context.palette.setColor(QPalette::Link, toQt(Theme::accent));
    context.clip = QRectF(-corner().x(), top - corner().y(), pageSize().width(), height);
    document_->documentLayout()->draw(&painter, context);
    return image;
}

QString RichDocument::linkAt(QPointF place) const {
    return document_ ? document_->documentLayout()->anchorAt(place - corner()) : QString();
}

std::optional<double> RichDocument::topOfAnchor(const QString& name) const {
    for (QTextBlock block = document_->begin(); block.isValid(); block = block.next())
        for (auto at = block.begin(); !at.atEnd(); ++at)
            if (at.fragment().charFormat().anchorNames().contains(name))
                return document_->documentLayout()->blockBoundingRect(block).top();
    return std::nullopt;
}

} // namespace platform
