#include "platform/documents/DocumentListController.h"

#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/FolderPath.h"
#include "platform/documents/ListScreen.h"
#include "platform/documents/list/ListWidget.h"

namespace platform {
DocumentListController::DocumentListController(std::unique_ptr<Impl> impl)
    : impl_(std::move(impl)) {
    impl_->self = this;
}

DocumentListController::~DocumentListController() = default;

std::shared_ptr<DocumentListController> DocumentListController::create() {
    const std::optional<Url> root = DocumentServices::current().documents.shelfroot();
    return root ? createForURL(*root) : nullptr;
}

std::shared_ptr<DocumentListController> DocumentListController::createForURL(const Url& folder) {
    const DocumentServices services = DocumentServices::current();
    const Url place = folder.standardized().markedAsDirectory(true);
    std::shared_ptr<DocumentListController> controller(
        new DocumentListController(std::make_unique<Impl>(place, services)));
    controller->setTitle(folderTitle(place, services.documents));
    return controller;
}

std::optional<std::vector<std::shared_ptr<DocumentListController>>>
DocumentListController::listControllerHierarchyForURL(const Url& folder) {
    const auto path = folderPathFromRoot(folder, DocumentServices::current().documents);
    if (!path)
        return std::nullopt;
    std::vector<std::shared_ptr<DocumentListController>> lists;
    for (const Url& each : *path)
        lists.push_back(createForURL(each));
    return lists;
}

const Url& DocumentListController::presentedURL() const {
    return impl_->model->folder();
}

std::vector<Url> DocumentListController::containedItems() const {
    std::vector<Url> urls;
    urls.reserve(impl_->model->count());
    for (std::size_t i = 0; i < impl_->model->count(); ++i)
        urls.push_back(impl_->model->urlAt(i));
    return urls;
}

std::size_t DocumentListController::containedItemCount() const {
    return impl_->model->count();
}

std::vector<Url> DocumentListController::selectedItems() const {
    return impl_->urlsOf(impl_->selection().indices(*impl_->model));
}

std::size_t DocumentListController::selectedItemCount() const {
    return impl_->selection().size();
}

std::size_t DocumentListController::selectedContainerCount() const {
    const FolderModel& model = *impl_->model;
    std::size_t found = 0;
    // They stand before everything else.
    for (std::size_t i = 0; i < model.count(); ++i) {
        if (model.entryAt(i).kind != EntryKind::container)
            break;
        found += impl_->selection().contains(model.idAt(i)) ? 1 : 0;
    }
    return found;
}

void DocumentListController::setSelectedItems(const std::vector<Url>& items) {
    std::vector<RowId> rows;
    for (const Url& item : items)
        if (const std::optional<std::size_t> index = impl_->model->indexOf(item))
            rows.push_back(impl_->model->idAt(*index));
    if (!impl_->selection().set(rows))
        return;
    impl_->repaint();
    impl_->itemsChanged();
}

bool DocumentListController::isEditing() const {
    return impl_->editing;
}

void DocumentListController::setEditing(bool editing, bool animated) {
    impl_->setEditing(editing, animated);
}

unsigned DocumentListController::availableActions() const {
    return impl_->actions;
}

void DocumentListController::setAvailableActions(unsigned bits) {
    if (std::exchange(impl_->actions, bits) != bits)
        impl_->repaint();
}

void DocumentListController::setDelegate(std::weak_ptr<DocumentListControllerDelegate> delegate) {
    impl_->delegate = std::move(delegate);
    // Whoever comes later than the first reading hears of it as well.
    if (impl_->model->state() != ModelState::loading)
        impl_->itemsChanged();
}

std::shared_ptr<DocumentListControllerDelegate> DocumentListController::delegate() const {
    return impl_->delegate.lock();
}

std::shared_ptr<void> DocumentListController::associatedObject(const std::string& key) const {
    const auto found = impl_->associated.find(key);
    return found == impl_->associated.end() ? nullptr : found->second;
}

void DocumentListController::setAssociatedObject(const std::string& key,
                                                 std::shared_ptr<void> object) {
    impl_->associated[key] = std::move(object);
}

void DocumentListController::loadView() {
    impl_->makeView();
    setView(impl_->list);
}

void DocumentListController::viewWillAppear(bool animated) {
    ViewController::viewWillAppear(animated);
    impl_->willAppear();
}

void DocumentListController::viewDidAppear(bool animated) {
    ViewController::viewDidAppear(animated);
    impl_->list->takeFocus();
}

void DocumentListController::viewWillDisappear(bool animated) {
    ViewController::viewWillDisappear(animated);
    impl_->willDisappear();
}

bool DocumentListController::performKeyCommand(KeyCommand command) {
    if (command == KeyCommand::find) {
        impl_->openSearch();
        return true;
    }
    if (command == KeyCommand::selectAll && impl_->editing) {
        impl_->list->widget().state().selectAll();
        impl_->list->takeFocus();
        return true;
    }
    if (command == KeyCommand::down && impl_->model->count() > 0) {
        impl_->list->takeFocus();
        return true;
    }
    return command == KeyCommand::cancel && impl_->leaveEditing();
}

} // namespace platform
