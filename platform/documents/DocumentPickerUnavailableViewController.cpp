#include "platform/documents/DocumentPickerUnavailableViewController.h"

#include "platform/base/NotificationCenter.h"
#include "platform/base/Text.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/CloudAccountService.h"
#include "platform/documents/CenteredColumn.h"
#include "platform/documents/DocumentServices.h"
#include "platform/ui/Theme.h"

#include <array>

namespace platform {
namespace {

constexpr double gap = 12;
constexpr Color commandFill = Color::hex(0xF1F3F7);

} // namespace

struct DocumentPickerUnavailableViewController::Content : public CenteredColumn {
    Content(const DocumentServices& theServices, const std::vector<Choice>& choices)
        : services(theServices),
          title(addText(TextStyle::title2, Theme::text, 0)),
          cause(addText(TextStyle::body, Theme::text, gap)),
          advice(addText(TextStyle::subheadline, Theme::secondaryText, 1.5 * gap)) {
        setBackgroundColor(Theme::page);
        const auto cloud = std::make_shared<ImageView>();
        cloud->setImage(Image::named("Cloud").tinted(Theme::badge));
        cloud->setContentMode(ContentMode::aspectFit);
        setPicture(cloud);
        title->setText(localized("Pelmora is not enabled"));
        hasChoices = !choices.empty();
        if (!hasChoices)
            advise();
        else
            offer(choices);
    }

    void advise() {
        advice->setText(
            localized("Sign in to a folder that holds your documents, such as a disk or "
                      "a network folder. In a terminal, type:"));
        addBox(commandFill, gap)->setText("pelmora sign-in folder PATH");
        addText(TextStyle::footnote, Theme::secondaryText, gap)
            ->setText(localized("PATH is that folder. The documents appear here as soon as you are "
                                "signed in."));
    }

    void offer(const std::vector<Choice>& choices) {
        advice->setText(localized("Your documents can be on a server, or in a folder such as a "
                                  "disk or a network folder."));
        for (const Choice& choice : choices) {
            const auto button = std::make_shared<Button>(ButtonType::system);
            button->setTitle(choice.title);
            button->setBackgroundColor(commandFill);
            button->setCornerRadius(Theme::buttonCorner);
            button->addAction(ControlEvent::touchUpInside, choice.choose);
            addControl(button, gap);
        }
    }

    /// The cause may change while there is still no account.
    void follow() {
        const auto changed = [this](const Notification&) { refresh(); };
        observations = {services.notifications.observe(cloudIdentityDidChangeNotification, changed),
                        services.notifications.observe(cloudProblemDidChangeNotification, changed)};
    }

    void refresh() {
        std::optional<std::string> problem = services.accounts.problem();
        if (hasChoices && problem == nobodySignedInText())
            problem.reset(); // the choices say what to do
        cause->setText(problem.value_or(std::string()));
        cause->setHidden(!problem);
        setNeedsLayout();
    }

    DocumentServices services;
    bool hasChoices = false;
    std::shared_ptr<Label> title;
    std::shared_ptr<Label> cause;
    std::shared_ptr<Label> advice;
    std::array<Observation, 2> observations;
};

DocumentPickerUnavailableViewController::DocumentPickerUnavailableViewController() = default;
DocumentPickerUnavailableViewController::~DocumentPickerUnavailableViewController() = default;

void DocumentPickerUnavailableViewController::loadView() {
    content_ = std::make_shared<Content>(DocumentServices::current(), choices_);
    setView(content_);
    content_->refresh();
    content_->follow();
}

void DocumentPickerUnavailableViewController::setChoices(std::vector<Choice> choices) {
    choices_ = std::move(choices);
}

void DocumentPickerUnavailableViewController::viewWillAppear(bool animated) {
    ViewController::viewWillAppear(animated);
    content_->refresh();
}

std::shared_ptr<ViewController> makeScreenByClassName(std::string_view className) {
    if (className == "DocumentPickerUnavailableViewController")
        return std::make_shared<DocumentPickerUnavailableViewController>();
    return nullptr;
}

} // namespace platform
