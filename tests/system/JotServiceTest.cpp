#include "platform/system/JotService.h"
#include "platform/base/ManualClock.h"
#include "platform/base/Process.h"

#include "tests/support/TemporaryFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <filesystem>
#include <fstream>
#include <sched.h>
#include <sys/mount.h>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <sys/wait.h>
#include <unistd.h>

namespace fs = std::filesystem;
using platform::JotHandle;
using platform::JotRecord;
using ::testing::HasSubstr;

namespace {

JotRecord record(std::string_view level, std::string_view message) {
    JotRecord out;
    out.set("Level", level);
    out.set("Message", message);
    return out;
}

bool journalRuns() {
    return fs::exists("/run/systemd/journal/socket");
}

/// Logging to files: where a journal answers, only the journal's own case can run.
struct FileLog : ::testing::Test {
    test::TemporaryFolder folder;
    platform::ManualClock clock;
    std::unique_ptr<platform::JotService> service;
    JotHandle handle = 0;

    void SetUp() override {
        if (journalRuns())
            GTEST_SKIP() << "the machine's journal takes the records";
        platform::setEnvironmentVariable("JOT_QUOTA_DISABLED", std::nullopt);
        service = platform::makeJotService(folder / "state", &clock);
        handle = service->open({}, "com.example.app", 0);
    }
    std::vector<std::string> lines(std::string_view file = "log") const {
        std::ifstream stream(folder / ("state/" + std::string(file)));
        std::vector<std::string> out;
        for (std::string line; std::getline(stream, line);)
            out.push_back(line);
        return out;
    }
};

TEST_F(FileLog, ARecordIsOneLineWithAllItsPairs) {
    JotRecord all = record("6", "two\nlines \"quoted\" \xff");
    all.set("Message", "a key may come twice");
    service->send(handle, all);
    service->send(handle, record("3", "next"));
    ASSERT_EQ(lines().size(), 2U);
    EXPECT_EQ(lines()[0], "{\"Sender\":\"system_tests\",\"Level\":\"6\",\"Message\":"
                          "\"two\\nlines \\\"quoted\\\" \xEF\xBF\xBD\","
                          "\"Message\":\"a key may come twice\"}");
}

TEST_F(FileLog, TheFilterLetsItsLevelsThrough) {
    service->setFilter(handle, 0b1111); // 0 to 3
    for (const char* level : {"3", "4", "7", "9"})
        service->send(handle, record(level, level));
    ASSERT_EQ(lines().size(), 2U);
    EXPECT_THAT(lines()[0], HasSubstr("\"Message\":\"3\""));
    EXPECT_THAT(lines()[1], HasSubstr("\"Message\":\"9\"")) << "no bit of its own";
    service->close(handle);
    service->send(handle, record("0", "closed"));
    EXPECT_EQ(lines().size(), 2U);
}

TEST_F(FileLog, ARunawayIsHeldBackAndWhatIsLeftOutIsCounted) {
    for (int i = 0; i < 2500; ++i)
        service->send(handle, record("6", "again"));
    EXPECT_EQ(lines().size(), 2000U);
    clock.advance(std::chrono::seconds(10));
    service->send(handle, record("6", "later"));
    ASSERT_EQ(lines().size(), 2002U);
    EXPECT_THAT(lines()[2000], HasSubstr("500 log messages are missing here: 500 above"));
    platform::setEnvironmentVariable("JOT_QUOTA_DISABLED", "1");
    for (int i = 0; i < 2500; ++i)
        service->send(handle, record("6", "unthrottled"));
    EXPECT_EQ(lines().size(), 4502U);
    platform::setEnvironmentVariable("JOT_QUOTA_DISABLED", std::nullopt);
}

TEST_F(FileLog, TheFilesTurnOverAndStayBounded) {
    platform::setEnvironmentVariable("JOT_QUOTA_DISABLED", "1");
    const std::string text(64 * 1024, 'x');
    for (int i = 0; i < 400; ++i) // 25 MiB
        service->send(handle, record("6", text));
    platform::setEnvironmentVariable("JOT_QUOTA_DISABLED", std::nullopt);
    std::uintmax_t total = 0;
    for (const auto& entry : fs::directory_iterator(folder / "state"))
        total += entry.file_size();
    EXPECT_GE(total, 16U << 20);
    EXPECT_LE(total, 21U << 20);
    EXPECT_TRUE(folder.has("state/log.4"));
    EXPECT_FALSE(folder.has("state/log.5"));
}

TEST_F(FileLog, TwoProcessesLoseNoRecordAndTearNone) {
    constexpr int each = 60; // of 100 KiB: the files turn over once in the middle
    std::vector<pid_t> children;
    for (int p = 0; p < 2; ++p) {
        children.push_back(::fork());
        if (children.back() != 0)
            continue;
        const auto own = platform::makeJotService(folder / "state");
        const JotHandle mine = own->open({}, "com.example.app", 0);
        for (int i = 0; i < each; ++i)
            own->send(mine, record("6", std::string(100 * 1024, static_cast<char>('a' + p))));
        ::_exit(0);
    }
    for (const pid_t child : children)
        ::waitpid(child, nullptr, 0);
    std::size_t whole = 0;
    for (const char* file : {"log", "log.1", "log.2", "log.3", "log.4"})
        for (const std::string& line : lines(file))
            whole += line.ends_with("\"}") &&
                     line.find_first_of("ab", line.find(":\"aa") + 2) != std::string::npos;
    EXPECT_EQ(whole, 2U * each);
}

TEST_F(FileLog, AFullOrForbiddenDiskIsCountedAndSaidOnceItWorksAgain) {
    folder.write("state", "a file where the folder should be");
    service->send(handle, record("3", "lost"));
    fs::remove(folder / "state");
    service->send(handle, record("3", "kept"));
    ASSERT_EQ(lines().size(), 2U);
    EXPECT_THAT(lines()[0], HasSubstr("1 could not be written"));
}

/// Gives the process an empty /run of its own. Nothing of it reaches the machine.
bool enterOwnRunFolder() {
    const std::string user = "0 " + std::to_string(::getuid()) + " 1";
    const std::string group = "0 " + std::to_string(::getgid()) + " 1";
    if (::unshare(CLONE_NEWUSER | CLONE_NEWNS) != 0)
        return false;
    std::ofstream("/proc/self/setgroups") << "deny";
    std::ofstream("/proc/self/uid_map") << user;
    std::ofstream("/proc/self/gid_map") << group;
    return ::mount("none", "/", nullptr, MS_REC | MS_PRIVATE, nullptr) == 0 &&
           ::mount("none", "/run", "tmpfs", 0, nullptr) == 0 &&
           ::mkdir("/run/systemd", 0700) == 0 && ::mkdir("/run/systemd/journal", 0700) == 0;
}

/// Runs in a process of its own.
int fieldsOfOneRecord() {
    if (!enterOwnRunFolder())
        return 77;
    const int listener = ::socket(AF_UNIX, SOCK_DGRAM, 0);
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    std::snprintf(address.sun_path, sizeof address.sun_path, "/run/systemd/journal/socket");
    if (::bind(listener, reinterpret_cast<sockaddr*>(&address), sizeof address) != 0)
        return 78;
    const auto service = platform::makeJotService("/run/state");
    JotRecord sent = record("6", "two\nlines");
    sent.set("Line", "12");
    sent.set("Odd key", "value");
    service->send(service->open("tavrin", "com.example.app", 0), sent);
    char buffer[4096];
    const ssize_t length = ::recv(listener, buffer, sizeof buffer, MSG_DONTWAIT);
    const std::string datagram(buffer, static_cast<std::size_t>(std::max<ssize_t>(length, 0)));
    const std::string binary = std::string("MESSAGE\n\x09\0\0\0\0\0\0\0", 16) + "two\nlines\n";
    for (const std::string& part :
         {std::string("SYSLOG_IDENTIFIER=tavrin\n"), std::string("PRIORITY=6\n"),
          std::string("LEVEL=6\n"), binary, std::string("CODE_LINE=12\n"),
          std::string("ODD_KEY=value\n"), std::string("KEY_OF_ODD_KEY=Odd key\n")})
        if (datagram.find(part) == std::string::npos)
            return 1;
    return ::access("/run/state/log", F_OK) == 0 ? 2 : 0;
}

TEST(Journal, GetsEveryPairUnderNamesThatItTakes) {
    const pid_t child = ::fork();
    if (child == 0)
        ::_exit(fieldsOfOneRecord());
    int status = -1;
    ::waitpid(child, &status, 0);
    if (WEXITSTATUS(status) == 77)
        GTEST_SKIP() << "no namespaces here";
    EXPECT_EQ(WEXITSTATUS(status), 0);
}

TEST(ConsoleLine, CarriesTimeAndProcess) {
    ::testing::internal::CaptureStderr();
    platform::writeConsoleLine("text");
    EXPECT_THAT(::testing::internal::GetCapturedStderr(),
                ::testing::MatchesRegex("[0-9]{4}-[0-9]{2}-[0-9]{2} [0-9:]{8}\\.[0-9]{3} "
                                        "system_tests\\[[0-9]+\\]: text\n"));
}

TEST(ConsoleLine, IsOneLineThatSteersNoTerminal) {
    ::testing::internal::CaptureStderr();
    platform::writeConsoleLine("a\nb\tc\x1B[31m \xC2\x9Bm \xC2\xA9 \x7F");
    EXPECT_THAT(::testing::internal::GetCapturedStderr(),
                ::testing::EndsWith(": a\\nb\\tc\\x1B[31m \\x9Bm \xC2\xA9 \\x7F\n"));
}

} // namespace
