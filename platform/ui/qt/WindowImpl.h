#pragma once

#include "platform/ui/StatusStrip.h"
#include "platform/ui/Window.h"
#include "platform/ui/layout/LayoutEngine.h"
#include "platform/ui/qt/Presentations.h"
#include "platform/ui/qt/WindowWidget.h"

#include <QPointer>

#include <memory>

namespace platform {

struct Window::Impl {
    Impl(Window& owner, Rect wanted);
    ~Impl();

    void resize(Size wanted);
    /// What a user may shrink the window to, in the orientation that it has.
    void applyMinimum(Size now);
    void scheduleLayout();
    bool layout();
    void place();
    void sizeChanged();
    void screenChanged();
    void settingsChanged();
    void willClose();
    void show();

    void addHost(const std::shared_ptr<View>& host);
    void restackStrip();
    Rect wholeArea() const;
    Rect areaBelowStrip() const;
    bool sendKeyCommand(KeyCommand command);
    const QWidget& focusScope() const;
    QImage picture(double scale) const;

    Window& owner;
    QPointer<WindowWidget> widget;
    // Before the views: they leave it when they go.
    LayoutEngine engine;
    std::shared_ptr<View> rootView;
    std::shared_ptr<StatusStrip> strip;
    std::shared_ptr<ViewController> root;
    Presentations presentations;
    Size size;
    bool visible = false;
    bool inLayout = false;
};

} // namespace platform
