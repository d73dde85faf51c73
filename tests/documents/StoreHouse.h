#pragma once

#include "platform/Platform.h"
#include "platform/base/ManualClock.h"
#include "platform/cloud/CloudService.h"
#include "platform/documents/DocumentServices.h"
#include "tests/support/TemporaryFolder.h"

#include <condition_variable>
#include <cstdint>
#include <functional>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <string_view>

namespace test {

/// The platform on a temporary folder and a clock that stands still, with a signed-in store: a real
/// remote, a real database, real promises. One at a time.
class StoreHouse {
public:
    StoreHouse();
    ~StoreHouse();

    /// Puts the platform in place; what givenRemote said before is in the store afterwards.
    void signIn();
    /// The same with nobody signed in.
    void withoutAccount();
    /// A document that is in the cloud only.
    void givenRemote(std::string_view path, std::string_view content = "in the cloud");
    /// In the default container, unless the path starts with "/" (then below the store's root).
    std::string path(std::string_view relative) const;
    platform::Url url(std::string_view relative = "") const;
    std::string givenFile(std::string_view relative, std::string_view content = "x") const;
    std::string givenFolder(std::string_view relative) const;
    /// Empty files "IMG 0.jpg", "IMG 1.jpg" and so on.
    void givenManyFiles(std::string_view folder, int count) const;
    void rename(std::string_view from, std::string_view to) const;
    void remove(std::string_view relative) const;

    /// Runs the main queue until the condition holds; false when it never does.
    bool until(const std::function<bool()>& condition);

    platform::CloudDocumentService& documents() const { return platform->documents(); }
    platform::DocumentServices services() const { return platform::DocumentServices::current(); }

    /// Puts parts of its own into the platform before it starts.
    std::function<void(platform::PlatformParts&)> adjustParts;

    /// Bytes a second that the account's transfers may take, from the next signIn on.
    std::optional<std::uint64_t> rateLimit;
    /// Size of the account in bytes, from the next signIn on.
    std::optional<std::uint64_t> quota;
    TemporaryFolder home;
    /// What the account signs in to.
    std::string remote = home / "remote";
    platform::ManualClock* clock = nullptr;
    std::unique_ptr<platform::Platform> platform;
    /// Runs what waits on the main thread, and the toolkit's events where there are any.
    std::function<void()> runPending;
    /// Returns when there may be something to run, or after a while.
    std::function<void()> waitForWork;

private:
    void start();
    std::mutex mutex_;
    std::condition_variable woken_;
    bool awake_ = false;
    bool wakes_ = false;
};

} // namespace test
