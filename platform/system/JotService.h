#pragma once

#include "platform/base/Clock.h"

#include <cstdint>
#include <memory>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace platform {

/// One structured log record: text keys to text values, in the order in which they were set.
class JotRecord {
public:
    void set(std::string_view key, std::string_view value) { fields_.emplace_back(key, value); }
    const std::vector<std::pair<std::string, std::string>>& fields() const { return fields_; }

private:
    std::vector<std::pair<std::string, std::string>> fields_;
};

/// An open connection to the log service; 0 is none.
using JotHandle = std::uint64_t;

/// The structured system log: journald where there is one, else a rotating file in the state
/// folder. A connection limits its own rate unless the environment has JOT_QUOTA_DISABLED=1; what
/// it leaves out it counts and says. One connection is used from one queue at a time.
class JotService {
public:
    virtual ~JotService() = default;
    virtual JotHandle open(std::string_view sender, std::string_view facility,
                           std::uint32_t options) = 0;
    /// Bit n set lets records of level n (the text of their key "Level") through; 0xFF after
    /// opening. A record whose level has no bit of its own passes.
    virtual void setFilter(JotHandle handle, std::uint32_t mask) = 0;
    /// None when the service cannot make one.
    virtual std::unique_ptr<JotRecord> createRecord() = 0;
    virtual void send(JotHandle handle, const JotRecord& record) = 0;
    virtual void close(JotHandle handle) = 0;
};

/// The machine's journal when it answers, else files "log", "log.1", … in `stateFolder`: a JSON
/// object a line, a few megabytes each, shared by all processes that log there. `clock` times the
/// limit of the rate (none: the machine's) and outlives the service.
std::unique_ptr<JotService> makeJotService(std::string stateFolder, const Clock* clock = nullptr);

/// Writes one line to the console (standard error) with time and process before it, and what would
/// end the line or steer a terminal as "\n", "\t" or "\x1B".
void writeConsoleLine(std::string_view line);

} // namespace platform
