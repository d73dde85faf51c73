#include "platform/documents/search/SearchModel.h"

#include <algorithm>

namespace platform {

SearchModel::SearchModel(const DocumentServices& services, std::unique_ptr<StoreSearch> search)
    : details_(services.documents, services.mainQueue,
               [this](const auto& answers) { takeDetails(answers); }),
      search_(std::move(search)) {
}

void SearchModel::find(const std::string& text) {
    if (text == text_)
        return;
    text_ = text;
    state_ = text.empty() ? ModelState::ready : ModelState::loading;
    if (text.empty())
        take({});
    else
        search_->find(text, [this](std::vector<FoundItem> items) { take(std::move(items)); });
    if (observer_)
        observer_->modelStateDidChange();
}

std::optional<std::size_t> SearchModel::indexOf(RowId id) const {
    if (id < first_ || id - first_ >= rows_.size())
        return std::nullopt;
    return id - first_;
}

void SearchModel::take(std::vector<FoundItem> items) {
    if (text_.empty())
        items.clear();
    if (observer_)
        observer_->rowsWillChange();
    first_ += rows_.size();
    rows_.clear();
    for (FoundItem& item : items)
        rows_.push_back({std::move(item), nullptr});
    state_ = ModelState::ready;
    if (!observer_)
        return;
    observer_->rowsDidChange();
    observer_->modelStateDidChange();
}

void SearchModel::setRowsInView(std::size_t first, std::size_t end) {
    std::vector<DetailsLoader::Request> requests;
    for (std::size_t i = first; i < std::min(end, rows_.size()); ++i)
        if (!rows_[i].details)
            requests.push_back(
                {idAt(i), 0, rows_[i].item.url, rows_[i].item.entry.kind, std::nullopt});
    details_.want(std::move(requests));
}

void SearchModel::takeDetails(const std::vector<DetailsLoader::Answer>& answers) {
    std::vector<RowId> rows;
    for (const DetailsLoader::Answer& answer : answers)
        if (const std::optional<std::size_t> index = indexOf(answer.row)) {
            rows_[*index].details = answer.details;
            rows.push_back(answer.row);
        }
    if (observer_ && !rows.empty())
        observer_->rowContentDidChange(rows);
}

} // namespace platform
