#pragma once

#include "platform/launch/DesktopEntry.h"

#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// Where a desktop keeps its applications and its lists of associations, most important first.
struct ApplicationPlaces {
    std::vector<std::string> configFolders;
    std::vector<std::string> dataFolders;
    /// The names of the running desktop, as entries write them.
    std::vector<std::string> desktops;
    /// In which languages names are wanted, best first.
    std::vector<std::string> locales;

    /// By the installed runtime's folders and the environment.
    static ApplicationPlaces current();
    bool operator==(const ApplicationPlaces&) const = default;
};

/// The installed applications and which of them open which types. Read when first asked, and again
/// after something changed there: every question looks at the dates of the files (a millisecond for
/// some hundred applications). Types are MIME types; where nobody takes a type, those count who
/// take what it is a kind of. Main thread only.
class ApplicationDatabase {
public:
    using Entry = std::shared_ptr<const DesktopEntry>;

    static ApplicationDatabase& shared();

    /// The application that the user, the administrator or the distribution chose, else the first
    /// that takes the type; none when there is none. This program only when it was chosen, or when
    /// nobody else takes the type.
    Entry defaultFor(std::string_view mimeType);
    /// What a menu offers for the type, the default first; never this program.
    std::vector<Entry> applicationsFor(std::string_view mimeType);
    /// The application for addresses such as "mailto:".
    Entry handlerOfScheme(std::string_view scheme);

    struct State;
    ~ApplicationDatabase();

private:
    ApplicationDatabase();
    const State& upToDate();
    std::unique_ptr<State> state_;
};

} // namespace platform
