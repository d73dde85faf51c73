#include "items/FileUtils.h"
#include "items/FilenamePrompt.h"
#include "items/UIUtils.h"
#include "tests/product/ProductFixture.h"

#include <filesystem>

using platform::ErrorCode;
using platform::Failure;
using platform::Url;
using tavrin::FilenamePrompt;
using tavrin::FileUtils;
using tavrin::NewFolderPrompt;
using tavrin::RenamePrompt;
using tavrin::UIUtils;
using testing::ElementsAre;
using testing::StartsWith;

namespace test {
namespace {

constexpr auto refusedCharacter = "Character not allowed in filename";

/// A prompt over the program's window, whose owner writes down what it is asked.
struct Prompt : ProductTest {
    UIUtils::Screen screen() { return window().rootViewController(); }
    FilenamePrompt::ValidateCallback owner() {
        return [this](const std::optional<std::string>& name, bool& dismiss) {
            asked.push_back(name.value_or("(none)"));
            EXPECT_FALSE(dismiss);
            dismiss = accepts;
            return answer;
        };
    }
    void show(const std::shared_ptr<FilenamePrompt>& prompt) {
        screen()->presentViewController(prompt->alert(), true);
        advance(1s);
        EXPECT_EQ(topPresented(), prompt->alert());
    }
    void showNewFolder() { show(NewFolderPrompt::newWithTitle("New Folder", "Create", owner())); }
    platform::TextField& field() { return *alert()->textFields().front(); }
    void clearField() {
        while (!field().text().empty())
            press(Key::backspace);
    }
    void retype(std::string_view text) {
        clearField();
        commit(text);
    }
    bool shows(std::string_view text) { return label(text) != nullptr; }

