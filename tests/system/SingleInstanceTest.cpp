#include "platform/system/SingleInstance.h"

#include "platform/base/Identity.h"
#include "platform/base/WorkQueue.h"
#include "platform/files/FileDescriptor.h"
#include "platform/system/SourceApplications.h"
#include "tests/support/PrivateBus.h"
#include "tests/support/TemporaryFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <condition_variable>
#include <csignal>
#include <filesystem>
#include <mutex>
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>

namespace fs = std::filesystem;
using namespace platform;
using test::Program;
using ::testing::ElementsAre;
using ::testing::HasSubstr;

namespace {

constexpr const char* peerProgram = INSTANCE_PEER;
const std::string url = "tavrinapp:///a%2520b";

/// The desk of one user: folders, perhaps a bus, and whoever starts the program there.
struct Instances : ::testing::Test {
    test::TemporaryFolder home;
    SingleInstance::Options options;
    std::string runtime = home.makeFolder("run");
    WorkQueue queue{"test.instance"};
    std::mutex mutex;
    std::condition_variable arrived;
    std::vector<OpenRequest> heard; // guarded by mutex
    std::unique_ptr<SingleInstance> instance;

    Instances() {
        fs::permissions(runtime, fs::perms::owner_all);
        options.folders.runtime = runtime;
        options.folders.state = home / "state";
    }
    ~Instances() override { instance.reset(); }

