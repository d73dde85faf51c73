#pragma once

#include "platform/cloud/webdav/HttpMessage.h"

#include <string>

// Private to the WebDAV remote: what a server's answers mean, in words.

namespace platform {

/// Of a request that came to no answer; `code` is the library's, `detail` its own words.
HttpResult brokenResult(int code, const std::string& detail, const std::string& url);
HttpResult passwordResult();
HttpResult elsewhereResult(const std::string& where);
HttpResult waitResult(std::int64_t seconds);

/// What an answer that is not a good one means for the item of that name. noSuchItem, fileExists,
/// changedRemotely and the other codes that promise that nothing was done are given only where the
/// server's answer does.
Error errorOfStatus(const HttpReply& reply, std::string_view method, std::string_view name);

} // namespace platform
