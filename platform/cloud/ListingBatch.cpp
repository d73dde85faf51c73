#include "platform/cloud/ListingBatch.h"

namespace platform {

void ListingBatch::writeTo(StateDatabase& database) const {
    for (const Change& change : changes) {
        if (change.insert)
            database.insertItem(change.item);
        database.putRemote(change.item.id, change.remote);
        if (change.local)
            database.putLocal(change.item.id, *change.local);
        if (change.base)
            database.putBase(change.item.id, *change.base);
    }
    for (const auto& [item, generation] : seen)
        database.setRemoteGeneration(item, generation);
    for (const Scan& scan : scans) {
        database.putScan(scan.folder, Side::remote, scan.row);
        if (scan.refused)
            database.setRefused(scan.folder, Side::remote, *scan.refused);
    }
}

} // namespace platform
