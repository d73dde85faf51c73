#include "platform/documents/model/FolderModel.h"

#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/model/StoreRootReader.h"

#include <algorithm>
#include <unordered_set>

namespace platform {
namespace {

std::unique_ptr<EntrySource> sourceFor(const Url& folder, const CloudDocumentService& documents) {
    const std::optional<Url> root = documents.shelfroot();
    if (root && *root == folder)
        return std::make_unique<StoreRootReader>(folder, documents);
    return std::make_unique<FolderReader>(folder, documents);
}

bool isComplete(const EntryTable::Row& row) {
    return row.details && !row.detailsStale && (isDocument(row.entry.kind) || row.details->counted);
}

} // namespace

FolderModel::FolderModel(const Url& folder, const DocumentServices& services)
    : folder_(folder),
      folders_(services.watcher, services.mainQueue,
               [this](const auto& rows) { takeFolderChanges(rows); }),
      details_(
          services.documents, services.mainQueue,
          [this](const auto& answers) { takeDetails(answers); },
          [this](RowId row, const Url& url) { folders_.follow(row, url); }),
      feed_(sourceFor(folder, services.documents), services.mainQueue, services.watcher,
            {[this](std::vector<DocumentEntry> sorted, bool replaced) {
                 takeReading(std::move(sorted), replaced);
             },
             [this](const auto& changes) { takeChanges(changes); },
             [this](const Error& error) { takeFailure(error); }}) {
}

FolderModel::~FolderModel() = default;

void FolderModel::start() {
    feed_.read();
}

void FolderModel::read(std::function<void()> done) {
    feed_.read(std::move(done));
}

void FolderModel::refreshShown() {
    for (std::size_t i = firstInView_; i < endInView_; ++i)
        table_.markDetailsStale(table_.at(i).id);
    wantDetails();
    feed_.verify();
}

std::optional<std::size_t> FolderModel::indexOf(const Url& item) const {
    const EntryTable::Row* const row = table_.find(item.lastPathComponent());
    if (row) {
        const std::optional<std::size_t> index = table_.indexOf(row->id);
        if (index && urlAt(*index) == item)
            return index;
    }
    // A container stands under the URL of its documents, whose last component says nothing.
    for (std::size_t i = 0; i < count() && entryAt(i).kind == EntryKind::container; ++i)
        if (urlAt(i) == item)
            return i;
    return std::nullopt;
}

Url FolderModel::urlAt(std::size_t index) const {
    const DocumentEntry& entry = table_.at(index).entry;
    if (entry.container && entry.container->documentsURL())
        return *entry.container->documentsURL();
    return folder_.appending(entry.name, entry.kind != EntryKind::file);
}

void FolderModel::setRowsInView(std::size_t first, std::size_t end) {
    end = std::min(end, count());
    first = std::min(first, end);
    if (first == firstInView_ && end == endInView_)
        return;
    firstInView_ = first;
    endInView_ = end;
    wantDetails();
}

/// Those that come into view again are counted again.
void FolderModel::followFoldersInView() {
    std::unordered_set<RowId> inView;
    for (std::size_t i = firstInView_; i < endInView_; ++i)
        if (!isDocument(entryAt(i).kind))
            inView.insert(idAt(i));
    for (const RowId left : folders_.keepOnly(inView))
        table_.markDetailsStale(left);
}

void FolderModel::takeFolderChanges(const std::vector<RowId>& rows) {
    for (const RowId row : rows)
        table_.markDetailsStale(row);
    wantDetails();
}

void FolderModel::wantDetails() {
    followFoldersInView();
    std::vector<DetailsLoader::Request> requests;
    for (std::size_t i = firstInView_; i < endInView_; ++i) {
        const EntryTable::Row& row = table_.at(i);
        if (!isComplete(row))
            requests.push_back({row.id, row.version, urlAt(i), row.entry.kind,
                                row.details ? row.details->itemCount : std::nullopt});
    }
    details_.want(std::move(requests));
}

void FolderModel::takeReading(std::vector<DocumentEntry> sorted, bool replaced) {
    if (observer_)
        observer_->rowsWillChange();
    if (replaced)
        table_.clear();
    table_.adopt(std::move(sorted));
    endInView_ = std::min(endInView_, count());
    firstInView_ = std::min(firstInView_, endInView_);
    setState(ModelState::ready, std::nullopt);
    if (observer_)
        observer_->rowsDidChange();
    wantDetails();
}

void FolderModel::takeChanges(const std::vector<EntryChanges>& changes) {
    // Notices of a folder that could not be read are older than the failure.
    if (state_ != ModelState::ready)
        return;
    if (observer_)
        observer_->rowsWillChange();
    bool changed = false;
    for (const EntryChanges& each : changes)
        changed = table_.apply(each) || changed;
    endInView_ = std::min(endInView_, count());
    firstInView_ = std::min(firstInView_, endInView_);
    if (observer_ && changed)
        observer_->rowsDidChange();
    wantDetails();
}

void FolderModel::takeFailure(const Error& error) {
    if (observer_)
        observer_->rowsWillChange();
    table_.clear();
    firstInView_ = endInView_ = 0;
    setState(ModelState::failed, error);
    if (observer_)
        observer_->rowsDidChange();
}

void FolderModel::takeDetails(const std::vector<DetailsLoader::Answer>& answers) {
    std::vector<RowId> rows;
    for (const DetailsLoader::Answer& answer : answers) {
        if (!table_.find(answer.row))
            continue;
        table_.setDetails(answer.row, answer.version, answer.details);
        rows.push_back(answer.row);
    }
    if (observer_ && !rows.empty())
        observer_->rowContentDidChange(rows);
}

void FolderModel::setState(ModelState state, std::optional<Error> error) {
    const bool changed = state_ != state || error_ != error;
    state_ = state;
    error_ = std::move(error);
    if (changed && observer_)
        observer_->modelStateDidChange();
}

} // namespace platform
