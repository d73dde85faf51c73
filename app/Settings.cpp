#include "app/Settings.h"

#include "app/VXLogging.h"
#include "platform/Platform.h"
#include "platform/base/Identity.h"
#include "platform/system/PreferencesStore.h"

namespace tavrin {
namespace {

constexpr std::string_view gridModeKey = "GridMode";
constexpr std::string_view quickLaunchKey = "QuickLaunch";

platform::PreferencesDomain domain() {
    return {std::string(platform::applicationIdentifier), platform::PreferencesUser::current,
            platform::PreferencesHost::any, Settings::_appContainerPath()};
}

platform::PreferencesStore& store() {
    return platform::Platform::current().preferences();
}

} // namespace

const std::string& Settings::_appContainerPath() {
    static const std::string path = [] {
        const auto url =
            platform::Platform::current().dataContainerURL(platform::applicationIdentifier);
        std::string found = url ? url->path() : std::string();
        VXLOG(vxDebug, "AppContainer is %@", found);
        return found;
    }();
    return path;
}

bool Settings::boolPrefForKey(std::string_view key, bool withDefault) {
    store().synchronize(domain());
    const platform::Value stored = store().value(domain(), key);
    const bool answer = stored.isNone()
                            ? withDefault
                            : stored.boolean().value_or(stored.integer().value_or(0) != 0);
    VXLOG(vxDebug, "%@ = %@", key, answer);
    return answer;
}

void Settings::setBoolPref(bool value, std::string_view forKey) {
    store().setValue(domain(), forKey, value);
    if (!store().synchronize(domain()))
        VXLOG(vxError, "Failed to write prefs");
}

bool Settings::gridMode() {
    return boolPrefForKey(gridModeKey, false);
}

void Settings::setGridMode(bool value) {
    setBoolPref(value, gridModeKey);
}

void Settings::setQuickLaunch(bool value) {
    VXLOG(vxDebug, "set QuickLaunch = %@", value);
    setBoolPref(value, quickLaunchKey);
}

} // namespace tavrin
