#pragma once

#include "platform/base/Url.h"
#include "platform/launch/ApplicationRecord.h"

#include <functional>
#include <optional>
#include <string>

namespace tavrin {

/// Decides whether a document goes to its default application instead of being shown here, and
/// hands it over. Media of the default container stay here; this program is never its own default.
/// No state. Main thread.
class LaunchUtils {
public:
    LaunchUtils() = delete;

    /// Calls back once, before it returns: true when an application was asked to open the document.
    static void openInDefaultApp(const platform::Url& document, bool requireOpenIn,
                                 const std::function<void(bool launched)>& completion);
    static bool isUrlInDefaultContainer(const platform::Url& url);
    static std::optional<platform::ApplicationRecord>
    defaultAppForDocument(const platform::Url& document, bool requireOpenIn);
    static std::optional<std::string> defaultAppNameForDocument(const platform::Url& document,
                                                                bool requireOpenIn);
};

} // namespace tavrin
