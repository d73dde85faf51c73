#pragma once

#include "platform/base/Result.h"
#include "platform/files/FileManager.h"

#include <cstdint>
#include <string>

namespace platform {

/// The pages made of office documents, in a folder below the user's cache folder: a file a version
/// of a document. May be emptied by anybody at any time. Safe from any thread of this process.
class OfficeCache {
public:
    explicit OfficeCache(std::string folder) : folder_(std::move(folder)) {}

    /// Where the pages of that version of a document are, or are to be put.
    std::string pathFor(const FileAttributes& document) const;
    /// Whether they are there. They count as used now.
    bool has(const std::string& path) const;
    /// Moves a file there, and throws away what was used longest ago until the rest fits.
    Failure put(const std::string& made, const std::string& path) const;
    void remove(const std::string& path) const;

    /// A new folder beside them, for one preview; those that a crash has left are removed.
    Result<std::string> makeWorkFolder() const;
    std::string profileFolder() const { return folder_ + "/profile"; }

private:
    Failure makeFolder(const std::string& path) const;
    void trim() const;
    void removeLeftFolders() const;

    std::string folder_;
};

} // namespace platform
