#pragma once

#include "platform/base/Executor.h"
#include "platform/base/Result.h"

#include <functional>
#include <memory>
#include <optional>

namespace platform {

/// Somebody who shows a file or a folder and wants to hear what others do to it. Notices arrive on
/// presentedItemOperationQueue(), in the order of the changes, for changes made through a
/// FileCoordinator and for those that any other program makes. Of a folder's contents a presenter
/// hears as change of the folder: at any depth when it was coordinated, of direct entries when it
/// was not. What another program moves or deletes is told a quarter of a second later: programs
/// save by putting a new file in the place of the old one.
class FilePresenter {
public:
    using DeletionHandler = std::function<void(const Failure&)>;

    virtual ~FilePresenter() = default;

    /// Asked at registration, on that thread, and before every notice, on any. A new answer moves
    /// the registration there. Must not wait for anything that coordinates files.
    virtual std::optional<Url> presentedItemURL() const = 0;
    virtual std::shared_ptr<Executor> presentedItemOperationQueue() const = 0;

    virtual void presentedItemDidChange() {}
    virtual void presentedItemDidMoveToURL(const Url& /*newUrl*/) {}
    /// Somebody is about to delete the item (or, for a change from outside, has). A coordinated
    /// deletion waits for the handler's call, at most a few seconds.
    virtual void accommodatePresentedItemDeletionWithCompletionHandler(DeletionHandler handler) {
        handler(std::nullopt);
    }
    virtual void accommodatePresentedSubitemDeletionAtURL(const Url& /*part*/,
                                                          DeletionHandler handler) {
        handler(std::nullopt);
    }
};

} // namespace platform
