#include "platform/documents/DocumentTargetSelectionController.h"

#include "platform/base/NotificationCenter.h"
#include "platform/base/Text.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/DocumentServices.h"
#include "platform/documents/FolderPath.h"
#include "platform/documents/targets/MovedItems.h"
#include "platform/documents/targets/TargetScreen.h"
#include "platform/ui/NavigationController.h"

namespace platform {

struct DocumentTargetSelectionController::Impl final : TargetChooser {
    explicit Impl(std::vector<Url> urls)
        : services(DocumentServices::current()),
          moved(std::move(urls)),
          stack(std::make_shared<NavigationController>()) {}

    void start() {
        stack->setToolbarHidden(false, false);
        stack->setViewControllers(firstScreens(), false);
        // The folders of another account are no targets for these items.
        accountChange = services.notifications.observe(cloudIdentityDidChangeNotification,
                                                       [this](const Notification&) { cancel(); });
    }

    /// From the store's root down to where the items are.
    std::vector<std::shared_ptr<ViewController>> firstScreens() {
        std::optional<std::vector<Url>> path;
        if (moved.count() > 0)
            path = folderPathFromRoot(moved.commonFolder(), services.documents);
        if (const std::optional<Url> root = services.documents.shelfroot(); !path && root)
            path = {*root};
        std::vector<std::shared_ptr<ViewController>> screens;
        for (const Url& folder : path.value_or(std::vector<Url>()))
            screens.push_back(TargetScreen::create(folder, *this));
        return screens;
    }

    const MovedItems& items() const override { return moved; }
    void openFolder(const Url& folder) override {
        stack->pushViewController(TargetScreen::create(folder, *this), true);
    }
    void choose(const Url& folder) override {
        const auto keep = self->shared_from_this();
        if (const auto receiver = delegate.lock())
            receiver->documentTargetSelectionControllerDidSelectItemAtURL(*self, folder);
    }
    void cancel() override {
        // With whatever it asks at the moment.
        if (ViewController* const presenter = self->presentingViewController())
            presenter->dismissViewController(true);
    }

    DocumentTargetSelectionController* self = nullptr;
    const DocumentServices services;
    const MovedItems moved;
    const std::shared_ptr<NavigationController> stack;
    std::weak_ptr<DocumentTargetSelectionControllerDelegate> delegate;
    Observation accountChange;
};

DocumentTargetSelectionController::DocumentTargetSelectionController(std::unique_ptr<Impl> impl)
    : impl_(std::move(impl)) {
    impl_->self = this;
    setModalPresentationStyle(PresentationStyle::overCurrentContext);
    setExtendsUnderBars(true);
    setTitle(localized("Move"));
}

DocumentTargetSelectionController::~DocumentTargetSelectionController() = default;

std::shared_ptr<DocumentTargetSelectionController>
DocumentTargetSelectionController::create(std::vector<Url> itemsToMove) {
    return std::shared_ptr<DocumentTargetSelectionController>(
        new DocumentTargetSelectionController(std::make_unique<Impl>(std::move(itemsToMove))));
}

const std::vector<Url>& DocumentTargetSelectionController::itemsToMove() const {
    return impl_->moved.urls();
}

void DocumentTargetSelectionController::setDelegate(
    std::weak_ptr<DocumentTargetSelectionControllerDelegate> delegate) {
    impl_->delegate = std::move(delegate);
}

void DocumentTargetSelectionController::loadView() {
    ViewController::loadView();
    addChildViewController(impl_->stack);
    view()->addSubview(impl_->stack->view());
    impl_->stack->didMoveToParent(this);
}

void DocumentTargetSelectionController::viewDidLoad() {
    ViewController::viewDidLoad();
    impl_->start();
}

void DocumentTargetSelectionController::viewDidLayoutSubviews() {
    ViewController::viewDidLayoutSubviews();
    impl_->stack->view()->setFrame(view()->bounds());
}

} // namespace platform
