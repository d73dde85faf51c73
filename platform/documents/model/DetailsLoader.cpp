#include "platform/documents/model/DetailsLoader.h"

#include "platform/base/MainQueue.h"
#include "platform/base/WorkQueue.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/model/FolderReader.h"

#include <algorithm>
#include <mutex>

namespace platform {
namespace {

/// Rows answered at once: about a screen of them, so that they come in together.
constexpr std::size_t batchSize = 32;

constexpr ResourceKey detailKeys[] = {ResourceKey::typeIdentifier, ResourceKey::fileSize,
                                      ResourceKey::contentModificationDate, ResourceKey::isShared,
                                      ResourceKey::downloadingStatus};

bool isFolder(EntryKind kind) {
    return !isDocument(kind);
}

} // namespace

EntryDetails readDetails(const Url& url, EntryKind kind, const CloudDocumentService& documents) {
    EntryDetails details;
    Result<ResourceValues> values = documents.promisedItemAttributes(url, detailKeys);
    if (!values)
        values = documents.plainAttributes(url, detailKeys);
    if (!values)
        return details;
    if (const std::string* const type = (*values)[ResourceKey::typeIdentifier].text())
        details.typeIdentifier = *type;
    if (const auto size = (*values)[ResourceKey::fileSize].integer(); size && *size >= 0)
        details.size = static_cast<std::uint64_t>(*size);
    details.modified = (*values)[ResourceKey::contentModificationDate].date();
    details.shared = (*values)[ResourceKey::isShared].boolean().value_or(false);
    const std::string* const status = (*values)[ResourceKey::downloadingStatus].text();
    details.promised = isDocument(kind) && status && *status == downloadingStatusNotDownloaded;
    return details;
}

struct DetailsLoader::State : std::enable_shared_from_this<DetailsLoader::State> {
    State(CloudDocumentService& theDocuments, MainQueue& theMain, Receiver theReceiver,
          Counting theCounting)
        : documents(theDocuments),
          main(theMain),
          receiver(std::move(theReceiver)),
          willCount(std::move(theCounting)) {}

    CloudDocumentService& documents;
    MainQueue& main;
    const Receiver receiver;
    const Counting willCount;
    std::unique_ptr<WorkQueue> queue =
        std::make_unique<WorkQueue>("platform.details", WorkPriority::userInitiated);
    std::mutex mutex;
    std::vector<Request> wanted; // guarded by mutex, as are the four below
    std::vector<std::pair<Request, EntryDetails>> uncounted;
    std::optional<Request> reading;
    std::shared_ptr<CancelFlag> counting;
    bool running = false;
    bool ended = false;

    void setWanted(std::vector<Request> requests) {
        const std::lock_guard lock(mutex);
        const auto stillWanted = [&](const Request& request) {
            return std::find(requests.begin(), requests.end(), request) != requests.end();
        };
        if (reading && counting && !stillWanted(*reading))
            counting->cancel();
        std::erase_if(uncounted, [&](const auto& each) { return !stillWanted(each.first); });
        std::erase_if(requests, [this](const Request& request) {
            return (reading && *reading == request) ||
                   std::any_of(uncounted.begin(), uncounted.end(),
                               [&](const auto& each) { return each.first == request; });
        });
        wanted = std::move(requests);
        if (!wanted.empty() && !std::exchange(running, true))
            queue->async([self = shared_from_this()] { self->run(); });
    }

    void end() {
        const std::lock_guard lock(mutex);
        ended = true;
        wanted.clear();
        uncounted.clear();
        if (counting)
            counting->cancel();
    }

    void run() {
        while (readBatch() || countOne()) {
        }
    }

    bool readBatch() {
        std::vector<Request> batch;
        {
            const std::lock_guard lock(mutex);
            const std::size_t count = std::min(batchSize, wanted.size());
            const auto end = wanted.begin() + static_cast<std::ptrdiff_t>(count);
            batch.assign(wanted.begin(), end);
            wanted.erase(wanted.begin(), end);
        }
        if (batch.empty())
            return false;
        std::vector<Answer> answers;
        for (const Request& request : batch) {
            EntryDetails details = readDetails(request.url, request.kind, documents);
            details.itemCount = request.formerCount;
            answers.push_back(
                {request.row, request.version, std::make_shared<const EntryDetails>(details)});
            const std::lock_guard lock(mutex);
            if (ended)
                return false;
            if (isFolder(request.kind))
                uncounted.emplace_back(request, std::move(details));
        }
        tell(std::move(answers));
        return true;
    }

    bool countOne() {
        std::pair<Request, EntryDetails> next;
        const auto cancel = std::make_shared<CancelFlag>();
        {
            const std::lock_guard lock(mutex);
            if (uncounted.empty()) {
                running = false;
                return false;
            }
            next = std::move(uncounted.front());
            uncounted.erase(uncounted.begin());
            reading = next.first;
            counting = cancel;
        }
        if (willCount)
            willCount(next.first.row, next.first.url);
        const auto count = FolderReader::count(next.first.url, documents, *cancel);
        {
            const std::lock_guard lock(mutex);
            reading.reset();
            counting.reset();
        }
        if (cancel->isCancelled())
            return true;
        next.second.itemCount = count;
        next.second.counted = true;
        tell({{next.first.row, next.first.version,
               std::make_shared<const EntryDetails>(std::move(next.second))}});
        return true;
    }

    void tell(std::vector<Answer> answers) {
        const auto shared = std::make_shared<std::vector<Answer>>(std::move(answers));
        main.async([weak = weak_from_this(), shared] {
            if (const auto self = weak.lock(); self && !self->ended)
                self->receiver(std::move(*shared));
        });
    }
};

DetailsLoader::DetailsLoader(CloudDocumentService& documents, MainQueue& main, Receiver receiver,
                             Counting counting)
    : state_(std::make_shared<State>(documents, main, std::move(receiver), std::move(counting))) {
}

DetailsLoader::~DetailsLoader() {
    state_->end();
    state_->queue.reset();
}

void DetailsLoader::want(std::vector<Request> requests) {
    state_->setWanted(std::move(requests));
}

} // namespace platform
