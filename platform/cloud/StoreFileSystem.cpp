#include "platform/cloud/StoreFileSystem.h"

#include "platform/cloud/Sidecar.h"
#include "platform/files/FileDescriptor.h"
#include "platform/files/OpenFile.h"
#include "platform/files/PathText.h"

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>

namespace platform {
namespace {

Error failed(const std::string& path, bool writing = true) {
    return posixError(errno, Url::file(path), writing);
}

/// Room is kept ahead of the writing in steps: to give back a gigabyte of it takes the disk a tenth
/// of a second, and whoever cancels a download waits for that.
constexpr std::uint64_t roomStep = 64ULL * 1024 * 1024;

class RealStagedFile final : public StagedFile {
public:
    RealStagedFile(FileDescriptor file, std::string path, std::uint64_t size)
        : file_(std::move(file)), path_(std::move(path)), size_(size) {}

    /// File systems that cannot keep room (EOPNOTSUPP) tell that there is none when it comes to
    /// that.
    Failure keepRoom() {
        const std::uint64_t length = std::min(roomStep, size_ - kept_);
        if (length > 0 &&
            fallocate(file_.get(), 0, static_cast<off_t>(kept_), static_cast<off_t>(length)) != 0 &&
            (errno == ENOSPC || errno == EDQUOT || errno == EFBIG))
            return failed(path_);
        kept_ += length;
        return std::nullopt;
    }

    Failure write(std::span<const std::byte> piece) override {
        while (kept_<size_&& static_cast<std::uint64_t>(written_) + piece.size()> kept_)
            if (Failure failure = keepRoom())
                return failure;
        while (!piece.empty()) {
            const ssize_t done = ::write(file_.get(), piece.data(), piece.size());
            if (done < 0 && errno == EINTR)
                continue;
            if (done < 0)
                return failed(path_);
            piece = piece.subspan(static_cast<std::size_t>(done));
            written_ += done;
        }
        return std::nullopt;
    }

    Failure finish(Date modified, const std::string& tags) override {
        // Room that was kept for more than came goes back.
        if (ftruncate(file_.get(), written_) != 0)
            return failed(path_);
        if (!tags.empty() &&
            fsetxattr(file_.get(), "user.xdg.tags", tags.data(), tags.size(), 0) != 0 &&
            errno != EOPNOTSUPP)
            return failed(path_);
        timespec times[2];
        times[0].tv_sec = 0;
        times[0].tv_nsec = UTIME_OMIT;
        times[1].tv_sec = modified.wholeSeconds();
        times[1].tv_nsec = modified.nanoseconds - modified.wholeSeconds() * 1'000'000'000;
        return futimens(file_.get(), times) == 0 ? Failure{} : failed(path_);
    }

    Failure sync() override { return fsync(file_.get()) == 0 ? Failure{} : failed(path_); }

private:
    FileDescriptor file_;
    std::string path_;
    const std::uint64_t size_;
    std::uint64_t kept_ = 0;
    off_t written_ = 0;
};

class RealOpenContent final : public OpenContent {
public:
    RealOpenContent(FileDescriptor file, std::string path)
        : file_(std::move(file)), path_(std::move(path)) {}

    Result<FileAttributes> attributes() override {
        return attributesOfOpen(file_.get(), path_);
    }

    Result<std::size_t> read(std::uint64_t offset, std::span<std::byte> buffer) override {
        for (;;) {
            const ssize_t got =
                pread(file_.get(), buffer.data(), buffer.size(), static_cast<off_t>(offset));
            if (got >= 0)
                return static_cast<std::size_t>(got);
            if (errno != EINTR)
                return failed(path_, false);
        }
    }

    Failure sync() override { return fsync(file_.get()) == 0 ? Failure{} : failed(path_); }

private:
    FileDescriptor file_;
    std::string path_;
};

/// Puts the mark on the open file: as an attribute, or as content where the disk has none.
Failure writeMark(int file, const std::string& path, const std::string& mark) {
    if (fsetxattr(file, sidecarAttribute, mark.data(), mark.size(), 0) == 0)
        return std::nullopt;
    if (errno != EOPNOTSUPP)
        return failed(path);
    if (ftruncate(file, 0) != 0 ||
        pwrite(file, mark.data(), mark.size(), 0) != static_cast<ssize_t>(mark.size()))
        return failed(path);
    return std::nullopt;
}

class RealStoreFileSystem final : public StoreFileSystem {
public:
    Result<FileAttributes> attributes(const std::string& path) override {
        return FileManager::attributes(path, FollowLinks::no);
    }

