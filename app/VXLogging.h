#pragma once

#include "platform/base/Format.h"
#include "platform/base/WorkQueue.h"
#include "platform/system/JotService.h"

#include <array>
#include <atomic>
#include <map>
#include <memory>
#include <span>
#include <string>
#include <string_view>
#include <type_traits>

namespace tavrin {

/// Levels of the syslog scale, as the program uses them.
enum VXLevel : int { vxError = 3, vxWarning = 4, vxInfo = 6, vxDebug = 7 };

/// Extra pairs of one record, in the order of their keys.
using VXExtras = std::map<std::string, std::string>;

/// The connection of the program to the structured log: the threshold, and the queue on which
/// records are built, sent and echoed to the console. Shared; safe from any thread.
class VXJotClient : public std::enable_shared_from_this<VXJotClient> {
public:
    /// The shared client; the first call makes it, and it stays to the end of the process. Nothing
    /// inside its making may log synchronously.
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
    /// Closes the connection after what was logged so far. Later messages reach the console alone,
    /// so that nothing uses the platform's services while they go away.
    void close();
    /// On logQueue(): there is a connection, and a service behind it.
    bool isConnected() const;

    platform::JotHandle jotClient() const { return jotClient_; }
    void setJotClient(platform::JotHandle handle) { jotClient_ = handle; }
    const std::shared_ptr<platform::WorkQueue>& logQueue() const { return logQueue_; }
    void setLogQueue(std::shared_ptr<platform::WorkQueue> queue) { logQueue_ = std::move(queue); }

private:
    VXJotClient();
    void _setLogLevelFromDefaults();
    void applyFilter();

    platform::JotHandle jotClient_ = 0; // used on logQueue_ only
    std::atomic<int> logLevel_;
    std::shared_ptr<platform::WorkQueue> logQueue_;
};

namespace detail {
/// The shared client once there is one, so that a dropped message costs one comparison.
extern std::atomic<const VXJotClient*> sharedClient;
} // namespace detail

void VXSetLogLevel(int level);
int VXJotLogLevel();

inline bool VXShouldLog(int level) {
    const VXJotClient* const client = detail::sharedClient.load(std::memory_order_acquire);
    return (client ? client : VXJotClient::JotClient().get())->logLevel() >= level;
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
void TavrinLogTest();

/// Keeps what the platform logs while it is being put together, for connectPlatformLog to write.
void keepPlatformLog();
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
