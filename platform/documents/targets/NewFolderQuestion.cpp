#include "platform/documents/targets/NewFolderQuestion.h"

#include "platform/base/Text.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"
#include "platform/ui/AlertController.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <QString>

#include <algorithm>

namespace platform {
namespace {

constexpr double sideMargin = 16;

/// What the person typed, without the blanks around it.
QString typedName(const TextField& field) {
    return toQt(field.text()).trimmed();
}

bool isForbidden(QChar unit) {
    return unit == u'/' || unit == u':' || unit.category() == QChar::Other_Control ||
           unit.category() == QChar::Separator_Line ||
           unit.category() == QChar::Separator_Paragraph;
}

bool isValidName(const QString& name) {
    return !name.isEmpty() && !name.startsWith(u'.') && name.isValidUtf16() &&
           std::ranges::none_of(name, isForbidden);
}

Failure makeFolder(const Url& folder) {
    FileCoordinator coordinator;
    Failure making;
    const Failure coordination =
        coordinator.coordinateWriting(folder, WritingOptions::forReplacing, [&](const Url& url) {
            making = FileManager::createDirectory(url, false);
        });
    return coordination ? coordination : making;
}

/// The line under the field that says what is wrong.
class Complaint : public ViewController {
public:
    void loadView() override {
        label_ = std::make_shared<Label>();
        label_->setNumberOfLines(0);
        label_->setLineBreak(LineBreak::wrap);
        label_->setFont(Font::preferred(TextStyle::footnote));
        label_->setTextColor(Theme::destructive);
        label_->setLaidOutByConstraints(true);
        const auto area = std::make_shared<View>();
        area->setLaidOutByConstraints(true);
        area->addSubview(label_);
        using enum LayoutAttribute;
        LayoutConstraint::activate(
            {LayoutConstraint::equal(*label_, top, *area, top),
             LayoutConstraint::equal(*label_, height, *area, height),
             LayoutConstraint::equal(*label_, leading, *area, leading, sideMargin),
             LayoutConstraint::equal(*label_, trailing, *area, trailing, -sideMargin)});
        area->setHidden(true);
        setView(area);
    }
    void say(const std::string& what) {
        view()->setHidden(what.empty());
        label_->setText(what);
    }

private:
    std::shared_ptr<Label> label_;
};

class Question : public std::enable_shared_from_this<Question> {
public:
    Question(const Url& folder, std::function<void(const Url&)> made)
        : folder_(folder),
          made_(std::move(made)),
          alert_(AlertController::create(localized("New Folder"),
                                         localized("Enter a name for this folder."),
                                         AlertStyle::alert)),
          complaint_(std::make_shared<Complaint>()) {}

    void ask(ViewController& screen) {
        alert_->addTextField([this](TextField& field) { setUp(field); });
        alert_->setContentViewController(complaint_);
        alert_->addAction(AlertAction::make(localized("Cancel"), ActionStyle::cancel));
        // The handler keeps the question for as long as the alert may answer it.
        create_ = AlertAction::make(
            localized("Create"), ActionStyle::standard,
            [self = shared_from_this()](AlertAction&) { self->made_(self->result_); });
        create_->setEnabled(false);
        create_->setShouldDismissHandler([this] { return makeIt(); });
        alert_->addAction(create_);
        screen.presentViewController(alert_, true);
    }

private:
    void setUp(TextField& field) {
        field.setPlaceholder(localized("Folder Name"));
        field.setClearButtonWhileEditing(true);
        field.setReturnKey(ReturnKey::done);
        field.setReturnKeyNeedsText(true);
        field.setCapitalization(Capitalization::words);
        field.setAutocorrection(false);
        field.setEditingChangedHandler([weak = weak_from_this()](TextField& changed) {
            if (const auto self = weak.lock())
                self->check(changed);
        });
    }

    void check(const TextField& field) {
        const QString name = typedName(field);
        const bool valid = isValidName(name);
        create_->setEnabled(valid);
        complaint_->say(valid || name.isEmpty() ? std::string()
                                                : localized("Character not allowed in filename"));
    }

    bool makeIt() {
        const QString name = typedName(*alert_->textFields().front());
        if (!isValidName(name))
            return false;
        result_ = folder_.appending(name.toStdString(), true);
        const Failure failure = makeFolder(result_);
        if (failure)
            complaint_->say(
                failure->localizedDescription.value_or(localized("The folder could not be made.")));
        return !failure;
    }

    const Url folder_;
    const std::function<void(const Url&)> made_;
    const std::shared_ptr<AlertController> alert_;
    const std::shared_ptr<Complaint> complaint_;
    AlertAction::Pointer create_;
    Url result_;
};

} // namespace

void askForNewFolder(ViewController& screen, const Url& folder,
                     std::function<void(const Url& folder)> made) {
    std::make_shared<Question>(folder, std::move(made))->ask(screen);
}

} // namespace platform
