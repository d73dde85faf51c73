#include "platform/documents/targets/MovedItems.h"

#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"
#include "platform/files/FileManager.h"
#include "platform/launch/TypeRegistry.h"

#include <algorithm>

namespace platform {
namespace {

/// A folder as people see one: a package is a document.
bool isFolder(const Url& item) {
    bool directory = item.hasDirectoryMark();
    if (!directory)
        FileManager::exists(item.path(), &directory);
    return directory && !TypeRegistry::isPackageName(item.lastPathComponent());
}

bool hasFolders(const Url& folder) {
    bool found = false;
    // What cannot be read is told when it is moved.
    (void)FileManager::enumerate(folder.path(), [&](const DirectoryEntry& entry) {
        if (!entry.name.starts_with('.') && entry.kind != FileKind::file)
            found = isFolder(folder.appending(entry.name, entry.kind == FileKind::directory));
        return !found;
    });
    return found;
}

std::optional<Url> folderOf(const Url& item) {
    return item.deletingLastPathComponent();
}

} // namespace

MovedItems::MovedItems(std::vector<Url> items) : urls_(std::move(items)) {
    for (const Url& url : urls_)
        paths_.insert(url.path());
}

Url MovedItems::commonFolder() const {
    Url common = folderOf(urls_.front()).value_or(urls_.front());
    for (const Url& url : urls_)
        while (!url.isInside(common))
            common = folderOf(common).value_or(common);
    return common.markedAsDirectory(true);
}

bool MovedItems::reachInto(const Url& folder) const {
    for (std::optional<Url> each = folder; each; each = folderOf(*each))
        if (contains(*each))
            return true;
    return false;
}

bool MovedItems::areAllIn(const Url& folder) const {
    return std::ranges::all_of(urls_, [&](const Url& url) { return folderOf(url) == folder; });
}

const MovedItems::Kinds& MovedItems::kinds() const {
    if (kinds_)
        return *kinds_;
    kinds_.emplace();
    for (const Url& url : urls_) {
        if (isFolder(url))
            kinds_->folders.push_back(url);
        else if (!url.pathExtension().empty())
            kinds_->extensions.emplace(url.pathExtension());
    }
    return *kinds_;
}

bool MovedItems::haveFolders() const {
    return !kinds().folders.empty();
}

bool MovedItems::haveNestedFolders() const {
    if (!nested_)
        nested_ = std::ranges::any_of(kinds().folders, hasFolders);
    return *nested_;
}

const std::set<std::string>& MovedItems::extensions() const {
    return kinds().extensions;
}

std::string MovedItems::title() const {
    return count() == 1 ? displayName(urls_.front().lastPathComponent())
                        : localizedPlural(".DICT.ITEMS.%d", static_cast<long long>(count()));
}

} // namespace platform