    void givenInstance() {
        auto claimed = SingleInstance::claim(options, {});
        ASSERT_TRUE(claimed) << *claimed.error().localizedDescription;
        ASSERT_TRUE(*claimed) << "the only one so far";
        instance = *std::move(claimed);
        instance->setHandler(queue, [this](const OpenRequest& request) {
            const std::lock_guard lock(mutex);
            heard.push_back(request);
            arrived.notify_all();
        });
    }
    /// As soon as there are so many.
    std::vector<OpenRequest> waitForRequests(std::size_t count) {
        std::unique_lock lock(mutex);
        arrived.wait_for(lock, std::chrono::seconds(20), [&] { return heard.size() >= count; });
        return heard;
    }
    Program::Start peer(const std::string& what, const std::vector<std::string>& urls = {},
                        const std::string& program = peerProgram) const {
        Program::Start start{{program, what, options.folders.runtime.value_or(""),
                              options.folders.state, options.busAddress, options.callers.opener}};
        start.arguments.insert(start.arguments.end(), urls.begin(), urls.end());
        return start;
    }
    std::string hand(const std::vector<std::string>& urls) const {
        return test::run(peer("hand", urls)).output;
    }
    FileDescriptor connected() const {
        FileDescriptor socket(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
        sockaddr_un address{};
        address.sun_family = AF_UNIX;
        const std::string path =
            runtime + "/" + std::string(applicationIdentifier) + "/instance.socket";
        path.copy(address.sun_path, sizeof address.sun_path - 1);
        EXPECT_EQ(::connect(socket.get(), reinterpret_cast<sockaddr*>(&address), sizeof address),
                  0);
        return socket;
    }
    static std::string readToEnd(const FileDescriptor& socket) {
        std::string out;
        char buffer[512];
        for (ssize_t got = 0; (got = ::recv(socket.get(), buffer, sizeof buffer, 0)) > 0;)
            out.append(buffer, static_cast<std::size_t>(got));
        return out;
    }
};

TEST_F(Instances, ASecondStartHandsOverAndEnds) {
    givenInstance();
    const test::Outcome second = test::run(peer("claim", {url, "tavrinapp:///%zz"}));
    EXPECT_EQ(second.output, "second\n");
    EXPECT_EQ(second.status, 0);
    const auto requests = waitForRequests(1);
    ASSERT_EQ(requests.size(), 1U);
    EXPECT_THAT(requests[0].urls, ElementsAre(url, "tavrinapp:///%zz")) << "as they were given";
    EXPECT_EQ(requests[0].source, fs::canonical(peerProgram)) << "who it really is";
    EXPECT_EQ(hand({}), "taken\n");
    EXPECT_TRUE(waitForRequests(2)[1].urls.empty()) << "only to come forward";
}

TEST_F(Instances, OfManyStartsAtOnceExactlyOneWins) {
    std::vector<std::unique_ptr<Program>> starts;
    for (int i = 0; i < 12; ++i)
        starts.push_back(std::make_unique<Program>(peer("claim", {url})));
    int winners = 0;
    Program* first = nullptr;
    for (const auto& start : starts) {
        const std::optional<std::string> line = start->readLine();
        ASSERT_TRUE(line == "first" || line == "second") << line.value_or("nothing");
        if (line == "first") {
            ++winners;
            first = start.get();
        }
    }
    ASSERT_EQ(winners, 1);
    for (int i = 0; i < 12; ++i)
        EXPECT_THAT(*first->readLine(), HasSubstr(url)) << "its own and those of all others";
}

TEST_F(Instances, ADeadInstanceLeavesNothingInTheWay) {
    Program first(peer("claim"));
    ASSERT_EQ(first.readLine(), "first");
    first.kill(SIGKILL);
    first.wait();
    EXPECT_EQ(hand({url}), "nobody\n");
    givenInstance();
    EXPECT_EQ(hand({url}), "taken\n");
    instance.reset();
    EXPECT_EQ(hand({url}), "nobody\n") << "it ended";
}

TEST_F(Instances, WhileOneEndsTheNextWaits) {
    givenInstance();
    instance->stop();
    EXPECT_EQ(hand({url}), "nobody\n") << "what it no longer does it does not promise";
    Program next(peer("claim", {url}));
    options.patience = std::chrono::milliseconds(50);
    EXPECT_FALSE(SingleInstance::claim(options, {})) << "it has not closed its files yet";
    instance.reset();
    EXPECT_EQ(next.readLine(), "first");
    EXPECT_TRUE(waitForRequests(0).empty());
}

TEST_F(Instances, WithNoPlaceForTheLockItStartsAllTheSame) {
    options.folders.runtime.reset();
    options.folders.state = home.write("state", "a file");
    givenInstance();
    EXPECT_EQ(hand({url}), "nobody\n");
}

TEST_F(Instances, OneThatDoesNotAnswerIsNamedAndNotDoubled) {
    Program first(peer("claim"));
    ASSERT_EQ(first.readLine(), "first");
    first.stop();
    options.patience = std::chrono::milliseconds(50);
    const auto second = SingleInstance::claim(options, {{url}});
    first.kill(SIGCONT);
    ASSERT_FALSE(second);
    EXPECT_TRUE(second.error().is(ErrorCode::timedOut));
}

TEST_F(Instances, TheOpenerAndTheTestRunnerAreKnownByTheirFiles) {
    fs::copy(peerProgram, home / "opener");
    fs::copy(peerProgram, home / "runner");
    fs::copy(peerProgram, home / "open-to-all");
    fs::permissions(home / "open-to-all", fs::perms::all);
    fs::create_symlink(home / "opener", home / "alias");
    options.callers = {home / "opener", home / "runner"};
    givenInstance();
    for (const char* program : {"opener", "runner", "alias"})
        EXPECT_EQ(test::run(peer("hand", {url}, home / program)).output, "taken\n");
    const auto requests = waitForRequests(3);
    ASSERT_EQ(requests.size(), 3U);
    EXPECT_EQ(requests[0].source, homeScreenApplicationIdentifier);
    EXPECT_EQ(requests[1].source, testRunnerApplicationIdentifier);
    EXPECT_EQ(requests[2].source, homeScreenApplicationIdentifier) << "whatever it is called";
    instance.reset();
    options.callers.opener = home / "open-to-all";
    givenInstance();
    EXPECT_EQ(test::run(peer("hand", {url}, home / "open-to-all")).output, "taken\n");
    EXPECT_EQ(waitForRequests(4)[3].source, home / "open-to-all")
        << "anybody could have put something else there";
}

TEST_F(Instances, HugeRequestsAreRefusedOnBothSides) {
    givenInstance();
    const auto refused = [&](std::size_t length) {
        const auto taken = handToRunningInstance(options, {{std::string(length, 'x')}});
        return !taken && taken.error().is(ErrorCode::invalidArgument);
    };
    EXPECT_TRUE(refused(1'000'000));
    EXPECT_TRUE(refused(longestRequestUrl + 1));
    EXPECT_FALSE(refused(longestRequestUrl));
    EXPECT_FALSE(handToRunningInstance(options, {std::vector<std::string>(65, "x")}));
    const FileDescriptor socket = connected();
    const std::string boast("TVRN\x7f\xff\xff\xff", 8);
    ::send(socket.get(), boast.data(), boast.size(), MSG_NOSIGNAL);
    EXPECT_THAT(readToEnd(socket), HasSubstr("damaged")) << "nobody waits for two gigabytes";
}

TEST_F(Instances, GarbageAndDawdlersHoldNobodyUp) {
    options.patience = std::chrono::milliseconds(100);
    givenInstance();
    std::vector<FileDescriptor> dawdlers;
    for (int i = 0; i < 60; ++i) {
        dawdlers.push_back(connected());
        ::send(dawdlers.back().get(), "TVR", 3, MSG_NOSIGNAL);
    }
    for (const std::string& garbage :
         {std::string("GET / HTTP/1.1\r\n\r\n"), std::string(100'000, '\0'), std::string("\xff"),
          std::string("TVRN\0\0\0\0", 8), std::string("TVRN\0\0\0\3abc", 11)}) {
        const FileDescriptor socket = connected();
        ::send(socket.get(), garbage.data(), garbage.size(), MSG_NOSIGNAL);
        EXPECT_THAT(readToEnd(socket), HasSubstr("damaged"));
    }
    for (const FileDescriptor& dawdler : dawdlers)
        EXPECT_EQ(readToEnd(dawdler), "") << "turned away after a while";
    EXPECT_EQ(hand({url}), "taken\n");
    EXPECT_EQ(waitForRequests(1).size(), 1U);
}

TEST_F(Instances, WithoutARuntimeFolderTheStateFolderServes) {
    options.folders.runtime.reset();
    options.folders.state = home / (std::string(150, 'n') + "/state"); // longer than an address
    givenInstance();
    EXPECT_EQ(hand({url}), "taken\n");
    const fs::path lap = fs::path(options.folders.state) / "com.pelmora.tavrin";
    for (const auto& entry : fs::directory_iterator(lap))
        EXPECT_EQ(entry.status().permissions(), fs::perms::owner_all);
}

TEST_F(Instances, ARuntimeFolderOpenToOthersIsNotTrusted) {
    fs::permissions(runtime, fs::perms::all);
    givenInstance();
    EXPECT_TRUE(fs::is_empty(runtime));
    EXPECT_EQ(hand({url}), "taken\n");
}

struct OnABus : Instances {
    test::PrivateBus bus{home.path()};
    void SetUp() override {
        if (!bus.works())
            GTEST_SKIP() << "the package dbus is not installed";
        options.busAddress = bus.address();
    }
    test::Outcome call(const std::string& method, const std::string& arguments) const {
        const std::string line = "exec busctl --address=" + bus.address() +
                                 " call com.pelmora.Tavrin /com/pelmora/Tavrin "
                                 "org.freedesktop.Application " +
                                 method + " " + arguments + " 2>&1";
        return test::run({{"sh", "-c", line}});
    }
};

TEST_F(OnABus, AnswersAsAnApplication) {
    if (!test::PrivateBus::hasCaller())
        GTEST_SKIP() << "busctl is not installed";
    givenInstance();
    EXPECT_EQ(call("Open", "'asa{sv}' 2 " + url + " b 1 activation-token s t").status, 0);
    EXPECT_EQ(call("Activate", "'a{sv}' 1 desktop-startup-id s u").status, 0);
    EXPECT_NE(call("ActivateAction", "'sava{sv}' erase 0 0").status, 0);
    EXPECT_NE(call("Open", "'asa{sv}' 1 " + std::string(100'000, 'x') + " 0").status, 0);
    const auto requests = waitForRequests(2);
    ASSERT_EQ(requests.size(), 2U);
    EXPECT_THAT(requests[0].urls, ElementsAre(url, "b"));
    EXPECT_EQ(requests[0].activationToken, "t");
    EXPECT_THAT(*requests[0].source, HasSubstr("busctl"));
    EXPECT_EQ(requests[1].activationToken, "u");
}

TEST_F(OnABus, TheNameOnTheBusHoldsOtherRuntimeFoldersTogether) {
    options.callers.opener = peerProgram;
    givenInstance();
    const std::string other = home.makeFolder("other");
    fs::permissions(other, fs::perms::owner_all);
    options.folders.runtime = other;
    EXPECT_EQ(test::run(peer("claim", {url})).output, "second\n");
    EXPECT_EQ(hand({url}), "taken\n");
    const auto requests = waitForRequests(2);
    ASSERT_EQ(requests.size(), 2U);
    EXPECT_EQ(requests[1].source, homeScreenApplicationIdentifier) << "known on the bus as well";
}

TEST_F(OnABus, ABusThatGoesAwayOrNeverAnswersTakesNothingWithIt) {
    givenInstance();
    bus.end();
    EXPECT_EQ(hand({url}), "taken\n");
    instance.reset();
    const FileDescriptor silent(::socket(AF_UNIX, SOCK_STREAM | SOCK_CLOEXEC, 0));
    sockaddr_un address{};
    address.sun_family = AF_UNIX;
    const std::string path = home / "silent";
    path.copy(address.sun_path, sizeof address.sun_path - 1);
    ASSERT_EQ(::bind(silent.get(), reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
    ASSERT_EQ(::listen(silent.get(), 4), 0);
    options.busAddress = "unix:path=" + path;
    options.patience = std::chrono::milliseconds(50);
    givenInstance();
    EXPECT_EQ(hand({url}), "taken\n");
}

} // namespace
