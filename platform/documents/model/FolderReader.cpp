#include "platform/documents/model/FolderReader.h"

#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/Sidecar.h"
#include "platform/documents/model/Parallel.h"
#include "platform/files/FileManager.h"
#include "platform/launch/TypeRegistry.h"

#include <algorithm>
#include <unordered_set>

namespace platform {
namespace {

/// Beyond that, one pass over the folder is cheaper than a look at each name.
constexpr std::size_t mostSingleLooks = 1024;

bool isHidden(std::string_view name) {
    return name.starts_with('.');
}

/// The name that a promise of this name stands for, unless its mark says otherwise.
std::string plainNameOf(std::string_view sidecar) {
    return promisedName(sidecar, {});
}

EntryKind kindOf(FileKind kind, std::string_view name) {
    if (kind != FileKind::directory)
        return EntryKind::file;
    return TypeRegistry::isPackageName(name) ? EntryKind::package : EntryKind::folder;
}

} // namespace

struct FolderReader::Names {
    std::vector<DirectoryEntry> plain;
    std::vector<std::string> sidecars;
};

FolderReader::FolderReader(Url folder, const CloudDocumentService& documents)
    : folder_(std::move(folder)), documents_(documents) {
}

Result<FolderReader::Names> FolderReader::readNames(const CancelFlag& cancel) const {
    Names names;
    const Failure failure =
        FileManager::enumerate(folder_.path(), [&](const DirectoryEntry& entry) {
            if (!isHidden(entry.name))
                names.plain.push_back(entry);
            else if (hasSidecarForm(entry.name))
                names.sidecars.push_back(entry.name);
            return !cancel.isCancelled();
        });
    if (failure)
        return *failure;
    return names;
}

Result<std::vector<DocumentEntry>> FolderReader::readAll(const CancelFlag& cancel) {
    Result<Names> names = readNames(cancel);
    if (!names)
        return names.error();
    std::vector<DocumentEntry> entries;
    entries.reserve(names->plain.size() + names->sidecars.size());
    for (DirectoryEntry& found : names->plain)
        entries.push_back(entryFor(std::move(found)));
    shortened_.clear();
    if (!names->sidecars.empty())
        addPromises(names->sidecars, entries, cancel);
    return entries;
}

/// There must be room in `entries`: their names are looked at while more are added.
void FolderReader::addPromises(const std::vector<std::string>& sidecars,
                               std::vector<DocumentEntry>& entries, const CancelFlag& cancel) {
    // Each mark is a system call on a file of its own, which is most of the work for a store whose
    // contents are still in the cloud.
    const std::size_t count = sidecars.size();
    std::vector<std::optional<std::string>> promised(count);
    const std::size_t pieces = parallelPieces(count);
    inParallel(pieces, [&](std::size_t piece) {
        const std::size_t end = count * (piece + 1) / pieces;
        for (std::size_t i = count * piece / pieces; i < end && !cancel.isCancelled(); ++i)
            promised[i] = promisedBy(sidecars[i]);
    });
    // A document that has arrived a moment ago may have its promise still beside it.
    std::unordered_set<std::string_view> present;
    for (const DocumentEntry& each : entries)
        present.insert(each.name);
    for (std::size_t i = 0; i < count; ++i) {
        const std::string& sidecar = sidecars[i];
        if (!promised[i])
            entries.push_back({sidecar, EntryKind::file, false, nullptr});
        else if (!isHidden(*promised[i]) && !present.contains(*promised[i]))
            entries.push_back({*promised[i], EntryKind::file, true, nullptr});
        if (promised[i] && *promised[i] != plainNameOf(sidecar))
            shortened_.emplace(sidecar, *promised[i]);
    }
}

std::optional<std::string> FolderReader::promisedBy(const std::string& sidecar) const {
    const std::optional<Url> document = documents_.logicalURLOfPromise(folder_.appending(sidecar));
    if (!document)
        return std::nullopt;
    return std::string(document->lastPathComponent());
}

DocumentEntry FolderReader::entryFor(DirectoryEntry found) const {
    FileKind kind = found.kind;
    if (kind == FileKind::symbolicLink || kind == FileKind::other) {
        // A link is what it leads to; one that leads nowhere is a document that cannot be opened.
        const auto attributes =
            FileManager::attributes(folder_.appending(found.name).path(), FollowLinks::yes);
        kind = attributes ? attributes->kind : FileKind::file;
    }
    const EntryKind shown = kindOf(kind, found.name);
    return {std::move(found.name), shown, false, nullptr};
}

/// What stands under a name now, whichever notice led to it.
EntryFact FolderReader::factFor(const std::string& name) const {
    EntryFact fact{{name, EntryKind::file, false, nullptr}, false};
    const Url url = folder_.appending(name);
    const auto attributes = FileManager::attributes(url.path(), FollowLinks::no);
    if (isHidden(name)) {
        fact.present = hasSidecarForm(name) && attributes && !documents_.isPromiseAtURL(url);
    } else if (attributes) {
        fact = {entryFor({name, attributes->kind}), true};
    } else if (documents_.isPromised(url)) {
        fact.entry.promised = true;
        fact.present = true;
    }
    return fact;
}

/// Gathers the names that a list shows of what notices tell of files on the disk.
class FolderReader::Notices {
public:
    explicit Notices(FolderReader& reader) : reader_(reader) {}

