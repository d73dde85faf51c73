#include "platform/cloud/ContentPlacing.h"

#include "platform/base/Log.h"
#include "platform/cloud/ContentHash.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/files/PathText.h"

#include <array>
#include <fcntl.h>
#include <unistd.h>

namespace platform {
namespace {

constexpr const char* downloadKind = "download";
/// Before the content has its name, and after it was recorded.
constexpr const char* placingPhase = "place";
constexpr const char* clearingPhase = "clear";

/// The hash of a file on the disk; empty when it cannot be read.
Bytes hashOfFile(const std::string& path) {
    const FileDescriptor file(open(path.c_str(), O_RDONLY | O_NOFOLLOW | O_NONBLOCK | O_CLOEXEC));
    std::vector<std::byte> piece(1024 * 1024);
    ContentHash hash;
    for (;;) {
        const ssize_t got = file ? ::read(file.get(), piece.data(), piece.size()) : -1;
        if (got < 0)
            return {};
        if (got == 0)
            return hash.finish();
        hash.add({piece.data(), static_cast<std::size_t>(got)});
    }
}

} // namespace

std::optional<ContentPlacing::Target> ContentPlacing::targetFor(ItemId item,
                                                                const std::string& wanted) {
    const std::optional<std::string> own = context_.database.pathOf(item);
    const auto look = [&](const std::string& relative) -> std::optional<Target> {
        const std::string path = context_.pathOf(relative);
        std::optional<FoundSidecar> found =
            findSidecar(std::string(folderOf(path)), nameOf(path), context_.mark);
        if (!found || found->mark.item != item)
            return std::nullopt;
        return Target{relative, std::move(*found), own == relative};
    };
    std::optional<Target> target = look(wanted);
    return target || !own ? target : look(*own);
}

Failure ContentPlacing::place(ItemId item, const std::string& wanted, const std::string& staged,
                              const RemoteEntry& version, const Bytes& hash) {
    const std::optional<Target> target = targetFor(item, wanted);
    if (!target)
        return makeError(ErrorCode::noSuchItem, nameOf(wanted));
    OpRow op{0, item, downloadKind, placingPhase, staged, version.etag, hash, 0, 0, {}, {}};
    if (target->own)
        if (Failure failure = context_.database.transaction([&]() -> Failure {
                op.id = context_.database.putOperation(op);
                return std::nullopt;
            }))
            return failure;
    const std::string path = context_.pathOf(target->relative);
    if (Failure failure = context_.disk.rename(context_.layout.staging() + '/' + staged, path)) {
        const Failure ignored = context_.database.transaction([&]() -> Failure {
            context_.database.removeOperation(op.id);
            return std::nullopt;
        });
        return failure;
    }
    if (Failure failure = context_.disk.syncFolder(std::string(folderOf(path))))
        return failure;
    if (!target->own)
        return context_.disk.removeFile(target->sidecar.path);
    const Result<FileAttributes> attributes = context_.disk.attributes(path);
    if (!attributes)
        return attributes.error();
    if (Failure failure = record(item, op, *attributes, &version))
        return failure;
    return removeSidecar(target->sidecar.path, op.id);
}

Failure ContentPlacing::record(ItemId item, OpRow op, const FileAttributes& attributes,
                               const RemoteEntry* version) {
    const std::optional<ItemState> state = context_.database.state(item);
    if (!state || !state->item.place || !state->remote)
        return context_.database.takeFault().value_or(makeError(ErrorCode::noSuchItem));
    op.phase = clearingPhase;
    return context_.database.transaction([&]() -> Failure {
        RemoteRow remote = *state->remote;
        if (version && version->etag != remote.etag) {
            remote.etag = version->etag;
            remote.size = version->size;
            remote.modified = version->modified;
            remote.remoteId = version->remoteId;
            remote.role = version->role;
            remote.tags = version->tags;
            context_.database.putRemote(item, remote);
        }
        context_.database.putLocal(item, localRowOf(*state->item.place, attributes, false));
        context_.database.putBase(item,
                                  baseRowOf(state->base ? state->base->place : remote.place,
                                            op.expectEtag, attributes.size, op.hash, attributes));
        context_.database.putOperation(op);
        return std::nullopt;
    });
}

Failure ContentPlacing::removeSidecar(const std::string& path, std::int64_t op) {
    // From here on the file is there and known: what fails now is finished at the next start.
    if (const Failure failure = context_.disk.removeFile(path)) {
        platformLog(LogLevel::warning, "cloud: cannot remove the promise %@: %@", path, *failure);
        return std::nullopt;
    }
    const Failure failure = context_.database.transaction([&]() -> Failure {
        context_.database.removeOperation(op);
        return std::nullopt;
    });
    if (failure)
        platformLog(LogLevel::warning, "cloud: cannot end a download's record: %@", *failure);
    return std::nullopt;
}

void ContentPlacing::resume(const OpRow& op) {
    if (op.kind != downloadKind)
        return;
    const std::optional<std::string> relative = context_.database.pathOf(op.item);
    const std::string path = relative ? context_.pathOf(*relative) : std::string();
    const std::optional<Target> target =
        relative ? targetFor(op.item, *relative) : std::optional<Target>();
    const Result<FileAttributes> file =
        relative ? context_.disk.attributes(path) : makeError(ErrorCode::noSuchItem);
    const bool stillStaged =
        context_.disk.attributes(context_.layout.staging() + '/' + op.staged).ok();
    const bool standing = file && file->kind == FileKind::file && target && !stillStaged;
    if (standing && op.phase == placingPhase && hashOfFile(path) == op.hash) {
        if (const Failure failure = record(op.item, op, *file, nullptr)) {
            platformLog(LogLevel::error, "cloud: cannot finish the download of %@: %@", path,
                        *failure);
            return;
        }
        const Failure ignored = removeSidecar(target->sidecar.path, op.id);
        return;
    }
    if (standing && op.phase == clearingPhase) {
        const Failure ignored = removeSidecar(target->sidecar.path, op.id);
        return;
    }
    // Nothing had reached its place: the promise stands as before.
    const Failure ignored = context_.database.transaction([&]() -> Failure {
        context_.database.removeOperation(op.id);
        return std::nullopt;
    });
}

} // namespace platform
