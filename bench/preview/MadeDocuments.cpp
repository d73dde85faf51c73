#include "bench/preview/MadeDocuments.h"

#include <QBuffer>
#include <QImage>
#include <QImageWriter>
#include <QPainter>
#include <QPdfWriter>

#include <cmath>
#include <cstdint>

namespace {

constexpr QColor mark(200, 30, 30);
constexpr int jpegQuality = 90;

void drawChart(QPainter& painter, int page) {
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    for (int bar = 0; bar < 12; ++bar) {
        const int height = 20 + (page * 37 + bar * 53) % 110;
        painter.setBrush(QColor::fromHsv(bar * 30, 120, 200));
        painter.drawRect(QRectF(60 + bar * 36, 780 - height, 28, height));
    }
    painter.setPen(Qt::black);
    painter.drawLine(QPointF(50, 780), QPointF(500, 780));
}

void drawPage(QPainter& painter, int page) {
    QFont font = painter.font();
    font.setPixelSize(11);
    painter.setFont(font);
    for (int line = 0; line < 36; ++line)
        painter.drawText(QPointF(50, 120 + line * 14),
                         QStringLiteral("The quarter closed with a result above the plan; line %1 "
                                        "of page %2 says so as well.")
                             .arg(line + 1)
                             .arg(page + 1));
    drawChart(painter, page);
}

/// Even noise; the same in every run.
class Noise {
public:
    int next(int range) {
        state_ = state_ * 1664525U + 1013904223U;
        return static_cast<int>((state_ >> 16) % static_cast<std::uint32_t>(range));
    }

private:
    std::uint32_t state_ = 1;
};

/// Slow shades, edges of shapes, and the grain of a sensor.
void paintScene(QImage& image) {
    Noise grain;
    for (int y = 0; y < image.height(); ++y) {
        auto* const line = reinterpret_cast<QRgb*>(image.scanLine(y));
        for (int x = 0; x < image.width(); ++x) {
            const int leaf = ((x >> 5) * 73 ^ (y >> 5) * 151) & 31;
            const int light = (x * 80 / image.width()) + (y * 60 / image.height()) + leaf;
            const int noise = grain.next(13);
            line[x] = qRgb(40 + light / 2 + noise, 70 + light + noise, 50 + light / 3 + noise);
        }
    }
}

} // namespace

std::string madePdf(int pages, Cover cover) {
    QBuffer buffer;
    buffer.open(QIODevice::WriteOnly);
    QPdfWriter writer(&buffer);
    writer.setPageSize(QPageSize(QPageSize::A4));
    writer.setPageMargins({});
    writer.setResolution(72);
    QPainter painter(&writer);
    painter.fillRect(QRectF(0, markTop, writer.width(), markBottom - markTop), mark);
    if (cover == Cover::photograph) {
        QImage photo(2400, 1600, QImage::Format_RGB32);
        paintScene(photo);
        painter.drawImage(QRectF(50, 100, 495, 330), photo);
    }
    for (int page = 0; page < pages; ++page) {
        if (page > 0)
            writer.newPage();
        drawPage(painter, page);
    }
    painter.end();
    return buffer.data().toStdString();
}

std::string madePhoto(int width, int height) {
    QImage image(width, height, QImage::Format_RGB32);
    paintScene(image);
    QPainter painter(&image);
    painter.setBrush(mark);
    painter.drawEllipse(QPointF(width / 2.0, height / 2.0), height * 0.1, height * 0.1);
    painter.end();
    QBuffer buffer;
    buffer.open(QIODevice::WriteOnly);
    QImageWriter writer(&buffer, "jpeg");
    writer.setQuality(jpegQuality);
    writer.write(image);
    return buffer.data().toStdString();
}
