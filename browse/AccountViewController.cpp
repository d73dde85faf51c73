#include "browse/AccountViewController.h"

#include "app/VXLogging.h"
#include "browse/NavController.h"
#include "browse/PasswordQuestion.h"
#include "items/UIUtils.h"
#include "platform/Platform.h"
#include "platform/base/Identity.h"
#include "platform/base/Text.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/ui/Theme.h"
#include "preview/PreviewItemManager.h"

#include <chrono>

namespace tavrin {
namespace {

using platform::localized;
using platform::localizedFormat;
using platform::Platform;
using platform::TextStyle;
using platform::Theme;

constexpr double sectionGap = 24;
constexpr double smallGap = 4;
constexpr std::size_t linesAtMost = 8;
constexpr std::size_t accountsAtMost = 5;
/// How far transfers are changes without a notice.
constexpr auto refreshInterval = std::chrono::milliseconds(700);

std::string placeText(const platform::AccountRecord& account) {
    return account.user.empty()
               ? account.address
               : localizedFormat("%1$@ at %2$@", account.user, account.address);
}

} // namespace

void AccountViewController::Section::show(const std::string& words) const {
    const bool hidden = words.empty();
    text->setText(words);
    heading->setHidden(hidden);
    text->setHidden(hidden);
    for (const auto& button : buttons)
        button->setHidden(hidden);
}

AccountViewController::AccountViewController()
    : account_(Platform::current().accountManager().active()),
      queue_(std::make_unique<platform::WorkQueue>(
          std::string(platform::applicationIdentifier) + ".accountpage")) {
}

AccountViewController::~AccountViewController() = default;

std::shared_ptr<AccountViewController> AccountViewController::create() {
    const std::shared_ptr<AccountViewController> screen(new AccountViewController());
    screen->setTitle(localized("Account"));
    return screen;
}

std::shared_ptr<AccountViewController> AccountViewController::self() {
    return std::static_pointer_cast<AccountViewController>(shared_from_this());
}

AccountViewController::Section AccountViewController::addSection(std::string_view heading) {
    Section section{form_->addText(TextStyle::headline, Theme::text, sectionGap),
                    form_->addText(TextStyle::subheadline, Theme::secondaryText, smallGap),
                    {}};
    section.heading->setText(heading);
    return section;
}

std::shared_ptr<platform::Button>
AccountViewController::addButton(std::string_view title, FormView::Look look,
                                 void (AccountViewController::*action)()) {
    return form_->addButton(title, look, [weak = std::weak_ptr(self()), action] {
        if (const auto screen = weak.lock())
            (*screen.*action)();
    });
}

void AccountViewController::loadView() {
    form_ = std::make_shared<FormView>();
    const auto name = form_->addText(TextStyle::title2, Theme::text, 0);
    const auto place = form_->addText(TextStyle::subheadline, Theme::secondaryText, smallGap);
    if (account_) {
        name->setText(account_->name);
        place->setText(placeText(*account_));
    }
    state_ = form_->addText(TextStyle::body, Theme::text, sectionGap / 2);
    addDecisions();
    transfers_ = addSection(localized("On Its Way"));
    waiting_ = addSection(localized("Waiting"));
    addButton(localized("Sync Now"), FormView::Look::primary, &AccountViewController::syncNow);
    addOtherAccounts();
    addButton(localized("Sign In to Another Account…"), FormView::Look::plain,
              &AccountViewController::addAccount);
    signOut_ = addButton(localized("Sign Out…"), FormView::Look::destructive,
                         &AccountViewController::signOut);
    show(report_);
    setView(form_);
}

void AccountViewController::addDecisions() {
    password_ = addSection(localized("The Password Is Wanted"));
    password_.buttons = {addButton(localized("Enter Password…"), FormView::Look::plain,
                                   &AccountViewController::givePassword)};
    vanished_ = addSection(localized("Delete or Bring Back?"));
    vanished_.buttons = {addButton(localized("Bring Them Back"), FormView::Look::plain,
                                   &AccountViewController::bringBack),
                         addButton(localized("Delete on Both Sides"), FormView::Look::destructive,
                                   &AccountViewController::deleteThem)};
    conflicts_ = addSection(localized("Changed on Both Sides"));
    conflicts_.buttons = {addButton(localized("Show the First"), FormView::Look::plain,
                                    &AccountViewController::showConflict)};
    refused_ = addSection(localized("Names That Cannot Be Kept"));
}

void AccountViewController::addOtherAccounts() {
    std::size_t shown = 0;
    for (const platform::AccountRecord& other : Platform::current().accountManager().accounts()) {
        if ((account_ && other.identity == account_->identity) || shown++ == accountsAtMost)
            continue;
        form_->addButton(localizedFormat("Use “%1$@”", other.name), FormView::Look::plain,
                         [weak = std::weak_ptr(self()), other] {
                             const auto failure =
                                 Platform::current().accountManager().use(other);
                             if (const auto screen = weak.lock(); screen && failure)
                                 UIUtils::showError(failure, screen);
                         });
    }
}

void AccountViewController::viewWillAppear(bool animated) {
    ViewController::viewWillAppear(animated);
    inSight_ = true;
    const auto changed = [this](const platform::Notification&) { refresh(); };
    platform::NotificationCenter& center = Platform::current().notifications();
    observations_ = {center.observe(platform::cloudProblemDidChangeNotification, changed),
                     center.observe(platform::cloudActivityDidChangeNotification, changed)};
    refresh();
}

void AccountViewController::viewWillDisappear(bool animated) {
    ViewController::viewWillDisappear(animated);
    inSight_ = false;
    observations_ = {};
    next_.cancel();
}

bool AccountViewController::performKeyCommand(platform::KeyCommand command) {
    if (command != platform::KeyCommand::cancel || !navigationController())
        return ViewController::performKeyCommand(command);
    navigationController()->popViewController(true);
    return true;
}

void AccountViewController::refresh() {
    if (asking_ || !inSight_)
        return;
    asking_ = true;
    queue_->async([weak = std::weak_ptr(self())] {
        Platform::current().mainQueue().async([weak, report = makeAccountReport()] {
            const auto screen = weak.lock();
            if (!screen)
                return;
            screen->asking_ = false;
            screen->show(report);
            if (screen->inSight_)
                screen->next_ = Platform::current().mainQueue().timer(refreshInterval, [weak] {
                    if (const auto again = weak.lock())
                        again->refresh();
                });
        });
    });
}

void AccountViewController::show(const AccountReport& report) {
    report_ = report;
    state_->setText(stateText(report));
    transfers_.show(linesOf(report.transfers, linesAtMost));
    waiting_.show(linesOf(report.waiting, linesAtMost));
    password_.show(Platform::current().cloud().passwordWanted().value_or(""));
    vanished_.show(report.question ? platform::textOf(*report.question) : "");
    conflicts_.show(report.conflicts.empty()
                        ? ""
                        : localized("Both versions are kept side by side. Compare them and delete "
                                    "the one that you do not want.") +
                              '\n' + linesOf(report.conflicts, linesAtMost));
    refused_.show(linesOf(report.refused, linesAtMost));
}

std::string AccountViewController::stateText(const AccountReport& report) const {
    if (const auto problem = Platform::current().accounts().problem())
        return *problem;
    if (!report.transfers.empty())
        return transferSummary(Platform::current().cloud().transfers());
    if (syncing_)
        return localized("Comparing both sides…");
    if (!report.waiting.empty())
        return localized("Something waits. It is tried again by itself.");
    return localized("Everything is on both sides.");
}

void AccountViewController::syncNow() {
    VXLOG(vxInfo, "Sync now");
    syncing_ = true;
    show(report_);
    Platform::current().cloud().sync([weak = std::weak_ptr(self())](const platform::Failure&) {
        Platform::current().mainQueue().async([weak] {
            const auto screen = weak.lock();
            if (!screen)
                return;
            screen->syncing_ = false;
            screen->refresh();
        });
    });
}

void AccountViewController::givePassword() {
    if (const auto why = Platform::current().cloud().passwordWanted(); why && account_)
        askForPassword(self(), *account_, *why);
}

void AccountViewController::bringBack() {
    answer(platform::DeletionAnswer::putBack);
}

void AccountViewController::deleteThem() {
    answer(platform::DeletionAnswer::deleteThem);
}

void AccountViewController::answer(platform::DeletionAnswer answer) {
    queue_->async([answer] {
        if (const platform::Failure failure = Platform::current().cloud().answer(answer))
            VXLOG(vxError, "Cannot tell the store what vanished items mean: %@", *failure);
    });
}

void AccountViewController::showConflict() {
    const std::optional<platform::Url> root = Platform::current().documents().shelfroot();
    auto* const stack = dynamic_cast<NavController*>(navigationController());
    if (!root || !stack || report_.conflicts.empty())
        return;
    stack->showURLPreview(platform::Url::file(root->path() + '/' + report_.conflicts.front()),
                          detailsMode);
}

void AccountViewController::addAccount() {
    auto sheet = platform::AlertController::create("", "", platform::AlertStyle::actionSheet);
    const auto add = [&](std::string_view title, SignInViewController::Kind kind) {
        sheet->addAction(platform::AlertAction::make(
            title, platform::ActionStyle::standard,
            [weak = std::weak_ptr(self()), kind](platform::AlertAction&) {
                const auto screen = weak.lock();
                if (auto* const stack =
                        screen ? dynamic_cast<NavController*>(screen->navigationController())
                               : nullptr)
                    stack->showSignIn(kind);
            }));
    };
    add(localized("Sign In to a Server…"), SignInViewController::Kind::server);
    add(localized("Use a Folder…"), SignInViewController::Kind::folder);
    sheet->addAction(
        platform::AlertAction::make(localized("Cancel"), platform::ActionStyle::cancel));
    sheet->setPopoverAnchor(signOut_, signOut_->bounds(), platform::ArrowDirection::any);
    presentViewController(sheet, true);
}

} // namespace tavrin
