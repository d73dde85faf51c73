#include "platform/system/DeskNotice.h"

#include "platform/base/Identity.h"
#include "platform/system/BusConnection.h"

#include <cstdio>
#include <string>
#include <unistd.h>

namespace platform {
namespace {

constexpr const char* noticesName = "org.freedesktop.Notifications";
constexpr const char* noticesPath = "/org/freedesktop/Notifications";
/// A desk without a service for notices must not keep the program from ending.
constexpr auto patience = std::chrono::seconds(2);
constexpr int desksOwnTime = -1;

/// What angle brackets and ampersands would do in a notice is up to the desk.
std::string asPlainText(const std::string& text) {
    std::string out;
    for (const char c : text) {
        if (c == '<')
            out += "&lt;";
        else if (c == '&')
            out += "&amp;";
        else
            out += c;
    }
    return out;
}

void showNotice(const std::string& text, const std::string& busAddress) {
    const Bus bus = connectToBus(busAddress, patience);
    if (!bus)
        return;
    const std::string name(applicationName);
    const std::string icon(applicationIdentifier);
    // Whether it was shown nobody can help any more.
    static_cast<void>(sd_bus_call_method(bus.get(), noticesName, noticesPath, noticesName, "Notify",
                                         nullptr, nullptr, "susssasa{sv}i", name.c_str(), 0U,
                                         icon.c_str(), name.c_str(), asPlainText(text).c_str(), 0,
                                         0, desksOwnTime));
}

} // namespace

void sayStartFailed(std::string_view program, const Error& error, const std::string& busAddress) {
    const std::string text = error.localizedDescription.value_or("");
    std::fprintf(stderr, "%.*s: %s\n", static_cast<int>(program.size()), program.data(),
                 text.c_str());
    if (::isatty(STDERR_FILENO) == 0)
        showNotice(text, busAddress);
}

} // namespace platform
