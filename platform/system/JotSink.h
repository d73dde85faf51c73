#pragma once

#include "platform/system/JotService.h"

#include <memory>
#include <string>

namespace platform {

/// Where records go. One call at a time.
class JotSink {
public:
    virtual ~JotSink() = default;
    /// False when the record could not be kept.
    virtual bool write(const std::string& sender, const JotRecord& record) = 0;
};

/// The system's journal; none when it does not answer.
std::unique_ptr<JotSink> makeJournalSink();
/// The files "log", "log.1", … of that folder, which is made when it is missing.
std::unique_ptr<JotSink> makeFileSink(std::string folder);

} // namespace platform
