#include "platform/cloud/StoreTakingAway.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/KeyValueSync.h"
#include "platform/cloud/LocalContent.h"
#include "platform/cloud/StoreFileSystem.h"

#include <map>
#include <set>

namespace platform {
namespace {

constexpr std::string_view onlyHereEnd = " only here";

/// What both sides agreed on, of each document that the remote still had when it was seen last.
using Agreed = std::map<std::string, BaseRow>;

Agreed agreedIn(StateQueries& queries) {
    const std::vector<ItemId> gone = queries.missingFromRemote(1);
    const std::set<ItemId> missing(gone.begin(), gone.end());
    Agreed agreed;
    for (const ItemState& state : queries.localItems()) {
        const bool sure = state.item.kind == ItemKind::file && state.local &&
                          !state.local->promise && state.base && !state.base->hash.empty() &&
                          state.remote && !isDisplaced(*state.remote) &&
                          state.remote->etag == state.base->etag && !missing.contains(state.item.id);
        if (!sure)
            continue;
        if (std::optional<std::string> path = queries.localPathOf(state.item.id))
            agreed.emplace(std::move(*path), *state.base);
    }
    return agreed;
}

/// Goes through the tree on the disk, and, where that is wanted, takes away what may go.
class Sweep {
public:
    enum class Mode { look, takeAway };
    Sweep(const StoreLayout& layout, StoreFileSystem& disk, Agreed agreed, std::string mark,
          Mode mode, CancelFlag& cancel)
        : layout_(layout),
          disk_(disk),
          agreed_(std::move(agreed)),
          mark_(std::move(mark)),
          mode_(mode),
          cancel_(cancel) {}

    Failure run() { return folder(""); }
    std::vector<std::string> stays() { return std::move(stays_); }

private:
    Failure folder(const std::string& relative) {
        const std::string path = pathOf(relative);
        const Result<std::vector<DirectoryEntry>> entries = disk_.entries(path);
        if (!entries)
            return entries.error().is(ErrorCode::noSuchItem) && relative.empty()
                       ? std::nullopt
                       : Failure(entries.error());
        for (const DirectoryEntry& entry : *entries) {
            if (cancel_.isCancelled())
                return makeError(ErrorCode::userCancelled);
            const std::string name = relative.empty() ? entry.name : relative + '/' + entry.name;
            if (pathOf(name) == layout_.rootMark())
                continue;
            if (Failure failure = item(name))
                return failure;
        }
        if (mode_ == Mode::look || relative.empty())
            return std::nullopt;
        Failure failure = disk_.removeFolder(path);
        return failure && failure->is(ErrorCode::folderNotEmpty) ? std::nullopt : failure;
    }

    Failure item(const std::string& relative) {
        const std::string path = pathOf(relative);
        const Result<FileAttributes> attributes = disk_.attributes(path);
        if (!attributes)
            return attributes.error().is(ErrorCode::noSuchItem) ? std::nullopt
                                                                : Failure(attributes.error());
        if (attributes->kind == FileKind::directory)
            return folder(relative);
        const Result<bool> sent = attributes->kind == FileKind::file
                                      ? isSent(relative, *attributes)
                                      : Result<bool>(false);
        if (!sent)
            return sent.error();
        if (!*sent)
            stays_.push_back(relative);
        return *sent && mode_ == Mode::takeAway ? disk_.removeFile(path) : std::nullopt;
    }

    Result<bool> isSent(const std::string& relative, const FileAttributes& attributes) {
        const std::string path = pathOf(relative);
        const std::size_t slash = relative.rfind('/');
        if (hasSidecarForm(relative.substr(slash == std::string::npos ? 0 : slash + 1)) &&
            readMark(path, mark_))
            return true; // a promise holds nothing
        const auto found = agreed_.find(relative);
        if (found == agreed_.end() || found->second.size != attributes.size)
            return false;
        const BaseRow& base = found->second;
        if (mode_ == Mode::look && base.identity == attributes.identity &&
            base.modified == attributes.modified && base.changed == attributes.changed)
            return true;
        const Result<LocalContent> content = readLocalContent(disk_, path, cancel_);
        if (!content && content.error().is(ErrorCode::userCancelled))
            return content.error();
        return content && content->hash == base.hash;
    }

    std::string pathOf(const std::string& relative) const {
        return relative.empty() ? layout_.root() : layout_.root() + '/' + relative;
    }

