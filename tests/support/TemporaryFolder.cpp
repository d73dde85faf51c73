#include "tests/support/TemporaryFolder.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>

namespace test {
namespace fs = std::filesystem;

TemporaryFolder::TemporaryFolder() {
    // Not /tmp where that is a memory file system: some of those lack user attributes.
    const fs::path base = fs::exists("/var/tmp") ? fs::path("/var/tmp") : fs::temp_directory_path();
    std::string pattern = (base / "tavrin-test-XXXXXX").string();
    if (!mkdtemp(pattern.data()))
        throw std::runtime_error("cannot make a temporary folder");
    path_ = pattern;
}

TemporaryFolder::~TemporaryFolder() {
    std::error_code ignored;
    for (const auto& entry : fs::recursive_directory_iterator(
             path_, fs::directory_options::skip_permission_denied, ignored))
        if (entry.is_directory(ignored) && !entry.is_symlink(ignored))
            fs::permissions(entry.path(), fs::perms::owner_all, fs::perm_options::add, ignored);
    fs::remove_all(path_, ignored);
}

std::string TemporaryFolder::operator/(std::string_view relative) const {
    return path_ + "/" + std::string(relative);
}

std::string TemporaryFolder::write(std::string_view relative, std::string_view content) const {
    const fs::path file = *this / relative;
    fs::create_directories(file.parent_path());
    std::ofstream(file, std::ios::binary) << content;
    return file.string();
}

std::string TemporaryFolder::makeFolder(std::string_view relative) const {
    fs::create_directories(*this / relative);
    return *this / relative;
}

std::string TemporaryFolder::read(std::string_view relative) const {
    std::ifstream file(*this / relative, std::ios::binary);
    return {std::istreambuf_iterator<char>(file), {}};
}

bool TemporaryFolder::has(std::string_view relative) const {
    return fs::exists(fs::symlink_status(*this / relative));
}

} // namespace test