    void take(const DirectoryChange& change) {
        using Kind = DirectoryChange::Kind;
        const bool leaves = change.kind == Kind::removed || change.kind == Kind::movedFrom;
        const std::optional<std::string> shown = shownName(change.name, leaves);
        if (change.kind == DirectoryChange::Kind::movedFrom && shown) {
            from_ = Half{change.cookie, *shown};
        } else if (change.kind == DirectoryChange::Kind::movedTo && shown && from_ &&
                   from_->cookie == change.cookie && from_->name != *shown) {
            renamings.push_back({from_->name, *shown});
            from_.reset();
        }
    }

    /// A name that calls for a look at the disk.
    struct Name {
        std::string name;
        /// Something was said to have left. Without that an item that is not there any more has
        /// only been outrun: the notice that follows tells whether it went or got another name.
        bool left = false;
    };

    std::vector<EntryRenaming> renamings;
    std::vector<Name> names;

private:
    struct Half {
        std::uint32_t cookie;
        std::string name;
    };

    void add(const std::string& name, bool left) {
        const auto [known, isNew] = places_.try_emplace(name, names.size());
        if (isNew)
            names.push_back({name, left});
        else
            names[known->second].left |= left;
    }

    /// The name under which the file's row stands, or stood.
    std::optional<std::string> shownName(const std::string& file, bool leaves) {
        if (!isHidden(file)) {
            add(file, leaves);
            return file;
        }
        if (!hasSidecarForm(file))
            return std::nullopt;
        // A promise may end without leaving: its mark is what makes it one.
        add(file, true);
        std::string document = plainNameOf(file);
        if (const auto known = reader_.shortened_.find(file); known != reader_.shortened_.end())
            document = known->second;
        if (const std::optional<std::string> now = reader_.promisedBy(file)) {
            if (*now != document) {
                add(document, true);
                document = *now;
                reader_.shortened_[file] = *now;
            }
        }
        add(document, true);
        return document;
    }

    FolderReader& reader_;
    std::optional<Half> from_;
    std::unordered_map<std::string, std::size_t> places_;
};

std::optional<EntryChanges> FolderReader::resolve(const std::vector<DirectoryChange>& changes) {
    Notices notices(*this);
    for (const DirectoryChange& change : changes) {
        if (change.kind == DirectoryChange::Kind::overflow ||
            notices.names.size() > mostSingleLooks)
            return std::nullopt;
        if (!change.name.empty())
            notices.take(change);
    }
    EntryChanges result{std::move(notices.renamings), {}};
    result.facts.reserve(notices.names.size());
    for (const Notices::Name& each : notices.names)
        if (EntryFact fact = factFor(each.name); fact.present || each.left)
            result.facts.push_back(std::move(fact));
    return result;
}

std::optional<std::size_t> FolderReader::count(const Url& folder,
                                               const CloudDocumentService& documents,
                                               const CancelFlag& cancel) {
    FolderReader reader(folder, documents);
    const Result<Names> names = reader.readNames(cancel);
    if (!names || cancel.isCancelled())
        return std::nullopt;
    if (names->sidecars.empty())
        return names->plain.size();
    const Result<std::vector<DocumentEntry>> entries = reader.readAll(cancel);
    if (!entries || cancel.isCancelled())
        return std::nullopt;
    return entries->size();
}

} // namespace platform
