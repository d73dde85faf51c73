#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "platform/Platform.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/launch/TypeRegistry.h"

#include <algorithm>
#include <array>

namespace tavrin {
namespace {

using platform::Platform;
using platform::TypeRegistry;
using platform::Url;

using ContainerPointer = std::shared_ptr<const platform::CloudContainer>;

/// A blank, a black right-pointing small triangle, a blank.
constexpr std::string_view locationSeparator = " \u25B8 ";

/// Characters that no name may hold: what cannot be written (U+FFFE, U+FFFF and their kin, lone
/// surrogates), broken UTF-8, controls (C0, DEL, C1) and line ends (also U+2028 and U+2029).
bool isForbiddenCharacter(char32_t c) {
    const bool control = c < 0x20 || (c >= 0x7F && c <= 0x9F);
    const bool lineEnd = c == 0x2028 || c == 0x2029;
    const bool nonCharacter = (c & 0xFFFE) == 0xFFFE || (c >= 0xFDD0 && c <= 0xFDEF);
    const bool surrogate = c >= 0xD800 && c <= 0xDFFF;
    return control || lineEnd || nonCharacter || surrogate || c > 0x10FFFF;
}

/// Takes one character off the front of UTF-8 text; none when it is broken there.
std::optional<char32_t> takeCharacter(std::string_view& text) {
    const auto lead = static_cast<unsigned char>(text.front());
    const std::size_t length = lead < 0x80   ? 1
                               : lead < 0xC2 ? 0
                               : lead < 0xE0 ? 2
                               : lead < 0xF0 ? 3
                               : lead < 0xF5 ? 4
                                             : 0;
    if (length == 0 || text.size() < length)
        return std::nullopt;
    static constexpr std::array<unsigned char, 5> leadMask = {0, 0x7F, 0x1F, 0x0F, 0x07};
    static constexpr std::array<char32_t, 5> smallest = {0, 0, 0x80, 0x800, 0x10000};
    char32_t c = lead & leadMask[length];
    for (std::size_t i = 1; i < length; ++i) {
        const auto next = static_cast<unsigned char>(text[i]);
        if ((next & 0xC0) != 0x80)
            return std::nullopt;
        c = (c << 6) | (next & 0x3F);
    }
    text.remove_prefix(length);
    return c < smallest[length] ? std::nullopt : std::optional(c);
}

std::optional<std::string> typeOfExtension(const Url& url) {
    const std::string_view extension = url.pathExtension();
    if (extension.empty())
        return std::nullopt;
    std::optional<std::string> type = TypeRegistry::preferredIdentifierForExtension(extension);
    return type && !type->empty() ? type : std::nullopt;
}

/// One content type that a container names: whether files of type `type` suit it.
bool contentTypeTakes(const platform::Value& content, std::string_view extension,
                      std::string_view type) {
    const std::string* family = content.text();
    if (!family) {
        VXLOG(vxError, "Expected array of strings");
        return false;
    }
    if (*family == platform::types::data || *family == platform::types::content) {
        VXLOG(vxInfo, "Container supports all types (%@)", *family);
        return true;
    }
    if (!TypeRegistry::conformsTo(type, *family))
        return false;
    VXLOG(vxInfo, "Extension %@ conforms to %@", extension, *family);
    return true;
}

/// The union, without repeats, of what the container's document types take; none (logged) when one
/// of them holds something else than a list.
std::optional<platform::Value::List> contentTypesOf(const platform::CloudContainer& container) {
    platform::Value::List found;
    for (const platform::ContainerDocumentType& kind : container.documentTypes()) {
        const platform::Value::List* types = kind.contentTypes.list();
        if (!types) {
            VXLOG(vxError, "Expected a set of content types, found %@", kind.contentTypes);
            return std::nullopt;
        }
        for (const platform::Value& one : *types)
            if (std::find(found.begin(), found.end(), one) == found.end())
                found.push_back(one);
    }
    return found;
}

/// The path below the directory of all cloud documents; none outside it.
std::optional<Url> relativeToShelfroot(const Url& url) {
    const auto path = Platform::current().documents().pathRelativeToShelfroot(url);
    return path ? std::optional(Url::file(*path)) : std::nullopt;
}

} // namespace

bool FileUtils::isValidFilename(std::string_view name) {
    if (name.empty() || name.front() == '.' || name.find_first_of("/:") != std::string_view::npos)
        return false;
    while (!name.empty()) {
        const std::optional<char32_t> c = takeCharacter(name);
        if (!c || isForbiddenCharacter(*c))
            return false;
    }
    return true;
}

bool FileUtils::isAudioVideoImageFile(const Url& url) {
    const std::optional<std::string> type = typeOfExtension(url);
    if (!type)
        return false;
    const std::string_view extension = url.pathExtension();
    for (const std::string_view family :
         {platform::types::image, platform::types::movie, platform::types::audio}) {
        if (TypeRegistry::conformsTo(*type, family)) {
            VXLOG(vxDebug, "Extension %@ (%@) conforms to %@", extension, *type, family);
            return true;
        }
    }
    VXLOG(vxDebug, "Extension %@ (%@) does not conform to image, movie or audio", extension, *type);
    return false;
}

bool FileUtils::isValidExtensionForContainer(const Url& url) {
    const std::optional<std::string> type = typeOfExtension(url);
    if (!type)
        return true;
    const auto container = Platform::current().documents().containerForItemAtURL(url);
    if (!container || !*container)
        return false;
    if ((*container)->identifier() == platform::defaultContainerIdentifier)
        return true;
    if (!(*container)->documentsURL())
        return false;
    if ((*container)->documentTypes().empty())
        return true;
    const std::optional<platform::Value::List> contents = contentTypesOf(**container);
    if (!contents)
        return false;
    const std::string_view extension = url.pathExtension();
    return std::any_of(contents->begin(), contents->end(), [&](const platform::Value& content) {
        return contentTypeTakes(content, extension, *type);
    });
}

std::optional<std::string> FileUtils::containerIdForURL(const Url& url) {
    const auto container = Platform::current().documents().containerForItemAtURL(url);
    return container && *container ? std::optional((*container)->identifier()) : std::nullopt;
}

platform::Failure
FileUtils::containerAndRelativePathforURL(const Url& url, ContainerPointer* container,
                                          std::vector<std::string>* relativePathComponents) {
    const platform::Result<ContainerPointer> found =
        Platform::current().documents().containerForItemAtURL(url);
    if (!found)
        return found.error();
    if (!*found)
        return std::nullopt;
    if (container)
        *container = *found;
    if (!relativePathComponents || !(*found)->documentsURL())
        return std::nullopt;
    const auto itemPath = relativeToShelfroot(url);
    const auto documentsPath = relativeToShelfroot(*(*found)->documentsURL());
    if (!itemPath || !documentsPath)
        return std::nullopt;
    const std::vector<std::string_view> item = itemPath->pathComponents();
    const std::size_t depth = documentsPath->pathComponents().size();
    if (item.size() > depth)
        relativePathComponents->assign(item.begin() + static_cast<std::ptrdiff_t>(depth),
                                       item.end());
    return std::nullopt;
}

std::optional<std::string> FileUtils::displayableLocationForURL(const Url& url) {
    ContainerPointer container;
    std::vector<std::string> path;
    if (containerAndRelativePathforURL(url, &container, &path) || !container)
        return std::nullopt;
    std::string text;
    if (!container->isDefault()) {
        text += Platform::current().documents().localizedNameForDefaultContainer();
        text += locationSeparator;
    }
    text += container->localizedName();
    for (std::size_t i = 0; i + 1 < path.size(); ++i) {
        text += locationSeparator;
        text += path[i];
    }
    VXLOG(vxDebug, "PathBar: %@", text);
    return text;
}

} // namespace tavrin
