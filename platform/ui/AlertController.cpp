#include "platform/ui/AlertController.h"

#include "platform/ui/AlertContent.h"
#include "platform/ui/ViewControllerImpl.h"
#include "platform/ui/Window.h"
#include "platform/ui/qt/WindowImpl.h"

#include <utility>

namespace platform {

AlertAction::Pointer AlertAction::make(std::string_view title, ActionStyle style, Handler handler) {
    return std::make_shared<AlertAction>(title, style, std::move(handler));
}

AlertAction::AlertAction(std::string_view title, ActionStyle style, Handler handler)
    : title_(title), style_(style), handler_(std::move(handler)) {
}

void AlertAction::setEnabled(bool enabled) {
    if (enabled_ == enabled)
        return;
    enabled_ = enabled;
    if (changed_)
        changed_();
}

void AlertAction::run() {
    // A copy: the handler may let go of the action.
    if (const Handler handler = handler_)
        handler(*this);
}

void AlertAction::release() {
    const Handler handler = std::exchange(handler_, {});
    const auto shouldDismiss = std::exchange(shouldDismiss_, {});
}

std::shared_ptr<AlertController>
AlertController::create(std::string_view title, std::string_view message, AlertStyle style) {
    return std::shared_ptr<AlertController>(new AlertController(title, message, style));
}

AlertController::AlertController(std::string_view title, std::string_view message, AlertStyle style)
    : content_(std::make_unique<Content>(*this)) {
    content_->title = title;
    content_->message = message;
    content_->style = style;
    setTitle(title);
    setModalPresentationStyle(PresentationStyle::overCurrentContext);
    impl().isOverlay = true;
    impl().takeInitialFocus = [this] { content_->takeFocus(); };
}

AlertController::~AlertController() = default;

AlertStyle AlertController::style() const {
    return content_->style;
}

const std::string& AlertController::alertTitle() const {
    return content_->title;
}

const std::string& AlertController::message() const {
    return content_->message;
}

void AlertController::addAction(AlertAction::Pointer action) {
    content_->actions.push_back(std::move(action));
    content_->rebuild();
}

const std::vector<AlertAction::Pointer>& AlertController::actions() const {
    return content_->actions;
}

void AlertController::addTextField(const std::function<void(TextField&)>& configure) {
    auto field = std::make_shared<TextField>();
    if (configure)
        configure(*field);
    content_->fields.push_back(std::move(field));
    content_->rebuild();
}

const std::vector<std::shared_ptr<TextField>>& AlertController::textFields() const {
    return content_->fields;
}

std::shared_ptr<ViewController> AlertController::contentViewController() const {
    return content_->area;
}

void AlertController::setContentViewController(std::shared_ptr<ViewController> content) {
    if (const auto former = std::exchange(content_->area, nullptr)) {
        former->view()->removeFromSuperview();
        former->removeFromParentViewController();
    }
    content_->area = std::move(content);
    if (content_->area)
        addChildViewController(content_->area);
    content_->rebuild();
    if (content_->area)
        content_->area->didMoveToParent(this);
}

void AlertController::setPopoverAnchor(const std::shared_ptr<View>& view, Rect rect,
                                       ArrowDirection directions) {
    content_->anchorItem.reset();
    content_->anchorView = view;
    content_->anchorRect = rect;
    content_->directions = directions;
}

void AlertController::setPopoverAnchor(const BarButtonItem::Pointer& item) {
    content_->anchorView.reset();
    content_->anchorItem = item;
    content_->directions = ArrowDirection::up | ArrowDirection::down;
}

void AlertController::choose(const AlertAction::Pointer& action) {
    if (!action || !action->isEnabled() || content_->chosen)
        return;
    const auto self = std::static_pointer_cast<AlertController>(shared_from_this());
    if (!action->mayDismiss())
        return;
    content_->chosen = true;
    const auto answer = [self, action] {
        action->run();
        self->content_->letGoOfHandlers();
    };
    if (Window* const window = impl().presentedIn)
        window->impl().presentations.dismissOne(*this, true, answer);
    else
        answer();
}

bool AlertController::performKeyCommand(KeyCommand command) {
    if (command == KeyCommand::cancel)
        content_->escape();
    else if (command == KeyCommand::confirm)
        choose(content_->defaultAction());
    // Nothing below an alert hears a key.
    return true;
}

void AlertController::loadView() {
    ViewController::loadView();
    content_->build();
}

void AlertController::viewDidLayoutSubviews() {
    ViewController::viewDidLayoutSubviews();
    content_->layout();
}

void AlertController::viewDidDisappear(bool animated) {
    ViewController::viewDidDisappear(animated);
    if (!content_->chosen)
        content_->letGoOfHandlers();
}

} // namespace platform
