#pragma once

#include "platform/base/Result.h"
#include "platform/system/SingleInstance.h"

#include <string>
#include <vector>

namespace opener {

/// What the desk asked for, if it is something to pass on: requests of Tavrin's own scheme only,
/// because this program's word stands for the home screen. An error names what is not.
platform::Result<platform::OpenRequest> requestOf(const std::vector<std::string>& arguments);

/// Brings the request to the running instance; without one, starts the program beside this one and
/// waits until it has taken the request.
platform::Failure bring(const platform::OpenRequest& request);

} // namespace opener
