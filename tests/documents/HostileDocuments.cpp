#include "tests/documents/HostileDocuments.h"

#include "tests/documents/SampleDocuments.h"

#include <QBuffer>
#include <QImage>
#include <QImageWriter>
#include <QtEndian>

#include <array>
#include <cstdio>
#include <vector>
#include <zlib.h>

namespace test {
namespace {

std::string bigEndian(unsigned value) {
    std::string bytes(4, '\0');
    qToBigEndian(value, bytes.data());
    return bytes;
}

std::string pngChunk(const std::string& content) {
    const auto sum = ::crc32(0, reinterpret_cast<const Bytef*>(content.data()),
                             static_cast<uInt>(content.size()));
    return bigEndian(static_cast<unsigned>(content.size() - 4)) + content +
           bigEndian(static_cast<unsigned>(sum));
}

/// A PDF of these objects, numbered from 1; `trailer` goes into its trailer.
std::string pdfOf(const std::vector<std::string>& objects, const std::string& trailer) {
    std::string pdf = "%PDF-1.4\n";
    std::string table = "0000000000 65535 f \n";
    for (std::size_t i = 0; i < objects.size(); ++i) {
        std::array<char, 32> line{};
        std::snprintf(line.data(), line.size(), "%010zu 00000 n \n", pdf.size());
        table += line.data();
        pdf += std::to_string(i + 1) + " 0 obj\n" + objects[i] + "\nendobj\n";
    }
    const std::string count = std::to_string(objects.size() + 1);
    const std::string start = std::to_string(pdf.size());
    return pdf + "xref\n0 " + count + "\n" + table + "trailer<</Size " + count + "/Root 1 0 R" +
           trailer + ">>\nstartxref\n" + start + "\n%%EOF";
}

} // namespace

std::string pngThatClaims(unsigned width, unsigned height) {
    return "\x89PNG\r\n\x1A\n" +
           pngChunk("IHDR" + bigEndian(width) + bigEndian(height) +
                    std::string("\x8\x6\0\0\0", 5)) +
           pngChunk("IDAT\x78\x9C");
}

std::string movingPicture() {
    const auto frame = [](char color) {
        return std::string("\x2C\0\0\0\0\x1\0\x1\0\0\x2\x2", 12) + (color ? '\x4C' : '\x44') +
               std::string("\x1\0", 2);
    };
    return std::string("GIF89a\x1\0\x1\0\x80\0\0\xFF\0\0\0\xFF\0", 19) + frame(0) + frame(1) + ";";
}

std::string photoLying(int orientation) {
    // What each orientation asks the reader to do.
    constexpr std::array<int, 9> transformations{0, 0, 1, 3, 2, 6, 4, 5, 7};
    const QImageIOHandler::Transformations wanted(
        QFlag(transformations[static_cast<std::size_t>(orientation)]));
    QImage upright = QImage::fromData(QByteArray::fromStdString(pngPicture(160, 120)));
    // The way back, step by step from the last one on.
    if (wanted.testFlag(QImageIOHandler::TransformationRotate90))
        upright = upright.transformed(QTransform().rotate(-90));
    upright = upright.mirrored(wanted.testFlag(QImageIOHandler::TransformationMirror),
                               wanted.testFlag(QImageIOHandler::TransformationFlip));
    QBuffer buffer;
    buffer.open(QIODevice::WriteOnly);
    QImageWriter writer(&buffer, "jpeg");
    writer.setTransformation(wanted);
    writer.write(upright);
    return buffer.data().toStdString();
}

std::string drawing(const std::string& content, const std::string& before) {
    return before +
           R"(<svg xmlns="http://www.w3.org/2000/svg" xmlns:xlink="http://www.w3.org/1999/xlink" )"
           R"(width="100" height="100">)" +
           content + "</svg>";
}

std::string packedSpaces(std::size_t count) {
    const std::string text = drawing(std::string(count, ' '));
    z_stream stream{};
    ::deflateInit2(&stream, 1, Z_DEFLATED, 15 + 16, 8, Z_DEFAULT_STRATEGY);
    std::string packed(::deflateBound(&stream, text.size()), '\0');
    stream.next_in = reinterpret_cast<Bytef*>(const_cast<char*>(text.data()));
    stream.avail_in = static_cast<uInt>(text.size());
    stream.next_out = reinterpret_cast<Bytef*>(packed.data());
    stream.avail_out = static_cast<uInt>(packed.size());
    ::deflate(&stream, Z_FINISH);
    packed.resize(packed.size() - stream.avail_out);
    ::deflateEnd(&stream);
    return packed;
}

std::string pdfOfBlankPages(int pages) {
    std::string kids;
    for (int i = 0; i < pages; ++i)
        kids += std::to_string(3 + i) + " 0 R ";
    std::vector<std::string> objects{"<</Type/Catalog/Pages 2 0 R>>", "<</Type/Pages/Count " +
                                                                          std::to_string(pages) +
                                                                          "/Kids[" + kids + "]>>"};
    objects.resize(static_cast<std::size_t>(pages) + 2,
                   "<</Type/Page/Parent 2 0 R/MediaBox[0 0 595 842]/Resources<<>>>>");
    return pdfOf(objects, "");
}

std::string lockedPdf() {
    const std::string key(64, 'A');
    return pdfOf({"<</Type/Catalog/Pages 2 0 R>>", "<</Type/Pages/Count 1/Kids[3 0 R]>>",
                  "<</Type/Page/Parent 2 0 R/MediaBox[0 0 595 842]/Resources<<>>>>",
                  "<</Filter/Standard/V 1/R 2/P -4/O<" + key + ">/U<" + key + ">>>"},
                 "/Encrypt 4 0 R/ID[<00><00>]");
}

} // namespace test
