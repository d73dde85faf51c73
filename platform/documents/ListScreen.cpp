#include "platform/documents/ListScreen.h"

#include "platform/base/Text.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/CloudService.h"
#include "platform/documents/DisplayName.h"
#include "platform/documents/DocumentSearchController.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/documents/list/SearchPill.h"
#include "platform/ui/AlertController.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/Theme.h"

namespace platform {
namespace {

std::shared_ptr<SearchPill> makePill(DocumentListController::Impl& screen,
                                     const std::weak_ptr<bool>& alive) {
    auto pill = std::make_shared<SearchPill>([&screen, alive] {
        if (!alive.expired())
            screen.openSearch();
    });
    pill->setUsable(!screen.editing);
    return pill;
}

} // namespace

DocumentListController::Impl::Impl(const Url& folder, const DocumentServices& theServices)
    : services(theServices),
      model(std::make_shared<FolderModel>(folder, services)),
      arrivals_(services.progress, services.mainQueue, [this](RowId row, auto share) {
          if (!list)
              return;
          if (share)
              rows().arriving[row] = *share;
          else
              rows().arriving.erase(row);
          list->widget().update();
      }) {
    model->start();
}

DocumentListController::Impl::~Impl() {
    if (list)
        list->leaveClient();
}

ListState& DocumentListController::Impl::rows() const {
    return list->widget().state();
}

void DocumentListController::Impl::makeView() {
    list = std::make_shared<ListView>(model, *this);
    list->setBackgroundColor(Theme::page);
    pill_ = makePill(*this, alive_);
    list->setHeader(pill_, SearchPill::heightWithMargins());
    list->widget().setChangeHandlers([this] { rowsChanged(); }, [this] { page_->update(); });
    rows().setEditing(editing, false);
    rows().selection = early_;
    page_ = std::make_unique<FolderPage>(services, model, list, emptyPage());
    page_->update();
    if (model->state() == ModelState::ready)
        itemsChanged();
}

StatusPage::Content DocumentListController::Impl::emptyPage() const {
    const bool isRoot = services.documents.shelfroot() == model->folder();
    return {StatusPage::Drawing::emptyFolder,
            localized("No documents here"),
            isRoot ? localized("What applications keep in the cloud appears here.")
                   : localized("Documents that are added to this folder, here or on another "
                               "device, appear here."),
            {}};
}

void DocumentListController::Impl::willAppear() {
    model->refreshShown();
    if (model->state() == ModelState::failed)
        model->read();
}

void DocumentListController::Impl::willDisappear() {
    rows().swipe.close();
    rows().scrolling.stop();
}

RowSelection& DocumentListController::Impl::selection() {
    return list ? rows().selection : early_;
}

void DocumentListController::Impl::repaint() {
    if (list)
        list->widget().update();
}

void DocumentListController::Impl::setEditing(bool value, bool animated) {
    editing = value;
    if (!list) {
        if (!value)
            early_.clear();
        return;
    }
    rows().setEditing(value, animated);
    pill_->setUsable(!value);
}

void DocumentListController::Impl::rowsChanged() {
    followArrivals();
    page_->update();
    itemsChanged();
}

void DocumentListController::Impl::followArrivals() {
    arrivals_.follow(*model, rows().firstInView(), rows().endInView());
}

void DocumentListController::Impl::listDidScroll() {
    if (!list)
        return;
    list->didScroll();
    followArrivals();
}

void DocumentListController::Impl::itemsChanged() {
    if (std::exchange(reportPending_, true))
        return;
    services.mainQueue.async([this, alive = std::weak_ptr(alive_)] {
        if (alive.expired())
            return;
        reportPending_ = false;
        const auto keep = self->shared_from_this();
        if (const auto receiver = delegate.lock())
            receiver->documentListControllerItemsChanged(*self);
    });
}

std::vector<Url>
DocumentListController::Impl::urlsOf(const std::vector<std::size_t>& indices) const {
    std::vector<Url> urls;
    urls.reserve(indices.size());
    for (const std::size_t index : indices)
        urls.push_back(model->urlAt(index));
    return urls;
}

// What is done with rows

void DocumentListController::Impl::listDidOpenRow(std::size_t index) {
    const auto keep = self->shared_from_this();
    const auto receiver = delegate.lock();
    if (!receiver)
        return;
    const Url url = model->urlAt(index);
    if (isDocument(model->entryAt(index).kind))
        receiver->documentListControllerDidSelectItemAtURL(*self, url);
    else
        receiver->documentListControllerDidSelectContainerWithViewController(*self,
                                                                             createForURL(url));
}

void DocumentListController::Impl::listDidChooseAction(int action, std::size_t index, Rect from,
                                                       std::function<void()> done) {
    performAction(action, model->urlAt(index), from, std::move(done));
}

void DocumentListController::Impl::performAction(int action, const Url& url, Rect from,
                                                 std::function<void()> done) {
    const auto keep = self->shared_from_this();
    const auto receiver = delegate.lock();
    if (!receiver) {
        done();
        return;
    }
    receiver->documentListControllerPerformAction(*self, action, url, list->anchorAt(from),
                                                  std::move(done));
}

void DocumentListController::Impl::listDidAskForActions(std::size_t index, Rect from,
                                                        std::function<void()> done) {
    const Url url = model->urlAt(index);
    const auto sheet = AlertController::create(displayName(model->entryAt(index).title()), {},
                                               AlertStyle::actionSheet);
    const auto finished = std::make_shared<std::function<void()>>(std::move(done));
    for (const int action : offeredActions(actions)) {
        const auto style = action == static_cast<int>(DocumentAction::remove)
                               ? ActionStyle::destructive
                               : ActionStyle::standard;
        sheet->addAction(AlertAction::make(
            actionTitle(action), style,
            [this, alive = std::weak_ptr(alive_), action, url, from, finished](AlertAction&) {
                if (!alive.expired())
                    performAction(action, url, from, *finished);
            }));
    }
    sheet->addAction(AlertAction::make(localized("Cancel"), ActionStyle::cancel,
                                       [finished](AlertAction&) { (*finished)(); }));
    const auto anchor = list->anchorAt(from);
    sheet->setPopoverAnchor(anchor, anchor->bounds());
    self->presentViewController(sheet, true);
}

void DocumentListController::Impl::listDidAskForRefresh(std::function<void()> done) {
    const auto finished = std::make_shared<std::function<void()>>(std::move(done));
    // The disk is read again whatever the cloud says, and also where there is no way to it.
    services.cloud.refresh(
        model->folder(),
        [&main = services.mainQueue, weak = std::weak_ptr(model), finished](const Failure&) {
            main.async([weak, finished] {
                if (const auto still = weak.lock())
                    still->read([finished] { (*finished)(); });
            });
        });
}

void DocumentListController::Impl::openSearch() {
    if (editing)
        return;
    const auto presented =
        std::static_pointer_cast<DocumentListController>(self->shared_from_this());
    ViewController* const presenter = self->navigationController();
    (presenter ? *presenter : *self)
        .presentViewController(DocumentSearchController::create(presented), true);
}

/// As the screen's own cancel button would.
bool DocumentListController::Impl::leaveEditing() {
    if (!editing)
        return false;
    for (const BarButtonItem::Pointer& item : self->navigationItem().rightBarButtonItems())
        if (item && item->systemItem() == SystemItem::cancel) {
            item->perform();
            return true;
        }
    return false;
}

} // namespace platform
