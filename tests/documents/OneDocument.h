#pragma once

#include "platform/documents/PlatformPreviewController.h"

#include <functional>
#include <optional>
#include <utility>

namespace test {

/// The preview of one document.
struct OneDocument : platform::PlatformPreviewController,
                     platform::PlatformPreviewDataSource,
                     platform::PlatformPreviewDelegate {
    explicit OneDocument(platform::Url theDocument) : document(std::move(theDocument)) {
        setDataSource(this);
        setDelegate(this);
    }
    std::size_t
    numberOfPreviewItemsInPreviewController(platform::PlatformPreviewController&) override {
        return 1;
    }
    std::optional<platform::Url>
    previewControllerPreviewItemAtIndex(platform::PlatformPreviewController&,
                                        std::size_t) override {
        return document;
    }
    void previewControllerDidShowItem(platform::PlatformPreviewController&,
                                      const platform::Url&) override {
        shown = true;
        if (whenShown)
            whenShown();
    }
    const platform::Url document;
    bool shown = false;
    std::function<void()> whenShown;
};

} // namespace test
