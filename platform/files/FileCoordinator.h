#pragma once

#include "platform/files/ContentProvider.h"
#include "platform/files/FilePresenter.h"

#include <functional>
#include <memory>

namespace platform {

enum class ReadingOptions : unsigned {
    none = 0,
    /// Does not ask presenters to save first.
    withoutChanges = 1,
    /// Hands the accessor what a symbolic link points at.
    resolvesSymbolicLink = 2,
    /// Attributes only: never waits for content nor for a writer of the content.
    immediatelyAvailableMetadataOnly = 4,
};
enum class WritingOptions : unsigned { none = 0, forDeleting = 1, forMoving = 2, forReplacing = 8 };
constexpr ReadingOptions operator|(ReadingOptions a, ReadingOptions b) {
    return static_cast<ReadingOptions>(static_cast<unsigned>(a) | static_cast<unsigned>(b));
}
constexpr bool contains(ReadingOptions set, ReadingOptions one) {
    return (static_cast<unsigned>(set) & static_cast<unsigned>(one)) != 0;
}

/// Serialises reads and writes of files among all coordinators of the process, by path and subtree:
/// readers share, a writer is alone. Each call blocks until access is granted and the accessor has
/// run on the calling thread; its error is the coordination's own (then the accessor never ran).
/// A coordinator is used for one piece of work, from one thread, and cancelled from any.
class FileCoordinator {
public:
    using Accessor = std::function<void(const Url& url)>;
    using PairAccessor = std::function<void(const Url& source, const Url& destination)>;

    /// Changes made through it are not reported back to `presenter`.
    explicit FileCoordinator(std::weak_ptr<FilePresenter> presenter = {});
    ~FileCoordinator();
    FileCoordinator(const FileCoordinator&) = delete;
    FileCoordinator& operator=(const FileCoordinator&) = delete;

    /// A read of a promised document makes it local first, unless only metadata is asked for.
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

    static void addFilePresenter(const std::shared_ptr<FilePresenter>& presenter);
    static void removeFilePresenter(const std::shared_ptr<FilePresenter>& presenter);

    /// Who fetches promised contents; none before there is a store. Not owned.
    static void setContentProvider(ContentProvider* provider);
    static ContentProvider* contentProvider();

private:
    struct State;
    std::shared_ptr<State> state_;
};

} // namespace platform
