#include "app/AppDelegate.h"

#include "app/VXLogging.h"
#include "browse/NavController.h"
#include "items/UrlExtensions.h"
#include "platform/system/SourceApplications.h"
#include "preview/PreviewItemManager.h"
#include "services/NetworkWatcher.h"

namespace tavrin {
namespace {

using platform::Url;

constexpr std::string_view scheme = "tavrinapp";
constexpr std::string_view modeItem = "mode";

/// The mode that the query asks for; of several recognised values the last one wins.
int previewModeOf(const Url& request) {
    int mode = fullPreviewMode;
    for (const platform::QueryItem& item : request.queryItems()) {
        if (platform::percentDecoded(item.name) != modeItem)
            continue;
        const std::optional<std::string> value = platform::percentDecoded(item.value);
        if (value == "preview")
            mode = fullPreviewMode;
        else if (value == "details" || value == "info")
            mode = detailsMode;
    }
    return mode;
}

/// The store item that the request's path names, decoded once more than the parser did; none when
/// that fails or is no absolute path.
std::optional<Url> itemOf(const Url& request) {
    const std::optional<std::string> path = platform::percentDecoded(request.path());
    if (!path || !path->starts_with('/') || path->find('\0') != std::string::npos)
        return std::nullopt;
    const Url file = Url::file(*path, request.hasDirectoryMark());
    return tavrin_URLByResolvingPromise(file).value_or(file);
}

/// Whether the caller may ask; logged when not.
bool isAccepted(const platform::OpenUrlOptions& options) {
    const auto found = options.find(platform::sourceApplicationKey);
    const std::string* source = found == options.end() ? nullptr : found->second.text();
    if (source && (*source == platform::homeScreenApplicationIdentifier ||
                   *source == platform::testRunnerApplicationIdentifier))
        return true;
    VXLOG(vxWarning, "Ignoring openURL launch from unknown source: %@", source);
    return false;
}

} // namespace

bool AppDelegate::applicationWillFinishLaunchingWithOptions(
    platform::Application& application, const platform::LaunchOptions& /*options*/) {
    NetworkWatcher::sharedNetworkWatcher()->start();
    rootWindow_ = std::make_unique<platform::Window>(application.mainScreenBounds());
    rootWindow_->setBackgroundColor(platform::Color::white);
    const auto root = std::make_shared<NavController>();
    rootWindow_->setRootViewController(root);
    root->setRestorationIdentifier("Root");
    rootWindow_->makeKeyAndVisible();
    statusStrip_ = std::make_unique<StatusStrip>(*rootWindow_);
    vanishedItems_ = std::make_unique<VanishedItems>(*rootWindow_);
    passwordPrompt_ = std::make_unique<PasswordPrompt>(*rootWindow_);
    rootWindow_->setStatusStripHandler([weak = std::weak_ptr(root)] {
        if (const auto screen = weak.lock(); screen && !screen->presentedViewController())
            screen->showAccount();
    });
    return true;
}

bool AppDelegate::applicationOpenURLOptions(platform::Application& application,
                                            const std::string& url,
                                            const platform::OpenUrlOptions& options) {
    VXLOG(vxInfo, "openURL: %@, options %@, app %@", url, options, application);
    const std::optional<Url> request = Url::parse(url);
    if (!request || request->scheme() != scheme || !isAccepted(options))
        return false;
    const std::optional<Url> item = itemOf(*request);
    if (!item)
        return false;
    const std::shared_ptr<NavController> root = rootScreen();
    return root && root->showURLPreview(*item, previewModeOf(*request));
}

std::shared_ptr<NavController> AppDelegate::rootScreen() const {
    return rootWindow_ ? std::dynamic_pointer_cast<NavController>(rootWindow_->rootViewController())
                       : nullptr;
}

bool AppDelegate::applicationShouldSaveApplicationState(platform::Application& /*application*/) {
    const std::shared_ptr<NavController> root = rootScreen();
    return root && root->checkPelmoraState();
}

bool AppDelegate::applicationShouldRestoreApplicationState(platform::Application& /*application*/) {
    const std::shared_ptr<NavController> root = rootScreen();
    return root && root->checkPelmoraState();
}

} // namespace tavrin
