#include "tests/cloud/ServiceFixture.h"

#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/Sidecar.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"

#include <array>
#include <future>
#include <unistd.h>

using namespace platform;

namespace {

constexpr std::array allKeys{ResourceKey::name,
                             ResourceKey::localizedName,
                             ResourceKey::typeIdentifier,
                             ResourceKey::fileSize,
                             ResourceKey::contentModificationDate,
                             ResourceKey::isDirectory,
                             ResourceKey::isPackage,
                             ResourceKey::hasHiddenExtension,
                             ResourceKey::isShared,
                             ResourceKey::sharedItemRole,
                             ResourceKey::downloadingStatus,
                             ResourceKey::parentDirectoryUrl};

struct Documents : test::ServiceFixture {
    CancelFlag cancel;

    const CloudDocumentService& documents() { return cloud->documents(); }
    ResourceValues attributes(const std::string& path) {
        const auto values = documents().promisedItemAttributes(url(path), allKeys);
        EXPECT_TRUE(values) << path;
        return values ? *values : ResourceValues();
    }
    void givenLocal(const std::string& path, const std::string& content = "local") {
        const Url file = url(path);
        ASSERT_EQ(FileManager::createDirectory(*file.deletingLastPathComponent(), true),
                  std::nullopt);
        ASSERT_EQ(FileManager::writeAtomically(file, content), std::nullopt);
    }
    void givenLink(const std::string& path, const std::string& target) {
        ASSERT_EQ(symlink(target.c_str(), url(path).path().c_str()), 0);
    }
    std::string containerOf(const std::string& path) {
        const auto container = documents().containerForItemAtURL(url(path));
        return container ? (*container)->identifier() : "none";
    }
};

TEST_F(Documents, APromiseHasTheRemotesAttributesAndAFileItsOwn) {
    const std::string file = givenRemote("Letters/Offer.pdf", "seven b");
    ASSERT_EQ(setExtendedAttribute(Url::file(file), "user.pelmora.shared", "participant"),
              std::nullopt);
    ASSERT_EQ(setExtendedAttribute(Url::file(file), "user.xdg.tags", "Red, Work ,"), std::nullopt);
    givenStore();
    for (const bool local : {false, true}) {
        if (local) {
            ASSERT_EQ(cloud->contents().makeLocal(url("Letters/Offer.pdf"), cancel), std::nullopt);
        }
        const ResourceValues values = attributes("Letters/Offer.pdf");
        EXPECT_EQ(*values[ResourceKey::name].text(), "Offer.pdf");
        EXPECT_EQ(values[ResourceKey::fileSize].integer(), 7);
        EXPECT_EQ(*values[ResourceKey::typeIdentifier].text(), "public.pdf");
        EXPECT_EQ(values[ResourceKey::isShared].boolean(), true);
        EXPECT_EQ(*values[ResourceKey::sharedItemRole].text(), sharedRoleParticipant);
        EXPECT_EQ(*values[ResourceKey::downloadingStatus].text(),
                  local ? downloadingStatusCurrent : downloadingStatusNotDownloaded);
        EXPECT_EQ(*values[ResourceKey::parentDirectoryUrl].url(), url("Letters"));
        EXPECT_EQ(documents().tags(url("Letters/Offer.pdf")),
                  (std::vector<std::string>{"Red", "Work"}));
        EXPECT_EQ(documents().isPromised(url("Letters/Offer.pdf")), !local);
    }
    EXPECT_FALSE(documents().promisedItemAttributes(Url::file("/etc/passwd"), allKeys));
    EXPECT_TRUE(documents().plainAttributes(Url::file("/etc/passwd"), allKeys));
}

TEST_F(Documents, TellsWherePromisesLieAndWhatTheyPromise) {
    givenRemote("Letters/a.txt", "a");
    givenStore();
    const Url logical = url("Letters/a.txt");
    const Url physical = url("Letters/.a.txt.promise");
    EXPECT_EQ(documents().physicalURL(logical), physical);
    EXPECT_TRUE(documents().isPromiseAtURL(physical));
    EXPECT_FALSE(documents().isPromiseAtURL(logical));
    EXPECT_EQ(documents().logicalURLOfPromise(physical), logical);
    // A file that only looks like a promise is the user's own.
    givenLocal("Letters/.b.txt.promise", "1 0123456789abcdef 7");
    EXPECT_FALSE(documents().isPromiseAtURL(url("Letters/.b.txt.promise")));
    EXPECT_FALSE(documents().physicalURL(url("Letters/b.txt")));
    // Content and promise side by side, as a crash leaves them: the content counts.
    givenLocal("Letters/a.txt", "content");
    EXPECT_FALSE(documents().isPromised(logical));
    EXPECT_EQ(documents().physicalURL(logical), logical);
    EXPECT_EQ(*attributes("Letters/a.txt")[ResourceKey::downloadingStatus].text(),
              downloadingStatusCurrent);
}

TEST_F(Documents, FindsTheContainerOfAnItemAndItsRules) {
    givenRemote("Music/.container.json",
                R"({"identifier": "com.example.music", "names": {"": "Tunes"},
                    "documents": "Documents", "folderLevels": "one",
                    "documentTypes": [{"contentTypes": ["public.audio", 7]},
                                      {"contentTypes": "public.audio"}]})");
    givenRemote("Music/Documents/a.wav", "a");
    givenRemote("Broken/.container.json", R"({"identifier": 12)");
    givenRemote("Bare/.container.json", R"({"documents": null})");
    givenRemote("Thief/.container.json", R"({"identifier": "com.pelmora.documents"})");
    givenStore();
    EXPECT_EQ(containerOf("Music/Documents/a.wav"), "com.example.music");
    EXPECT_EQ(containerOf("Documents/x"), defaultContainerIdentifier);
    EXPECT_EQ(containerOf("Thief/x"), "com.pelmora.folder.Thief");
    EXPECT_EQ(containerOf("Broken"), "com.pelmora.folder.Broken");
    EXPECT_EQ(containerOf(""), "none");
    const auto music = *documents().containerForItemAtURL(url("Music"));
    EXPECT_EQ(music->localizedName(), "Tunes");
    EXPECT_EQ(music->documentsURL(), url("Music/Documents"));
    EXPECT_EQ(music->supportedFolderLevels(), static_cast<int>(FolderLevels::one));
    EXPECT_EQ(music->documentTypes().at(0).contentTypes.list()->at(1).integer(), 7);
    EXPECT_EQ(*music->documentTypes().at(1).contentTypes.text(), "public.audio") << "as it is";
    EXPECT_FALSE((*documents().containerForItemAtURL(url("Bare")))->documentsURL());
    EXPECT_TRUE(documents().isDocumentsContainer(url("Music/Documents")));
    EXPECT_FALSE(documents().isDocumentsContainer(url("Music")));
    EXPECT_EQ(documents().pathRelativeToShelfroot(url("Music/../Bare/x")), "Bare/x");
    EXPECT_FALSE(documents().isInShelfroot(Url::file(home / "data")));
    EXPECT_EQ(documents().defaultContainerURL(), url("Documents"));
}

