#pragma once

#include "platform/documents/PlatformPreviewController.h"
#include "platform/documents/preview/PreviewView.h"
#include "tests/documents/ScreenHouse.h"

#include <QApplication>
#include <QColor>
#include <QImage>
#include <QWidget>

#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <vector>

namespace test {

/// The preview of one document, and what it says it has shown.
struct Documents : platform::PlatformPreviewController,
                   platform::PlatformPreviewDataSource,
                   platform::PlatformPreviewDelegate {
    Documents() {
        setDataSource(this);
        setDelegate(this);
    }
    std::size_t
    numberOfPreviewItemsInPreviewController(platform::PlatformPreviewController&) override {
        return items.size();
    }
    std::optional<platform::Url>
    previewControllerPreviewItemAtIndex(platform::PlatformPreviewController&,
                                        std::size_t index) override {
        return items[index];
    }
    void previewControllerDidShowItem(platform::PlatformPreviewController&,
                                      const platform::Url& item) override {
        seen.push_back(item);
    }
    std::vector<platform::Url> items;
    std::vector<platform::Url> seen;
};

/// A window in which documents of the store are shown.
struct Preview : ::testing::Test {
    ScreenHouse house;
    std::shared_ptr<Documents> screen = std::make_shared<Documents>();

    void SetUp() override {
        house.givenRemote("Promised.txt");
        house.signIn();
        house.openWindow();
    }
    platform::PreviewView& view() const {
        return static_cast<platform::PreviewView&>(*screen->view());
    }
    void show(const std::string& name) {
        screen->items = {house.url(name)};
        screen->reloadData();
        house.show({screen});
    }
    bool untilShown(std::size_t times = 1) {
        return house.until([&] { return screen->seen.size() >= times; });
    }
    bool untilPage(const std::string& text) {
        return house.until([&] {
            return view().showsPage() && view().pageText().find(text) != std::string::npos;
        });
    }
    template<class Widget>
    Widget* find() const {
        for (QWidget* const each : QApplication::allWidgets())
            if (auto* const found = dynamic_cast<Widget*>(each); found && found->isVisible())
                return found;
        return nullptr;
    }
    QColor colorAt(QWidget& widget, double x, double y) const {
        const QImage picture = widget.grab().toImage();
        return picture.pixelColor(static_cast<int>(picture.width() * x),
                                  static_cast<int>(picture.height() * y));
    }
};

} // namespace test
