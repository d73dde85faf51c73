#pragma once

#include "platform/documents/model/FolderReader.h"

namespace platform {

/// The root of the store: one entry a container, under its localized name, and the user's own files
/// that lie beside the containers.
class StoreRootReader final : public EntrySource {
public:
    StoreRootReader(const Url& root, const CloudDocumentService& documents);

    const Url& folder() const override { return reader_.folder(); }
    Result<std::vector<DocumentEntry>> readAll(const CancelFlag& cancel) override;
    std::optional<EntryChanges> resolve(const std::vector<DirectoryChange>&) override {
        return std::nullopt;
    }
    std::vector<Url> dependencies() const override { return folders_; }
    std::string_view dependencyName() const override;
    Duration settlingTime() const override;

private:
    FolderReader reader_;
    const CloudDocumentService& documents_;
    std::vector<Url> folders_;
};

} // namespace platform
