// Pictures of the document screens, for the eye: writes PNG files into the folder that it is given.

#include "platform/base/Text.h"
#include "platform/documents/DocumentPickerUnavailableViewController.h"
#include "platform/documents/DocumentSearchController.h"
#include "platform/documents/DocumentTargetSelectionController.h"
#include "platform/documents/ListScreen.h"
#include "platform/documents/PlatformPreviewController.h"
#include "platform/documents/list/ListView.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/documents/targets/TargetScreen.h"
#include "platform/ui/Controls.h"
#include "tests/documents/SampleDocuments.h"
#include "tests/documents/ScreenHouse.h"

#include <QApplication>
#include <QContextMenuEvent>
#include <QKeyEvent>
#include <QLineEdit>
#include <QtTest/QTest>

#include <functional>

using namespace platform;
using namespace std::chrono_literals;

namespace {

std::string folder = "screens";

struct Scene : test::ScreenHouse {
    explicit Scene(Size size, bool rightToLeft = false, double textScale = 1) {
        givenRemote("Annual report 2026.pdf", std::string(1'234'567, 'x'));
        givenRemote("Holiday/IMG 2041.jpg");
        givenRemote("/Sketches/.container.json",
                    R"({"identifier":"com.example.sketches","names":{"en":"Sketches"}})");
        givenRemote("/Sketches/Tree.png");
        givenRemote("/Notebook/Ideas.md");
        signIn();
        givenFile("Budget 2026.ods", std::string(45'000, 'x'));
        givenFile("Letter to the tax office about the corrected statement of last year.odt",
                  std::string(18'000, 'x'));
        givenFile("Notes.txt", "Milk");
        givenFile("Song.mp3", std::string(4'200'000, 'x'));
        givenFile("Clip.mp4", std::string(999'000, 'x'));
        givenFile("Photo.jpg", std::string(2'500'000, 'x'));
        givenFile("Archive.zip", std::string(300'000, 'x'));
        givenFile("data.xyzzy", "?");
        givenFile("تقرير سنوي.pdf", "x");
        givenFile("evil\u202egpj.exe", "x");
        for (int i = 0; i < 12; ++i)
            givenFile("Work/Minutes " + std::to_string(i) + ".txt");
        givenFolder("Empty");
        openWindow(size);
        application->setRightToLeft(rightToLeft);
        application->setTextScale(textScale);
        settle();
    }

    std::shared_ptr<DocumentListController> list(std::string_view where = "") {
        const auto shown = showList(where);
        shown->setAvailableActions(15);
        const auto label = std::make_shared<Label>();
        label->setFont(Font::preferred(TextStyle::footnote));
        label->setText("17 items, 1.5 GB available");
        const auto space = BarButtonItem::withSystemItem(SystemItem::flexibleSpace);
        shown->setToolbarItems({space, BarButtonItem::withCustomView(label), space});
        shown->navigationItem().setRightBarButtonItem(
            BarButtonItem::withTitle("Select", BarStyle::plain, {}));
        until([&] {
            const FolderModel& model = *shown->impl().model;
            if (model.state() == ModelState::loading)
                return false;
            for (std::size_t i = 0; i < std::min<std::size_t>(model.count(), 8); ++i) {
                const auto details = model.detailsAt(i);
                if (!details || (!isDocument(model.entryAt(i).kind) && !details->itemCount))
                    return false;
            }
            return true;
        });
        advance(1s);
        return shown;
    }
    void save(const std::string& name) {
        advance(500ms);
        savePicture(folder + "/documents-" + name + ".png");
    }
};

void lists() {
    {
        Scene scene({360, 640});
        scene.list("/");
        scene.save("root-phone");
        const auto list = scene.list();
        scene.save("list-phone");
        ListWidget& widget = list->impl().list->widget();
        widget.state().swipe.begin(list->impl().model->idAt(4), offeredActions(15), 360);
        widget.state().swipe.open();
        scene.save("swipe-phone");
        widget.state().swipe.close();
        list->setEditing(true, true);
        list->setSelectedItems({list->containedItems()[1], list->containedItems()[4]});
        scene.save("edit-phone");
        scene.list("Empty");
        scene.save("empty-phone");
        scene.list("Missing");
        scene.save("failure-phone");
    }
    {
        Scene scene({360, 640}, true);
        const auto list = scene.list();
        list->impl().list->widget().state().swipe.begin(list->impl().model->idAt(4),
                                                        offeredActions(15), 360);
        list->impl().list->widget().state().swipe.open();
        scene.save("list-rtl");
    }
    {
        Scene scene({360, 640}, false, 2);
        const auto list = scene.list();
        scene.save("list-200");
        list->impl().list->widget().state().swipe.begin(list->impl().model->idAt(3),
                                                        offeredActions(15), 360);
        list->impl().list->widget().state().swipe.open();
        scene.save("swipe-200");
        scene.list("Empty");
        scene.save("empty-200");
    }
    {
        Scene scene({1024, 768});
        const auto list = scene.list();
        list->impl().list->takeFocus();
        for (int i = 0; i < 3; ++i) {
            QKeyEvent down(QEvent::KeyPress, Qt::Key_Down, Qt::NoModifier);
            QCoreApplication::sendEvent(&list->impl().list->widget(), &down);
        }
        scene.save("list-tablet");
    }
}

struct OneDocument : PlatformPreviewController, PlatformPreviewDataSource {
    OneDocument() { setDataSource(this); }
    std::size_t numberOfPreviewItemsInPreviewController(PlatformPreviewController&) override {
        return 1;
    }
    std::optional<Url> previewControllerPreviewItemAtIndex(PlatformPreviewController&,
                                                           std::size_t) override {
        return document;
    }
    Url document;
};

void preview(Scene& scene, const std::string& file, const std::string& name) {
    const auto below = DocumentListController::createForURL(scene.url());
    const auto screen = std::make_shared<OneDocument>();
    screen->document = scene.url(file);
    screen->setAdditionalRightBarButtonItems({BarButtonItem::withSystemItem(SystemItem::trash),
                                              BarButtonItem::withSystemItem(SystemItem::organize)});
    screen->reloadData();
    scene.show({below, screen});
    for (int i = 0; i < 40; ++i) {
        scene.advance(20ms);
        scene.waitBriefly();
    }
    scene.save("preview-" + name);
}

void previews() {
    Scene scene({360, 640});
    scene.givenFile("Upright.jpg", test::turnedPhoto(1600, 1200));
    scene.givenFile("Report.pdf", test::pdfOfPages(5));
    scene.givenFile("Story.txt", test::longText(2000));
    scene.givenFile("Broken.png", "this is no picture");
    scene.givenFile("Nothing.pdf", "");
    preview(scene, "Upright.jpg", "image");
    preview(scene, "Report.pdf", "pdf");
    preview(scene, "Story.txt", "text");
    preview(scene, "Broken.png", "damaged");
    preview(scene, "Nothing.pdf", "nothing");
    preview(scene, "Archive.zip", "unknown");
    scene.application->setTextScale(2);
    preview(scene, "Archive.zip", "unknown-200");
}

/// The chooser for those items, over a list.
std::shared_ptr<NavigationController> choose(Scene& scene, const std::vector<Url>& items) {
    scene.list();
    const auto chooser = DocumentTargetSelectionController::create(items);
    scene.navigation->presentViewController(chooser, false);
    for (int i = 0; i < 10; ++i) {
        scene.advance(50ms);
        scene.waitBriefly();
    }
    return std::static_pointer_cast<NavigationController>(chooser->childViewControllers().front());
}

void choosers() {
    for (const bool rightToLeft : {false, true}) {
        Scene scene({360, 640}, rightToLeft);
        const std::string kind = rightToLeft ? "-rtl" : "-phone";
        const auto stack = choose(
            scene, {scene.url("Budget 2026.ods"), scene.url("Holiday").markedAsDirectory(true)});
        scene.save("target-here" + kind);
        ListWidget& rows = static_cast<TargetScreen&>(*stack->topViewController()).list().widget();
        rows.state().activate(2); // "Work"
        for (int i = 0; i < 10; ++i) {
            scene.advance(50ms);
            scene.waitBriefly();
        }
        scene.save("target-possible" + kind);
        stack->topViewController()->toolbarItems().front()->perform();
        scene.save("target-new-folder" + kind);
    }
    {
        Scene scene({360, 640}, false, 2);
        choose(scene, {scene.url("Budget 2026.ods")});
        scene.save("target-here-200");
    }
    {
        Scene scene({1024, 768});
        const auto stack = choose(scene, {scene.url("Work/Minutes 1.txt")});
        scene.save("target-tablet");
        while (stack->popViewController(false)) {
        }
        for (int i = 0; i < 10; ++i) {
            scene.advance(50ms);
            scene.waitBriefly();
        }
        scene.save("target-root-tablet");
    }
}

void others() {
    {
        Scene scene({360, 640});
        const auto list = scene.list();
        const auto search = DocumentSearchController::create(list);
        scene.navigation->presentViewController(search, false);
        scene.advance(500ms);
        scene.save("search-start");
        auto& field = static_cast<QLineEdit&>(*QApplication::focusWidget());
        QTest::keyClicks(&field, QStringLiteral("min"));
        for (int i = 0; i < 20; ++i) {
            scene.advance(20ms);
            scene.waitBriefly();
        }
        scene.save("search-found");
        QTest::keyClicks(&field, QStringLiteral("xyz"));
        for (int i = 0; i < 20; ++i) {
            scene.advance(20ms);
            scene.waitBriefly();
        }
        scene.save("search-nothing");
    }
    {
        Scene scene({360, 640});
        const auto list = scene.list("Empty");
        list->impl().list->setPage(std::nullopt);
        list->impl().list->setShowsPlaceholders(true);
        scene.save("loading-phone");
        const auto all = scene.list();
        QContextMenuEvent menu(QContextMenuEvent::Mouse, QPoint(100, 300), QPoint(100, 300));
        QCoreApplication::sendEvent(&all->impl().list->widget(), &menu);
        scene.save("actions-phone");
    }
    {
        test::ScreenHouse house;
        house.withoutAccount();
        house.openWindow({360, 640});
        house.show({makeScreenByClassName("DocumentPickerUnavailableViewController")});
        house.advance(500ms);
        house.savePicture(folder + "/documents-unavailable.png");
        house.application->setTextScale(2);
        house.advance(500ms);
        house.savePicture(folder + "/documents-unavailable-200.png");
    }
}

} // namespace

int main(int argc, char** argv) {
    if (argc > 1)
        folder = argv[1];
    loadLocalizedTexts("en_US");
    lists();
    previews();
    choosers();
    others();
    return 0;
}
