#include "platform/cloud/LocalContent.h"

#include "platform/cloud/ContentHash.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

constexpr std::size_t localPieceSize = std::size_t{1024} * 1024;

} // namespace

Result<LocalContent> readLocalContent(StoreFileSystem& disk, const std::string& path,
                                      CancelFlag& cancel) {
    const Result<std::unique_ptr<OpenContent>> file = disk.openContent(path);
    if (!file)
        return file.error();
    const Result<FileAttributes> before = (*file)->attributes();
    if (!before)
        return before.error();
    ContentHash hash;
    std::vector<std::byte> piece(std::min<std::uint64_t>(localPieceSize, before->size + 1));
    for (std::uint64_t offset = 0;;) {
        if (cancel.isCancelled())
            return makeError(ErrorCode::userCancelled);
        const Result<std::size_t> got = (*file)->read(offset, piece);
        if (!got)
            return got.error();
        if (*got == 0) {
            if (offset != before->size)
                return makeError(ErrorCode::changedWhileRead, nameOf(path));
            break;
        }
        hash.add({piece.data(), *got});
        offset += *got;
    }
    const Result<FileAttributes> after = (*file)->attributes();
    if (!after || !sameContentAs(*after, *before) || after->changed != before->changed)
        return makeError(ErrorCode::changedWhileRead, nameOf(path));
    return LocalContent{*after, hash.finish()};
}

Result<FoundSidecar> makeSidecarFor(StoreContext& context, ItemId item, const std::string& folder,
                                    std::string_view name) {
    const SidecarName usual = sidecarNameFor(name);
    const SidecarName cut = usual.needsName ? usual : shortenedSidecarNameFor(name);
    for (const SidecarName* form : {&usual, &cut}) {
        FoundSidecar made{folder + '/' + form->text,
                          {context.mark, item, form->needsName ? std::string(name) : ""}};
        const Result<FileAttributes> attributes =
            context.disk.makeSidecar(made.path, encodedMark(made.mark));
        if (attributes)
            return made;
        if (!attributes.error().is(ErrorCode::fileExists))
            return attributes.error();
        if (const std::optional<SidecarMark> mark = readMark(made.path, context.mark);
            mark && mark->item == item && promisedName(form->text, *mark) == name)
            return made;
    }
    return makeError(ErrorCode::fileExists, name);
}

} // namespace platform
