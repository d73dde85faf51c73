#include "platform/cloud/FolderVersion.h"

#include "platform/cloud/SyncTimes.h"
#include "platform/cloud/Tokens.h"

namespace platform {
namespace {

/// What a version ends with that could still have a twin; see SyncTimes.h.
constexpr std::string_view youngMark = "-young";

std::string hexOf(std::int64_t number) {
    return hexText(static_cast<std::uint64_t>(number));
}

std::string whoText(const FileAttributes& attributes) {
    return hexText(attributes.identity.inode) + '-' + hexOf(attributes.identity.birthNanoseconds);
}

} // namespace

std::string identityText(const FileAttributes& attributes) {
    return attributes.identity.birthNanoseconds == 0 ? std::string() : whoText(attributes);
}

std::string versionText(const FileAttributes& attributes, Date now) {
    if (attributes.kind == FileKind::directory)
        return whoText(attributes);
    std::string text = hexText(attributes.size) + '-' + hexOf(attributes.modified.nanoseconds) +
                       '-' + hexOf(attributes.changed.nanoseconds) + '-' + whoText(attributes);
    if (isYoung(attributes.modified, now))
        text += youngMark;
    return text;
}

} // namespace platform
