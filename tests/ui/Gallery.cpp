// Pictures of every control, alert and sheet and of the navigation chrome, for the eye: writes
// gallery-*.png into the folder that it is given.

#include "platform/base/Text.h"
#include "platform/ui/AlertController.h"
#include "platform/ui/Controls.h"
#include "platform/ui/StackView.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "tests/ui/UiEnvironment.h"

#include <QApplication>
#include <QKeyEvent>
#include <QMouseEvent>
#include <QWidget>

#include <cstdio>
#include <filesystem>
#include <fstream>
#include <functional>

namespace {

using namespace platform;
using namespace std::chrono_literals;

constexpr Size phone{390, 844};
constexpr Size phoneTurned{844, 390};
constexpr Size smallPhone{360, 640};
constexpr Size tablet{1024, 768};

struct Look {
    std::string name;
    Size size = phone;
    DeviceIdiom idiom = DeviceIdiom::phone;
    bool rightToLeft = false;
    double textScale = 1;
};

/// One window with a stack of screens, drawn into one file.
class Picture {
public:
    Picture(test::UiEnvironment& environment, const Look& look)
        : environment_(environment), name_(look.name) {
        environment.application->setIdiom(look.idiom);
        environment.application->setRightToLeft(look.rightToLeft);
        environment.application->setTextScale(look.textScale);
        window_ = std::make_unique<Window>(Rect{0, 0, look.size.width, look.size.height});
        window_->setStatusStrip({"anna@example.org", "Wi-Fi", true});
        stack = std::make_shared<NavigationController>();
        stack->setToolbarHidden(false, false);
        window_->setRootViewController(stack);
        window_->makeKeyAndVisible();
    }
    ~Picture() {
        environment_.settle();
        window_->setRootViewController(nullptr);
    }

    std::shared_ptr<ViewController> push(std::string_view title, bool animated = false) {
        auto screen = std::make_shared<ViewController>();
        screen->setTitle(title);
        stack->pushViewController(screen, animated);
        return screen;
    }
    void after(Duration time) { environment_.advance(time); }
    /// Moves the keyboard's focus on, as the Tab key does.
    void pressTab(int times) {
        QWidget* const top = widgetOf(*stack->view())->window();
        for (int i = 0; i < times; ++i) {
            QWidget* const focused = QApplication::focusWidget();
            QKeyEvent tab(QEvent::KeyPress, Qt::Key_Tab, Qt::NoModifier);
            QCoreApplication::sendEvent(focused ? focused : top, &tab);
        }
        environment_.settle();
    }
    /// Leaves the button pressed.
    static void hold(const Button& button) {
        QMouseEvent press(QEvent::MouseButtonPress, QPointF(9, 9), QPointF(9, 9), Qt::LeftButton,
                          Qt::LeftButton, Qt::NoModifier);
        QCoreApplication::sendEvent(widgetOf(button), &press);
    }
    void save(const std::filesystem::path& folder) {
        environment_.settle();
        const Bytes png = window_->snapshotPng(2);
        const auto file = folder / ("gallery-" + name_ + ".png");
        std::ofstream(file, std::ios::binary)
            .write(reinterpret_cast<const char*>(png.data()),
                   static_cast<std::streamsize>(png.size()));
        std::printf("%s\n", file.c_str());
    }