    const StoreLayout& layout_;
    StoreFileSystem& disk_;
    const Agreed agreed_;
    const std::string mark_;
    const Mode mode_;
    CancelFlag& cancel_;
    std::vector<std::string> stays_;
};

Error interruptedWork() {
    return makeErrorWithText(ErrorCode::itemBusy,
                             localized("The store has work in it that was interrupted. Use it once "
                                       "more, so that it comes to its end, and sign out then."));
}

/// Content that is only in the staging folder, because a program was stopped in the middle.
bool hasInterruptedWork(StateQueries& queries, const StoreLayout& layout, StoreFileSystem& disk) {
    for (const OpRow& op : queries.operations())
        if (!op.staged.empty() && disk.attributes(layout.staging() + '/' + op.staged))
            return true;
    return false;
}

/// Everything else in the account's folder. What is only here stays.
void removeRest(const StoreLayout& layout, StoreFileSystem& disk, Clock& clock, bool treeStays) {
    const auto removing = [](const std::string& path) {
        Failure failure = FileManager::removeItem(Url::file(path));
        if (failure && !failure->is(ErrorCode::noSuchItem))
            platformLog(LogLevel::warning, "cloud: cannot remove %@: %@", path, *failure);
    };
    removing(layout.staging());
    if (const Result<std::vector<DirectoryEntry>> moments = disk.entries(layout.kept()))
        for (const DirectoryEntry& moment : *moments)
            if (!moment.name.ends_with(onlyHereEnd))
                removing(layout.kept() + '/' + moment.name);
    if (!KeyValueSync(layout.values(), disk, clock, {}).hasUnsent())
        removing(layout.values());
    if (!treeStays) {
        removing(layout.rootMark());
        if (const Failure failure = disk.removeFolder(layout.root()))
            platformLog(LogLevel::warning, "cloud: cannot remove %@: %@", layout.root(), *failure);
    }
    const Failure kept = disk.removeFolder(layout.kept());
    if (kept && !kept->is(ErrorCode::folderNotEmpty))
        platformLog(LogLevel::warning, "cloud: cannot remove %@: %@", layout.kept(), *kept);
}

} // namespace

Result<std::vector<std::string>> unsentDocuments(const StoreLayout& layout, StoreFileSystem& disk,
                                                 CancelFlag& cancel) {
    const std::optional<std::string> mark = readRootMark(layout);
    if (!mark)
        return std::vector<std::string>();
    Result<std::shared_ptr<StateReader>> reader = StateReader::open(layout.database());
    Agreed agreed;
    if (reader)
        agreed = (*reader)->ask(&agreedIn);
    Sweep sweep(layout, disk, std::move(agreed), *mark, Sweep::Mode::look, cancel);
    if (Failure failure = sweep.run())
        return *failure;
    return sweep.stays();
}

Result<std::vector<std::string>> takeStoreAway(const StoreLayout& layout, StoreFileSystem& disk,
                                               Clock& clock, CancelFlag& cancel) {
    if (!FileManager::exists(layout.folder))
        return std::vector<std::string>();
    Agreed agreed;
    std::string mark;
    std::optional<StoreLock> lock;
    {
        Result<OpenedStore> store = openStore(layout, disk, clock);
        if (!store)
            return store.error();
        if (hasInterruptedWork(*store->database, layout, disk))
            return interruptedWork();
        agreed = agreedIn(*store->database);
        if (const Failure fault = store->database->takeFault())
            return *fault;
        mark = store->mark;
        store->database.reset();
        lock.emplace(std::move(store->lock));
    }
    for (const std::string& records : {layout.database() + "-wal", layout.database() + "-shm",
                                       layout.database(), layout.session()})
        if (Failure failure = disk.removeFile(records))
            return *failure;
    if (Failure failure = disk.syncFolder(layout.folder))
        return *failure;
    Sweep sweep(layout, disk, std::move(agreed), mark, Sweep::Mode::takeAway, cancel);
    if (Failure failure = sweep.run())
        return *failure;
    std::vector<std::string> stays = sweep.stays();
    removeRest(layout, disk, clock, !stays.empty());
    lock.reset();
    if (const Failure failure = disk.removeFile(layout.lock()))
        platformLog(LogLevel::warning, "cloud: cannot remove %@: %@", layout.lock(), *failure);
    const Failure left = disk.removeFolder(layout.folder);
    if (left && !left->is(ErrorCode::folderNotEmpty))
        platformLog(LogLevel::warning, "cloud: cannot remove %@: %@", layout.folder, *left);
    return stays;
}

} // namespace platform
