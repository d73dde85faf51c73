#include "platform/cloud/Eviction.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/KeptFolder.h"
#include "platform/cloud/LocalContent.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/Tokens.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

constexpr const char* evictionKind = "evict";

Error notUploaded(const std::string& relative) {
    return makeErrorWithText(
        ErrorCode::notUploadedYet,
        localizedFormat("“%1$@” stays on this device: your account does not have this version yet.",
                        nameOf(relative)));
}

Error changedMeanwhile(const std::string& relative) {
    return makeError(ErrorCode::changedWhileRead, nameOf(relative));
}

void endOperation(StoreContext& context, std::int64_t op) {
    if (const Failure failure = context.database.transaction([&]() -> Failure {
            context.database.removeOperation(op);
            return std::nullopt;
        }))
        platformLog(LogLevel::warning, "cloud: cannot end an eviction's record: %@", *failure);
}

} // namespace

bool Eviction::owns(const OpRow& op) {
    return op.kind == evictionKind;
}

Failure Eviction::evict(const std::string& relative) {
    const std::string path = context_.pathOf(relative);
    if (!context_.disk.attributes(path) &&
        findSidecar(std::string(folderOf(path)), nameOf(path), context_.mark))
        return std::nullopt; // a promise already
    Result<Subject> subject = subjectOf(relative);
    if (!subject)
        return subject.error();
    if (Failure failure = compare(*subject))
        return failure;
    Failure failure;
    context_.queue.sync([&] { failure = putPromise(*subject); });
    return failure;
}

Result<Eviction::Subject> Eviction::subjectOf(const std::string& relative) {
    Subject subject{relative, {}, {}, {}, {}, {}};
    std::optional<ItemState> state;
    std::optional<std::string> remotePath;
    context_.queue.sync([&] {
        if (const std::optional<ItemId> item = context_.database.itemAtPath(relative)) {
            state = context_.database.state(*item);
            remotePath = context_.database.remotePathOf(*item);
        }
    });
    const Result<FileAttributes> attributes = context_.disk.attributes(context_.pathOf(relative));
    if (!attributes)
        return attributes.error();
    if (attributes->kind != FileKind::file)
        return makeErrorWithText(
            ErrorCode::unsupportedOperation,
            localizedFormat("“%1$@” is no document that could be fetched again.",
                            nameOf(relative)));
    if (!state || !state->remote || !remotePath || state->item.kind != ItemKind::file)
        return notUploaded(relative);
    subject.state = std::move(*state);
    subject.remotePath = std::move(*remotePath);
    return subject;
}

Failure Eviction::compare(Subject& subject) {
    const std::string path = context_.pathOf(subject.relative);
    const Result<LocalContent> content = readLocalContent(context_.disk, path, cancel_);
    if (!content)
        return content.error();
    subject.attributes = content->attributes;
    subject.hash = content->hash;
    const Result<RemoteEntry> entry = context_.remote.entry(subject.remotePath, cancel_);
    if (!entry)
        return entry.error().is(ErrorCode::noSuchItem) ? notUploaded(subject.relative)
                                                       : entry.error();
    subject.version = *entry;
    const std::optional<BaseRow>& base = subject.state.base;
    if (base && !entry->young && base->hash == subject.hash && base->etag == entry->etag)
        return std::nullopt;
    if (entry->size != subject.attributes.size)
        return notUploaded(subject.relative);
    // Nothing proves it yet but the remote's own bytes.
    ContentHash hash;
    const Result<RemoteEntry> version = context_.remote.read(
        subject.remotePath,
        [&](std::span<const std::byte> piece) -> Failure {
            hash.add(piece);
            return std::nullopt;
        },
        cancel_);
    if (!version)
        return version.error();
    if (hash.finish() != subject.hash)
        return notUploaded(subject.relative);
    subject.version = *version;
    return std::nullopt;
}

