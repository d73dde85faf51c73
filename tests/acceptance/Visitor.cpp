#include "tests/acceptance/Visitor.h"

#include <QDBusConnectionInterface>

#include <chrono>
#include <csignal>
#include <stdexcept>
#include <thread>

namespace test {
namespace {

/// No machine is that busy.
constexpr auto patience = std::chrono::seconds(60);
constexpr auto betweenLooks = std::chrono::milliseconds(25);
constexpr const char* pressAction = "Press";

/// How far below the window a dialog may stand.
constexpr int dialogDepth = 4;

/// The one that came last lies above the others.
std::optional<Accessible> topDialog(const Accessible& below, int depth) {
    std::optional<Accessible> top;
    if (depth == 0)
        return top;
    for (const Accessible& each : below.children()) {
        if (!each.has(Has::showing))
            continue;
        if (each.has(Has::modality) && each.role() == "dialog")
            top = each;
        else if (const auto inner = topDialog(each, depth - 1))
            top = inner;
    }
    return top;
}

bool isCalled(const Accessible& thing, const std::string& role, const std::string& name) {
    return thing.role() == role && thing.name() == name;
}

} // namespace

void Visitor::until(const std::string& what, const std::function<bool()>& isSo) const {
    const auto deadline = std::chrono::steady_clock::now() + patience;
    while (!isSo()) {
        if (std::chrono::steady_clock::now() > deadline)
            throw std::runtime_error("waited in vain for " + what);
        std::this_thread::sleep_for(betweenLooks);
    }
}

void Visitor::launch() {
    program_ = desk_.start("tavrin");
    until("the window of the program", [this] { return scope().has_value(); });
}

void Visitor::killProgram() {
    program_->kill(SIGKILL);
    program_->wait();
    program_.reset();
}

std::optional<Accessible> Visitor::application() const {
    const Accessible desktop(desk_.accessibility(), QStringLiteral("org.a11y.atspi.Registry"),
                             QStringLiteral("/org/a11y/atspi/accessible/root"));
    const QDBusConnectionInterface* const bus = desk_.accessibility().interface();
    for (const Accessible& each : desktop.children())
        if (program_ && static_cast<pid_t>(bus->servicePid(each.program()).value()) == program_->pid())
            return each;
    return std::nullopt;
}

std::optional<Accessible> Visitor::scope() const {
    const std::optional<Accessible> whole = application();
    if (!whole)
        return std::nullopt;
    const auto window = whole->find([](const Accessible&) { return true; });
    if (!window)
        return std::nullopt;
    const std::optional<Accessible> dialog = topDialog(*window, dialogDepth);
    return dialog ? dialog : window;
}

std::optional<Accessible> Visitor::look(const std::string& role, const std::string& name) const {
    const std::optional<Accessible> place = scope();
    return place ? place->find([&](const Accessible& each) { return isCalled(each, role, name); })
                 : std::nullopt;
}

Accessible Visitor::sees(const std::string& role, const std::string& name) const {
    std::optional<Accessible> found;
    until("the " + role + " “" + name + "”", [&] {
        found = look(role, name);
        return found.has_value();
    });
    return *found;
}

void Visitor::seesNo(const std::string& role, const std::string& name) const {
    until("the " + role + " “" + name + "” to go", [&] { return scope() && !look(role, name); });
}

std::string Visitor::reads(const std::string& part) const {
    std::string whole;
    until("the words “" + part + "”", [&] {
        const std::optional<Accessible> place = scope();
        return place && place->find([&](const Accessible& each) {
            for (const std::string& words : {each.name(), each.text()})
                if (words.find(part) != std::string::npos) {
                    whole = words;
                    return true;
                }
            return false;
        });
    });
    return whole;
}

std::vector<std::string> Visitor::rows() const {
    std::vector<std::string> names;
    if (const std::optional<Accessible> place = scope())
        place->find([&](const Accessible& each) {
            if (each.role() == "list item")
                names.push_back(each.name());
            return false;
        });
    return names;
}

void Visitor::press(const std::string& role, const std::string& name) const {
    until("the " + role + " “" + name + "” that can be pressed", [&] {
        const std::optional<Accessible> found = look(role, name);
        return found && found->has(Has::sensitivity) && found->act(pressAction);
    });
}

void Visitor::goBack() const {
    until("the way back", [&] {
        const std::optional<Accessible> place = scope();
        const auto back = place ? place->find([](const Accessible& each) {
            return each.role() == "push button" && each.name().starts_with("Back");
        })
                                : std::nullopt;
        return back && back->has(Has::sensitivity) && back->act(pressAction);
    });
}

void Visitor::choose(const std::string& action, const std::string& rowName) const {
    until("the action “" + action + "” of “" + rowName + "”", [&] {
        const std::optional<Accessible> found = look("list item", rowName);
        return found && found->has(Has::sensitivity) && found->act(action);
    });
}

void Visitor::select(const std::vector<std::string>& names) const {
    for (const std::string& name : names) {
        open(name);
        until("“" + name + "” to be selected", [&] {
            const std::optional<Accessible> found = look("list item", name);
            return found && found->has(Has::selection);
        });
    }
}

void Visitor::type(const std::string& text) const {
    until("a field that takes “" + text + "”", [&] {
        const std::optional<Accessible> place = scope();
        const auto field = place ? place->find([](const Accessible& each) {
            return each.role() == "text" || each.role() == "entry";
        })
                                 : std::nullopt;
        return field && field->setText(text) && field->text() == text;
    });
}

std::string Visitor::tree() const {
    const std::optional<Accessible> whole = application();
    return whole ? whole->picture() : "The program is not on the accessibility bus.\n";
}

} // namespace test
