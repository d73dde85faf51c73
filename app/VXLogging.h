#pragma once

#include "platform/base/Format.h"
#include "platform/base/WorkQueue.h"
#include "platform/system/JotService.h"

#include <atomic>
#include <functional>
#include <map>
#include <memory>
#include <span>
#include <string>
#include <string_view>

namespace tavrin {

/// Levels of the syslog scale, as the program uses them.
enum VXLevel : int { vxError = 3, vxWarning = 4, vxInfo = 6, vxDebug = 7 };

/// Extra pairs of one record, in the order of their keys.
using VXExtras = std::map<std::string, std::string>;

/// The connection of the program to the structured log: the threshold, and the queue on which
/// records are built, sent and echoed to the console. Shared; safe from any thread.
class VXJotClient : public std::enable_shared_from_this<VXJotClient> {
public:
    /// The shared client; the first call makes it. Nothing inside that may log synchronously.
    static const std::shared_ptr<VXJotClient>& JotClient();
    /// Opens the connection and evaluates the threshold, on the new client's queue.
    static std::shared_ptr<VXJotClient> create();
    ~VXJotClient();
    VXJotClient(const VXJotClient&) = delete;
    VXJotClient& operator=(const VXJotClient&) = delete;

    /// The threshold: a message of level m passes when logLevel() >= m.
    int logLevel() const { return logLevel_.load(std::memory_order_relaxed); }
    /// At once on the calling thread; the service's filter follows before it returns.
    void setLogLevel(int level);
    /// logLevel(), at most 7.
    int logLevelForJot() const;
    void performLoggingBlock(platform::Job job);

    platform::JotHandle jotClient() const { return jotClient_; }
    void setJotClient(platform::JotHandle handle) { jotClient_ = handle; }
    const std::shared_ptr<platform::WorkQueue>& logQueue() const { return logQueue_; }
    void setLogQueue(std::shared_ptr<platform::WorkQueue> queue) { logQueue_ = std::move(queue); }

private:
    VXJotClient();
    void _setLogLevelFromDefaults();
    void storeLevel(int level);
    void applyFilter();

    platform::JotHandle jotClient_ = 0; // used on logQueue_ only
    std::atomic<int> logLevel_;
    std::shared_ptr<platform::WorkQueue> logQueue_;
};

namespace detail {
/// The shared client's threshold once there is one; before that a value that lets everything on to
/// the client, so that a dropped message costs one comparison.
extern std::atomic<int> sharedThreshold;
} // namespace detail

void VXSetLogLevel(int level);
int VXJotLogLevel();

inline bool VXShouldLog(int level) {
    return detail::sharedThreshold.load(std::memory_order_relaxed) >= level &&
           VXJotClient::JotClient()->logLevel() >= level;
}

/// Formats on the calling thread and hands the record to the log queue. `file`, `function` and
/// `category` are kept by reference: literals.
void VXLogv(const char* file, const char* function, unsigned line, const char* category, int level,
            std::shared_ptr<const VXExtras> extras, std::string_view format,
            std::span<const platform::FormatArgument> arguments);

template<class... Args>
void VXLog(const char* file, const char* function, unsigned line, const char* category, int level,
           std::type_identity_t<platform::FormatString<Args...>> format, const Args&... args) {
    const std::array<platform::FormatArgument, sizeof...(Args)> arguments{
        platform::makeFormatArgument(args)...};
    VXLogv(file, function, line, category, level, nullptr, format.text(), arguments);
}

/// Writes the six levels once each; for trying out the log by hand.
void _TavrinLogTest();

/// Sends what the platform logs through the same client, under the file and line where it stands.
void connectPlatformLog();

} // namespace tavrin

/// The log call: file, function, line and category are filled in, and the arguments are evaluated
/// only when the level passes.
#define VXLOG(level, ...)                                                                          \
    do {                                                                                           \
        if (::tavrin::VXShouldLog(level))                                                          \
            ::tavrin::VXLog(__FILE__, __PRETTY_FUNCTION__, __LINE__, "VX", level, __VA_ARGS__);    \
    } while (false)
