#include "platform/cloud/StoreMoves.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

Error notYetHere(const Url& item) {
    return makeErrorWithText(
        ErrorCode::unsupportedOperation,
        localizedFormat("“%1$@” has to be downloaded before it can leave your documents.",
                        item.lastPathComponent()));
}

} // namespace

std::optional<std::string> StoreMoves::relative(const Url& url) const {
    const Url root = Url::file(context_.layout.root(), true);
    if (url.path().size() <= root.path().size() || !url.isInside(root))
        return std::nullopt;
    return url.path().substr(root.path().size() + 1);
}

Failure StoreMoves::move(const Url& from, const Url& to) {
    const Result<Moved> moved = moveOnDisk(from, to);
    if (!moved)
        return moved.error();
    const Failure failure = record({*moved});
    if (!failure)
        return std::nullopt;
    platformLog(LogLevel::warning, "cloud: the move of “%@” to “%@” is undone: %@", from, to,
                *failure);
    if (const Failure stays = putBack(*moved))
        platformLog(LogLevel::error, "cloud: “%@” stays under its new name: %@", to, *stays);
    return namedForPeople(*failure, from.lastPathComponent());
}

Result<StoreMoves::Moved> StoreMoves::moveOnDisk(const Url& from, const Url& to) {
    const Result<FileAttributes> source = context_.disk.attributes(from.path());
    const bool promisedThere = relative(to) && findSidecar(std::string(folderOf(to.path())),
                                                           nameOf(to.path()), context_.mark);
    if (promisedThere || context_.disk.attributes(to.path()).ok())
        return makeError(ErrorCode::fileExists, to.lastPathComponent());
    if (source)
        return movePresent(from, to, source->kind == FileKind::directory);
    if (!source.error().is(ErrorCode::noSuchItem))
        return source.error();
    const std::optional<FoundSidecar> promise =
        relative(from)
            ? findSidecar(std::string(folderOf(from.path())), nameOf(from.path()), context_.mark)
            : std::nullopt;
    return promise ? movePromise(from, to, *promise) : Result<Moved>(source.error());
}

Result<StoreMoves::Moved> StoreMoves::movePresent(const Url& from, const Url& to, bool directory) {
    const std::optional<std::string> source = relative(from);
    const std::optional<std::string> target = relative(to);
    if (source && !target && directory && containsPromise(from.path(), context_.mark))
        return notYetHere(from);
    if (Failure failure = context_.disk.rename(from.path(), to.path()))
        return *failure;
    Moved moved{from, to};
    // Arrivals and departures are found by looking at the disk.
    if (source && target)
        if (const Result<FileAttributes> attributes = context_.disk.attributes(to.path()))
            moved.attributes = *attributes;
    return moved;
}

Result<StoreMoves::Moved> StoreMoves::movePromise(const Url& from, const Url& to,
                                                  const FoundSidecar& promise) {
    if (!relative(to))
        return notYetHere(from);
    // The promise's own file would have room for it; the content could then never come.
    if (nameOf(to.path()).size() > longestName)
        return makeError(ErrorCode::nameTooLong, to.lastPathComponent());
    const Result<FoundSidecar> renamed =
        renameSidecar(promise, std::string(folderOf(to.path())), std::string(nameOf(to.path())));
    if (!renamed)
        return namedForPeople(renamed.error(), from.lastPathComponent());
    const Result<FileAttributes> attributes = context_.disk.attributes(renamed->path);
    if (!attributes)
        return attributes.error();
    return Moved{from, to, *renamed, *attributes};
}

Failure StoreMoves::putBack(const Moved& moved) {
    if (!moved.promise)
        return context_.disk.rename(moved.to.path(), moved.from.path());
    const Result<FoundSidecar> back =
        renameSidecar(*moved.promise, std::string(folderOf(moved.from.path())),
                      std::string(nameOf(moved.from.path())));
    return back ? Failure() : Failure(back.error());
}

Result<FoundSidecar> StoreMoves::renameSidecar(const FoundSidecar& promise,
                                               const std::string& folder, const std::string& name) {
    const SidecarName usual = sidecarNameFor(name);
    const SidecarName cut = usual.needsName ? usual : shortenedSidecarNameFor(name);
    Failure failure;
    for (const SidecarName* form : {&usual, &cut}) {
        FoundSidecar moved{folder + '/' + form->text, promise.mark};
        moved.mark.name = form->needsName ? name : std::string();
        // The mark's name is looked at only under a file name that was made from it: written
        // before the rename, or taken away after it, it is right on both sides of a stop.
        if (form->needsName)
            failure = context_.disk.setMark(promise.path, encodedMark(moved.mark));
        if (!failure || !form->needsName)
            failure = context_.disk.rename(promise.path, moved.path);
        if (!failure && !form->needsName && !promise.mark.name.empty())
            failure = context_.disk.setMark(moved.path, encodedMark(moved.mark));
        if (!failure)
            return moved;
        if (!failure->is(ErrorCode::fileExists))
            break;
    }
    return *failure;
}

Failure StoreMoves::record(const std::vector<Moved>& moves) {
    return context_.database.transaction([&]() -> Failure {
        for (const Moved& moved : moves)
            if (Failure failure = recordOne(moved))
                return failure;
        return std::nullopt;
    });
}

Failure StoreMoves::recordOne(const Moved& moved) {
    StateDatabase& database = context_.database;
    const std::optional<std::string> source = relative(moved.from);
    const std::optional<std::string> target = relative(moved.to);
    if (!source || !target || !moved.attributes)
        return std::nullopt;
    const FileAttributes& attributes = *moved.attributes;
    std::optional<ItemId> item = moved.promise ? std::optional(moved.promise->mark.item)
                                               : database.itemAtPath(*source);
    // A copy of a promise has no row of its own that could follow.
    if (!item || (moved.promise && database.pathOf(*item) != source))
        return std::nullopt;
    const std::size_t slash = target->rfind('/');
    const Result<ItemId> parent =
        folderItem(slash == std::string::npos ? std::string() : target->substr(0, slash));
    if (!parent)
        return parent.error();
    const Place place{*parent, std::string(nameOf(*target))};
    // Whoever the record still shows under that name is not there any more: the rename proved it.
    if (const std::optional<ItemId> other = database.itemAt(place); other && *other != *item) {
        database.setItemPlace(*other, std::nullopt);
        database.removeLocal(*other);
    }
    if (const std::optional<ItemState> state = database.state(*item);
        state && state->base && state->local && state->local->changed == state->base->changed &&
        state->local->identity == state->base->identity) {
        BaseRow base = *state->base; // a rename changes this time, and no content
        base.changed = attributes.changed;
        database.putBase(*item, base);
    }
    database.setItemPlace(*item, place);
    database.putLocal(*item, localRowOf(place, attributes, moved.promise.has_value()));
    return std::nullopt;
}

Result<ItemId> StoreMoves::folderItem(const std::string& path) {
    if (path.empty())
        return rootItem;
    if (const std::optional<ItemId> known = context_.database.itemAtPath(path))
        return *known;
    const std::size_t slash = path.rfind('/');
    const Result<ItemId> parent =
        folderItem(slash == std::string::npos ? std::string() : path.substr(0, slash));
    if (!parent)
        return parent;
    const Result<FileAttributes> attributes = context_.disk.attributes(context_.pathOf(path));
    if (!attributes)
        return attributes.error();
    const Place place{*parent, std::string(nameOf(path))};
    const ItemId item = context_.database.newItemId();
    context_.database.insertItem({item, ItemKind::folder, place});
    context_.database.putLocal(item, localRowOf(place, *attributes, false));
    return item;
}

} // namespace platform
