#include "platform/ui/AlertContent.h"

#include "platform/base/Text.h"
#include "platform/ui/Application.h"
#include "platform/ui/Theme.h"
#include "platform/ui/ViewControllerImpl.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/ViewImpl.h"
#include "platform/ui/qt/WindowImpl.h"

#include <QWidget>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// Between an alert or popover and the edge of the window.
constexpr double windowMargin = 16;
constexpr double sheetMargin = 8;
constexpr double sheetGap = 8;
constexpr double widestSheet = 460;

std::vector<AlertAction::Pointer> without(std::vector<AlertAction::Pointer> actions,
                                          const AlertAction::Pointer& left) {
    std::erase(actions, left);
    return actions;
}

} // namespace

AlertController::Content::Form AlertController::Content::form() const {
    if (style == AlertStyle::alert)
        return Form::centered;
    const Application& application = Application::shared();
    return application.idiom() == DeviceIdiom::tablet &&
                   owner.traitCollection().horizontal == SizeClass::regular
               ? Form::popover
               : Form::bottomSheet;
}

void AlertController::Content::build() {
    View& view = *owner.impl().loadedView();
    for (const std::shared_ptr<View>& former :
         std::initializer_list<std::shared_ptr<View>>{dim, backdrop, card, cancelCard})
        if (former)
            former->removeFromSuperview();
    backdrop = nullptr;
    cancelCard = nullptr;
    cancelPanel = nullptr;
    builtForm = form();

    dim = std::make_shared<View>();
    dim->addTapHandler([this] {
        if (style == AlertStyle::actionSheet)
            escape();
    });
    dim->impl().role = QAccessible::Client;
    if (QWidget* const widget = widgetOf(*dim)) {
        widget->setFocusPolicy(Qt::NoFocus);
        widget->setCursor(Qt::ArrowCursor);
    }
    view.addSubview(dim);

    const auto choose = [this](const AlertAction::Pointer& action) { owner.choose(action); };
    const AlertAction::Pointer wayOut = escapeAction();
    const bool apart = builtForm == Form::bottomSheet && wayOut &&
                       wayOut->style() == ActionStyle::cancel && actions.size() > 1;
    AlertPanelParts parts{title,
                          message,
                          fields,
                          area ? area->view() : nullptr,
                          apart ? without(actions, wayOut) : actions,
                          defaultAction(),
                          wayOut,
                          style == AlertStyle::actionSheet};
    if (apart) {
        backdrop = std::make_shared<Card>(Card::Look::shadowOnly);
        backdrop->setUserInteractionEnabled(false);
        view.addSubview(backdrop);
    }
    card = std::make_shared<Card>(apart ? Card::Look::groundOnly : Card::Look::whole);
    const auto resized = [this] {
        if (View* const whole = owner.impl().loadedView())
            whole->setNeedsLayout();
    };
    panel = std::make_shared<AlertPanel>(parts, choose, resized);
    owner.impl().dialogName = title.empty() ? message : title;
    card->addSubview(panel);
    view.addSubview(card);
    if (apart) {
        cancelCard = std::make_shared<Card>(Card::Look::groundOnly);
        cancelPanel = std::make_shared<AlertPanel>(
            AlertPanelParts{{}, {}, {}, nullptr, {wayOut}, nullptr, wayOut, true}, choose, resized);
        cancelCard->addSubview(cancelPanel);
        view.addSubview(cancelCard);
    }
    owner.impl().entrance = {style == AlertStyle::actionSheet && builtForm == Form::bottomSheet
                                 ? Duration(Theme::pushTime)
                                 : Duration(Theme::alertTime),
                             [this](double shown) { showStep(shown); }};
    view.setNeedsLayout();
}

void AlertController::Content::rebuild() {
    if (owner.isViewLoaded())
        build();
}

void AlertController::Content::layout() {
    const View* const view = owner.impl().loadedView();
    if (!view || !card)
        return;
    if (form() != builtForm)
        build();
    const Rect whole = view->bounds();
    dim->setFrame(whole);
    switch (builtForm) {
    case Form::centered:
        layoutCentered(whole.inset(windowMargin, windowMargin));
        break;
    case Form::bottomSheet:
        layoutBottomSheet(whole.inset(sheetMargin, sheetMargin));
        break;
    case Form::popover:
        layoutPopover(whole.inset(sheetMargin, sheetMargin));
        break;
    }
    showStep(progress);
}

