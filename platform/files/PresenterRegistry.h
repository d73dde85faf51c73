#pragma once

#include "platform/base/WorkQueue.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/ItemWatch.h"
#include "platform/files/PresentedItemState.h"

#include <atomic>
#include <map>
#include <mutex>

namespace platform {

/// One registered presenter and what is known of its item. The fields below `registered` belong to
/// the registry's lock.
struct PresenterRecord : std::enable_shared_from_this<PresenterRecord> {
    explicit PresenterRecord(const std::shared_ptr<FilePresenter>& one)
        : presenter(one), key(one.get()) {}

    const std::weak_ptr<FilePresenter> presenter;
    const FilePresenter* const key;
    std::atomic<bool> registered{true};

    /// What the presenter answered last for its URL.
    std::optional<std::string> answer;
    /// Where the item is: that answer, or where the item went since. "" for none.
    std::string path;
    PresentedItemState state;
    ItemHandle handle;
    /// Counts every change of path and state.
    std::uint64_t version = 0;
    /// Of a folder: the state of its direct entries that the presenter knows, by name.
    std::map<std::string, PresentedItemState> entries;
    /// Counts every change of `entries`.
    std::uint64_t entriesVersion = 0;
    /// Notices of entries that came while somebody wrote, to be looked into when he has finished.
    std::vector<DirectoryChange> postponed;
    /// When the item was first found missing; it is given a moment to come back.
    std::optional<Duration> missingSince;
    std::unique_ptr<ItemWatch> watch;
    DirectoryWatcher::Token entriesWatch;
};
using PresenterRecordPointer = std::shared_ptr<PresenterRecord>;

/// What one coordinated write touches, from before its accessor runs until after.
struct WriteScope {
    struct Item {
        std::string path;
        WritingOptions options;
    };
    std::vector<Item> items;
    /// From and to, in the order in which the accessor told of them.
    std::vector<std::pair<std::string, std::string>> moves;
    /// Further paths to which the accessor is about to do something.
    std::vector<std::string> announced;
    /// Hears nothing of this write.
    const FilePresenter* own = nullptr;

    bool meets(std::string_view path) const;
    bool has(WritingOptions options) const;
};

/// All registered presenters of the process: tells them of coordinated changes and of those that
/// other programs make, each change once. No presenter is ever called with the registry's lock
/// held, nor on the caller's thread except to ask for its URL and queue. Safe from any thread.
class PresenterRegistry {
public:
    using Notice = std::function<void(FilePresenter&)>;

    static PresenterRegistry& shared();

    void add(const std::shared_ptr<FilePresenter>& presenter);
    void remove(const FilePresenter* presenter);

    /// Those that present the item, something below it or a folder above it.
    std::vector<PresenterRecordPointer> presentersMeeting(std::string_view path);
    std::string pathOf(const PresenterRecord& record);
    /// Runs the notice on the presenter's queue unless it was removed by then.
    static void post(const PresenterRecordPointer& record, Notice notice);

    /// Between begin and end, changes of what the scope touches are not taken for somebody else's;
    /// at the end they are told.
    void beginWrite(const WriteScope& scope);
    void noteAnnounced(WriteScope& scope, const std::string& path);
    void noteMove(WriteScope& scope, const std::string& from, const std::string& to);
    void endWrite(const WriteScope& scope);

    /// Until all that is queued for examination has been examined.
    void waitUntilIdle() {
        queue_.sync([] {});
    }

private:
    PresenterRegistry() = default;

    std::vector<PresenterRecordPointer> all();
    /// Asks the presenter for its URL and follows a new answer. False when the presenter is gone.
    bool askForUrl(const PresenterRecordPointer& record);
    void setPath(const PresenterRecordPointer& record, const std::string& path);
    PresentedItemState refresh(PresenterRecord& record, bool keepMissing);
    void store(PresenterRecord& record, const PresentedItemState& state);

    void finishWrite(const WriteScope& scope, const PresenterRecordPointer& record);
    bool changedByWrite(const WriteScope& scope, const PresenterRecordPointer& record,
                        const std::string& path);

    // Changes by other programs; PresenterRegistryWatch.cpp. All but the first on queue_.
    void examineLater(const PresenterRecordPointer& record);
    void examine(const PresenterRecordPointer& record);
    void itemMissing(const PresenterRecordPointer& record, std::uint64_t version);
    void itemGone(const PresenterRecordPointer& record, std::uint64_t version);
    void watchEntries(PresenterRecord& record);
    void takeUpPostponed();
    void entriesChanged(const PresenterRecordPointer& record,
                        const std::vector<DirectoryChange>& changes);
    std::optional<PresentedItemState> newEntryState(PresenterRecord& record,
                                                    const std::string& folder,
                                                    const DirectoryChange& change);
    static bool noteEntry(PresenterRecord& record, const std::string& name,
                          const PresentedItemState& now);
    void noteEntries(PresenterRecord& record, const WriteScope& scope, const std::string& folder);
    void noteAllEntries(PresenterRecord& record, const std::string& folder);
    bool beingWritten(std::string_view path) const;

    mutable std::mutex mutex_;
    std::vector<PresenterRecordPointer> records_;
    std::vector<const WriteScope*> scopes_;
    DirectoryWatcher watcher_;
    WorkQueue queue_{"file-presenters", WorkPriority::utility};
};

} // namespace platform