TEST_F(Documents, FollowsChangesOfContainers) {
    givenStore();
    ASSERT_EQ(FileManager::createDirectory(url("New"), false), std::nullopt);
    const auto named = [&](const std::string& identifier) {
        main.async([] {}); // the snapshot changes on the store's queue: look again and again
        return containerOf("New/x") == identifier;
    };
    runUntil([&] { return named("com.pelmora.folder.New"); });
    givenLocal("New/.container.json", R"({"identifier": "com.example.new"})");
    runUntil([&] { return named("com.example.new"); });
    ASSERT_EQ(FileManager::removeItem(url("New")), std::nullopt);
    runUntil([&] { return named("none"); });
}

TEST_F(Documents, ExternalReferencesAreLinksThatLeaveTheirContainer) {
    givenRemote("Letters/a.txt", "a");
    givenRemote("Travel/there.txt", "there");
    givenStore();
    home.write("outside.txt", "outside");
    givenLocal("Letters/local.txt");
    givenLink("Letters/out", home / "outside.txt");
    givenLink("Letters/inner", "local.txt");
    givenLink("Letters/promised", "../Travel/there.txt");
    givenLink("Letters/dangling", "/nowhere/at/all");
    givenLink("Letters/loop", "../Letters/loop");
    EXPECT_TRUE(documents().isExternalDocumentReference(url("Letters/out")));
    EXPECT_EQ(*documents().resolveExternalDocumentReference(url("Letters/out")),
              Url::file(home / "outside.txt"));
    EXPECT_FALSE(documents().isExternalDocumentReference(url("Letters/inner")));
    EXPECT_FALSE(documents().isExternalDocumentReference(url("Letters/local.txt")));
    EXPECT_TRUE(documents().isExternalDocumentReference(url("Letters/promised")));
    EXPECT_EQ(*documents().resolveExternalDocumentReference(url("Letters/promised")),
              url("Travel/there.txt"));
    EXPECT_TRUE(documents().isExternalDocumentReference(url("Letters/dangling")));
    EXPECT_FALSE(documents().resolveExternalDocumentReference(url("Letters/dangling")));
    EXPECT_FALSE(documents().resolveExternalDocumentReference(url("Letters/loop")));
    EXPECT_TRUE(documents().promisedItemAttributes(url("Letters/inner"), allKeys));
}

