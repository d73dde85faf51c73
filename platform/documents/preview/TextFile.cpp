#include "platform/documents/preview/TextFile.h"

#include "platform/files/PathText.h"

#include <QStringDecoder>

#include <algorithm>
#include <array>
#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace platform {
namespace {

constexpr std::size_t sampleSize = 64 * 1024;
constexpr std::size_t windowSize = 128 * 1024;
/// A longer line is laid out in pieces.
constexpr std::size_t longestLine = 4 * 1024;

bool isUtf8(std::string_view bytes) {
    QStringDecoder decoder(QStringDecoder::Utf8);
    // A character that the end of the sample cuts is no fault: it stays in the decoder.
    const QString ignored =
        decoder(QByteArrayView(bytes.data(), static_cast<qsizetype>(bytes.size())));
    return !decoder.hasError();
}

/// Text of mostly Western letters has a zero in every other byte.
std::optional<TextEncoding> utf16ByZeros(std::string_view bytes) {
    std::array<std::size_t, 2> zeros{};
    for (std::size_t i = 0; i < bytes.size(); ++i)
        zeros[i % 2] += bytes[i] == '\0' ? 1 : 0;
    const std::size_t pairs = bytes.size() / 2;
    if (pairs == 0 || zeros[0] + zeros[1] < pairs / 3)
        return std::nullopt;
    if (zeros[1] > 8 * zeros[0])
        return TextEncoding::utf16LittleEndian;
    if (zeros[0] > 8 * zeros[1])
        return TextEncoding::utf16BigEndian;
    return std::nullopt;
}

/// What would reach beyond its own line, or not be seen.
QChar shownUnit(QChar unit) {
    const char16_t code = unit.unicode();
    if (code == u'\t' || (code >= 0x20 && code != 0x7F && code != 0x2028 && code != 0x2029))
        return unit;
    return code < 0x20 ? QChar(static_cast<char16_t>(0x2400 + code)) : QChar::ReplacementCharacter;
}

} // namespace

DetectedEncoding detectEncoding(std::string_view sample) {
    if (sample.starts_with("\xEF\xBB\xBF"))
        return {TextEncoding::utf8, 3};
    if (sample.starts_with("\xFF\xFE"))
        return {TextEncoding::utf16LittleEndian, 2};
    if (sample.starts_with("\xFE\xFF"))
        return {TextEncoding::utf16BigEndian, 2};
    if (const auto wide = utf16ByZeros(sample))
        return {*wide, 0};
    return {isUtf8(sample) ? TextEncoding::utf8 : TextEncoding::windows1252, 0};
}

Result<TextFile> TextFile::open(const Url& file, const std::string& path) {
    TextFile text;
    text.file_ = FileDescriptor(::open(PathText(path).c_str(), O_RDONLY | O_CLOEXEC));
    struct stat status {};
    if (!text.file_ || ::fstat(text.file_.get(), &status) != 0)
        return posixError(errno, file, false);
    text.size_ = static_cast<std::uint64_t>(status.st_size);
    text.encoding_ = detectEncoding(text.read(0, sampleSize));
    return text;
}

std::size_t TextFile::unit() const {
    const bool wide = encoding_.encoding == TextEncoding::utf16LittleEndian ||
                      encoding_.encoding == TextEncoding::utf16BigEndian;
    return wide ? 2 : 1;
}

std::string TextFile::read(std::uint64_t offset, std::size_t length) const {
    std::string bytes(length, '\0');
    std::size_t have = 0;
    while (have < length) {
        const ssize_t got = ::pread(file_.get(), bytes.data() + have, length - have,
                                    static_cast<off_t>(offset + have));
        if (got <= 0)
            break; // its end, or a disk that gives no more: what there is is shown
        have += static_cast<std::size_t>(got);
    }
    bytes.resize(have);
    return bytes;
}

std::size_t TextFile::behindLineEnd(std::string_view bytes, std::size_t from) const {
    const std::size_t step = unit();
    for (std::size_t at = bytes.find('\n', from); at != std::string_view::npos;
         at = bytes.find('\n', at + 1)) {
        if (step == 1)
            return at + 1;
        const std::size_t first = at - at % 2;
        const bool little = encoding_.encoding == TextEncoding::utf16LittleEndian;
        const std::size_t other = little ? first + 1 : first;
        if (at % 2 == (little ? 0U : 1U) && other < bytes.size() && bytes[other] == '\0')
            return first + 2;
    }
    return std::string_view::npos;
}

