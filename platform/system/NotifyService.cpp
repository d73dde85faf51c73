#include "platform/system/NotifyService.h"

#include "platform/base/Log.h"
#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"
#include "platform/files/ItemWatch.h"
#include "platform/files/PathText.h"

#include <cerrno>
#include <fcntl.h>
#include <mutex>
#include <optional>
#include <utility>

namespace platform {
namespace {

/// A notice's file is emptied when it has become that long.
constexpr off_t fileLimit = 4096;

/// Tells whether a file's state changed since it was asked last; false the first time.
class FileChanges {
public:
    /// What makes a change: a file that only grows has one with each new size. Its date would tell
    /// of the same write twice, because the kernel sets it a moment before the size.
    enum class By { size, sizeAndDate };

    FileChanges(std::string path, By by) : path_(std::move(path)), by_(by) {}

    bool happened() {
        const std::lock_guard lock(mutex_);
        const State now = read();
        return std::exchange(known_, now).value_or(now) != now;
    }

private:
    struct State {
        FileIdentity identity;
        std::uint64_t size = 0;
        Date modified;
        bool operator==(const State&) const = default;
    };

    State read() const {
        const auto found = FileManager::attributes(path_, FollowLinks::yes);
        if (!found)
            return {};
        return {found->identity, found->size, by_ == By::sizeAndDate ? found->modified : Date()};
    }

    std::string path_;
    By by_;
    std::mutex mutex_;
    std::optional<State> known_;
};

class FileNotifyService final : public NotifyService {
public:
    FileNotifyService(std::string folder, std::string managedFile)
        : folder_(std::move(folder)), managedFile_(std::move(managedFile)) {}
    /// Whoever still holds a token hears nothing more.
    ~FileNotifyService() override {
        for (const std::weak_ptr<Observer>& each : observers_)
            if (const std::shared_ptr<Observer> observer = each.lock())
                observer->watches.clear();
    }

    Token observe(std::string_view name, Executor& queue, Job handler) override {
        makeFolder();
        const std::string path = pathOf(name);
        open(path); // so that the first notice is one change of the file, not two
        auto observer = std::make_shared<Observer>();
        observer->watcher = watcher_;
        const auto shared = std::make_shared<const Job>(std::move(handler));
        observer->watch(path, FileChanges::By::size, queue, shared);
        if (name == managedSettingsChangedNotice)
            observer->watch(managedFile_, FileChanges::By::sizeAndDate, queue, shared);
        const std::lock_guard lock(mutex_);
        std::erase_if(observers_, [](const auto& each) { return each.expired(); });
        observers_.push_back(observer);
        return observer;
    }

    /// A byte more: each notice changes the file's size, however quickly one follows another.
    void post(std::string_view name) override {
        makeFolder();
        const std::string path = pathOf(name);
        const FileDescriptor file = open(path);
        const bool full = file && ::lseek(file.get(), 0, SEEK_END) >= fileLimit;
        if (!file || (full && ::ftruncate(file.get(), 0) != 0) || ::write(file.get(), ".", 1) != 1)
            platformLogLater(LogLevel::error, "Cannot post the notice %@: %@", name,
                             posixError(errno, Url::file(path), true));
    }

private:
    struct Observer {
        std::shared_ptr<DirectoryWatcher> watcher;
        std::vector<std::unique_ptr<ItemWatch>> watches;

        void watch(const std::string& path, FileChanges::By by, Executor& queue,
                   const std::shared_ptr<const Job>& handler) {
            const auto file = std::make_shared<FileChanges>(path, by);
            watches.push_back(std::make_unique<ItemWatch>(*watcher, path, ItemWatch::Scope::item,
                                                          queue, [file, handler] {
                                                              if (file->happened())
                                                                  (*handler)();
                                                          }));
            // Only now, when the watch hears what comes: a notice in between is not lost.
            file->happened();
        }
    };

    static FileDescriptor open(const std::string& path) {
        return FileDescriptor(::open(PathText(path).c_str(),
                                     O_WRONLY | O_APPEND | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0600));
    }

    void makeFolder() const {
        if (FileManager::exists(folder_))
            return;
        if (const Failure failure = FileManager::createDirectory(Url::file(folder_), true))
            platformLogLater(LogLevel::error, "No folder for notices: %@", *failure);
    }

    std::string pathOf(std::string_view name) const { return folder_ + '/' + percentEncoded(name); }

    std::string folder_;
    std::string managedFile_;
    std::mutex mutex_;
    std::vector<std::weak_ptr<Observer>> observers_; // guarded by mutex_
    std::shared_ptr<DirectoryWatcher> watcher_ = std::make_shared<DirectoryWatcher>();
};

} // namespace

std::unique_ptr<NotifyService> makeNotifyService(std::string folder, std::string managedFile) {
    return std::make_unique<FileNotifyService>(std::move(folder), std::move(managedFile));
}

} // namespace platform
