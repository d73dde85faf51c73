#include "tests/acceptance/Accessible.h"

#include <QDBusArgument>
#include <QDBusMessage>
#include <QDBusObjectPath>
#include <QDBusVariant>

#include <utility>

namespace test {
namespace {

constexpr const char* accessibleInterface = "org.a11y.atspi.Accessible";
constexpr const char* actionInterface = "org.a11y.atspi.Action";
constexpr const char* textInterface = "org.a11y.atspi.Text";
constexpr const char* editableInterface = "org.a11y.atspi.EditableText";
constexpr const char* componentInterface = "org.a11y.atspi.Component";

/// A program that does not answer for that long hangs.
constexpr int answerTime = 10'000; // milliseconds
constexpr int deepest = 60;

bool isTrue(const QVariantList& answer) {
    return !answer.isEmpty() && answer.front().toBool();
}

} // namespace

Accessible::Accessible(QDBusConnection bus, QString program, QString path)
    : bus_(std::move(bus)), program_(std::move(program)), path_(std::move(path)) {
}

QVariantList Accessible::call(const char* interface, const char* method,
                              const QVariantList& arguments) const {
    QDBusMessage message = QDBusMessage::createMethodCall(
        program_, path_, QString::fromLatin1(interface), QString::fromLatin1(method));
    message.setArguments(arguments);
    const QDBusMessage answer = bus_.call(message, QDBus::Block, answerTime);
    return answer.type() == QDBusMessage::ReplyMessage ? answer.arguments() : QVariantList();
}

QVariant Accessible::property(const char* name) const {
    const QVariantList answer =
        call("org.freedesktop.DBus.Properties", "Get",
             {QString::fromLatin1(accessibleInterface), QString::fromLatin1(name)});
    return answer.isEmpty() ? QVariant() : answer.front().value<QDBusVariant>().variant();
}

std::string Accessible::role() const {
    const QVariantList answer = call(accessibleInterface, "GetRoleName");
    return answer.isEmpty() ? std::string() : answer.front().toString().toStdString();
}

std::string Accessible::name() const {
    return property("Name").toString().toStdString();
}

std::string Accessible::description() const {
    return property("Description").toString().toStdString();
}

std::uint64_t Accessible::states() const {
    const QVariantList answer = call(accessibleInterface, "GetState");
    if (answer.isEmpty())
        return 0;
    const auto words = qdbus_cast<QList<std::uint32_t>>(answer.front());
    return words.size() < 2 ? 0 : words[0] | static_cast<std::uint64_t>(words[1]) << 32;
}

bool Accessible::has(Has state) const {
    return (states() >> static_cast<std::uint32_t>(state) & 1) != 0;
}

std::vector<Accessible> Accessible::children() const {
    std::vector<Accessible> found;
    const QVariantList answer = call(accessibleInterface, "GetChildren");
    if (answer.isEmpty())
        return found;
    const auto list = answer.front().value<QDBusArgument>();
    list.beginArray();
    while (!list.atEnd()) {
        QString program;
        QDBusObjectPath path;
        list.beginStructure();
        list >> program >> path;
        list.endStructure();
        found.emplace_back(bus_, program, path.path());
    }
    list.endArray();
    return found;
}

std::vector<std::string> Accessible::actions() const {
    std::vector<std::string> names;
    for (;;) {
        const QVariantList answer =
            call(actionInterface, "GetName", {static_cast<int>(names.size())});
        if (answer.isEmpty() || answer.front().toString().isEmpty())
            return names;
        names.push_back(answer.front().toString().toStdString());
    }
}

bool Accessible::act(const std::string& action) const {
    const std::vector<std::string> names = actions();
    for (std::size_t i = 0; i < names.size(); ++i)
        if (names[i] == action)
            return isTrue(call(actionInterface, "DoAction", {static_cast<int>(i)}));
    return false;
}

std::string Accessible::text() const {
    const QVariantList answer = call(textInterface, "GetText", {0, -1});
    return answer.isEmpty() ? std::string() : answer.front().toString().toStdString();
}

bool Accessible::setText(const std::string& text) const {
    return isTrue(call(editableInterface, "SetTextContents", {QString::fromStdString(text)}));
}

bool Accessible::takeFocus() const {
    return isTrue(call(componentInterface, "GrabFocus"));
}

std::optional<Accessible>
Accessible::find(const std::function<bool(const Accessible&)>& passes) const {
    for (const Accessible& child : children()) {
        if (!child.has(Has::showing) && child.role() != "list item")
            continue;
        if (passes(child))
            return child;
        if (const auto found = child.find(passes))
            return found;
    }
    return std::nullopt;
}

std::string Accessible::picture(int depth) const {
    if (depth > deepest)
        return {};
    std::string line(static_cast<std::size_t>(depth) * 2, ' ');
    line += role() + " “" + name() + "”";
    if (const std::string more = description(); !more.empty())
        line += " (" + more + ")";
    for (const auto& [state, word] :
         {std::pair(Has::modality, "modal"), {Has::focus, "focused"}, {Has::selection, "selected"}})
        if (has(state))
            line += std::string(" ") + word;
    line += has(Has::sensitivity) ? "" : " disabled";
    line += has(Has::showing) ? "" : " hidden";
    for (const std::string& action : actions())
        line += " <" + action + ">";
    line += '\n';
    for (const Accessible& child : children())
        line += child.picture(depth + 1);
    return line;
}

} // namespace test
