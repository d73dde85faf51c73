#pragma once

#include "platform/files/ContentProvider.h"
#include "platform/files/FilePresenter.h"

#include <functional>
#include <memory>
#include <vector>

namespace platform {

enum class ReadingOptions : unsigned {
    none = 0,
    /// Does not ask presenters to save first. (Presenters here keep no changes to themselves, so
    /// nobody is asked in any case.)
    withoutChanges = 1,
    /// Hands the accessor what a symbolic link points at.
    resolvesSymbolicLink = 2,
    /// Attributes only: never waits for content nor for a writer of the content. It does wait while
    /// the item, or a folder above it, is being moved or deleted, which is short.
    immediatelyAvailableMetadataOnly = 4,
};
enum class WritingOptions : unsigned {
    /// Changes the content that is there; a promised document is therefore made local first.
    none = 0,
    /// Presenters of the item, its parts and the folders above it are asked first. One that
    /// refuses keeps the item: its error is the coordination's.
    forDeleting = 1,
    forMoving = 2,
    /// Makes the item, or puts another in its place.
    forReplacing = 8
};
constexpr ReadingOptions operator|(ReadingOptions a, ReadingOptions b) {
    return static_cast<ReadingOptions>(static_cast<unsigned>(a) | static_cast<unsigned>(b));
}
constexpr bool contains(ReadingOptions set, ReadingOptions one) {
    return (static_cast<unsigned>(set) & static_cast<unsigned>(one)) != 0;
}

/// Serialises reads and writes of files among all coordinators of the process, by path and subtree:
/// readers share, a writer is alone, in the order in which they came. Each call blocks until access
/// is granted and the accessor has run on the calling thread; its error is the coordination's own
/// (then the accessor never ran). The accessor's URL differs from the given one when the item was
/// moved meanwhile. Within an accessor the same thread may coordinate again; where two threads that
/// hold something each want what the other has, the later one gets itemBusy. Items are told apart
/// by the text of their paths. A coordinator is used for one piece of work, from one thread, and
/// cancelled from any.
class FileCoordinator {
public:
    using Accessor = std::function<void(const Url& url)>;
    using PairAccessor = std::function<void(const Url& source, const Url& destination)>;

    /// Changes made through it are not reported back to `presenter`.
    explicit FileCoordinator(std::weak_ptr<FilePresenter> presenter = {});
    ~FileCoordinator();
    FileCoordinator(const FileCoordinator&) = delete;
    FileCoordinator& operator=(const FileCoordinator&) = delete;

    /// A read of a promised document makes it local first, unless only metadata is asked for; then
    /// not on the main thread. Nothing is held meanwhile.
    [[nodiscard]] Failure coordinateReading(const Url& item, ReadingOptions options,
                                            const Accessor& accessor);
    [[nodiscard]] Failure coordinateWriting(const Url& item, WritingOptions options,
                                            const Accessor& accessor);
    [[nodiscard]] Failure coordinateWriting(const Url& source, WritingOptions sourceOptions,
                                            const Url& destination,
                                            WritingOptions destinationOptions,
                                            const PairAccessor& accessor);
    /// From within a moving accessor: presenters of the item follow it to its new place.
    void itemAtURLWillMoveToURL(const Url& from, const Url& to);
    void itemAtURLDidMoveToURL(const Url& from, const Url& to);

    /// Ends what waits or downloads with userCancelled, now and later. From any thread.
    void cancel();

    /// Asks for the presenter's URL on the calling thread. What happens from the return on is told.
    static void addFilePresenter(const std::shared_ptr<FilePresenter>& presenter);
    /// No notice starts after this; one that runs is not waited for, so this may be called from
    /// anywhere, also from within a notice.
    static void removeFilePresenter(const std::shared_ptr<FilePresenter>& presenter);
    /// The same for a presenter that is being destroyed.
    static void removeFilePresenter(const FilePresenter* presenter);

    /// Waits until what the kernel has reported of presented items so far is dealt with. Before the
    /// installed runtime goes away, so that nobody uses its clock any more.
    static void waitUntilIdle();

    /// Who fetches promised contents; none before there is a store. Not owned. Replacing it cancels
    /// what it fetches and waits until nobody is inside it any more.
    static void setContentProvider(ContentProvider* provider);
    static ContentProvider* contentProvider();

private:
    struct State;
    struct Target;
    using Targets = std::vector<Target>;
    std::shared_ptr<State> state_;
};

} // namespace platform
