#include "app/VanishedItems.h"

#include "app/FreeScreen.h"
#include "app/VXLogging.h"
#include "platform/Platform.h"
#include "platform/base/Identity.h"
#include "platform/base/Text.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/cloud/CloudService.h"
#include "platform/ui/AlertController.h"
#include "platform/ui/Application.h"

namespace tavrin {
namespace {

using platform::ActionStyle;
using platform::AlertAction;
using platform::DeletionAnswer;
using platform::localized;
using platform::Platform;

} // namespace

VanishedItems::VanishedItems(platform::Window& window)
    : window_(window), answers_(std::string(platform::applicationIdentifier) + ".vanisheditems") {
    Platform& platform = Platform::current();
    problemChanged_ =
        platform.notifications().observe(platform::cloudProblemDidChangeNotification,
                                         [this](const platform::Notification&) { update(); });
    becameActive_ = platform.notifications().observe(
        platform::applicationDidBecomeActiveNotification, [this](const platform::Notification&) {
            asked_.reset();
            update();
        });
    update();
}

VanishedItems::~VanishedItems() = default;

void VanishedItems::update() {
    const std::optional<platform::DeletionQuestion> question =
        Platform::current().cloud().question();
    if (!question) {
        retry_.cancel();
        asked_.reset();
        if (const std::shared_ptr<platform::AlertController> alert = alert_.lock())
            alert->dismissViewController(true);
        alert_.reset();
        return;
    }
    if (alert_.lock() || asked_ == question)
        return;
    ask(*question);
}

void VanishedItems::ask(const platform::DeletionQuestion& question) {
    const std::shared_ptr<platform::ViewController> screen = freeScreen(window_);
    if (!screen) {
        retry_ = Platform::current().mainQueue().timer(questionDelay, [this] { update(); });
        return;
    }
    asked_ = question;
    const bool here = question.side == platform::Side::local;
    auto alert =
        platform::AlertController::create(localized("Delete or Bring Back?"),
                                          platform::textOf(question), platform::AlertStyle::alert);
    alert->addAction(AlertAction::make(localized("Bring Them Back"), ActionStyle::standard,
                                       [this](AlertAction&) { answer(DeletionAnswer::putBack); }));
    alert->addAction(AlertAction::make(
        localized(here ? "Delete on the Account Too" : "Delete on This Device Too"),
        ActionStyle::destructive, [this](AlertAction&) { answer(DeletionAnswer::deleteThem); }));
    alert->addAction(AlertAction::make(localized("Decide Later"), ActionStyle::cancel,
                                       [this](AlertAction&) { alert_.reset(); }));
    alert_ = alert;
    screen->presentViewController(alert, true);
}

void VanishedItems::answer(DeletionAnswer answer) {
    alert_.reset();
    answers_.async([answer] {
        if (const platform::Failure failure = Platform::current().cloud().answer(answer))
            VXLOG(vxError, "Cannot tell the store what vanished items mean: %@", *failure);
    });
}

} // namespace tavrin
