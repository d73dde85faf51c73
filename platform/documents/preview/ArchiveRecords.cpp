#include "platform/documents/preview/ArchiveRecords.h"

#include <charconv>
#include <utility>

namespace platform {
namespace {

constexpr char unknown = '-';
/// Kind, mark, size, date and length with a blank behind each.
constexpr std::size_t longestHead = 80;

void appendNumber(std::string& out, std::optional<std::int64_t> number) {
    out += ' ';
    out += number ? std::to_string(*number) : std::string(1, unknown);
}

/// Takes the word at `at` and goes behind the character that ends it.
template<class Number>
bool readNumber(std::string_view text, std::size_t& at, char end, std::optional<Number>& into) {
    const std::size_t stop = text.find(end, at);
    if (stop == std::string_view::npos)
        return false;
    const std::string_view word = text.substr(at, stop - at);
    at = stop + 1;
    if (word == "-")
        return true;
    Number value{};
    const auto [last, fault] = std::from_chars(word.data(), word.data() + word.size(), value);
    if (fault != std::errc() || last != word.data() + word.size())
        return false;
    into = value;
    return true;
}

bool isKind(char letter) {
    return std::string_view("fdlcztxp").find(letter) != std::string_view::npos;
}

} // namespace

void appendRecord(std::string& out, const ArchiveRecord& record) {
    const std::string_view text = std::string_view(record.text).substr(0, longestRecordText);
    out += static_cast<char>(record.kind);
    out += record.encrypted ? 'e' : unknown;
    std::optional<std::int64_t> size;
    if (record.size && *record.size <= static_cast<std::uint64_t>(INT64_MAX))
        size = static_cast<std::int64_t>(*record.size);
    appendNumber(out, size);
    appendNumber(out, record.modified);
    appendNumber(out, static_cast<std::int64_t>(text.size()));
    out += '\n';
    out += text;
}

std::optional<ArchiveRecord> ArchiveRecordReader::next() {
    const std::string_view rest = std::string_view(pending_).substr(at_);
    const std::size_t line = rest.substr(0, longestHead).find('\n');
    if (failed_ || line == std::string_view::npos) {
        failed_ = failed_ || rest.size() > longestHead;
        pending_.erase(0, std::exchange(at_, 0));
        return std::nullopt;
    }
    ArchiveRecord record;
    std::optional<std::size_t> length;
    std::size_t at = 3;
    if (line < at || !isKind(rest[0]) || !readNumber(rest, at, ' ', record.size) ||
        !readNumber(rest, at, ' ', record.modified) || !readNumber(rest, at, '\n', length) ||
        !length || *length > longestRecordText) {
        failed_ = true;
        return std::nullopt;
    }
    if (rest.size() - at < *length) {
        pending_.erase(0, std::exchange(at_, 0));
        return std::nullopt;
    }
    record.kind = static_cast<ArchiveRecord::Kind>(rest[0]);
    record.encrypted = rest[1] == 'e';
    record.text = rest.substr(at, *length);
    at_ += at + *length;
    return record;
}

} // namespace platform
