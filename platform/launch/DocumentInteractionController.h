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
/// it, open it elsewhere or copy it. Stays alive while its menu is shown. Main thread.
class DocumentInteractionController
    : public std::enable_shared_from_this<DocumentInteractionController> {
public:
    static std::shared_ptr<DocumentInteractionController> create(const Url& document);
    ~DocumentInteractionController();
    DocumentInteractionController(const DocumentInteractionController&) = delete;
    DocumentInteractionController& operator=(const DocumentInteractionController&) = delete;

    const Url& url() const;
    void setDelegate(std::weak_ptr<DocumentInteractionControllerDelegate> delegate);

    /// By the document's type; works for a promised document as well. None when the user has none;
    /// this very program only when the user chose it or nothing else takes the type.
    std::optional<ApplicationRecord> defaultApplication() const;
    /// Makes the document local when it is only promised, then starts the application. What goes
    /// wrong is shown to the user. Answers whether a start was asked for: never of this program.
    bool openWithDefaultApplication();

    /// Applications that take the document, "Copy", "Copy Path" and "Send by Mail". The delegate
    /// hears when it has gone, whatever was chosen. False, and the delegate hears nothing, when it
    /// cannot be shown: there is no window, or it is shown already.
    bool presentOptionsMenuFromRectInView(Rect rect, const std::shared_ptr<View>& view,
                                          bool animated);
    bool presentOptionsMenuFromBarButtonItem(const BarButtonItem::Pointer& item, bool animated);
    void dismissMenuAnimated(bool animated);

    struct Impl;

private:
    struct MenuLife;
    explicit DocumentInteractionController(std::unique_ptr<Impl> impl);
    std::unique_ptr<Impl> impl_;
};

} // namespace platform