    std::vector<std::string> asked;
    bool accepts = false;
    std::optional<std::string> answer;
};

TEST_F(Prompt, letsANameThroughOnlyWhileItIsOne) {
    launch();
    showNewFolder();
    EXPECT_EQ(alertText(), "New Folder: Enter a name for this folder.");
    EXPECT_EQ(field().placeholder(), "Folder Name");
    EXPECT_EQ(field().text(), "");
    EXPECT_FALSE(button("Create")->isEnabled());
    struct Case {
        const char* text;
        bool valid, refused;
    };
    for (const Case& each :
         {Case{"Notes", true, false}, Case{".hidden", false, true}, Case{"a/b", false, true},
          Case{"  a b ", true, false}, Case{" .a", false, true}, Case{"   ", false, false},
          Case{"\u3000\u00A0", false, false}, Case{"\u65E5\u672C", true, false}}) {
        retype(each.text);
        EXPECT_EQ(button("Create")->isEnabled(), each.valid) << each.text;
        EXPECT_EQ(shows(refusedCharacter), each.refused) << each.text;
        clearField();
        EXPECT_FALSE(button("Create")->isEnabled());
        EXPECT_FALSE(shows(refusedCharacter)) << "no complaint about nothing";
    }
}

TEST_F(Prompt, staysUntilItsOwnerLetsItGo) {
    launch();
    showNewFolder();
    answer = "That name is bad luck";
    retype("\u2003 Thirteen \u00A0");
    tap(*button("Create"));
    advance(1s);
    EXPECT_THAT(asked, ElementsAre("Thirteen"));
    EXPECT_TRUE(shows("That name is bad luck"));
    commit("x");
    EXPECT_FALSE(shows("That name is bad luck")) << "another name, another judgement";
    answer.reset();
    accepts = true;
    press(Key::enter);
    advance(1s);
    EXPECT_EQ(asked.size(), 2U);
    EXPECT_EQ(alert(), nullptr);
}

TEST_F(Prompt, closesOnCancelWithoutAWord) {
    launch();
    const std::weak_ptr<FilenamePrompt> prompt = [this] {
        const auto made = RenamePrompt::newWithFilename("Milk.txt", owner());
        show(made);
        return std::weak_ptr(made);
    }();
    EXPECT_FALSE(prompt.expired()) << "its alert keeps it";
    EXPECT_EQ(alertText(), "Rename Item: Enter a new name for this item.");
    EXPECT_EQ(field().text(), "Milk.txt");
    EXPECT_EQ(field().placeholder(), "Milk.txt");
    EXPECT_TRUE(button("Done")->isEnabled());
    tap(*button("Cancel"));
    advance(1s);
    EXPECT_EQ(alert(), nullptr);
    EXPECT_TRUE(asked.empty());
    EXPECT_TRUE(prompt.expired());
}

TEST_F(Prompt, isToldNoneForANameThatIsNoName) {
    launch();
    const auto prompt = FilenamePrompt::newWithTitle({}, {}, {}, "a", "", owner());
    show(prompt);
    EXPECT_NE(button("Done"), nullptr) << "the word where none is given";
    field().setText("a:b"); // no edit, so nothing has judged it yet
    tap(*button("Done"));
    EXPECT_THAT(asked, ElementsAre("(none)"));
    EXPECT_NE(alert(), nullptr);
}

struct Renaming : HouseTest {
    Failure rename(std::string_view item, std::string_view name) const {
        return UIUtils::renameItemAtURL(url(item), name);
    }
    bool has(std::string_view name) const { return FileUtils::isTaken(url(name)); }
};

TEST_F(Renaming, keepsTheExtensionUnlessOnlyItsCaseDiffers) {
    const std::vector<std::array<std::string, 3>> cases = {
        {"Letter.pages", "Offer", "Offer.pages"},
        {"Letter.pages", "Offer.PAGES", "Offer.PAGES"},
        {"Letter.pages", "Offer.txt", "Offer.txt.pages"},
        {"Folder", "Offer", "Offer"},
        {"Folder", "Offer.txt", "Offer.txt"},
        {"archive.tar.gz", "backup", "backup.gz"},
        {".profile", "profile", "profile"},
        {"a.\u00C4", "b.\u00E4", "b.\u00E4"},
        {"a.txt", "b.", "b..txt"},
    };
    for (const auto& [old, name, wanted] : cases)
        EXPECT_EQ(UIUtils::computeNewURL(Url::file("/x/" + old), name), Url::file("/x/" + wanted));
    EXPECT_TRUE(UIUtils::computeNewURL(Url::file("/x/Folder", true), "b").hasDirectoryMark());
}

TEST_F(Renaming, movesBesideATakenName) {
    givenRemote("Far.pdf");
    signIn();
    listenClosely();
    givenFile("Report.pdf");
    EXPECT_EQ(rename("Report.pdf", "Report.pdf"), std::nullopt);
    EXPECT_EQ(rename("Report.pdf", "Report"), std::nullopt);
    EXPECT_TRUE(has("Report.pdf")) << "the same name without its extension";
    EXPECT_EQ(rename("Report.pdf", "Far"), std::nullopt);
    EXPECT_TRUE(has("Far 2.pdf"));
    EXPECT_EQ(rename("Far 2.pdf", "far 2.PDF"), std::nullopt);
    EXPECT_TRUE(has("far 2.PDF"));
    EXPECT_EQ(rename("Far.pdf", "Away"), std::nullopt);
    EXPECT_TRUE(documents().isPromised(url("Away.pdf")));
}

TEST_F(Renaming, refusesWhatIsNoName) {
    signIn();
    listenClosely();
    givenFile("a.txt");
    clearLog();
    for (const char* name : {"", ".a", "a/b"})
        EXPECT_TRUE(rename("a.txt", name)->is(ErrorCode::invalidFilename)) << name;
    EXPECT_THAT(logLines(), ElementsAre("7 Rename: empty, reverting", "7 Name is invalid: .a",
                                        "7 Name is invalid: a/b"));
    EXPECT_TRUE(rename("a.txt", std::string(300, 'n')).has_value());
    EXPECT_TRUE(has("a.txt"));
}

TEST_F(Renaming, renamesTheDocumentBehindABookmark) {
    signIn();
    listenClosely();
    home.write("outside/Plan.txt", "plan");
    std::filesystem::create_symlink(home / "outside/Plan.txt", path("Bookmark"));
    clearLog();
    EXPECT_EQ(rename("Bookmark", "Map"), std::nullopt);
    EXPECT_TRUE(home.has("outside/Map.txt"));
    EXPECT_THAT(logLines().at(1), StartsWith("7 Renaming bookmark file://"));
}

TEST_F(Renaming, findsWordsForAnError) {
    withoutAccount();
    platform::Error error{"domain", 1, "description", "reason"};
    EXPECT_EQ(UIUtils::bestMessage(error), "description");
    error.localizedDescription.reset();
    EXPECT_EQ(UIUtils::bestMessage(error), "reason");
    error.localizedFailureReason.reset();
    EXPECT_EQ(UIUtils::bestMessage(error), "Error exception");
    EXPECT_EQ(UIUtils::bestMessage(std::nullopt), "");
    EXPECT_NE(UIUtils::bestMessage(platform::makeError(ErrorCode::invalidFilename, "a")), "");
}

struct Alerts : Prompt {
    void dismiss(const char* title = "OK") {
        tap(*button(title));
        advance(1s);
        EXPECT_EQ(alert(), nullptr);
    }
    void askToDelete(const std::vector<Url>& items) {
        UIUtils::showDeleteWarningAlert(
            items, false, screen(), nullptr, nullptr,
            [this](const platform::AlertAction* action, bool cancelled) {
                asked.push_back((action ? action->title() : "nothing") +
                                (cancelled ? " cancelled" : ""));
            });
        advance(1s);
    }
    /// A container and two documents.
    void givenDocuments() {
        givenRemote("far.txt");
        signIn();
        givenFile("near \"1\".txt");
        launch();
    }
};

TEST_F(Alerts, nameWhatIsWrong) {
    launch();
    UIUtils::showItemExistsAlert("Report.final.pdf", screen());
    EXPECT_EQ(alertText(), "The name “Report.final” with extension “.pdf” is already taken.: "
                           "Choose a different name.");
    dismiss();
    UIUtils::showItemExistsAlert("100%@", screen());
    EXPECT_THAT(alertText(), StartsWith("The name “100%@” is already taken.: "));
    dismiss();
    UIUtils::showInvalidItemNameAlert("a:b", screen());
    EXPECT_THAT(alertText(), StartsWith(": The name “a:b” can’t be used. Try using a name with"));
    dismiss();
    UIUtils::showError(platform::Error{"domain", 1, {}, "reason"}, screen());
    EXPECT_EQ(alertText(), "reason: ");
    dismiss();
    UIUtils::showError(std::nullopt, screen());
    EXPECT_EQ(alertText(), "Error exception: ");
    dismiss();
}

TEST_F(Alerts, sayWhatADeletionTakesFromAllDevices) {
    givenDocuments();
    const auto message = [this](const std::vector<Url>& items) {
        return UIUtils::messageForDeletePrompt(items).value_or("(none)");
    };
    const std::string rest = " will be permanently deleted from Tavrin on all your devices. This "
                             "action cannot be undone.";
    EXPECT_EQ(message({url("near \"1\".txt")}), "\"near \"1\".txt\"" + rest);
    EXPECT_EQ(message({url("far.txt")}), "\"far.txt\"" + rest);
    EXPECT_EQ(message({url("far.txt"), url("none")}), "2 items" + rest);
    EXPECT_EQ(message({}), "0 items" + rest);
    EXPECT_EQ(message({url("")}), "The Documents app library, and all its documents," + rest);
    EXPECT_EQ(message({url("none")}), "(none)");
}

TEST_F(Alerts, askBeforeADeletionWhereThereIsSomethingToAsk) {
    givenDocuments();
    askToDelete({});
    EXPECT_THAT(asked, ElementsAre("nothing cancelled"));
    askToDelete({url("none")});
    EXPECT_EQ(alert(), nullptr);
    askToDelete({url("far.txt")});
    EXPECT_EQ(alert()->style(), platform::AlertStyle::actionSheet);
    EXPECT_EQ(alert()->actions().front()->style(), platform::ActionStyle::destructive);
    dismiss("Cancel");
    askToDelete({url("far.txt")});
    dismiss("Delete from Tavrin");
    EXPECT_THAT(asked, ElementsAre("nothing cancelled", "Cancel cancelled", "Delete from Tavrin"));
    EXPECT_TRUE(logged("6 Delete: Cancel pressed"));
    EXPECT_TRUE(FileUtils::isTaken(url("far.txt"))) << "asking deletes nothing";
}

TEST_F(Alerts, putTheCursorBeforeTheExtension) {
    launch();
    showNewFolder();
    using Range = std::pair<std::size_t, std::size_t>;
    const std::vector<std::pair<std::string, Range>> cases = {{"Report.pdf", {6, 0}},
                                                              {"a.tar.gz", {5, 0}},
                                                              {"\U0001F4C4\u00E4.txt", {3, 0}},
                                                              {".profile", {0, 0}},
                                                              {"", {0, 0}}};
    for (const auto& [text, cursor] : cases) {
        field().setText(text);
        UIUtils::setCursorInTextFieldToBeforeExtension(field());
        EXPECT_EQ(field().selectedRange(), cursor) << text;
    }
    field().setText("Report");
    UIUtils::selectTextInTextField(field(), 1, 3);
    EXPECT_EQ(field().selectedRange(), Range(1, 3));
}

} // namespace
} // namespace test
