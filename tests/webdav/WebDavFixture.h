#pragma once

#include "platform/base/ManualClock.h"
#include "platform/cloud/webdav/WebDavRemote.h"
#include "tests/webdav/DavHost.h"

#include <gtest/gtest.h>

#include <cstring>
#include <memory>
#include <set>
#include <string>

namespace test {

inline platform::HttpOptions signedIn(std::string authorities = {}) {
    return {[](bool refused) {
                return refused ? std::nullopt
                               : std::optional(platform::WebDavCredentials{"user", "secret"});
            },
            std::move(authorities), std::chrono::seconds(2)};
}

inline std::unique_ptr<platform::WebDavRemote> remoteAt(const std::string& url,
                                                        platform::Clock& clock,
                                                        platform::HttpOptions options) {
    const auto address = platform::WebDavAddress::parse(url);
    EXPECT_TRUE(address) << url;
    return std::make_unique<platform::WebDavRemote>(*address, std::move(options), clock);
}

inline platform::RemoteUpload uploadOf(std::string text) {
    const auto content = std::make_shared<const std::string>(std::move(text));
    return {content->size(),
            {},
            {},
            [content](std::uint64_t offset,
                      std::span<std::byte> buffer) -> platform::Result<std::size_t> {
                const std::string_view left = std::string_view(*content).substr(offset);
                const std::size_t count = std::min(left.size(), buffer.size());
                std::memcpy(buffer.data(), left.data(), count);
                return count;
            }};
}

inline std::string wordsOf(const platform::Failure& failure) {
    return failure ? std::to_string(failure->code) + ' ' +
                         failure->localizedDescription.value_or("") + " [" +
                         failure->localizedFailureReason.value_or("") + ']'
                   : std::string("none");
}

inline ::testing::AssertionResult endedWith(platform::ErrorCode code,
                                            const platform::Failure& failure) {
    return (failure && failure->is(code) ? ::testing::AssertionSuccess()
                                         : ::testing::AssertionFailure())
           << wordsOf(failure);
}
template<class T>
::testing::AssertionResult endedWith(platform::ErrorCode code,
                                     const platform::Result<T>& result) {
    return endedWith(code, result ? platform::Failure() : platform::Failure(result.error()));
}

template<class T>
::testing::AssertionResult went(const platform::Result<T>& result) {
    return result ? ::testing::AssertionSuccess()
                  : ::testing::AssertionFailure() << wordsOf(result.error());
}

/// One server, and words for what is done to it.
struct OnServer : ::testing::TestWithParam<DavHost::Kind> {
    DavHost host{GetParam()};
    platform::ManualClock clock;
    platform::CancelFlag cancel;

    std::unique_ptr<platform::WebDavRemote> connected() {
        auto remote = remoteAt(host.url(), clock, signedIn());
        const auto mark = remote->connect(cancel);
        EXPECT_TRUE(mark) << wordsOf(mark ? platform::Failure() : mark.error());
        return remote;
    }
    /// The version that came of it; "" when it failed, with the error in `failure`.
    std::string put(platform::Remote& remote, const std::string& path, const std::string& text,
                    const platform::RemoteCondition& condition) {
        const auto written = remote.write(path, uploadOf(text), condition, cancel);
        failure = written ? platform::Failure() : written.error();
        return written ? written->etag : std::string();
    }
    std::string put(platform::Remote& remote, const std::string& path, const std::string& text) {
        return put(remote, path, text, platform::RemoteCondition::nameFree());
    }
    std::string get(platform::Remote& remote, const std::string& path) {
        std::string text;
        const auto read = remote.read(
            path,
            [&](std::span<const std::byte> piece) -> platform::Failure {
                text.append(reinterpret_cast<const char*>(piece.data()), piece.size());
                return std::nullopt;
            },
            cancel);
        failure = read ? platform::Failure() : read.error();
        return read ? text : std::string();
    }
    std::set<std::string> names(platform::Remote& remote, const std::string& folder) {
        std::set<std::string> found;
        const auto listing = remote.list(folder, cancel);
        failure = listing ? platform::Failure() : listing.error();
        if (listing)
            for (const platform::RemoteEntry& entry : listing->entries)
                found.insert(entry.name);
        return found;
    }
    bool failedWith(platform::ErrorCode code) const { return failure && failure->is(code); }
    platform::Failure failure;
};

inline std::string nameOfCase(const ::testing::TestParamInfo<DavHost::Kind>& info) {
    return nameOf(info.param);
}
inline const auto everyServer =
    ::testing::Values(DavHost::Kind::apache, DavHost::Kind::lighttpd, DavHost::Kind::nginx,
                      DavHost::Kind::rclone);

} // namespace test
