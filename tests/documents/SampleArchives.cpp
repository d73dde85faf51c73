#include "tests/documents/SampleArchives.h"

#include <archive.h>
#include <archive_entry.h>

namespace test {
namespace {

constexpr std::int64_t packedOn = 1'700'000'000;

la_ssize_t keep(archive*, void* out, const void* bytes, std::size_t size) {
    static_cast<std::string*>(out)->append(static_cast<const char*>(bytes), size);
    return static_cast<la_ssize_t>(size);
}

void write(archive* writer, const PackedItem& item) {
    archive_entry* const entry = ::archive_entry_new();
    ::archive_entry_set_pathname(entry, item.path.c_str());
    ::archive_entry_set_filetype(entry, item.folder ? AE_IFDIR : AE_IFREG);
    ::archive_entry_set_perm(entry, item.folder ? 0755 : 0644);
    ::archive_entry_set_mtime(entry, packedOn, 0);
    ::archive_entry_set_size(entry, static_cast<la_int64_t>(item.content.size()));
    ::archive_write_header(writer, entry);
    ::archive_write_data(writer, item.content.data(), item.content.size());
    ::archive_entry_free(entry);
}

} // namespace

std::string archiveOf(const std::vector<PackedItem>& items, const std::string& format,
                      const std::string& compression, const std::string& options) {
    std::string bytes;
    archive* const writer = ::archive_write_new();
    ::archive_write_set_format_by_name(writer, format.c_str());
    if (!compression.empty())
        ::archive_write_add_filter_by_name(writer, compression.c_str());
    ::archive_write_set_bytes_in_last_block(writer, 1);
    ::archive_write_set_passphrase(writer, "secret");
    if (!options.empty())
        ::archive_write_set_options(writer, options.c_str());
    ::archive_write_open(writer, &bytes, nullptr, &keep, nullptr);
    for (const PackedItem& item : items)
        write(writer, item);
    ::archive_write_close(writer);
    ::archive_write_free(writer);
    return bytes;
}

} // namespace test
