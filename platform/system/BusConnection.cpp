#include "platform/system/BusConnection.h"

#include "platform/base/Folders.h"
#include "platform/base/Process.h"

#include <unistd.h>

namespace platform {
namespace {

/// The library itself would wait a minute and a half for a bus that lets one in and says nothing.
bool becomesReady(sd_bus* bus, Duration patience) {
    const auto deadline = std::chrono::steady_clock::now() + patience;
    for (;;) {
        const int ready = sd_bus_is_ready(bus);
        if (ready != 0)
            return ready > 0;
        const auto left = std::chrono::duration_cast<std::chrono::microseconds>(
            deadline - std::chrono::steady_clock::now());
        if (left.count() <= 0)
            return false;
        const int result = sd_bus_process(bus, nullptr);
        if (result < 0 ||
            (result == 0 && sd_bus_wait(bus, static_cast<std::uint64_t>(left.count())) < 0))
            return false;
    }
}

} // namespace

Bus connectToBus(const std::string& address, Duration patience) {
    sd_bus* made = nullptr;
    if (address.empty() || sd_bus_new(&made) < 0)
        return nullptr;
    Bus bus(made);
    const auto limit = static_cast<std::uint64_t>(
        std::chrono::duration_cast<std::chrono::microseconds>(patience).count());
    if (sd_bus_set_address(made, address.c_str()) < 0 || sd_bus_set_bus_client(made, 1) < 0 ||
        sd_bus_set_method_call_timeout(made, limit) < 0 || sd_bus_start(made) < 0 ||
        !becomesReady(made, patience))
        return nullptr;
    return bus;
}

std::string sessionBusAddress() {
    if (const auto named = environmentVariable("DBUS_SESSION_BUS_ADDRESS"))
        return *named;
    const Folders folders = Folders::fromProcessEnvironment();
    const std::string usual = folders.runtime ? *folders.runtime + "/bus" : std::string();
    return !usual.empty() && ::access(usual.c_str(), F_OK) == 0 ? "unix:path=" + usual : "";
}

std::string busPathOf(std::string_view applicationIdentifier) {
    std::string path = "/";
    for (const char c : applicationIdentifier)
        path += c == '.' ? '/' : c == '-' ? '_' : c;
    return path;
}

} // namespace platform
