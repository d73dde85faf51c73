#pragma once

#include "platform/base/Clock.h"
#include "platform/cloud/StoreFolder.h"
#include "platform/files/ContentProvider.h"

#include <string>
#include <vector>

// Takes the files of an account off this device when its user signs out and wants that. Only what
// the account surely has goes; the rest stays where it is and is named.

namespace platform {

/// What is on this device alone: documents that the account is not known to have in this version,
/// relative to the store's root. Changes nothing; also while the store is in use. Blocks, and reads
/// the documents whose dates differ from those recorded.
Result<std::vector<std::string>> unsentDocuments(const StoreLayout& layout, StoreFileSystem& disk,
                                                 CancelFlag& cancel);

/// Removes the store: first the records, so that whoever signs in again takes nothing for deleted,
/// then each document whose whole content is the one that was recorded as uploaded, then what is
/// left empty. Answers what stays, as above; contents in `kept/` that are only here stay as well.
/// itemBusy while another program has the store, or while a stopped one has left work in it.
/// Blocks. Nothing may have the store open in this program.
Result<std::vector<std::string>> takeStoreAway(const StoreLayout& layout, StoreFileSystem& disk,
                                               Clock& clock, CancelFlag& cancel);

} // namespace platform
