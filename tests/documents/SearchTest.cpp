#include "platform/documents/DocumentSearchController.h"
#include "platform/documents/search/SearchModel.h"
#include "tests/documents/ListFixture.h"

#include <QApplication>
#include <QtTest/QTest>

#include <unistd.h>

using namespace platform;
using namespace std::chrono_literals;
using ::testing::ElementsAre;
using ::testing::IsEmpty;

namespace {

struct Names : ::testing::Test {
    test::StoreHouse house;
    std::vector<std::string> found;
    std::vector<std::string> places;

    /// Everything that is found for the text, by a search that begins now.
    std::vector<std::string> find(const std::string& text) {
        const auto search = makeNameSearch(house.services());
        bool answered = false;
        search->find(text, [&](std::vector<FoundItem> items) {
            answered = true;
            found.clear();
            places.clear();
            for (const FoundItem& item : items) {
                found.emplace_back(item.url.lastPathComponent());
                places.push_back(item.place);
            }
        });
        EXPECT_TRUE(house.until([&] { return answered; }));
        return found;
    }
};

TEST_F(Names, findsPromisesFoldersAndFilesWhateverTheirLetterCaseAndAccents) {
    house.givenRemote("Trips/Réunion/Plan.pdf");
    house.givenRemote("/Notebook/plan b.md");
    house.signIn();
    house.givenFile("Trips/Old PLANS/x.txt");
    house.givenFile(".hidden plan");
    EXPECT_THAT(find("plan"), ElementsAre("plan b.md", "Plan.pdf", "Old PLANS"));
    EXPECT_THAT(places,
                ElementsAre("Notebook", "Documents › Trips › Réunion", "Documents › Trips"));
    EXPECT_THAT(find("RE\u0301UNION"), ElementsAre("Réunion"));
    EXPECT_THAT(find("no such name"), IsEmpty());
}

TEST_F(Names, putsWholeNamesAndBeginningsFirstAndNumbersByValue) {
    house.signIn();
    for (const char* const name : {"Report 10", "report", "Old report", "Report 9", "Misreported"})
        house.givenFile(name);
    EXPECT_THAT(find("report"),
                ElementsAre("report", "Report 9", "Report 10", "Old report", "Misreported"));
}

TEST_F(Names, doesNotGoRoundInLinksAndAnswersNothingThatIsGone) {
    house.signIn();
    house.givenFile("A/needle.txt");
    ::symlink(house.path("A").c_str(), house.path("A/loop").c_str());
    const auto search = makeNameSearch(house.services());
    int answers = 0;
    std::size_t count = 0;
    const auto ask = [&] {
        search->find("needle", [&](std::vector<FoundItem> items) {
            ++answers;
            count = items.size();
        });
    };
    ask();
    ASSERT_TRUE(house.until([&] { return answers == 1; }));
    EXPECT_EQ(count, 1U);
    house.remove("A/needle.txt");
    ask();
    ASSERT_TRUE(house.until([&] { return answers == 2; }));
    EXPECT_EQ(count, 0U);
}

TEST_F(Names, answersTheLastTextAlone) {
    house.signIn();
    house.givenFile("abc.txt");
    const auto search = makeNameSearch(house.services());
    std::vector<std::string> answered;
    for (const std::string text : {"a", "ab", "abc"})
        search->find(text, [&answered, text](std::vector<FoundItem>) { answered.push_back(text); });
    ASSERT_TRUE(house.until([&] { return !answered.empty(); }));
    EXPECT_EQ(answered.back(), "abc");
    EXPECT_EQ(answered.size(), 1U);
}

struct SearchScreen : test::ListFixture {
    std::shared_ptr<DocumentSearchController> screen;

    void SetUp() override {
        open();
        house.givenFile("Trip/needle.txt");
        house.givenFolder("Needles");
        showList();
    }
    bool searches() const { return house.navigation->presentedViewController() != nullptr; }
    ListWidget* results() const {
        for (QWidget* const each : QApplication::allWidgets())
            if (auto* const found = dynamic_cast<ListWidget*>(each);
                found && found != &widget() && found->isVisible())
                return found;
        return nullptr;
    }
    void search(const char* text, std::size_t count) {
        QTest::keyClicks(QApplication::focusWidget(), QLatin1String(text));
        ASSERT_TRUE(house.until([&] { return results()->state().model.count() == count; }));
    }
    void tapResult(std::size_t index) {
        const Point at = results()->state().rowRect(index).center();
        QTest::mouseClick(results(), Qt::LeftButton, {},
                          QPoint(static_cast<int>(at.x), static_cast<int>(at.y)));
    }
};

/// Notes whether the search screen is still there when a callback comes.
struct Watching : test::ListDelegate {
    NavigationController* navigation = nullptr;
    std::vector<bool> presented;
    void note() {
        presented.push_back(std::dynamic_pointer_cast<DocumentSearchController>(
                                navigation->presentedViewController()) != nullptr);
    }
    void documentListControllerDidSelectContainerWithViewController(
        DocumentListController& list,
        const std::shared_ptr<DocumentListController>& next) override {
        note();
        ListDelegate::documentListControllerDidSelectContainerWithViewController(list, next);
    }
    void documentListControllerDidSelectItemAtURL(DocumentListController& list,
                                                  const Url& url) override {
        note();
        ListDelegate::documentListControllerDidSelectItemAtURL(list, url);
    }
};

TEST_F(SearchScreen, reportsWhatIsTappedThroughTheListWhileItIsPresented) {
    const auto watching = std::make_shared<Watching>();
    watching->navigation = house.navigation.get();
    list->setDelegate(watching);
    ASSERT_TRUE(list->performKeyCommand(KeyCommand::find));
    house.advance(1s);
    ASSERT_TRUE(searches());
    search("needle", 2);
    tapResult(1);
    EXPECT_THAT(watching->folders, ElementsAre(house.url("Needles")));
    EXPECT_TRUE(searches()) << "the delegate takes the screen away when it shows the folder";
    tapResult(0);
    EXPECT_THAT(watching->files, ElementsAre(house.url("Trip/needle.txt")));
    EXPECT_THAT(watching->presented, ElementsAre(true, true));
    house.advance(1s);
    EXPECT_FALSE(searches());
}

TEST_F(SearchScreen, theArrowLeadsFromTheFieldIntoTheResults) {
    ASSERT_TRUE(list->performKeyCommand(KeyCommand::find));
    house.advance(1s);
    search("needle", 2);
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Down);
    ASSERT_EQ(QApplication::focusWidget(), results());
    QTest::keyClick(results(), Qt::Key_Return);
    EXPECT_THAT(delegate->files, ElementsAre(house.url("Trip/needle.txt")));
}

TEST_F(SearchScreen, opensByTheFieldAboveTheListAndClosesByEscape) {
    QWidget* const above = widget().parentWidget()->childAt(100, 30);
    ASSERT_TRUE(above);
    QTest::mouseClick(above, Qt::LeftButton);
    house.advance(1s);
    ASSERT_TRUE(searches());
    QTest::keyClick(QApplication::focusWidget(), Qt::Key_Escape);
    house.advance(1s);
    EXPECT_FALSE(searches());
}

} // namespace
