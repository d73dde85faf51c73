#include "platform/launch/ApplicationFolders.h"

#include "platform/base/Process.h"
#include "platform/base/Runtime.h"
#include "platform/launch/KeyFile.h"

#include <algorithm>

namespace platform {
namespace {

constexpr std::string_view entrySuffix = ".desktop";
constexpr std::string_view listName = "mimeapps.list";
constexpr std::uint64_t largestFile = 1024 * 1024;
/// A link may lead back to a folder above it.
constexpr int deepestFolder = 6;

std::vector<std::string> split(std::string_view text, char separator) {
    std::vector<std::string> parts;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find(separator), text.size());
        if (end > 0)
            parts.emplace_back(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
    }
    return parts;
}

/// The user's folder, then those of a variable such as $XDG_DATA_DIRS.
std::vector<std::string> foldersOf(const std::string& own, const char* variable,
                                   std::string_view standard) {
    std::string value = environmentVariable(variable).value_or("");
    if (value.empty())
        value = standard;
    std::vector<std::string> folders{own};
    for (std::string& folder : split(value, ':')) {
        while (folder.size() > 1 && folder.ends_with('/'))
            folder.pop_back();
        if (folder.starts_with('/') && std::ranges::find(folders, folder) == folders.end())
            folders.push_back(std::move(folder));
    }
    return folders;
}

std::string lowerCase(std::string text) {
    for (char& letter : text)
        if (letter >= 'A' && letter <= 'Z')
            letter = static_cast<char>(letter - 'A' + 'a');
    return text;
}

/// Gathers the files of one level after the other.
class FileWalk {
public:
    explicit FileWalk(const ApplicationPlaces& places) : places_(places) {}

    std::vector<ApplicationFile> files() {
        for (const std::string& folder : places_.configFolders) {
            addLists(folder);
            ++level_;
        }
        for (const std::string& folder : places_.dataFolders) {
            addLists(folder + "/applications");
            addEntries(folder + "/applications", "", 0);
            ++level_;
        }
        return std::move(files_);
    }

private:
    /// Only where a file stands, perhaps behind a link.
    bool add(const std::string& path, std::string id, std::size_t list) {
        const Result<FileAttributes> found = FileManager::attributes(path, FollowLinks::yes);
        if (!found || found->kind != FileKind::file)
            return false;
        files_.push_back({path, std::move(id), level_, list, found->modified, found->changed,
                          found->size, found->identity});
        return true;
    }

    void addLists(const std::string& folder) {
        std::size_t list = 0;
        for (const std::string& desktop : places_.desktops)
            add(folder + "/" + lowerCase(desktop) + "-" + std::string(listName), "", list++);
        add(folder + "/" + std::string(listName), "", list);
    }

    void addEntries(const std::string& folder, const std::string& prefix, int depth) {
        Result<std::vector<DirectoryEntry>> found = FileManager::entries(folder);
        if (!found)
            return; // most of the places do not exist
        std::ranges::sort(*found, {}, &DirectoryEntry::name);
        for (const DirectoryEntry& each : *found) {
            const std::string path = folder + "/" + each.name;
            if (each.name.size() > entrySuffix.size() && each.name.ends_with(entrySuffix) &&
                add(path, idOf(prefix, each.name), 0))
                continue;
            bool isFolder = each.kind == FileKind::directory;
            if (!isFolder && each.kind != FileKind::file)
                FileManager::exists(path, &isFolder);
            if (isFolder && depth < deepestFolder)
                addEntries(path, prefix + each.name + "-", depth + 1);
        }
    }

    static std::string idOf(const std::string& prefix, const std::string& name) {
        return prefix + name.substr(0, name.size() - entrySuffix.size());
    }

    const ApplicationPlaces& places_;
    std::size_t level_ = 0;
    std::vector<ApplicationFile> files_;
};

} // namespace

ApplicationPlaces ApplicationPlaces::current() {
    const Folders& folders = Runtime::current().folders;
    ApplicationPlaces places;
    places.configFolders = foldersOf(folders.config, "XDG_CONFIG_DIRS", "/etc/xdg");
    places.dataFolders = foldersOf(folders.data, "XDG_DATA_DIRS", "/usr/local/share:/usr/share");
    places.desktops = split(environmentVariable("XDG_CURRENT_DESKTOP").value_or(""), ':');
    for (const char* name : {"LC_ALL", "LC_MESSAGES", "LANG"})
        if (const auto value = environmentVariable(name); value && !value->empty()) {
            places.locales = localeNames(*value);
            break;
        }
    return places;
}

std::vector<ApplicationFile> applicationFiles(const ApplicationPlaces& places) {
    return FileWalk(places).files();
}

std::vector<ApplicationLevel> readLevels(const ApplicationPlaces& places,
                                         const std::vector<ApplicationFile>& files) {
    std::vector<ApplicationLevel> levels(places.configFolders.size() + places.dataFolders.size());
    for (ApplicationLevel& level : levels)
        level.desktopLists.resize(places.desktops.size());
    for (const ApplicationFile& file : files) {
        const Result<Bytes> content = FileManager::contents(Url::file(file.path), largestFile);
        if (!content)
            continue;
        const std::string_view text(reinterpret_cast<const char*>(content->data()),
                                    content->size());
        ApplicationLevel& level = levels[file.level];
        if (!file.id.empty()) {
            if (auto entry = DesktopEntry::parse(file.id, file.path, text, places.locales))
                level.entries.emplace(file.id,
                                      std::make_shared<const DesktopEntry>(*std::move(entry)));
        } else if (file.list < level.desktopLists.size()) {
            level.desktopLists[file.list] = MimeAppsList::parse(text);
        } else {
            level.list = MimeAppsList::parse(text);
        }
    }
    return levels;
}

} // namespace platform
