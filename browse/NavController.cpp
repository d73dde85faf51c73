#include "browse/NavController.h"

#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "items/UIUtils.h"
#include "items/UrlExtensions.h"
#include "platform/Platform.h"
#include "platform/base/Identity.h"
#include "platform/base/Text.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/DocumentPickerUnavailableViewController.h"
#include "platform/system/PreferencesStore.h"
#include "platform/ui/Application.h"
#include "preview/PreviewItemManager.h"

#include <utility>

namespace tavrin {
namespace {

using platform::IdentityToken;
using platform::Platform;
using platform::Url;

constexpr double quotaInterval = 300.0; // seconds
constexpr std::string_view placeholderClass = "DocumentPickerUnavailableViewController";
constexpr const char* restoredUrlKey = "url";
constexpr const char* restoredModeKey = "PreviewMode";

std::string tokenKey() {
    return std::string(platform::applicationIdentifier) + ".UbiquityIdentityToken";
}

std::optional<IdentityToken> storedToken() {
    const platform::Value stored = Platform::current().standardPreferences().value(tokenKey());
    return stored.bytes() ? IdentityToken::deserialized(*stored.bytes()) : std::nullopt;
}

} // namespace

NavController::NavController() = default;
NavController::~NavController() = default;

std::shared_ptr<NavController> NavController::self() {
    return std::static_pointer_cast<NavController>(shared_from_this());
}

void NavController::viewDidLoad() {
    setDelegate(std::weak_ptr<NavigationControllerDelegate>(self()));
    platform::NotificationCenter& center = Platform::current().notifications();
    becameActive_ = center.observe(platform::applicationDidBecomeActiveNotification,
                                   [this](const platform::Notification& notification) {
                                       didBecomeActiveNotification(notification);
                                   });
    identityChanged_ = center.observe(platform::cloudIdentityDidChangeNotification,
                                      [this](const auto&) { pelmoraAccountAvailabilityChanged(); });
    setupInitialViewController();
    NavigationController::viewDidLoad();
}

void NavController::setupInitialViewController() {
    pickerIsAlive_ = false;
    if (checkPelmoraState())
        showStoreRoot();
    else
        showPlaceholder();
    VXLOG(vxDebug, "%@ viewDidLoad", "NavController");
}

void NavController::showStoreRoot() {
    VXLOG(vxDebug, "Pelmora is enabled");
    setToolbarHidden(false, false);
    const ListPointer list = List::create();
    if (list) {
        VXLOG(vxDebug, "Contained items: %@", list->containedItems());
        initNewListController(*list);
        setViewControllers({list}, false);
    } else {
        VXLOG(vxError, "Creating the document list failed");
    }
    quotaFetcher_ = QuotaFetcher::create();
    quotaFetcher_->setDelegate(std::weak_ptr<QuotaFetcherDelegate>(self()));
    quotaFetcher_->runWithInterval(quotaInterval);
}

void NavController::showPlaceholder() {
    VXLOG(vxWarning, "Pelmora is not enabled");
    if (const auto placeholder = platform::makeScreenByClassName(placeholderClass)) {
        if (const auto known =
                std::dynamic_pointer_cast<platform::DocumentPickerUnavailableViewController>(
                    placeholder))
            offerSignIn(*known);
        setViewControllers({placeholder}, false);
        endPreview();
    } else {
        VXLOG(vxError, "Creating the placeholder screen (%@) failed", placeholderClass);
        Platform::current().mainQueue().async([weak = weak_from_this()] {
            if (const auto screen = weak.lock())
                UIUtils::showAlert("", platform::localized("Pelmora is not enabled"), screen);
        });
    }
    setToolbarHidden(true, false);
    quotaFetcher_.reset();
    quotaBytes_ = 0;
}

bool NavController::checkPelmoraState() const {
    return Platform::current().accounts().identityToken().has_value();
}

void NavController::handleAccountChanges() {
    const std::optional<IdentityToken> current = Platform::current().accounts().identityToken();
    if (current == storedToken()) {
        VXLOG(vxDebug, "Pelmora Token Matches");
        return;
    }
    VXLOG(vxInfo, "Pelmora Token Changed, enabled=%@, reinitializing view", current ? "YES" : "NO");
    savePelmoraToken(current);
    // What is presented asks about documents of the account that was there before.
    if (presentedViewController())
        dismissViewController(false);
    setupInitialViewController();
}

void NavController::savePelmoraToken(const std::optional<IdentityToken>& token) {
    platform::StandardPreferences& preferences = Platform::current().standardPreferences();
    if (token)
        preferences.setValue(tokenKey(), token->serialized());
    else
        preferences.removeValue(tokenKey());
}

void NavController::didBecomeActiveNotification(const platform::Notification& notification) {
    VXLOG(vxInfo, "%@ (navigation controller)", notification.name);
    handleAccountChanges();
}

void NavController::pelmoraAccountAvailabilityChanged() {
    VXLOG(vxInfo, "Pelmora account availability changed");
    handleAccountChanges();
}

NavController::ListPointer NavController::getTopDocumentListController() const {
    const auto top = topViewController();
    if (!top)
        VXLOG(vxWarning, "ERROR: topViewController is nil");
    return std::dynamic_pointer_cast<List>(top);
}

std::shared_ptr<PreviewItemManager> NavController::startItemManager(int previewMode) {
    // A transition that still runs ends now: ending later, the list that it brings to the top would
    // take the new coordinator away.
    setViewControllers(viewControllers(), false);
    endPreview();
    itemManager_ = PreviewItemManager::create();
    itemManager_->setMode(previewMode);
    itemManager_->setNavigationController(self());
    return itemManager_;
}

void NavController::endPreview() {
    if (const auto ended = std::exchange(itemManager_, nullptr))
        ended->unregisterAsFilePresenter();
}

void NavController::showPreview(const std::shared_ptr<VXItem>& item, int previewMode) {
    startItemManager(previewMode)->previewItem(item);
}

void NavController::logContainerURL() const {
    if (const auto url = Platform::current().documents().defaultContainerURL())
        VXLOG(vxDebug, "Pelmora container is at %@", *url);
    else
        VXLOG(vxDebug, "Pelmora is not available");
}

void NavController::encodeRestorableStateWithCoder(platform::RestorationCoder& coder) {
    NavigationController::encodeRestorableStateWithCoder(coder);
    const std::shared_ptr<VXItem> item = itemManager_ ? itemManager_->item() : nullptr;
    if (!item || !item->url())
        return;
    coder[restoredUrlKey] = *item->url();
    coder[restoredModeKey] = itemManager_->mode();
}

void NavController::decodeRestorableStateWithCoder(const platform::RestorationCoder& coder) {
    NavigationController::decodeRestorableStateWithCoder(coder);
    const auto found = coder.find(restoredUrlKey);
    const Url* url = found == coder.end() ? nullptr : found->second.url();
    if (!url || !FileUtils::exists(*url) || !FileUtils::isFile(*url))
        return;
    // A state that was saved under another account stays that account's.
    if (!dossa_isInShelfroot(*url))
        return;
    const auto mode = coder.find(restoredModeKey);
    const std::optional<std::int64_t> number =
        mode == coder.end() ? std::nullopt : mode->second.integer();
    showPreview(std::make_shared<VXItem>(*url), static_cast<int>(number.value_or(fullPreviewMode)));
}

void NavController::navigationControllerDidShowViewController(platform::NavigationController&,
                                                              platform::ViewController& screen,
                                                              bool /*animated*/) {
    auto* list = dynamic_cast<List*>(&screen);
    if (!list)
        return;
    endPreview();
    if (editMode_)
        editMode_ = list->isEditing();
    updateStatusUI(list);
    initNewListController(*list);
    setToolbarHidden(false, false);
}

} // namespace tavrin
