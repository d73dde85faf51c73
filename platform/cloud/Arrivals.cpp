#include "platform/cloud/Arrivals.h"

#include "platform/base/Text.h"
#include "platform/cloud/ContainerFile.h"
#include "platform/cloud/ContainerSet.h"
#include "platform/cloud/ContentHash.h"
#include "platform/cloud/Sidecar.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

/// Why a disk cannot have an item of that name; none when it can.
std::optional<std::string> nameProblem(const std::string& name, const Arrivals::Spot& spot) {
    if (name.empty() || name == "." || name == ".." || name.find('/') != std::string::npos ||
        name.find('\0') != std::string::npos)
        return localized("The disk cannot have an item of that name.");
    if (name.size() > longestName)
        return localized("The name is too long for the disk.");
    if (hasSidecarForm(name) || (spot.relative.empty() && name == ".pelmora-root"))
        return localized("The name is one that the store uses itself.");
    return std::nullopt;
}

BaseRow baseOf(const Place& place, const RemoteEntry& entry, const FileAttributes& here,
               Bytes hash = {}) {
    return baseRowOf(place, entry.etag, entry.size, std::move(hash), here);
}

} // namespace

bool Arrivals::isFetchedAtOnce(const Spot& spot, const RemoteEntry& entry) {
    return entry.name == containerFileName && entry.kind == ItemKind::file &&
           !spot.relative.empty() && spot.relative.find('/') == std::string::npos &&
           entry.size <= largestContainerFile;
}

Result<Arrivals::Outcome> Arrivals::arrive(const Spot& spot, const RemoteEntry& entry,
                                           std::optional<ItemId> item) {
    Outcome outcome;
    outcome.refused = nameProblem(entry.name, spot);
    if (outcome.refused)
        return outcome;
    outcome.item = item ? *item : context_.database.newItemId();
    if (spot.names.contains(entry.name))
        return takeExisting(spot, entry, std::move(outcome));
    if (entry.kind == ItemKind::folder)
        return takeFolder(spot, entry, std::move(outcome));
    if (isFetchedAtOnce(spot, entry))
        return fetch(spot, entry, std::move(outcome));
    return promise(spot, entry, std::move(outcome));
}

Result<Arrivals::Outcome> Arrivals::takeFolder(const Spot& spot, const RemoteEntry& entry,
                                               Outcome outcome) {
    const std::string path = spot.path + '/' + entry.name;
    if (Failure failure = context_.disk.makeFolder(path)) {
        if (failure->is(ErrorCode::fileExists)) // made by somebody a moment ago
            return takeExisting(spot, entry, std::move(outcome));
        return *failure;
    }
    const Result<FileAttributes> attributes = context_.disk.attributes(path);
    if (!attributes)
        return attributes.error();
    const Place place{spot.folder, entry.name};
    outcome.madeFolder = true;
    outcome.local = localRowOf(place, *attributes, false);
    outcome.base = baseOf(place, entry, *attributes);
    return outcome;
}

Result<Arrivals::Outcome> Arrivals::takeExisting(const Spot& spot, const RemoteEntry& entry,
                                                 Outcome outcome) {
    const Result<FileAttributes> attributes =
        context_.disk.attributes(spot.path + '/' + entry.name);
    if (!attributes)
        return attributes.error();
    const bool folder = attributes->kind == FileKind::directory;
    if (attributes->kind != FileKind::file && !folder)
        outcome.refused = localized("Something else has that name on the device.");
    else if (folder && entry.kind == ItemKind::file)
        outcome.refused = localized("A folder on the device has that name.");
    else if (!folder && entry.kind == ItemKind::folder)
        outcome.refused = localized("A file on the device has that name.");
    if (outcome.refused)
        return outcome;
    const Place place{spot.folder, entry.name};
    outcome.local = localRowOf(place, *attributes, false);
    // Two folders of one name are one folder. Two files have nothing in common until their
    // contents were compared: no base.
    if (folder)
        outcome.base = baseOf(place, entry, *attributes);
    return outcome;
}

Result<Arrivals::Outcome> Arrivals::promise(const Spot& spot, const RemoteEntry& entry,
                                            Outcome outcome) {
    const SidecarName usual = sidecarNameFor(entry.name);
    if (!usual.needsName && !spot.names.empty()) {
        const SidecarName cut = shortenedSidecarNameFor(entry.name);
        if (spot.names.contains(cut.text)) { // an earlier run found the usual name taken
            const Result<std::optional<Outcome>> taken = takeOver(spot, cut, entry, outcome);
            if (!taken)
                return taken.error();
            if (*taken)
                return **taken;
        }
    }
    Result<std::optional<Outcome>> made = promiseAs(usual, spot, entry, outcome);
    if (made && !*made && !usual.needsName)
        made = promiseAs(shortenedSidecarNameFor(entry.name), spot, entry, outcome);
    if (!made)
        return made.error();
    if (*made)
        return std::move(**made);
    outcome.refused = localized("Files on the device have the names that its promise would need.");
    return outcome;
}

