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
    return promise ? movePromise(from, to, *promise) : Failure(source.error());
}

Failure StoreMoves::movePresent(const Url& from, const Url& to, bool directory) {
    const std::optional<std::string> source = relative(from);
    const std::optional<std::string> target = relative(to);
    if (source && !target && directory && containsPromise(from.path(), context_.mark))
        return notYetHere(from);
    if (Failure failure = context_.disk.rename(from.path(), to.path()))
        return failure;
    if (!source || !target)
        return std::nullopt; // arrivals and departures are found by looking at the disk
    const std::optional<ItemId> item = context_.database.itemAtPath(*source);
    const Result<FileAttributes> attributes = context_.disk.attributes(to.path());
    if (!item || !attributes)
        return context_.database.takeFault();
    if (Failure failure = recordMove(*item, *target, *attributes, false))
        return undone(*failure, from, to,
                      [&] { return context_.disk.rename(to.path(), from.path()); });
    return std::nullopt;
}

Failure StoreMoves::movePromise(const Url& from, const Url& to, const FoundSidecar& promise) {
    const std::optional<std::string> target = relative(to);
    if (!target)
        return notYetHere(from);
    // The promise's own file would have room for it; the content could then never come.
    if (nameOf(to.path()).size() > longestName)
        return makeError(ErrorCode::nameTooLong, to.lastPathComponent());
    const Result<FoundSidecar> moved =
        renameSidecar(promise, std::string(folderOf(to.path())), std::string(nameOf(to.path())));
    if (!moved)
        return namedForPeople(moved.error(), from.lastPathComponent());
    // A copy of a promise has no row of its own that could follow.
    if (context_.database.pathOf(promise.mark.item) != relative(from))
        return context_.database.takeFault();
    const Result<FileAttributes> attributes = context_.disk.attributes(moved->path);
    if (!attributes)
        return attributes.error();
    if (Failure failure = recordMove(promise.mark.item, *target, *attributes, true))
        return undone(*failure, from, to, [&]() -> Failure {
            const Result<FoundSidecar> back = renameSidecar(
                *moved, std::string(folderOf(from.path())), std::string(nameOf(from.path())));
            return back ? Failure() : Failure(back.error());
        });
    return std::nullopt;
}

Error StoreMoves::undone(const Error& cause, const Url& from, const Url& to,
                         const std::function<Failure()>& undo) {
    platformLog(LogLevel::warning, "cloud: the move of “%@” to “%@” is undone: %@", from, to,
                cause);
    if (const Failure failure = undo())
        platformLog(LogLevel::error, "cloud: “%@” stays under its new name: %@", to, *failure);
    return namedForPeople(cause, from.lastPathComponent());
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

Failure StoreMoves::recordMove(ItemId item, const std::string& to, const FileAttributes& attributes,
                               bool promise) {
    StateDatabase& database = context_.database;
    return database.transaction([&]() -> Failure {
        const std::size_t slash = to.rfind('/');
        const Result<ItemId> parent =
            folderItem(slash == std::string::npos ? std::string() : to.substr(0, slash));
        if (!parent)
            return parent.error();
        const Place place{*parent, std::string(nameOf(to))};
        // Whoever the record still shows under that name is not there any more: the rename proved
        // it.
        if (const std::optional<ItemId> other = database.itemAt(place); other && *other != item) {
            database.setItemPlace(*other, std::nullopt);
            database.removeLocal(*other);
        }
        if (const std::optional<ItemState> state = database.state(item);
            state && state->base && state->local && state->local->changed == state->base->changed &&
            state->local->identity == state->base->identity) {
            BaseRow base = *state->base; // a rename changes this time, and no content
            base.changed = attributes.changed;
            database.putBase(item, base);
        }
        database.setItemPlace(item, place);
        database.putLocal(item, localRowOf(place, attributes, promise));
        return std::nullopt;
    });
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
