#pragma once

#include "tests/support/Program.h"

#include <memory>
#include <string>

namespace test {

/// A message bus of the test's own, as long as the object lives (package dbus).
class PrivateBus {
public:
    /// Its socket lies in that folder.
    explicit PrivateBus(const std::string& folder);
    /// False where no bus daemon is installed; then the case is skipped.
    bool works() const { return !address_.empty(); }
    const std::string& address() const { return address_; }
    /// Whether the caller that tests use on the bus (busctl, of the package systemd) is installed.
    static bool hasCaller();
    /// Ends the bus, as a desk that goes away does.
    void end() { daemon_.reset(); }

private:
    std::unique_ptr<Program> daemon_;
    std::string address_;
};

} // namespace test
