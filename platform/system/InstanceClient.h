#pragma once

#include "platform/system/InstanceFolder.h"
#include "platform/system/SingleInstance.h"

namespace platform {

/// Hands a request to whoever listens in that folder. False when nobody listens, or whoever did is
/// gone before it answered. Blocks, at most for `patience`.
Result<bool> handToSocket(const InstanceFolder& folder, const OpenRequest& request,
                          Duration patience);
/// One runs and does not answer, in words.
Error instanceSilentError();

} // namespace platform
