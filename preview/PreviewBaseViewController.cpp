#include "preview/PreviewBaseViewController.h"

#include "app/VXLogging.h"
#include "browse/LaunchUtils.h"
#include "items/UIUtils.h"
#include "platform/ui/Application.h"
#include "platform/ui/NavigationController.h"
#include "preview/PreviewItemManager.h"
#include "preview/ProgressState.h"

#include <algorithm>

namespace tavrin {
namespace {

using platform::BarButtonItem;
using platform::LayoutAttribute;
using platform::LayoutConstraint;
using platform::SizeClass;
using platform::SystemItem;

constexpr double firstInset = 8; // before the margins are known
constexpr double narrowMargin = 17;
constexpr double wideMargin = 45;

} // namespace

PreviewBaseViewController::PreviewBaseViewController()
    : progress_(std::make_shared<ProgressState>()) {
    setExtendsUnderBars(true); // the margins keep the content clear of the bars
}

PreviewBaseViewController::~PreviewBaseViewController() {
    progress_->end();
}

void PreviewBaseViewController::loadView() {
    ViewController::loadView();
    wrapperView_ = std::make_shared<platform::View>();
    wrapperView_->setLaidOutByConstraints(true);
    view()->addSubview(wrapperView_);
    progress_->resetChunk();
}

void PreviewBaseViewController::viewDidLoad() {
    ViewController::viewDidLoad();
    view()->setBackgroundColor(platform::Color::white);
}

void PreviewBaseViewController::viewWillAppear(bool animated) {
    ViewController::viewWillAppear(animated);
    configureButtons();
    setupConstraints();
    refreshItem();
}

void PreviewBaseViewController::viewWillDisappear(bool animated) {
    unregisterProgress();
    if (const auto manager = itemManager())
        manager->viewControllerWillDisappear(*this);
    ViewController::viewWillDisappear(animated);
}

void PreviewBaseViewController::setupConstraints() {
    if (!navigationController())
        return;
    const std::vector<LayoutConstraint::Pointer> earlier = {leadingConstraint_, trailingConstraint_,
                                                            topConstraint_, bottomConstraint_};
    if (leadingConstraint_)
        LayoutConstraint::deactivate(earlier);
    const auto pinned = [this](LayoutAttribute edge, double inset) {
        return LayoutConstraint::equal(*wrapperView_, edge, *view(), edge, inset);
    };
    leadingConstraint_ = pinned(LayoutAttribute::leading, firstInset);
    trailingConstraint_ = pinned(LayoutAttribute::trailing, -firstInset);
    topConstraint_ = pinned(LayoutAttribute::top, firstInset);
    bottomConstraint_ = pinned(LayoutAttribute::bottom, -firstInset);
    configureMargins();
    LayoutConstraint::activate(
        {leadingConstraint_, trailingConstraint_, topConstraint_, bottomConstraint_});
}

void PreviewBaseViewController::configureMargins() {
    if (!leadingConstraint_)
        return;
    const platform::TraitCollection traits = traitCollection();
    const bool wide =
        traits.horizontal == SizeClass::regular && traits.vertical == SizeClass::regular;
    const double side = wide ? wideMargin : narrowMargin;
    leadingConstraint_->setConstant(side);
    trailingConstraint_->setConstant(-side);

    const platform::Rect bounds = view()->bounds();
    const double vertical = bounds.height > 2 * bounds.width ? wideMargin : side;
    const platform::NavigationController* stack = navigationController();
    const double toolbar = stack && !stack->isToolbarHidden() ? stack->toolbarFrame().height : 0;
    const double bar = stack ? stack->navigationBarFrame().height : 0;
    const platform::Rect status = platform::Application::shared().statusBarFrame();
    topConstraint_->setConstant(std::min(status.width, status.height) + vertical + bar);
    bottomConstraint_->setConstant(-(vertical + toolbar));
}

platform::Orientation PreviewBaseViewController::currentPseudoOrientation() const {
    const platform::TraitCollection traits = traitCollection();
    if (traits.horizontal == SizeClass::compact && traits.vertical == SizeClass::regular)
        return platform::Orientation::portrait;
    return platform::Application::shared().statusBarOrientation();
}

bool PreviewBaseViewController::itemHasUrl() const {
    const auto manager = itemManager();
    const auto item = manager ? manager->item() : nullptr;
    return item && item->url();
}

void PreviewBaseViewController::refreshItem() {
    const bool enabled = itemHasUrl();
    for (const BarButtonItem::Pointer& item : {actionItem_, deleteItem_, moveItem_})
        if (item)
            item->setEnabled(enabled);
    progress_->resetChunk();
}

std::function<void()> PreviewBaseViewController::calling(Operation operation) {
    return [weak = weak_from_this(), operation] {
        if (const auto self = std::static_pointer_cast<PreviewBaseViewController>(weak.lock()))
            ((*self).*operation)();
    };
}

void PreviewBaseViewController::configureButtons() {
    const auto button = [this](SystemItem image, Operation operation) {
        return BarButtonItem::withSystemItem(
            image, [call = calling(operation)](BarButtonItem&) { call(); });
    };
    moveItem_ = button(SystemItem::organize, &PreviewBaseViewController::showMoveTarget);
    deleteItem_ =
        button(SystemItem::trash, &PreviewBaseViewController::showWarningAndDeleteDocument);
    actionItem_ = button(SystemItem::action, &PreviewBaseViewController::showDocumentActivities);
    const BarButtonItem::Pointer openItem = makeOpenItem();
    if (!itemHasUrl())
        for (const BarButtonItem::Pointer& item : {actionItem_, deleteItem_, moveItem_})
            item->setEnabled(false);
    placeButtons(openItem);
}

BarButtonItem::Pointer PreviewBaseViewController::makeOpenItem() {
    const auto control = openInAppNavControllerButton();
    if (!control)
        return nullptr;
    // A control that comes back at a later appearance is connected already.
    if (connectedControl_.lock() != control)
        control->addAction(platform::ControlEvent::touchUpInside,
                           calling(&PreviewBaseViewController::openInDefaultApp));
    connectedControl_ = control;
    control->sizeToFit();
    return BarButtonItem::withCustomView(control);
}

void PreviewBaseViewController::placeButtons(const BarButtonItem::Pointer& openItem) {
    platform::NavigationController* stack = navigationController();
    if (UIUtils::tabloMode()) {
        const auto fixed = BarButtonItem::withSystemItem(SystemItem::fixedSpace);
        navigationItem().setRightBarButtonItems(
            {actionItem_, fixed, deleteItem_, fixed, moveItem_});
        if (stack)
            stack->setToolbarHidden(true, false);
        return;
    }
    const auto flexible = BarButtonItem::withSystemItem(SystemItem::flexibleSpace);
    setToolbarItems({actionItem_, flexible, deleteItem_, flexible, moveItem_});
    if (stack)
        stack->setToolbarHidden(false, false);
    if (openItem && mode_ == detailsMode)
        navigationItem().setRightBarButtonItem(openItem);
}

void PreviewBaseViewController::openInDefaultApp() {
    const auto manager = itemManager();
    if (manager && itemHasUrl())
        LaunchUtils::openInDefaultApp(*manager->item()->url(), true, [](bool) {});
}

void PreviewBaseViewController::showWarningAndDeleteDocument() {
    if (const auto manager = itemManager())
        manager->showWarningAndDeleteDocument(shared_from_this(), deleteItem_);
}

void PreviewBaseViewController::showMoveTarget() {
    if (const auto manager = itemManager())
        manager->showMoveTarget(*this);
}

void PreviewBaseViewController::showDocumentActivities() {
    const auto manager = itemManager();
    if (!manager || !itemHasUrl())
        return;
    const std::optional<platform::Url> url = manager->item()->resolvedURL();
    if (!url) {
        VXLOG(vxWarning, "showDocumentActivities: url is wrong class: %@",
              platform::Value().kindName());
        return;
    }
    VXLOG(vxInfo, "showDocumentActivities: %@", *url);
    const auto menu = platform::DocumentInteractionController::create(*url);
    manager->setDocumentInteractionController(menu);
    menu->presentOptionsMenuFromBarButtonItem(actionItem_, true);
}

} // namespace tavrin