void AlertController::Content::layoutCentered(Rect room) {
    const double wanted = Theme::alertWidth * std::max(1.0, Application::shared().textScale());
    const double width = std::floor(std::min(room.width, wanted));
    const double height = std::min(panel->heightForWidth(width), room.height);
    card->setGround(
        {std::round(room.midX() - width / 2), std::round(room.midY() - height / 2), width, height});
    panel->setFrame(card->ground());
}

void AlertController::Content::layoutBottomSheet(Rect room) {
    const double width = std::floor(std::min(room.width, widestSheet));
    const double x = std::round(room.midX() - width / 2);
    double bottom = room.maxY();
    if (cancelPanel) {
        const double height = cancelPanel->heightForWidth(width);
        cancelCard->setGround({x, bottom - height, width, height});
        cancelPanel->setFrame(cancelCard->ground());
        bottom -= height + sheetGap;
    }
    const double height = std::min(panel->heightForWidth(width), bottom - room.y);
    card->setGround({x, bottom - height, width, height});
    panel->setFrame(card->ground());
    if (backdrop)
        backdrop->setGround({x, bottom - height, width, room.maxY() - bottom + height});
}

void AlertController::Content::layoutPopover(Rect room) {
    const double wanted = Theme::alertWidth * std::max(1.0, Application::shared().textScale());
    const double width = std::floor(std::min(room.width, wanted));
    const double height = std::min(panel->heightForWidth(width), room.height);
    const auto anchor = anchorInWindow();
    PopoverPlace place;
    if (anchor)
        place = placePopover(*anchor, {width, height}, room, directions);
    else
        place.panel = {std::round(room.midX() - width / 2), std::round(room.midY() - height / 2),
                       width, height};
    card->setGround(place.panel);
    card->setArrow(place.arrow, place.arrowAt);
    panel->setFrame(card->ground());
}

std::optional<Rect> AlertController::Content::anchorInWindow() const {
    if (const auto view = anchorView.lock(); view && view->window())
        return view->convertToWindow(anchorRect);
    const auto item = anchorItem.lock();
    if (const View* const shown = item ? item->shownView() : nullptr)
        return shown->convertToWindow(shown->bounds());
    return std::nullopt;
}

void AlertController::Content::showStep(double shown) {
    progress = shown;
    if (!card)
        return;
    dim->setBackgroundColor(Color::black.withAlpha(Theme::dimAlpha * shown));
    if (builtForm != Form::bottomSheet) {
        card->setAlpha(shown);
        card->impl().setScale(Theme::alertStartScale + (1 - Theme::alertStartScale) * shown);
        return;
    }
    const double below = dim->frame().height - card->frame().y - card->ground().y;
    const Point away{0, std::round((1 - shown) * std::max(0.0, below))};
    for (const auto& each : {backdrop, card, cancelCard})
        if (each)
            each->impl().setTranslation(away);
}

void AlertController::Content::takeFocus() const {
    if (!fields.empty()) {
        fields.front()->becomeFirstResponder();
        return;
    }
    // Where something could be destroyed the keyboard rests on the way out.
    const bool dangerous = std::ranges::any_of(
        actions, [](const auto& each) { return each->style() == ActionStyle::destructive; });
    const AlertAction::Pointer usual = dangerous ? escapeAction() : defaultAction();
    const AlertAction::Pointer first = usual || actions.empty() ? usual : actions.front();
    if (cancelPanel)
        cancelPanel->focusAction(first);
    panel->focusAction(first);
}

AlertAction::Pointer AlertController::Content::escapeAction() const {
    for (const auto& each : actions)
        if (each->style() == ActionStyle::cancel)
            return each;
    if (actions.size() == 1)
        return actions.front();
    const auto named = std::ranges::find_if(actions, [](const auto& each) {
        return each->style() == ActionStyle::standard && each->title() == localized("Cancel");
    });
    return named == actions.end() ? nullptr : *named;
}

AlertAction::Pointer AlertController::Content::defaultAction() const {
    if (actions.size() == 1)
        return actions.front();
    if (style == AlertStyle::actionSheet)
        return nullptr;
    const AlertAction::Pointer wayOut = escapeAction();
    for (auto each = actions.rbegin(); each != actions.rend(); ++each)
        if ((*each)->style() == ActionStyle::standard && *each != wayOut)
            return *each;
    return nullptr;
}

void AlertController::Content::escape() {
    if (const AlertAction::Pointer wayOut = escapeAction())
        owner.choose(wayOut);
    else if (style == AlertStyle::actionSheet && owner.impl().presentedIn)
        owner.impl().presentedIn->impl().presentations.dismissOne(owner, true, {});
}

void AlertController::Content::letGoOfHandlers() {
    for (const auto& each : actions)
        each->release();
}

} // namespace platform
