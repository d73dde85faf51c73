#include "platform/files/FileCoordinator.h"
#include "platform/files/Progress.h"
#include "platform/launch/DocumentInteractionController.h"
#include "platform/ui/AlertController.h"
#include "tests/launch/Desk.h"

#include <QClipboard>
#include <QGuiApplication>
#include <QMimeData>
#include <QUrl>

#include <gmock/gmock.h>

#include <future>

namespace test {
namespace {

using namespace platform;
using namespace std::chrono_literals;
using testing::ElementsAre;
using testing::HasSubstr;

/// A cloud that keeps people waiting until it is told what becomes of it.
class SlowCloud : public ContentProvider {
public:
    bool isPromised(const Url& item) const override { return item == promised && !arrived; }
    Failure makeLocal(const Url& item, CancelFlag& cancel) override {
        const auto progress = std::make_shared<Progress>(std::string(fileProgressKind), 2'000'000);
        const auto token = Platform::current().fileProgress().publish(item, progress);
        progress->update(500'000, 2'000'000);
        cancel.setHandler([this] { answer.set_value(makeError(ErrorCode::userCancelled)); });
        Failure failure = answered.get();
        cancel.setHandler({});
        if (!failure) // one that was given up may end long after the test goes on
            arrived = true;
        return failure;
    }
    Failure moveItem(const Url&, const Url&) override {
        return makeError(ErrorCode::unsupportedOperation);
    }

    Url promised;
    std::atomic<bool> arrived{false};
    std::promise<Failure> answer;
    /// For as many fetches as there are: a coordinated read may ask again.
    std::shared_future<Failure> answered = answer.get_future().share();
};

struct Listener : DocumentInteractionControllerDelegate {
    void
    documentInteractionControllerDidDismissOptionsMenu(DocumentInteractionController&) override {
        ++dismissals;
    }
    int dismissals = 0;
};

class DocumentInteraction : public Desk {
protected:
    ~DocumentInteraction() override {
        if (slow.promised != Url())
            FileCoordinator::setContentProvider(&house.platform->cloud().contents());
    }
    void givenViewer(const std::string& exec = "viewer %f") {
        givenProgram("viewer");
        givenApplication("viewer", "Viewer", "Exec=" + exec + "\nMimeType=text/plain;");
    }
    /// It is there, but the system cannot run it.
    void givenInterpreterlessViewer() { house.home.write("bin/viewer", "#!/nowhere/shell\n"); }
    Url givenLetter() { return Url::file(house.givenFile("Letter.txt")); }
    /// One whose download goes on until the test says what becomes of it. Beside the store, which
    /// would ask for it as well.
    Url givenSlowLetter() {
        slow.promised = Url::file(house.home.write("elsewhere/Letter.txt", "x"));
        FileCoordinator::setContentProvider(&slow);
        return slow.promised;
    }
    std::shared_ptr<DocumentInteractionController> menuFor(const Url& document) {
        auto controller = DocumentInteractionController::create(document);
        controller->setDelegate(listener);
        EXPECT_TRUE(controller->presentOptionsMenuFromRectInView(
            {0, 40, 360, 0}, house.navigation->topViewController()->view(), true));
        house.advance(300ms);
        return controller;
    }
    void choose(std::string_view title) {
        ASSERT_NE(button(title), nullptr) << title;
        tap(*button(title));
        house.advance(300ms);
    }
    bool untilAlert(std::string_view title) {
        return house.until([&] { return topPresented() && topPresented()->title() == title; });
    }
    std::shared_ptr<AlertController> alert() {
        return std::dynamic_pointer_cast<AlertController>(topPresented());
    }
    std::string alertMessage() { return alert() ? alert()->message() : ""; }
    std::vector<std::string> choices() {
        std::vector<std::string> titles;
        for (const auto& each : alert()->actions())
            titles.push_back(each->title());
        return titles;
    }
    void savePicture(const std::string& name) { house.savePicture("screens/launch-" + name); }
    static const QMimeData& clipboard() { return *QGuiApplication::clipboard()->mimeData(); }

