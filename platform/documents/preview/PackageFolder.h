#pragma once

#include "platform/base/Result.h"
#include "platform/documents/preview/ContentsTree.h"

#include <memory>

namespace platform {

class CloudDocumentService;

/// What could be listed of a package.
struct PackageContents {
    std::shared_ptr<ContentsTree> tree = std::make_shared<ContentsTree>();
    /// There is more than a listing shows, or a folder in it could not be read.
    bool cut = false;
};

/// Lists a folder that is one document, with the folders in it. Links are shown and not followed:
/// what they lead to is no part of the document. Blocks; unfinished when cancelled. An error when
/// the folder itself cannot be read.
Result<PackageContents> listPackage(const Url& package, const CloudDocumentService& documents,
                                    const CancelFlag& cancel);

} // namespace platform