    std::shared_ptr<NavigationController> stack;

private:
    test::UiEnvironment& environment_;
    std::string name_;
    std::unique_ptr<Window> window_;
};

std::shared_ptr<Label> label(std::string_view text, TextStyle style, Color color = Theme::text) {
    auto made = std::make_shared<Label>();
    made->setText(text);
    made->setFont(Font::preferred(style));
    made->setTextColor(color);
    return made;
}

std::shared_ptr<Button> button(std::string_view title, bool enabled = true) {
    auto made = std::make_shared<Button>(ButtonType::system);
    made->setTitle(title);
    made->setEnabled(enabled);
    return made;
}

std::shared_ptr<TextField> field(std::string_view text, std::string_view placeholder) {
    auto made = std::make_shared<TextField>();
    made->setText(text);
    made->setPlaceholder(placeholder);
    made->setClearButtonWhileEditing(true);
    return made;
}

std::shared_ptr<StackView> row(const std::vector<std::shared_ptr<View>>& views) {
    auto made = std::make_shared<StackView>(views);
    made->setSpacing(12);
    made->setAlignment(StackAlignment::center);
    return made;
}

/// Takes what a row leaves over, so that nothing in it is stretched.
std::shared_ptr<StackView> withRest(const std::shared_ptr<StackView>& views) {
    views->addArrangedSubview(std::make_shared<View>());
    return views;
}

std::shared_ptr<StackView> iconRow() {
    auto made = row({});
    for (const auto which :
         {SystemImage::organize, SystemImage::trash, SystemImage::action, SystemImage::back,
          SystemImage::chevron, SystemImage::more, SystemImage::cloudDownload,
          SystemImage::checkmark, SystemImage::search, SystemImage::folder, SystemImage::warning}) {
        auto view = std::make_shared<ImageView>();
        view->setImage(Image::system(which).tinted(Theme::accent));
        made->addArrangedSubview(view);
    }
    made->setSpacing(8);
    return withRest(made);
}

std::shared_ptr<StackView> pictureRow() {
    auto made = row({});
    for (const char* const name : {"Cloudload", "Cloud", "Tavrin"}) {
        auto view = std::make_shared<ImageView>();
        view->setImage(Image::named(name));
        view->setContentMode(ContentMode::aspectFit);
        LayoutConstraint::constant(*view, LayoutAttribute::width, LayoutRelation::equal, 56)
            ->setActive(true);
        LayoutConstraint::constant(*view, LayoutAttribute::height, LayoutRelation::equal, 56)
            ->setActive(true);
        made->addArrangedSubview(view);
    }
    return withRest(made);
}

/// Every control below each other.
void fillWithControls(ViewController& screen) {
    auto wrapped = label("A text of several lines wraps at the width that the layout gives it; its "
                         "height follows.",
                         TextStyle::body);
    wrapped->setNumberOfLines(0);
    auto elided = label("Quarterly figures of the northern branches, revised and final.numbers",
                        TextStyle::body);
    elided->setLineBreak(LineBreak::elideMiddle);
    auto typing = field("Summer journey", "Folder Name");
    auto column = std::make_shared<StackView>(std::vector<std::shared_ptr<View>>{
        label("Title two", TextStyle::title2), label("Headline", TextStyle::headline), wrapped,
        elided, label("Subheadline, العربية, naïve", TextStyle::subheadline),
        label("Footnote – 12 November 2026", TextStyle::footnote, Theme::secondaryText),
        label("Caption", TextStyle::caption, Theme::secondaryText), iconRow(), pictureRow(),
        withRest(row({button("Download to View"), button("Disabled", false)})), typing,
        field("", "Folder Name")});
    column->setAxis(Axis::vertical);
    column->setSpacing(12);
    column->setLaidOutByConstraints(true);
    View& view = *screen.view();
    view.addSubview(column);
    LayoutConstraint::activate(
        {LayoutConstraint::equal(*column, LayoutAttribute::leading, view, LayoutAttribute::leading,
                                 Theme::phoneMargin),
         LayoutConstraint::equal(*column, LayoutAttribute::trailing, view,
                                 LayoutAttribute::trailing, -Theme::phoneMargin),
         LayoutConstraint::equal(*column, LayoutAttribute::top, view, LayoutAttribute::top, 16)});
    typing->becomeFirstResponder();
}

void setEditingBars(ViewController& screen) {
    const auto space = BarButtonItem::withSystemItem(SystemItem::flexibleSpace);
    const auto item = [](std::string_view title, bool enabled) {
        auto made = BarButtonItem::withCustomView(button(localized(title), enabled));
        return made;
    };
    screen.navigationItem().setHidesBackButton(true, false);
    screen.navigationItem().setRightBarButtonItem(
        BarButtonItem::withSystemItem(SystemItem::cancel));
    screen.setToolbarItems(
        {item("New Folder", true), space, item("Move", true), space, item("Delete", false)});
}

void setListBars(ViewController& screen) {
    const auto space = BarButtonItem::withSystemItem(SystemItem::flexibleSpace);
    const auto status = label("12 items, 1.5 GB available", TextStyle::footnote);
    screen.navigationItem().setRightBarButtonItem(
        BarButtonItem::withTitle("Select", BarStyle::plain, {}));
    screen.setToolbarItems({space, BarButtonItem::withCustomView(status), space});
}

void setPreviewBars(ViewController& screen, DeviceIdiom idiom) {
    const auto space = BarButtonItem::withSystemItem(SystemItem::flexibleSpace);
    const auto fixed = BarButtonItem::withSystemItem(SystemItem::fixedSpace);
    const auto share = BarButtonItem::withSystemItem(SystemItem::action);
    const auto trash = BarButtonItem::withSystemItem(SystemItem::trash);
    const auto move = BarButtonItem::withSystemItem(SystemItem::organize);
    if (idiom == DeviceIdiom::phone)
        screen.setToolbarItems({share, space, trash, space, move});
    else
        screen.navigationItem().setRightBarButtonItems({share, fixed, trash, fixed, move});
}

std::shared_ptr<AlertController> question(std::string_view title, std::string_view message,
                                          const std::vector<std::string>& answers) {
    auto alert = AlertController::create(title, message, AlertStyle::alert);
    for (const std::string& each : answers)
        alert->addAction(AlertAction::make(each, each == "Cancel" || each == "Abbrechen"
                                                     ? ActionStyle::cancel
                                                     : ActionStyle::standard));
    return alert;
}

/// The text of an error under a prompt's field.
class ErrorLine : public ViewController {
public:
    void viewDidLoad() override {
        View& area = *view();
        area.setLaidOutByConstraints(true);
        auto text =
            label("Character not allowed in filename", TextStyle::footnote, Theme::destructive);
        text->setNumberOfLines(5);
        text->setLaidOutByConstraints(true);
        area.addSubview(text);
        using enum LayoutAttribute;
        LayoutConstraint::activate({LayoutConstraint::equal(*text, top, area, top),
                                    LayoutConstraint::equal(*text, height, area, height),
                                    LayoutConstraint::equal(*text, leading, area, leading, 16),
                                    LayoutConstraint::equal(*text, trailing, area, trailing, -16)});
    }
};

std::shared_ptr<AlertController> prompt(bool withError) {
    auto alert =
        AlertController::create("New Folder", "Enter a name for this folder.", AlertStyle::alert);
    alert->addTextField([&](TextField& name) {
        name.setPlaceholder("Folder Name");
        if (withError)
            name.setText(".hidden");
        name.setClearButtonWhileEditing(true);
        LayoutConstraint::constant(name, LayoutAttribute::height, LayoutRelation::equal,
                                   1.2 * name.font().lineHeight())
            ->setActive(true);
    });
    alert->addAction(AlertAction::make("Cancel", ActionStyle::standard));
    alert->addAction(AlertAction::make("Create", ActionStyle::standard));
    alert->actions().back()->setEnabled(false);
    auto error = std::make_shared<ErrorLine>();
    alert->setContentViewController(error);
    error->view()->setHidden(!withError);
    return alert;
}

std::shared_ptr<AlertController> deleteSheet() {
    auto sheet = AlertController::create("",
                                         "“Report.pdf” will be permanently deleted from Tavrin on "
                                         "all your devices. This action cannot be undone.",
                                         AlertStyle::actionSheet);
    sheet->addAction(AlertAction::make("Delete from Tavrin", ActionStyle::destructive));
    sheet->addAction(AlertAction::make("Cancel", ActionStyle::cancel));
    return sheet;
}

std::shared_ptr<AlertController> actionsSheet() {
    auto sheet = AlertController::create("", "", AlertStyle::actionSheet);
    for (const char* const title : {"Rename Item…", "Share Item…", "Move to Folder…"})
        sheet->addAction(AlertAction::make(title, ActionStyle::standard));
    sheet->actions()[1]->setEnabled(false);
    sheet->addAction(AlertAction::make("Cancel", ActionStyle::cancel));
    return sheet;
}

using Scene = std::function<void(Picture&)>;

/// Buttons at rest, disabled, and one pressed or with the keyboard's focus.
void states(Picture& picture, bool isPressed) {
    picture.push("Tavrin");
    const auto screen = picture.push("Documents");
    setEditingBars(*screen);
    screen->navigationItem().setHidesBackButton(false, false);
    const auto changed = button(isPressed ? "Pressed" : "With the focus");
    double y = 24;
    for (const auto& each : {changed, button("At rest"), button("Disabled", false)}) {
        each->sizeToFit();
        each->setFrame({16, y, each->frame().width, each->frame().height});
        screen->view()->addSubview(each);
        y += 56;
    }
    if (isPressed)
        Picture::hold(*changed);
    else
        picture.pressTab(3);
}

void controls(Picture& picture) {
    picture.push("Tavrin");
    const auto screen = picture.push("Documents");
    setListBars(*screen);
    fillWithControls(*screen);
}

void editing(Picture& picture) {
    picture.push("Tavrin");
    const auto screen = picture.push("3 Items Selected");
    setEditingBars(*screen);
}

Scene presenting(const std::function<std::shared_ptr<AlertController>()>& make) {
    return [make](Picture& picture) {
        picture.push("Tavrin");
        const auto screen = picture.push("Documents");
        setListBars(*screen);
        fillWithControls(*screen);
        screen->presentViewController(make(), true);
        picture.after(1s);
    };
}

Scene popover(const std::function<std::shared_ptr<AlertController>()>& make, bool atButton) {
    return [make, atButton](Picture& picture) {
        picture.push("Documents");
        const auto screen = picture.push("Report.pdf");
        setPreviewBars(*screen, DeviceIdiom::tablet);
        const auto sheet = make();
        if (atButton) {
            sheet->setPopoverAnchor(screen->navigationItem().rightBarButtonItems()[2]);
        } else {
            auto anchor = std::make_shared<View>(Rect{700, 240, 44, 44});
            anchor->setBackgroundColor(Theme::selection);
            screen->view()->addSubview(anchor);
            sheet->setPopoverAnchor(anchor, {0, 22, 44, 0},
                                    ArrowDirection::left | ArrowDirection::right);
        }
        screen->presentViewController(sheet, true);
        picture.after(1s);
    };
}

void pushHalfWay(Picture& picture) {
    setListBars(*picture.push("Tavrin"));
    fillWithControls(*picture.stack->topViewController());
    const auto screen = picture.push("Report.pdf", true);
    setPreviewBars(*screen, DeviceIdiom::phone);
    screen->view()->setBackgroundColor(Theme::page);
    picture.after(60ms);
}

const auto longQuestion = [] {
    return question("Dieses Objekt ist größer als 100 MB.",
                    "„Jahresabschluss der Niederlassungen 2026 (endgültige Fassung).pdf“ wird erst "
                    "geladen, wenn eine Verbindung zu einem WLAN besteht.",
                    {"Einstellungen öffnen", "Später erinnern", "Abbrechen"});
};
const auto shortQuestion = [] {
    return question("The name “Report” with extension “.pdf” is already taken.",
                    "Choose a different name.", {"OK"});
};
const auto twoAnswers = [] {
    return question("Sign out?", "Documents that are not uploaded yet stay on this device.",
                    {"Sign Out", "Cancel"});
};

} // namespace

