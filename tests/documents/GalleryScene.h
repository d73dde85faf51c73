#pragma once

#include "platform/documents/DocumentSearchController.h"
#include "platform/documents/DocumentTargetSelectionController.h"
#include "platform/documents/ListScreen.h"
#include "platform/documents/PlatformPreviewController.h"
#include "tests/documents/ScreenHouse.h"

#include <memory>
#include <string>
#include <vector>

namespace test {

/// In what kind of window pictures are drawn.
struct Look {
    /// Ends the names of its pictures.
    std::string name;
    platform::Size size;
    bool rightToLeft = false;
    double textScale = 1;
    /// Pixels a point.
    double pictureScale = 2;
};

/// A store of all kinds of documents, shown in a window of that look, and its pictures.
class GalleryScene : public ScreenHouse {
public:
    GalleryScene(const Look& look, std::string folder);

    std::shared_ptr<platform::DocumentListController> list(std::string_view where = "");
    /// Draws the row's actions in beside it.
    void swipe(const platform::DocumentListController& list, std::size_t row);
    /// Shows the document over the list and waits until there is something to see of it.
    void preview(const std::string& file);
    /// Over the list of the default container; answers the chooser's stack.
    std::shared_ptr<platform::NavigationController> choose(const std::vector<platform::Url>& items);
    void openTarget(platform::NavigationController& stack, std::string_view name);
    void search(platform::DocumentListController& list, const std::string& text);
    /// Shows a screen without a toolbar.
    void showAlone(std::vector<std::shared_ptr<platform::ViewController>> screens);

    /// Writes "documents-<name>-<look>.png".
    void save(const std::string& name);
    /// What could not be drawn, in words; empty when all is well.
    const std::vector<std::string>& complaints() const { return complaints_; }

private:
    void fill();
    /// Lets what is decoded beside the main thread come in.
    void waitForPictures();
    void check(const std::string& file);

    const Look look_;
    const std::string folder_;
    std::vector<std::string> complaints_;
};

} // namespace test
