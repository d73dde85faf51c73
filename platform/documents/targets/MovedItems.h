#pragma once

#include "platform/base/Url.h"

#include <optional>
#include <set>
#include <string>
#include <unordered_set>
#include <vector>

namespace platform {

/// The items that are to go into another folder, and what the rules of folders ask of them. Looks
/// at the disk only where a rule needs it, and then once. Belongs to one thread.
class MovedItems {
public:
    explicit MovedItems(std::vector<Url> items);

    const std::vector<Url>& urls() const { return urls_; }
    std::size_t count() const { return urls_.size(); }
    /// The folder in which all of them are, or the nearest one above them. There must be items.
    Url commonFolder() const;
    /// The URL is one of them.
    bool contains(const Url& url) const { return paths_.contains(url.path()); }
    /// The folder is one of them, or lies below one.
    bool reachInto(const Url& folder) const;
    bool areAllIn(const Url& folder) const;

    bool haveFolders() const;
    /// One of the folders has a folder in it.
    bool haveNestedFolders() const;
    /// Of the documents; without those that have none.
    const std::set<std::string>& extensions() const;
    /// "Budget.ods", or "3 items".
    std::string title() const;

private:
    struct Kinds {
        std::vector<Url> folders;
        std::set<std::string> extensions;
    };
    const Kinds& kinds() const;

    std::vector<Url> urls_;
    std::unordered_set<std::string> paths_;
    mutable std::optional<Kinds> kinds_;
    mutable std::optional<bool> nested_;
};

} // namespace platform
