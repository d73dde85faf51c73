#pragma once

#include "platform/files/FileManager.h"

#include <cstddef>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// A content on its way to its place: written beside the store's tree, seen by nobody.
class StagedFile {
public:
    virtual ~StagedFile() = default;
    [[nodiscard]] virtual Failure write(std::span<const std::byte> piece) = 0;
    /// Sets the time and the tags ("" for none). The content may still be in memory alone.
    [[nodiscard]] virtual Failure finish(Date modified, const std::string& tags) = 0;
    /// After it, what was written survives a loss of power; its name needs a sync of its own.
    [[nodiscard]] virtual Failure sync() = 0;
};

/// A content of the tree that is being read: the same one until the end, whatever happens to its
/// name meanwhile.
class OpenContent {
public:
    virtual ~OpenContent() = default;
    /// As they are now; those from before and after reading tell whether it changed.
    virtual Result<FileAttributes> attributes() = 0;
    /// How many bytes were read; 0 at the end.
    virtual Result<std::size_t> read(std::uint64_t offset, std::span<std::byte> buffer) = 0;
    /// As StagedFile::sync().
    [[nodiscard]] virtual Failure sync() = 0;
};

/// What the store does to its disk, one step a call, so that a twin can fail or stop at any of
/// them. Paths are absolute. Symbolic links are never followed. Safe from any thread.
class StoreFileSystem {
public:
    virtual ~StoreFileSystem() = default;

    virtual Result<FileAttributes> attributes(const std::string& path) = 0;
    virtual Result<std::vector<DirectoryEntry>> entries(const std::string& path) = 0;

    /// fileExists when something is there.
    [[nodiscard]] virtual Failure makeFolder(const std::string& path) = 0;
    /// A new, empty, hidden-by-name file with its mark; fileExists when something is there.
    virtual Result<FileAttributes> makeSidecar(const std::string& path,
                                               const std::string& mark) = 0;
    [[nodiscard]] virtual Failure setMark(const std::string& path, const std::string& mark) = 0;
    /// Never replaces: fileExists when something stands at `to`.
    [[nodiscard]] virtual Failure rename(const std::string& from, const std::string& to) = 0;
    /// Swaps two files at once: there is no moment at which either name has nothing. noSuchItem
    /// when one of them is gone; unsupportedOperation where the disk cannot do it.
    [[nodiscard]] virtual Failure exchange(const std::string& a, const std::string& b) = 0;
    /// A file or a link; success when it is gone already.
    [[nodiscard]] virtual Failure removeFile(const std::string& path) = 0;
    /// folderNotEmpty when anything is in it; success when it is gone already.
    [[nodiscard]] virtual Failure removeFolder(const std::string& path) = 0;
    /// A regular file; anything else is refused with invalidArgument.
    virtual Result<std::unique_ptr<OpenContent>> openContent(const std::string& path) = 0;
    /// A new file for `size` bytes, for which the disk has room; outOfSpace otherwise.
    virtual Result<std::unique_ptr<StagedFile>> stage(const std::string& path,
                                                      std::uint64_t size) = 0;
    /// The whole small file at once, in place of an older one.
    [[nodiscard]] virtual Failure writeSmallFile(const std::string& path,
                                                 std::string_view content) = 0;
    /// After it, the names in this folder survive a loss of power.
    [[nodiscard]] virtual Failure syncFolder(const std::string& path) = 0;
    /// The same for everything on the file system that holds `path`.
    [[nodiscard]] virtual Failure syncAll(const std::string& path) = 0;
    /// Bytes that may still be written to the file system that holds `path`.
    virtual Result<std::uint64_t> freeBytes(const std::string& path) = 0;
};

std::unique_ptr<StoreFileSystem> makeRealStoreFileSystem();

} // namespace platform