int main(int argc, char** argv) {
    const std::filesystem::path folder = argc > 1 ? argv[1] : "screens";
    std::filesystem::create_directories(folder);
    platform::loadLocalizedTexts("en_US");
    test::UiEnvironment environment;
    const auto onTablet = DeviceIdiom::tablet;
    const std::vector<std::pair<Look, Scene>> scenes = {
        {{"controls-phone"}, controls},
        {{"controls-phone-rtl", phone, DeviceIdiom::phone, true}, controls},
        {{"controls-phone-200", phone, DeviceIdiom::phone, false, 2}, controls},
        {{"controls-phone-turned", phoneTurned}, controls},
        {{"controls-tablet", tablet, onTablet}, controls},
        {{"pressed", smallPhone}, [](Picture& picture) { states(picture, true); }},
        {{"editing-small-phone", smallPhone}, editing},
        {{"editing-small-phone-200", smallPhone, DeviceIdiom::phone, false, 2}, editing},
        {{"editing-phone-rtl", phone, DeviceIdiom::phone, true}, editing},
        {{"push-half-way", phone}, pushHalfWay},
        {{"push-half-way-rtl", phone, DeviceIdiom::phone, true}, pushHalfWay},
        {{"alert-one", phone}, presenting(shortQuestion)},
        {{"alert-two", phone}, presenting(twoAnswers)},
        {{"alert-two-rtl", phone, DeviceIdiom::phone, true}, presenting(twoAnswers)},
        {{"alert-german", smallPhone}, presenting(longQuestion)},
        {{"alert-german-200", smallPhone, DeviceIdiom::phone, false, 2}, presenting(longQuestion)},
        {{"alert-tablet", tablet, onTablet}, presenting(twoAnswers)},
        {{"prompt", phone}, presenting([] { return prompt(false); })},
        {{"prompt-error", phone}, presenting([] { return prompt(true); })},
        {{"prompt-error-200", smallPhone, DeviceIdiom::phone, false, 2},
         presenting([] { return prompt(true); })},
        {{"sheet-delete", phone}, presenting(deleteSheet)},
        {{"sheet-actions", phone}, presenting(actionsSheet)},
        {{"sheet-turned", phoneTurned}, presenting(actionsSheet)},
        {{"sheet-delete-200", smallPhone, DeviceIdiom::phone, false, 2}, presenting(deleteSheet)},
        {{"popover-button", tablet, onTablet}, popover(deleteSheet, true)},
        {{"popover-row", tablet, onTablet}, popover(actionsSheet, false)},
        {{"popover-row-rtl", tablet, onTablet, true}, popover(actionsSheet, false)},
        // Last: from the first Tab on the focus shows.
        {{"focus", smallPhone}, [](Picture& picture) { states(picture, false); }},
        {{"alert-focus", phone},
         [](Picture& picture) {
             presenting(twoAnswers)(picture);
             picture.pressTab(1);
         }},
    };
    for (const auto& [look, scene] : scenes) {
        Picture picture(environment, look);
        scene(picture);
        picture.save(folder);
    }
    return 0;
}
