#pragma once

#include "platform/documents/model/DocumentEntry.h"
#include "platform/files/ContentProvider.h"

#include <memory>
#include <string_view>
#include <vector>

namespace platform {

/// The order of names in a list: that of the user's language, with numbers by their value and
/// letter case as the last word. Belongs to one thread.
class NameOrder {
public:
    NameOrder();
    ~NameOrder();
    NameOrder(const NameOrder&) = delete;
    NameOrder& operator=(const NameOrder&) = delete;

    /// Below, at or above 0. It is 0 for equal bytes only: names that the language does not tell
    /// apart stand in the order of their bytes.
    int compare(std::string_view a, std::string_view b) const;
    bool before(const DocumentEntry& a, const DocumentEntry& b) const;

private:
    struct Collator;
    std::unique_ptr<Collator> collator_;
};

/// Sorts the entries of a folder, with as many cores as are free. Unfinished when cancelled.
void sortEntries(std::vector<DocumentEntry>& entries, const CancelFlag& cancel);

} // namespace platform
