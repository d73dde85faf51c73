#include "platform/files/ItemWatch.h"

#include "platform/files/PathText.h"

#include <algorithm>
#include <mutex>
#include <unistd.h>

namespace platform {

/// One link for every folder from the root down to the item's own.
struct ItemWatch::State : std::enable_shared_from_this<State> {
    using Kind = DirectoryChange::Kind;

    struct Link {
        std::string folder;
        /// The entry of that folder that leads to the item; "" for all of them.
        std::string entry;
        DirectoryWatcher::Token token;
    };

    DirectoryWatcher& watcher;
    Executor& queue;
    Job touched;
    std::mutex mutex;
    std::vector<Link> links; // guarded by mutex

    State(DirectoryWatcher& theWatcher, Executor& theQueue, Job job)
        : watcher(theWatcher), queue(theQueue), touched(std::move(job)) {}

    void arm(std::string_view path, Scope scope) {
        for (std::size_t slash = 0; slash != std::string_view::npos && slash + 1 < path.size();) {
            const std::size_t next = path.find('/', slash + 1);
            const std::string_view entry = path.substr(slash + 1, next - slash - 1);
            links.push_back({std::string(path.substr(0, std::max<std::size_t>(slash, 1))),
                             std::string(entry), nullptr});
            slash = next;
        }
        if (!links.empty() && scope == Scope::wholeFolder)
            links.back().entry.clear();
        rearm();
    }

    /// From the root down, so that a folder which appears meanwhile is heard by the one above it.
    void rearm() {
        for (std::size_t i = 0; i < links.size(); ++i) {
            Link& link = links[i];
            // What cannot be read cannot be watched; often that is a folder far above the item.
            if (link.token || ::access(PathText(link.folder).c_str(), R_OK) != 0)
                continue;
            link.token = watcher.watch(
                Url::file(link.folder), queue,
                [weak = weak_from_this(), i](const std::vector<DirectoryChange>& changes) {
                    if (const auto self = weak.lock())
                        self->happened(i, changes);
                });
        }
    }

    static bool isStructural(const DirectoryChange& change) {
        return change.kind != Kind::modified && change.kind != Kind::attributes;
    }

    void happened(std::size_t index, const std::vector<DirectoryChange>& changes) {
        std::vector<DirectoryWatcher::Token> dropped; // released without the lock
        {
            const std::lock_guard lock(mutex);
            if (index >= links.size())
                return; // ended meanwhile
            bool concerned = false;
            bool cut = false;
            for (const DirectoryChange& change : changes) {
                const bool whole = change.kind == Kind::folderGone || change.kind == Kind::overflow;
                const std::string& entry = links[index].entry;
                const bool named = entry.empty() || change.name == entry;
                concerned = concerned || whole ||
                            (named && (index + 1 == links.size() || isStructural(change)));
                cut = cut || change.kind == Kind::folderGone;
            }
            if (!concerned)
                return;
            // What hangs below may be another folder by now.
            for (std::size_t i = index + (cut ? 0 : 1); i < links.size(); ++i)
                dropped.push_back(std::move(links[i].token));
            rearm();
        }
        touched();
    }
};

ItemWatch::ItemWatch(DirectoryWatcher& watcher, std::string_view path, Scope scope, Executor& queue,
                     Job touched)
    : state_(std::make_shared<State>(watcher, queue, std::move(touched))) {
    const std::lock_guard lock(state_->mutex);
    state_->arm(path, scope);
}

ItemWatch::~ItemWatch() {
    std::vector<State::Link> links;
    const std::lock_guard lock(state_->mutex);
    links.swap(state_->links);
}

} // namespace platform
