#pragma once

#include "platform/cloud/StoreContext.h"

namespace platform {

/// Where local content goes that was replaced or deleted: `kept/MOMENT/PATH`, and
/// `kept/MOMENT only here/PATH` for what the remote is not known to have. See docs/store.md.
class KeptFolder {
public:
    explicit KeptFolder(const StoreContext& context) : context_(context) {}

    /// Moves the item there. Answers its path there; after an error it is where it was.
    Result<std::string> take(const std::string& relative, bool onlyHere) {
        return takeFrom(context_.pathOf(relative), relative, onlyHere);
    }
    /// The same for what lies at `from` now and was at `relative`.
    Result<std::string> takeFrom(const std::string& from, const std::string& relative,
                                 bool onlyHere);

    /// Removes what has lain there for 30 days, and the oldest where all of it takes more than a
    /// tenth of the free space. Never what is only here.
    void expire();

private:
    Failure makeFolders(const std::string& relative);
    std::uint64_t sizeOf(const std::string& folder) const;

    const StoreContext& context_;
};

} // namespace platform
