#include "tests/product/LogCapture.h"

#include "app/VXLogging.h"

#include <algorithm>
#include <atomic>
#include <mutex>

namespace test {
namespace {

struct Captured {
    std::mutex mutex;
    std::vector<platform::JotRecord> records;
    std::string facility;
    std::atomic<std::uint32_t> filter{0};
    std::atomic<bool> refuses{false};
};

Captured& captured() {
    static Captured all;
    return all;
}

} // namespace

platform::JotHandle CapturingJot::open(std::string_view /*sender*/, std::string_view facility,
                                       std::uint32_t /*options*/) {
    const std::lock_guard lock(captured().mutex);
    captured().facility = facility;
    return 1;
}

void CapturingJot::setFilter(platform::JotHandle /*handle*/, std::uint32_t mask) {
    captured().filter = mask;
}

std::unique_ptr<platform::JotRecord> CapturingJot::createRecord() {
    return captured().refuses ? nullptr : std::make_unique<platform::JotRecord>();
}

void CapturingJot::send(platform::JotHandle /*handle*/, const platform::JotRecord& record) {
    const std::lock_guard lock(captured().mutex);
    captured().records.push_back(record);
}

void CapturingJot::close(platform::JotHandle /*handle*/) {
}

std::uint32_t CapturingJot::filter() {
    return captured().filter;
}

std::string CapturingJot::lastFacility() {
    const std::lock_guard lock(captured().mutex);
    return captured().facility;
}

void CapturingJot::refuseRecords(bool refuse) {
    captured().refuses = refuse;
}

std::vector<platform::JotRecord> logRecords() {
    tavrin::VXJotClient::JotClient()->logQueue()->sync([] {});
    const std::lock_guard lock(captured().mutex);
    return captured().records;
}

std::vector<std::string> logLines() {
    std::vector<std::string> lines;
    for (const platform::JotRecord& record : logRecords())
        lines.push_back(valueOf(record, "Level") + ' ' + valueOf(record, "Message"));
    return lines;
}

bool logged(const std::string& line) {
    const std::vector<std::string> lines = logLines();
    return std::ranges::find(lines, line) != lines.end();
}

void clearLog() {
    tavrin::VXJotClient::JotClient()->logQueue()->sync([] {});
    const std::lock_guard lock(captured().mutex);
    captured().records.clear();
}

std::string valueOf(const platform::JotRecord& record, std::string_view key) {
    for (const auto& [name, value] : record.fields())
        if (name == key)
            return value;
    return "";
}

} // namespace test
