#pragma once

#include "platform/base/MainOwned.h"
#include "platform/files/Progress.h"
#include "preview/PreviewBaseViewController.h"

#include <atomic>
#include <memory>
#include <mutex>

namespace tavrin {

/// The progress side of a preview screen: its subscription and the step logged last. Of its own,
/// because the progress service calls from its own threads while the screen lives on the main one.
struct PreviewBaseViewController::ProgressState
    : std::enable_shared_from_this<PreviewBaseViewController::ProgressState> {
    /// Subscribes for `file`; changes go to `screen` while it is there.
    void begin(const platform::Url& file, std::weak_ptr<PreviewBaseViewController> screen);
    void end();
    void resetChunk() { lastChunk = -1; }
    /// Logs the change: at the more visible level when a new 5 % step is reached.
    void logStep(const platform::Progress& progress);

    std::mutex mutex;
    platform::FileProgressSubscription::Token subscriber; // guarded by mutex
    std::atomic<int> lastChunk{-1};

private:
    using Screen = platform::MainOwned<PreviewBaseViewController>;

    /// The screen, held for a frame and for all reports that come meanwhile: the main thread is
    /// asked to let go of it sixty times a second at most, however many reports there are.
    std::shared_ptr<Screen> hold(const std::weak_ptr<PreviewBaseViewController>& screen);

    platform::FileProgressSubscription::Unpublished
    observe(const std::shared_ptr<platform::Progress>& progress,
            const std::weak_ptr<PreviewBaseViewController>& screen);

    std::weak_ptr<Screen> held_; // guarded by mutex
};

} // namespace tavrin
