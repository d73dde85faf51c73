#include "platform/system/MeteredConnection.h"

#include "platform/base/Log.h"
#include "platform/system/EventThread.h"
#include "platform/system/SystemHandles.h"

#include <cstdint>
#include <cstring>
#include <string>
#include <string_view>
#include <utility>

namespace platform {
namespace {

constexpr const char* managerName = "org.freedesktop.NetworkManager";
constexpr const char* managerPath = "/org/freedesktop/NetworkManager";
constexpr const char* propertiesInterface = "org.freedesktop.DBus.Properties";

/// NetworkManager's words for it: 1 is yes, 3 a guess of yes.
bool meansMetered(std::uint32_t metered) {
    return metered == 1 || metered == 3;
}

bool isMobile(std::string_view connectionType) {
    return connectionType == "gsm" || connectionType == "cdma" || connectionType == "bluetooth";
}

} // namespace

struct MeteredConnection::State {
    std::function<void(bool cellular)> changed;
    Bus bus;
    BusSlot propertyMatch;
    BusSlot ownerMatch;
    BusSlot endMatch;
    BusSlot question;
    std::uint32_t metered = 0;
    std::string connectionType;
    bool cellular = false;

    bool open(EventThread& thread) {
        sd_bus* made = nullptr;
        if (sd_bus_open_system(&made) < 0)
            return false;
        bus.reset(made);
        sd_bus_slot* properties = nullptr;
        sd_bus_slot* owner = nullptr;
        sd_bus_slot* end = nullptr;
        if (sd_bus_match_signal_async(made, &properties, managerName, managerPath,
                                      propertiesInterface, "PropertiesChanged", propertiesChanged,
                                      nullptr, this) < 0 ||
            sd_bus_add_match_async(made, &owner,
                                   "type='signal',sender='org.freedesktop.DBus',"
                                   "interface='org.freedesktop.DBus',member='NameOwnerChanged',"
                                   "arg0='org.freedesktop.NetworkManager'",
                                   ownerChanged, nullptr, this) < 0 ||
            sd_bus_add_match_async(made, &end,
                                   "type='signal',interface='org.freedesktop.DBus.Local',"
                                   "member='Disconnected'",
                                   disconnected, nullptr, this) < 0)
            return false;
        propertyMatch.reset(properties);
        ownerMatch.reset(owner);
        endMatch.reset(end);
        return sd_bus_attach_event(made, thread.loop(), SD_EVENT_PRIORITY_NORMAL) >= 0;
    }

    /// Asks for everything; without NetworkManager the answer is an error, which means "no".
    void ask() {
        sd_bus_message* made = nullptr;
        sd_bus_slot* slot = nullptr;
        if (sd_bus_message_new_method_call(bus.get(), &made, managerName, managerPath,
                                           propertiesInterface, "GetAll") < 0)
            return;
        const BusMessage message(made);
        // Nobody is started for the sake of this question.
        if (sd_bus_message_set_auto_start(made, 0) >= 0 &&
            sd_bus_message_append(made, "s", managerName) >= 0 &&
            sd_bus_call_async(bus.get(), &slot, made, answered, this, 0) >= 0)
            question.reset(slot);
    }

    static int answered(sd_bus_message* message, void* self, sd_bus_error* /*error*/) {
        auto& state = *static_cast<State*>(self);
        if (sd_bus_message_is_method_error(message, nullptr) != 0)
            state.forget();
        else
            state.read(message);
        return 0;
    }

    static int propertiesChanged(sd_bus_message* message, void* self, sd_bus_error* /*error*/) {
        const char* interface = nullptr;
        if (sd_bus_message_read(message, "s", &interface) > 0 &&
            std::string_view(interface) == managerName)
            static_cast<State*>(self)->read(message);
        return 0;
    }

    static int ownerChanged(sd_bus_message* message, void* self, sd_bus_error* /*error*/) {
        auto& state = *static_cast<State*>(self);
        const char* name = nullptr;
        const char* former = nullptr;
        const char* now = nullptr;
        if (sd_bus_message_read(message, "sss", &name, &former, &now) <= 0)
            return 0;
        if (*now == '\0')
            state.forget();
        else
            state.ask();
        return 0;
    }

    static int disconnected(sd_bus_message* /*message*/, void* self, sd_bus_error* /*error*/) {
        static_cast<State*>(self)->forget();
        return 0;
    }

    void forget() {
        metered = 0;
        connectionType.clear();
        decide();
    }

    /// Takes what is of interest out of a dictionary of properties.
    void read(sd_bus_message* message) {
        if (sd_bus_message_enter_container(message, 'a', "{sv}") <= 0)
            return;
        while (sd_bus_message_enter_container(message, 'e', "sv") > 0) {
            const char* key = nullptr;
            const char* type = nullptr;
            if (sd_bus_message_read(message, "s", &key) <= 0)
                return;
            if (std::strcmp(key, "Metered") == 0) {
                if (sd_bus_message_read(message, "v", "u", &metered) < 0)
                    return;
            } else if (std::strcmp(key, "PrimaryConnectionType") == 0) {
                if (sd_bus_message_read(message, "v", "s", &type) < 0)
                    return;
                connectionType = type;
            } else if (sd_bus_message_skip(message, "v") < 0) {
                return;
            }
            sd_bus_message_exit_container(message);
        }
        decide();
    }

    void decide() {
        const bool now = meansMetered(metered) || isMobile(connectionType);
        if (std::exchange(cellular, now) != now)
            changed(now);
    }
};

MeteredConnection::MeteredConnection(EventThread& thread, std::function<void(bool)> changed)
    : state_(std::make_unique<State>()) {
    state_->changed = std::move(changed);
    if (state_->open(thread))
        state_->ask();
    else
        platformLog(LogLevel::debug, "No system bus: whether the network is metered is unknown");
}

MeteredConnection::~MeteredConnection() = default;

} // namespace platform
