#pragma once

#include "platform/base/Format.h"

#include <functional>
#include <source_location>
#include <string>

namespace platform {

/// Levels of the syslog scale that platform code uses.
enum class LogLevel { error = 3, warning = 4, info = 6, debug = 7 };

struct LogSink {
    /// Whether a message of that level would be kept; called on any thread, must be quick.
    std::function<bool(int level)> accepts;
    /// Takes the finished message; called on any thread, must not block.
    std::function<void(int level, std::string message, const std::source_location& where)> write;
};

/// Where platform messages go: the application's log service, or a test's list. Without a sink,
/// errors and warnings go to the console.
void setLogSink(LogSink sink);
bool logAccepts(LogLevel level);
void logMessage(LogLevel level, std::string message, const std::source_location& where);
/// Logs from the process-wide queue, later.
void logMessageLater(LogLevel level, std::string message, const std::source_location& where);

/// A format with the place where it stands.
template<class... Args>
struct LogFormat {
    consteval LogFormat(const char* text, // NOLINT(google-explicit-constructor)
                        std::source_location place = std::source_location::current())
        : format(text), where(place) {}
    FormatString<Args...> format;
    std::source_location where;
};

/// Logs from platform code; the product's own code uses VXLog.
template<class... Args>
void platformLog(LogLevel level, std::type_identity_t<LogFormat<Args...>> text,
                 const Args&... args) {
    if (!logAccepts(level))
        return;
    const std::array<FormatArgument, sizeof...(Args)> arguments{makeFormatArgument(args)...};
    logMessage(level, formatRuntime(text.format.text(), arguments), text.where);
}

/// The same from code that the log service itself rests on (preferences, notices, watched folders):
/// it may be the log service's own start that calls it, and then nobody may log on that thread.
template<class... Args>
void platformLogLater(LogLevel level, std::type_identity_t<LogFormat<Args...>> text,
                      const Args&... args) {
    const std::array<FormatArgument, sizeof...(Args)> arguments{makeFormatArgument(args)...};
    logMessageLater(level, formatRuntime(text.format.text(), arguments), text.where);
}

} // namespace platform
