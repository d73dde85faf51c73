#include "platform/cloud/ListingBatch.h"

namespace platform {

void ListingBatch::writeTo(StateDatabase& database) const {
    for (const ItemId item : displaced)
        database.displaceRemote(item);
    for (const Change& change : changes)
        write(database, change);
    for (const auto& [item, generation] : seen)
        database.setRemoteGeneration(item, generation);
    for (const Scan& scan : scans) {
        database.putScan(scan.folder, Side::remote, scan.row);
        if (scan.refused)
            database.setRefused(scan.folder, Side::remote, *scan.refused);
    }
}

void ListingBatch::write(StateDatabase& database, const Change& change) const {
    ItemRow item = change.item;
    bool local = change.local.has_value();
    if (!first) {
        // Since the folder was read, a look at the disk may have found somebody else there.
        const auto taken = [&](std::optional<ItemId> other) { return other && *other != item.id; };
        if (item.place && taken(database.itemAt(*item.place)))
            item.place.reset();
        if (local && taken(database.localItemAt(change.local->place)))
            local = false;
        if (!change.insert && !database.state(item.id))
            return; // forgotten meanwhile; the next listing sees it as new
        if (const auto other = database.remoteItemAt(change.remote.place); taken(other))
            database.displaceRemote(*other); // it is not there any more
    }
    if (change.insert)
        database.insertItem(item);
    else if (local && item.place)
        database.setItemPlace(item.id, item.place);
    database.putRemote(item.id, change.remote);
    if (local)
        database.putLocal(item.id, *change.local);
    if (change.base && (local || !change.local))
        database.putBase(item.id, *change.base);
}

} // namespace platform
