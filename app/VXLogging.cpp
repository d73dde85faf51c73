#include "app/VXLogging.h"

#include "platform/Platform.h"
#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/base/OperationQueue.h"
#include "platform/base/Process.h"
#include "platform/system/NotifyService.h"
#include "platform/system/PreferencesStore.h"

#include <algorithm>
#include <array>
#include <climits>
#include <mutex>
#include <source_location>
#include <utility>
#include <vector>

namespace tavrin {
namespace {

using platform::Platform;

constexpr int defaultThreshold = 6;
/// The lowest threshold that a preference can set: errors are always kept.
constexpr int lowestPreference = 3;
/// From here on everything passes and the service does not throttle.
constexpr int unthrottledThreshold = 8;
constexpr int highestServiceLevel = 7;
/// The level whose passing marks records for the log file.
constexpr int fileLevel = 6;
constexpr const char* quotaVariable = "JOT_QUOTA_DISABLED";
constexpr const char* markerFile = "/etc/vx_hella_logging";
constexpr std::string_view levelPreference = "VXLogLevel";

struct EarlyMessage {
    int level;
    std::string text;
    std::source_location where;
};

std::mutex earlyMutex;
std::vector<EarlyMessage> early; // guarded by earlyMutex

void writePlatformMessage(int level, const std::string& message,
                          const std::source_location& where) {
    const std::array<platform::FormatArgument, 1> arguments{platform::makeFormatArgument(message)};
    VXLogv(where.file_name(), where.function_name(), where.line(), "VX", level, nullptr, "%@",
           arguments);
}

const char* levelText(int level) {
    static constexpr std::array<const char*, 8> texts = {"0", "1", "2", "3", "4", "5", "6", "7"};
    return level >= 0 && level < static_cast<int>(texts.size())
               ? texts[static_cast<std::size_t>(level)]
               : "9";
}

struct ProcessNames {
    std::string host;
    std::string identifier;
};

const ProcessNames& processNames() {
    static const ProcessNames names{platform::hostName().value_or("UnknownHost"),
                                    std::to_string(platform::processIdentifier())};
    return names;
}

/// What one message carries from its caller's thread to the log queue.
struct Message {
    const char* file;
    const char* function;
    const char* category;
    unsigned line;
    int level;
    std::string text;
    std::string queueLabel;
    std::shared_ptr<const VXExtras> extras;
};

void fillRecord(platform::JotRecord& record, const Message& message) {
    if (const auto time = Platform::current().clock().preciseTime()) {
        record.set("Time", std::to_string(time->seconds));
        record.set("TimeNanoSec", std::to_string(time->microseconds * 1000));
    } else {
        record.set("Time", std::to_string(Platform::current().clock().now().wholeSeconds()));
    }
    record.set("Level", levelText(message.level));
    record.set("Facility", platform::applicationIdentifier);
    record.set("PID", processNames().identifier);
    record.set("Host", processNames().host);
    record.set("Message", message.text);
    record.set("Source", message.file);
    if (message.line >= 1)
        record.set("Line", std::to_string(message.line));
    record.set("Function", message.function);
    record.set("VXFacility", message.category);
    if (VXShouldLog(fileLevel))
        record.set("VXLogToFile", "1");
    if (!message.queueLabel.empty())
        record.set("Thread", message.queueLabel);
    if (message.extras)
        for (const auto& [key, value] : *message.extras)
            record.set(key, value);
}

void sendMessage(const Message& message) {
    if (const std::shared_ptr<VXJotClient>& client = VXJotClient::JotClient();
        client->isConnected()) {
        platform::JotService& jot = Platform::current().jot();
        if (const std::unique_ptr<platform::JotRecord> record = jot.createRecord()) {
            fillRecord(*record, message);
            jot.send(client->jotClient(), *record);
        }
    }
    platform::writeConsoleLine(message.text);
}

} // namespace

std::atomic<const VXJotClient*> detail::sharedClient{nullptr};

const std::shared_ptr<VXJotClient>& VXJotClient::JotClient() {
    // Never destroyed: other threads may log until the process has ended.
    static const std::shared_ptr<VXJotClient>& client = *new std::shared_ptr<VXJotClient>([] {
        std::shared_ptr<VXJotClient> made = create();
        detail::sharedClient.store(made.get(), std::memory_order_release);
        return made;
    }());
    return client;
}

VXJotClient::VXJotClient()
    : logLevel_(defaultThreshold),
      logQueue_(std::make_shared<platform::WorkQueue>(
          std::string(platform::applicationIdentifierLowercase) + ".logging",
          platform::WorkPriority::utility, -15)) {
}

std::shared_ptr<VXJotClient> VXJotClient::create() {
    std::shared_ptr<VXJotClient> client(new VXJotClient());
    client->logQueue_->sync([&client] {
        client->jotClient_ = Platform::current().jot().open({}, platform::applicationIdentifier, 0);
        client->_setLogLevelFromDefaults();
    });
    return client;
}

VXJotClient::~VXJotClient() {
    close();
}

void VXJotClient::close() {
    logQueue_->sync([this] {
        if (isConnected())
            Platform::current().jot().close(jotClient_);
        jotClient_ = 0;
    });
}

bool VXJotClient::isConnected() const {
    return jotClient_ != 0 && Platform::installed();
}

void VXJotClient::_setLogLevelFromDefaults() {
    static std::once_flag registered;
    static auto& token = *new platform::NotifyService::Token(); // kept to the end of the process
    std::call_once(registered, [this] {
        token = Platform::current().notify().observe(platform::managedSettingsChangedNotice,
                                                     *logQueue_, [self = shared_from_this()] {
                                                         if (self->isConnected())
                                                             self->_setLogLevelFromDefaults();
                                                     });
    });
    platform::StandardPreferences& preferences = Platform::current().standardPreferences();
    preferences.synchronize();
    const std::int64_t preferred = preferences.integer(levelPreference);
    int level = defaultThreshold;
    if (Platform::current().markerExists(markerFile))
        level = unthrottledThreshold;
    else if (preferred >= lowestPreference)
        level = static_cast<int>(std::min<std::int64_t>(preferred, INT_MAX));
    logLevel_.store(level, std::memory_order_relaxed);
    applyFilter();
    if (level < unthrottledThreshold) {
        platform::setEnvironmentVariable(quotaVariable, std::nullopt);
        return;
    }
    platform::setEnvironmentVariable(quotaVariable, "1");
    // Not here and now: VXLog fetches the shared client, which may be in the making.
    platform::OperationQueue::global().async([] { VXLOG(vxDebug, "Unthrottling logging"); });
}

void VXJotClient::applyFilter() {
    if (!isConnected())
        return;
    const auto levels = static_cast<std::uint32_t>(std::max(logLevelForJot(), -1) + 1);
    Platform::current().jot().setFilter(jotClient_, (1U << levels) - 1);
}

void VXJotClient::setLogLevel(int level) {
    logLevel_.store(level, std::memory_order_relaxed);
    logQueue_->sync([this] { applyFilter(); });
}

int VXJotClient::logLevelForJot() const {
    return std::min(logLevel(), highestServiceLevel);
}

void VXJotClient::performLoggingBlock(platform::Job job) {
    logQueue_->async(std::move(job));
}

void VXSetLogLevel(int level) {
    VXJotClient::JotClient()->setLogLevel(level);
}

int VXJotLogLevel() {
    return VXJotClient::JotClient()->logLevelForJot();
}

void VXLogv(const char* file, const char* function, unsigned line, const char* category, int level,
            std::shared_ptr<const VXExtras> extras, std::string_view format,
            std::span<const platform::FormatArgument> arguments) {
    if (!VXShouldLog(level))
        return;
    auto message = std::make_shared<Message>(
        Message{file, function, category, line, level, platform::formatRuntime(format, arguments),
                std::string(platform::WorkQueue::currentLabel()), std::move(extras)});
    VXJotClient::JotClient()->performLoggingBlock(
        [message = std::move(message)] { sendMessage(*message); });
}

void TavrinLogTest() {
    platform::writeConsoleLine(platform::format("Jot log level is %@", VXJotLogLevel()));
    static constexpr std::array<std::pair<int, const char*>, 6> levels = {{{7, "LOG_DEBUG"},
                                                                           {6, "LOG_INFO"},
                                                                           {4, "LOG_WARNING"},
                                                                           {3, "LOG_ERR"},
                                                                           {2, "LOG_CRIT"},
                                                                           {1, "LOG_ALERT"}}};
    for (const auto& [level, name] : levels)
        VXLog(__FILE__, __func__, __LINE__, "VX", level, "%@", name);
}

void keepPlatformLog() {
    platform::setLogSink({[](int level) { return level <= vxInfo; },
                          [](int level, std::string message, const std::source_location& where) {
                              const std::lock_guard lock(earlyMutex);
                              early.push_back({level, std::move(message), where});
                          }});
}

void connectPlatformLog() {
    platform::setLogSink({[](int level) { return VXShouldLog(level); }, writePlatformMessage});
    // Nobody adds to them any more.
    for (const EarlyMessage& each : std::exchange(early, {}))
        writePlatformMessage(each.level, each.text, each.where);
}

} // namespace tavrin
