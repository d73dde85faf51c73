#pragma once

#include "platform/documents/DocumentServices.h"
#include "platform/documents/model/DetailsLoader.h"
#include "platform/documents/model/EntryTable.h"
#include "platform/documents/model/FolderFeed.h"
#include "platform/documents/model/FolderWatches.h"
#include "platform/documents/model/RowModel.h"

#include <functional>
#include <memory>

namespace platform {

/// The entries of one folder of the store, or of its root, in step with the disk.
class FolderModel final : public RowModel {
public:
    FolderModel(const Url& folder, const DocumentServices& services);
    ~FolderModel() override;

    const Url& folder() const { return folder_; }

    /// Starts to read and to follow the folder.
    void start();
    /// Reads it again; `done` is called in a later turn of the loop, unless the model is gone.
    void read(std::function<void()> done = {});
    /// The folder is shown again: what gave no notice meanwhile is looked up.
    void refreshShown();
    std::optional<std::size_t> indexOf(const Url& item) const;
    /// An item of that name is in the folder.
    bool contains(std::string_view name) const { return table_.find(name) != nullptr; }
    using RowModel::contains;

    ModelState state() const override { return state_; }
    const std::optional<Error>& error() const override { return error_; }
    std::size_t count() const override { return table_.size(); }
    RowId idAt(std::size_t index) const override { return table_.at(index).id; }
    std::optional<std::size_t> indexOf(RowId id) const override { return table_.indexOf(id); }
    const DocumentEntry& entryAt(std::size_t index) const override {
        return table_.at(index).entry;
    }
    Url urlAt(std::size_t index) const override;
    std::shared_ptr<const EntryDetails> detailsAt(std::size_t index) const override {
        return table_.at(index).details;
    }
    void setRowsInView(std::size_t first, std::size_t end) override;

private:
    void takeReading(std::vector<DocumentEntry> sorted, bool replaced);
    void takeChanges(const std::vector<EntryChanges>& changes);
    void takeFailure(const Error& error);
    void takeDetails(const std::vector<DetailsLoader::Answer>& answers);
    void setState(ModelState state, std::optional<Error> error);
    void takeFolderChanges(const std::vector<RowId>& rows);
    void wantDetails();
    void followFoldersInView();

    Url folder_;
    EntryTable table_;
    ModelState state_ = ModelState::loading;
    std::optional<Error> error_;
    std::size_t firstInView_ = 0;
    std::size_t endInView_ = 0;
    FolderWatches folders_; // used on the queue of the details
    DetailsLoader details_;
    FolderFeed feed_;
};

} // namespace platform
