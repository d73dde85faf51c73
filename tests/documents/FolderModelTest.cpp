#include "platform/documents/model/FolderModel.h"
#include "platform/documents/model/FolderReader.h"
#include "tests/documents/StoreHouse.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <fstream>
#include <random>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>

using namespace platform;
using ::testing::ElementsAre;

namespace {

using Names = std::vector<std::string>;

struct Folder : ::testing::Test, RowModelObserver {
    test::StoreHouse house;
    std::unique_ptr<FolderModel> model;
    std::vector<RowId> contentChanges;

    void show(std::string_view folder = "") {
        model = std::make_unique<FolderModel>(house.url(folder), house.services());
        model->setObserver(this);
        model->start();
        ASSERT_TRUE(house.until([this] { return model->state() != ModelState::loading; }));
    }
    Names shown() const {
        Names names;
        for (std::size_t i = 0; i < model->count(); ++i)
            names.push_back(model->entryAt(i).title());
        return names;
    }
    bool untilShown(const Names& names) {
        const bool came = house.until([&] { return shown() == names; });
        EXPECT_THAT(shown(), ::testing::ElementsAreArray(names));
        return came;
    }
    std::shared_ptr<const EntryDetails> details(std::size_t row) {
        model->setRowsInView(0, model->count());
        house.until([&] {
            const auto read = model->detailsAt(row);
            return read && (isDocument(model->entryAt(row).kind) || read->itemCount);
        });
        return model->detailsAt(row);
    }