TEST_F(Documents, APackageIsThereWhenAllOfItIs) {
    givenRemote("Letters/Plan.rtfd/TXT.rtf", "text");
    givenRemote("Letters/Plan.rtfd/deep/plan.png", "picture");
    givenStore();
    const auto status = [&] {
        return *attributes("Letters/Plan.rtfd")[ResourceKey::downloadingStatus].text();
    };
    EXPECT_EQ(attributes("Letters/Plan.rtfd")[ResourceKey::isPackage].boolean(), true);
    EXPECT_TRUE(documents().isPromised(url("Letters/Plan.rtfd")));
    EXPECT_EQ(status(), downloadingStatusNotDownloaded);
    ASSERT_EQ(cloud->contents().makeLocal(url("Letters/Plan.rtfd"), cancel), std::nullopt);
    EXPECT_EQ(status(), downloadingStatusCurrent);
    EXPECT_TRUE(FileManager::exists(url("Letters/Plan.rtfd/deep/plan.png").path()));
}

TEST_F(Documents, ACoordinatedReadFindsTheContent) {
    givenRemote("Letters/a.txt", "content");
    givenStore();
    FileCoordinator::setContentProvider(&cloud->contents());
    const Url item = url("Letters/a.txt");
    std::string read;
    const Failure failure = std::async(std::launch::async, [&] {
                                return FileCoordinator().coordinateReading(
                                    item, ReadingOptions::none, [&](const Url& there) {
                                        const auto content = FileManager::contents(there, 100);
                                        read = std::to_string(content->size());
                                    });
                            }).get();
    FileCoordinator::setContentProvider(nullptr);
    EXPECT_EQ(failure, std::nullopt);
    EXPECT_EQ(read, "7");
}

TEST_F(Documents, WithoutAnAccountThereIsNothing) {
    start();
    EXPECT_FALSE(documents().shelfroot());
    EXPECT_TRUE(documents().containers().empty());
    EXPECT_TRUE(documents()
                    .promisedItemAttributes(Url::file("/x"), allKeys)
                    .error()
                    .is(ErrorCode::noAccount));
    EXPECT_TRUE(cloud->contents().makeLocal(Url::file("/x"), cancel)->is(ErrorCode::noAccount));
}

} // namespace
