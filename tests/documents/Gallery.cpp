// Pictures of the document screens, for the eye: writes documents-*.png into the folder that it is
// given. As a test it shows that all of them can be drawn.

#include "platform/base/Text.h"
#include "platform/documents/DocumentPickerUnavailableViewController.h"
#include "platform/documents/list/ListView.h"
#include "platform/documents/list/ListWidget.h"
#include "tests/documents/GalleryScene.h"

#include <QContextMenuEvent>
#include <QCoreApplication>
#include <QKeyEvent>

#include <cstdio>
#include <functional>

using namespace platform;
using namespace std::chrono_literals;
using test::GalleryScene;
using test::Look;

namespace {

const Look phone{"phone", {360, 640}};
const Look phoneTurned{"phone-turned", {640, 360}};
const Look phoneRtl{"phone-rtl", {360, 640}, true};
const Look phoneLarge{"phone-200", {360, 640}, false, 2};
const Look phoneCoarse{"phone-at-1x", {360, 640}, false, 1, 1};
const Look tablet{"tablet", {1024, 768}};
const Look tabletUpright{"tablet-upright", {768, 1024}};
const Look tabletRtl{"tablet-rtl", {1024, 768}, true};

void pressKey(QWidget& widget, Qt::Key key) {
    QKeyEvent down(QEvent::KeyPress, key, Qt::NoModifier);
    QCoreApplication::sendEvent(&widget, &down);
}

void lists(GalleryScene& scene) {
    scene.list("/");
    scene.save("root");
    const auto list = scene.list();
    scene.save("list");
    scene.swipe(*list, 2);
    scene.save("swipe");
    list->impl().list->widget().state().swipe.close();
    list->setEditing(true, true);
    list->setSelectedItems({list->containedItems()[1], list->containedItems()[4]});
    scene.save("edit");
}

void pagesInPlaceOfRows(GalleryScene& scene) {
    scene.list("Missing");
    scene.save("failure");
    const auto list = scene.list("Empty");
    scene.save("empty");
    list->impl().list->setPage(std::nullopt);
    list->impl().list->setShowsPlaceholders(true);
    scene.save("loading");
}

void actions(GalleryScene& scene) {
    const auto list = scene.list();
    ListWidget& widget = list->impl().list->widget();
    const QPoint at(100, static_cast<int>(widget.state().rowRect(2).midY()));
    QContextMenuEvent menu(QContextMenuEvent::Mouse, at, at);
    QCoreApplication::sendEvent(&widget, &menu);
    scene.save("actions");
}

void searches(GalleryScene& scene) {
    const auto list = scene.list();
    scene.search(*list, "");
    scene.save("search-start");
    scene.navigation->dismissViewController(false);
    scene.search(*list, "min");
    scene.save("search-found");
    scene.navigation->dismissViewController(false);
    scene.search(*list, "minxyz");
    scene.save("search-nothing");
}

void previews(GalleryScene& scene) {
    for (const auto& [file, name] :
         {std::pair("Files/Upright.jpg", "image"), std::pair("Files/Report.pdf", "pdf"),
          std::pair("Files/Story.txt", "text"), std::pair("Files/Program.cpp", "source"),
          std::pair("Files/Accounts.csv", "table"), std::pair("Files/Guide.md", "markdown")}) {
        scene.preview(file);
        scene.save(std::string("preview-") + name);
    }
}

void previewsOfContents(GalleryScene& scene) {
    scene.preview("Files/Holiday.zip");
    scene.save("preview-archive");
    scene.preview("Files/Diary.package");
    scene.save("preview-package");
    scene.preview("Files/Tune.wav");
    scene.save("preview-sound");
    scene.preview("Files/Clip.avi");
    scene.save("preview-film");
}

void previewsOfNothing(GalleryScene& scene) {
    for (const auto& [file, name] :
         {std::pair("Files/Broken.png", "damaged"), std::pair("Files/Nothing.pdf", "nothing"),
          std::pair("data.xyzzy", "unknown")}) {
        scene.preview(file);
        scene.save(std::string("preview-") + name);
    }
}

void choosers(GalleryScene& scene) {
    const auto stack = scene.choose({scene.url("Budget 2026.ods"), scene.url("Empty/")});
    scene.save("target-here");
    scene.openTarget(*stack, "Work");
    scene.save("target-possible");
    stack->topViewController()->toolbarItems().front()->perform();
    scene.save("target-new-folder");
    stack->presentedViewController()->dismissViewController(false);
    while (stack->popViewController(false)) {
    }
    scene.advance(1s);
    scene.save("target-root");
}

void unavailable(GalleryScene& scene) {
    scene.showAlone({makeScreenByClassName("DocumentPickerUnavailableViewController")});
    scene.save("unavailable");
}

/// Last: from the first key on the focus shows.
void focus(GalleryScene& scene) {
    const auto list = scene.list();
    list->impl().list->takeFocus();
    for (int i = 0; i < 3; ++i)
        pressKey(list->impl().list->widget(), Qt::Key_Down);
    scene.save("focus");
}

using Scene = void (*)(GalleryScene&);

const std::vector<std::pair<Look, std::vector<Scene>>>& gallery() {
    static const std::vector<std::pair<Look, std::vector<Scene>>> all = {
        {phone,
         {lists, pagesInPlaceOfRows, previews, previewsOfContents, previewsOfNothing, choosers,
          unavailable, searches, actions, focus}},
        {phoneRtl,
         {lists, pagesInPlaceOfRows, previews, previewsOfContents, choosers, searches, actions}},
        {phoneLarge,
         {lists, pagesInPlaceOfRows, previews, previewsOfContents, previewsOfNothing, choosers,
          unavailable, searches, actions}},
        {phoneTurned, {lists, pagesInPlaceOfRows, previews, choosers, unavailable, searches}},
        {phoneCoarse, {lists}},
        {tablet,
         {lists, pagesInPlaceOfRows, previews, previewsOfContents, choosers, searches, actions,
          focus}},
        {tabletUpright, {lists, previews}},
        {tabletRtl, {lists, choosers}},
    };
    return all;
}

} // namespace

int main(int argc, char** argv) {
    const std::string folder = argc > 1 ? argv[1] : "screens";
    loadLocalizedTexts("en_US");
    bool complete = true;
    for (const auto& [look, scenes] : gallery())
        for (const Scene draw : scenes) {
            GalleryScene scene(look, folder);
            draw(scene);
            for (const std::string& complaint : scene.complaints()) {
                std::fprintf(stderr, "%s\n", complaint.c_str());
                complete = false;
            }
        }
    return complete ? 0 : 1;
}
