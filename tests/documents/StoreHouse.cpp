#include "tests/documents/StoreHouse.h"

#include "platform/cloud/AccountFile.h"
#include "platform/files/FileManager.h"

#include <fcntl.h>
#include <filesystem>
#include <future>
#include <stdexcept>
#include <unistd.h>

namespace fs = std::filesystem;

namespace test {
namespace {

constexpr auto patience = std::chrono::seconds(20);

platform::Folders foldersBelow(const TemporaryFolder& home) {
    platform::Folders folders;
    folders.home = home.path();
    folders.config = home / "config";
    folders.data = home / "data";
    folders.state = home / "state";
    folders.cache = home / "cache";
    return folders;
}

} // namespace

StoreHouse::StoreHouse() {
    home.makeFolder("remote/Documents");
    runPending = [this] { platform->mainQueue().drainAll(); };
    waitForWork = [this] {
        if (!std::exchange(wakes_, true))
            platform->mainQueue().setWake([this] {
                const std::lock_guard lock(mutex_);
                awake_ = true;
                woken_.notify_all();
            });
        std::unique_lock lock(mutex_);
        woken_.wait_for(lock, patience, [this] { return awake_; });
        awake_ = false;
    };
}

StoreHouse::~StoreHouse() = default;

void StoreHouse::start() {
    platform::PlatformParts parts;
    auto manual = std::make_unique<platform::ManualClock>();
    clock = manual.get();
    parts.clock = std::move(manual);
    parts.folders = foldersBelow(home);
    if (adjustParts)
        adjustParts(parts);
    platform = std::make_unique<platform::Platform>(std::move(parts));
}

void StoreHouse::signIn() {
    platform::AccountRecord account;
    account.kind = platform::folderAccountKind;
    account.address = remote;
    account.name = "anna@example.org";
    account.rateLimit = rateLimit;
    account.quota = quota;
    account.identity = platform::Bytes(16, std::byte{7});
    if (const auto failure = platform::writeAccount(foldersBelow(home), account))
        throw std::runtime_error(failure->localizedDescription.value_or("no account"));
    start();
    std::promise<void> listed;
    platform->cloud().refresh(std::nullopt,
                              [&listed](const platform::Failure&) { listed.set_value(); });
    if (listed.get_future().wait_for(patience) != std::future_status::ready)
        throw std::runtime_error("the store was never listed");
}

void StoreHouse::withoutAccount() {
    start();
}

void StoreHouse::givenRemote(std::string_view path, std::string_view content) {
    home.write("remote/" + (path.starts_with('/') ? std::string(path.substr(1))
                                                  : "Documents/" + std::string(path)),
               content);
}

std::string StoreHouse::path(std::string_view relative) const {
    const auto root = documents().shelfroot();
    if (!root)
        throw std::runtime_error("there is no store");
    if (relative.starts_with('/'))
        return relative.size() == 1 ? root->path() : root->path() + std::string(relative);
    const std::string documents = root->path() + "/Documents";
    return relative.empty() ? documents : documents + "/" + std::string(relative);
}

platform::Url StoreHouse::url(std::string_view relative) const {
    return platform::Url::file(path(relative));
}

std::string StoreHouse::givenFile(std::string_view relative, std::string_view content) const {
    const std::string file = path(relative);
    const std::size_t below = home.path().size() + 1;
    return home.write(file.substr(below), content);
}

std::string StoreHouse::givenFolder(std::string_view relative) const {
    return home.makeFolder(path(relative).substr(home.path().size() + 1));
}

void StoreHouse::givenManyFiles(std::string_view folder, int count) const {
    const std::string prefix = givenFolder(folder) + "/IMG ";
    for (int i = 0; i < count; ++i) {
        const std::string file = prefix + std::to_string(i) + ".jpg";
        ::close(::open(file.c_str(), O_CREAT | O_WRONLY | O_CLOEXEC, 0644));
    }
}

void StoreHouse::rename(std::string_view from, std::string_view to) const {
    fs::rename(path(from), path(to));
}

void StoreHouse::remove(std::string_view relative) const {
    fs::remove_all(path(relative));
}

bool StoreHouse::until(const std::function<bool()>& condition) {
    const auto deadline = std::chrono::steady_clock::now() + patience;
    for (;;) {
        runPending();
        if (condition())
            return true;
        if (std::chrono::steady_clock::now() >= deadline)
            return false;
        waitForWork();
    }
}

} // namespace test
