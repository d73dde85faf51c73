#pragma once

#include "platform/base/MainQueue.h"
#include "platform/base/NotificationCenter.h"
#include "platform/documents/DocumentServices.h"
#include "platform/documents/list/StatusPage.h"

#include <memory>
#include <optional>
#include <string>

namespace platform {

class FolderModel;
class ListView;

/// What the list of a folder shows in place of rows: rows that are to come, that there are none, or
/// why the folder cannot be shown. Main thread; both are held for as long as it lives.
class FolderPage {
public:
    /// `empty` is what an empty folder says.
    FolderPage(const DocumentServices& services, std::shared_ptr<FolderModel> model,
               std::shared_ptr<ListView> list, StatusPage::Content empty);

    /// After every change of the model.
    void update();

private:
    std::optional<StatusPage::Content> content() const;
    StatusPage::Content failure(const Error& error) const;
    StatusPage::Content failure(const std::string& cause) const;
    bool storeIsStillListing() const;
    bool storeIsListed() const;

    const DocumentServices services_;
    const std::shared_ptr<FolderModel> model_;
    const std::shared_ptr<ListView> list_;
    const StatusPage::Content empty_;
    /// A short wait before the screen admits that it is loading.
    Timer loading_;
    bool showsLoading_ = false;
    Timer listingCheck_;
    Observation problemChanged_;
};

} // namespace platform
