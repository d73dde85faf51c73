#pragma once

#include "platform/cloud/ItemAttributes.h"
#include "platform/cloud/StoreView.h"

#include <string>
#include <string_view>

namespace platform {

/// Attributes of what stands at `path`, whose state `attributes` is. Asks the disk for nothing
/// else, except the extension's visibility and, of a package, whether promises lie in it. `view` is
/// empty for an item outside the store.
ResourceValues readLocalAttributes(const Url& url, const FileAttributes& attributes,
                                   const StoreView* view, ResourceKeys keys);

/// Attributes of a document that is only promised.
ResourceValues readPromisedAttributes(const Url& url, const RemoteRow& remote, ResourceKeys keys);

/// Whether a folder of that name is shown as one document.
bool isPackageFolder(const Url& url);

} // namespace platform
