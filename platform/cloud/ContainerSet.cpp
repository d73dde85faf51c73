#include "platform/cloud/ContainerSet.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/ContainerFile.h"
#include "platform/files/FileManager.h"

#include <algorithm>
#include <set>

namespace platform {
namespace {

ContainerDescription descriptionOf(const std::string& folder) {
    const std::string path = folder + '/' + std::string(containerFileName);
    const Result<Bytes> content = FileManager::contents(Url::file(path), largestContainerFile + 1);
    if (!content) {
        if (!content.error().is(ErrorCode::noSuchItem))
            platformLog(LogLevel::warning, "cloud: cannot read %@: %@", path, content.error());
        return {};
    }
    Result<ContainerDescription> description =
        content->size() > largestContainerFile
            ? makeErrorWithText(ErrorCode::readCorrupt, "it is too large")
            : parseContainerFile({reinterpret_cast<const char*>(content->data()), content->size()});
    if (description)
        return std::move(*description);
    platformLog(LogLevel::warning, "cloud: %@ is malformed and counts as absent: %@", path,
                description.error());
    return {};
}

/// The identifier of a folder without a description: the same for the same name.
std::string identifierForFolder(const std::string& folder) {
    return folder == defaultContainerFolder ? std::string(defaultContainerIdentifier)
                                            : "com.pelmora.folder." + percentEncoded(folder);
}

std::vector<std::string> topFolders(const std::string& root) {
    std::vector<std::string> names;
    const Failure failure = FileManager::enumerate(root, [&](const DirectoryEntry& entry) {
        bool isFolder = entry.kind == FileKind::directory;
        if (entry.kind == FileKind::other) {
            const auto attributes =
                FileManager::attributes(root + '/' + entry.name, FollowLinks::no);
            isFolder = attributes && attributes->kind == FileKind::directory;
        }
        if (isFolder && !entry.name.starts_with('.'))
            names.push_back(entry.name);
        return true;
    });
    if (failure)
        platformLog(LogLevel::error, "cloud: cannot read the containers: %@", *failure);
    std::sort(names.begin(), names.end());
    return names;
}

ContainerSet::Entry entryOf(const std::string& root, const std::string& folder,
                            std::set<std::string>& taken) {
    ContainerDescription description = descriptionOf(root + '/' + folder);
    std::string identifier =
        description.identifier.empty() ? identifierForFolder(folder) : description.identifier;
    const bool claimsDefault =
        identifier == defaultContainerIdentifier && folder != defaultContainerFolder;
    if (claimsDefault || !taken.insert(identifier).second) {
        platformLog(LogLevel::warning,
                    "cloud: container %@ claims the identifier %@, which is taken", folder,
                    identifier);
        identifier = "com.pelmora.folder." + percentEncoded(folder);
        taken.insert(identifier);
    }
    CloudContainer::Rules rules;
    rules.identifier = std::move(identifier);
    const bool isDefault = folder == defaultContainerFolder;
    rules.localizedName =
        description.nameIn(systemLanguage()).value_or(isDefault ? localized("Documents") : folder);
    ContainerSet::Entry entry{folder, nullptr, ""};
    if (description.documents) {
        entry.documents = folder;
        if (!description.documents->empty())
            entry.documents += '/' + *description.documents;
        rules.documentsUrl = Url::file(root + '/' + entry.documents, true);
    }
    rules.supportedFolderLevels = description.folderLevels;
    rules.documentTypes = std::move(description.documentTypes);
    entry.container = std::make_shared<const CloudContainer>(std::move(rules));
    return entry;
}

} // namespace

std::shared_ptr<const ContainerSet> ContainerSet::read(const std::string& root) {
    auto set = std::make_shared<ContainerSet>();
    std::set<std::string> taken;
    for (const std::string& folder : topFolders(root))
        set->entries_.push_back(entryOf(root, folder, taken));
    for (std::size_t i = 0; i < set->entries_.size(); ++i)
        set->byFolder_.emplace(set->entries_[i].folder, i);
    return set;
}

const ContainerSet::Entry* ContainerSet::holding(std::string_view relativePath) const {
    const auto found = byFolder_.find(relativePath.substr(0, relativePath.find('/')));
    return found == byFolder_.end() ? nullptr : &entries_[found->second];
}

const ContainerSet::Entry* ContainerSet::defaultEntry() const {
    return holding(defaultContainerFolder);
}

bool ContainerSet::isDocumentsRoot(std::string_view relativePath) const {
    const Entry* const entry = holding(relativePath);
    return entry && !relativePath.empty() && entry->documents == relativePath;
}

} // namespace platform
