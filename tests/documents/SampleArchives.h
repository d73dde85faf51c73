#pragma once

#include <string>
#include <vector>

namespace test {

struct PackedItem {
    std::string path;
    /// A folder has none.
    std::string content;
    bool folder = false;
};

/// An archive of a format and a compression by the names that the library gives them ("zip",
/// "7zip", "pax", "cpio", "raw"; "gzip", "xz" or "" for none). `options` go to its format.
std::string archiveOf(const std::vector<PackedItem>& items, const std::string& format,
                      const std::string& compression = {}, const std::string& options = {});

} // namespace test
