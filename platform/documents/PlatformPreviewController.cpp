#include "platform/documents/PlatformPreviewController.h"

#include "platform/base/ByteCount.h"
#include "platform/base/Runtime.h"
#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/preview/PreviewRenderer.h"
#include "platform/documents/preview/PreviewView.h"
#include "platform/files/FileManager.h"
#include "platform/launch/DocumentInteractionController.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/Theme.h"

namespace platform {
namespace {

constexpr double pageIconEdge = 96;

std::string typeOf(const Url& item) {
    return TypeRegistry::identifierForFileName(item.lastPathComponent());
}

/// "PDF document, 1.2 MB"
std::string factsOf(const Url& item, const std::string& type) {
    const std::string facts = TypeRegistry::localizedDescription(type).value_or(std::string());
    const auto attributes = FileManager::attributes(item.path(), FollowLinks::yes);
    if (!attributes || attributes->kind != FileKind::file)
        return facts;
    const std::string size = byteCountText(attributes->size, ByteCountStyle::file);
    return facts.empty() ? size : localizedFormat("%1$@, %2$@", facts, size);
}

} // namespace

struct PlatformPreviewController::Impl {
    explicit Impl(PlatformPreviewController& owner) : self(owner) {}

    void makeView() {
        renderer.reset();
        shown.reset();
        view = std::make_shared<PreviewView>();
    }

    std::optional<Url> currentItem() {
        if (!source || source->numberOfPreviewItemsInPreviewController(self) == 0)
            return std::nullopt;
        return source->previewControllerPreviewItemAtIndex(self, 0);
    }

    void reload() {
        const std::optional<Url> item = currentItem();
        self.setTitle(item ? displayName(item->lastPathComponent()) : std::string());
        if (!self.isViewLoaded())
            return;
        if (item && item == shown && renderer) {
            refresh();
            return;
        }
        drop();
        if (!item) {
            view->showPage({{}, localized("There is no document to show"), {}, {}});
            return;
        }
        show(*item);
    }

    void refresh() {
        if (!renderer) {
            reload();
            return;
        }
        renderer->reload();
    }

    void show(const Url& item) {
        shown = item;
        const std::string type = typeOf(item);
        const PreviewKind* const kind = previewKindFor(type);
        if (!kind) {
            showPage(localized("This kind of document cannot be shown here."));
            return;
        }
        renderer = kind->make(Runtime::current().mainQueue,
                              {[this] { documentShown(); },
                               [this](const Error& error) { documentFailed(error); },
                               [this](const std::string& place) { view->setPlace(place); }});
        view->setDocument(renderer->view());
        loading = Runtime::current().mainQueue.timer(Theme::loadingDelay,
                                                     [this] { view->showLoading(); });
        renderer->load(item);
    }

    void documentShown() {
        loading.cancel();
        view->showDocument();
        const auto zoom = renderer->zoom();
        view->setZoom(zoom ? *zoom : std::function<void(double)>());
        if (delegate)
            delegate->previewControllerDidShowItem(self, *shown);
    }

    void documentFailed(const Error& error) {
        loading.cancel();
        showPage(error.localizedDescription.value_or(localized("This document cannot be shown.")));
    }

    void showPage(const std::string& message) {
        const std::string type = TypeRegistry::identifierForFile(shown->path());
        view->showPage({DocumentIcons::forType(type, pageIconEdge),
                        displayName(shown->lastPathComponent()), factsOf(*shown, type), message,
                        menuOf(*shown)});
    }

    /// What other programs can do with the document; none when it is not there.
    std::function<void(const std::shared_ptr<View>&)> menuOf(const Url& document) {
        if (!FileManager::exists(document.path()))
            return {};
        return [this, document](const std::shared_ptr<View>& beside) {
            menu = DocumentInteractionController::create(document);
            menu->presentOptionsMenuFromRectInView(beside->bounds(), beside, true);
        };
    }

    /// Lets go of the document and of all that was made from it.
    void drop() {
        loading.cancel();
        if (view) {
            view->setZoom({});
            view->setPlace({});
            view->setDocument(nullptr);
        }
        renderer.reset();
        shown.reset();
    }

    PlatformPreviewController& self;
    PlatformPreviewDataSource* source = nullptr;
    PlatformPreviewDelegate* delegate = nullptr;
    std::shared_ptr<PreviewView> view;
    std::unique_ptr<PreviewRenderer> renderer;
    std::optional<Url> shown;
    std::shared_ptr<DocumentInteractionController> menu;
    Timer loading;
};

PlatformPreviewController::PlatformPreviewController() : impl_(std::make_unique<Impl>(*this)) {
}

PlatformPreviewController::~PlatformPreviewController() {
    impl_->drop();
}

bool PlatformPreviewController::canPreview(const Url& url) {
    const std::string type = typeOf(url);
    // A folder of that name is a folder, whatever its name ends in, unless it is a package.
    return (!url.hasDirectoryMark() || TypeRegistry::conformsTo(type, types::package)) &&
           previewKindFor(type) != nullptr;
}

void PlatformPreviewController::setDataSource(PlatformPreviewDataSource* source) {
    impl_->source = source;
}

void PlatformPreviewController::setDelegate(PlatformPreviewDelegate* delegate) {
    impl_->delegate = delegate;
}

void PlatformPreviewController::reloadData() {
    impl_->reload();
}

void PlatformPreviewController::refreshCurrentPreviewItem() {
    if (isViewLoaded())
        impl_->refresh();
}

void PlatformPreviewController::setAdditionalRightBarButtonItems(
    std::vector<BarButtonItem::Pointer> items) {
    navigationItem().setRightBarButtonItems(std::move(items));
}

void PlatformPreviewController::loadView() {
    impl_->makeView();
    setView(impl_->view);
}

void PlatformPreviewController::viewWillAppear(bool animated) {
    ViewController::viewWillAppear(animated);
    // All that can be done here stands in the bar above.
    if (NavigationController* const stack = navigationController())
        stack->setToolbarHidden(true, false);
    if (!impl_->shown)
        impl_->reload();
}

void PlatformPreviewController::viewDidDisappear(bool animated) {
    ViewController::viewDidDisappear(animated);
    // Under another screen it keeps its place; off the stack it keeps nothing.
    if (!navigationController())
        impl_->drop();
}

} // namespace platform
