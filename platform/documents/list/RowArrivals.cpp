#include "platform/documents/list/RowArrivals.h"

#include <atomic>
#include <cmath>

namespace platform {
namespace {

/// A ring of that many steps looks smooth; a transfer reports far more often.
constexpr double steps = 200;

} // namespace

struct RowArrivals::Receiver : std::enable_shared_from_this<RowArrivals::Receiver> {
    Receiver(MainQueue& theMain, Changed theChanged)
        : main(theMain), changed(std::move(theChanged)) {}

    void tell(RowId row, std::optional<double> share) {
        main.async([weak = weak_from_this(), row, share] {
            if (const auto self = weak.lock())
                self->changed(row, share);
        });
    }

    MainQueue& main;
    const Changed changed;
};

RowArrivals::RowArrivals(FileProgressSubscription& progress, MainQueue& main, Changed changed)
    : progress_(progress), receiver_(std::make_shared<Receiver>(main, std::move(changed))) {
}

RowArrivals::~RowArrivals() {
    for (const auto& [row, followed] : followed_)
        progress_.removeSubscriber(followed.token);
}

void RowArrivals::follow(const RowModel& model, std::size_t first, std::size_t end) {
    std::unordered_map<RowId, Followed> wanted;
    for (std::size_t i = first; i < std::min(end, model.count()); ++i) {
        const DocumentEntry& entry = model.entryAt(i);
        const auto details = model.detailsAt(i);
        if (!entry.promised && !(details && details->promised))
            continue;
        const RowId row = model.idAt(i);
        const Url url = model.urlAt(i);
        const auto known = followed_.find(row);
        if (known != followed_.end() && known->second.url == url)
            wanted.insert(followed_.extract(known));
        else
            wanted.emplace(row, Followed{url, subscribe(row, url)});
    }
    for (const auto& [row, followed] : followed_) {
        progress_.removeSubscriber(followed.token);
        // One whose place another subscription has taken goes on.
        if (!wanted.contains(row))
            receiver_->changed(row, std::nullopt);
    }
    followed_ = std::move(wanted);
}

FileProgressSubscription::Token RowArrivals::subscribe(RowId row, const Url& url) {
    return progress_.addSubscriber(
        url, [receiver = receiver_, row](const std::shared_ptr<Progress>& progress) {
            const auto last = std::make_shared<std::atomic<int>>(-1);
            const auto observe = [receiver, row, last](const Progress& now) {
                const double share = now.fractionCompleted();
                const int step = static_cast<int>(std::floor(share * steps));
                if (last->exchange(step) != step)
                    receiver->tell(row, share);
            };
            observe(*progress);
            const Progress::ObserverId observer = progress->addObserver(observe);
            return [receiver, row, progress, observer] {
                progress->removeObserver(observer);
                receiver->tell(row, std::nullopt);
            };
        });
}

} // namespace platform
