#include "tools/pelmora/SamplePictures.h"

#include <QBuffer>
#include <QImage>
#include <QLinearGradient>
#include <QPainter>
#include <QPainterPath>

#include <array>
#include <cmath>
#include <random>

namespace pelmora {
namespace {

struct Palette {
    const char* top;
    const char* horizon;
    const char* sun;
    const char* far;
    const char* near;
};

constexpr std::array<Palette, 5> palettes{{
    {"#20344f", "#f2a65a", "#ffe2a8", "#5b5f86", "#1d2436"},
    {"#3d7fc0", "#dcecf7", "#fff8dc", "#8fb0a9", "#2f5d4a"},
    {"#2b1b4d", "#e86a7a", "#ffd0a0", "#6b4a86", "#231436"},
    {"#6fa8c9", "#f7ead2", "#ffffff", "#b7a58f", "#5a4632"},
    {"#0f2f3f", "#7fc8b8", "#f3fff0", "#3f7f86", "#0c2a33"},
}};

QColor mixed(const QColor& a, const QColor& b, double part) {
    const auto blend = [part](int x, int y) { return static_cast<int>(x + (y - x) * part); };
    return {blend(a.red(), b.red()), blend(a.green(), b.green()), blend(a.blue(), b.blue())};
}

/// A ridge as a sum of waves, from the left edge to the right and around the bottom.
QPainterPath ridge(std::mt19937& random, double level, double height, int width, int bottom) {
    std::uniform_real_distribution<double> phase(0, 6.283);
    std::array<double, 5> phases{};
    for (double& each : phases)
        each = phase(random);
    QPainterPath path(QPointF(0, bottom));
    for (int x = 0; x <= width; x += 4) {
        double y = 0;
        for (std::size_t i = 0; i < phases.size(); ++i) {
            const double frequency = std::pow(2.0, static_cast<double>(i));
            y += std::sin(x * 6.283 * frequency / width + phases[i]) / frequency;
        }
        path.lineTo(x, level - y * height / 2);
    }
    path.lineTo(width, bottom);
    path.closeSubpath();
    return path;
}

void drawWater(QPainter& painter, std::mt19937& random, const Palette& palette, int width,
               int height, int shore) {
    QLinearGradient water(0, shore, 0, height);
    water.setColorAt(0, mixed(QColor(QLatin1String(palette.horizon)),
                              QColor(QLatin1String(palette.near)), 0.35));
    water.setColorAt(1, QColor(QLatin1String(palette.near)));
    painter.fillRect(0, shore, width, height - shore, water);
    std::uniform_real_distribution<double> place(0, 1);
    QColor glint(QLatin1String(palette.sun));
    for (int i = 0; i < 160; ++i) {
        const double depth = place(random);
        glint.setAlphaF(static_cast<float>(0.28 * (1 - depth)));
        const double length = (12 + 50 * depth) * width / 1600;
        const double x = width * (0.5 + (place(random) - 0.5) * (0.25 + depth * 0.6));
        painter.fillRect(QRectF(x, shore + depth * (height - shore), length, 1 + 2 * depth), glint);
    }
}

std::uint32_t crcOf(std::string_view bytes) {
    std::uint32_t crc = 0xFFFFFFFFU;
    for (const char c : bytes) {
        crc ^= static_cast<unsigned char>(c);
        for (int bit = 0; bit < 8; ++bit)
            crc = crc >> 1U ^ ((crc & 1U) ? 0xEDB88320U : 0U);
    }
    return ~crc;
}

std::string bigEndian(std::uint32_t number) {
    std::string bytes;
    for (int shift = 24; shift >= 0; shift -= 8)
        bytes.push_back(static_cast<char>(number >> static_cast<unsigned>(shift) & 0xFFU));
    return bytes;
}

std::string bytesOf(const QImage& image, const char* format, int quality) {
    QByteArray bytes;
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::WriteOnly);
    image.save(&buffer, format, quality);
    return bytes.toStdString();
}

} // namespace

