#include "platform/system/InstanceMessage.h"

#include "platform/base/Text.h"

#include <algorithm>

namespace platform {
namespace {

constexpr std::string_view magic = "TVRN";
constexpr std::size_t headerSize = magic.size() + 4;
constexpr std::size_t longestToken = 1024;
constexpr std::size_t longestBody = mostRequestUrls * (longestRequestUrl + 1) + longestToken + 1;

std::size_t bodyLength(std::string_view bytes) {
    std::size_t length = 0;
    for (std::size_t i = magic.size(); i < headerSize; ++i)
        length = length << 8U | static_cast<unsigned char>(bytes[i]);
    return length;
}

std::vector<std::string> textsOf(std::string_view body) {
    std::vector<std::string> texts;
    while (!body.empty()) {
        const std::size_t end = body.find('\0');
        texts.emplace_back(body.substr(0, end));
        body.remove_prefix(end + 1);
    }
    return texts;
}

OpenRequest requestOf(std::string_view body) {
    std::vector<std::string> texts = textsOf(body);
    OpenRequest request;
    request.activationToken = std::move(texts.front());
    request.urls.assign(std::make_move_iterator(texts.begin() + 1),
                        std::make_move_iterator(texts.end()));
    return request;
}

} // namespace

Failure checkRequestLimits(const OpenRequest& request) {
    const auto isLong = [](const std::string& url) { return url.size() > longestRequestUrl; };
    const auto hasNul = [](const std::string& text) {
        return text.find('\0') != std::string::npos;
    };
    if (request.urls.size() > mostRequestUrls)
        return makeErrorWithText(ErrorCode::invalidArgument,
                                 localizedFormat("More than %@ addresses at once are not taken.",
                                                 std::to_string(mostRequestUrls)));
    if (std::ranges::any_of(request.urls, isLong))
        return makeErrorWithText(
            ErrorCode::invalidArgument,
            localizedFormat("An address of more than %@ characters names no document.",
                            std::to_string(longestRequestUrl)));
    if (request.activationToken.size() > longestToken || hasNul(request.activationToken) ||
        std::ranges::any_of(request.urls, hasNul))
        return makeErrorWithText(ErrorCode::invalidArgument,
                                 localized("The request is damaged and was not taken."));
    return std::nullopt;
}

std::string frameOf(const OpenRequest& request) {
    std::string body = request.activationToken + '\0';
    for (const std::string& url : request.urls)
        body.append(url).push_back('\0');
    std::string out(magic);
    for (int shift = 24; shift >= 0; shift -= 8)
        out.push_back(static_cast<char>(body.size() >> static_cast<unsigned>(shift) & 0xFFU));
    return out + body;
}

FrameReader::State FrameReader::take(std::string_view piece) {
    bytes_.append(piece);
    const std::string_view known = std::string_view(bytes_).substr(0, magic.size());
    if (!magic.starts_with(known))
        return State::broken;
    if (bytes_.size() < headerSize)
        return State::wantsMore;
    const std::size_t length = bodyLength(bytes_);
    if (length == 0 || length > longestBody || bytes_.size() > headerSize + length)
        return State::broken;
    if (bytes_.size() < headerSize + length)
        return State::wantsMore;
    return bytes_.back() == '\0' ? State::complete : State::broken;
}

OpenRequest FrameReader::request() const {
    return requestOf(std::string_view(bytes_).substr(headerSize));
}

} // namespace platform
