#include "platform/base/Log.h"

#include "platform/base/OperationQueue.h"

#include <cstdio>
#include <memory>
#include <mutex>
#include <shared_mutex>

namespace platform {
namespace {

std::shared_mutex sinkMutex;
LogSink currentSink; // guarded by sinkMutex

} // namespace

void setLogSink(LogSink sink) {
    const std::unique_lock lock(sinkMutex);
    currentSink = std::move(sink);
}

bool logAccepts(LogLevel level) {
    const std::shared_lock lock(sinkMutex);
    if (!currentSink.accepts)
        return level <= LogLevel::warning;
    return currentSink.accepts(static_cast<int>(level));
}

void logMessage(LogLevel level, std::string message, const std::source_location& where) {
    const std::shared_lock lock(sinkMutex);
    if (currentSink.write)
        currentSink.write(static_cast<int>(level), std::move(message), where);
    else
        std::fprintf(stderr, "%s\n", message.c_str());
}

void logMessageLater(LogLevel level, std::string message, const std::source_location& where) {
    OperationQueue::global().async([level, message = std::move(message), where] {
        if (logAccepts(level))
            logMessage(level, message, where);
    });
}

} // namespace platform
