#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <string_view>

namespace platform {

/// What the lister of archives, a process of its own, tells the preview through a pipe: a record an
/// entry, and a last one that says how the listing ended.
struct ArchiveRecord {
    enum class Kind : char {
        file = 'f',
        folder = 'd',
        link = 'l',
        /// The one thing in a file that is only compressed. It has no name of its own.
        content = 'c',
        /// The last record, one of these: all was read; there is more than a listing shows; what
        /// comes next cannot be read; the names are encrypted.
        complete = 'z',
        cut = 't',
        damaged = 'x',
        locked = 'p',
    };
    Kind kind = Kind::file;
    bool encrypted = false;
    std::optional<std::uint64_t> size;
    /// Seconds since 1970.
    std::optional<std::int64_t> modified;
    /// The path as the archive has it; of the last record, what the decoder said.
    std::string text;

    bool isLast() const {
        return kind == Kind::complete || kind == Kind::cut || kind == Kind::damaged ||
               kind == Kind::locked;
    }
};

/// Longer paths and messages are cut: no file system knows longer paths.
inline constexpr std::size_t longestRecordText = 4096;

void appendRecord(std::string& out, const ArchiveRecord& record);

/// Puts records together from the pieces in which they come.
class ArchiveRecordReader {
public:
    void add(std::string_view bytes) { pending_ += bytes; }
    /// The next whole record; none until more is added.
    std::optional<ArchiveRecord> next();
    /// What came is no listing.
    bool failed() const { return failed_; }

private:
    std::string pending_;
    std::size_t at_ = 0;
    bool failed_ = false;
};

} // namespace platform
