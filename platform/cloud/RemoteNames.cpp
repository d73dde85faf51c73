#include "platform/cloud/RemoteNames.h"

#include "platform/base/Text.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/Sidecar.h"
#include "platform/cloud/SyncNames.h"

namespace platform {

Error nameRefusedError(std::string_view name, std::string reason) {
    Error error = makeError(ErrorCode::nameRefused, name);
    error.localizedFailureReason = std::move(reason);
    return error;
}

Failure remoteNameProblem(std::string_view path, std::string_view name) {
    if (name.empty() || name == "." || name == ".." || name.find('\0') != std::string_view::npos)
        return nameRefusedError(name, localized("The disk cannot have an item of that name."));
    if (name.size() > longestItemName)
        return nameRefusedError(name, localized("The name is too long for the disk."));
    if (hasSidecarForm(name))
        return nameRefusedError(
            name,
            localized("Names that begin with “.” and end in “.promise” are kept for promises."));
    if (path == remoteServiceFolder)
        return nameRefusedError(name, localized("The name is one that the account uses itself."));
    return std::nullopt;
}

} // namespace platform
