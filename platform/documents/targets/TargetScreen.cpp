#include "platform/documents/targets/TargetScreen.h"

#include "platform/base/Text.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/DocumentServices.h"
#include "platform/documents/FolderPage.h"
#include "platform/documents/FolderPath.h"
#include "platform/documents/list/ListClient.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/documents/model/FolderModel.h"
#include "platform/documents/targets/MovedItems.h"
#include "platform/documents/targets/NewFolderQuestion.h"
#include "platform/documents/targets/TargetPage.h"
#include "platform/documents/targets/TargetRules.h"

#include <algorithm>

namespace platform {
namespace {

std::string movedTitle(const MovedItems& items) {
    if (items.count() == 1)
        return localizedFormat("Move “%1$@”", items.title());
    return localizedPlural(".DICT.MOVE_ITEMS.%d", static_cast<long long>(items.count()));
}

} // namespace

struct TargetScreen::Impl final : ListClient {
    Impl(const Url& folder, TargetChooser& theChooser)
        : services(DocumentServices::current()),
          chooser(theChooser),
          model(std::make_shared<FolderModel>(folder, services)) {
        model->start();
    }
    ~Impl() override {
        if (list)
            list->leaveClient();
    }

    void makeBarItems() {
        const auto item = [this](std::string_view title, BarStyle style, void (Impl::*action)()) {
            return BarButtonItem::withTitle(title, style,
                                            [this, action](BarButtonItem&) { (this->*action)(); });
        };
        newFolder = item(localized("New Folder"), BarStyle::plain, &Impl::askForFolder);
        moveHere = item(localized("Move Here"), BarStyle::done, &Impl::choose);
        self->navigationItem().setRightBarButtonItem(BarButtonItem::withSystemItem(
            SystemItem::cancel, [this](BarButtonItem&) { chooser.cancel(); }));
        self->setToolbarItems(
            {newFolder, BarButtonItem::withSystemItem(SystemItem::flexibleSpace), moveHere});
    }

    std::shared_ptr<View> makeView() {
        list = std::make_shared<ListView>(model, *this);
        list->widget().setChangeHandlers([this] { update(); }, [this] { update(); });
        page = std::make_shared<TargetPage>(movedTitle(chooser.items()), list);
        status = std::make_unique<FolderPage>(
            services, model, list,
            StatusPage::Content{
                StatusPage::Drawing::emptyFolder, localized("Nothing here yet"), {}, {}});
        update();
        return page;
    }

    void update() {
        status->update();
        const bool known = model->state() == ModelState::ready;
        const std::optional<std::string> reason = known ? whyNot() : std::nullopt;
        page->setReason(reason.value_or(std::string()));
        moveHere->setEnabled(known && !reason);
        newFolder->setEnabled(known && mayHoldNewFolder(model->folder(), services.documents));
    }

    std::optional<std::string> whyNot() const {
        const MovedItems& items = chooser.items();
        if (auto reason = whyNotInto(model->folder(), items, services.documents))
            return reason;
        // Where only some names are taken the others can go; those that cannot are told then.
        const bool allTaken = std::ranges::all_of(items.urls(), [this](const Url& item) {
            return model->contains(item.lastPathComponent());
        });
        if (!allTaken)
            return std::nullopt;
        return items.count() == 1 ? localized("An item with this name is here already.")
                                  : localized("Items with these names are here already.");
    }

    void choose() {
        // The folder may have become another since the button was drawn.
        if (model->state() == ModelState::ready && !whyNot())
            chooser.choose(model->folder());
    }

    void askForFolder() {
        const auto screen = std::weak_ptr(self->shared_from_this());
        askForNewFolder(*self, model->folder(), [this, screen](const Url& made) {
            if (const auto keep = screen.lock())
                chooser.openFolder(made);
        });
    }

    bool listAllowsRow(std::size_t index) const override {
        return !isDocument(model->entryAt(index).kind) &&
               !chooser.items().contains(model->urlAt(index));
    }
    void listDidOpenRow(std::size_t index) override { chooser.openFolder(model->urlAt(index)); }
    unsigned listActions() const override { return 0; }
    void listDidChooseAction(int, std::size_t, Rect, std::function<void()> done) override {
        done();
    }
    void listDidAskForActions(std::size_t, Rect, std::function<void()> done) override { done(); }

    TargetScreen* self = nullptr;
    const DocumentServices services;
    TargetChooser& chooser;
    const std::shared_ptr<FolderModel> model;
    /// None before the view is loaded, as are the two below.
    std::shared_ptr<ListView> list;
    std::shared_ptr<TargetPage> page;
    std::unique_ptr<FolderPage> status;
    BarButtonItem::Pointer newFolder;
    BarButtonItem::Pointer moveHere;
};

TargetScreen::TargetScreen(std::unique_ptr<Impl> impl) : impl_(std::move(impl)) {
    impl_->self = this;
    impl_->makeBarItems();
}

TargetScreen::~TargetScreen() = default;

std::shared_ptr<TargetScreen> TargetScreen::create(const Url& folder, TargetChooser& chooser) {
    const std::shared_ptr<TargetScreen> screen(
        new TargetScreen(std::make_unique<Impl>(folder, chooser)));
    screen->setTitle(folderTitle(folder, screen->impl_->services.documents));
    return screen;
}

const Url& TargetScreen::folder() const {
    return impl_->model->folder();
}

const FolderModel& TargetScreen::model() const {
    return *impl_->model;
}

ListView& TargetScreen::list() const {
    return *impl_->list;
}

const std::string& TargetScreen::reason() const {
    return impl_->page->reason();
}

void TargetScreen::loadView() {
    setView(impl_->makeView());
}

void TargetScreen::viewWillAppear(bool animated) {
    ViewController::viewWillAppear(animated);
    impl_->model->refreshShown();
    impl_->update();
}

void TargetScreen::viewDidAppear(bool animated) {
    ViewController::viewDidAppear(animated);
    impl_->list->takeFocus();
}

bool TargetScreen::performKeyCommand(KeyCommand command) {
    if (command == KeyCommand::cancel)
        impl_->chooser.cancel();
    else if (command == KeyCommand::confirm)
        impl_->choose();
    return command == KeyCommand::cancel || command == KeyCommand::confirm;
}

} // namespace platform
