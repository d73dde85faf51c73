#include "platform/launch/DesktopEntry.h"
#include "platform/launch/KeyFile.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using namespace platform;
using testing::ElementsAre;

using Arguments = std::vector<std::string>;

const Url letter = Url::file("/home/anna/A letter; $(rm) \"100%\".txt");

/// What the application of that Exec line, as a desktop file has it, is started with.
std::optional<Arguments> started(const std::string& exec,
                                 const std::optional<Url>& document = letter) {
    const auto entry = DesktopEntry::parse("viewer", "/apps/viewer.desktop",
                                           "[Desktop Entry]\nType=Application\nName=Viewer\n"
                                           "Name[de]=Betrachter\nIcon=eye\nExec=" +
                                               exec,
                                           {"de"});
    if (!entry || !entry->exec)
        return std::nullopt;
    return entry->exec->arguments(*entry, document);
}

TEST(ExecLine, ADocumentIsOneArgumentWhateverItsName) {
    for (const char* line : {"viewer %f", "viewer %F", "  viewer\t%f "})
        EXPECT_EQ(started(line), (Arguments{"viewer", letter.path()})) << line;
    for (const char* line : {"viewer %u", "viewer %U"})
        EXPECT_EQ(started(line), (Arguments{"viewer", letter.absoluteString()})) << line;
    EXPECT_EQ(started("viewer --file=%f --new"),
              (Arguments{"viewer", "--file=" + letter.path(), "--new"}));
    EXPECT_EQ(started("viewer"), (Arguments{"viewer", letter.path()}))
        << "where the line has no place for it, it comes last";
    EXPECT_EQ(started("viewer %F", std::nullopt), Arguments{"viewer"});
}

TEST(ExecLine, QuotesAreTheEntrysOwn) {
    // A desktop file doubles its backslashes: once for the value, once for the quotation.
    EXPECT_EQ(started(R"("/opt/My Viewer/run" "a \\"b\\" \\$HOME \\\\" %f)"),
              (Arguments{"/opt/My Viewer/run", R"(a "b" $HOME \)", letter.path()}));
    EXPECT_EQ(started(R"(sh -c 'echo "$1"' sh %f)"),
              (Arguments{"sh", "-c", "echo \"$1\"", "sh", letter.path()}));
    EXPECT_EQ(started(R"(viewer "" x""y)", std::nullopt), (Arguments{"viewer", "", "xy"}));
}

TEST(ExecLine, TheOtherFieldsSayWhatTheEntrySays) {
    EXPECT_EQ(started("viewer %i -t %c -k %k 50%% %d%m", std::nullopt),
              (Arguments{"viewer", "--icon", "eye", "-t", "Betrachter", "-k",
                         "/apps/viewer.desktop", "50%"}));
}

TEST(ExecLine, WhatNobodyUnderstandsIsNotRun) {
    for (const char* line : {"", "viewer \"half", "viewer 'half", "viewer %z", "viewer %"})
        EXPECT_EQ(started(line), std::nullopt) << line;
}

TEST(KeyFile, NamesComeInTheNearestOfTheUsersLanguages) {
    EXPECT_THAT(localeNames("sr_RS.UTF-8@latin"),
                ElementsAre("sr_RS@latin", "sr_RS", "sr@latin", "sr"));
    EXPECT_THAT(localeNames("de"), ElementsAre("de"));
    EXPECT_THAT(localeNames("C.UTF-8"), ElementsAre());
    const KeyFile file = KeyFile::parse("noise\n[A]\r\n# Name=no\nName = A\\sB\\n \nName[de]=X\n"
                                        "Name[de_AT]=Y\nList=a\\;b;;c;\nHalf\n[A\nName=no\n");
    const KeyFile::Group& group = *file.group("A");
    EXPECT_EQ(KeyFile::text(group, "Name"), "A B\n");
    EXPECT_EQ(KeyFile::localizedText(group, "Name", localeNames("de_AT")), "Y");
    EXPECT_EQ(KeyFile::localizedText(group, "Name", localeNames("de_CH")), "X");
    EXPECT_EQ(KeyFile::localizedText(group, "Name", localeNames("fr")), "A B\n");
    EXPECT_THAT(KeyFile::list(group, "List"), ElementsAre("a;b", "c"));
}

} // namespace
