#include "platform/launch/DesktopEntry.h"

#include "platform/files/PathText.h"
#include "platform/launch/KeyFile.h"

#include <QFile>
#include <QStandardPaths>

#include <algorithm>

namespace platform {
namespace {

struct Terminal {
    const char* program;
    /// What says that a command follows; none where it simply follows.
    const char* option;
};
/// The agreed ways to whatever the user prefers come first.
constexpr Terminal terminals[] = {
    {"xdg-terminal-exec", nullptr}, {"x-terminal-emulator", "-e"},
    {"gnome-terminal", "--"},       {"konsole", "-e"},
    {"xfce4-terminal", "-x"},       {"xterm", "-e"},
};

} // namespace

std::optional<DesktopEntry> DesktopEntry::parse(std::string id, std::string path,
                                                std::string_view text,
                                                const std::vector<std::string>& locales) {
    const KeyFile file = KeyFile::parse(text);
    const KeyFile::Group* const group = file.group("Desktop Entry");
    if (!group)
        return std::nullopt;
    const auto plain = [group](std::string_view key) {
        return KeyFile::text(*group, key).value_or("");
    };
    DesktopEntry entry;
    entry.hidden = KeyFile::flag(*group, "Hidden");
    entry.name = plain("Name");
    // An entry that only hides another one need not say more.
    if (!entry.hidden && (plain("Type") != "Application" || entry.name.empty()))
        return std::nullopt;
    entry.id = std::move(id);
    entry.path = std::move(path);
    entry.localizedName = KeyFile::localizedText(*group, "Name", locales).value_or("");
    entry.icon = KeyFile::localizedText(*group, "Icon", locales).value_or("");
    entry.exec = ExecLine::parse(plain("Exec"));
    entry.tryExec = plain("TryExec");
    entry.workingFolder = plain("Path");
    entry.mimeTypes = KeyFile::list(*group, "MimeType");
    std::ranges::sort(entry.mimeTypes);
    entry.onlyShowIn = KeyFile::list(*group, "OnlyShowIn");
    entry.notShowIn = KeyFile::list(*group, "NotShowIn");
    entry.needsTerminal = KeyFile::flag(*group, "Terminal");
    entry.noDisplay = KeyFile::flag(*group, "NoDisplay");
    return entry;
}

bool DesktopEntry::takes(const std::vector<std::string>& typeNames) const {
    return std::ranges::any_of(typeNames, [this](const std::string& each) {
        return std::ranges::binary_search(mimeTypes, each);
    });
}

bool DesktopEntry::isFor(const std::vector<std::string>& desktops) const {
    // The first of the desktop's names that either list has decides.
    for (const std::string& desktop : desktops) {
        if (std::ranges::find(onlyShowIn, desktop) != onlyShowIn.end())
            return true;
        if (std::ranges::find(notShowIn, desktop) != notShowIn.end())
            return false;
    }
    return onlyShowIn.empty();
}

bool DesktopEntry::canRun() const {
    return !hidden && exec && findProgram(exec->program()) &&
           (tryExec.empty() || findProgram(tryExec)) && (!needsTerminal || terminalCommand());
}

ApplicationRecord recordOf(const DesktopEntry& entry) {
    ApplicationRecord record;
    record.itemName = entry.name;
    record.localizedName = entry.localizedName;
    record.bundleIdentifier = entry.id;
    if (entry.exec)
        record.bundleExecutable = entry.exec->program();
    record.bundleContainerURL = Url::file(folderOf(entry.path), true);
    record.supportsOpenInPlace = entry.exec && entry.exec->takesDocument();
    return record;
}

void appendDescription(std::string& out, const ApplicationRecord& record) {
    out += record.bundleIdentifier;
    if (record.localizedName)
        out += " (" + *record.localizedName + ")";
}

std::optional<std::string> findProgram(const std::string& name) {
    const QString found = QStandardPaths::findExecutable(QFile::decodeName(name.c_str()));
    if (found.isEmpty())
        return std::nullopt;
    return QFile::encodeName(found).toStdString();
}

std::optional<std::vector<std::string>> terminalCommand() {
    for (const Terminal& terminal : terminals)
        if (auto path = findProgram(terminal.program)) {
            std::vector<std::string> command{*std::move(path)};
            if (terminal.option)
                command.emplace_back(terminal.option);
            return command;
        }
    return std::nullopt;
}

} // namespace platform
