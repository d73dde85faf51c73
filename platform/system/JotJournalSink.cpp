#include "platform/files/FileDescriptor.h"
#include "platform/system/JotSink.h"

#define SD_JOURNAL_SUPPRESS_LOCATION
#include <algorithm>
#include <cerrno>
#include <cstring>
#include <sys/socket.h>
#include <sys/uio.h>
#include <sys/un.h>
#include <systemd/sd-journal.h>
#include <vector>

namespace platform {
namespace {

constexpr const char* journalSocket = "/run/systemd/journal/socket";
constexpr std::size_t longestField = 64;

/// The journal's own name for what every record says; "" for other keys.
std::string_view wellKnownField(std::string_view key) {
    if (key == "Source")
        return "CODE_FILE";
    if (key == "Line")
        return "CODE_LINE";
    return key == "Function" ? "CODE_FUNC" : "";
}

/// The journal takes capitals, digits and underscores, not in front an underscore or a digit.
std::string journalField(std::string_view key) {
    std::string field;
    for (const char c : key.substr(0, longestField)) {
        const bool lower = c >= 'a' && c <= 'z';
        const bool allowed = (c >= 'A' && c <= 'Z') || (c >= '0' && c <= '9');
        field += lower ? static_cast<char>(c - 'a' + 'A') : allowed ? c : '_';
    }
    if (field.empty() || field.front() < 'A' || field.front() > 'Z')
        field.insert(0, "X");
    field.resize(std::min(field.size(), longestField));
    return field;
}

/// True when the field's name says all that the key said, but for the case of letters.
bool saysTheSame(std::string_view key, std::string_view field) {
    return key.size() == field.size() &&
           std::equal(key.begin(), key.end(), field.begin(), [](char a, char b) {
               return (a >= 'a' && a <= 'z' ? a - 'a' + 'A' : a) == b;
           });
}

class JournalSink final : public JotSink {
public:
    bool write(const std::string& sender, const JotRecord& record) override {
        std::vector<std::string> fields;
        const auto add = [&fields](std::string_view field, std::string_view value) {
            fields.push_back(std::string(field).append("=").append(value));
        };
        add("SYSLOG_IDENTIFIER", sender);
        for (const auto& [key, value] : record.fields()) {
            const std::string field = journalField(key);
            add(field, value);
            if (!saysTheSame(key, field))
                add("KEY_OF_" + field.substr(0, longestField - 7), key);
            if (const std::string_view known = wellKnownField(key); !known.empty())
                add(known, value);
            if (key == "Level")
                add("PRIORITY", value.size() == 1 && value < "8" ? value : "7");
        }
        std::vector<iovec> parts;
        parts.reserve(fields.size());
        for (std::string& field : fields)
            parts.push_back({field.data(), field.size()});
        return sd_journal_sendv(parts.data(), static_cast<int>(parts.size())) == 0;
    }
};

/// Asked of the socket itself: where nobody listens, sending would succeed silently.
bool journalAnswers() {
    const FileDescriptor connection(::socket(AF_UNIX, SOCK_DGRAM | SOCK_CLOEXEC, 0));
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    std::strncpy(address.sun_path, journalSocket, sizeof address.sun_path - 1);
    return connection && ::connect(connection.get(), reinterpret_cast<const sockaddr*>(&address),
                                   sizeof address) == 0;
}

} // namespace

std::unique_ptr<JotSink> makeJournalSink() {
    return journalAnswers() ? std::make_unique<JournalSink>() : nullptr;
}

} // namespace platform
