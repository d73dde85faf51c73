#pragma once

#include <memory>
#include <systemd/sd-bus.h>
#include <systemd/sd-event.h>

namespace platform {

/// Owners of the system library's objects, for .cpp files below the line.
struct SystemHandleDeleter {
    void operator()(sd_event* loop) const { sd_event_unref(loop); }
    void operator()(sd_event_source* source) const { sd_event_source_disable_unref(source); }
    void operator()(sd_bus* bus) const { sd_bus_close_unref(bus); }
    void operator()(sd_bus_slot* slot) const { sd_bus_slot_unref(slot); }
    void operator()(sd_bus_message* message) const { sd_bus_message_unref(message); }
};
template<class T>
using SystemHandle = std::unique_ptr<T, SystemHandleDeleter>;

using EventLoop = SystemHandle<sd_event>;
using EventSource = SystemHandle<sd_event_source>;
using Bus = SystemHandle<sd_bus>;
using BusSlot = SystemHandle<sd_bus_slot>;
using BusMessage = SystemHandle<sd_bus_message>;

/// An error of a bus call, freed with the object.
class BusError {
public:
    BusError() = default;
    ~BusError() { sd_bus_error_free(&error_); }
    BusError(const BusError&) = delete;
    BusError& operator=(const BusError&) = delete;
    sd_bus_error* get() { return &error_; }
    /// In words; "" when there is none.
    const char* text() const { return error_.message ? error_.message : ""; }
    bool is(const char* name) const { return sd_bus_error_has_name(&error_, name) != 0; }

private:
    sd_bus_error error_ = SD_BUS_ERROR_NULL;
};

} // namespace platform