Failure Eviction::putPromise(const Subject& subject) {
    const ItemId item = subject.state.item.id;
    const std::string path = context_.pathOf(subject.relative);
    const std::string folder(folderOf(path));
    const Result<FileAttributes> standing = context_.disk.attributes(path);
    if (!standing || !sameContentAs(*standing, subject.attributes) ||
        context_.database.pathOf(item) != subject.relative)
        return changedMeanwhile(subject.relative);
    OpRow op{0, item, evictionKind, "", "", subject.version.etag, subject.hash, 0, 0, {}, {}};
    op.staged = hexText(static_cast<std::uint64_t>(item)) + "-evicted-" + hexText(randomBytes(6));
    if (Failure failure = context_.database.transaction([&]() -> Failure {
            op.id = context_.database.putOperation(op);
            return std::nullopt;
        }))
        return failure;
    const Result<FoundSidecar> sidecar = makeSidecarFor(context_, item, folder, nameOf(path));
    Failure failure = sidecar ? context_.disk.syncFolder(folder) : Failure(sidecar.error());
    if (!failure)
        failure = record(subject, op, *sidecar);
    if (!failure)
        failure = removeContent(subject, op);
    if (failure)
        resume(context_, op); // undone
    else
        endOperation(context_, op.id);
    return failure;
}

Failure Eviction::record(const Subject& subject, OpRow& op, const FoundSidecar& sidecar) {
    const Result<FileAttributes> attributes = context_.disk.attributes(sidecar.path);
    if (!attributes)
        return attributes.error();
    const Place place = *subject.state.item.place;
    RemoteRow remote = *subject.state.remote;
    remote.etag = subject.version.etag;
    remote.size = subject.version.size;
    remote.modified = subject.version.modified;
    BaseRow base =
        baseRowOf(remote.place, subject.version.etag, subject.version.size, {}, *attributes);
    if (subject.state.base)
        base.place = subject.state.base->place;
    return context_.database.transaction([&]() -> Failure {
        context_.database.putRemote(op.item, remote);
        context_.database.putLocal(op.item, localRowOf(place, *attributes, true));
        context_.database.putBase(op.item, base);
        return std::nullopt;
    });
}

Failure Eviction::removeContent(const Subject& subject, const OpRow& op) {
    const std::string path = context_.pathOf(subject.relative);
    const std::string staged = context_.layout.staging() + '/' + op.staged;
    if (Failure failure = context_.disk.rename(path, staged))
        return failure;
    const Result<FileAttributes> taken = context_.disk.attributes(staged);
    if (!taken || !sameContentAs(*taken, subject.attributes))
        return changedMeanwhile(subject.relative); // somebody saved in the last moment
    if (Failure failure = context_.disk.syncFolder(std::string(folderOf(path))))
        return failure;
    return context_.disk.removeFile(staged);
}

void Eviction::resume(StoreContext& context, const OpRow& op) {
    const std::optional<std::string> relative = context.database.pathOf(op.item);
    const std::string path = relative ? context.pathOf(*relative) : std::string();
    const std::string staged = context.layout.staging() + '/' + op.staged;
    // It was not looked at any more: it goes back, unless its name, or its folder, is not its own
    // any more.
    if (context.disk.attributes(staged) && (!relative || context.disk.rename(staged, path)))
        if (const Result<std::string> kept =
                KeptFolder(context).takeFrom(staged, relative.value_or(op.staged), true);
            !kept) {
            platformLog(LogLevel::error, "cloud: cannot put %@ back: %@", path, kept.error());
            return;
        }
    if (!relative) {
        endOperation(context, op.id);
        return;
    }
    const Result<FileAttributes> file = context.disk.attributes(path);
    const std::optional<FoundSidecar> promise =
        findSidecar(std::string(folderOf(path)), nameOf(path), context.mark);
    const bool undone = file && file->kind == FileKind::file;
    if (undone && promise && promise->mark.item == op.item)
        if (const Failure failure = context.disk.removeFile(promise->path))
            platformLog(LogLevel::warning, "cloud: cannot remove %@: %@", promise->path, *failure);
    const std::optional<ItemState> state = context.database.state(op.item);
    const Failure failure = context.database.transaction([&]() -> Failure {
        if (undone && state && state->item.place) {
            context.database.putLocal(op.item, localRowOf(*state->item.place, *file, false));
            if (state->base) {
                context.database.putBase(op.item, baseRowOf(state->base->place, op.expectEtag,
                                                            file->size, op.hash, *file));
            }
        }
        context.database.removeOperation(op.id);
        return std::nullopt;
    });
    if (failure)
        platformLog(LogLevel::warning, "cloud: cannot undo an eviction: %@", *failure);
}

} // namespace platform
