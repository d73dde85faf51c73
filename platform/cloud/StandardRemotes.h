#pragma once

#include "platform/cloud/Remote.h"
#include "platform/cloud/webdav/WebDavAccount.h"

namespace platform {

/// The kinds of remote that this version knows. `credentials` answers those of accounts that have
/// any; see HttpClient.h for when it is asked.
RemoteFactory standardRemotes(Clock& clock, AccountCredentials credentials = {});

} // namespace platform
