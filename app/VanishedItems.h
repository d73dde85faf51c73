#pragma once

#include "platform/base/MainQueue.h"
#include "platform/base/NotificationCenter.h"
#include "platform/base/WorkQueue.h"
#include "platform/cloud/SyncState.h"
#include "platform/ui/Window.h"

#include <memory>
#include <optional>

namespace platform {
class AlertController;
}

namespace tavrin {

/// Asks what it means that much has vanished at once from the store or from the account: the sync
/// engine lets nothing follow from it until the user has said so. Asks once for each such event,
/// and again whenever the program becomes active. Main thread.
class VanishedItems {
public:
    /// The window outlives it.
    explicit VanishedItems(platform::Window& window);
    ~VanishedItems();
    VanishedItems(const VanishedItems&) = delete;
    VanishedItems& operator=(const VanishedItems&) = delete;

private:
    void update();
    void ask(const platform::DeletionQuestion& question);
    void answer(platform::DeletionAnswer answer);

    platform::Window& window_;
    std::weak_ptr<platform::AlertController> alert_;
    /// What the alert asked last; not asked again before the program becomes active anew.
    std::optional<platform::DeletionQuestion> asked_;
    platform::Timer retry_;
    platform::WorkQueue answers_; // an answer waits for the store
    platform::Observation problemChanged_;
    platform::Observation becameActive_;
};

} // namespace tavrin
