// A tour of the program's screens on the sample store: writes a picture of each into the folder
// that it is given.

#include "platform/base/Text.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/TransferActivity.h"
#include "platform/documents/DocumentSearchController.h"
#include "platform/files/FileCoordinator.h"
#include "preview/PreviewDownloadViewController.h"
#include "preview/PreviewItemManager.h"
#include "tests/product/ProgramHouse.h"
#include "tools/pelmora/SampleStore.h"

#include <QGuiApplication>

#include <cstdio>
#include <future>
#include <string>

using namespace std::chrono_literals;

namespace {

struct Look {
    std::string name;
    platform::Size size;
    /// Every text, figure and name of a library is in it, and the screens run in its direction.
    std::string language = "en_US";
    double scale = 1;
};

std::string folder = "screens";
/// The remote that all windows show; nobody changes it.
std::string sampleFolder;

/// Its pages and pictures are drawn with the toolkit's fonts.
void makeSample(const std::string& root) {
    int count = 1;
    char name[] = "tour";
    char* arguments[] = {name, nullptr};
    const QGuiApplication drawing(count, arguments);
    if (const auto failure = pelmora::makeSampleStore(root))
        throw std::runtime_error(failure->localizedDescription.value_or("no sample"));
    sampleFolder = root;
}

/// The language that the program finds when it starts.
void speak(const std::string& language) {
    setenv("LC_ALL", (language + ".UTF-8").c_str(), 1);
    platform::loadLocalizedTexts(platform::systemLanguage());
}

/// The program on the sample, in one form of the window.
struct Tour : test::ProgramHouse {
    explicit Tour(Look look, std::optional<std::uint64_t> rate = {}) : look_(std::move(look)) {
        remote = sampleFolder;
        rateLimit = rate;
        speak(look_.language);
        signIn();
        launch(look_.size);
        // A phone that lies on its side is one all the same.
        if (look_.name.starts_with("phone"))
            application->setIdiom(platform::DeviceIdiom::phone);
        untilShows("Travel");
    }

