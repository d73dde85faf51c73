#include "browse/LaunchUtils.h"

#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "items/UrlExtensions.h"
#include "platform/Platform.h"
#include "platform/base/Identity.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/launch/DocumentInteractionController.h"

namespace tavrin {

using platform::ApplicationRecord;
using platform::DocumentInteractionController;
using platform::Url;

bool LaunchUtils::isUrlInDefaultContainer(const Url& url) {
    const auto container = platform::Platform::current().documents().containerForItemAtURL(url);
    if (!container) {
        VXLOG(vxWarning, "Can't get container for URL %@: %@", url, container.error());
        return false;
    }
    return *container && (*container)->identifier() == platform::defaultContainerIdentifier;
}

std::optional<ApplicationRecord> LaunchUtils::defaultAppForDocument(const Url& document,
                                                                    bool requireOpenIn) {
    if (!FileUtils::exists(document))
        VXLOG(vxDebug, "Assuming apps can open a promised document...");
    if (isUrlInDefaultContainer(document) && FileUtils::isAudioVideoImageFile(document)) {
        VXLOG(vxDebug, "Preferring Glimpse over default app to open %@", document);
        return std::nullopt;
    }
    std::optional<ApplicationRecord> app =
        DocumentInteractionController::create(document)->defaultApplication();
    if (!app) {
        VXLOG(vxDebug, "No default app to open %@", document);
        return std::nullopt;
    }
    VXLOG(vxDebug, "App for %@: %@, %@, %@, %@, %@, %@, %@, %@, %@, %@, %@", document,
          app->itemName, app->localizedName, app->localizedShortName, app->shortVersionString,
          app->vendorName, app->bundleIdentifier, app->bundleExecutable, app->bundleContainerURL,
          app->isInstalled, app->itemID, *app);
    if (requireOpenIn && !app->supportsOpenInPlace) {
        VXLOG(vxDebug, "App %@ does not support open in place. Ignoring", *app);
        return std::nullopt;
    }
    if (app->bundleIdentifier == platform::applicationIdentifier) {
        VXLOG(vxDebug, "Ignoring %@ as default app", *app);
        return std::nullopt;
    }
    return app;
}

std::optional<std::string> LaunchUtils::defaultAppNameForDocument(const Url& document,
                                                                  bool requireOpenIn) {
    const std::optional<ApplicationRecord> app = defaultAppForDocument(document, requireOpenIn);
    return app ? app->localizedName : std::nullopt;
}

void LaunchUtils::openInDefaultApp(const Url& document, bool requireOpenIn,
                                   const std::function<void(bool)>& completion) {
    VXLOG(vxInfo, "Opening document %@ in default app", document);
    const Url opened = tavrin_URLByResolvingBookmark(document).value_or(document);
    if (!defaultAppForDocument(opened, requireOpenIn)) {
        completion(false);
        return;
    }
    DocumentInteractionController::create(opened)->openWithDefaultApplication();
    completion(true);
}

} // namespace tavrin