Result<std::optional<Arrivals::Outcome>> Arrivals::promiseAs(const SidecarName& name,
                                                             const Spot& spot,
                                                             const RemoteEntry& entry,
                                                             const Outcome& outcome) {
    const SidecarMark mark{context_.mark, outcome.item,
                           name.needsName ? entry.name : std::string()};
    const Result<FileAttributes> made =
        context_.disk.makeSidecar(spot.path + '/' + name.text, encodedMark(mark));
    if (!made && made.error().is(ErrorCode::fileExists))
        return takeOver(spot, name, entry, outcome);
    if (!made)
        return made.error();
    const Place place{spot.folder, entry.name};
    Outcome promised = outcome;
    promised.local = localRowOf(place, *made, true);
    promised.base = baseOf(place, entry, *made);
    return std::optional(std::move(promised));
}

Result<std::optional<Arrivals::Outcome>> Arrivals::takeOver(const Spot& spot,
                                                            const SidecarName& name,
                                                            const RemoteEntry& entry,
                                                            const Outcome& outcome) {
    const std::string path = spot.path + '/' + name.text;
    const Result<std::optional<SidecarMark>> read = examineMark(path, context_.mark);
    if (!read)
        return read.error();
    std::optional<SidecarMark> mark = *read;
    if (!mark || promisedName(name.text, *mark) != entry.name)
        return std::optional<Outcome>();
    Outcome taken = outcome;
    if (mark->item != outcome.item && !isKnown(mark->item)) {
        taken.item = mark->item; // made by a run that did not come to write it down
    } else if (mark->item != outcome.item && !isCopy(mark->item, path)) {
        // Moved here a moment ago: the name is that one's until a plan says otherwise.
        return makeError(ErrorCode::fileExists, entry.name);
    } else if (mark->item != outcome.item) {
        mark->item = outcome.item; // a copy of another item's promise
        if (Failure failure = context_.disk.setMark(path, encodedMark(*mark)))
            return *failure;
    }
    const Result<FileAttributes> attributes = context_.disk.attributes(path);
    if (!attributes && attributes.error().is(ErrorCode::noSuchItem)) // moved a moment ago
        return makeError(ErrorCode::fileExists, entry.name);
    if (!attributes)
        return attributes.error();
    const Place place{spot.folder, entry.name};
    taken.local = localRowOf(place, *attributes, true);
    taken.base = baseOf(place, entry, *attributes);
    return std::optional(std::move(taken));
}

bool Arrivals::isCopy(ItemId item, const std::string& path) {
    std::optional<std::string> own;
    context_.queue.sync([&] { own = context_.database.localPathOf(item); });
    if (!own)
        return false;
    const std::string document = context_.pathOf(*own);
    const auto found =
        findSidecar(std::string(folderOf(document)), nameOf(document), context_.mark);
    return found && found->mark.item == item && found->path != path;
}

bool Arrivals::isKnown(ItemId item) {
    bool known = false;
    context_.queue.sync([&] { known = context_.database.state(item).has_value(); });
    return known;
}

Result<Arrivals::Outcome> Arrivals::fetch(const Spot& spot, const RemoteEntry& entry,
                                          Outcome outcome) {
    std::string content;
    const std::string remotePath = spot.remotePath + '/' + entry.name;
    const Result<RemoteEntry> version = context_.remote.read(
        remotePath,
        [&](std::span<const std::byte> piece) -> Failure {
            content.append(reinterpret_cast<const char*>(piece.data()), piece.size());
            return std::nullopt;
        },
        cancel_);
    if (!version)
        return version.error();
    const std::string path = spot.path + '/' + entry.name;
    if (Failure failure = context_.disk.writeSmallFile(path, content))
        return *failure;
    const Result<FileAttributes> attributes = context_.disk.attributes(path);
    if (!attributes)
        return attributes.error();
    const Place place{spot.folder, entry.name};
    outcome.local = localRowOf(place, *attributes, false);
    outcome.base = baseOf(place, *version, *attributes, ContentHash::of(content));
    return outcome;
}

Result<Arrivals::Outcome> Arrivals::renew(const Spot& spot, const RemoteEntry& entry,
                                          const ItemState& state) {
    Outcome outcome;
    outcome.item = state.item.id;
    const Result<Bytes> content =
        FileManager::contents(Url::file(spot.path + '/' + entry.name), largestContainerFile + 1);
    if (!content || !state.base)
        return outcome;
    const Bytes hash =
        ContentHash::of({reinterpret_cast<const char*>(content->data()), content->size()});
    return hash == state.base->hash ? fetch(spot, entry, std::move(outcome)) : outcome;
}

} // namespace platform
