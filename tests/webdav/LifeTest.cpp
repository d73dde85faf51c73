#include "tests/webdav/Device.h"

using namespace platform;

namespace {

constexpr int races = 3;

/// Two devices of one account.
struct LifeOn : ::testing::TestWithParam<test::DavHost::Kind> {
    test::DavHost host{GetParam()};
    test::Device a{host.url()};
    test::Device b{host.url()};

    /// Until nothing is left to do on either.
    void agree() {
        for (int round = 0; round < 2; ++round) {
            a.synced();
            b.synced();
        }
        a.fetchAll();
        b.fetchAll();
        EXPECT_EQ(a.documents(), b.documents());
    }
    static std::string large(const std::string& text) { return text + std::string(400'000, '.'); }
};
INSTANTIATE_TEST_SUITE_P(Servers, LifeOn, test::everyServer, test::nameOfCase);

TEST_P(LifeOn, ATreeLivesOnTwoDevices) {
    a.givenLocal("Plans/first é.txt", "first");
    a.givenLocal("Plans/100% #1?.txt", "odd");
    a.givenLocal("Plans/deep/er/still", large("deep"));
    for (int i = 0; i < 10; ++i)
        a.givenLocal("Rest/" + std::to_string(i), "rest " + std::to_string(i));
    a.synced();
    b.synced();
    EXPECT_TRUE(b.isPromised("Plans/first é.txt"));
    agree();
    EXPECT_EQ(b.local("Plans/deep/er/still"), large("deep"));

    // Each does something else.
    a.givenLocal("Plans/first é.txt", "edited on a");
    a.rename("Plans/deep/er", "Rest/er");
    a.erase("Rest/1");
    b.givenLocal("Rest/5", large("edited on b"));
    b.givenLocal("New/one", "one");
    b.rename("Rest/2", "New/two");
    b.erase("Plans/100% #1?.txt");
    agree();
    const auto documents = a.documents();
    EXPECT_EQ(documents.at("Plans/first é.txt"), "edited on a");
    EXPECT_EQ(documents.at("Rest/5"), large("edited on b"));
    EXPECT_EQ(documents.at("Rest/er/still"), large("deep"));
    EXPECT_EQ(documents.at("New/two"), "rest 2");
    EXPECT_EQ(documents.size(), 12U);

    // Both do something to the same things.
    a.givenLocal("New/one", "a's");
    b.givenLocal("New/one", "b's");
    a.givenLocal("Both/same", "same");
    b.givenLocal("Both/same", "same");
    a.erase("Rest/3");
    b.givenLocal("Rest/3", "an edit beats a deletion");
    agree();
    const auto after = b.documents();
    EXPECT_EQ(after.at("Rest/3"), "an edit beats a deletion");
    EXPECT_EQ(after.at("Both/same"), "same");
    EXPECT_EQ(after.size(), 14U) << "a conflict keeps both";
    a.erase("Plans");
    agree();
    EXPECT_FALSE(FileManager::exists(b.pathOf("Plans")));
    EXPECT_EQ(a.sync().changes, 0U) << "nothing is done twice";
}

TEST_P(LifeOn, OfTwoWhoCreateTheSameNameAtOnceNothingIsLost) {
    a.synced();
    b.synced();
    for (int i = 0; i < races; ++i) {
        const std::string name = "race-" + std::to_string(i);
        a.givenLocal(name, "written on device A, " + name);
        b.givenLocal(name, "written on device B, " + name);
        std::thread other([this] { b.sync(); });
        a.sync();
        other.join();
    }
    agree();
    std::string all = a.kept() + b.kept();
    for (const auto& [path, content] : a.documents())
        all += content.value_or("");
    for (int i = 0; i < races; ++i)
        for (const char* who : {"A", "B"})
            EXPECT_NE(all.find(std::string("written on device ") + who + ", race-" +
                               std::to_string(i)),
                      std::string::npos)
                << who << i;
}

} // namespace
