#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"
#include "platform/system/JotSink.h"

#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <nlohmann/json.hpp>
#include <sys/file.h>
#include <sys/stat.h>

namespace platform {
namespace {

constexpr off_t sizeLimit = 4L * 1024 * 1024;
/// "log" itself and four older ones.
constexpr int fileCount = 5;

/// Bytes that are no UTF-8 are replaced; line ends are escaped, so that a record is one line.
std::string jsonText(const std::string& text) {
    return nlohmann::json(text).dump(-1, ' ', false, nlohmann::json::error_handler_t::replace);
}

std::string lineOf(const std::string& sender, const JotRecord& record) {
    // Written by hand: an object type would drop a key that comes twice.
    std::string line = "{\"Sender\":" + jsonText(sender);
    for (const auto& [key, value] : record.fields())
        line += ',' + jsonText(key) + ':' + jsonText(value);
    return line + "}\n";
}

/// Processes share the files: each record is one write at the end of "log", which the kernel keeps
/// whole, and whoever finds the file full renames the row of files, under a lock.
class FileSink final : public JotSink {
public:
    explicit FileSink(std::string folder) : folder_(std::move(folder)), path_(folder_ + "/log") {}

    bool write(const std::string& sender, const JotRecord& record) override {
        if (!openCurrent())
            return false;
        std::string line = lineOf(sender, record);
        // After a write that was cut off, the next record starts on a line of its own.
        if (torn_)
            line.insert(0, "\n");
        const ssize_t put = ::write(file_.get(), line.data(), line.size());
        if (put >= 0)
            torn_ = static_cast<std::size_t>(put) != line.size();
        struct stat info {};
        if (::fstat(file_.get(), &info) == 0 && info.st_size >= sizeLimit)
            rotate(info);
        return put >= 0 && !torn_;
    }

private:
    /// Opens "log", anew when another process renamed or removed it.
    bool openCurrent() {
        struct stat held {};
        struct stat named {};
        if (file_ && ::fstat(file_.get(), &held) == 0 && ::stat(path_.c_str(), &named) == 0 &&
            held.st_ino == named.st_ino && held.st_dev == named.st_dev)
            return true;
        constexpr int flags = O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC | O_NOFOLLOW;
        file_ = FileDescriptor(::open(path_.c_str(), flags, 0600));
        if (!file_ && errno == ENOENT && !FileManager::createDirectory(Url::file(folder_), true))
            file_ = FileDescriptor(::open(path_.c_str(), flags, 0600));
        torn_ = false;
        return static_cast<bool>(file_);
    }

    std::string pathOf(int index) const {
        return index == 0 ? path_ : path_ + '.' + std::to_string(index);
    }

    void rotate(const struct stat& full) {
        const FileDescriptor lock(
            ::open((folder_ + "/log.lock").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600));
        if (!lock || ::flock(lock.get(), LOCK_EX) != 0)
            return;
        struct stat named {};
        const bool done = ::stat(path_.c_str(), &named) != 0 || named.st_ino != full.st_ino ||
                          named.st_dev != full.st_dev;
        if (done)
            return; // by another process
        for (int i = fileCount - 2; i >= 0; --i)
            std::rename(pathOf(i).c_str(), pathOf(i + 1).c_str());
    }

    std::string folder_;
    std::string path_;
    FileDescriptor file_;
    bool torn_ = false;
};

} // namespace

std::unique_ptr<JotSink> makeFileSink(std::string folder) {
    return std::make_unique<FileSink>(std::move(folder));
}

} // namespace platform
