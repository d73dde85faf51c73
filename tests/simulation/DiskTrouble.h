#pragma once

#include "tests/simulation/machine/Fibers.h"
#include "tests/simulation/machine/Machine.h"

#include <cstdint>
#include <cstring>
#include <functional>
#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace simulation {

/// Fails calls of the engine's by their number from now on, and tells of those that changed
/// something. The database is spared: what it makes of a failing disk is its makers' to test.
class DiskTrouble final : public DiskListener {
public:
    /// By the number of the call (0 is the next one), with the errno.
    std::map<std::uint64_t, int> faults;
    /// Hears of every path that was changed.
    std::function<void(const std::string& path)> follow;
    /// Those that failed, for the story.
    std::vector<std::string> failed;

    int before(const DiskCall& call) override {
        if (faults.empty() || Fibers::shared().isDriver() ||
            call.path.find("/state.db") != std::string_view::npos)
            return 0;
        const auto fault = faults.find(calls_++);
        if (fault == faults.end())
            return 0;
        failed.push_back(std::string(call.name) + ' ' + call.path + ": " +
                         std::strerror(fault->second));
        return fault->second;
    }
    void after(const DiskCall& call, long result) override {
        if (!call.changes || result < 0 || !follow)
            return;
        follow(call.path);
        if (!call.to.empty())
            follow(call.to);
    }
    void begin(std::map<std::uint64_t, int> those) {
        faults = std::move(those);
        calls_ = 0;
    }

private:
    std::uint64_t calls_ = 0;
};

} // namespace simulation
