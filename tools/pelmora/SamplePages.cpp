#include "tools/pelmora/SamplePages.h"

#include <QBuffer>
#include <QFont>
#include <QMarginsF>
#include <QPageLayout>
#include <QPageSize>
#include <QPainter>
#include <QPdfWriter>

#include <algorithm>

namespace pelmora {
namespace {

constexpr int resolution = 96;

class Sheet {
public:
    Sheet(QPdfWriter& writer, QPainter& painter)
        : painter_(painter), width_(writer.width()), height_(writer.height()) {}

    void begin(const std::string& title, int number) {
        y_ = 0;
        painter_.setPen(QColor(QLatin1String("#7a7f87")));
        painter_.setFont(QFont(QLatin1String("Inter"), 8));
        painter_.drawText(QRect(0, height_ - 20, width_, 20), Qt::AlignCenter,
                          QString::number(number));
        painter_.drawText(QRect(0, 0, width_, 16), Qt::AlignRight, QString::fromStdString(title));
        y_ = 40;
    }

    void text(const std::string& words, int points, bool bold) {
        QFont font(QLatin1String("Inter"), points);
        font.setBold(bold);
        painter_.setFont(font);
        painter_.setPen(QColor(QLatin1String("#1d2430")));
        const QRect room(0, y_, width_, height_ - 40 - y_);
        QRect used;
        painter_.drawText(room, Qt::TextWordWrap, QString::fromStdString(words), &used);
        y_ = used.bottom() + points;
    }

    void figure(const std::vector<double>& values, const std::string& caption) {
        if (values.empty())
            return;
        y_ += 16;
        const int tall = std::min(200, height_ - y_ - 80);
        const double most = *std::max_element(values.begin(), values.end());
        const int step = width_ / static_cast<int>(values.size());
        for (std::size_t i = 0; i < values.size(); ++i) {
            const int bar = static_cast<int>(tall * values[i] / most);
            painter_.fillRect(static_cast<int>(i) * step + 4, y_ + tall - bar, step - 10, bar,
                              QColor::fromHsv(200 + static_cast<int>(i) * 6, 110, 170));
        }
        painter_.setPen(QColor(QLatin1String("#7a7f87")));
        painter_.drawLine(0, y_ + tall, width_, y_ + tall);
        y_ += tall + 8;
        text(caption, 8, false);
    }

private:
    QPainter& painter_;
    const int width_;
    const int height_;
    int y_ = 0;
};

} // namespace

std::string pdfBytes(const std::string& title, const std::vector<PageText>& pages) {
    QByteArray bytes;
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::WriteOnly);
    {
        QPdfWriter writer(&buffer);
        writer.setPageSize(QPageSize(QPageSize::A4));
        writer.setPageMargins(QMarginsF(22, 20, 22, 18), QPageLayout::Millimeter);
        writer.setResolution(resolution);
        writer.setTitle(QString::fromStdString(title));
        QPainter painter(&writer);
        Sheet sheet(writer, painter);
        for (std::size_t i = 0; i < pages.size(); ++i) {
            if (i > 0)
                writer.newPage();
            sheet.begin(title, static_cast<int>(i) + 1);
            if (i == 0)
                sheet.text(title, 22, true);
            sheet.text(pages[i].heading, 14, true);
            for (const std::string& paragraph : pages[i].paragraphs)
                sheet.text(paragraph, 10, false);
            sheet.figure(pages[i].figure, pages[i].caption);
        }
    }
    return bytes.toStdString();
}

} // namespace pelmora
