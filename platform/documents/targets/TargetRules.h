#pragma once

#include "platform/base/Url.h"

#include <optional>
#include <string>

namespace platform {

class CloudDocumentService;
class MovedItems;

/// Why the items cannot go into the folder, in the user's language; none when they can. The names
/// that are in the folder already play no part in it.
std::optional<std::string> whyNotInto(const Url& folder, const MovedItems& items,
                                      const CloudDocumentService& documents);

/// Whether the container lets a folder be made in that one.
bool mayHoldNewFolder(const Url& folder, const CloudDocumentService& documents);

} // namespace platform
