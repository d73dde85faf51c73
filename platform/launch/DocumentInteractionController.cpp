#include "platform/launch/DocumentInteractionController.h"

#include "platform/base/Identity.h"
#include "platform/base/Text.h"
#include "platform/launch/Alerts.h"
#include "platform/launch/ApplicationDatabase.h"
#include "platform/launch/ApplicationStart.h"
#include "platform/launch/DocumentClipboard.h"
#include "platform/launch/DocumentFetch.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/AlertController.h"

#include <utility>

namespace platform {
namespace {

using Entry = ApplicationDatabase::Entry;

std::string mimeTypeOf(const Url& document) {
    return TypeRegistry::mimeTypeForIdentifier(TypeRegistry::identifierForFile(document.path()));
}

std::string failureTitle(std::string_view key, const Url& document) {
    return localizedFormat(key, document.lastPathComponent());
}

void openIn(const Entry& application, const Url& document) {
    const std::string title = failureTitle("“%1$@” could not be opened", document);
    DocumentFetch::start(
        {document, "open in " + application->id, title, [application, title](const Url& local) {
             const auto tell = [title](const Error& error) { showFailure(title, error); };
             if (const Failure failure = ApplicationStart::open(*application, local, tell))
                 tell(*failure);
         }});
}

void copy(const Url& document) {
    DocumentFetch::start(
        {document, "copy", failureTitle("“%1$@” could not be copied", document), copyDocument});
}

/// The common helper knows how each mail program takes an attachment; without it the address says
/// so, which most programs understand.
Failure startMail(const Entry& handler, const Url& document,
                  const ApplicationStart::EndedAtOnce& tell) {
    if (const auto helper = findProgram("xdg-email"))
        return ApplicationStart::run({*helper, "--attach", document.path()}, handler->localizedName,
                                     {}, tell);
    const std::string address = "mailto:?subject=" + percentEncoded(document.lastPathComponent()) +
                                "&attach=" + percentEncoded(document.path(), "/");
    return ApplicationStart::open(*handler, Url::parse(address), tell);
}

void sendByMail(const Entry& handler, const Url& document) {
    const std::string title = failureTitle("“%1$@” could not be sent", document);
    DocumentFetch::start({document, "mail", title, [handler, title](const Url& local) {
                              const auto tell = [title](const Error& error) {
                                  showFailure(title, error);
                              };
                              if (const Failure failure = startMail(handler, local, tell))
                                  tell(*failure);
                          }});
}

} // namespace

struct DocumentInteractionController::Impl {
    Url url;
    std::weak_ptr<DocumentInteractionControllerDelegate> delegate;
    std::weak_ptr<AlertController> menu;

    std::shared_ptr<AlertController> makeMenu(const std::shared_ptr<MenuLife>& shown) const;
    bool present(const std::shared_ptr<DocumentInteractionController>& owner,
                 const std::function<void(AlertController& menu)>& place, bool animated);
};

/// Held by every choice of a menu that is shown: goes, and tells the delegate, when the menu has
/// gone, however it went.
struct DocumentInteractionController::MenuLife {
    MenuLife() = default;
    ~MenuLife();
    MenuLife(const MenuLife&) = delete;
    MenuLife& operator=(const MenuLife&) = delete;

    std::shared_ptr<DocumentInteractionController> owner;
};

std::shared_ptr<DocumentInteractionController>
DocumentInteractionController::create(const Url& document) {
    auto impl = std::make_unique<Impl>();
    impl->url = document;
    return std::shared_ptr<DocumentInteractionController>(
        new DocumentInteractionController(std::move(impl)));
}

DocumentInteractionController::DocumentInteractionController(std::unique_ptr<Impl> impl)
    : impl_(std::move(impl)) {
}

DocumentInteractionController::~DocumentInteractionController() = default;

const Url& DocumentInteractionController::url() const {
    return impl_->url;
}

void DocumentInteractionController::setDelegate(
    std::weak_ptr<DocumentInteractionControllerDelegate> delegate) {
    impl_->delegate = std::move(delegate);
}

std::optional<ApplicationRecord> DocumentInteractionController::defaultApplication() const {
    if (const Entry entry = ApplicationDatabase::shared().defaultFor(mimeTypeOf(impl_->url)))
        return recordOf(*entry);
    return std::nullopt;
}

bool DocumentInteractionController::openWithDefaultApplication() {
    const Entry entry = ApplicationDatabase::shared().defaultFor(mimeTypeOf(impl_->url));
    if (!entry || entry->id == applicationIdentifier)
        return false;
    openIn(entry, impl_->url);
    return true;
}

std::shared_ptr<AlertController>
DocumentInteractionController::Impl::makeMenu(const std::shared_ptr<MenuLife>& shown) const {
    auto sheet = AlertController::create(url.lastPathComponent(), "", AlertStyle::actionSheet);
    const auto add = [&](const std::string& title, std::function<void()> chosen) {
        sheet->addAction(
            AlertAction::make(title, ActionStyle::standard,
                              [shown, chosen = std::move(chosen)](AlertAction&) { chosen(); }));
    };
    ApplicationDatabase& database = ApplicationDatabase::shared();
    for (const Entry& entry : database.applicationsFor(mimeTypeOf(url)))
        add(localizedFormat("Open in “%1$@”", entry->localizedName),
            [entry, document = url] { openIn(entry, document); });
    add(localized("Copy"), [document = url] { copy(document); });
    add(localized("Copy Path"), [document = url] { copyText(document.path()); });
    if (const Entry handler = database.handlerOfScheme("mailto"))
        add(localized("Send by Mail"),
            [handler, document = url] { sendByMail(handler, document); });
    sheet->addAction(
        AlertAction::make(localized("Cancel"), ActionStyle::cancel, [shown](AlertAction&) {}));
    return sheet;
}

/// Shows the menu that `place` anchored. False when it cannot be shown now.
bool DocumentInteractionController::Impl::present(
    const std::shared_ptr<DocumentInteractionController>& owner,
    const std::function<void(AlertController& menu)>& place, bool animated) {
    if (url.empty() || !menu.expired())
        return false;
    const auto shown = std::make_shared<MenuLife>();
    const auto sheet = makeMenu(shown);
    place(*sheet);
    if (!presentOverWindow(sheet, animated))
        return false;
    menu = sheet;
    shown->owner = owner;
    return true;
}

DocumentInteractionController::MenuLife::~MenuLife() {
    if (!owner)
        return;
    owner->impl_->menu.reset();
    if (const auto delegate = owner->impl_->delegate.lock())
        delegate->documentInteractionControllerDidDismissOptionsMenu(*owner);
}

bool DocumentInteractionController::presentOptionsMenuFromRectInView(
    Rect rect, const std::shared_ptr<View>& view, bool animated) {
    return impl_->present(
        shared_from_this(),
        [&](AlertController& menu) {
            if (view)
                menu.setPopoverAnchor(view, rect);
        },
        animated);
}

bool DocumentInteractionController::presentOptionsMenuFromBarButtonItem(
    const BarButtonItem::Pointer& item, bool animated) {
    return impl_->present(
        shared_from_this(),
        [&](AlertController& menu) {
            if (item)
                menu.setPopoverAnchor(item);
        },
        animated);
}

void DocumentInteractionController::dismissMenuAnimated(bool animated) {
    if (const auto menu = impl_->menu.lock())
        menu->dismissViewController(animated);
}

} // namespace platform
