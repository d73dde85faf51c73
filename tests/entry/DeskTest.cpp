#include "platform/system/SourceApplications.h"
#include "tests/support/PrivateBus.h"
#include "tests/support/TemporaryFolder.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <csignal>
#include <filesystem>

namespace fs = std::filesystem;
using test::Outcome;
using test::Program;
using ::testing::HasSubstr;
using ::testing::StartsWith;

namespace {

const std::string homeScreen(platform::homeScreenApplicationIdentifier);
const std::string testRunner(platform::testRunnerApplicationIdentifier);
const std::string deepLink = "tavrinapp:///a%2520b?mode=details";

/// A user's desk: the programs in a folder of their own and an environment to start them in.
struct Desk : ::testing::Test {
    test::TemporaryFolder home;
    std::string bin = home.makeFolder("my bin");
    std::vector<std::string> environment;
    std::unique_ptr<Program> cold;
    pid_t running = 0;

    Desk() {
        fs::copy(ENTRY_PEER, bin + "/tavrin");
        fs::copy(OPENER, bin + "/tavrin-open");
        fs::permissions(home.makeFolder("run"), fs::perms::owner_all);
        environment = {"HOME=" + home.path(), "QT_QPA_PLATFORM=offscreen", "LC_ALL=C.UTF-8",
                       std::string("PATH=") + std::getenv("PATH")};
    }
    ~Desk() override {
        if (running > 0)
            ::kill(running, SIGKILL);
    }

