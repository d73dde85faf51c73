// Signing in and out in the window, on a real server, and what the account's page tells.

#include "platform/cloud/AccountBook.h"
#include "platform/cloud/AccountManager.h"
#include "platform/files/FileManager.h"
#include "tests/product/ProductFixture.h"
#include "tests/webdav/DavHost.h"
#include "tests/webdav/HttpHost.h"

#include <filesystem>
#include <fstream>

using testing::Contains;
using testing::HasSubstr;
using testing::Not;

namespace test {
namespace {

struct AccountScreens : ProductTest {
    DavHost server{DavHost::Kind::lighttpd};

    std::string textWith(const std::string& part) {
        std::string found;
        eachLabel([&](const platform::Label& label) {
            if (!label.isHidden() && label.text().find(part) != std::string::npos)
                found = label.text();
        });
        return found;
    }
    void eachLabel(const std::function<void(const platform::Label&)>& see) {
        settle();
        const std::function<void(const platform::View&)> visit = [&](const platform::View& view) {
            if (const auto* const label = dynamic_cast<const platform::Label*>(&view))
                see(*label);
            for (const auto& child : view.subviews())
                visit(*child);
        };
        visit(*nav().view());
    }
    bool untilSays(const std::string& part) {
        return untilElsewhere([&] { return !textWith(part).empty(); });
    }
    void tapButton(const std::string& title) {
        platform::Button* const found = button(title);
        ASSERT_TRUE(found) << title;
        tap(*found);
        advance(1s);
    }
    /// On the sign-in screen, whose first field has the focus.
    void fillIn(const std::string& address, const std::string& password) {
        type(address);
        press(Key::tab);
        type("user");
        press(Key::tab);
        type(password);
    }
    void givenSignInScreen() {
        launch(phone);
        tapButton("Sign In to a Server…");
    }
    void givenSignedIn() {
        givenSignInScreen();
        fillIn(server.url(), "secret");
        press(Key::enter);
        ASSERT_TRUE(untilElsewhere([&] { return button("Keep It in a File") != nullptr; }));
        tapButton("Keep It in a File");
        ASSERT_TRUE(untilShows("Documents"));
    }
    platform::AccountRecord account() const {
        return platform->accountManager().active().value_or(platform::AccountRecord{});
    }
    std::string store() const {
        return platform->documents().shelfroot().value_or(platform::Url::file("/")).path();
    }
};

TEST_F(AccountScreens, SignsInToAServerAndKeepsThePasswordOutOfSight) {
    std::ofstream(server.folder() + "/Hello.txt") << "hello";
    givenSignedIn();
    EXPECT_EQ(account().name, "user@" + server.authority());
    const std::string file = home / "config/pelmora/secrets.json";
    EXPECT_EQ(platform::FileManager::attributes(file, platform::FollowLinks::no)->mode & 0777U,
              0600U);
    for (const std::string other : {"config/pelmora/account.json", "config/pelmora/accounts.json"})
        EXPECT_THAT(home.read(other), Not(HasSubstr("secret")));
    EXPECT_TRUE(untilElsewhere(
        [&] { return std::filesystem::exists(store() + "/.Hello.txt.promise"); }));
}

TEST_F(AccountScreens, SaysWhatIsWrongWithAPlace) {
    givenSignInScreen();
    tapButton("Sign In");
    EXPECT_NE(textWith("Give the address"), "");
    fillIn(server.url(), "wrong");
    press(Key::enter);
    EXPECT_TRUE(untilSays("does not accept the user or the password"));
    press(Key::escape);
    advance(1s);
    tapButton("Sign In to a Server…");
    fillIn(server.url() + "nowhere/", "secret");
    press(Key::enter);
    EXPECT_TRUE(untilSays("There is nothing at"));
    EXPECT_FALSE(platform->accountManager().active());
    EXPECT_FALSE(std::filesystem::exists(home / "config/pelmora/secrets.json"));
}

TEST_F(AccountScreens, AServerThatSaysNothingIsLeftByEscape) {
    HttpHost silent([](const WireRequest&) {
        WireReply reply;
        reply.silent = true;
        return reply;
    });
    givenSignInScreen();
    fillIn("http://" + silent.authority() + "/", "secret");
    press(Key::enter);
    EXPECT_NE(textWith("Looking at the server…"), "");
    press(Key::escape);
    EXPECT_TRUE(untilElsewhere([&] { return textWith("Looking at the server…").empty(); }));
    press(Key::escape); // and now the screen itself
    advance(1s);
    EXPECT_TRUE(button("Sign In to a Server…"));
}

TEST_F(AccountScreens, APasswordThatIsRefusedIsAskedForOnceAndThenWaits) {
    givenSignedIn();
    const platform::AccountRecord before = account();
    delegate.reset();
    application.reset();
    platform.reset();
    home.write("config/pelmora/secrets.json",
               "{\"" + platform::secretNameOf(before) + "\": \"old\"}");
    withoutAccount(); // the same home: the account is there
    launch(phone);
    ASSERT_TRUE(untilElsewhere([&] { return alert() != nullptr; }));
    EXPECT_THAT(alertText(), HasSubstr("Password for"));
    tapButton("Not Now");
    EXPECT_THAT(window().statusStrip().account, HasSubstr("does not accept"));
    nav().showAccount();
    advance(1s);
    tapButton("Enter Password…");
    type("secret");
    press(Key::enter);
    advance(1s);
    EXPECT_TRUE(untilElsewhere([&] { return !platform->cloud().passwordWanted(); }));
    EXPECT_TRUE(untilElsewhere([&] { return !platform->accounts().problem(); }));
}

TEST_F(AccountScreens, SigningOutTakesNothingAwayThatHasNotBeenSent) {
    givenSignedIn();
    givenNetwork("cellular"); // where it is not sent by itself
    ASSERT_TRUE(untilElsewhere([&] { return window().statusStrip().network == "Cellular"; }));
    calmDown();
    givenFile("mine.txt", "mine");
    nav().showAccount();
    advance(1s);
    tapButton("Sign Out…");
    tapButton("Remove Files from This Device");
    ASSERT_TRUE(untilElsewhere([&] { return alert() && alertText().starts_with("Not Every"); }));
    EXPECT_THAT(alertText(), HasSubstr("Documents/mine.txt"));
    tapButton("Stay Signed In");
    ASSERT_TRUE(platform->accountManager().active());

    givenNetwork("wifi"); // time goes on, and it is sent
    const std::string there = server.folder() + "/Documents/mine.txt";
    for (int i = 0; i < 100 && !std::filesystem::exists(there); ++i) {
        advance(2s);
        calmDown();
    }
    ASSERT_TRUE(std::filesystem::exists(there));
    calmDown();
    const std::string folder = std::filesystem::path(store()).parent_path();
    tapButton("Sign Out…");
    tapButton("Remove Files from This Device");
    ASSERT_TRUE(untilElsewhere([&] { return !std::filesystem::exists(folder); }));
    EXPECT_FALSE(std::filesystem::exists(home / "config/pelmora/secrets.json"));
    EXPECT_TRUE(untilElsewhere([&] { return button("Sign In to a Server…") != nullptr; }));
}

TEST_F(AccountScreens, OnAMobileNetworkContentsWaitAndItIsSaid) {
    signIn();
    launch(phone);
    givenNetwork("cellular");
    ASSERT_TRUE(untilElsewhere([&] { return window().statusStrip().network == "Cellular"; }));
    givenFile("new.txt", "new");
    const auto later = [&](const std::function<bool()>& holds) {
        for (int i = 0; i < 100 && !holds(); ++i) {
            advance(2s);
            calmDown();
        }
        return holds();
    };
    EXPECT_TRUE(later([&] {
        return window().statusStrip().account.find("1 document waits") != std::string::npos;
    }));
    nav().showAccount();
    advance(1s);
    EXPECT_TRUE(untilSays("“new.txt”: Waits for a network"));
    EXPECT_FALSE(home.has("remote/Documents/new.txt"));
    givenNetwork("wifi");
    EXPECT_TRUE(later([&] { return home.has("remote/Documents/new.txt"); }));
}

} // namespace
} // namespace test
