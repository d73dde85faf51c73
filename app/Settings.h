#pragma once

#include "platform/ui/Color.h"

#include <string>
#include <string_view>

namespace tavrin {

/// The program's few preferences and fixed colours. Boolean preferences are addressed by the
/// application, the current user, any host and the application's data container, so that every
/// process finds them in the same place. Main thread, except _appContainerPath().
class Settings {
public:
    Settings() = delete;

    /// Of every document list.
    static platform::Color backgroundColor() { return platform::Color::white; }
    /// Of the status line.
    static platform::Color statusLabelColor() { return platform::Color::black; }

    /// Computed once a process.
    static const std::string& _appContainerPath();
    static bool boolPrefForKey(std::string_view key, bool withDefault);
    static void setBoolPref(bool value, std::string_view forKey);

    static bool gridMode();
    static void setGridMode(bool value);
    /// Always true: the stored value is kept for the day it is wanted again.
    static bool quickLaunch() { return true; }
    static void setQuickLaunch(bool value);
};

} // namespace tavrin
