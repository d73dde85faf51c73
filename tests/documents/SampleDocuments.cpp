#include "tests/documents/SampleDocuments.h"

#include <QBuffer>
#include <QImageWriter>
#include <QLinearGradient>
#include <QPainter>
#include <QPdfWriter>

namespace test {
namespace {

QImage landscape(int width, int height) {
    QImage image(width, height, QImage::Format_RGB32);
    QPainter painter(&image);
    QLinearGradient sky(0, 0, 0, height * 0.6);
    sky.setColorAt(0, QColor(70, 130, 200));
    sky.setColorAt(1, QColor(230, 220, 200));
    painter.fillRect(image.rect(), sky);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    painter.setBrush(QColor(250, 230, 120));
    painter.drawEllipse(QPointF(width * 0.75, height * 0.25), height * 0.08, height * 0.08);
    painter.setBrush(QColor(90, 140, 70));
    painter.drawEllipse(QPointF(width * 0.3, height * 1.1), width * 0.6, height * 0.5);
    painter.setBrush(QColor(60, 110, 60));
    painter.drawEllipse(QPointF(width * 0.8, height * 1.15), width * 0.6, height * 0.5);
    return image;
}

std::string encoded(const QImage& image, const char* format,
                    QImageIOHandler::Transformations transformation) {
    QBuffer buffer;
    buffer.open(QIODevice::WriteOnly);
    QImageWriter writer(&buffer, format);
    writer.setTransformation(transformation);
    writer.write(image);
    return buffer.data().toStdString();
}

} // namespace

std::string turnedPhoto(int width, int height) {
    const QImage lying = landscape(width, height).transformed(QTransform().rotate(-90));
    return encoded(lying, "jpeg", QImageIOHandler::TransformationRotate90);
}

std::string pngPicture(int width, int height) {
    return encoded(landscape(width, height), "png", QImageIOHandler::TransformationNone);
}

std::string pdfOfPages(int pages) {
    QBuffer buffer;
    buffer.open(QIODevice::WriteOnly);
    QPdfWriter writer(&buffer);
    writer.setPageSize(QPageSize(QPageSize::A4));
    writer.setResolution(72);
    QPainter painter(&writer);
    for (int page = 0; page < pages; ++page) {
        if (page > 0)
            writer.newPage();
        QFont font = painter.font();
        font.setPixelSize(28);
        painter.setFont(font);
        painter.drawText(QRectF(20, 20, 400, 60), QStringLiteral("Page %1").arg(page + 1));
        font.setPixelSize(12);
        painter.setFont(font);
        for (int line = 0; line < 40; ++line)
            painter.drawText(QPointF(20, 110 + line * 16),
                             QStringLiteral("The quarter closed with a result above the plan; "
                                            "line %1 says so as well.")
                                 .arg(line + 1));
    }
    painter.end();
    return buffer.data().toStdString();
}

std::string longText(int lines) {
    std::string text;
    for (int i = 1; i <= lines; ++i) {
        text += "Line " + std::to_string(i);
        if (i % 7 == 0)
            text += " goes on for a good while, so that it has to be wrapped, at least where the "
                    "window is as narrow as that of a phone";
        text += '\n';
    }
    return text;
}

std::string soundOf(int seconds) {
    constexpr std::uint32_t rate = 8000;
    const auto number = [](std::uint32_t value, int bytes) {
        std::string out;
        for (int i = 0; i < bytes; ++i)
            out += static_cast<char>(value >> (8 * i) & 0xFF);
        return out;
    };
    const auto chunk = [&](const char* name, const std::string& content) {
        return name + number(static_cast<std::uint32_t>(content.size()), 4) + content;
    };
    std::string samples;
    for (std::uint32_t i = 0; i < rate * static_cast<std::uint32_t>(seconds); ++i)
        samples += static_cast<char>(i % 16 < 8 ? 108 : 148);
    const std::string format = number(1, 2) + number(1, 2) + number(rate, 4) + number(rate, 4) +
                               number(1, 2) + number(8, 2);
    return chunk("RIFF",
                 "WAVE" + chunk("fmt ", format) +
                     chunk("LIST", "INFO" + chunk("INAM", "A low tone") + chunk("IART", "Nobody")) +
                     chunk("data", samples));
}

std::string filmOf(int width, int height, int pictures) {
    std::string film = "YUV4MPEG2 W" + std::to_string(width) + " H" + std::to_string(height) +
                       " F10:1 Ip A1:1 C420jpeg\n";
    const auto pixels = static_cast<std::size_t>(width * height);
    for (int i = 0; i < pictures; ++i)
        film += "FRAME\n" + std::string(pixels, '\x70') + std::string(pixels / 2, '\x40');
    return film;
}

std::string sampleProgram() {
    std::string text = "#include <string>\n\n/* Adds\n   things. */\nnamespace sums {\n\n";
    for (int i = 1; i < 40; ++i)
        text += "// The sum, and " + std::to_string(i) + ".\nint plus" + std::to_string(i) +
                "(int value) {\n    const char* const note = \"more\";\n    return value + " +
                std::to_string(i) + ";\n}\n\n";
    return text + "} // namespace sums\n";
}

std::string sampleTable() {
    std::string text = "Date,Account,Purpose,Amount\n";
    for (int i = 1; i < 400; ++i)
        text += "2026-" + std::to_string(10 + i % 3) + "-" + std::to_string(10 + i % 18) +
                (i % 2 ? ",Household,\"Groceries, and what else one needs for a week\","
                       : ",Savings,Interest,") +
                std::to_string(i * 37 % 900) + ".50\n";
    return text;
}

std::string sampleGuide() {
    return "# A short guide\n\nWith **bold**, *italic* and `code`, and a "
           "[link](https://example.org).\n\n## What to do\n\n- [x] read it\n- [ ] try it\n\n"
           "1. first\n2. then\n\n> Somebody said this, and it took more than one line.\n\n"
           "```\nfor (int i = 0; i < 3; ++i)\n    print(i);\n```\n\n"
           "| Name | Amount |\n|:-----|-------:|\n| Anna | 12.50 |\n| Bert | 3.00 |\n";
}

} // namespace test