    Result<std::vector<DirectoryEntry>> entries(const std::string& path) override {
        return FileManager::entries(path);
    }

    Failure makeFolder(const std::string& path) override {
        // Not by FileManager: a hundred thousand of them are made in one go.
        return mkdir(path.c_str(), 0777) == 0 ? Failure{} : failed(path);
    }

    Result<FileAttributes> makeSidecar(const std::string& path, const std::string& mark) override {
        const FileDescriptor file(
            open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0644));
        if (!file)
            return failed(path);
        if (Failure failure = writeMark(file.get(), path, mark)) {
            unlink(path.c_str()); // made here a moment ago and empty
            return *failure;
        }
        // By the open file: somebody may have moved it already.
        return attributesOfOpen(file.get(), path);
    }

    Failure setMark(const std::string& path, const std::string& mark) override {
        const FileDescriptor file(open(path.c_str(), O_WRONLY | O_NOFOLLOW | O_CLOEXEC));
        return file ? writeMark(file.get(), path, mark) : failed(path);
    }

    Failure rename(const std::string& from, const std::string& to) override {
        return FileManager::moveItem(Url::file(from), Url::file(to));
    }

    Failure exchange(const std::string& a, const std::string& b) override {
        return FileManager::exchangeItems(Url::file(a), Url::file(b));
    }

    Failure removeFile(const std::string& path) override {
        return unlink(path.c_str()) == 0 || errno == ENOENT ? Failure{} : failed(path);
    }

    Failure removeFolder(const std::string& path) override {
        return rmdir(path.c_str()) == 0 || errno == ENOENT ? Failure{} : failed(path);
    }

    Result<std::unique_ptr<OpenContent>> openContent(const std::string& path) override {
        FileDescriptor file(open(path.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
        if (!file)
            return failed(path, false);
        auto content = std::make_unique<RealOpenContent>(std::move(file), path);
        const Result<FileAttributes> attributes = content->attributes();
        if (!attributes)
            return attributes.error();
        if (attributes->kind != FileKind::file)
            return makeError(ErrorCode::invalidArgument, Url::file(path).lastPathComponent());
        return std::unique_ptr<OpenContent>(std::move(content));
    }

    Result<std::unique_ptr<StagedFile>> stage(const std::string& path,
                                              std::uint64_t size) override {
        FileDescriptor file(
            open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_NOFOLLOW | O_CLOEXEC, 0644));
        if (!file)
            return failed(path);
        auto staged = std::make_unique<RealStagedFile>(std::move(file), path, size);
        // A full disk is known before the first byte is fetched.
        Failure failure = hasRoom(path, size) ? staged->keepRoom() : noRoom(path);
        if (failure) {
            unlink(path.c_str());
            return *failure;
        }
        return std::unique_ptr<StagedFile>(std::move(staged));
    }

    Failure writeSmallFile(const std::string& path, std::string_view content) override {
        return FileManager::writeAtomically(Url::file(path), content);
    }

    Failure syncFolder(const std::string& path) override { return syncWith(path, &fsync); }

    Failure syncAll(const std::string& path) override { return syncWith(path, &syncfs); }

    Result<std::uint64_t> freeBytes(const std::string& path) override {
        return FileManager::freeBytes(path);
    }

private:
    /// Of what is kept at once the disk itself says so. Where it cannot be known there is.
    static bool hasRoom(const std::string& path, std::uint64_t size) {
        const Result<std::uint64_t> free =
            size > roomStep ? FileManager::freeBytes(folderOf(path)) : Result(size);
        return !free || *free >= size;
    }

    static Error noRoom(const std::string& path) {
        return posixError(ENOSPC, Url::file(path), true);
    }

    static Failure syncWith(const std::string& path, int (*sync)(int)) {
        const FileDescriptor folder(open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
        if (!folder || sync(folder.get()) != 0)
            return failed(path);
        return std::nullopt;
    }
};

} // namespace

std::unique_ptr<StoreFileSystem> makeRealStoreFileSystem() {
    return std::make_unique<RealStoreFileSystem>();
}

} // namespace platform
