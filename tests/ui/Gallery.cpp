// Pictures of every control, alert, sheet and of the navigation chrome, for the eye: writes
// gallery-*.png into the folder that it is given.

#include "platform/base/Text.h"
#include "platform/ui/AlertController.h"
#include "platform/ui/Controls.h"
#include "platform/ui/StackView.h"
#include "platform/ui/Theme.h"
#include "tests/ui/UiEnvironment.h"

#include <cstdio>
#include <filesystem>
#include <fstream>

using namespace platform;

int main(int argc, char** argv) {
    const std::filesystem::path folder = argc > 1 ? argv[1] : "screens";
    std::filesystem::create_directories(folder);
    loadLocalizedTexts("en_US");
    test::UiEnvironment environment;
    environment.application->setIdiom(DeviceIdiom::phone);
    Window window({});
    window.setStatusStrip({"anna@example.org", "Wi-Fi", true});
    auto nav = std::make_shared<NavigationController>();
    window.setRootViewController(nav);
    auto a = std::make_shared<ViewController>();
    a->setTitle("Tavrin");
    auto b = std::make_shared<ViewController>();
    b->setTitle("Quarterly report with a very long name 2026-11.pdf");
    b->navigationItem().setRightBarButtonItem(
        BarButtonItem::withTitle("Select", BarStyle::plain, {}));
    auto label = std::make_shared<Label>();
    label->setFont(Font::preferred(TextStyle::footnote));
    label->setText("12 items, 1.5 GB available");
    auto flex = BarButtonItem::withSystemItem(SystemItem::flexibleSpace);
    b->setToolbarItems({flex, BarButtonItem::withCustomView(label), flex});
    nav->setViewControllers({a, b}, false);
    nav->setToolbarHidden(false, false);
    auto view = b->view();
    double y = 20;
    for (auto style : {TextStyle::title2, TextStyle::headline, TextStyle::body,
                       TextStyle::subheadline, TextStyle::footnote, TextStyle::caption}) {
        auto l = std::make_shared<Label>(Rect{16, y, 358, 0});
        l->setFont(Font::preferred(style));
        l->setText("The quick brown fox, العربية, naïve");
        l->sizeToFit();
        view->addSubview(l);
        y += l->frame().height + 6;
    }
    double x = 16;
    for (int i = 0; i < 11; ++i) {
        auto v = std::make_shared<ImageView>(Rect{x, y, 24, 24});
        v->setImage(Image::system(static_cast<SystemImage>(i)).tinted(Theme::accent));
        view->addSubview(v);
        x += 32;
    }
    y += 40;
    x = 16;
    for (auto n : {"Cloudload", "Cloud", "Tavrin"}) {
        auto v = std::make_shared<ImageView>(Rect{x, y, 64, 64});
        v->setImage(Image::named(n));
        view->addSubview(v);
        x += 80;
    }
    y += 80;
    auto button = std::make_shared<Button>(ButtonType::system, Rect{16, y, 0, 0});
    button->setTitle("Download to View");
    button->sizeToFit();
    view->addSubview(button);
    auto off = std::make_shared<Button>(ButtonType::system, Rect{200, y, 0, 0});
    off->setTitle("Disabled");
    off->setEnabled(false);
    off->sizeToFit();
    view->addSubview(off);
    y += 60;
    auto field = std::make_shared<TextField>(Rect{16, y, 358, 44});
    field->setText("Some text");
    field->setClearButtonWhileEditing(true);
    view->addSubview(field);
    field->becomeFirstResponder();
    y += 52;
    auto field2 = std::make_shared<TextField>(Rect{16, y, 358, 44});
    field2->setPlaceholder("Folder Name");
    view->addSubview(field2);
    window.makeKeyAndVisible();
    environment.advance(std::chrono::milliseconds(500));
    const Bytes png = window.snapshotPng(2);
    std::ofstream(folder / "gallery-first.png", std::ios::binary)
        .write(reinterpret_cast<const char*>(png.data()), static_cast<std::streamsize>(png.size()));
    return 0;
}
