#include "platform/cloud/webdav/HttpMessage.h"

#include <charconv>
#include <curl/curl.h>

namespace platform {

std::optional<Date> dateOfHttpText(std::string_view text) {
    const time_t seconds = text.empty() ? -1 : curl_getdate(std::string(text).c_str(), nullptr);
    return seconds < 0 ? std::nullopt : std::optional(Date::fromParts(seconds, 0));
}

std::string_view HttpReply::header(std::string_view name) const {
    for (const auto& [key, value] : headers)
        if (key == name)
            return value;
    return {};
}

std::optional<std::uint64_t> HttpReply::number(std::string_view name) const {
    const std::string_view text = header(name);
    std::uint64_t number = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), number);
    return error == std::errc() && end == text.data() + text.size() ? std::optional(number)
                                                                    : std::nullopt;
}

std::optional<Date> HttpReply::date() const {
    return dateOfHttpText(header("date"));
}

} // namespace platform