    void rowsWillChange() override {}
    void rowsDidChange() override {}
    void rowContentDidChange(const std::vector<RowId>& rows) override {
        contentChanges.insert(contentChanges.end(), rows.begin(), rows.end());
    }
    void modelStateDidChange() override {}
};

TEST_F(Folder, showsPromisesUnderTheirNamesAndHidesWhatIsHidden) {
    house.givenRemote("Report 2.pdf");
    house.givenRemote("Report 10.pdf");
    house.signIn();
    house.givenFile("Notes.txt");
    house.givenFile(".hidden");
    house.givenFile(".container.json", "{}");
    house.givenFile(".Mine.promise", "the user's own");
    house.givenFolder("Pictures");
    show();
    untilShown({"Pictures", ".Mine.promise", "Notes.txt", "Report 2.pdf", "Report 10.pdf"});
    EXPECT_FALSE(model->entryAt(2).promised);
    EXPECT_TRUE(model->entryAt(3).promised);
    EXPECT_EQ(model->urlAt(3), house.url("Report 2.pdf"));
}

TEST_F(Folder, readsDetailsOfTheRowsInViewAndCountsFolders) {
    house.givenRemote("Promised.txt", "12345");
    house.signIn();
    house.givenFile("Local.txt", "123");
    house.givenFile("Pictures/a.png");
    house.givenFile("Pictures/b.png");
    house.givenFile("Pictures/.hidden");
    show();
    ASSERT_TRUE(untilShown({"Pictures", "Local.txt", "Promised.txt"}));
    EXPECT_EQ(details(0)->itemCount, 2U);
    EXPECT_EQ(details(1)->size, 3U);
    EXPECT_EQ(details(2)->size, 5U);
    EXPECT_TRUE(details(2)->promised);
    EXPECT_EQ(details(2)->typeIdentifier, "public.plain-text");
}

TEST_F(Folder, countsAFolderAnewWhenSomethingGoesIntoIt) {
    house.signIn();
    house.givenFolder("Box");
    house.givenFile("a.txt");
    show();
    ASSERT_EQ(details(0)->itemCount, 0U);
    // Items that follow one another quickly are counted together, a moment later.
    const auto untilBoxHas = [this](std::size_t items) {
        return house.until([&] {
            house.clock->advance(std::chrono::seconds(1));
            model->setRowsInView(0, model->count());
            return model->count() > 0 && model->detailsAt(0) &&
                   model->detailsAt(0)->itemCount == items;
        });
    };
    house.rename("a.txt", "Box/a.txt");
    EXPECT_TRUE(untilBoxHas(1));
    house.givenFile("Box/b.txt");
    EXPECT_TRUE(untilBoxHas(2));
    house.remove("Box");
    house.givenFile("Box/c.txt");
    EXPECT_TRUE(untilBoxHas(1));
    house.givenFile("Box/d.txt");
    EXPECT_TRUE(untilBoxHas(2));
}

TEST_F(Folder, keepsTheRowOfAPromiseThatArrives) {
    house.givenRemote("Report.pdf");
    house.signIn();
    show();
    ASSERT_TRUE(untilShown({"Report.pdf"}));
    const RowId row = model->idAt(0);
    CancelFlag never;
    std::thread download([&] {
        EXPECT_EQ(house.platform->cloud().contents().makeLocal(house.url("Report.pdf"), never),
                  std::nullopt);
    });
    EXPECT_TRUE(house.until([&] { return model->count() == 1 && !model->entryAt(0).promised; }));
    download.join();
    EXPECT_EQ(model->idAt(0), row);
}

TEST_F(Folder, followsARenameOfAFileAndOfAPromise) {
    house.givenRemote("A.pdf");
    house.signIn();
    house.givenFile("B.txt");
    show();
    ASSERT_TRUE(untilShown({"A.pdf", "B.txt"}));
    const RowId promise = model->idAt(0);
    const RowId file = model->idAt(1);
    house.rename("B.txt", "D.txt");
    ASSERT_EQ(house.platform->cloud().contents().moveItem(house.url("A.pdf"), house.url("E.pdf")),
              std::nullopt);
    ASSERT_TRUE(untilShown({"D.txt", "E.pdf"}));
    EXPECT_EQ(model->idAt(0), file);
    EXPECT_EQ(model->idAt(1), promise);
}

TEST_F(Folder, aNoticeThatTheDiskHasOutrunDoesNotTakeTheItemAway) {
    house.signIn();
    FolderReader reader(house.url(), house.documents());
    using Kind = DirectoryChange::Kind;
    const auto changed = reader.resolve({{Kind::modified, "B.txt", false, 0}});
    ASSERT_TRUE(changed);
    EXPECT_TRUE(changed->facts.empty()) << "its renaming is still to be told, and keeps its row";
    const auto gone = reader.resolve({{Kind::removed, "B.txt", false, 0}});
    ASSERT_TRUE(gone);
    ASSERT_EQ(gone->facts.size(), 1U);
    EXPECT_FALSE(gone->facts[0].present);
}

TEST_F(Folder, readsAChangedFileAgain) {
    house.signIn();
    house.givenFile("a.txt", "1");
    show();
    ASSERT_EQ(details(0)->size, 1U);
    house.givenFile("a.txt", "1234");
    EXPECT_TRUE(house.until([&] { return model->detailsAt(0)->size == 4U; }));
}

TEST_F(Folder, linksAreWhatTheyLeadToAndThoseThatLeadNowhereAreDocuments) {
    house.signIn();
    const std::string folder = house.path("");
    house.givenFile("Trip/a.txt");
    for (const auto& [link, target] :
         {std::pair("to folder", "Trip"), std::pair("to file", "Trip/a.txt"),
          std::pair("dangling", "nowhere"), std::pair("loop", "loop"), std::pair("ping", "pong"),
          std::pair("pong", "ping"), std::pair("self", ".")})
        ASSERT_EQ(::symlink(target, (folder + "/" + link).c_str()), 0);
    ASSERT_EQ(::mkfifo((folder + "/pipe.txt").c_str(), 0600), 0);
    show();
    ASSERT_TRUE(untilShown(
        {"self", "to folder", "Trip", "dangling", "loop", "ping", "pipe.txt", "pong", "to file"}));
    for (std::size_t i = 0; i < 3; ++i)
        EXPECT_EQ(model->entryAt(i).kind, EntryKind::folder);
    EXPECT_EQ(details(1)->itemCount, 1U);
    for (std::size_t i = 3; i < model->count(); ++i) {
        EXPECT_EQ(model->entryAt(i).kind, EntryKind::file);
        EXPECT_TRUE(details(i)) << "nothing waits for a pipe or goes round";
    }
}

TEST_F(Folder, listsContainersByTheirNamesAndLooseFilesAfterThem) {
    house.givenRemote("/Zeichnen/.container.json",
                      R"({"identifier":"com.example.draw","names":{"en":"Drawings"},)"
                      R"("documents":"Documents"})");
    house.givenRemote("/Zeichnen/Documents/x.txt");
    house.givenRemote("/Loose.txt");
    house.signIn();
    show("/");
    house.until([&] { return model->count() == 3; });
    ASSERT_EQ(model->count(), 3U);
    EXPECT_EQ(model->entryAt(0).kind, EntryKind::container);
    EXPECT_EQ(model->entryAt(2).name, "Loose.txt");
    for (std::size_t i = 0; i < 2; ++i)
        EXPECT_TRUE(house.documents().isDocumentsContainer(model->urlAt(i)));
}

TEST_F(Folder, saysThatItIsGoneAndComesBack) {
    house.signIn();
    house.givenFile("Trip/a.txt");
    show("Trip");
    ASSERT_TRUE(untilShown({"a.txt"}));
    house.remove("Trip");
    ASSERT_TRUE(house.until([&] { return model->state() == ModelState::failed; }));
    EXPECT_TRUE(model->error()->is(ErrorCode::noSuchItem));
    EXPECT_EQ(model->count(), 0U);
    house.givenFile("Trip/b.txt");
    untilShown({"b.txt"});
}

TEST_F(Folder, aFolderPutInPlaceOfTheShownOneIsReadAnew) {
    house.signIn();
    house.givenFile("Trip/same.txt");
    house.givenFile("Other/same.txt");
    house.givenFile("Other/new.txt");
    show("Trip");
    ASSERT_TRUE(untilShown({"same.txt"}));
    const RowId row = model->idAt(0);
    house.rename("Trip", "Old");
    house.rename("Other", "Trip");
    ASSERT_TRUE(untilShown({"new.txt", "same.txt"}));
    EXPECT_NE(model->idAt(1), row) << "a selection must not pass to another folder's file";
}

TEST_F(Folder, noticesOnReturnThatAFolderAboveWasRenamed) {
    house.signIn();
    house.givenFile("Above/Trip/a.txt");
    show("Above/Trip");
    house.rename("Above", "Elsewhere");
    EXPECT_EQ(model->state(), ModelState::ready);
    model->refreshShown();
    EXPECT_TRUE(house.until([&] { return model->state() == ModelState::failed; }));
}

TEST_F(Folder, aFileInPlaceOfTheFolderAndAFileThatCannotBeListedAreFailures) {
    house.signIn();
    house.givenFile("NotAFolder");
    show("NotAFolder");
    EXPECT_EQ(model->state(), ModelState::failed);
    EXPECT_TRUE(model->error()->localizedDescription);
}

/// Random work of another program on the folder; at the end the list is what a fresh reading is.
class FolderChurn : public Folder, public ::testing::WithParamInterface<unsigned> {};

TEST_P(FolderChurn, endsWhereAFreshReadingWould) {
    house.signIn();
    show();
    std::mt19937 random(GetParam());
    const auto someName = [&] { return "item " + std::to_string(random() % 40); };
    for (int i = 0; i < 2000; ++i) {
        const std::string name = someName();
        switch (random() % 4) {
        case 0:
            house.remove(name);
            break;
        case 1:
            if (house.home.has(house.path(name).substr(house.home.path().size() + 1)))
                std::rename(house.path(name).c_str(), house.path(someName()).c_str());
            break;
        case 2:
            ::mkdir(house.path(name).c_str(), 0755);
            break;
        default:
            std::ofstream(house.path(name)) << i;
        }
        if (random() % 16 == 0)
            house.runPending();
    }
    house.givenFile("zz the last change");
    ASSERT_TRUE(house.until(
        [&] { return model->count() > 0 && model->entryAt(model->count() - 1).name[0] == 'z'; }));
    FolderModel fresh(house.url(), house.services());
    fresh.start();
    ASSERT_TRUE(house.until([&] { return fresh.state() == ModelState::ready; }));
    Names expected;
    for (std::size_t i = 0; i < fresh.count(); ++i)
        expected.push_back(fresh.entryAt(i).name);
    EXPECT_EQ(shown(), expected);
}

INSTANTIATE_TEST_SUITE_P(Seeds, FolderChurn, ::testing::Values(1U, 2U, 3U));

} // namespace
