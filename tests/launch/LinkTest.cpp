#include "platform/documents/preview/ZoomWidget.h"
#include "tests/documents/OneDocument.h"
#include "tests/launch/Desk.h"

#include <QApplication>
#include <QImage>
#include <QtTest/QTest>

#include <gmock/gmock.h>

namespace test {
namespace {

using namespace platform;

/// A preview of a text whose first words are a link.
class Link : public Desk {
protected:
    void given(const std::string& address) {
        open();
        const std::string path = house.givenFile("Links.md", "[there](" + address + ") one goes");
        const auto screen = std::make_shared<OneDocument>(Url::file(path));
        house.show({screen});
        ASSERT_TRUE(house.until([&] { return screen->shown && page(); }));
    }
    static ZoomWidget* page() {
        for (QWidget* const each : QApplication::allWidgets())
            if (auto* const found = dynamic_cast<ZoomWidget*>(each); found && found->isVisible())
                return found;
        return nullptr;
    }
    static void touch() { QTest::mouseClick(page(), Qt::LeftButton, {}, {30, 32}); }
};

TEST_F(Link, GoesToTheBrowserOfTheDesk) {
    givenProgram("browser");
    givenApplication("browser", "Browser",
                     "Exec=browser --new %u\nMimeType=x-scheme-handler/https;");
    given("https://a.org/x%2Fy?z=%20&a#end");
    touch();
    EXPECT_EQ(argumentsOf("browser"),
              (std::vector<std::string>{"--new", "https://a.org/x%2Fy?z=%20&a#end"}));
    EXPECT_EQ(topPresented(), nullptr);
}

TEST_F(Link, WithoutABrowserSaysSo) {
    given("https://a.org");
    touch();
    ASSERT_TRUE(house.until([&] { return topPresented() != nullptr; }));
    EXPECT_THAT(topPresented()->title(), testing::HasSubstr("https://a.org"));
}

} // namespace
} // namespace test
