#include "platform/base/Clock.h"
#include "platform/base/Process.h"
#include "platform/files/FileDescriptor.h"
#include "tests/support/PrivateBus.h"
#include "tests/support/TemporaryFolder.h"
#include "tests/system/FakeNetworkManager.h"
#include "tests/system/NetworkReports.h"

#include <gtest/gtest.h>

#include <arpa/inet.h>
#include <cstring>
#include <fstream>
#include <net/if.h>
#include <sched.h>
#include <sys/ioctl.h>
#include <sys/socket.h>
#include <sys/wait.h>

using namespace platform;
using test::cellular;
using test::NetworkReports;
using test::wifi;

namespace {

constexpr int noNamespaces = 77;

/// Gives the process a network of its own, in which nothing is up.
bool enterOwnNetwork() {
    const std::string user = "0 " + std::to_string(::getuid()) + " 1";
    const std::string group = "0 " + std::to_string(::getgid()) + " 1";
    if (::unshare(CLONE_NEWUSER | CLONE_NEWNET) != 0)
        return false;
    std::ofstream("/proc/self/setgroups") << "deny";
    std::ofstream("/proc/self/uid_map") << user;
    std::ofstream("/proc/self/gid_map") << group;
    return true;
}

/// The cases below change the machine's network, so they run in a process with one of its own.
TEST(Network, ComesAndGoesUnderTheLiveService) {
    const pid_t child = ::fork();
    if (child == 0) {
        const char* const self = "/proc/self/exe";
        if (!enterOwnNetwork())
            ::_exit(noNamespaces);
        ::execl(self, self, "--gtest_also_run_disabled_tests",
                "--gtest_filter=DISABLED_OwnNetwork.*", nullptr);
        ::_exit(1);
    }
    int status = -1;
    ::waitpid(child, &status, 0);
    if (WEXITSTATUS(status) == noNamespaces)
        GTEST_SKIP() << "no namespaces here";
    EXPECT_EQ(status, 0);
}

class DISABLED_OwnNetwork : public ::testing::Test {
protected:
    test::TemporaryFolder folder;
    std::unique_ptr<Clock> clock = makeRealClock();

    void SetUp() override {
        setEnvironmentVariable("DBUS_SYSTEM_BUS_ADDRESS", "unix:path=" + (folder / "bus"));
        setInterface("lo", true);
    }
    void TearDown() override { setRoute(false); }

    /// A route to the whole of 192.0.2.0/24: a second address of the one interface there is.
    static void setRoute(bool there) {
        if (!there)
            return setInterface("lo:1", false);
        sockaddr_in address{};
        address.sin_family = AF_INET;
        ::inet_pton(AF_INET, "192.0.2.1", &address.sin_addr);
        ifreq request{};
        std::memcpy(&request.ifr_addr, &address, sizeof address);
        change("lo:1", request, SIOCSIFADDR);
    }

private:
    static void setInterface(const char* name, bool up) {
        ifreq request{};
        request.ifr_flags = static_cast<short>(up ? IFF_UP : 0);
        change(name, request, SIOCSIFFLAGS);
    }
    static void change(const char* name, ifreq& request, unsigned long what) {
        const FileDescriptor socket(::socket(AF_INET, SOCK_DGRAM | SOCK_CLOEXEC, 0));
        std::strcpy(request.ifr_name, name);
        ::ioctl(socket.get(), what, &request);
    }
};

TEST_F(DISABLED_OwnNetwork, AHostIsReachableWhileThereIsARouteToIt) {
    const auto service = makeLiveReachability(*clock);
    NetworkReports server(*service, "192.0.2.7");
    NetworkReports elsewhere(*service, "198.51.100.1");
    ASSERT_TRUE(server.waitFor({0}));
    setRoute(true);
    ASSERT_TRUE(server.waitFor({0, wifi}));
    setRoute(false);
    ASSERT_TRUE(server.waitFor({0, wifi, 0}));
    service->setWatchedRemote(WatchedRemote{{}, "192.0.2.9"});
    setRoute(true);
    EXPECT_TRUE(server.waitFor({0, wifi, 0, wifi}));
    EXPECT_TRUE(elsewhere.waitFor({0, wifi})) << "the account's server stands for every host";
}

TEST_F(DISABLED_OwnNetwork, MobileAndMeteredConnectionsAreCellular) {
    test::PrivateBus bus(folder.path());
    if (!bus.works())
        GTEST_SKIP() << "the package dbus is not installed";
    setRoute(true);
    test::FakeNetworkManager manager(bus.address());
    manager.set(1, "802-11-wireless");
    const auto service = makeLiveReachability(*clock);
    NetworkReports server(*service, "192.0.2.7");
    NetworkReports own(*service, "localhost");
    ASSERT_TRUE(server.waitForLast(cellular)) << "metered";
    manager.set(2, "802-11-wireless");
    ASSERT_TRUE(server.waitForLast(wifi));
    manager.set(0, "gsm");
    ASSERT_TRUE(server.waitForLast(cellular)) << "mobile";
    manager.stop();
    ASSERT_TRUE(server.waitForLast(wifi)) << "nobody says so any more";
    manager.start();
    ASSERT_TRUE(server.waitForLast(cellular)) << "it came back";
    bus.end();
    EXPECT_TRUE(server.waitForLast(wifi));
    EXPECT_EQ(own.all(), NetworkReports::Flags{wifi}) << "this machine is never far";
}

} // namespace
