#pragma once

#include "platform/base/Clock.h"
#include "platform/documents/preview/ContentsTree.h"
#include "platform/documents/preview/PreviewWorker.h"
#include "platform/files/FileDescriptor.h"

#include <functional>
#include <memory>
#include <string>

namespace platform {

/// What could be listed of an archive, and why it is not more.
struct ArchiveListing {
    enum class State {
        /// There is more to come.
        reading,
        complete,
        /// There is more than a listing shows, or than the time sufficed for.
        cut,
        damaged,
        /// The names are encrypted.
        locked,
    };
    std::shared_ptr<ContentsTree> tree = std::make_shared<ContentsTree>();
    State state = State::reading;
    /// What the decoder said.
    std::string detail;
};

/// Lists an archive by the lister, a process of its own. Belongs to one queue.
class ArchiveFile {
public:
    /// `lister` is the program's path; `name` what the one thing in a merely compressed file is
    /// called.
    ArchiveFile(std::string lister, std::string name, Clock& clock);

    /// Reads the file from its descriptor's place on. `progress` gets a copy of what is there, less
    /// and less often. An error when the lister cannot be started, or when cancelled.
    Result<ArchiveListing> list(int file, PreviewToken& token,
                                const std::function<void(ArchiveListing)>& progress);

private:
    /// False at the last record.
    bool take(const struct ArchiveRecord& record);
    void tell(PreviewToken& token, const std::function<void(ArchiveListing)>& progress);

    const std::string lister_;
    const std::string name_;
    Clock& clock_;
    ArchiveListing listing_;
    bool full_ = false;
    Duration nextTold_{};
};

} // namespace platform
