#include "platform/cloud/StandardRemotes.h"

#include "platform/cloud/FolderRemote.h"

namespace platform {

RemoteFactory standardRemotes(Clock& clock, AccountCredentials credentials) {
    return [&clock, credentials = std::move(credentials)](
               const AccountRecord& account) -> std::unique_ptr<Remote> {
        if (account.kind == folderAccountKind)
            return std::make_unique<FolderRemote>(account.address, clock);
        if (account.kind == webDavAccountKind)
            return makeWebDavRemote(account, credentials, clock);
        return nullptr;
    };
}

} // namespace platform
