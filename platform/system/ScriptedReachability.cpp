#include "platform/base/Log.h"
#include "platform/files/FileManager.h"
#include "platform/files/ItemWatch.h"
#include "platform/system/ReachabilityReports.h"

#include <string_view>
#include <utility>

namespace platform {
namespace {

constexpr std::string_view filePrefix = "file:";
/// A script is a word; more of the file is not read.
constexpr std::uint64_t scriptLimit = 64;

std::string_view trimmed(std::string_view text) {
    constexpr std::string_view blank = " \t\r\n";
    const std::size_t first = text.find_first_not_of(blank);
    if (first == std::string_view::npos)
        return {};
    return text.substr(first, text.find_last_not_of(blank) - first + 1);
}

std::optional<std::uint32_t> flagsOf(std::string_view word) {
    if (word == "wifi")
        return reachabilityReachable;
    if (word == "cellular")
        return reachabilityReachable | reachabilityCellular;
    if (word == "offline")
        return 0;
    return std::nullopt;
}

/// The same state for every target, whatever its host.
class ConstantReachability : public ReachabilityService {
public:
    explicit ConstantReachability(std::uint32_t flags) : flags_(flags) {}

    std::unique_ptr<ReachabilityTarget> createTarget(const std::string& host) override {
        auto target = targets_.make(host);
        const std::lock_guard lock(mutex_);
        tellAll();
        return target;
    }

protected:
    void change(std::uint32_t flags) {
        const std::lock_guard lock(mutex_);
        flags_ = flags;
        tellAll();
    }

private:
    /// Under the lock, so that the reports keep the order of the changes.
    void tellAll() {
        for (const auto& target : targets_.living())
            target->tell(flags_);
    }

    ReachabilityTargets targets_;
    std::mutex mutex_;
    std::uint32_t flags_;
};

class FileReachability final : public ConstantReachability {
public:
    explicit FileReachability(std::string path)
        : ConstantReachability(read(path)),
          path_(std::move(path)),
          watch_(watcher_, path_, ItemWatch::Scope::item, queue_, [this] { change(read(path_)); }) {
        queue_.async([this] { change(read(path_)); }); // written before it was watched
    }

private:
    static std::uint32_t read(const std::string& path) {
        const Result<Bytes> found = FileManager::contents(Url::file(path), scriptLimit);
        if (!found)
            return 0;
        const std::string_view text(reinterpret_cast<const char*>(found->data()), found->size());
        const std::optional<std::uint32_t> flags = flagsOf(trimmed(text));
        if (!flags)
            platformLog(LogLevel::warning, "%@ says nothing of the network; it is taken as offline",
                        path);
        return flags.value_or(0);
    }

    std::string path_;
    DirectoryWatcher watcher_;
    WorkQueue queue_{"platform.reachability"};
    ItemWatch watch_;
};

} // namespace

std::unique_ptr<ReachabilityService> makeScriptedReachability(const std::string& script) {
    if (script.starts_with(filePrefix) && script.size() > filePrefix.size() &&
        script[filePrefix.size()] == '/')
        return std::make_unique<FileReachability>(script.substr(filePrefix.size()));
    const std::optional<std::uint32_t> flags = flagsOf(script);
    return flags ? std::make_unique<ConstantReachability>(*flags) : nullptr;
}

std::unique_ptr<ReachabilityService>
makeReachability(Clock& clock, const std::optional<std::string>& pelmoraNetwork) {
    if (pelmoraNetwork && !pelmoraNetwork->empty() && *pelmoraNetwork != "live") {
        if (auto scripted = makeScriptedReachability(*pelmoraNetwork))
            return scripted;
        platformLog(LogLevel::error,
                    "PELMORA_NETWORK is %@; it can be wifi, cellular, offline, live or file:/path",
                    *pelmoraNetwork);
    }
    return makeLiveReachability(clock);
}

} // namespace platform
