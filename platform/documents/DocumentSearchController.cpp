#include "platform/documents/DocumentSearchController.h"

#include "platform/base/Text.h"
#include "platform/documents/DocumentListController.h"
#include "platform/documents/list/ListView.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/documents/search/SearchModel.h"
#include "platform/ui/BarButtonImpl.h"
#include "platform/ui/Controls.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"

#include <algorithm>
#include <cmath>
#include <utility>

namespace platform {
namespace {

/// A button's own padding, which stands within the page's margin.
constexpr double buttonPadding = Theme::iconGap;
constexpr double bottomGap = 4;
constexpr double largestCancelShare = 0.45;

/// The field and the way out, above what was found.
class SearchPage : public View {
public:
    SearchPage(std::shared_ptr<ListView> results, std::function<void()> cancelled)
        : field(std::make_shared<TextField>()),
          results_(std::move(results)),
          cancel_(std::make_shared<Button>(ButtonType::system)),
          bar_(std::make_shared<View>()),
          line_(std::make_shared<View>()) {
        setBackgroundColor(Theme::page);
        field->setPlaceholder(localized("Search all documents"));
        field->setClearButtonWhileEditing(true);
        field->setAutocorrection(false);
        field->setCapitalization(Capitalization::none);
        cancel_->setTitle(localized("Cancel"));
        cancel_->addAction(ControlEvent::touchUpInside, std::move(cancelled));
        bar_->setBackgroundColor(Theme::bar);
        line_->setBackgroundColor(Theme::hairline);
        for (const std::shared_ptr<View>& each :
             std::initializer_list<std::shared_ptr<View>>{bar_, field, cancel_, results_, line_})
            addSubview(each);
    }

    const std::shared_ptr<TextField> field;

protected:
    void layoutSubviews() override {
        const double width = bounds().width;
        const double margin = pageMargin();
        const double height =
            std::max(Theme::minimumTarget, std::ceil(field->intrinsicContentSize().height));
        const double top = (Theme::barHeight - Theme::minimumTarget) / 2;
        // As in the bar that stands here on other screens.
        if (const double scale = barTitleScale(); std::exchange(cancelScale_, scale) != scale)
            cancel_->setTitleFont(Font::preferred(TextStyle::body).scaled(scale));
        const double cancelWidth =
            std::min(cancel_->intrinsicContentSize().width, width * largestCancelShare);
        const double fieldWidth = std::max(0.0, width - 2 * margin + buttonPadding - cancelWidth);
        field->setFrame(mirrored({margin, top, fieldWidth, height}, width));
        cancel_->setFrame(mirrored({margin + fieldWidth, top, cancelWidth, height}, width));
        const double y = top + height + bottomGap;
        bar_->setFrame({0, 0, width, y});
        line_->setFrame({0, y - 1, width, 1});
        results_->setFrame({0, y, width, std::max(0.0, bounds().height - y)});
    }

private:
    std::shared_ptr<ListView> results_;
    std::shared_ptr<Button> cancel_;
    double cancelScale_ = 1;
    std::shared_ptr<View> bar_;
    std::shared_ptr<View> line_;
};

} // namespace

struct DocumentSearchController::Impl final : ListClient {
    Impl(std::shared_ptr<DocumentListController> presenter, const DocumentServices& services)
        : list(std::move(presenter)),
          main(services.mainQueue),
          model(std::make_shared<SearchModel>(services, makeNameSearch(services))) {}
    ~Impl() override {
        if (results)
            results->leaveClient();
    }

    std::shared_ptr<View> makeView() {
        results = std::make_shared<ListView>(model, *this);
        results->widget().setChangeHandlers([this] { rowsChanged(); }, [this] { update(); });
        page = std::make_shared<SearchPage>(results, [this] { self->dismissViewController(true); });
        page->field->setEditingChangedHandler(
            [this](TextField& field) { model->find(field.text()); });
        page->field->setReturnHandler([this](TextField&) { enterResults(); });
        update();
        return page;
    }

    bool enterResults() {
        if (model->count() == 0)
            return false;
        results->takeFocus();
        return true;
    }

    void rowsChanged() {
        results->widget().state().scrolling.jumpTo(0);
        update();
    }

    void update() {
        // What was found before stays while the next text is looked for, so that nothing flickers.
        if (model->state() == ModelState::loading) {
            if (!loading_)
                loading_ = main.timer(Theme::loadingDelay, [this] {
                    results->setPage(std::nullopt);
                    results->setShowsPlaceholders(true);
                });
            return;
        }
        loading_.cancel();
        results->setShowsPlaceholders(false);
        results->setPage(pageContent());
    }

    std::optional<StatusPage::Content> pageContent() const {
        if (model->count() > 0)
            return std::nullopt;
        if (model->text().empty())
            return StatusPage::Content{
                StatusPage::Drawing::nothingFound,
                localized("Type a part of a name"),
                localized("Documents and folders of the whole store are found, also those "
                          "that are not downloaded."),
                {}};
        return StatusPage::Content{
            StatusPage::Drawing::nothingFound,
            localized("Nothing found"),
            localizedFormat("No name in the store contains “%1$@”.", model->text()),
            {}};
    }

    void listDidOpenRow(std::size_t index) override {
        const auto keep = self->shared_from_this();
        const auto receiver = list->delegate();
        if (!receiver)
            return;
        const Url url = model->urlAt(index);
        if (!isDocument(model->entryAt(index).kind)) {
            // The receiver takes this screen away: it knows what to show in its place.
            receiver->documentListControllerDidSelectContainerWithViewController(
                *list, DocumentListController::createForURL(url));
            return;
        }
        receiver->documentListControllerDidSelectItemAtURL(*list, url);
        if (self->presentingViewController())
            self->dismissViewController(true);
    }
    unsigned listActions() const override { return 0; }
    void listDidChooseAction(int, std::size_t, Rect, std::function<void()> done) override {
        done();
    }
    void listDidAskForActions(std::size_t, Rect, std::function<void()> done) override { done(); }

    DocumentSearchController* self = nullptr;
    const std::shared_ptr<DocumentListController> list;
    MainQueue& main;
    const std::shared_ptr<SearchModel> model;
    std::shared_ptr<ListView> results;
    std::shared_ptr<SearchPage> page;

private:
    Timer loading_;
};

DocumentSearchController::DocumentSearchController(std::unique_ptr<Impl> impl)
    : impl_(std::move(impl)) {
    impl_->self = this;
}

DocumentSearchController::~DocumentSearchController() = default;

std::shared_ptr<DocumentSearchController>
DocumentSearchController::create(const std::shared_ptr<DocumentListController>& list) {
    auto impl = std::make_unique<Impl>(list, DocumentServices::current());
    return std::shared_ptr<DocumentSearchController>(new DocumentSearchController(std::move(impl)));
}

void DocumentSearchController::loadView() {
    setView(impl_->makeView());
}

void DocumentSearchController::viewDidAppear(bool animated) {
    ViewController::viewDidAppear(animated);
    impl_->page->field->becomeFirstResponder();
}

bool DocumentSearchController::performKeyCommand(KeyCommand command) {
    if (command == KeyCommand::down)
        return impl_->enterResults();
    if (command != KeyCommand::cancel)
        return false;
    dismissViewController(true);
    return true;
}

} // namespace platform