    SlowCloud slow;
    std::shared_ptr<Listener> listener = std::make_shared<Listener>();
};

TEST_F(DocumentInteraction, ADocumentGoesToItsDefaultApplication) {
    open();
    givenViewer("viewer --now %f");
    const Url letter = givenLetter();
    EXPECT_EQ(DocumentInteractionController::create(letter)->defaultApplication()->localizedName,
              "Viewer");
    EXPECT_TRUE(DocumentInteractionController::create(letter)->openWithDefaultApplication());
    EXPECT_EQ(argumentsOf("viewer"), (std::vector<std::string>{"--now", letter.path()}));
    EXPECT_EQ(topPresented(), nullptr);
    EXPECT_FALSE(DocumentInteractionController::create(Url::file(house.givenFile("a.xyzzy", "\1")))
                     ->openWithDefaultApplication());
}

TEST_F(DocumentInteraction, APromisedDocumentIsMadeLocalFirst) {
    house.givenRemote("Letter.txt", "from afar");
    open();
    givenViewer();
    const auto controller = DocumentInteractionController::create(house.url("Letter.txt"));
    ASSERT_TRUE(house.documents().isPromised(controller->url()));
    EXPECT_EQ(controller->defaultApplication()->bundleIdentifier, "viewer");
    EXPECT_TRUE(controller->openWithDefaultApplication());
    EXPECT_EQ(argumentsOf("viewer"), std::vector{house.path("Letter.txt")});
    EXPECT_EQ(house.home.read(house.path("Letter.txt").substr(house.home.path().size() + 1)),
              "from afar");
}

TEST_F(DocumentInteraction, ALongDownloadIsSeenAndThenTheApplicationStarts) {
    open();
    givenViewer();
    DocumentInteractionController::create(givenSlowLetter())->openWithDefaultApplication();
    house.advance(150ms);
    EXPECT_EQ(topPresented(), nullptr) << "what is quick shows nothing";
    house.advance(500ms);
    ASSERT_TRUE(untilAlert("Downloading “Letter.txt”"));
    slow.answer.set_value(std::nullopt);
    ASSERT_TRUE(house.until([&] { return topPresented() == nullptr; }));
    house.advance(300ms);
    EXPECT_TRUE(argumentsOf("viewer").has_value());
}

TEST_F(DocumentInteraction, ALongDownloadShowsItsProgressAndCanBeCancelled) {
    open();
    givenViewer();
    const Url letter = givenSlowLetter();
    DocumentInteractionController::create(letter)->openWithDefaultApplication();
    house.advance(500ms);
    ASSERT_TRUE(house.until([&] { return label("500 KB of 2 MB") != nullptr; }));
    savePicture("download.png");
    choose("Cancel");
    EXPECT_EQ(topPresented(), nullptr);
    // The wish is over, so the same one is a new one.
    slow.arrived = true;
    DocumentInteractionController::create(letter)->openWithDefaultApplication();
    EXPECT_TRUE(argumentsOf("viewer").has_value());
    EXPECT_EQ(topPresented(), nullptr) << "a cancellation is no failure";
}

TEST_F(DocumentInteraction, WhatGoesWrongIsSaidWithItsCause) {
    open();
    const Url letter = givenSlowLetter();
    givenViewer();
    DocumentInteractionController::create(letter)->openWithDefaultApplication();
    slow.answer.set_value(makeError(ErrorCode::serverNotAvailable));
    ASSERT_TRUE(untilAlert("“Letter.txt” could not be opened"));
    EXPECT_THAT(alertMessage(), HasSubstr("cannot be reached"));
    house.advance(300ms);
    choose("OK");
    slow.arrived = true;
    givenInterpreterlessViewer();
    DocumentInteractionController::create(letter)->openWithDefaultApplication();
    ASSERT_TRUE(untilAlert("“Letter.txt” could not be opened"));
    EXPECT_THAT(alertMessage(), HasSubstr("“Viewer” could not be started."));
    house.advance(300ms);
    choose("OK");
    givenProgram("viewer", 3);
    givenApplication("viewer", "Viewer", "Exec=viewer %f\nMimeType=text/plain;");
    DocumentInteractionController::create(letter)->openWithDefaultApplication();
    ASSERT_TRUE(untilAlert("“Letter.txt” could not be opened"));
    EXPECT_THAT(alertMessage(), HasSubstr("ended as soon as it had been started (exit status 3)"));
}

TEST_F(DocumentInteraction, TheMenuOffersWhatCanBeDoneWithTheDocument) {
    open();
    givenViewer();
    givenProgram("editor");
    givenProgram("mail");
    givenApplication("editor", "Editor", "Exec=editor %u\nMimeType=text/plain;");
    givenApplication("mail", "Mail", "Exec=mail %u\nMimeType=x-scheme-handler/mailto;");
    givenList("config/mimeapps.list", "[Default Applications]\ntext/plain=viewer.desktop\n");
    const Url letter = givenLetter();
    menuFor(letter);
    EXPECT_THAT(choices(), ElementsAre("Open in “Viewer”", "Open in “Editor”", "Copy", "Copy Path",
                                       "Send by Mail", "Cancel"));
    savePicture("menu-phone.png");
    choose("Open in “Editor”");
    EXPECT_EQ(argumentsOf("editor"), std::vector{letter.absoluteString()});
    EXPECT_EQ(listener->dismissals, 1);
}

TEST_F(DocumentInteraction, TheMenuStandsAtItsButtonOnATablet) {
    open({1024, 768});
    givenViewer();
    const auto item = BarButtonItem::withSystemItem(SystemItem::action);
    house.navigation->topViewController()->navigationItem().setRightBarButtonItem(item);
    settle();
    const auto controller = DocumentInteractionController::create(givenLetter());
    ASSERT_TRUE(controller->presentOptionsMenuFromBarButtonItem(item, true));
    house.advance(300ms);
    savePicture("menu-tablet.png");
    const View& shown = *button("Copy Path");
    EXPECT_GT(shown.convertToWindow(shown.bounds()).x, 600);
    EXPECT_EQ(button("Send by Mail"), nullptr) << "nobody sends mail here";
}

TEST_F(DocumentInteraction, CopiesAreForFileManagersAndForText) {
    open();
    const Url file = Url::file(house.givenFile("Ä % letter.txt"));
    menuFor(file);
    choose("Copy Path");
    EXPECT_EQ(clipboard().text().toStdString(), file.path());
    EXPECT_FALSE(clipboard().hasUrls());
    menuFor(file);
    choose("Copy");
    ASSERT_TRUE(house.until([] { return clipboard().hasUrls(); }));
    EXPECT_EQ(clipboard().urls().first().toLocalFile().toStdString(), file.path());
    EXPECT_EQ(clipboard().data(QStringLiteral("x-special/gnome-copied-files")).toStdString(),
              "copy\n" + file.absoluteString());
}

TEST_F(DocumentInteraction, MailTakesTheDocumentAlong) {
    open();
    set("PATH", house.home / "bin");
    givenProgram("mail");
    givenApplication("mail", "Mail", "Exec=mail %u\nMimeType=x-scheme-handler/mailto;");
    const Url file = Url::file(house.givenFile("A & B?.txt"));
    menuFor(file);
    choose("Send by Mail");
    EXPECT_EQ(argumentsOf("mail"), std::vector{"mailto:?subject=A%20%26%20B%3F.txt&attach=" +
                                               percentEncoded(file.path(), "/")});
    givenProgram("xdg-email");
    menuFor(file);
    choose("Send by Mail");
    EXPECT_EQ(argumentsOf("xdg-email"), (std::vector<std::string>{"--attach", file.path()}));
}

TEST_F(DocumentInteraction, TheDelegateHearsOnceHoweverTheMenuGoes) {
    open();
    const Url letter = givenLetter();
    const auto first = menuFor(letter);
    EXPECT_FALSE(first->presentOptionsMenuFromRectInView({}, nullptr, true)) << "it is shown";
    press(Key::escape);
    house.advance(300ms);
    EXPECT_EQ(listener->dismissals, 1);
    menuFor(letter)->dismissMenuAnimated(true);
    house.advance(300ms);
    EXPECT_EQ(topPresented(), nullptr);
    EXPECT_EQ(listener->dismissals, 2);
    menuFor(letter)->dismissMenuAnimated(false);
    settle();
    EXPECT_EQ(listener->dismissals, 3);
    house.window.reset();
    EXPECT_FALSE(first->presentOptionsMenuFromRectInView({}, nullptr, true)) << "no window";
    EXPECT_EQ(listener->dismissals, 3);
}

TEST_F(DocumentInteraction, WhatIsUnderWayWhenTheProgramEndsIsGivenUp) {
    open();
    givenViewer();
    DocumentInteractionController::create(givenSlowLetter())->openWithDefaultApplication();
    house.advance(500ms);
    house.navigation.reset();
    house.window.reset();
    house.application.reset();
    house.platform->mainQueue().drainAll();
    EXPECT_FALSE(house.home.has("bin/viewer.said"));
}

} // namespace
} // namespace test
