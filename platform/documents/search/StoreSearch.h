#pragma once

#include "platform/base/Url.h"
#include "platform/documents/model/DocumentEntry.h"

#include <functional>
#include <memory>
#include <string>
#include <vector>

namespace platform {

struct DocumentServices;

/// An item whose name fits what was searched for.
struct FoundItem {
    Url url;
    DocumentEntry entry;
    /// The names of the folders that lead to it, below its container's; for people.
    std::string place;
};

/// Finds items of the whole store by their names. Belongs to the main thread.
///
/// What it wants of the store is one question: the items, promised or not, whose folded name
/// contains a folded text, at most so many, each with its place and kind.
class StoreSearch {
public:
    /// Best first. Called on the main thread once for every text, unless a later one came first.
    using Receiver = std::function<void(std::vector<FoundItem> items)>;

    virtual ~StoreSearch() = default;
    virtual void find(const std::string& text, Receiver receiver) = 0;
};

/// More than anybody reads through; who wants more types more.
inline constexpr std::size_t mostFoundItems = 300;

/// Reads the names of the whole store once, on a queue of its own, and answers from them. What has
/// gone meanwhile is not answered; what came after that is.
std::unique_ptr<StoreSearch> makeNameSearch(const DocumentServices& services);

} // namespace platform
