#include "platform/cloud/StoreFolder.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/Tokens.h"

#include <cerrno>
#include <fcntl.h>
#include <sys/file.h>
#include <unistd.h>

namespace platform {
namespace {

constexpr std::string_view markPrefix = "pelmora store ";
constexpr std::uint64_t largestMark = 256;

std::string lockHolder(int file) {
    char text[64] = {};
    const ssize_t length = pread(file, text, sizeof(text) - 1, 0);
    return length > 0 ? std::string(text, static_cast<std::size_t>(length)) : std::string("?");
}

Error otherTree(const StoreLayout& layout) {
    return makeErrorWithText(
        ErrorCode::databaseUnusable,
        localizedFormat("The folder “%1$@” is not the one that this store was made with. Put it "
                        "back, or move “%2$@” away to begin anew; nothing was changed.",
                        layout.root(), layout.database()));
}

/// Makes the tree's mark, or reads it. With a database there must be one.
Result<std::string> rootMark(const StoreLayout& layout, StoreFileSystem& disk, bool haveDatabase) {
    if (const std::optional<std::string> mark = readRootMark(layout))
        return *mark;
    if (haveDatabase)
        return otherTree(layout);
    if (Failure failure = disk.makeFolder(layout.root());
        failure && !failure->is(ErrorCode::fileExists))
        return *failure;
    const std::string mark = hexText(randomBytes(8));
    if (Failure failure =
            disk.writeSmallFile(layout.rootMark(), std::string(markPrefix) + mark + '\n'))
        return *failure;
    return mark;
}

/// Moves a damaged database out of the way, for whoever wants to look at it.
Result<std::string> setAside(const StoreLayout& layout, StoreFileSystem& disk, Clock& clock) {
    const std::string stamp =
        ".damaged-" + std::to_string(clock.now().wholeSeconds()) + '-' + hexText(randomBytes(3));
    for (const char* part : {"-wal", "-shm", ""}) {
        const std::string from = layout.database() + part;
        if (Failure failure = disk.rename(from, layout.database() + stamp + part);
            failure && !failure->is(ErrorCode::noSuchItem))
            return *failure;
    }
    return layout.database() + stamp;
}

/// A device's number may differ after a restart; the mark has proved that the tree is the same.
Failure adoptDevice(StateDatabase& database, std::uint64_t device) {
    const std::string now = std::to_string(device);
    const std::string before = database.meta("device");
    if (before == now)
        return database.takeFault();
    return database.transaction([&]() -> Failure {
        database.replaceDevice(before, now);
        return std::nullopt;
    });
}

/// Promises on the disk have numbers of items. A database that was put back from a copy would give
/// some of those out a second time: it is told by the session that it remembers, and goes on with
/// numbers of its own.
Failure beginSession(const StoreLayout& layout, StoreFileSystem& disk, StateDatabase& database) {
    constexpr const char* key = "session";
    const Result<Bytes> last = FileManager::contents(Url::file(layout.session()), largestMark);
    if (!last && !last.error().is(ErrorCode::noSuchItem))
        return last.error();
    const std::string remembered = database.meta(key);
    const bool same =
        last &&
        remembered == std::string_view(reinterpret_cast<const char*>(last->data()), last->size());
    if (!remembered.empty() && !same) {
        platformLog(LogLevel::warning, "cloud: the records are not those of the last time");
        if (Failure failure = database.beginNewNumbers())
            return failure;
    }
    const std::string now = hexText(randomBytes(8));
    if (Failure failure = database.transaction([&]() -> Failure {
            if (!remembered.empty() && !same)
                database.setMeta(restoredKey, now);
            database.setMeta(key, now);
            return std::nullopt;
        }))
        return failure;
    return disk.writeSmallFile(layout.session(), now);
}

Result<std::unique_ptr<StateDatabase>> openDatabase(const StoreLayout& layout,
                                                    StoreFileSystem& disk, Clock& clock,
                                                    bool afterCrash,
                                                    std::optional<std::string>& notice) {
    Result<std::unique_ptr<StateDatabase>> database =
        StateDatabase::open(layout.database(), afterCrash);
    if (database || !database.error().is(ErrorCode::readCorrupt))
        return database;
    const Result<std::string> aside = setAside(layout, disk, clock);
    if (!aside)
        return aside.error();
    notice = localizedFormat("The store's records were damaged. They were set aside as “%1$@” and "
                             "are made anew from the disk and the account.",
                             *aside);
    platformLog(LogLevel::error, "cloud: database damaged, set aside as %@: %@", *aside,
                database.error());
    return StateDatabase::open(layout.database(), false);
}

} // namespace

StoreLayout StoreLayout::of(const Folders& folders, const AccountRecord& account) {
    return {folders.data + "/pelmora/" + storeFolderName(account)};
}

Result<StoreLock> StoreLock::acquire(const StoreLayout& layout) {
    const std::string path = layout.lock();
    FileDescriptor file(open(path.c_str(), O_RDWR | O_CREAT | O_CLOEXEC | O_NOFOLLOW, 0600));
    if (!file)
        return posixError(errno, Url::file(path), true);
    if (flock(file.get(), LOCK_EX | LOCK_NB) != 0) {
        if (errno != EWOULDBLOCK)
            return posixError(errno, Url::file(path), true);
        return makeErrorWithText(
            ErrorCode::itemBusy,
            localizedFormat("The store is in use by another program (process %1$@). Wait until it "
                            "has finished, or close it.",
                            lockHolder(file.get())));
    }
    StoreLock lock(std::move(file));
    lock.afterCrash_ = lseek(lock.file_.get(), 0, SEEK_END) > 0;
    const std::string self = std::to_string(getpid());
    if (ftruncate(lock.file_.get(), 0) != 0 ||
        pwrite(lock.file_.get(), self.data(), self.size(), 0) < 0)
        platformLog(LogLevel::warning, "cloud: cannot write %@", path); // only names the holder
    return lock;
}

StoreLock::~StoreLock() {
    if (file_ && !keepMark_ && ftruncate(file_.get(), 0) != 0)
        platformLog(LogLevel::warning, "cloud: the lock file looks like that of a crash");
}

std::optional<std::string> readRootMark(const StoreLayout& layout) {
    const Result<Bytes> content = FileManager::contents(Url::file(layout.rootMark()), largestMark);
    if (!content)
        return std::nullopt;
    std::string_view text(reinterpret_cast<const char*>(content->data()), content->size());
    while (text.ends_with('\n'))
        text.remove_suffix(1);
    if (!text.starts_with(markPrefix) || !bytesOfHex(text.substr(markPrefix.size())))
        return std::nullopt;
    return std::string(text.substr(markPrefix.size()));
}

Result<OpenedStore> openStore(const StoreLayout& layout, StoreFileSystem& disk, Clock& clock) {
    for (const std::string& folder : {layout.folder, layout.staging(), layout.kept()})
        if (Failure failure = FileManager::createDirectory(Url::file(folder), true))
            return *failure;
    Result<StoreLock> lock = StoreLock::acquire(layout);
    if (!lock)
        return lock.error();
    const bool haveDatabase = FileManager::exists(layout.database());
    const Result<std::string> mark = rootMark(layout, disk, haveDatabase);
    if (!mark)
        return mark.error();
    std::optional<std::string> notice;
    Result<std::unique_ptr<StateDatabase>> database =
        openDatabase(layout, disk, clock, lock->afterCrash(), notice);
    if (!database)
        return database.error();
    const std::string recorded = (*database)->meta("store");
    if (!recorded.empty() && recorded != *mark)
        return otherTree(layout);
    const Result<FileAttributes> root = disk.attributes(layout.root());
    if (!root)
        return root.error();
    if (recorded.empty())
        if (Failure failure = (*database)->transaction([&]() -> Failure {
                (*database)->setMeta("store", *mark);
                return std::nullopt;
            }))
            return *failure;
    if (Failure failure = adoptDevice(**database, root->identity.device))
        return *failure;
    if (Failure failure = beginSession(layout, disk, **database))
        return *failure;
    return OpenedStore{std::move(*lock), *mark, std::move(*database), std::move(notice)};
}

} // namespace platform
