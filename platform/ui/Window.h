#pragma once

#include "platform/ui/ViewController.h"

#include <functional>

namespace platform {

/// The text and the states that the strip at the top of the window shows.
struct StatusStripContent {
    std::string account;
    std::string network;
    bool activity = false;
    bool operator==(const StatusStripContent&) const = default;
};

/// The program's window: a status strip above its root screen, overlays above both, one solver for
/// the constraints of its whole tree.
class Window {
public:
    /// An empty frame, or one as large as the screen, stands for the device's own size on a desk.
    explicit Window(Rect frame);
    ~Window();
    Window(const Window&) = delete;
    Window& operator=(const Window&) = delete;

    void setRootViewController(std::shared_ptr<ViewController> root);
    std::shared_ptr<ViewController> rootViewController() const;
    void setBackgroundColor(Color color);
    void makeKeyAndVisible();
    bool isVisible() const;
    void close();

    Size size() const;
    /// As a user's resize or rotation does; no smaller than 320 x 480, or 480 x 320 when turned.
    void resize(Size size);
    TraitCollection traitCollection() const;
    Orientation orientation() const;
    /// Pixels a point of the screen that shows the window.
    double screenScale() const;
    Rect statusBarFrame() const;
    void setStatusStrip(const StatusStripContent& content);
    const StatusStripContent& statusStrip() const;
    /// A tap on the strip. What it does must be in reach of the keyboard as well.
    void setStatusStripHandler(std::function<void()> tapped);

    /// Lays everything out now; true when something was dirty.
    bool layoutIfNeeded();
    /// The window as a PNG, at `scale` pixels a point.
    Bytes snapshotPng(double scale = 1) const;

    struct Impl;
    Impl& impl() const { return *impl_; }

private:
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
