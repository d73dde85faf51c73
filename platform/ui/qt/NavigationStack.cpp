#include "platform/ui/qt/NavigationStack.h"

#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/ApplicationImpl.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/WindowImpl.h"

#include <algorithm>

namespace platform {
namespace {

/// Where the view stands in its window by frames alone, whatever slides at the moment.
double topInWindow(const View& view) {
    double y = 0;
    for (const View* each = &view; each; each = each->superview())
        y += each->frame().y;
    return y;
}

} // namespace

void NavigationController::Stack::build(View& view) {
    view.setBackgroundColor(Theme::page);
    pages = std::make_shared<View>();
    pages->setDebugName("pages");
    bar = std::make_shared<NavigationBar>();
    toolbar = std::make_shared<Toolbar>();
    edge = std::make_shared<View>();
    edge->setBackgroundColor(Theme::hairline);
    edge->setHidden(true);
    toolbar->setHidden(toolbarHidden);
    view.addSubview(pages);
    view.addSubview(bar);
    view.addSubview(toolbar);
    bar->setBackHandler([this] { owner.popViewController(true); });
    swipe = std::make_unique<EdgeSwipe>(
        *widgetOf(*pages),
        EdgeSwipe::Handlers{[this] { return maySwipe(); }, [this] { beginSwipe(); },
                            [this](double progress) { showProgress(progress); },
                            [this](bool far) { endSwipe(far); }});
    showTop();
}

double NavigationController::Stack::topInset() const {
    const View* const view = owner.impl().loadedView();
    if (!view || !view->window() || !owner.extendsUnderBars())
        return 0;
    const double strip = view->window()->statusBarFrame().maxY();
    return std::max(0.0, strip - topInWindow(*view));
}

Rect NavigationController::Stack::barFrame() const {
    const View* const view = owner.impl().loadedView();
    return {0, topInset(), view ? view->bounds().width : 0, NavigationBar::contentHeight()};
}

Rect NavigationController::Stack::toolbarFrame() const {
    const View* const view = owner.impl().loadedView();
    const Size size = view ? view->bounds().size() : Size{};
    return {0, size.height - Toolbar::height(), size.width, Toolbar::height()};
}

void NavigationController::Stack::layout() {
    const View* const view = owner.impl().loadedView();
    if (!view || !pages)
        return;
    pages->setFrame(view->bounds());
    const Rect content = barFrame();
    bar->setFrame({0, 0, content.width, content.maxY()});
    toolbar->setFrame(toolbarFrame());
    const double line = view->window() ? 1 / view->window()->screenScale() : 1;
    edge->setFrame({0, 0, line, view->bounds().height});
    if (transition) {
        placePage(*transition->fromPage, *transition->from);
        placePage(*transition->toPage, *transition->to);
    } else if (topPage && top()) {
        placePage(*topPage, *top());
    }
}

void NavigationController::Stack::placePage(View& page, const ViewController& screen) {
    page.setFrame(pages->bounds());
    Rect area = pages->bounds();
    if (!screen.extendsUnderBars()) {
        const double bottom = toolbarHidden ? area.height : toolbarFrame().y;
        area.y = barFrame().maxY();
        area.height = std::max(0.0, bottom - area.y);
    }
    screen.impl().loadedView()->setFrame(area);
}

std::shared_ptr<View> NavigationController::Stack::makePage(const Screen& screen) {
    auto page = std::make_shared<View>();
    page->setBackgroundColor(Theme::page);
    page->setDebugName("page");
    const auto view = screen->view();
    view->setLaidOutByConstraints(false);
    page->addSubview(view);
    return page;
}

/// Shows the top screen without any transition.
void NavigationController::Stack::showTop() {
    if (!pages)
        return;
    if (topPage)
        topPage->removeFromSuperview();
    topPage = nullptr;
    if (const Screen screen = top()) {
        topPage = makePage(screen);
        pages->addSubview(topPage);
        follow(screen);
    }
    updateBar();
    updateToolbar();
    layout();
}

/// The bars hear of changes of the top screen's items, and of the title that the way back bears.
void NavigationController::Stack::follow(const Screen& screen) {
    Screens others = screens;
    if (transition)
        others.push_back(transition->from);
    for (const Screen& each : others) {
        each->navigationItem().setChangeHandler({});
        each->impl().toolbarItemsChanged = {};
    }
    screen->navigationItem().setChangeHandler([this] { updateBar(); });
    if (screens.size() > 1)
        screens[screens.size() - 2]->navigationItem().setChangeHandler([this] { updateBar(); });
    screen->impl().toolbarItemsChanged = [this](bool) { updateToolbar(); };
}

BarEntry NavigationController::Stack::entryFor(std::size_t index) const {
    NavigationItem& item = screens[index]->navigationItem();
    BarEntry entry{item.title(), std::nullopt, item.rightBarButtonItems()};
    if (index > 0 && !item.hidesBackButton())
        entry.backTitle = screens[index - 1]->navigationItem().title();
    return entry;
}

void NavigationController::Stack::updateBar() {
    if (!bar)
        return;
    bar->show(screens.empty() ? BarEntry{} : entryFor(screens.size() - 1));
}

void NavigationController::Stack::updateToolbar() {
    if (toolbar)
        toolbar->setItems(top() ? top()->toolbarItems() : std::vector<BarButtonItem::Pointer>{});
}

void NavigationController::Stack::step(AppearanceStep step, bool animated) {
    if (step != AppearanceStep::willAppear)
        finishTransition();
    const Screen screen = top();
    if (!screen)
        return;
    screen->impl().take(step, animated);
    const auto listener = delegate.lock();
    if (step == AppearanceStep::willAppear && listener)
        listener->navigationControllerWillShowViewController(owner, *screen, animated);
    if (step == AppearanceStep::didAppear)
        didShow(animated);
}

void NavigationController::Stack::didShow(bool animated) {
    const auto listener = delegate.lock();
    if (const Screen screen = top(); screen && listener)
        listener->navigationControllerDidShowViewController(owner, *screen, animated);
    if (Application::Impl* const application = applicationImpl())
        application->saveStateSoon();
}

} // namespace platform
