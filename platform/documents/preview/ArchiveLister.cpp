// Lists the archive that is its standard input on its standard output, as ArchiveRecords.h has it.
// A program of its own, because archives come from anywhere: what a hostile one makes of the
// decoder's memory, time or code ends with this process. It unpacks nothing but what the names of
// the following entries take.

#include "platform/documents/preview/ArchiveRecords.h"
#include "platform/documents/preview/ChildLimits.h"

#include <archive.h>
#include <archive_entry.h>

#include <cerrno>
#include <chrono>
#include <clocale>
#include <iconv.h>
#include <unistd.h>

namespace {

using platform::ArchiveRecord;
using Kind = ArchiveRecord::Kind;

/// A list of more is of no use to anybody, and takes 50 MB of the preview's memory.
constexpr std::size_t mostEntries = 100'000;
/// Of all names together, for archives whose every path is thousands of bytes long.
constexpr std::size_t mostNameBytes = 24UL << 20;
/// The largest dictionaries in use take 64 to 128 MiB; a directory of 100,000 names about 30.
constexpr std::size_t mostMemory = 512UL << 20;
/// Seconds of work; the preview, which counts other seconds, ends a silent lister as well.
constexpr unsigned mostWork = 120;
constexpr std::size_t archiveReadSize = 64UL << 10;
constexpr std::size_t flushSize = 64UL << 10;
constexpr std::chrono::milliseconds flushTime(200);

class Output {
public:
    void add(const ArchiveRecord& record) {
        platform::appendRecord(pending_, record);
        const auto now = std::chrono::steady_clock::now();
        if (pending_.size() < flushSize && now - flushed_ < flushTime && !record.isLast())
            return;
        flush();
        flushed_ = now;
    }

private:
    void flush() {
        std::size_t done = 0;
        while (done < pending_.size()) {
            const ssize_t written =
                ::write(STDOUT_FILENO, pending_.data() + done, pending_.size() - done);
            if (written < 0 && errno != EINTR)
                ::_exit(1); // nobody listens any more
            done += written > 0 ? static_cast<std::size_t>(written) : 0;
        }
        pending_.clear();
    }

