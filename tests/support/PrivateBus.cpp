#include "tests/support/PrivateBus.h"

namespace test {

PrivateBus::PrivateBus(const std::string& folder)
    : daemon_(std::make_unique<Program>(
          Program::Start{{"dbus-daemon", "--session", "--nofork", "--nopidfile", "--print-address",
                          "--address=unix:path=" + folder + "/bus"}})),
      address_(daemon_->readLine().value_or("")) {
}

bool PrivateBus::hasCaller() {
    return run({{"/bin/sh", "-c", "command -v busctl"}}).status == 0;
}

} // namespace test
