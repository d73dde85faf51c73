#pragma once

#include "platform/base/Error.h"
#include "platform/files/Progress.h"
#include "platform/ui/AlertController.h"

#include <functional>
#include <memory>
#include <string>
#include <string_view>

namespace platform {

/// Shows it over whatever the program's visible window shows; false where there is no window.
bool presentOverWindow(const std::shared_ptr<ViewController>& screen, bool animated);

/// Tells the user what did not succeed, and why.
void showFailure(std::string_view title, const Error& error);

/// An alert that shows how far a download is, with a way out. Main thread.
class ProgressAlert {
public:
    ProgressAlert(std::string_view document, std::function<void()> cancelled);
    ~ProgressAlert();
    ProgressAlert(const ProgressAlert&) = delete;
    ProgressAlert& operator=(const ProgressAlert&) = delete;

    void present();
    void setProgress(std::int64_t completed, std::int64_t total);
    /// Takes it away and runs `then` when it has gone; at once when it was never shown.
    void finish(std::function<void()> then);

private:
    class Area;
    std::shared_ptr<Area> area_;
    std::shared_ptr<AlertController> alert_;
    bool shown_ = false;
};

} // namespace platform
