#pragma once

#include "platform/system/JotService.h"

#include <memory>
#include <string>
#include <vector>

namespace test {

/// What the program said to the structured log since the last clearLog, oldest first. The program's
/// log client opens its connection once a process, so the records of all services land here.
std::vector<platform::JotRecord> logRecords();
/// "6 Begin Edit mode": level and message of each record.
std::vector<std::string> logLines();
bool logged(const std::string& line);
void clearLog();
/// The value of a key; "" where the record has none.
std::string valueOf(const platform::JotRecord& record, std::string_view key);

/// A log service that keeps what it is sent. The rest of its behaviour can be looked at as well.
struct CapturingJot : platform::JotService {
    platform::JotHandle open(std::string_view sender, std::string_view facility,
                             std::uint32_t options) override;
    void setFilter(platform::JotHandle handle, std::uint32_t mask) override;
    std::unique_ptr<platform::JotRecord> createRecord() override;
    void send(platform::JotHandle handle, const platform::JotRecord& record) override;
    void close(platform::JotHandle handle) override;

    /// The last one set by anybody in this process.
    static std::uint32_t filter();
    static std::string lastFacility();
    /// From now on no record can be made.
    static void refuseRecords(bool refuse);
};

} // namespace test
