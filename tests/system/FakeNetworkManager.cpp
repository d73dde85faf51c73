#include "tests/system/FakeNetworkManager.h"

#include <cstring>

namespace test {
namespace {

constexpr const char* name = "org.freedesktop.NetworkManager";
constexpr const char* path = "/org/freedesktop/NetworkManager";

} // namespace

FakeNetworkManager::FakeNetworkManager(std::string busAddress) : address_(std::move(busAddress)) {
    start();
}

FakeNetworkManager::~FakeNetworkManager() {
    stop();
}

void FakeNetworkManager::start() {
    static const sd_bus_vtable table[] = {
        SD_BUS_VTABLE_START(0),
        SD_BUS_PROPERTY("Metered", "u", answer, 0, SD_BUS_VTABLE_PROPERTY_EMITS_CHANGE),
        SD_BUS_PROPERTY("PrimaryConnectionType", "s", answer, 0,
                        SD_BUS_VTABLE_PROPERTY_EMITS_CHANGE),
        SD_BUS_VTABLE_END};
    thread_->sync([this] {
        sd_bus* made = nullptr;
        sd_bus_new(&made);
        bus_.reset(made);
        sd_bus_set_address(made, address_.c_str());
        sd_bus_set_bus_client(made, 1);
        sd_bus_start(made);
        sd_bus_add_object_vtable(made, nullptr, path, name, table, &properties_);
        sd_bus_request_name(made, name, 0);
        sd_bus_attach_event(made, thread_->loop(), SD_EVENT_PRIORITY_NORMAL);
    });
}

void FakeNetworkManager::stop() {
    thread_->sync([this] { bus_.reset(); });
}

void FakeNetworkManager::set(std::uint32_t metered, const std::string& primaryConnectionType) {
    thread_->sync([&] {
        properties_ = {metered, primaryConnectionType};
        sd_bus_emit_properties_changed(bus_.get(), path, name, "Metered", "PrimaryConnectionType",
                                       nullptr);
    });
}

int FakeNetworkManager::answer(sd_bus* /*bus*/, const char* /*path*/, const char* /*interface*/,
                               const char* property, sd_bus_message* reply, void* properties,
                               sd_bus_error* /*error*/) {
    const auto& known = *static_cast<const Properties*>(properties);
    return std::strcmp(property, "Metered") == 0
               ? sd_bus_message_append(reply, "u", known.metered)
               : sd_bus_message_append(reply, "s", known.type.c_str());
}

} // namespace test
