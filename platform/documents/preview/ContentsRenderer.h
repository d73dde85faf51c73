#pragma once

#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/ContentsPage.h"
#include "platform/documents/preview/PreviewRenderer.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/ui/qt/Bridge.h"

#include <memory>
#include <utility>

namespace platform {

/// Shows documents as a list of what is in them; subclasses read that on the worker's queue.
class ContentsRenderer : public PreviewRenderer {
public:
    std::shared_ptr<View> view() override { return view_; }

    void load(const Url& file) override {
        file_ = file;
        page_->list().setAccessibleName(shownName(file.lastPathComponent()));
        reload();
    }

protected:
    ContentsRenderer(MainQueue& main, PreviewReports reports)
        : reports_(std::move(reports)), worker_(main) {
        auto page = std::make_unique<ContentsPage>();
        page_ = page.get();
        view_ = std::make_shared<WidgetView>(std::move(page));
    }

    PreviewReports reports_;
    Url file_;
    ContentsPage* page_ = nullptr;

private:
    std::shared_ptr<View> view_;

protected:
    PreviewWorker worker_; // goes first
};

} // namespace platform
