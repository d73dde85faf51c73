#pragma once

#include "platform/base/Clock.h"
#include "platform/base/Folders.h"
#include "platform/base/Result.h"
#include "platform/cloud/StateDatabase.h"
#include "platform/files/FileDescriptor.h"

#include <memory>
#include <optional>
#include <string>

namespace platform {

class StoreFileSystem;
struct AccountRecord;

/// Where the parts of an account's store lie. See docs/store.md.
struct StoreLayout {
    /// $XDG_DATA_HOME/pelmora/<account>
    std::string folder;

    static StoreLayout of(const Folders& folders, const AccountRecord& account);
    std::string root() const { return folder + "/Shelfroot"; }
    std::string rootMark() const { return root() + "/.pelmora-root"; }
    std::string database() const { return folder + "/state.db"; }
    std::string staging() const { return folder + "/staging"; }
    std::string kept() const { return folder + "/kept"; }
    /// Which of the database's states was the last one.
    std::string session() const { return folder + "/session"; }
    std::string values() const { return folder + "/keyvalue.json"; }
    std::string lock() const { return folder + "/lock"; }
};

/// The right to change a store: one process has it at a time, and it ends with the process.
class StoreLock {
public:
    /// itemBusy, naming the process, when another one has it.
    static Result<StoreLock> acquire(const StoreLayout& layout);
    ~StoreLock();
    StoreLock(StoreLock&&) noexcept = default;
    StoreLock& operator=(StoreLock&&) noexcept = default;
    /// The last one that had it ended without giving it back.
    bool afterCrash() const { return afterCrash_; }
    /// The next one that gets it is to look for damage.
    void keepCrashMark() { keepMark_ = true; }

private:
    explicit StoreLock(FileDescriptor file) : file_(std::move(file)) {}
    FileDescriptor file_;
    bool afterCrash_ = false;
    bool keepMark_ = false;
};

/// A store that may be changed.
struct OpenedStore {
    StoreLock lock;
    /// What this store's promises are marked with.
    std::string mark;
    std::unique_ptr<StateDatabase> database;
    /// What had to be done to open it, for people; none when nothing.
    std::optional<std::string> notice;
};

/// Opens the store, making what is missing. A damaged database is set aside and a new one begun. A
/// store whose tree is not there, or is another one, is refused and stays as it is.
Result<OpenedStore> openStore(const StoreLayout& layout, StoreFileSystem& disk, Clock& clock);
/// The mark of the tree, for reading without the lock; none when there is no tree.
std::optional<std::string> readRootMark(const StoreLayout& layout);

} // namespace platform
