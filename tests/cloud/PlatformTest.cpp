#include "platform/Platform.h"

#include "platform/base/ManualClock.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/Tokens.h"
#include "platform/files/FileCoordinator.h"
#include "platform/system/PreferencesStore.h"
#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

using namespace platform;

namespace {

TEST(Platform, PutsOneSetOfServicesOnAFolderOfItsOwn) {
    test::TemporaryFolder home;
    home.write("remote/Letters/a.txt", "a");
    const Folders folders{home.path(),    home / "config", home / "data",
                          home / "state", home / "cache",  home / "run"};
    ASSERT_EQ(writeAccount(folders, {"folder", home / "remote", "Nora", randomBytes(16), {}, {}}),
              std::nullopt);
    EXPECT_FALSE(Platform::installed());
    {
        PlatformParts parts;
        parts.clock = std::make_unique<ManualClock>();
        parts.folders = folders;
        parts.markerExists = [](const std::string& path) { return path == "/marker"; };
        Platform platform(std::move(parts));
        EXPECT_EQ(&Platform::current(), &platform);
        EXPECT_EQ(&Runtime::current(), &platform.runtime());
        EXPECT_EQ(platform.accounts().account()->name, "Nora");
        EXPECT_TRUE(platform.documents().shelfroot()->isInside(Url::file(home / "data")));
        EXPECT_TRUE(FileCoordinator::contentProvider());
        platform.standardPreferences().setValue("key", 7);
        EXPECT_EQ(platform.standardPreferences().integer("key"), 7);
        EXPECT_TRUE(platform.markerExists("/marker"));
        EXPECT_EQ(platform.dataContainerURL("com.example.a"),
                  Url::file(home / "data/com.example.a"));
        EXPECT_FALSE(platform.dataContainerURL("../b"));
    }
    EXPECT_FALSE(Platform::installed());
    EXPECT_FALSE(Runtime::installed());
    EXPECT_FALSE(FileCoordinator::contentProvider());
}

} // namespace
