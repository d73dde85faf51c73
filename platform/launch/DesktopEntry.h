#pragma once

#include "platform/launch/ApplicationRecord.h"
#include "platform/launch/ExecLine.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// One installed application as its desktop entry describes it. A value.
struct DesktopEntry {
    /// The entry's name below its folder, with "-" for "/", without ".desktop".
    std::string id;
    std::string path;
    std::string name;
    std::string localizedName;
    std::string icon;
    /// None when the entry has no command that can be run.
    std::optional<ExecLine> exec;
    std::string tryExec;
    std::string workingFolder;
    std::vector<std::string> mimeTypes; // sorted
    std::vector<std::string> onlyShowIn;
    std::vector<std::string> notShowIn;
    bool needsTerminal = false;
    bool noDisplay = false;
    /// As good as removed; it hides entries of its name in the folders that come later.
    bool hidden = false;

    /// None when the text describes no application.
    static std::optional<DesktopEntry> parse(std::string id, std::string path,
                                             std::string_view text,
                                             const std::vector<std::string>& locales);

    bool takes(const std::vector<std::string>& typeNames) const;
    /// Whether the entry is meant for a desktop that goes by these names.
    bool isFor(const std::vector<std::string>& desktops) const;
    /// Whether what it runs is on this machine, a terminal included where it needs one.
    bool canRun() const;
};

ApplicationRecord recordOf(const DesktopEntry& entry);

/// The path of a program given by its path or by a name to be looked for in $PATH; none when there
/// is none that may be run.
std::optional<std::string> findProgram(const std::string& name);
/// What to write before a command that wants a terminal; none without a terminal emulator.
std::optional<std::vector<std::string>> terminalCommand();

} // namespace platform
