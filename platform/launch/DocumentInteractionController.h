#pragma once

#include "platform/launch/ApplicationRecord.h"
#include "platform/ui/BarButtonItem.h"
#include "platform/ui/View.h"

#include <memory>
#include <optional>

namespace platform {

class DocumentInteractionController;

class DocumentInteractionControllerDelegate {
public:
    virtual ~DocumentInteractionControllerDelegate() = default;
    virtual void
    documentInteractionControllerDidDismissOptionsMenu(DocumentInteractionController& /*sender*/) {}
};

/// What other applications can do with one document: its default application, and a menu to share
/// it, open it elsewhere or copy it. Alive while its menu is shown. Main thread.
class DocumentInteractionController
    : public std::enable_shared_from_this<DocumentInteractionController> {
public:
    static std::shared_ptr<DocumentInteractionController> create(const Url& document);
    ~DocumentInteractionController();
    DocumentInteractionController(const DocumentInteractionController&) = delete;
    DocumentInteractionController& operator=(const DocumentInteractionController&) = delete;

    const Url& url() const;
    void setDelegate(std::weak_ptr<DocumentInteractionControllerDelegate> delegate);

    /// By the document's type; works for a promised document as well. None when the user has none.
    std::optional<ApplicationRecord> defaultApplication() const;
    /// Makes the document local when it is only promised, then starts the application. What goes
    /// wrong is shown to the user. Answers whether a start was asked for.
    bool openWithDefaultApplication();

    bool presentOptionsMenuFromRectInView(Rect rect, const std::shared_ptr<View>& view, bool animated);
    bool presentOptionsMenuFromBarButtonItem(const BarButtonItem::Pointer& item, bool animated);
    void dismissMenuAnimated(bool animated);

    struct Impl;

private:
    explicit DocumentInteractionController(std::unique_ptr<Impl> impl);
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
