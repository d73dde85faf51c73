#include "tests/base/SourceKeys.h"

#include <QFile>
#include <QRegularExpression>
#include <QXmlStreamReader>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>

namespace test {
namespace {

enum class Kind { text, word, sign };
struct Token {
    Kind kind;
    std::string text;
};
using Tokens = std::vector<Token>;

/// The functions that look their first argument up.
const std::set<std::string> askers = {"localized", "localizedPlural", "localizedPluralText",
                                      "localizedFormat"};

/// Functions of one file that pass their first argument on to one of these.
const std::map<std::string, std::string> passers = {
    {"preview/FileInfoStackView.cpp", "addRow"},
    {"platform/launch/DocumentInteractionController.cpp", "failureTitle"},
};

/// Keys that reach the text table by a variable: the last literal of every `stride` ones between
/// the word `name` and the word or sign `end`.
struct KeyTable {
    const char* file;
    const char* name;
    const char* end;
    std::size_t stride;
};
constexpr KeyTable tables[] = {
    {"platform/base/ByteCount.cpp", "units", ";", 1},
    {"platform/base/Error.cpp", "textKey", "codeForErrno", 1},
    {"platform/launch/TypeTable.cpp", "words", ";", 2},
};

std::string readFile(const std::filesystem::path& path) {
    std::ifstream file(path);
    return {std::istreambuf_iterator<char>(file), {}};
}

std::string unescaped(std::string literal) {
    for (std::size_t at = 0; (at = literal.find('\\', at)) != std::string::npos; ++at)
        literal.erase(at, 1);
    return literal;
}

/// Without comments; neighbouring literals are one.
Tokens tokensOf(const std::string& source) {
    static const QRegularExpression pattern(
        QStringLiteral(R"rx(//[^\n]*|/\*[\s\S]*?\*/|R"(\w*)\([\s\S]*?\)\1"|"((?:\\.|[^"\\\n])*)")rx"
                       R"rx(|\d[\w']*|'(?:\\.|[^'\\\n])+'|(\w+)|\S)rx"));
    Tokens tokens;
    auto matches = pattern.globalMatch(QString::fromStdString(source));
    while (matches.hasNext()) {
        const QRegularExpressionMatch match = matches.next();
        const std::string whole = match.captured().toStdString();
        if (whole.starts_with("//") || whole.starts_with("/*"))
            continue;
        if (match.hasCaptured(3)) {
            tokens.push_back({Kind::word, whole});
        } else if (whole.front() != '"') {
            tokens.push_back({Kind::sign, whole});
        } else {
            const std::string text = unescaped(match.captured(2).toStdString());
            if (!tokens.empty() && tokens.back().kind == Kind::text)
                tokens.back().text += text;
            else
                tokens.push_back({Kind::text, text});
        }
    }
    return tokens;
}

/// The literals of the first argument of the call whose "(" is at `open`.
std::vector<std::string> firstArgument(const Tokens& tokens, std::size_t open) {
    std::vector<std::string> literals;
    int depth = 0;
    for (std::size_t i = open; i < tokens.size(); ++i) {
        const Token& token = tokens[i];
        if (token.kind == Kind::text)
            literals.push_back(token.text);
        if (token.kind != Kind::sign)
            continue;
        if (token.text == "(" || token.text == "{" || token.text == "[")
            ++depth;
        else if (token.text == ")" || token.text == "}" || token.text == "]")
            --depth;
        if (depth == 0 || (depth == 1 && token.text == ","))
            break;
    }
    return literals;
}

void takeCalls(const Tokens& tokens, const std::string& file, SourceKeys& keys) {
    const auto passer = passers.find(file);
    const auto asks = [&](const Token& token) {
        return token.kind == Kind::word &&
               (askers.contains(token.text) ||
                (passer != passers.end() && token.text == passer->second));
    };
    for (std::size_t i = 0; i + 1 < tokens.size(); ++i) {
        if (!asks(tokens[i]) || tokens[i + 1].text != "(")
            continue;
        const std::vector<std::string> literals = firstArgument(tokens, i + 1);
        if (literals.empty())
            keys.indirect.insert(file);
        for (const std::string& key : literals)
            keys.files.emplace(key, file);
    }
}

void takeTable(const KeyTable& table, const std::string& root, SourceKeys& keys) {
    const Tokens tokens = tokensOf(readFile(std::filesystem::path(root) / table.file));
    auto at = std::ranges::find_if(tokens, [&](const Token& token) {
        return token.kind == Kind::word && token.text == table.name;
    });
    std::size_t count = 0;
    for (; at != tokens.end() && (at->kind == Kind::text || at->text != table.end); ++at)
        if (at->kind == Kind::text && !at->text.empty() && ++count % table.stride == 0)
            keys.files.emplace(at->text, table.file);
    if (count == 0 || at == tokens.end())
        keys.lost.emplace_back(table.file);
}

} // namespace

SourceKeys readSourceKeys(const std::string& root) {
    SourceKeys keys;
    for (const char* folder :
         {"app", "browse", "items", "platform", "preview", "services", "tools"}) {
        for (const auto& each :
             std::filesystem::recursive_directory_iterator(std::filesystem::path(root) / folder)) {
            const std::filesystem::path& path = each.path();
            const std::string file = path.lexically_relative(root).string();
            if ((path.extension() == ".cpp" || path.extension() == ".h") &&
                !file.starts_with("platform/base/Text."))
                takeCalls(tokensOf(readFile(path)), file, keys);
        }
    }
    for (const KeyTable& table : tables)
        takeTable(table, root, keys);
    return keys;
}

Translations readTranslations(const std::string& file) {
    QFile opened(QString::fromStdString(file));
    if (!opened.open(QIODevice::ReadOnly))
        throw std::runtime_error("cannot read " + file);
    QXmlStreamReader reader(&opened);
    Translations translations;
    QString context;
    std::string key;
    const auto add = [&](const QString& text) {
        if (context == QLatin1String("tavrin"))
            translations[key].push_back(text.toStdString());
    };
    while (!reader.atEnd()) {
        if (reader.readNext() != QXmlStreamReader::StartElement)
            continue;
        if (reader.name() == QLatin1String("name")) {
            context = reader.readElementText();
        } else if (reader.name() == QLatin1String("source")) {
            key = reader.readElementText().toStdString();
        } else if (reader.name() == QLatin1String("numerusform")) {
            add(reader.readElementText());
        } else if (reader.name() == QLatin1String("translation") && !key.starts_with(".DICT.")) {
            add(reader.readElementText());
        }
    }
    if (reader.hasError())
        throw std::runtime_error(file + ": " + reader.errorString().toStdString());
    return translations;
}

} // namespace test
