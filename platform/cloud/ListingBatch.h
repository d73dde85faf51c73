#pragma once

#include "platform/cloud/StateDatabase.h"

#include <optional>
#include <utility>
#include <vector>

namespace platform {

/// What a listing has found out and carried out on the disk, and not written down yet.
struct ListingBatch {
    struct Change {
        ItemRow item;
        bool insert = false;
        RemoteRow remote;
        std::optional<LocalRow> local;
        std::optional<BaseRow> base;
    };
    struct Scan {
        ItemId folder = 0;
        ScanRow row;
        /// Set with a whole listing: what of the folder cannot be an item.
        std::optional<std::vector<RefusedRow>> refused;
    };
    /// Items whose place on the remote another one has now.
    std::vector<ItemId> displaced;
    std::vector<Change> changes;
    /// Items that were seen unchanged, with the listing's number.
    std::vector<std::pair<ItemId, std::int64_t>> seen;
    std::vector<Scan> scans;
    bool effectsOnDisk = false;
    /// Nothing was known before: no place can be another one's.
    bool first = false;

    std::size_t size() const {
        return displaced.size() + changes.size() + seen.size() + scans.size();
    }
    void writeTo(StateDatabase& database) const;

private:
    void write(StateDatabase& database, const Change& change) const;
};

} // namespace platform