    void picture(const std::string& name) {
        calmDown();
        advance(1s); // what moves comes to rest
        savePicture(folder + "/" + name + "-" + look_.name + ".png", look_.scale);
    }
    /// Its contents come to this device.
    void fetch(const std::string& path) {
        bool here = false;
        const auto fetching = std::async(std::launch::async, [this, &here, item = url(path)] {
            (void)platform::FileCoordinator().coordinateReading(item, {},
                                                                [](const platform::Url&) {});
            platform->mainQueue().async([&here] { here = true; });
        });
        until([&] { return here; });
    }
    void back() {
        nav().popViewController(false);
        advance(1s);
    }
    void closeAlert() {
        if (platform::AlertController* const shown = alert())
            shown->dismissViewController(false);
        advance(1s);
    }
    void select(const std::vector<std::string>& names) {
        std::vector<platform::Url> urls;
        for (const std::string& name : names)
            urls.push_back(row(name));
        list()->setSelectedItems(urls);
        nav().documentListControllerItemsChanged(*list());
    }
    void action(platform::DocumentAction number, const std::string& name) {
        nav().documentListControllerPerformAction(*list(), static_cast<int>(number), row(name),
                                                  list()->view(), [] {});
        advance(1s);
    }

private:
    Look look_;
};

void lists(Tour& tour) {
    tour.picture("1-store");
    tour.open("Documents");
    tour.untilShows("House Rules.pdf");
    tour.picture("2-folder");
    tour.nav().beginEditMode();
    tour.picture("3-edit");
    tour.select({"Archive", "Budget 2026.csv"});
    tour.picture("3-edit-selected");
    tour.nav().showMoveTargetForSelectedItems();
    tour.advance(1s);
    tour.picture("4-move-to");
    tour.nav().dismissViewController(false);
    tour.advance(1s);
    tour.nav().beginEditMode();
    tour.select({"Archive", "Budget 2026.csv"});
    tour.nav().showWarningAndDeleteDocument();
    tour.picture("5-delete");
    tour.closeAlert();
    tour.nav().promtForNewFolderAndCreate();
    tour.picture("6-new-folder");
    tour.closeAlert();
    tour.nav().endEditMode();
    tour.action(platform::DocumentAction::rename, "Shopping.txt");
    tour.picture("7-rename");
    tour.closeAlert();
    tour.action(platform::DocumentAction::more, "House Rules.pdf");
    tour.picture("8-more");
    tour.nav().dismissViewController(false);
    tour.advance(1s);
    tour.action(platform::DocumentAction::information, "House Rules.pdf");
    tour.picture("9-details");
    tour.back();
}

/// Pictures in a list, and the details of every kind of item.
void details(const Look& look, double textScale = 1) {
    Tour tour(look);
    tour.application->setTextScale(textScale);
    tour.open("Photos");
    tour.open("Summer");
    for (const char* const photo : {"The Bay.jpg", "First Snow.jpg", "Hills.jpg", "Road North.jpg"})
        tour.fetch("/Photos/Summer/" + std::string(photo));
    tour.picture("photos");
    tour.fetch("House Rules.pdf");
    tour.fetch("Archive/2021/Garden Plan.rtfd");
    const auto show = [&](const std::string& name, const std::string& path) {
        tour.nav().showPreview(std::make_shared<tavrin::VXItem>(tour.url(path)),
                               tavrin::detailsMode);
        tour.picture("details-" + name);
        tour.back();
    };
    show("picture", "/Photos/Summer/The Bay.jpg");
    show("pdf", "House Rules.pdf");
    show("folder", "Archive");
    show("container", "/Travel");
    show("package", "Archive/2021/Garden Plan.rtfd");
    show("promise", "/Letters/Complaint about the Stove.pdf");
    show("shared", "/Travel/Club Minutes.md");
    if (!tour.documents().evictItem(tour.url("/Photos/Summer/The Bay.jpg")))
        show("evicted", "/Photos/Summer/The Bay.jpg");
}

void documents(Tour& tour) {
    for (const std::string name : {"House Rules.pdf", "Lake House.svg", "Long Story.txt"}) {
        tour.open(name);
        tour.until([&] { return tour.titles().back() == name; });
        tour.calmDown();
        tour.picture("document-" + name.substr(0, name.find(' ')));
        tour.back();
    }
    tour.open("Coast Panorama.png");
    tour.picture("download-waiting");
    tour.back();
}

void search(Tour& tour) {
    const auto screen = platform::DocumentSearchController::create(tour.list());
    tour.nav().presentViewController(screen, false);
    tour.advance(1s);
    tour.type("fer");
    tour.picture("search");
    tour.nav().dismissViewController(false);
    tour.advance(1s);
}

void download(const Look& look) {
    Tour tour(look, 6'291'456 / 10);
    tour.open("Documents");
    tour.open("Coast Panorama.png");
    tour.tap(*tour.button(platform::localized("Download to View")));
    tour.calmDown();
    tour.advance(3s);
    tour.picture("download-running");
    tour.nav().itemManager()->cancelDownload();
    tour.calmDown();
}

void signedOut(const Look& look) {
    speak(look.language);
    test::ProgramHouse house;
    house.launch(look.size);
    house.calmDown();
    house.savePicture(folder + "/nobody-" + look.name + ".png");
    using Kind = tavrin::SignInViewController::Kind;
    for (const auto& [kind, name] : {std::pair{Kind::server, "server"}, {Kind::folder, "folder"}}) {
        house.nav().showSignIn(kind);
        house.advance(1s);
        house.tap(*house.button(platform::localized("Sign In"))); // with nothing filled in
        house.advance(1s);
        house.savePicture(folder + "/sign-in-" + name + "-" + look.name + ".png", look.scale);
        house.nav().popViewController(false);
        house.advance(1s);
    }
}

/// What goes on with the account while a document comes.
void account(const Look& look) {
    std::future<void> fetching; // ends with the tour's platform
    Tour tour(look, 6'291'456 / 10);
    fetching = std::async(std::launch::async, [item = tour.url("Coast Panorama.png")] {
        (void)platform::FileCoordinator().coordinateReading(item, {}, [](const platform::Url&) {});
    });
    tour.until([&] { return !tour.platform->cloud().transfers().empty(); });
    tour.advance(2s);
    tour.nav().showAccount();
    tour.advance(1s);
    tour.calmDown();
    tour.picture("account");
    tour.tap(*tour.button(platform::localized("Sign Out…")));
    tour.advance(1s);
    tour.picture("account-sign-out");
}

void show(const Look& look) {
    std::printf("%s\n", look.name.c_str());
    Tour tour(look);
    lists(tour);
    documents(tour);
    search(tour);
}

} // namespace

int main(int argc, char** argv) {
    if (argc > 1)
        folder = argv[1];
    const test::TemporaryFolder sample;
    makeSample(sample / "Sample");
    const Look phone{"phone", test::phone};
    const Look tablet{"tablet", test::tablet};
    const Look turned{"phone-landscape", {844, 390}};
    const Look german{"phone-german", {360, 640}, "de_DE"};
    const Look arabic{"phone-arabic", test::phone, "ar_EG", 2};
    show(phone);
    show(tablet);
    show(turned);
    show(german);
    show({"tablet-russian", {768, 1024}, "ru_RU"});
    show(arabic);
    for (const Look& look :
         {phone, turned, tablet, arabic, Look{"phone-small", {360, 640}, "de_DE"},
          Look{"tablet-arabic", {768, 1024}, "ar_EG"}})
        details(look);
    account(turned);
    signedOut(turned);
    details({"phone-large-text", {360, 640}}, 2);
    details({"phone-landscape-large-text", {844, 390}}, 2);
    for (const Look& look : {phone, tablet, german, arabic}) {
        download(look);
        account(look);
        signedOut(look);
    }
    return 0;
}