    void givenRuntimeFolder() { environment.push_back("XDG_RUNTIME_DIR=" + (home / "run")); }
    Program::Start start(const std::string& program, const std::vector<std::string>& urls) {
        Program::Start out{{bin + "/" + program}, environment};
        out.arguments.insert(out.arguments.end(), urls.begin(), urls.end());
        return out;
    }
    Outcome run(const std::string& program, const std::vector<std::string>& urls = {}) {
        Program::Start wanted = start(program, urls);
        wanted.arguments.insert(wanted.arguments.begin(),
                                {"/bin/sh", "-c", R"(exec "$0" "$@" 2>&1)"});
        return test::run(std::move(wanted));
    }
    /// What the program that this starts writes is read by nextLine().
    void givenCold(const std::string& program, const std::vector<std::string>& urls = {}) {
        cold = std::make_unique<Program>(start(program, urls));
        const std::string line = nextLine();
        ASSERT_THAT(line, StartsWith("launched "));
        running = std::stoi(line.substr(9));
    }
    std::string nextLine() { return cold->readLine().value_or("(ended)"); }
};

TEST_F(Desk, TheOpenerStartsTheProgramAndStandsForTheHomeScreen) {
    givenRuntimeFolder();
    givenCold("tavrin-open", {deepLink});
    EXPECT_EQ(nextLine(), homeScreen + " " + deepLink);
    EXPECT_EQ(cold->wait(), 0) << "the opener, with the request taken";
    EXPECT_EQ(run("tavrin-open", {"TavrinApp:///x", deepLink}).status, 0);
    EXPECT_EQ(nextLine(), homeScreen + " TavrinApp:///x") << "as it was given";
    EXPECT_EQ(nextLine(), homeScreen + " " + deepLink);
    EXPECT_EQ(run("tavrin-open").status, 0) << "only to come forward";
    EXPECT_EQ(run("tavrin-open", {"tavrinapp:///end"}).status, 0);
    EXPECT_EQ(nextLine(), homeScreen + " tavrinapp:///end");
    EXPECT_EQ(nextLine(), "(ended)");
    running = 0;
}

TEST_F(Desk, ASecondStartIsKnownAsItselfAndTheTestRunnerAsSuch) {
    fs::copy(OPENER, bin + "/tavrin-test-runner");
    givenRuntimeFolder();
    givenCold("tavrin", {"-style", "fusion", deepLink});
    EXPECT_EQ(nextLine(), bin + "/tavrin " + deepLink) << "its own arguments vouch for nobody";
    const Outcome second = run("tavrin", {deepLink});
    EXPECT_EQ(second.status, 0);
    EXPECT_THAT(second.output, HasSubstr("runs already"));
    EXPECT_EQ(nextLine(), bin + "/tavrin " + deepLink);
    EXPECT_EQ(run("tavrin-test-runner", {deepLink}).status, 0);
    EXPECT_EQ(nextLine(), testRunner + " " + deepLink);
}

TEST_F(Desk, WithoutRuntimeFolderAndBusAllOfItWorks) {
    givenCold("tavrin-open", {deepLink});
    EXPECT_EQ(nextLine(), homeScreen + " " + deepLink);
    EXPECT_EQ(run("tavrin", {deepLink}).status, 0);
    EXPECT_EQ(nextLine(), bin + "/tavrin " + deepLink);
}

TEST_F(Desk, ACrashedProgramIsNotInTheWay) {
    givenRuntimeFolder();
    givenCold("tavrin-open", {deepLink});
    nextLine();
    ::kill(running, SIGKILL);
    EXPECT_EQ(nextLine(), "(ended)");
    givenCold("tavrin-open", {deepLink});
    EXPECT_EQ(nextLine(), homeScreen + " " + deepLink);
}

TEST_F(Desk, ABusCallerIsHeardByItsOwnName) {
    const test::PrivateBus bus(home.path());
    if (!bus.works() || !test::PrivateBus::hasCaller())
        GTEST_SKIP() << "the package dbus, or busctl, is not installed";
    environment.push_back("DBUS_SESSION_BUS_ADDRESS=" + bus.address());
    givenCold("tavrin");
    const std::string call = "exec busctl --user call com.pelmora.Tavrin /com/pelmora/Tavrin "
                             "org.freedesktop.Application Open 'asa{sv}' 1 '" +
                             deepLink + "' 0";
    EXPECT_EQ(test::run({{"/bin/sh", "-c", call}, environment}).status, 0);
    EXPECT_THAT(nextLine(), HasSubstr("/busctl " + deepLink));
}

TEST_F(Desk, InstalledItOpensTheAddressesOfItsScheme) {
    if (test::run({{"/bin/sh", "-c", "command -v xdg-open update-desktop-database"}}).status != 0)
        GTEST_SKIP() << "the packages xdg-utils and desktop-file-utils are not installed";
    givenRuntimeFolder();
    environment.emplace_back("DISPLAY=:99"); // asked for, though nothing is drawn there
    for (const char* const name :
         {"pelmora", "tavrin-draw-picture", "tavrin-list-archive", "tavrin-play-media"})
        fs::copy("/bin/true", bin + "/" + name);
    const auto install = [&](const std::string& more) {
        return test::run({{INSTALLER, "--programs", bin, more}, environment});
    };
    EXPECT_EQ(install("--prefix").status, 2) << "where to?";
    ASSERT_EQ(test::run({{INSTALLER, "--programs", bin}, environment}).status, 0);
    const std::string entry = home / ".local/share/applications/com.pelmora.Tavrin.desktop";
    EXPECT_EQ(test::run({{"desktop-file-validate", entry}}).output, "");
    cold = std::make_unique<Program>(Program::Start{{"xdg-open", deepLink}, environment});
    const std::string line = nextLine();
    ASSERT_THAT(line, StartsWith("launched "));
    running = std::stoi(line.substr(9));
    EXPECT_EQ(nextLine(), homeScreen + " " + deepLink);
    EXPECT_EQ(install("--uninstall").status, 0);
    EXPECT_FALSE(fs::exists(entry));
    EXPECT_TRUE(fs::is_empty(home / ".local/bin"));
}

TEST_F(Desk, TheOpenerSaysWhatStandsInTheWay) {
    givenRuntimeFolder();
    const auto says = [&](const Outcome& outcome, int status, const std::string& text) {
        EXPECT_EQ(outcome.status, status);
        EXPECT_THAT(outcome.output, HasSubstr(text));
    };
    says(run("tavrin-open", {"https://example.org/"}), 2, "“https://example.org/” is no address");
    says(run("tavrin-open", {"tavrinapp:/" + std::string(100'000, 'x')}), 2, "names no document");
    says(run("tavrin", {"tavrinapp:/" + std::string(100'000, 'x')}), 2, "names no document");
    fs::remove(bin + "/tavrin");
    says(run("tavrin-open", {deepLink}), 1, "Install Tavrin again");
    fs::copy("/bin/false", bin + "/tavrin");
    says(run("tavrin-open", {deepLink}), 1, "exit status 1");
}

} // namespace
