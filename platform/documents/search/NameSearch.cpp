#include "platform/base/MainQueue.h"
#include "platform/base/WorkQueue.h"
#include "platform/documents/DocumentServices.h"
#include "platform/documents/search/NameIndex.h"

namespace platform {
namespace {

class NameSearch final : public StoreSearch {
public:
    explicit NameSearch(const DocumentServices& services)
        : main_(services.mainQueue),
          index_(services.documents),
          queue_(std::make_unique<WorkQueue>("platform.search", WorkPriority::userInitiated)) {
        queue_->async([this] { index_.read(ended_); });
    }

    ~NameSearch() override {
        ended_.cancel();
        if (asked_)
            asked_->cancel();
        queue_.reset();
    }

    void find(const std::string& text, Receiver receiver) override {
        if (asked_)
            asked_->cancel();
        asked_ = std::make_shared<CancelFlag>();
        const auto answer = std::make_shared<Receiver>(std::move(receiver));
        queue_->async([this, asked = asked_, text, answer] {
            if (asked->isCancelled())
                return;
            const auto items = std::make_shared<std::vector<FoundItem>>(index_.find(text, *asked));
            main_.async([asked, items, answer] {
                if (!asked->isCancelled())
                    (*answer)(std::move(*items));
            });
        });
    }

private:
    MainQueue& main_;
    CancelFlag ended_;
    NameIndex index_; // of the queue
    std::shared_ptr<CancelFlag> asked_;
    std::unique_ptr<WorkQueue> queue_;
};

} // namespace

std::unique_ptr<StoreSearch> makeNameSearch(const DocumentServices& services) {
    return std::make_unique<NameSearch>(services);
}

} // namespace platform
