#include "tests/documents/GalleryScene.h"

#include "platform/documents/list/ListView.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/documents/preview/PreviewView.h"
#include "platform/documents/targets/TargetScreen.h"
#include "platform/ui/Controls.h"
#include "tests/documents/OneDocument.h"
#include "tests/documents/SampleArchives.h"
#include "tests/documents/SampleDocuments.h"

#include <QApplication>
#include <QImage>
#include <QLineEdit>
#include <QtTest/QTest>

#include <set>

namespace test {

using namespace platform;
using namespace std::chrono_literals;

namespace {

/// The details of the rows in view are there.
bool isComplete(const FolderModel& model) {
    if (model.state() == ModelState::loading)
        return false;
    for (std::size_t i = 0; i < std::min<std::size_t>(model.count(), 4); ++i) {
        const auto details = model.detailsAt(i);
        if (!details || (!isDocument(model.entryAt(i).kind) && !details->itemCount))
            return false;
    }
    return true;
}

std::string holidayArchive() {
    std::vector<PackedItem> items = {
        {"Holiday in the north/Plan of the journey.odt", std::string(18'000, 'o')},
        {"Holiday in the north/Tickets.pdf", std::string(240'000, 'p')},
        {"Read me.txt", "All pictures are from August."}};
    for (int i = 1; i <= 20; ++i)
        items.push_back({"Holiday in the north/Pictures/IMG " + std::to_string(2040 + i) + ".jpg",
                         std::string(static_cast<std::size_t>(90'000 + i * 7'777), 'j')});
    return archiveOf(items, "zip", "", "zip:encryption=traditional");
}

/// Text on a page alone has more shades than this.
constexpr std::size_t fewestColors = 16;

} // namespace

GalleryScene::GalleryScene(const Look& look, std::string folder)
    : look_(look), folder_(std::move(folder)) {
    givenRemote("Annual report 2026.pdf", std::string(1'234'567, 'x'));
    givenRemote("Holiday/IMG 2041.jpg");
    givenRemote("/Sketches/.container.json",
                R"({"identifier":"com.example.sketches","names":{"en":"Sketches"}})");
    givenRemote("/Sketches/Tree.png");
    givenRemote("/Notebook/Ideas.md");
    signIn();
    openWindow(look.size);
    fill();
    application->setReducesMotion(true);
    application->setRightToLeft(look.rightToLeft);
    application->setTextScale(look.textScale);
    settle();
}

void GalleryScene::fill() {
    givenFile("Budget 2026.ods", std::string(45'000, 'x'));
    givenFile("Letter to the tax office about the corrected statement of last year.odt",
              std::string(18'000, 'x'));
    givenFile("Notes.txt", "Milk");
    givenFile("Song.mp3", std::string(4'200'000, 'x'));
    givenFile("Clip.mp4", std::string(999'000, 'x'));
    givenFile("Archive.zip", std::string(300'000, 'x'));
    givenFile("data.xyzzy", "?");
    givenFile("تقرير سنوي.pdf", "x");
    givenFile("evil\u202egpj.exe", "x");
    for (int i = 0; i < 12; ++i)
        givenFile("Work/Minutes " + std::to_string(i) + ".txt");
    givenFolder("Empty");
    givenFile("Files/Upright.jpg", turnedPhoto(1600, 1200));
    givenFile("Files/Report.pdf", pdfOfPages(5));
    givenFile("Files/Story.txt", longText(2000));
    givenFile("Files/Program.cpp", sampleProgram());
    givenFile("Files/Accounts.csv", sampleTable());
    givenFile("Files/Guide.md", sampleGuide());
    givenFile("Files/Broken.png", "this is no picture");
    givenFile("Files/Nothing.pdf", "");
    givenFile("Files/Tune.wav", soundOf(200));
    givenFile("Files/Clip.avi", filmOf(320, 180, 40));
    givenFile("Files/Holiday.zip", holidayArchive());
    givenFile("Files/Diary.package/Entries/August.md", longText(40));
    givenFile("Files/Diary.package/Entries/September.md", longText(90));
    givenFile("Files/Diary.package/Pictures/Lake.jpg", std::string(345'000, 'j'));
    givenFile("Files/Diary.package/index.json", "{}");
}

std::shared_ptr<DocumentListController> GalleryScene::list(std::string_view where) {
    navigation->setToolbarHidden(false, false);
    const auto shown = showList(where);
    shown->setAvailableActions(15);
    const auto label = std::make_shared<Label>();
    label->setFont(Font::preferred(TextStyle::footnote));
    label->setText("17 items, 1.5 GB available");
    const auto space = BarButtonItem::withSystemItem(SystemItem::flexibleSpace);
    shown->setToolbarItems({space, BarButtonItem::withCustomView(label), space});
    shown->navigationItem().setRightBarButtonItem(
        BarButtonItem::withTitle("Select", BarStyle::plain, {}));
    until([&] { return isComplete(*shown->impl().model); });
    advance(1s);
    return shown;
}

void GalleryScene::swipe(const DocumentListController& list, std::size_t row) {
    RowSwipe& swipe = list.impl().list->widget().state().swipe;
    swipe.begin(list.impl().model->idAt(row), offeredActions(15), look_.size.width);
    swipe.open();
    advance(1s);
}

void GalleryScene::showAlone(std::vector<std::shared_ptr<ViewController>> screens) {
    navigation->setToolbarHidden(true, false);
    show(std::move(screens));
}

void GalleryScene::preview(const std::string& file) {
    const auto screen = std::make_shared<OneDocument>(url(file));
    screen->setAdditionalRightBarButtonItems({BarButtonItem::withSystemItem(SystemItem::trash),
                                              BarButtonItem::withSystemItem(SystemItem::organize)});
    screen->reloadData();
    showAlone({DocumentListController::createForURL(url()), screen});
    until([&] {
        return screen->shown || static_cast<const PreviewView&>(*screen->view()).showsPage();
    });
    waitForPictures();
}

void GalleryScene::waitForPictures() {
    for (int i = 0; i < 15; ++i) {
        advance(20ms);
        waitBriefly();
    }
}

std::shared_ptr<NavigationController> GalleryScene::choose(const std::vector<Url>& items) {
    list();
    const auto chooser = DocumentTargetSelectionController::create(items);
    navigation->presentViewController(chooser, false);
    auto stack =
        std::static_pointer_cast<NavigationController>(chooser->childViewControllers().front());
    until([&] {
        return isComplete(static_cast<TargetScreen&>(*stack->topViewController()).model());
    });
    return stack;
}

void GalleryScene::openTarget(NavigationController& stack, std::string_view name) {
    auto& before = static_cast<TargetScreen&>(*stack.topViewController());
    for (std::size_t i = 0; i < before.model().count(); ++i)
        if (before.model().entryAt(i).title() == name) {
            before.list().widget().state().activate(i);
            break;
        }
    auto& after = static_cast<TargetScreen&>(*stack.topViewController());
    until([&] { return isComplete(after.model()); });
    advance(1s);
}

void GalleryScene::search(DocumentListController& list, const std::string& text) {
    const auto screen = DocumentSearchController::create(
        std::static_pointer_cast<DocumentListController>(list.shared_from_this()));
    navigation->presentViewController(screen, false);
    advance(500ms);
    auto* const field = dynamic_cast<QLineEdit*>(QApplication::focusWidget());
    if (!field)
        complaints_.push_back("the search has no field with the focus");
    else if (!text.empty())
        QTest::keyClicks(field, QString::fromStdString(text));
    waitForPictures();
}

void GalleryScene::save(const std::string& name) {
    advance(500ms);
    const std::string file = folder_ + "/documents-" + name + "-" + look_.name + ".png";
    savePicture(file, look_.pictureScale);
    check(file);
}

void GalleryScene::check(const std::string& file) {
    const QImage picture(QString::fromStdString(file));
    const QSize wanted(static_cast<int>(look_.size.width * look_.pictureScale),
                       static_cast<int>(look_.size.height * look_.pictureScale));
    if (picture.size() != wanted) {
        complaints_.push_back(file + " is missing or of another size");
        return;
    }
    std::set<QRgb> colors;
    for (int y = 0; y < picture.height(); ++y)
        for (int x = 0; x < picture.width(); ++x)
            colors.insert(picture.pixel(x, y));
    if (colors.size() < fewestColors)
        complaints_.push_back(file + " shows nothing");
}

} // namespace test
