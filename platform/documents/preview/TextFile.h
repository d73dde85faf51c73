#pragma once

#include "platform/base/Result.h"
#include "platform/base/Url.h"
#include "platform/documents/preview/SyntaxScanner.h"
#include "platform/files/FileDescriptor.h"

#include <QString>

#include <cstdint>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

enum class TextEncoding { utf8, utf16LittleEndian, utf16BigEndian, windows1252 };

struct DetectedEncoding {
    TextEncoding encoding = TextEncoding::utf8;
    /// Of the mark at the head of the file, which is no text.
    std::size_t markLength = 0;
};
/// By the mark at the head, else by what the bytes could be. `sample` is the head of the file; its
/// last character may be cut.
DetectedEncoding detectEncoding(std::string_view sample);

/// A line of a text file, or a piece of one that is too long to be laid out at once.
struct TextLine {
    std::uint64_t offset = 0;
    /// Where the next one begins.
    std::uint64_t end = 0;
    QString text;
    /// The next piece belongs to the same line.
    bool goesOn = false;
    /// From 1 on; 0 for one that is not counted, as the later pieces of a line.
    std::uint64_t number = 0;
    /// What is coloured in it.
    std::vector<SyntaxSpan> spans = {};
};

/// An open text file, read by windows: its length does not matter. Belongs to one queue.
class TextFile {
public:
    static Result<TextFile> open(const Url& file, const std::string& path);

    std::uint64_t size() const { return size_; }
    /// The lines from `offset` on (where one begins), about a window full.
    std::vector<TextLine> linesFrom(std::uint64_t offset) const;
    /// The lines before `offset` (where one begins), about a window full.
    std::vector<TextLine> linesBefore(std::uint64_t offset) const;
    /// The lines around any place.
    std::vector<TextLine> linesAround(std::uint64_t offset) const;
    std::uint64_t start() const { return encoding_.markLength; }
    std::uint64_t lineEndsBetween(std::uint64_t from, std::uint64_t to) const;

    TextEncoding encoding() const { return encoding_.encoding; }
    /// The bytes there; fewer at the end of the file.
    std::string read(std::uint64_t offset, std::size_t length) const;
    /// What the bytes say, without the end of a line and with signs in place of what cannot be
    /// shown.
    QString decode(std::string_view bytes) const;
    /// What the bytes say, as it is.
    QString decodeWhole(std::string_view bytes) const;

private:
    TextFile() = default;
    std::size_t unit() const;
    /// Just behind the first line end at or after `from`; npos when there is none.
    std::size_t behindLineEnd(std::string_view bytes, std::size_t from) const;
    std::vector<TextLine> split(std::string_view bytes, std::uint64_t offset, bool toEnd) const;

    FileDescriptor file_;
    std::uint64_t size_ = 0;
    DetectedEncoding encoding_;
};

} // namespace platform
