#include "platform/documents/preview/RichDocument.h"
#include "platform/documents/preview/TextFile.h"
#include "platform/documents/thumbnails/ThumbnailDrawing.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QPainter>
#include <QTextLayout>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// The paper, in points: small, so that its letters can be made out in a small picture.
constexpr QSizeF paper(360, 509);
constexpr double paperMargin = 20;
constexpr int paperLetters = 13;
/// Of structured texts, which are laid out to their end; in points.
constexpr double richWidth = 480;
constexpr std::uint64_t longestRich = 128UL * 1024;

QImage emptyPaper(int edge) {
    const QSizeF fitting = paper.scaled(edge, edge, Qt::KeepAspectRatio);
    QImage image(std::max(1, static_cast<int>(std::lround(fitting.width()))),
                 std::max(1, static_cast<int>(std::lround(fitting.height()))),
                 QImage::Format_RGB32);
    image.fill(Qt::white);
    return image;
}

/// Answers the height of the line.
double drawPaperLine(QPainter& painter, const QString& text, const QFont& font, double y) {
    QTextLayout layout(text, font);
    QTextOption option;
    option.setWrapMode(QTextOption::WrapAtWordBoundaryOrAnywhere);
    layout.setTextOption(option);
    layout.beginLayout();
    double height = 0;
    while (y + height < paper.height() - paperMargin) {
        QTextLine line = layout.createLine();
        if (!line.isValid())
            break;
        line.setLineWidth(paper.width() - 2 * paperMargin);
        line.setPosition({0, height});
        height += line.height();
    }
    layout.endLayout();
    layout.draw(&painter, {paperMargin, y});
    return height;
}

Result<QImage> drawRichTop(const Url& file, const std::string& path, int edge, PreviewToken& token,
                           RichFormat format) {
    const Result<TextFile> text = TextFile::open(file, path);
    if (!text)
        return text.error();
    RichDocument document;
    const Result<bool> read =
        text->size() > longestRich ? false : document.read(file, path, format, token);
    if (!read)
        return read.error();
    if (!*read)
        return drawFirstLines(file, path, edge, token);
    document.layOut({richWidth, 1}, 0);
    QImage image = emptyPaper(edge);
    const QSizeF page = document.pageSize();
    const double shown = std::min(page.height(), page.width() * paper.height() / paper.width());
    QPainter(&image).drawImage(0, 0, document.draw(0, shown, image.width()));
    return image;
}

} // namespace

Result<QImage> drawFirstLines(const Url& file, const std::string& path, int edge,
                              PreviewToken& /*token*/) {
    const Result<TextFile> text = TextFile::open(file, path);
    if (!text)
        return text.error();
    QImage image = emptyPaper(edge);
    QPainter painter(&image);
    painter.setRenderHint(QPainter::TextAntialiasing);
    painter.scale(image.width() / paper.width(), image.width() / paper.width());
    painter.setPen(toQt(Theme::text));
    QFont font = toQt(Font::preferred(TextStyle::footnote));
    font.setPixelSize(paperLetters);
    double y = paperMargin;
    for (const TextLine& line : text->linesFrom(text->start())) {
        if (y >= paper.height() - paperMargin)
            break;
        y += drawPaperLine(painter, line.text, font, y);
    }
    painter.end();
    return image;
}

Result<QImage> drawMarkdownTop(const Url& file, const std::string& path, int edge,
                               PreviewToken& token) {
    return drawRichTop(file, path, edge, token, RichFormat::markdown);
}

Result<QImage> drawHtmlTop(const Url& file, const std::string& path, int edge,
                           PreviewToken& token) {
    return drawRichTop(file, path, edge, token, RichFormat::html);
}

} // namespace platform