QImage landscape(unsigned seed, int width, int height) {
    std::mt19937 random(seed);
    const Palette& palette = palettes[seed % palettes.size()];
    QImage image(width, height, QImage::Format_RGB32);
    QPainter painter(&image);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    const int shore = height * 68 / 100;
    QLinearGradient sky(0, 0, 0, shore);
    sky.setColorAt(0, QColor(QLatin1String(palette.top)));
    sky.setColorAt(1, QColor(QLatin1String(palette.horizon)));
    painter.fillRect(0, 0, width, shore, sky);
    const double radius = height * 0.07;
    const QPointF sun(width * (0.3 + 0.4 * (seed % 7) / 6.0), height * 0.36);
    for (int halo = 5; halo >= 0; --halo) {
        QColor light(QLatin1String(palette.sun));
        light.setAlphaF(halo == 0 ? 1.0F : 0.07F);
        painter.setBrush(light);
        painter.drawEllipse(sun, radius * (1 + halo * 0.5), radius * (1 + halo * 0.5));
    }
    constexpr int ridges = 4;
    for (int i = 0; i < ridges; ++i) {
        const double depth = static_cast<double>(i) / (ridges - 1);
        painter.setBrush(
            mixed(QColor(QLatin1String(palette.far)), QColor(QLatin1String(palette.near)), depth));
        painter.drawPath(
            ridge(random, height * (0.46 + 0.16 * depth), height * 0.16, width, shore));
    }
    drawWater(painter, random, palette, width, height, shore);
    return image;
}

QImage pattern(unsigned seed, int width, int height) {
    std::mt19937 random(seed);
    QImage image(width, height, QImage::Format_RGB32);
    image.fill(QColor(QLatin1String("#f6f1e7")));
    QPainter painter(&image);
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(Qt::NoPen);
    const int cell = width / 8;
    for (int row = 0; row * cell < height; ++row)
        for (int column = 0; column < 8; ++column) {
            const Palette& palette = palettes[random() % palettes.size()];
            const QRect square(column * cell, row * cell, cell, cell);
            painter.fillRect(square,
                             QColor(QLatin1String(random() % 2 ? palette.horizon : palette.far)));
            painter.setBrush(QColor(QLatin1String(palette.top)));
            painter.drawPie(square, static_cast<int>(random() % 4) * 90 * 16, 90 * 16);
            painter.setBrush(QColor(QLatin1String(palette.sun)));
            painter.drawEllipse(QRectF(square).center(), cell * 0.18, cell * 0.18);
        }
    return image;
}

std::string pngBytes(const QImage& image) {
    return bytesOf(image, "PNG", -1);
}

std::string jpegBytes(const QImage& image) {
    return bytesOf(image, "JPEG", 88);
}

std::string pngOfSize(const QImage& image, std::uint64_t size) {
    std::string bytes = pngBytes(image);
    constexpr std::size_t chunkFrame = 12; // length, kind, checksum
    constexpr std::size_t endChunk = 12;
    const std::string keyword = std::string("Comment") + '\0';
    const std::uint64_t room = size - bytes.size() - chunkFrame;
    if (size < bytes.size() + chunkFrame + keyword.size())
        return {};
    const std::string chunk = "tEXt" + keyword + std::string(room - keyword.size(), '.');
    const std::string framed =
        bigEndian(static_cast<std::uint32_t>(room)) + chunk + bigEndian(crcOf(chunk));
    bytes.insert(bytes.size() - endChunk, framed);
    return bytes;
}

std::string floorPlanSvg() {
    return R"(<svg xmlns="http://www.w3.org/2000/svg" viewBox="0 0 640 460" width="640" height="460">
<rect width="640" height="460" fill="#fbf8f1"/>
<g fill="none" stroke="#2b3a4a" stroke-width="8" stroke-linejoin="round">
<path d="M40 40h560v360h-560z"/><path d="M300 40v150M300 260v140M40 220h180M400 220h200"/></g>
<g fill="none" stroke="#b0563b" stroke-width="3"><path d="M300 190a70 70 0 0 1 70 70"/>
<path d="M220 220a60 60 0 0 0 60-60"/></g>
<g fill="#d9e6ef" stroke="#6a8aa3" stroke-width="2"><rect x="70" y="70" width="120" height="70" rx="10"/>
<rect x="70" y="260" width="150" height="110" rx="6"/><rect x="430" y="70" width="140" height="60" rx="6"/>
<circle cx="480" cy="310" r="46"/></g>
<g font-family="sans-serif" font-size="18" fill="#2b3a4a" text-anchor="middle">
<text x="170" y="190">Kitchen</text><text x="450" y="180">Study</text>
<text x="150" y="395" dy="-8">Bedroom</text><text x="480" y="385">Living room</text>
<text x="320" y="440">Lake house, ground floor, 1 : 100</text></g></svg>
)";
}

} // namespace pelmora