    std::string pending_;
    std::chrono::steady_clock::time_point flushed_ = std::chrono::steady_clock::now();
};

/// The text in UTF-8: what is not is taken for the code page of the format's first years.
std::string fromOldCodePage(std::string text) {
    const auto convert = [&text](const char* from) -> std::optional<std::string> {
        iconv_t converter = ::iconv_open("UTF-8", from);
        if (converter == reinterpret_cast<iconv_t>(-1))
            return std::nullopt;
        std::string out(text.size() * 3, '\0');
        char* in = text.data();
        std::size_t inLeft = text.size();
        char* to = out.data();
        std::size_t outLeft = out.size();
        const std::size_t fault = ::iconv(converter, &in, &inLeft, &to, &outLeft);
        ::iconv_close(converter);
        out.resize(out.size() - outLeft);
        return fault == static_cast<std::size_t>(-1) ? std::nullopt : std::optional(out);
    };
    if (convert("UTF-8"))
        return text;
    return convert("CP437").value_or(text);
}

std::string pathOf(archive* reader, archive_entry* entry) {
    const char* name = ::archive_entry_pathname(entry);
    if (!name)
        name = ::archive_entry_pathname_utf8(entry);
    if (!name)
        return "?";
    const bool zip = (::archive_format(reader) & ARCHIVE_FORMAT_BASE_MASK) == ARCHIVE_FORMAT_ZIP;
    return zip ? fromOldCodePage(name) : std::string(name);
}

Kind kindOf(archive* reader, archive_entry* entry) {
    if (::archive_format(reader) == ARCHIVE_FORMAT_RAW)
        return Kind::content;
    if (::archive_entry_filetype(entry) == AE_IFDIR)
        return Kind::folder;
    if (::archive_entry_filetype(entry) == AE_IFLNK || ::archive_entry_hardlink(entry))
        return Kind::link;
    return Kind::file;
}

ArchiveRecord recordOf(archive* reader, archive_entry* entry) {
    ArchiveRecord record;
    record.kind = kindOf(reader, entry);
    record.encrypted = ::archive_entry_is_encrypted(entry) != 0;
    if (record.kind == Kind::file && ::archive_entry_size_is_set(entry) &&
        ::archive_entry_size(entry) >= 0)
        record.size = static_cast<std::uint64_t>(::archive_entry_size(entry));
    // 0 is what many writers put where they know no date.
    if (record.kind != Kind::content && ::archive_entry_mtime_is_set(entry) &&
        ::archive_entry_mtime(entry) != 0)
        record.modified = ::archive_entry_mtime(entry);
    if (record.kind != Kind::content)
        record.text = pathOf(reader, entry);
    return record;
}

/// Formats and compressions that the decoder knows by itself, without the help of other programs.
void supportFormats(archive* reader) {
    ::archive_read_support_filter_bzip2(reader);
    ::archive_read_support_filter_compress(reader);
    ::archive_read_support_filter_gzip(reader);
    ::archive_read_support_filter_lz4(reader);
    ::archive_read_support_filter_lzip(reader);
    ::archive_read_support_filter_lzma(reader);
    ::archive_read_support_filter_xz(reader);
    ::archive_read_support_filter_zstd(reader);
    ::archive_read_support_format_7zip(reader);
    ::archive_read_support_format_ar(reader);
    ::archive_read_support_format_cab(reader);
    ::archive_read_support_format_cpio(reader);
    ::archive_read_support_format_iso9660(reader);
    ::archive_read_support_format_lha(reader);
    ::archive_read_support_format_rar(reader);
    ::archive_read_support_format_rar5(reader);
    ::archive_read_support_format_raw(reader);
    ::archive_read_support_format_tar(reader);
    ::archive_read_support_format_zip(reader);
}

ArchiveRecord endOf(archive* reader, Kind kind) {
    ArchiveRecord last;
    last.kind = kind;
    if (kind == Kind::damaged && ::archive_read_has_encrypted_entries(reader) > 0)
        last.kind = Kind::locked;
    if (const char* said = ::archive_error_string(reader); said && kind == Kind::damaged)
        last.text = said;
    return last;
}

/// Whether the one thing in a compressed file can be read at all.
bool isReadable(archive* reader) {
    const void* block = nullptr;
    std::size_t size = 0;
    la_int64_t offset = 0;
    return ::archive_read_data_block(reader, &block, &size, &offset) >= ARCHIVE_WARN;
}

ArchiveRecord list(archive* reader, Output& output) {
    supportFormats(reader);
    if (::archive_read_open_fd(reader, STDIN_FILENO, archiveReadSize) != ARCHIVE_OK)
        return endOf(reader, Kind::damaged);
    std::size_t entries = 0;
    std::size_t nameBytes = 0;
    for (;;) {
        archive_entry* entry = nullptr;
        const int result = ::archive_read_next_header(reader, &entry);
        if (result == ARCHIVE_EOF)
            return endOf(reader, Kind::complete);
        if (result < ARCHIVE_WARN)
            return endOf(reader, Kind::damaged);
        const ArchiveRecord record = recordOf(reader, entry);
        // Anything at all is "raw": only what was compressed is something to show.
        if (record.kind == Kind::content &&
            (::archive_filter_count(reader) < 2 || !isReadable(reader)))
            return endOf(reader, Kind::damaged);
        nameBytes += record.text.size();
        if (++entries > mostEntries || nameBytes > mostNameBytes)
            return endOf(reader, Kind::cut);
        output.add(record);
    }
}

} // namespace

int main() {
    platform::limitThisProcess(mostMemory, mostWork);
    // Names in an archive are converted to the locale's encoding.
    std::setlocale(LC_ALL, "C.UTF-8");
    Output output;
    archive* const reader = ::archive_read_new();
    if (!reader)
        return 1;
    output.add(list(reader, output));
    // The end of the process frees it faster than a decoder in whatever state it is.
    ::_exit(0);
}
