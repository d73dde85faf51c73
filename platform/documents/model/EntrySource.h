#pragma once

#include "platform/base/Result.h"
#include "platform/documents/model/DocumentEntry.h"
#include "platform/files/ContentProvider.h"
#include "platform/files/DirectoryWatcher.h"

#include <optional>
#include <vector>

namespace platform {

/// Reads what a list shows of one folder. Blocks; used by one thread at a time.
class EntrySource {
public:
    virtual ~EntrySource() = default;
    virtual const Url& folder() const = 0;
    /// Unsorted. Ends early, with whatever it has, when cancelled.
    virtual Result<std::vector<DocumentEntry>> readAll(const CancelFlag& cancel) = 0;
    /// What the notices come to, by the disk as it is now; none when reading all again is better.
    virtual std::optional<EntryChanges> resolve(const std::vector<DirectoryChange>& changes) = 0;
    /// Other folders on which the reading depends; asked after each one. A change of an item of
    /// that name in one of them calls for another reading.
    virtual std::vector<Url> dependencies() const { return {}; }
    virtual std::string_view dependencyName() const { return {}; }
    /// Somebody else's answers that the reading is made of come a moment after the notice: read
    /// once more after this time. Zero when the disk is all there is.
    virtual Duration settlingTime() const { return Duration::zero(); }
};

} // namespace platform
