#pragma once

#include "platform/system/EventThread.h"
#include "platform/system/SystemHandles.h"

#include <cstdint>
#include <memory>
#include <string>

namespace test {

/// Stands on a bus under NetworkManager's name with the properties that matter here.
class FakeNetworkManager {
public:
    explicit FakeNetworkManager(std::string busAddress);
    ~FakeNetworkManager();
    FakeNetworkManager(const FakeNetworkManager&) = delete;
    FakeNetworkManager& operator=(const FakeNetworkManager&) = delete;

    void set(std::uint32_t metered, const std::string& primaryConnectionType);
    /// Leaves the bus, and comes back to it with the properties as they were.
    void stop();
    void start();

private:
    struct Properties {
        std::uint32_t metered = 0;
        std::string type;
    };
    static int answer(sd_bus* bus, const char* path, const char* interface, const char* property,
                      sd_bus_message* reply, void* properties, sd_bus_error* error);

    std::string address_;
    std::unique_ptr<platform::EventThread> thread_ = platform::EventThread::create("test.manager");
    Properties properties_; // of the thread, as is the next
    platform::Bus bus_;
};

} // namespace test
