#pragma once

#include "platform/documents/ListScreen.h"
#include "platform/documents/list/ListWidget.h"
#include "tests/documents/ScreenHouse.h"

#include <QAccessible>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <memory>
#include <string>
#include <string_view>
#include <vector>

namespace test {

/// Writes down what a list tells its delegate.
struct ListDelegate : platform::DocumentListControllerDelegate {
    struct Action {
        int number;
        platform::Url url;
        std::shared_ptr<platform::View> view;
        std::function<void()> completion;
    };
    void documentListControllerDidSelectContainerWithViewController(
        platform::DocumentListController&,
        const std::shared_ptr<platform::DocumentListController>& next) override {
        folders.push_back(next->presentedURL());
    }
    void documentListControllerDidSelectItemAtURL(platform::DocumentListController&,
                                                  const platform::Url& url) override {
        files.push_back(url);
    }
    void documentListControllerItemsChanged(platform::DocumentListController&) override {
        ++changes;
    }
    void documentListControllerPerformAction(platform::DocumentListController&, int action,
                                             const platform::Url& url,
                                             const std::shared_ptr<platform::View>& view,
                                             std::function<void()> completion) override {
        actions.push_back({action, url, view, std::move(completion)});
    }
    std::vector<platform::Url> folders;
    std::vector<platform::Url> files;
    std::vector<Action> actions;
    int changes = 0;
};

/// A list on a phone, and what people do with it.
struct ListFixture : ::testing::Test {
    ScreenHouse house;
    std::shared_ptr<ListDelegate> delegate = std::make_shared<ListDelegate>();
    std::shared_ptr<platform::DocumentListController> list;

    /// Signs in and opens the window; files may be given before or after.
    void open(platform::Size size = {360, 640});
    void showList(std::string_view folder = "");
    void givenFiles(int count, const std::string& folder = "");
    platform::ListWidget& widget() const { return list->impl().list->widget(); }
    platform::ListState& state() const { return widget().state(); }
    std::vector<std::string> shown() const;
    bool untilShown(const std::vector<std::string>& names);
    std::vector<std::string> selected() const;
    std::size_t rowNamed(std::string_view name) const;
    std::string currentName() const;
    std::string nameAtTop() const;
    double yOf(std::string_view name) const { return state().yOf(rowNamed(name)); }

    platform::Point middleOf(std::string_view name) const;
    void tap(platform::Point point, Qt::KeyboardModifiers modifiers = Qt::NoModifier);
    void tap(std::string_view name, Qt::KeyboardModifiers modifiers = Qt::NoModifier) {
        tap(middleOf(name), modifiers);
    }
    void press(int key, Qt::KeyboardModifiers modifiers = Qt::NoModifier);
    void type(const std::string& text);
    void fingerDown(platform::Point point);
    void fingerTo(platform::Point point);
    void fingerUp(platform::Point point);
    /// A finger that goes from one place to another in ten steps of `step`.
    void drag(platform::Point from, platform::Point to,
              platform::Duration step = std::chrono::milliseconds(8));
    /// Draws the row aside by that many points toward the leading edge.
    void swipe(std::string_view name, double distance = 240,
               platform::Duration step = std::chrono::milliseconds(8));
    QAccessibleInterface* accessibleRow(std::string_view name) const;
};

} // namespace test
