#pragma once

#include "browse/SignInViewController.h"
#include "items/FilenamePrompt.h"
#include "items/VXItem.h"
#include "platform/base/NotificationCenter.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/documents/DocumentListController.h"
#include "platform/documents/DocumentTargetSelectionController.h"
#include "platform/launch/DocumentInteractionController.h"
#include "platform/ui/NavigationController.h"
#include "services/QuotaFetcher.h"

#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace platform {
class DocumentPickerUnavailableViewController;
}

namespace tavrin {

class PreviewItemManager;

/// The program's root screen: the stack of document lists and previews. Told over several files, a
/// topic each. Main thread only.
class NavController : public platform::NavigationController,
                      public platform::NavigationControllerDelegate,
                      public platform::DocumentListControllerDelegate,
                      public platform::DocumentTargetSelectionControllerDelegate,
                      public platform::DocumentInteractionControllerDelegate,
                      public QuotaFetcherDelegate {
public:
    using List = platform::DocumentListController;
    using ListPointer = std::shared_ptr<List>;
    using Urls = std::vector<platform::Url>;

    NavController();
    ~NavController() override;

    // Account and stack (NavController.cpp)
    void viewDidLoad() override;
    /// Builds the bottom of the stack for the current account state.
    void setupInitialViewController();
    /// A cloud identity token is current.
    bool checkPelmoraState() const;
    /// Rebuilds everything when the account is not the one last seen.
    void handleAccountChanges();
    void savePelmoraToken(const std::optional<platform::IdentityToken>& token);
    ListPointer getTopDocumentListController() const;
    void showPreview(const std::shared_ptr<VXItem>& item, int previewMode);
    void logContainerURL() const;
    void encodeRestorableStateWithCoder(platform::RestorationCoder& coder) override;
    void decodeRestorableStateWithCoder(const platform::RestorationCoder& coder) override;
    void navigationControllerDidShowViewController(platform::NavigationController& navigation,
                                                   platform::ViewController& screen,
                                                   bool animated) override;

    // Accounts (NavControllerAccounts.cpp)
    /// The screen that signs in, over what is shown.
    void showSignIn(SignInViewController::Kind kind);
    /// Who is signed in, and what goes on with the account; not while it is shown already.
    void showAccount();

    // Lists (NavControllerLists.cpp)
    void initNewListController(List& list);
    /// Builds the lists down to the item's folder, then its preview. Answers whether it did.
    bool showURLPreview(const std::optional<platform::Url>& url, int previewMode);
    void
    documentListControllerDidSelectContainerWithViewController(List& list,
                                                               const ListPointer& next) override;
    void documentListControllerDidSelectItemAtURL(List& list, const platform::Url& url) override;
    void documentListControllerItemsChanged(List& list) override;
    void documentListControllerPerformAction(List& list, int action, const platform::Url& url,
                                             const std::shared_ptr<platform::View>& originatingView,
                                             std::function<void()> completion) override;
    /// The older form, without a view and a completion.
    void documentListControllerPerformAction(List& list, int action, const platform::Url& url);

    // Row actions (NavControllerActions.cpp)
    void showActionsMenuFromView(const std::shared_ptr<platform::View>& view,
                                 const platform::Url& url, const platform::Url& presentedURL,
                                 std::function<void()> completion);
    void showRenamePrompt(const platform::Url& url);
    void showDIC(const std::shared_ptr<platform::View>& view, const platform::Value& url,
                 const std::function<void()>& completion);

    // Edit mode (NavControllerEdit.cpp)
    void beginEditMode();
    void endEditMode();
    void selectAllItems();
    void setEditModeAndUpdateUI(bool editing, List& forViewController);
    void configureVisibleControllerForMode();
    void configureNavBar(List& list);
    void configureToolbar(List& list);
    /// The status line, the edit title and the buttons; with none given, of the top list.
    void updateStatusUI(List* list);
    static std::size_t numContainersInURLArray(const Urls& urls);
    static bool canShowMoveForSelectedItems(const List& list);
    static bool canShowDeleteForSelectedItems(const List& list);
    static bool canEnableNewFolderForSelectedItems(const List& list);
    void promtForNewFolderAndCreate();

    // Moving (NavControllerMove.cpp)
    void showMoveTargetForSelectedItems();
    void showMoveTargetForItems(const Urls& items, const platform::Url& inFolder);
    static bool containerHasSubfolders(const platform::Url& url);
    void showNewFolderPromptDuringMove(const std::optional<platform::Url>& folder,
                                       const std::optional<Urls>& itemsToMove);
    void documentTargetSelectionControllerDidSelectItemAtURL(
        platform::DocumentTargetSelectionController& chooser, const platform::Url& folder) override;
    /// The errors, in the order of the items; empty when all moved.
    static std::vector<platform::Error> moveItemsToDirectory(const Urls& items,
                                                             const platform::Url& toDirectory);
    void moveItemsToDirectoryAndShowErrors(const Urls& items, const platform::Url& toDirectory);

    // Deleting (NavControllerDelete.cpp)
    void showWarningAndDeleteDocument();
    void showWarningAndDeleteURLs(const Urls& urls,
                                  const std::shared_ptr<platform::View>& usingView,
                                  const ListPointer& withDocumentListController,
                                  std::function<void()> finishedCompletion);

    // Status line (NavControllerStatus.cpp)
    bool okToShowQuota() const { return lastQuotaFetch_.has_value(); }
    std::string toolbarStatusText(std::size_t itemCount) const;
    std::string quotaAvailableString() const;
    void quotaFetcherDidUpdateValue(QuotaFetcher& fetcher, std::uint64_t freeBytes) override;

    bool editMode() const { return editMode_; }
    const std::string& viewTitle() const { return viewTitle_; }
    bool pickerIsAlive() const { return pickerIsAlive_; }
    std::uint64_t quotaBytes() const { return quotaBytes_; }
    const std::shared_ptr<QuotaFetcher>& quotaFetcher() const { return quotaFetcher_; }
    const std::shared_ptr<PreviewItemManager>& itemManager() const { return itemManager_; }
    const std::shared_ptr<FilenamePrompt>& folderPromptAlert() const { return folderPromptAlert_; }
    const platform::BarButtonItem::Pointer& barButtonNewFolder() const {
        return barButtonNewFolder_;
    }
    const platform::BarButtonItem::Pointer& barButtonMoveItem() const { return barButtonMoveItem_; }
    const platform::BarButtonItem::Pointer& barButtonDeleteItem() const {
        return barButtonDeleteItem_;
    }

private:
    struct DeletionTally;

    void didBecomeActiveNotification(const platform::Notification& notification);
    void pelmoraAccountAvailabilityChanged();
    void showStoreRoot();
    void showPlaceholder();
    void offerSignIn(platform::DocumentPickerUnavailableViewController& placeholder);
    platform::BarButtonItem::Pointer makeAccountButton();
    std::shared_ptr<PreviewItemManager> startItemManager(int previewMode);
    void endPreview();
    /// Takes the search screen away; answers whether there was one.
    bool leaveSearch();
    /// The tapped folder of a search's results; answers whether that was dealt with.
    bool leaveSearchForFolder(const ListPointer& next);
    platform::BarButtonItem::Pointer makeEditButton(std::string_view title,
                                                    void (NavController::*action)());
    void presentPrompt(std::shared_ptr<FilenamePrompt> prompt);
    static void deleteEntry(const platform::Url& url, DeletionTally& tally);
    static void deleteContainer(const platform::Url& url, DeletionTally& tally);
    std::shared_ptr<NavController> self();

    bool editMode_ = false;
    std::string viewTitle_;
    platform::BarButtonItem::Pointer barButtonNewFolder_;
    platform::BarButtonItem::Pointer barButtonDeleteItem_;
    platform::BarButtonItem::Pointer barButtonMoveItem_;
    bool pickerIsAlive_ = false;
    std::uint64_t quotaBytes_ = 0;
    std::optional<platform::Date> lastQuotaFetch_;
    std::shared_ptr<QuotaFetcher> quotaFetcher_;
    std::shared_ptr<platform::DocumentInteractionController> documentInteractionController_;
    std::shared_ptr<FilenamePrompt> folderPromptAlert_;
    std::shared_ptr<PreviewItemManager> itemManager_;
    platform::Observation becameActive_;
    platform::Observation identityChanged_;
};

} // namespace tavrin
