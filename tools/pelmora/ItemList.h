#pragma once

#include "platform/cloud/CloudDocumentService.h"

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

namespace pelmora {

struct ListedItem {
    std::string name;
    platform::Url url;
    bool folder = false;
    bool promised = false;
    std::optional<std::int64_t> size;
    std::optional<platform::Date> modified;
};

/// The documents and folders of a folder in the order of their names, promised ones among them; of
/// a document, the document alone. Hidden items are left out.
platform::Result<std::vector<ListedItem>> itemsAt(const platform::CloudDocumentService& documents,
                                                  const platform::Url& url);

/// For people: "6.3 MB".
std::string sizeText(std::int64_t bytes);

} // namespace pelmora
