#pragma once

#include "platform/documents/model/EntrySource.h"
#include "platform/files/FileManager.h"

#include <string>
#include <unordered_map>

namespace platform {

class CloudDocumentService;

/// An ordinary folder of the store: its names in one pass. Promises stand under the names of their
/// documents; a file that only looks like a promise is the user's own and is listed as what it is.
/// Other hidden files are left out.
class FolderReader final : public EntrySource {
public:
    FolderReader(Url folder, const CloudDocumentService& documents);

    const Url& folder() const override { return folder_; }
    Result<std::vector<DocumentEntry>> readAll(const CancelFlag& cancel) override;
    std::optional<EntryChanges> resolve(const std::vector<DirectoryChange>& changes) override;

    /// How many entries readAll would answer; none when the folder cannot be read or the count was
    /// cancelled.
    static std::optional<std::size_t>
    count(const Url& folder, const CloudDocumentService& documents, const CancelFlag& cancel);

private:
    struct Names;
    class Notices;

    Result<Names> readNames(const CancelFlag& cancel) const;
    void addPromises(const std::vector<std::string>& sidecars, std::vector<DocumentEntry>& entries,
                     const CancelFlag& cancel);
    DocumentEntry entryFor(DirectoryEntry found) const;
    EntryFact factFor(const std::string& name) const;
    std::optional<std::string> promisedBy(const std::string& sidecar) const;

    Url folder_;
    const CloudDocumentService& documents_;
    /// What promises that bear a shortened name stand for: not to be told from the name alone once
    /// they are gone.
    std::unordered_map<std::string, std::string> shortened_;
};

} // namespace platform
