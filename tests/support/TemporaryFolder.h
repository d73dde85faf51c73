#pragma once

#include <string>
#include <string_view>

namespace test {

/// A folder that exists as long as the object, with its contents. On a disk that has user
/// attributes when there is one.
class TemporaryFolder {
public:
    TemporaryFolder();
    ~TemporaryFolder();
    TemporaryFolder(const TemporaryFolder&) = delete;
    TemporaryFolder& operator=(const TemporaryFolder&) = delete;

    const std::string& path() const { return path_; }
    /// The path of an item below the folder.
    std::string operator/(std::string_view relative) const;
    /// Writes a file below the folder, making missing folders; answers its path.
    std::string write(std::string_view relative, std::string_view content = "") const;
    std::string makeFolder(std::string_view relative) const;
    std::string read(std::string_view relative) const;
    bool has(std::string_view relative) const;

private:
    std::string path_;
};

} // namespace test
