#include "platform/cloud/TransferActivity.h"

#include <utility>

namespace platform {

std::vector<TransferInfo> TransferActivity::now() const {
    const std::lock_guard lock(mutex_);
    std::vector<TransferInfo> transfers;
    transfers.reserve(entries_.size());
    for (const auto& [number, entry] : entries_)
        transfers.push_back({entry->path_, entry->up_,
                             entry->done_.load(std::memory_order_relaxed), entry->total_});
    return transfers;
}

TransferActivity::Entry::Entry(TransferActivity* activity, std::string path, bool up,
                               std::uint64_t total)
    : activity_(activity), path_(std::move(path)), up_(up), total_(total) {
    if (!activity_)
        return;
    {
        const std::lock_guard lock(activity_->mutex_);
        number_ = activity_->next_++;
        activity_->entries_.emplace(number_, this);
    }
    if (activity_->changed_)
        activity_->changed_();
}

TransferActivity::Entry::~Entry() {
    if (!activity_)
        return;
    {
        const std::lock_guard lock(activity_->mutex_);
        activity_->entries_.erase(number_);
    }
    if (activity_->changed_)
        activity_->changed_();
}

} // namespace platform
