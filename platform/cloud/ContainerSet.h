#pragma once

#include "platform/cloud/CloudContainer.h"

#include <memory>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace platform {

/// The folder of the store's own library, below the root of the store.
inline constexpr std::string_view defaultContainerFolder = "Documents";
inline constexpr std::string_view containerFileName = ".container.json";

/// The containers of a store at one moment: immutable, so that any thread may ask without a lock.
class ContainerSet {
public:
    struct Entry {
        /// Name of the top-level folder.
        std::string folder;
        std::shared_ptr<const CloudContainer> container;
        /// Path of the documents root relative to the store's root; "" when there is none.
        std::string documents;
    };

    /// Reads the top-level folders below `root` and the files that describe them. A malformed file
    /// is logged and counts as none.
    static std::shared_ptr<const ContainerSet> read(const std::string& root);

    const std::vector<Entry>& entries() const { return entries_; }
    /// By a path relative to the store's root: the container that holds it, or is it.
    const Entry* holding(std::string_view relativePath) const;
    const Entry* defaultEntry() const;
    bool isDocumentsRoot(std::string_view relativePath) const;

private:
    std::vector<Entry> entries_;
    std::unordered_map<std::string_view, std::size_t> byFolder_; // keys lie in entries_
};

} // namespace platform
