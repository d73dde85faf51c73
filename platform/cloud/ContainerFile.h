#pragma once

#include "platform/base/Value.h"
#include "platform/cloud/CloudContainer.h"

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// What a ".container.json" says.
struct ContainerDescription {
    std::string identifier;
    /// By language code; "" is for all others.
    std::map<std::string, std::string> names;
    /// Below the container's folder; "" for the folder itself, none for no documents folder.
    std::optional<std::string> documents = "";
    std::optional<int> folderLevels;
    std::vector<ContainerDocumentType> documentTypes;

    /// The name in a language ("de_AT" falls back to "de", then to ""); none when there is none.
    std::optional<std::string> nameIn(std::string_view language) const;
};

inline constexpr std::uint64_t largestContainerFile = 64ULL * 1024;

/// Error text for the log when the file is malformed.
Result<ContainerDescription> parseContainerFile(std::string_view content);

} // namespace platform
