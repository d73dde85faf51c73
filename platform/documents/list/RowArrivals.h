#pragma once

#include "platform/base/MainQueue.h"
#include "platform/documents/model/RowModel.h"
#include "platform/files/Progress.h"

#include <functional>
#include <memory>
#include <optional>
#include <unordered_map>

namespace platform {

/// Follows how far the contents of the promised rows in view have arrived. Belongs to the main
/// thread.
class RowArrivals {
public:
    /// None: nothing is on its way (any more).
    using Changed = std::function<void(RowId row, std::optional<double> share)>;

    RowArrivals(FileProgressSubscription& progress, MainQueue& main, Changed changed);
    ~RowArrivals();
    RowArrivals(const RowArrivals&) = delete;
    RowArrivals& operator=(const RowArrivals&) = delete;

    /// Follows the promised rows from `first` up to `end` and lets go of all others.
    void follow(const RowModel& model, std::size_t first, std::size_t end);

private:
    struct Receiver;
    struct Followed {
        Url url;
        FileProgressSubscription::Token token;
    };

    FileProgressSubscription::Token subscribe(RowId row, const Url& url);

    FileProgressSubscription& progress_;
    std::shared_ptr<Receiver> receiver_;
    std::unordered_map<RowId, Followed> followed_;
};

} // namespace platform