std::vector<TextLine> TextFile::split(std::string_view bytes, std::uint64_t offset,
                                      bool toEnd) const {
    std::vector<TextLine> lines;
    std::size_t at = 0;
    while (at < bytes.size()) {
        std::size_t end = behindLineEnd(bytes, at);
        const bool open = end == std::string_view::npos;
        bool goesOn = open && !toEnd;
        if (open)
            end = bytes.size();
        if (end - at > longestLine) {
            end = at + longestLine;
            goesOn = true;
            // Not within a character.
            while (unit() == 1 && end > at + 1 &&
                   (static_cast<unsigned char>(bytes[end]) & 0xC0) == 0x80)
                --end;
        } else if (open && !toEnd && at > 0) {
            break; // the rest of the line is in the next window
        }
        lines.push_back({offset + at, offset + end, decode(bytes.substr(at, end - at)), goesOn});
        at = end;
    }
    return lines;
}

std::vector<TextLine> TextFile::linesFrom(std::uint64_t offset) const {
    const std::string bytes = read(offset, windowSize);
    return split(bytes, offset, offset + bytes.size() >= size_);
}

std::vector<TextLine> TextFile::linesBefore(std::uint64_t offset) const {
    const std::uint64_t first = start();
    if (offset <= first)
        return {};
    std::uint64_t from = offset - std::min<std::uint64_t>(offset - first, windowSize);
    from += (from - first) % unit();
    const std::string bytes = read(from, static_cast<std::size_t>(offset - from));
    std::size_t at = 0;
    // Where the window begins within a line, that line belongs to the window before.
    if (from > first) {
        const std::size_t next = behindLineEnd(bytes, 0);
        at = next == std::string_view::npos || next >= bytes.size() ? 0 : next;
    }
    return split(std::string_view(bytes).substr(at), from + at, true);
}

std::vector<TextLine> TextFile::linesAround(std::uint64_t offset) const {
    offset = std::clamp(offset, start(), std::max(start(), size_));
    std::vector<TextLine> before = linesBefore(offset - (offset - start()) % unit());
    const std::uint64_t from = before.empty() ? start() : before.back().offset;
    if (!before.empty())
        before.pop_back(); // its end is only where the search began
    for (TextLine& line : linesFrom(from))
        before.push_back(std::move(line));
    return before;
}

std::uint64_t TextFile::lineEndsBetween(std::uint64_t from, std::uint64_t to) const {
    std::uint64_t count = 0;
    while (from < to) {
        const std::string bytes =
            read(from, static_cast<std::size_t>(std::min<std::uint64_t>(windowSize, to - from)));
        if (bytes.empty())
            break;
        for (std::size_t at = behindLineEnd(bytes, 0); at != std::string_view::npos;
             at = behindLineEnd(bytes, at))
            ++count;
        from += bytes.size();
    }
    return count;
}

QString TextFile::decodeWhole(std::string_view bytes) const {
    const QByteArrayView view(bytes.data(), static_cast<qsizetype>(bytes.size()));
    QString text;
    switch (encoding_.encoding) {
    case TextEncoding::utf8:
        text = QString::fromUtf8(view);
        break;
    case TextEncoding::utf16LittleEndian:
        text = QStringDecoder(QStringDecoder::Utf16LE)(view);
        break;
    case TextEncoding::utf16BigEndian:
        text = QStringDecoder(QStringDecoder::Utf16BE)(view);
        break;
    case TextEncoding::windows1252: {
        QStringDecoder decoder("windows-1252");
        text = decoder.isValid() ? QString(decoder(view)) : QString::fromLatin1(view);
        break;
    }
    }
    return text;
}

QString TextFile::decode(std::string_view bytes) const {
    QString text = decodeWhole(bytes);
    while (text.endsWith(QChar(u'\n')) || text.endsWith(QChar(u'\r')))
        text.chop(1);
    for (QChar& unit : text)
        if (const QChar shown = shownUnit(unit); shown != unit)
            unit = shown;
    return text;
}

} // namespace platform
