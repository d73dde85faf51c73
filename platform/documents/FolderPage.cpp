#include "platform/documents/FolderPage.h"

#include "platform/base/Text.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/cloud/CloudService.h"
#include "platform/documents/list/ListView.h"
#include "platform/documents/model/FolderModel.h"
#include "platform/ui/Theme.h"

namespace platform {
namespace {

/// How often an empty list looks whether the store knows all of the cloud by now.
constexpr Duration listingCheckTime = std::chrono::seconds(1);

} // namespace

FolderPage::FolderPage(const DocumentServices& services, std::shared_ptr<FolderModel> model,
                       std::shared_ptr<ListView> list, StatusPage::Content empty)
    : services_(services),
      model_(std::move(model)),
      list_(std::move(list)),
      empty_(std::move(empty)),
      problemChanged_(services_.notifications.observe(cloudProblemDidChangeNotification,
                                                      [this](const Notification&) { update(); })) {
    if (model_->state() == ModelState::loading)
        loading_ = services_.mainQueue.timer(Theme::loadingDelay, [this] {
            showsLoading_ = true;
            update();
        });
}

void FolderPage::update() {
    const bool listing =
        model_->state() == ModelState::ready && model_->count() == 0 && storeIsStillListing();
    if (model_->state() != ModelState::loading) {
        loading_.cancel();
        showsLoading_ = false;
    }
    list_->setShowsPlaceholders(showsLoading_ || listing);
    if (listing)
        listingCheck_ = services_.mainQueue.timer(listingCheckTime, [this] { update(); });
    list_->setPage(listing ? std::nullopt : content(),
                   [weak = std::weak_ptr(model_), &cloud = services_.cloud] {
                       if (const auto model = weak.lock())
                           model->read();
                       cloud.refresh(std::nullopt, {});
                   });
}

/// An empty folder is not known to be empty before the cloud has been looked through once.
bool FolderPage::storeIsStillListing() const {
    return !storeIsListed() && !services_.accounts.problem();
}

bool FolderPage::storeIsListed() const {
    const std::optional<CloudStatus> status = services_.cloud.status();
    return !status || status->listed;
}

std::optional<StatusPage::Content> FolderPage::content() const {
    if (model_->state() == ModelState::failed)
        return failure(*model_->error());
    if (model_->state() != ModelState::ready || model_->count() > 0)
        return std::nullopt;
    if (!storeIsListed())
        if (const std::optional<std::string> problem = services_.accounts.problem())
            return failure(*problem);
    return empty_;
}

StatusPage::Content FolderPage::failure(const Error& error) const {
    StatusPage::Content page = failure(error.localizedDescription.value_or(std::string()));
    if (error.is(ErrorCode::noSuchItem))
        page.title = localized("This folder is no longer here");
    return page;
}

StatusPage::Content FolderPage::failure(const std::string& cause) const {
    return {StatusPage::Drawing::problem, localized("This folder cannot be shown"), cause,
            localized("Try Again")};
}

} // namespace platform
