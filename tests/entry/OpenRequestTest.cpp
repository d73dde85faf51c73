#include "platform/ApplicationEntry.h"
#include "tests/support/TemporaryFolder.h"
#include "tests/ui/UiEnvironment.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

using namespace platform;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace {

struct OpenRequests : ::testing::Test, ApplicationDelegate {
    test::TemporaryFolder home;
    test::UiEnvironment environment;
    Application& application = *environment.application;
    SingleInstance::Options options = optionsIn(home);
    ApplicationEntry entry{options, {}};
    std::vector<std::string> opened;

    static SingleInstance::Options optionsIn(const test::TemporaryFolder& folder) {
        SingleInstance::Options options;
        options.folders.state = folder / "state";
        return options;
    }
    void SetUp() override {
        application.launch(std::shared_ptr<ApplicationDelegate>(std::shared_ptr<void>(), this));
        entry.serve(application);
    }
    void TearDown() override { entry.stopServing(); }
    bool applicationOpenURLOptions(Application& /*application*/, const std::string& url,
                                   const OpenUrlOptions& /*options*/) override {
        opened.push_back(url);
        return true;
    }
    void ask(const std::string& url) {
        EXPECT_TRUE(*handToRunningInstance(options, {{url}}));
        environment.settle();
    }
};

TEST_F(OpenRequests, WaitForTheApplicationToBeActiveAndForWhatItDoesThen) {
    const Observation rebuilding = environment.notifications.observe(
        applicationDidBecomeActiveNotification,
        [this](const Notification&) { opened.emplace_back("rebuilt"); });
    ask("tavrinapp:///a");
    ask("tavrinapp:///b");
    EXPECT_THAT(opened, IsEmpty());
    application.setActive(true);
    environment.settle();
    EXPECT_THAT(opened, ElementsAre("rebuilt", "tavrinapp:///a", "tavrinapp:///b"));
    ask("tavrinapp:///c");
    EXPECT_EQ(opened.back(), "tavrinapp:///c");
}

TEST_F(OpenRequests, AreOpenedAllTheSameWhereTheDeskKeepsTheFocus) {
    ask("tavrinapp:///a");
    environment.advance(499ms);
    EXPECT_THAT(opened, IsEmpty());
    environment.advance(1ms);
    EXPECT_THAT(opened, ElementsAre("tavrinapp:///a"));
}

} // namespace
