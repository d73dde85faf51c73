#include "app/VXLogging.h"
#include "browse/NavController.h"
#include "items/FileUtils.h"
#include "items/UIUtils.h"
#include "items/UrlExtensions.h"
#include "platform/Platform.h"
#include "platform/base/Text.h"
#include "platform/cloud/CloudDocumentService.h"

namespace tavrin {

using platform::Failure;
using platform::Url;

/// What went wrong during one deletion. Not every failure brings an error.
struct NavController::DeletionTally {
    std::size_t failures = 0;
    Failure lastError;

    void count() { ++failures; }
    void count(const Failure& error) {
        ++failures;
        lastError = error;
    }
};

void NavController::showWarningAndDeleteDocument() {
    const ListPointer list = getTopDocumentListController();
    if (!list)
        return;
    const Urls items = list->selectedItems();
    VXLOG(vxInfo, "Pressed Delete after selecting %@ items: %@", items.size(), items);
    showWarningAndDeleteURLs(items, nullptr, list, {});
}

void NavController::showWarningAndDeleteURLs(const Urls& urls,
                                             const std::shared_ptr<platform::View>& usingView,
                                             const ListPointer& withDocumentListController,
                                             std::function<void()> finishedCompletion) {
    const std::size_t containers = numContainersInURLArray(urls);
    if (containers > 0 && containers != urls.size()) {
        VXLOG(vxError, "Not Deleting: mix of containers and items: %@", urls);
        if (finishedCompletion)
            finishedCompletion();
        return;
    }
    const auto finish = [screen = self(), urls, list = withDocumentListController,
                         finished = std::move(finishedCompletion)](const platform::AlertAction*,
                                                                   bool cancelled) {
        DeletionTally tally;
        if (!cancelled) {
            if (list)
                screen->setEditModeAndUpdateUI(false, *list);
            for (const Url& url : urls)
                deleteEntry(url, tally);
        }
        if (finished)
            finished();
        if (tally.failures == 1)
            UIUtils::showError(tally.lastError, screen->topViewController());
        else if (tally.failures > 1)
            UIUtils::showAlert(platform::localizedPlural(".DICT.CANNOT_DELETE_ITEMS.%d",
                                                         static_cast<long long>(tally.failures)),
                               "", screen->topViewController());
    };
    UIUtils::showDeleteWarningAlert(urls, containers > 0, self(), usingView, barButtonDeleteItem_,
                                    finish);
}

void NavController::deleteEntry(const Url& url, DeletionTally& tally) {
    if (dossa_isDocumentsContainer(url)) {
        deleteContainer(url, tally);
        return;
    }
    VXLOG(vxInfo, "Deleting item %@", url);
    if (const Failure failure = FileUtils::remove(url)) {
        VXLOG(vxWarning, "Failed to delete URL %@: %@", url, failure->localizedDescription);
        tally.count(failure);
    }
}

void NavController::deleteContainer(const Url& url, DeletionTally& tally) {
    platform::CloudDocumentService& documents = platform::Platform::current().documents();
    const auto container = documents.containerForItemAtURL(url);
    if (!container || !*container || (*container)->identifier().empty()) {
        const Failure lookup = container ? Failure() : Failure(container.error());
        VXLOG(vxWarning, "No container for URL %@: %@", url, lookup);
        tally.count();
        return;
    }
    if ((*container)->identifier() == platform::defaultContainerIdentifier) {
        VXLOG(vxError, "NOT Deleting root container %@", url);
        tally.count();
        return;
    }
    VXLOG(vxInfo, "Deleting container %@", url);
    if (const Failure failure = documents.deleteAllContentsOnClientAndServer(**container)) {
        VXLOG(vxWarning, "Failed to delete container %@: %@", url, failure->localizedDescription);
        tally.count(failure);
    }
}

} // namespace tavrin
