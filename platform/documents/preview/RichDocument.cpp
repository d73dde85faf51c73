#include "platform/documents/preview/RichDocument.h"

#include "platform/documents/preview/CleanHtml.h"
#include "platform/documents/preview/MarkdownText.h"
#include "platform/documents/preview/PageMetrics.h"
#include "platform/documents/preview/PictureFile.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/preview/TextFile.h"
#include "platform/files/FileDescriptor.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QAbstractTextDocumentLayout>
#include <QBuffer>
#include <QEventLoop>
#include <QFile>
#include <QPainter>
#include <QStringDecoder>
#include <QTextBlock>
#include <QTextDocument>
#include <QTextFrame>
#include <QTextTable>
#include <QUrl>

#include <algorithm>
#include <cmath>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace platform {
namespace {

/// A longer text takes seconds to lay out anew in another width; its source is shown instead.
constexpr std::uint64_t longestSource = 1024ULL * 1024;
/// Of a picture's file beside the text.
constexpr off_t longestPicture = 16LL * 1024 * 1024;
/// Of all pictures of a text together; 64 MB. None needs more than twice a wide column.
constexpr double mostPixelsTogether = 16e6;
constexpr double mostPixelsEach = 2e6;
/// Each is decoded, however small it is drawn.
constexpr qsizetype mostPictures = 200;
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

/// Reads the pictures of a text, each once.
class PictureShelf {
public:
    PictureShelf(std::string folder, const PreviewToken& token)
        : folder_(std::move(folder)), token_(token) {}

    std::optional<InlinePicture> find(const QString& address) {
        if (const auto known = known_.constFind(address); known != known_.constEnd())
            return *known;
        std::optional<InlinePicture> found;
        if (known_.size() < mostPictures && !token_.isCancelled())
            found = read(address);
        known_.insert(address, found);
        return found;
    }
    QHash<QString, QImage> take() { return std::move(images_); }

private:
    std::optional<InlinePicture> read(const QString& address) {
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

    static QImage written(const QString& address) {
        const qsizetype comma = address.indexOf(u',');
        if (comma < 0 || !QStringView(address).first(comma).endsWith(QLatin1StringView("base64")))
            return {};
        QByteArray bytes = QByteArray::fromBase64(address.sliced(comma + 1).toLatin1());
        QBuffer buffer(&bytes);
        return buffer.open(QIODevice::ReadOnly) ? readPixels(buffer, mostPixelsEach) : QImage();
    }

    /// A plain file of the folder itself: no link to elsewhere, no pipe, no device.
    QImage beside(const QString& address) const {
        const QUrl url(address);
        QString name = url.path(QUrl::FullyDecoded);
        if (name.startsWith(QLatin1StringView("./")))
            name.remove(0, 2);
        if (!url.isRelative() || !url.host().isEmpty() || name.isEmpty() || name.contains(u'/') ||
            name.contains(QChar(0)))
            return {};
        const std::string path = folder_ + name.toStdString();
        const FileDescriptor file(
            ::open(path.c_str(), O_RDONLY | O_CLOEXEC | O_NOFOLLOW | O_NONBLOCK));
        struct stat status {};
        if (!file || ::fstat(file.get(), &status) != 0 || !S_ISREG(status.st_mode) ||
            status.st_size > longestPicture)
            return {};
        QFile content;
        if (!content.open(file.get(), QIODevice::ReadOnly))
            return {};
        return readPixels(content, mostPixelsEach);
    }

    const std::string folder_;
    const PreviewToken& token_;
    QHash<QString, std::optional<InlinePicture>> known_;
    QHash<QString, QImage> images_;
    double pixels_ = 0;
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

int sizeOf(TextStyle style, double scale) {
    return static_cast<int>(std::lround(Font::preferred(style).pointSize() * scale));
}

/// Quiet and roomy; sizes in pixels of the letters' own scale.
QString styleSheet(double scale) {
    const auto size = [scale](TextStyle style, double factor = 1) {
        return sizeOf(style, scale * factor);
    };
    return QStringLiteral(
               "body{color:%1} p,li,dd,dt{line-height:135%} "
               "p{margin-top:0;margin-bottom:%2px}"
               "h1{font-size:%3px;font-weight:600;margin-top:%2px;margin-bottom:%2px}"
               "h2{font-size:%4px;font-weight:600;margin-top:%5px;margin-bottom:%2px}"
               "h3{font-size:%6px;font-weight:600;margin-top:%5px;margin-bottom:%7px}"
               "h4,h5,h6{font-size:%8px;font-weight:600;margin-top:%5px;margin-bottom:%7px}"
               "ul,ol{margin-top:0;margin-bottom:%2px} li{margin-bottom:%7px}"
               "a{color:%9;text-decoration:none}")
               .arg(toQt(Theme::text).name())
               .arg(size(TextStyle::body, 0.65))
               .arg(size(TextStyle::title2, 1.1))
               .arg(size(TextStyle::title2, 0.9))
               .arg(size(TextStyle::body, 1.2))
               .arg(size(TextStyle::headline, 1.05))
               .arg(size(TextStyle::body, 0.3))
               .arg(size(TextStyle::subheadline))
               .arg(toQt(Theme::accent).name()) +
           QStringLiteral("code{font-family:monospace;font-size:%1px;background-color:%2}"
                          "pre{font-family:monospace;font-size:%1px;white-space:pre-wrap;"
                          "line-height:130%;margin-top:0;margin-bottom:0}"
                          "blockquote{color:%3;margin-left:%4px;margin-right:%4px;"
                          "margin-top:0;margin-bottom:0}"
                          "th{font-weight:600;background-color:%2}"
                          "table{margin-top:4px;margin-bottom:12px}"
                          "table.grid{border-collapse:collapse;border-color:%5;border-style:solid}"
                          "table.code{background-color:%2;border-style:none}")
               .arg(size(TextStyle::footnote))
               .arg(toQt(Theme::bar).name(), toQt(Theme::secondaryText).name())
               .arg(size(TextStyle::body))
               .arg(toQt(Theme::hairline).name());
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
    font.setPixelSize(std::max(6, sizeOf(TextStyle::subheadline, shape.scale)));
    document_->setDefaultFont(font);
    document_->setDefaultStyleSheet(styleSheet(shape.scale));
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
