#pragma once

#include "platform/documents/model/DocumentEntry.h"

#include <functional>
#include <memory>
#include <vector>

namespace platform {

class CloudDocumentService;
class MainQueue;

/// Reads the details of the rows in view on a queue of its own: first what one look at each tells,
/// in batches, then the number of items in each folder. Belongs to the main thread.
class DetailsLoader {
public:
    struct Request {
        RowId row = 0;
        std::uint32_t version = 0;
        Url url;
        EntryKind kind = EntryKind::file;
        /// Answered before the folder was counted anew, so that the line does not flicker.
        std::optional<std::size_t> formerCount;
        bool operator==(const Request& other) const {
            return row == other.row && version == other.version;
        }
    };
    struct Answer {
        RowId row = 0;
        std::uint32_t version = 0;
        std::shared_ptr<const EntryDetails> details;
    };
    /// Called on the main queue, not any more once the loader is gone.
    using Receiver = std::function<void(std::vector<Answer> answers)>;
    /// Called on the loader's queue before a folder is counted.
    using Counting = std::function<void(RowId row, const Url& folder)>;

    DetailsLoader(CloudDocumentService& documents, MainQueue& main, Receiver receiver,
                  Counting counting = {});
    /// Waits for the look that is under way.
    ~DetailsLoader();
    DetailsLoader(const DetailsLoader&) = delete;
    DetailsLoader& operator=(const DetailsLoader&) = delete;

    /// What is wanted now: takes the place of earlier wishes, of which those that are not repeated
    /// are dropped unread.
    void want(std::vector<Request> requests);

private:
    struct State;
    std::shared_ptr<State> state_;
};

/// Everything but the count. Blocks.
EntryDetails readDetails(const Url& url, EntryKind kind, const CloudDocumentService& documents);

} // namespace platform
