#include "platform/base/Text.h"

#include "resources/Resources.h"

#include <QLocale>
#include <QString>
#include <QStringList>
#include <QTranslator>
#include <array>
#include <cmath>
#include <cstdlib>
#include <memory>

namespace platform {
namespace {

/// The one context under which every text stands in the translation files.
constexpr const char* context = "tavrin";

/// Both live as long as the process: other threads may still make texts while it ends.
std::unique_ptr<QTranslator>& table() {
    static auto* const translator = new std::unique_ptr<QTranslator>();
    return *translator;
}

std::string& tableLanguage() {
    static auto* const language = new std::string("en");
    return *language;
}

std::string lookUp(std::string_view key, int count) {
    if (table()) {
        const std::string terminated(key);
        const QString found = table()->translate(context, terminated.c_str(), nullptr, count);
        if (!found.isEmpty())
            return found.toStdString();
    }
    return std::string(key);
}

/// The count by which a language chooses the form for a number that is not whole. Arabic has a form
/// of its own for these ("other", as for 100); elsewhere it is that of 2.
int countForFraction() {
    return tableLanguage() == "ar" ? 100 : 2;
}

std::string replaceAll(std::string text, std::string_view what, std::string_view with) {
    for (std::size_t at = text.find(what); at != std::string::npos;
         at = text.find(what, at + with.size()))
        text.replace(at, what.size(), with);
    return text;
}

std::unique_ptr<QTranslator> openTable(const QString& language) {
    auto translator = std::make_unique<QTranslator>();
    if (!translator->load(QStringLiteral(":/i18n/tavrin_%1.qm").arg(language)))
        return nullptr;
    return translator;
}

} // namespace

std::string systemLanguage() {
    for (const char* name : {"LC_ALL", "LC_MESSAGES", "LANG"}) {
        const char* value = std::getenv(name);
        if (!value || !*value)
            continue;
        const std::string_view text = value;
        const std::string_view plain = text.substr(0, text.find_first_of(".@"));
        return plain == "C" || plain == "POSIX" ? "en" : std::string(plain);
    }
    return "en";
}

std::string loadLocalizedTexts(std::string_view language) {
    initializeResources();
    const QString wanted =
        QString::fromUtf8(language.data(), static_cast<qsizetype>(language.size()));
    const QString code = wanted.section(QLatin1Char('_'), 0, 0).section(QLatin1Char('-'), 0, 0);
    // Numbers and dates follow the texts: a sentence in one language with the figures of another
    // reads like a fault.
    if (std::unique_ptr<QTranslator> found = openTable(code)) {
        table() = std::move(found);
        tableLanguage() = code.toStdString();
        QLocale::setDefault(QLocale(wanted));
    } else {
        table() = openTable(QStringLiteral("en"));
        tableLanguage() = "en";
        QLocale::setDefault(QLocale(QLocale::English, QLocale::UnitedStates));
    }
    return tableLanguage();
}

std::string localized(std::string_view key) {
    return lookUp(key, -1);
}

std::string localizedNumber(long long number) {
    return QLocale().toString(number).toStdString();
}

std::string localizedPlural(std::string_view key, long long count) {
    // The forms depend on the last digits and on small numbers only.
    const long long magnitude = std::llabs(count);
    const int chosen =
        static_cast<int>(magnitude > 1'000'000 ? magnitude % 1'000'000 + 1'000'000 : magnitude);
    return replaceAll(lookUp(key, chosen), "%n", localizedNumber(count));
}

std::string localizedPluralText(std::string_view key, double number, std::string_view text) {
    const bool whole = std::floor(number) == number && std::fabs(number) < 1e9;
    const int chosen = whole ? static_cast<int>(std::fabs(number)) : countForFraction();
    const std::string found = lookUp(key, chosen);
    if (found.find("%1$@") == std::string::npos && found.find("%@") == std::string::npos)
        return replaceAll(found, "%n", text);
    const std::array<FormatArgument, 1> arguments{makeFormatArgument(text)};
    return formatRuntime(found, arguments);
}

} // namespace platform
