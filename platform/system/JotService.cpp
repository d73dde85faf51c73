#include "platform/system/JotService.h"

#include "platform/base/Format.h"
#include "platform/base/Process.h"
#include "platform/system/JotSink.h"

#include <cerrno>
#include <map>
#include <mutex>

namespace platform {
namespace {

/// A connection may send that many records in that time: far more than a person causes, far less
/// than a loop gone wild.
constexpr int recordLimit = 2000;
constexpr Duration limitedTime = std::chrono::seconds(10);
constexpr std::string_view levelOfNotice = "4";

struct Connection {
    std::string sender;
    std::string facility;
    std::uint32_t mask = 0xFF;
    Duration since{};
    int sent = 0;
    std::uint64_t leftOut = 0;
    /// Records that could not be written.
    std::uint64_t lost = 0;
};

bool quotaDisabled() {
    return environmentVariable("JOT_QUOTA_DISABLED") == "1";
}

bool passes(std::uint32_t mask, const JotRecord& record) {
    for (const auto& [key, value] : record.fields())
        if (key == "Level" && value.size() == 1 && value[0] >= '0' && value[0] <= '7')
            return (mask >> (value[0] - '0') & 1U) != 0;
    return true;
}

class SinkJotService final : public JotService {
public:
    SinkJotService(std::string stateFolder, const Clock* clock)
        : clock_(clock),
          journal_(makeJournalSink()),
          files_(makeFileSink(std::move(stateFolder))) {}

    JotHandle open(std::string_view sender, std::string_view facility,
                   std::uint32_t /*options*/) override {
        const std::lock_guard lock(mutex_);
        Connection& connection = connections_[++last_];
        connection.sender = sender.empty() ? program_invocation_short_name : std::string(sender);
        connection.facility = facility;
        connection.since = now();
        return last_;
    }

    void setFilter(JotHandle handle, std::uint32_t mask) override {
        const std::lock_guard lock(mutex_);
        if (const auto found = connections_.find(handle); found != connections_.end())
            found->second.mask = mask;
    }

    std::unique_ptr<JotRecord> createRecord() override { return std::make_unique<JotRecord>(); }

    void send(JotHandle handle, const JotRecord& record) override {
        const std::lock_guard lock(mutex_);
        const auto found = connections_.find(handle);
        if (found == connections_.end() || !passes(found->second.mask, record))
            return;
        Connection& connection = found->second;
        if (!withinLimit(connection)) {
            ++connection.leftOut;
            return;
        }
        sayWhatIsMissing(connection);
        if (!write(connection, record))
            ++connection.lost;
    }

    void close(JotHandle handle) override {
        const std::lock_guard lock(mutex_);
        const auto found = connections_.find(handle);
        if (found == connections_.end())
            return;
        sayWhatIsMissing(found->second);
        connections_.erase(found);
    }

private:
    Duration now() const {
        return clock_ ? clock_->monotonic() : std::chrono::steady_clock::now().time_since_epoch();
    }

    bool withinLimit(Connection& connection) const {
        if (quotaDisabled())
            return true;
        if (now() - connection.since >= limitedTime) {
            connection.since = now();
            connection.sent = 0;
        }
        return connection.sent++ < recordLimit;
    }

    bool write(const Connection& connection, const JotRecord& record) {
        if (journal_ && journal_->write(connection.sender, record))
            return true;
        return files_->write(connection.sender, record);
    }

    void sayWhatIsMissing(Connection& connection) {
        const std::uint64_t missing = connection.leftOut + connection.lost;
        if (missing == 0)
            return;
        JotRecord notice;
        notice.set("Level", levelOfNotice);
        notice.set("Facility", connection.facility);
        notice.set("PID", std::to_string(processIdentifier()));
        notice.set("Message",
                   format("%u log messages are missing here: %u above the limit of the rate, %u "
                          "could not be written",
                          missing, connection.leftOut, connection.lost));
        if (write(connection, notice))
            connection.leftOut = connection.lost = 0;
    }

    const Clock* clock_;
    std::mutex mutex_;
    std::unique_ptr<JotSink> journal_;
    std::unique_ptr<JotSink> files_;
    std::map<JotHandle, Connection> connections_;
    JotHandle last_ = 0;
};

} // namespace

std::unique_ptr<JotService> makeJotService(std::string stateFolder, const Clock* clock) {
    return std::make_unique<SinkJotService>(std::move(stateFolder), clock);
}

} // namespace platform
