#pragma once

#include "platform/base/Url.h"

#include <optional>
#include <string>
#include <vector>

namespace platform {

class CloudDocumentService;

/// The folders whose lists lead from the store's root down to `folder`, in order; a container
/// stands there as its documents. None when the folder is not inside the store or not there.
std::optional<std::vector<Url>> folderPathFromRoot(const Url& folder,
                                                   const CloudDocumentService& documents);

/// What a screen of that folder is called.
std::string folderTitle(const Url& folder, const CloudDocumentService& documents);

/// How many folders `folder` lies below the documents of its container; 0 there. None outside any
/// container, and where a container keeps no documents.
std::optional<std::size_t> folderDepth(const Url& folder, const CloudDocumentService& documents);

} // namespace platform
