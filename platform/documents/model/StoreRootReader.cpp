#include "platform/documents/model/StoreRootReader.h"

#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/ContainerSet.h"

namespace platform {
namespace {

/// The store looks at its containers on a queue of its own, by the same notices as we do.
constexpr Duration storeSettlingTime = std::chrono::milliseconds(500);

} // namespace

StoreRootReader::StoreRootReader(const Url& root, const CloudDocumentService& documents)
    : reader_(root, documents), documents_(documents) {
}

Result<std::vector<DocumentEntry>> StoreRootReader::readAll(const CancelFlag& cancel) {
    Result<std::vector<DocumentEntry>> all = reader_.readAll(cancel);
    if (!all)
        return all;
    folders_.clear();
    std::vector<DocumentEntry> shown;
    for (DocumentEntry& entry : *all) {
        if (entry.kind == EntryKind::file) {
            shown.push_back(std::move(entry));
            continue;
        }
        const Url folder = reader_.folder().appending(entry.name, true);
        folders_.push_back(folder);
        if (auto container = documents_.containerForItemAtURL(folder)) {
            // A container without a documents folder keeps nothing for people to see.
            if (!(*container)->documentsURL())
                continue;
            entry.kind = EntryKind::container;
            entry.container = std::move(*container);
        }
        shown.push_back(std::move(entry));
    }
    return shown;
}

std::string_view StoreRootReader::dependencyName() const {
    return containerFileName;
}

Duration StoreRootReader::settlingTime() const {
    return storeSettlingTime;
}

} // namespace platform
