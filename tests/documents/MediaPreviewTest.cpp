#include "platform/documents/preview/MediaProcess.h"
#include "platform/documents/preview/MediaWidget.h"
#include "tests/documents/PreviewFixture.h"
#include "tests/documents/SampleDocuments.h"

#include <QtTest/QTest>

#include <gmock/gmock.h>

#include <cerrno>
#include <fcntl.h>
#include <filesystem>
#include <sys/wait.h>

using namespace platform;
using namespace std::chrono_literals;
using ::testing::HasSubstr;
namespace fs = std::filesystem;

namespace {

struct MediaPreview : test::Preview {
    MediaWidget& media() const { return *find<MediaWidget>(); }
    bool givenShown(const std::string& name, const std::string& content) {
        house.givenFile(name, content);
        show(name);
        return untilShown();
    }
    void press(Qt::Key key) { QTest::keyClick(&media(), key); }
    bool untilPlaying(bool playing) {
        return house.until([&] { return media().isPlaying() == playing; });
    }
    std::string times() const { return media().timeText().toStdString(); }
};

TEST_F(MediaPreview, knowsWhatCanBePlayed) {
    const auto canShow = [&](const char* name) {
        return PlatformPreviewController::canPreview(house.url(name));
    };
    for (const char* const name :
         {"a.mp3", "a.m4a", "a.flac", "a.ogg", "a.oga", "a.opus", "a.wav", "a.aiff", "a.mp4",
          "a.m4v", "a.webm", "a.mkv", "a.mov", "a.avi", "a.ogv", "a.mpg"})
        EXPECT_TRUE(canShow(name)) << name;
    EXPECT_FALSE(canShow("a.mid"));
}

TEST_F(MediaPreview, playsNothingUntilItIsAskedTo) {
    ASSERT_TRUE(givenShown("Tune.wav", test::soundOf(20)));
    EXPECT_EQ(times(), "0:00 / 0:20");
    EXPECT_FALSE(media().isPlaying());
    press(Qt::Key_Space);
    EXPECT_TRUE(untilPlaying(true));
    EXPECT_TRUE(house.until([&] { return media().position() > 0; }));
    QTest::mouseClick(&media().playButton(), Qt::LeftButton);
    EXPECT_TRUE(untilPlaying(false));
}

TEST_F(MediaPreview, goesToAnyPlaceByKeyAndByFinger) {
    ASSERT_TRUE(givenShown("Tune.wav", test::soundOf(20)));
    press(Qt::Key_Right);
    EXPECT_EQ(times(), "0:05 / 0:20");
    press(Qt::Key_Left);
    press(Qt::Key_Left);
    EXPECT_EQ(times(), "0:00 / 0:20");
    LineSlider& line = media().timeLine();
    QTest::mouseClick(&line, Qt::LeftButton, {}, line.rect().center());
    EXPECT_NEAR(static_cast<double>(media().position()), 10'000, 200);
    house.givenFile("Tune.wav", test::soundOf(30));
    screen->refreshCurrentPreviewItem();
    ASSERT_TRUE(untilShown(2));
    EXPECT_THAT(times(), HasSubstr("/ 0:30"));
    EXPECT_TRUE(house.until([&] { return media().position() > 9'000; })) << "where it was";
}

TEST_F(MediaPreview, showsThePicturesOfAFilm) {
    ASSERT_TRUE(givenShown("Clip.avi", test::filmOf(64, 48, 20)));
    ASSERT_TRUE(house.until([&] { return media().hasPicture(); }));
    const auto seen = [&] { return colorAt(media(), 0.5, 0.2); };
    EXPECT_GT(seen().green(), 80) << "between the bands there is the film";
    EXPECT_LT(seen().red(), 60);
    EXPECT_TRUE(media().remark().isEmpty()) << "nothing to hear";
    QTest::mouseClick(&media(), Qt::LeftButton, {}, QPoint(100, 100));
    EXPECT_TRUE(untilPlaying(true));
    EXPECT_TRUE(untilPlaying(false)) << "at its end";
    press(Qt::Key_Space);
    EXPECT_TRUE(untilPlaying(true)) << "again";
}

TEST_F(MediaPreview, isSilentUnderAnotherScreenAndGoneWithItsOwn) {
    ASSERT_TRUE(givenShown("Tune.wav", test::soundOf(20)));
    MediaWidget& widget = media();
    press(Qt::Key_Space);
    ASSERT_TRUE(untilPlaying(true));
    house.navigation->pushViewController(std::make_shared<ViewController>(), false);
    EXPECT_TRUE(house.until([&] { return !widget.isPlaying(); }));
    house.show({});
    screen.reset();
    house.navigation.reset();
    house.window.reset();
    house.application.reset(); // waits for what is left
    EXPECT_EQ(::waitpid(-1, nullptr, WNOHANG), -1);
    EXPECT_EQ(errno, ECHILD);
}

TEST_F(MediaPreview, saysThatAFileCannotBePlayed) {
    const std::string sound = test::soundOf(2);
    house.givenFile("Garbage.mp3", "no sound at all");
    house.givenFile("Noise.mp4", test::longText(300));
    house.givenFile("Head.wav", sound.substr(0, 40));
    for (const char* const name : {"Garbage.mp3", "Noise.mp4", "Head.wav"}) {
        show(name);
        EXPECT_TRUE(untilPage(std::string(name) + "” cannot be played")) << name;
    }
    EXPECT_TRUE(screen->seen.empty());
}

TEST_F(MediaPreview, maybeLeftWhileItIsMadeReady) {
    house.givenFile("Tune.wav", test::soundOf(20));
    for (int i = 0; i < 4; ++i) {
        show("Tune.wav");
        if (i % 2)
            house.waitBriefly();
        house.show({});
    }
}

/// A script in place of the player.
struct Players : ::testing::Test {
    test::ScreenHouse house;
    bool gone = false;
    std::vector<std::string> heard;
    std::vector<QSize> drawn;

    void runPlayer(const std::string& script) {
        house.withoutAccount();
        house.openWindow();
        const std::string path = house.home.write("player", "#!/bin/sh\n" + script);
        fs::permissions(path, fs::perms::owner_all);
        const FileDescriptor file(::open("/dev/null", O_RDONLY));
        const auto child = startPlayer(path, file.get());
        ASSERT_TRUE(child);
        MediaProcess process(
            child,
            {[this](MediaEvent, std::int64_t, const std::string& text) { heard.push_back(text); },
             [this](MediaEvent, const QImage& image) { drawn.push_back(image.size()); },
             [this] { gone = true; }});
        EXPECT_TRUE(house.until([this] { return gone; }));
    }
};

TEST_F(Players, areHeardInPiecesAndMissedWhenTheyGo) {
    // A title of three letters, then a picture of 2 by 1.
    runPlayer(R"(printf '\006\0\0\0\003\0\0\0\0\0\0\0\0\0'
printf '\0\0abc\010\0\0\0\010\0\0\0\001\0\0\0\002\0\0\0'
printf '12345678')");
    EXPECT_EQ(heard, std::vector<std::string>{"abc"});
    EXPECT_EQ(drawn, std::vector<QSize>{QSize(2, 1)});
}

TEST_F(Players, thatTalkNonsenseAreGivenUp) {
    runPlayer("while :; do echo gibberish gibberish; done");
    EXPECT_TRUE(heard.empty());
}

TEST_F(Players, thatAreNotThereAreNone) {
    EXPECT_FALSE(startPlayer("/no/such/player", 0));
}

} // namespace
