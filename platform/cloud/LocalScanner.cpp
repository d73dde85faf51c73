#include "platform/cloud/LocalScanner.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/SyncTimes.h"
#include "platform/files/PathText.h"

#include <algorithm>

namespace platform {
namespace {

constexpr std::string_view rootMarkName = ".pelmora-root";

bool sameAsRow(const LocalRow& row, const FileAttributes& attributes) {
    return row.identity == attributes.identity && row.size == attributes.size &&
           row.modified == attributes.modified && row.changed == attributes.changed;
}

} // namespace

Failure LocalScanner::lookAtAll() {
    if (Failure failure = begin())
        return failure;
    if (Failure failure = known_.readEverything())
        return failure;
    visits_.push_back({"", rootItem});
    return lookAtVisits();
}

Failure LocalScanner::lookAt(const std::set<std::string>& folders) {
    whole_ = false;
    if (Failure failure = begin())
        return failure;
    visitKnown(folders);
    return fault_ ? fault_ : lookAtVisits();
}

Failure LocalScanner::begin() {
    if (readRootMark(context_.layout) != context_.mark)
        return makeErrorWithText(
            ErrorCode::databaseUnusable,
            localizedFormat(
                "The folder “%1$@” is not there. Connect its disk; nothing was changed.",
                context_.layout.root()));
    const Result<FileAttributes> root = context_.disk.attributes(context_.layout.root());
    if (!root)
        return root.error();
    device_ = root->identity.device;
    return std::nullopt;
}

Failure LocalScanner::lookAtVisits() {
    for (std::size_t visit = 0; visit < visits_.size(); ++visit) {
        if (cancel_.isCancelled())
            return makeError(ErrorCode::userCancelled);
        if (Failure failure = look(visit))
            return failure;
    }
    // A disk that went away in the middle leaves empty folders.
    if (readRootMark(context_.layout) != context_.mark)
        return makeError(ErrorCode::databaseUnusable, context_.layout.root());
    if (Failure failure = matchMoved())
        return failure;
    Failure failure;
    context_.queue.sync([&] {
        failure = writeDown();
        if (!failure && !again_)
            collectVanished();
        if (failure && again_ && failure->is(ErrorCode::changedWhileRead)) {
            platformLog(LogLevel::debug, "cloud: the disk changed under a look at it: %@",
                        *failure);
            failure.reset(); // nothing was written down
        }
    });
    return failure;
}

void LocalScanner::visitKnown(const std::set<std::string>& folders) {
    std::set<ItemId> begun;
    for (const std::string& folder : folders)
        if (Visit visit = nearestKnown(folder); begun.insert(visit.item).second)
            visits_.push_back(std::move(visit));
}

/// As far down as the disk is as it is known: what stands there instead is new where it stands.
LocalScanner::Visit LocalScanner::nearestKnown(const std::string& folder) {
    Visit visit{"", rootItem};
    std::size_t begin = 0;
    while (begin < folder.size()) {
        const std::size_t end = std::min(folder.find('/', begin), folder.size());
        const std::string path = folder.substr(0, end);
        fault_ = known_.readFolder(visit.item);
        if (fault_)
            break;
        const ItemState* known = known_.at(visit.item, folder.substr(begin, end - begin));
        const Result<FileAttributes> now = context_.disk.attributes(context_.pathOf(path));
        if (!known || known->item.kind != ItemKind::folder || !now ||
            now->kind != FileKind::directory || now->identity != known->local->identity)
            break;
        visit = {path, known->item.id};
        begin = end + 1;
    }
    return visit;
}

Failure LocalScanner::look(std::size_t visit) {
    const std::string path = visits_[visit].path;
    folders_.push_back(path);
    if (Failure failure = known_.readFolder(visits_[visit].item))
        return failure;
    const Result<std::vector<DirectoryEntry>> entries =
        context_.disk.entries(context_.pathOf(path));
    if (!entries) {
        if (path.empty())
            return entries.error();
        platformLog(LogLevel::warning, "cloud: cannot look into “%@”: %@", path, entries.error());
        blind_.insert(visits_[visit].item); // a notice tells when it can be read again
        if (!entries.error().is(ErrorCode::noSuchItem))
            unreadable_ = entries.error();
        return std::nullopt;
    }
    visits_[visit].read = true;
    readFolders_.insert(visits_[visit].item);
    for (const DirectoryEntry& entry : *entries)
        take(visit, entry);
    return fault_;
}

void LocalScanner::refuse(std::size_t visit, const std::string& name, std::string reason) {
    refused_.emplace_back(visit, RefusedRow{name, std::move(reason)});
}

void LocalScanner::takeUnreadable(std::size_t visit, const std::string& name, const Error& error) {
    const ItemState* known = known_.at(visits_[visit].item, name);
    if (error.is(ErrorCode::noSuchItem)) {
        lookAfter(visit, settleTime);
    } else if (known) {
        seen_.insert(known->item.id);
        blind_.insert(known->item.id);
        unreadable_ = error;
    } else if (hasSidecarForm(name)) {
        noteUnknownPromise(name, error);
    }
}

void LocalScanner::take(std::size_t visit, const DirectoryEntry& entry) {
    const Visit in = visits_[visit];
    if (in.path.empty() && entry.name == rootMarkName)
        return;
    const std::string path = joinedPath(in.path, entry.name);
    const Result<FileAttributes> attributes = context_.disk.attributes(context_.pathOf(path));
    if (!attributes)
        return takeUnreadable(visit, entry.name, attributes.error());
    if (attributes->kind == FileKind::symbolicLink)
        return refuse(visit, entry.name, localized("It is a symbolic link."));
    if (attributes->kind == FileKind::other)
        return refuse(visit, entry.name, localized("It is neither a file nor a folder."));
    const ItemState* known = known_.at(in.item, entry.name);
    if (attributes->identity.device != device_) {
        if (known) {
            seen_.insert(known->item.id);
            blind_.insert(known->item.id);
        }
        return refuse(visit, entry.name, localized("It lies on another disk than the store."));
    }
    const bool folder = attributes->kind == FileKind::directory;
    if (!folder && hasSidecarForm(entry.name))
        return takeSidecar(visit, entry.name, *attributes);
    Found found{path, {}, *attributes, 0, 0, visit, false, SIZE_MAX};
    // The folder of that place may have been met elsewhere already; then this is a new one.
    const bool elsewhere = folder && known && seen_.contains(known->item.id);
    if (known && !elsewhere && (known->item.kind == ItemKind::folder) == folder) {
        found.item = known->item.id;
        seen_.insert(found.item);
        const bool same = !known->local->promise && sameAsRow(*known->local, *attributes);
        if (same && !folder && !isYoung(attributes->modified, context_.clock.now()))
            return;
        if (folder && known->local->identity == attributes->identity) {
            if (whole_)
                visits_.push_back({path, found.item});
            else
                folders_.push_back(path);
            return;
        }
    } else if (folder) {
        if (const ItemState* other = folderElsewhere(attributes->identity)) {
            found.item = other->item.id;
            found.moved = true;
        }
    }
    note(std::move(found), visit, folder);
}

void LocalScanner::lookAfter(std::size_t visit, Duration delay) {
    settlesIn_ = std::max(settlesIn_.value_or(delay), delay);
    unsettled_.insert(visits_[visit].path);
}

void LocalScanner::note(Found found, std::size_t visit, bool isFolder) {
    found.folder = visit;
    if (!isFolder && isYoung(found.attributes.modified, context_.clock.now())) {
        lookAfter(visit, settleTimeOf(found.attributes.modified));
        youngFile_ = found.path;
    }
    if (isFolder) {
        found.opens = visits_.size();
        visits_.push_back({found.path, found.item});
    }
    found_.push_back(std::move(found));
}

/// Whose it is only its mark would tell: until it can be read no promise counts as gone.
void LocalScanner::noteUnknownPromise(const std::string& name, const Error& error) {
    platformLog(LogLevel::warning, "cloud: cannot read the promise “%@”: %@", name, error);
    unknownPromise_ = true;
}

void LocalScanner::takeSidecar(std::size_t visit, const std::string& name,
                               const FileAttributes& attributes) {
    const Visit in = visits_[visit];
    const std::string path = joinedPath(in.path, name);
    const Result<std::optional<SidecarMark>> read =
        examineMark(context_.pathOf(path), context_.mark);
    if (!read)
        return noteUnknownPromise(name, read.error());
    const std::optional<SidecarMark>& mark = *read;
    if (!mark && isHalfWritten(context_.pathOf(path), context_.mark)) {
        halfWritten_.push_back(path);
        return;
    }
    if (!mark)
        return refuse(
            visit, name,
            localized("Names that begin with “.” and end in “.promise” are kept for promises."));
    const std::string document = promisedName(name, *mark);
    const ItemState* known = known_.at(in.item, document);
    if (known && known->item.id == mark->item) {
        if (!known->local->promise) {
            spare_.push_back(path);
            return;
        }
        seen_.insert(mark->item);
        if (sameAsRow(*known->local, attributes))
            return;
    }
    note({joinedPath(in.path, document), path, attributes, mark->item, mark->item, visit,
          !known || known->item.id != mark->item, SIZE_MAX},
         visit, false);
}

} // namespace platform
