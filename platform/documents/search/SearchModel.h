#pragma once

#include "platform/documents/DocumentServices.h"
#include "platform/documents/model/DetailsLoader.h"
#include "platform/documents/model/RowModel.h"
#include "platform/documents/search/StoreSearch.h"

#include <memory>
#include <string>
#include <vector>

namespace platform {

/// What was found for the text that is being searched for. Belongs to the main thread.
class SearchModel final : public RowModel {
public:
    SearchModel(const DocumentServices& services, std::unique_ptr<StoreSearch> search);

    /// The former rows stay until there are new ones. "" finds nothing.
    void find(const std::string& text);
    const std::string& text() const { return text_; }

    ModelState state() const override { return state_; }
    const std::optional<Error>& error() const override { return noError_; }
    std::size_t count() const override { return rows_.size(); }
    RowId idAt(std::size_t index) const override { return first_ + index; }
    std::optional<std::size_t> indexOf(RowId id) const override;
    const DocumentEntry& entryAt(std::size_t index) const override {
        return rows_[index].item.entry;
    }
    Url urlAt(std::size_t index) const override { return rows_[index].item.url; }
    std::shared_ptr<const EntryDetails> detailsAt(std::size_t index) const override {
        return rows_[index].details;
    }
    std::string placeAt(std::size_t index) const override { return rows_[index].item.place; }
    void setRowsInView(std::size_t first, std::size_t end) override;

private:
    struct Row {
        FoundItem item;
        std::shared_ptr<const EntryDetails> details;
    };
    void take(std::vector<FoundItem> items);
    void takeDetails(const std::vector<DetailsLoader::Answer>& answers);

    std::string text_;
    ModelState state_ = ModelState::ready;
    std::optional<Error> noError_;
    std::vector<Row> rows_;
    /// Rows of an earlier search have other numbers.
    RowId first_ = 1;
    DetailsLoader details_;
    std::unique_ptr<StoreSearch> search_;
};

} // namespace platform
