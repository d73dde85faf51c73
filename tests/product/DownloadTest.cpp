#include "platform/system/NetworkActivityIndicator.h"
#include "tests/product/PreviewFixture.h"

#include <unistd.h>

using platform::Progress;
using tavrin::DownloadView;
using tavrin::RoundProgressView;
using tavrin::VXItem;
using testing::HasSubstr;

namespace fs = std::filesystem;

namespace test {
namespace {

constexpr std::uint64_t cellularLimit = 104'857'600;

struct Download : PreviewTest {
    /// Big.txt of ten seconds, on its way and a little of it here.
    void givenRunningDownload() {
        rateLimit = 100'000;
        givenPromise("Big.txt", 1'000'000);
        start();
        preview("Big.txt");
        ASSERT_TRUE(download()->downloading()) << "it began by itself";
        ASSERT_TRUE(untilReceived());
    }
    bool untilReceived() {
        return whileTimePasses([this] {
            const auto pie = download() ? download()->downloadView()->roundProgressView() : nullptr;
            return pie && pie->realProgress() > 0;
        });
    }
    /// Big.txt at the network's own speed, waiting for the button.
    void givenWaitingDownload(std::uintmax_t bytes = 1000) {
        givenPromise("Big.txt", bytes);
        start();
        givenNetwork("cellular");
        ASSERT_TRUE(untilNetwork(tavrin::networkCellular));
        preview("Big.txt");
    }
    bool showsIdle() const {
        const DownloadView& view = *download()->downloadView();
        return !view.downloading() && view.cancelButton()->isHidden() &&
               view.roundProgressView()->isHidden() && !view.downloadButton()->isHidden() &&
               !view.cloudButton()->isHidden();
    }
    bool networkIsBusy() const { return platform->networkActivityIndicator().isVisible(); }
};

TEST_F(Download, cancelLeavesThePromiseAndNoPart) {
    givenRunningDownload();
    givenWholeLog();
    EXPECT_TRUE(networkIsBusy());
    tap(*button("Cancel Download"));
    EXPECT_TRUE(showsIdle());
    EXPECT_FALSE(networkIsBusy());
    downloadsEnd();
    EXPECT_TRUE(isPromise("Big.txt"));
    EXPECT_EQ(partialFiles(), 0U);
    EXPECT_EQ(alertText(), "");
    EXPECT_EQ(manager().downloadFC(), nullptr);
    const std::string file = told("Big.txt");
    EXPECT_TRUE(logged("7 coordinateReadingItemAtURL was cancelled, URL " + file));
    EXPECT_TRUE(logged("7 Evicted " + file));
    tap(*button("Download to View"));
    EXPECT_TRUE(whileTimePasses([this] { return showsFullPreview(); })) << "it can begin again";
}

TEST_F(Download, ofADocumentThatIsNotThereSaysSoOnce) {
    start();
    ASSERT_TRUE(nav().showURLPreview(url("Gone.txt"), tavrin::fullPreviewMode));
    advance(1s);
    downloadsEnd();
    EXPECT_THAT(alertText(), HasSubstr("Gone.txt"));
    EXPECT_TRUE(showsIdle());
    EXPECT_EQ(timesLogged("6 Dispatching download of " + told("Gone.txt")), 1U);
}

TEST_F(Download, endsWhenItsScreenIsLeft) {
    givenRunningDownload();
    const auto held = nav().itemManager();
    nav().popViewController(true);
    held->downloadQueue()->sync([] {});
    advance(2s);
    EXPECT_TRUE(isPromise("Big.txt"));
    EXPECT_EQ(partialFiles(), 0U);
    EXPECT_FALSE(networkIsBusy());
    EXPECT_EQ(titles().back(), "Documents");
    EXPECT_EQ(nav().itemManager(), nullptr);
}

TEST_F(Download, doesNotBeginWhenItWasCancelledBefore) {
    givenWaitingDownload();
    std::vector<int> codes;
    manager().downloadQueue()->sync([this, &codes] {
        // The queue is held, as by an earlier read.
        manager().startDownloading([&codes](const auto&, const auto&, const auto& error) {
            codes.push_back(error ? error->code : 0);
        });
        manager().cancelDownload();
    });
    downloadsEnd();
    EXPECT_THAT(codes, testing::ElementsAre(3072));
    EXPECT_TRUE(isPromise("Big.txt"));
    EXPECT_FALSE(networkIsBusy());
}

TEST_F(Download, endsBeforeTheProgramDoes) {
    givenRunningDownload();
    const auto queue = manager().downloadQueue();
    const auto atRest = std::make_shared<bool>(false);
    queue->async([this, atRest] { // behind the read, and long enough to be missed
        for (int i = 0; i < 1000; ++i)
            home.write("work/" + std::to_string(i), "x");
        *atRest = true;
    });
    delegate.reset();
    application.reset();
    EXPECT_TRUE(*atRest);
    EXPECT_TRUE(isPromise("Big.txt"));
    EXPECT_EQ(partialFiles(), 0U);
}

TEST_F(Download, tellsThatTheFileWentInTheMiddle) {
    for (int i = 0; i < 4; ++i)
        givenPromise("Other " + std::to_string(i), 10);
    givenRunningDownload();
    // So much at once that nothing of it counts as deleted before somebody has said so.
    fs::rename(remote + "/Documents", home / "away");
    const std::string gone = ": “Big.txt” is no longer there. It may have been moved or deleted.";
    ASSERT_TRUE(whileTimePasses([this] { return button("Decide Later") != nullptr; }));
    tap(*button("Decide Later"));
    ASSERT_TRUE(whileTimePasses([&] { return alertText() == gone; }));
    EXPECT_TRUE(showsIdle());
    EXPECT_TRUE(isPromise("Big.txt"));
    EXPECT_EQ(partialFiles(), 0U);
    EXPECT_FALSE(networkIsBusy());
    tap(*button("OK"));
    advance(1s);
    EXPECT_EQ(topPresented(), nullptr);
}

TEST_F(Download, endsWithItsScreenWhenTheFileIsDeletedOnTheAccount) {
    rateLimit = 1000;
    givenPromise("Big.txt", 1'000'000);
    start();
    preview("Big.txt");
    ASSERT_TRUE(untilReceived());
    fs::remove(remoteFile("Big.txt"));
    ASSERT_TRUE(whileTimePasses([this] { return download() == nullptr; }));
    EXPECT_TRUE(whileTimePasses([this] { return !networkIsBusy(); }));
    EXPECT_EQ(titles().back(), "Documents");
    EXPECT_EQ(alertText(), "");
    EXPECT_FALSE(documents().isPromised(url("Big.txt")));
    EXPECT_EQ(partialFiles(), 0U);
}

TEST_F(Download, tellsThatTheFileMayNotBeRead) {
    if (::geteuid() == 0)
        GTEST_SKIP() << "the superuser reads everything";
    givenWaitingDownload();
    fs::permissions(remoteFile("Big.txt"), fs::perms::none);
    tap(*button("Download to View"));
    ASSERT_TRUE(whileTimePasses([this] { return alert() != nullptr; }));
    EXPECT_THAT(alertText(), HasSubstr("Big.txt"));
    EXPECT_TRUE(isPromise("Big.txt"));
}

TEST_F(Download, saysThatTheNetworkIsGoneOnlyWhenItIs) {
    givenWaitingDownload();
    fs::rename(remote, remote + ".away");
    for (const auto& [network, state, text] :
         {std::tuple{"cellular", tavrin::networkCellular,
                     ": The folder “" + remote +
                         "” of your Pelmora account is not there. Connect its disk, or sign in "
                         "again if it has moved."},
          {"offline", tavrin::networkNotConnected,
           std::string(
               ": Unable to download file. You are no longer connected to the Internet.")}}) {
        givenNetwork(network);
        ASSERT_TRUE(untilNetwork(state));
        tap(*download()->downloadView()->cloudButton());
        ASSERT_TRUE(whileTimePasses([this] { return alert() != nullptr; }));
        EXPECT_EQ(alertText(), text);
        tap(*button("OK"));
        advance(1s);
        EXPECT_TRUE(showsIdle());
    }
    fs::rename(remote + ".away", remote);
    tap(*button("Download to View"));
    EXPECT_TRUE(whileTimePasses([this] { return showsFullPreview(); }));
}

TEST_F(Download, refusesMoreThanTheLimitOnCellular) {
    givenPromise("Over.txt", cellularLimit + 1);
    givenWaitingDownload(cellularLimit);
    tap(*button("Download to View"));
    EXPECT_TRUE(download()->downloadView()->downloading()) << "exactly the limit is allowed";
    tap(*button("Cancel Download"));
    downloadsEnd();
    back();
    preview("Over.txt");
    tap(*button("Download to View"));
    advance(1s);
    EXPECT_EQ(alertText(), "This item is over 100 MB.: “Over.txt” will not download until you "
                           "connect to Wi-Fi.");
    EXPECT_TRUE(showsIdle());
    tap(*button("OK"));
    advance(1s);
    givenNetwork("offline");
    ASSERT_TRUE(untilNetwork(tavrin::networkNotConnected));
    tap(*button("Download to View"));
    EXPECT_TRUE(download()->downloadView()->downloading()) << "the failure is the download's own";
    tap(*button("Cancel Download"));
    downloadsEnd();
    EXPECT_TRUE(isPromise("Over.txt"));
}

TEST_F(Download, ofAFileThatIsHereRebuildsThePreview) {
    start();
    givenFile("Here.txt");
    preview("Here.txt", tavrin::detailsMode);
    givenWholeLog();
    const auto before = details();
    manager().startDownload();
    downloadsEnd();
    EXPECT_TRUE(logged("7 Dispatching download -- although file is already local"));
    EXPECT_NE(details(), before);
    EXPECT_EQ(nav().viewControllers().size(), 3U);
    EXPECT_FALSE(networkIsBusy());
}

TEST_F(Download, showsBytesAndPieAsTheyCome) {
    givenRunningDownload();
    const DownloadView& view = *download()->downloadView();
    EXPECT_THAT(view.sizeLabel()->text(), HasSubstr(" of 1 MB"));
    EXPECT_TRUE(whileTimePasses([&] { return view.roundProgressView()->realProgress() > 0.5F; }));
    const RoundProgressView& pie = *view.roundProgressView();
    EXPECT_LE(pie.uiProgress(), pie.realProgress() + pie.increaseRate());
    EXPECT_GT(pie.uiProgress(), 0);
    EXPECT_TRUE(view.downloadButton()->isHidden());
    EXPECT_FALSE(view.cancelButton()->isHidden());
    EXPECT_TRUE(whileTimePasses([this] { return showsFullPreview(); }));
    const std::string file = path("Big.txt");
    EXPECT_EQ(fs::file_size(file), 1'000'000U);
}

TEST_F(Download, logsEachTwentiethOnceAndHearsOfEveryChange) {
    givenWaitingDownload();
    const auto progress = std::make_shared<Progress>(std::string(platform::fileProgressKind), 100);
    const auto published = platform->fileProgress().publish(url("Big.txt"), progress);
    download()->registerForProgress();
    download()->setDownloading(true);
    givenWholeLog();
    clearLog();
    for (int i = 0; i < 100; ++i)
        progress->update(i, 100);
    EXPECT_EQ(download()->lastProgressChunk(), 19);
    progress->update(100, 100);
    EXPECT_EQ(download()->lastProgressChunk(), 20);
    const std::vector<std::string> lines = logLines();
    const auto atLevel = [&](const std::string& start) {
        return std::ranges::count_if(lines,
                                     [&](const auto& line) { return line.starts_with(start); });
    };
    EXPECT_EQ(atLevel("6 Progress "), 21);
    EXPECT_EQ(atLevel("7 Progress "), 80);
    advance(20ms);
    EXPECT_EQ(download()->downloadView()->sizeLabel()->text(), "100 bytes of 100 bytes");
    download()->unregisterProgress();
    download()->unregisterProgress();
    clearLog();
    progress->update(50, 100);
    EXPECT_EQ(logLines(), std::vector<std::string>());
}

TEST_F(Download, takesAFloodOfReportsOnceAFrame) {
    givenWaitingDownload();
    const auto progress =
        std::make_shared<Progress>(std::string(platform::fileProgressKind), 10'000);
    const auto published = platform->fileProgress().publish(url("Big.txt"), progress);
    download()->registerForProgress();
    download()->setDownloading(true);
    const auto& shown = *download()->downloadView()->sizeLabel();
    for (int i = 1; i < 9'000; ++i)
        progress->update(i, 10'000);
    settle();
    EXPECT_EQ(shown.text(), "0 bytes of 1 KB");
    advance(17ms);
    EXPECT_EQ(shown.text(), "9 KB of 10 KB");
    progress->update(9'500, 10'000);
    advance(16ms);
    EXPECT_EQ(shown.text(), "9 KB of 10 KB") << "it waits for the next step of the pie";
    advance(34ms);
    EXPECT_EQ(shown.text(), "10 KB of 10 KB");
}

/// The widgets alone, on the screen of nobody's store.
struct Widget : PreviewTest {
    void SetUp() override {
        launch();
        view = std::make_shared<DownloadView>();
        nav().view()->addSubview(view);
    }
    std::shared_ptr<VXItem> item(std::optional<std::uint64_t> size) const {
        auto made = std::make_shared<VXItem>(platform::Url::file(home / "A.txt"));
        made->setFileSize(size);
        made->setFriendlyFileSize(size ? VXItem::Text("big") : std::nullopt);
        return made;
    }
    std::shared_ptr<DownloadView> view;
};

TEST_F(Widget, saysWhatIsThereAndWhatIsStillUnknown) {
    EXPECT_EQ(view->downloadButton()->title(), "Download to View");
    EXPECT_EQ(view->zeroProgressMsg(), "Loading…");
    view->setItem(item(2'500'000));
    EXPECT_EQ(view->sizeLabel()->text(), "big");
    view->setDownloading(true);
    EXPECT_EQ(view->sizeLabel()->text(), DownloadView::progressMsgWithBytesCompleted(0, 2'500'000));
    EXPECT_THAT(view->sizeLabel()->text(), HasSubstr(" of 2.5 MB"));
    view->setItem(item(std::nullopt));
    EXPECT_FALSE(view->downloading()) << "another item is idle";
    EXPECT_EQ(view->sizeLabel()->text(), "");
    view->setDownloading(true);
    EXPECT_EQ(view->sizeLabel()->text(), "Loading…");
    view->setItem(std::make_shared<VXItem>(platform::Url::file(home / "A.unheardof")));
    EXPECT_EQ(view->downloadButton()->title(), "Download");
}

TEST_F(Widget, ignoresReportsThatSayNothing) {
    view->setItem(item(1000));
    Progress progress(std::string(platform::fileProgressKind));
    progress.update(500, 1000);
    view->updateProgress(progress);
    EXPECT_TRUE(logged("4 Received progress when not downloading"));
    EXPECT_EQ(view->sizeLabel()->text(), "big");
    view->setDownloading(true);
    const std::string before = view->sizeLabel()->text();
    for (const std::int64_t total : {0, -1}) {
        progress.update(500, total);
        view->updateProgress(progress);
        EXPECT_EQ(view->sizeLabel()->text(), before);
        EXPECT_FALSE(view->roundProgressView()->isAnimating());
    }
}

struct Pie : Widget {
    void SetUp() override {
        Widget::SetUp();
        pie = std::make_shared<RoundProgressView>(platform::Rect{0, 0, 32, 32}, 1);
        nav().view()->addSubview(pie);
    }
    void step(int count = 1) {
        for (int i = 0; i < count; ++i)
            advance(frame);
    }
    static constexpr platform::Duration frame{16'666'667};
    std::shared_ptr<RoundProgressView> pie;
};

TEST_F(Pie, creepsToAQuarterBeforeAnythingIsReal) {
    pie->setProgress(0);
    EXPECT_TRUE(pie->isAnimating());
    for (int i = 1; i <= 149; ++i) {
        step();
        ASSERT_NEAR(pie->uiProgress(), i / 600.0, 1e-4) << i;
    }
    step(10);
    EXPECT_NEAR(pie->uiProgress(), 0.25, 0.002);
    EXPECT_FALSE(pie->isAnimating());
    pie->setProgress(0.5F);
    EXPECT_TRUE(pie->isAnimating()) << "a real value sets it going again";
    pie->resetProgress();
    EXPECT_EQ(pie->uiProgress(), 0);
    EXPECT_FALSE(pie->isAnimating());
}

TEST_F(Pie, fillsInATenthOfASecondWhenAllIsThere) {
    pie->setProgress(1);
    EXPECT_NEAR(pie->increaseRate(), 1 / 6.0, 1e-6);
    step(5);
    EXPECT_NEAR(pie->uiProgress(), 5 / 6.0, 1e-5);
    EXPECT_TRUE(pie->isAnimating());
    step(2);
    EXPECT_EQ(pie->uiProgress(), 1);
    EXPECT_FALSE(pie->isAnimating());
    pie->setProgress(1);
    EXPECT_FALSE(pie->isAnimating());
}

TEST_F(Pie, growsAtTheSpeedOfTheRealAndNeverFarPastIt) {
    advance(100ms);
    pie->setProgress(0.5F); // the rest at this speed: 0.1 s x 1 / 0.5
    EXPECT_NEAR(pie->increaseRate(), 1 / 0.2 / 60, 1e-5);
    for (int i = 1; i <= 6; ++i) {
        step();
        ASSERT_NEAR(pie->uiProgress(), i / 12.0, 1e-5);
    }
    step(60);
    EXPECT_NEAR(pie->uiProgress(), 0.5, 1.0 / 12) << "it waits for the real value";
    EXPECT_TRUE(pie->isAnimating());
    pie->setProgress(0.3F);
    EXPECT_EQ(pie->realProgress(), 0.5F) << "a value that goes down moves nothing";
    EXPECT_EQ(pie->progress(), 0.3F);
    const float shown = pie->uiProgress();
    pie->setProgress(0.6F); // after a second and more: no slower than in 0.3 s
    EXPECT_NEAR(pie->increaseRate(), (1 - shown) / 0.3 / 60, 1e-5);
}

TEST_F(Pie, stopsShortOfAnEndThatHasNotCome) {
    pie->setProgress(0.01F);
    advance(10ms);
    pie->setProgress(0.999F);
    step(100);
    EXPECT_LT(pie->uiProgress(), 1);
    EXPECT_FALSE(pie->isAnimating());
    pie->setProgress(1);
    step(20);
    EXPECT_EQ(pie->uiProgress(), 1);
}

TEST_F(Pie, takesItsInitialRateOnlyAtRestAndKeepsItsShape) {
    pie->setInitialIncreaseRatePerFrame(0.1F);
    pie->setProgress(0);
    pie->setInitialIncreaseRatePerFrame(0.2F);
    step();
    EXPECT_NEAR(pie->uiProgress(), 0.1, 1e-6);
    EXPECT_EQ(pie->pieRadius(), 16);
    EXPECT_EQ(pie->circleLayer()->lineWidth(), 2);
    const RoundProgressView large({10, 10, 60, 40});
    EXPECT_EQ(large.pieRadius(), 18);
    EXPECT_EQ(large.circleLayer()->lineWidth(), 4);
    EXPECT_EQ(large.frame(), (platform::Rect{12, 2, 36, 36}));
}

struct Screen : PreviewTest {
    double constant(const platform::LayoutConstraint::Pointer& edge) const {
        return edge->constant();
    }
};

TEST_F(Screen, keepsItsMarginsInEveryWindow) {
    givenPromise("Away.txt", 10'000'000);
    start();
    const struct {
        platform::Size size;
        double side;
        double vertical;
    } rows[] = {{{390, 844}, 17, 45}, {{390, 700}, 17, 17}, {{844, 390}, 17, 17}};
    for (const auto& row : rows) {
        SCOPED_TRACE(row.size.height);
        window().resize(row.size);
        preview("Away.txt");
        const auto screen = download();
        EXPECT_EQ(constant(screen->parentLeadingConstraint()), row.side);
        EXPECT_EQ(constant(screen->parentTrailingConstraint()), -row.side);
        EXPECT_EQ(constant(screen->parentTopConstraint()),
                  20 + row.vertical + nav().navigationBarFrame().height);
        EXPECT_EQ(constant(screen->parentBottomConstraint()),
                  -(row.vertical + nav().toolbarFrame().height));
        back();
    }
}

TEST_F(Screen, turnsWithTheWindow) {
    givenPromise("Away.txt", 10'000'000);
    start(tablet);
    preview("Away.txt");
    EXPECT_TRUE(nav().isToolbarHidden());
    EXPECT_EQ(constant(download()->parentBottomConstraint()), -45);
    const auto thumbnail = download()->thumbnailView();
    const auto widget = download()->downloadView();
    EXPECT_NEAR(thumbnail->bounds().width, widget->bounds().width, 1);
    EXPECT_LT(thumbnail->frame().x, widget->frame().x);
    window().resize({768, 1024});
    advance(1s);
    EXPECT_LT(thumbnail->frame().maxY(), widget->frame().y);
    EXPECT_GT(thumbnail->bounds().height, widget->bounds().height);
    EXPECT_EQ(constant(download()->parentLeadingConstraint()), 45);
}

TEST_F(Screen, offersButtonsOnlyForWhatIsThere) {
    givenPromise("Away.txt", 10'000'000);
    start();
    preview("Away.txt");
    const auto screen = download();
    EXPECT_EQ(screen->toolbarItems().size(), 5U);
    EXPECT_FALSE(nav().isToolbarHidden());
    for (const bool there : {false, true}) {
        manager().setItem(
            std::make_shared<VXItem>(there ? std::optional(url("Away.txt")) : std::nullopt), false);
        screen->refreshItem();
        for (const auto& item : {screen->barButtonActionItem(), screen->barButtonDeleteItem(),
                                 screen->barButtonMoveItem()})
            EXPECT_EQ(item->isEnabled(), there);
    }
}

} // namespace
} // namespace test
