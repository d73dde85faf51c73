#include "platform/documents/thumbnails/ThumbnailLoader.h"

#include "platform/base/WorkQueue.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/documents/thumbnails/ThumbnailMaking.h"
#include "platform/documents/thumbnails/ThumbnailMemory.h"
#include "platform/launch/ThumbnailCache.h"
#include "platform/ui/qt/Bridge.h"

#include <algorithm>

namespace platform {
namespace {

/// Decoders are hungry: two leave a machine of two cores usable, and one large picture does not
/// hold up all others.
constexpr std::size_t laneCount = 2;

ThumbnailMemory& memory() {
    static auto* const memory = new ThumbnailMemory(); // lives as long as the process
    return *memory;
}

} // namespace

/// One thread and what is being done on it.
class ThumbnailLoader::Lane {
public:
    explicit Lane(MainQueue& main) : worker_(main) {}

    const std::optional<ThumbnailRequest>& current() const { return current_; }

    void begin(ThumbnailLoader& owner, const ThumbnailRequest& request) {
        current_ = request;
        // The platform may have gone when the thread comes to it.
        worker_.run(
            [this, &owner, request, cache = ThumbnailCache::current()](PreviewToken& token) -> Job {
                setThreadPriority(WorkPriority::background);
                MadeThumbnail made = makeThumbnail(cache, request, token);
                const Image image = imageOf(std::move(made.image), request.scale);
                return [this, &owner, request, image, lasting = made.lasting] {
                    current_.reset();
                    owner.take(request, image, lasting);
                };
            });
    }

    void giveUp() {
        worker_.cancel();
        current_.reset();
    }

private:
    std::optional<ThumbnailRequest> current_;
    PreviewWorker worker_;
};

ThumbnailLoader::ThumbnailLoader(MainQueue& main, Receiver receiver)
    : main_(main), receiver_(std::move(receiver)) {
}

ThumbnailLoader::~ThumbnailLoader() = default;

void ThumbnailLoader::want(std::vector<ThumbnailRequest> requests) {
    for (const std::unique_ptr<Lane>& lane : lanes_) {
        if (!lane->current())
            continue;
        if (std::erase(requests, *lane->current()) == 0)
            lane->giveUp();
    }
    waiting_ = std::move(requests);
    start();
}

void ThumbnailLoader::start() {
    while (!waiting_.empty()) {
        const auto idle = std::ranges::find_if(
            lanes_, [](const std::unique_ptr<Lane>& lane) { return !lane->current(); });
        if (idle == lanes_.end() && lanes_.size() == laneCount)
            return;
        Lane& lane =
            idle == lanes_.end() ? *lanes_.emplace_back(std::make_unique<Lane>(main_)) : **idle;
        const ThumbnailRequest next = std::move(waiting_.front());
        waiting_.erase(waiting_.begin());
        lane.begin(*this, next);
    }
}

void ThumbnailLoader::take(const ThumbnailRequest& request, const Image& image, bool lasting) {
    if (lasting)
        memory().keep(request, image);
    start();
    receiver_(request, image);
}

bool ThumbnailLoader::makes(std::string_view typeIdentifier) {
    return makesThumbnails(typeIdentifier);
}

std::optional<Image> ThumbnailLoader::remembered(const ThumbnailRequest& request) {
    return memory().find(request);
}

} // namespace platform
