#include "platform/cloud/ContainerFile.h"

#include <nlohmann/json.hpp>

namespace platform {
namespace {

using Json = nlohmann::json;

/// Of a number that no level has: the container says something that this version does not know.
constexpr int unknownFolderLevels = -1;

Error malformed(const char* what) {
    return makeErrorWithText(ErrorCode::readCorrupt, what);
}

Value valueOf(const Json& json) {
    switch (json.type()) {
    case Json::value_t::boolean:
        return json.get<bool>();
    case Json::value_t::number_integer:
    case Json::value_t::number_unsigned:
        return json.get<std::int64_t>();
    case Json::value_t::number_float:
        return json.get<double>();
    case Json::value_t::string:
        return json.get<std::string>();
    case Json::value_t::array: {
        Value::List list;
        for (const Json& element : json)
            list.push_back(valueOf(element));
        return list;
    }
    default:
        return {};
    }
}

/// A path that stays below the folder that it is relative to.
bool isInnerPath(std::string_view path) {
    if (path.starts_with('/') || path.find('\0') != std::string_view::npos)
        return false;
    while (!path.empty()) {
        const std::size_t slash = path.find('/');
        const std::string_view part = path.substr(0, slash);
        if (part.empty() || part == "." || part == "..")
            return false;
        path.remove_prefix(slash == std::string_view::npos ? path.size() : slash + 1);
    }
    return true;
}

Failure readNames(const Json& object, ContainerDescription& description) {
    const auto names = object.find("names");
    if (names == object.end())
        return std::nullopt;
    if (!names->is_object())
        return malformed("“names” is no object");
    for (const auto& [language, name] : names->items()) {
        if (!name.is_string())
            return malformed("a name is no text");
        description.names[language] = name.get<std::string>();
    }
    return std::nullopt;
}

Failure readDocuments(const Json& object, ContainerDescription& description) {
    const auto documents = object.find("documents");
    if (documents == object.end())
        return std::nullopt;
    if (documents->is_null()) {
        description.documents.reset();
        return std::nullopt;
    }
    if (!documents->is_string() || !isInnerPath(documents->get_ref<const std::string&>()))
        return malformed("“documents” is no path within the container");
    description.documents = documents->get<std::string>();
    return std::nullopt;
}

Failure readLevels(const Json& object, ContainerDescription& description) {
    const auto levels = object.find("folderLevels");
    if (levels == object.end())
        return std::nullopt;
    if (!levels->is_string())
        return malformed("“folderLevels” is no text");
    const std::string& text = levels->get_ref<const std::string&>();
    description.folderLevels = text == "none"  ? static_cast<int>(FolderLevels::none)
                               : text == "one" ? static_cast<int>(FolderLevels::one)
                               : text == "any" ? static_cast<int>(FolderLevels::any)
                                               : unknownFolderLevels;
    return std::nullopt;
}

Failure readTypes(const Json& object, ContainerDescription& description) {
    const auto types = object.find("documentTypes");
    if (types == object.end())
        return std::nullopt;
    if (!types->is_array())
        return malformed("“documentTypes” is no list");
    for (const Json& type : *types) {
        if (!type.is_object())
            return malformed("a document type is no object");
        ContainerDocumentType documentType;
        if (const auto name = type.find("name"); name != type.end() && name->is_string())
            documentType.name = name->get<std::string>();
        if (const auto contents = type.find("contentTypes"); contents != type.end())
            documentType.contentTypes = valueOf(*contents);
        description.documentTypes.push_back(std::move(documentType));
    }
    return std::nullopt;
}

} // namespace

std::optional<std::string> ContainerDescription::nameIn(std::string_view language) const {
    for (const std::string& key :
         {std::string(language), std::string(language.substr(0, language.find('_'))),
          std::string()})
        if (const auto found = names.find(key); found != names.end() && !found->second.empty())
            return found->second;
    return std::nullopt;
}

Result<ContainerDescription> parseContainerFile(std::string_view content) {
    const Json object = Json::parse(content.begin(), content.end(), nullptr, false);
    if (!object.is_object())
        return malformed("it is no JSON object");
    ContainerDescription description;
    if (const auto found = object.find("identifier"); found != object.end()) {
        if (!found->is_string() || found->get_ref<const std::string&>().empty())
            return malformed("“identifier” is no text");
        description.identifier = found->get<std::string>();
    }
    for (const auto read : {&readNames, &readDocuments, &readLevels, &readTypes})
        if (Failure failure = read(object, description))
            return *failure;
    return description;
}

} // namespace platform
