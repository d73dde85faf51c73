#include "platform/launch/ApplicationDatabase.h"
#include "tests/launch/Desk.h"

#include <gmock/gmock.h>

#include <filesystem>

namespace test {
namespace {

using namespace platform;
using testing::ElementsAre;
using testing::IsEmpty;

const std::string takesText = "Exec=true %f\nMimeType=text/plain;";

class Applications : public Desk {
protected:
    Applications() { house.withoutAccount(); }

    static std::string defaultFor(const std::string& type) {
        const auto entry = ApplicationDatabase::shared().defaultFor(type);
        return entry ? entry->id : "";
    }
    static std::vector<std::string> offeredFor(const std::string& type) {
        std::vector<std::string> ids;
        for (const auto& entry : ApplicationDatabase::shared().applicationsFor(type))
            ids.push_back(entry->id);
        return ids;
    }
};

TEST_F(Applications, TheUsersChoiceStandsAboveAllOthers) {
    for (const char* id : {"a", "b", "c", "d"})
        givenApplication(id, id, takesText, "system");
    EXPECT_EQ(defaultFor("text/plain"), "a");
    const std::string lists[] = {
        "system/applications/mimeapps.list", "system/applications/calm-mimeapps.list",
        "data/applications/mimeapps.list",   "etc/mimeapps.list",
        "etc/quiet-mimeapps.list",           "config/mimeapps.list",
        "config/calm-mimeapps.list",         "config/quiet-mimeapps.list"};
    int turn = 0;
    for (const std::string& list : lists) {
        const std::string chosen = ++turn % 2 == 0 ? "c" : "b";
        givenList(list,
                  "[Default Applications]\ntext/plain=gone.desktop;" + chosen + ".desktop;\n");
        EXPECT_EQ(defaultFor("text/plain"), chosen) << list;
    }
    givenList("config/quiet-mimeapps.list", "[Default Applications]\ntext/plain=other.desktop\n");
    EXPECT_EQ(defaultFor("text/plain"), "b") << "who is not there cannot be the default";
}

TEST_F(Applications, ListsAddAndRemoveTypes) {
    givenApplication("editor", "Editor", takesText, "system");
    givenApplication("notes", "Notes", takesText, "system");
    givenApplication("own", "Own", takesText);
    givenApplication("shell", "Shell", "Exec=true %f");
    givenList("config/mimeapps.list", "[Added Associations]\ntext/plain=shell.desktop;\n"
                                      "[Removed Associations]\ntext/plain=notes.desktop;\n");
    givenList("config/quiet-mimeapps.list",
              "[Removed Associations]\ntext/plain=editor.desktop;\n"); // may only choose
    givenList("system/applications/mimeapps.list",
              "[Removed Associations]\ntext/plain=own.desktop;\n"); // not of its folder
    EXPECT_THAT(offeredFor("text/plain"), ElementsAre("shell", "own", "editor"));
    givenList("config/mimeapps.list", "[Default Applications]\ntext/plain=notes.desktop;\n"
                                      "[Removed Associations]\ntext/plain=notes.desktop;\n");
    EXPECT_EQ(defaultFor("text/plain"), "own") << "a removed one cannot be the default";
}

TEST_F(Applications, AnEntryHidesThoseOfItsNameThatComeLater) {
    givenApplication("editor", "Ours", "Exec=true %f\nMimeType=text/html;");
    givenApplication("editor", "Theirs", takesText, "system");
    givenApplication("removed", "", "Hidden=true");
    givenApplication("removed", "Theirs", takesText, "system");
    givenApplication("vendor/viewer", "Viewer", takesText, "system");
    EXPECT_THAT(offeredFor("text/plain"), ElementsAre("vendor-viewer"));
    EXPECT_EQ(defaultFor("text/html"), "editor");
}

TEST_F(Applications, OnlyWhatCanRunAndIsMeantForThisDesktopIsOffered) {
    givenApplication("elsewhere", "E", takesText + "\nOnlyShowIn=Loud;");
    givenApplication("not-here", "N", takesText + "\nNotShowIn=Calm;");
    givenApplication("missing", "M", takesText + "\nTryExec=/nowhere/at-all");
    givenApplication("gone", "G", "Exec=/nowhere/gone %f\nMimeType=text/plain;");
    givenApplication("nothing", "N", "MimeType=text/plain;");
    givenApplication("broken", "B", "Exec=true %y\nMimeType=text/plain;");
    givenApplication("link", "L", "Type=Link\n" + takesText);
    givenApplication("silent", "S", takesText + "\nNoDisplay=true");
    givenApplication("works", "W", takesText + "\nOnlyShowIn=Calm;\nTryExec=sh");
    EXPECT_THAT(offeredFor("text/plain"), ElementsAre("silent", "works"))
        << "the silent one, as the default";
    givenList("config/mimeapps.list", "[Default Applications]\ntext/plain=works.desktop\n");
    EXPECT_THAT(offeredFor("text/plain"), ElementsAre("works"));
}

TEST_F(Applications, ATerminalIsNeededForThoseThatWantOne) {
    set("PATH", house.home / "bin");
    givenProgram("true");
    givenApplication("vi", "Vi", takesText + "\nTerminal=true");
    EXPECT_EQ(defaultFor("text/plain"), "");
    givenProgram("x-terminal-emulator");
    EXPECT_EQ(defaultFor("text/plain"), "vi");
}

TEST_F(Applications, AKindOfATypeIsForWhoTakesTheType) {
    givenApplication("editor", "Editor", takesText);
    givenApplication("archiver", "Archiver", "Exec=true %f\nMimeType=application/zip;");
    givenApplication("pictures", "Pictures", "Exec=true %f\nMimeType=image/pjpeg;");
    givenApplication("any", "Any", "Exec=true %f\nMimeType=application/octet-stream;");
    EXPECT_EQ(defaultFor("text/x-csrc"), "editor");
    EXPECT_EQ(defaultFor("image/jpeg"), "pictures") << "by another name of the type";
    EXPECT_EQ(defaultFor("application/vnd.oasis.opendocument.text"), "") << "packed, no archive";
    EXPECT_EQ(defaultFor("application/java-archive"), "archiver");
    EXPECT_EQ(defaultFor("image/png"), "") << "who takes anything was not asked for";
    EXPECT_EQ(defaultFor("application/octet-stream"), "any");
}

TEST_F(Applications, ThisProgramIsTheDefaultOnlyByChoice) {
    const std::string own = "com.pelmora.Tavrin";
    givenApplication(own, "Tavrin", takesText);
    EXPECT_EQ(defaultFor("text/plain"), own) << "nobody else takes it";
    EXPECT_THAT(offeredFor("text/plain"), IsEmpty());
    givenApplication("x", "X", takesText);
    EXPECT_EQ(defaultFor("text/plain"), "x");
    givenList("config/mimeapps.list", "[Default Applications]\ntext/plain=" + own + ".desktop;\n");
    EXPECT_EQ(defaultFor("text/plain"), own);
    EXPECT_THAT(offeredFor("text/plain"), ElementsAre("x"));
}

TEST_F(Applications, WhatIsInstalledOrRemovedMeanwhileCounts) {
    givenApplication("a", "A", takesText, "system");
    EXPECT_EQ(defaultFor("text/plain"), "a");
    givenApplication("a", "A", "Exec=true %f\nMimeType=text/html;", "system");
    EXPECT_EQ(defaultFor("text/plain"), "");
    givenApplication("sub/b", "B", takesText);
    EXPECT_EQ(defaultFor("text/plain"), "sub-b");
    std::filesystem::remove_all(house.home / "data/applications");
    EXPECT_EQ(defaultFor("text/plain"), "");
}

TEST_F(Applications, ARecordSaysWhatTheEntrySays) {
    set("LC_ALL", "de_AT.UTF-8");
    const std::string program = givenProgram("my viewer");
    givenApplication("org.example.Viewer", "Viewer",
                     "Name[de]=Betrachter\nExec=\"" + program + "\" %U\nMimeType=text/plain;");
    givenApplication("batch", "Batch", "Exec=true\nMimeType=text/html;");
    const ApplicationRecord record =
        recordOf(*ApplicationDatabase::shared().defaultFor("text/plain"));
    EXPECT_EQ(record.itemName, "Viewer");
    EXPECT_EQ(record.localizedName, "Betrachter");
    EXPECT_EQ(record.bundleIdentifier, "org.example.Viewer");
    EXPECT_EQ(record.bundleExecutable, program);
    EXPECT_EQ(record.bundleContainerURL, Url::file(house.home / "data/applications"));
    EXPECT_TRUE(record.supportsOpenInPlace);
    EXPECT_FALSE(
        recordOf(*ApplicationDatabase::shared().defaultFor("text/html")).supportsOpenInPlace);
}

} // namespace
} // namespace test
