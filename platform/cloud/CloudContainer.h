#pragma once

#include "platform/base/Result.h"
#include "platform/base/Value.h"

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {

/// The identifier of the store's own top-level library.
inline constexpr std::string_view defaultContainerIdentifier = "com.pelmora.documents";

/// How deep a container lets folders go; the values stand in this order.
enum class FolderLevels { none = 0, any = 1, one = 2 };

struct ContainerDocumentType {
    std::string name;
    /// A list of the type identifiers of the contents that the type takes; any other kind of value
    /// when the container's description is malformed there.
    Value contentTypes;
};

/// An application library at the top of the store. An immutable snapshot of its rules.
class CloudContainer {
public:
    struct Rules {
        std::string identifier;
        std::string localizedName;
        std::optional<Url> documentsUrl;
        /// None when the container does not say; any other number when it says something unknown.
        std::optional<int> supportedFolderLevels;
        std::vector<ContainerDocumentType> documentTypes;
    };
    explicit CloudContainer(Rules rules) : rules_(std::move(rules)) {}

    const std::string& identifier() const { return rules_.identifier; }
    const std::string& localizedName() const { return rules_.localizedName; }
    /// The folder that holds the container's documents.
    const std::optional<Url>& documentsURL() const { return rules_.documentsUrl; }
    std::optional<int> supportedFolderLevels() const { return rules_.supportedFolderLevels; }
    const std::vector<ContainerDocumentType>& documentTypes() const { return rules_.documentTypes; }
    bool isDefault() const { return rules_.identifier == defaultContainerIdentifier; }

private:
    Rules rules_;
};

} // namespace platform
