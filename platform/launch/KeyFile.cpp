#include "platform/launch/KeyFile.h"

namespace platform {
namespace {

constexpr std::string_view blanks = " \t\r";

std::string_view trimmed(std::string_view text) {
    const std::size_t first = text.find_first_not_of(blanks);
    if (first == std::string_view::npos)
        return {};
    return text.substr(first, text.find_last_not_of(blanks) - first + 1);
}

/// The character that a backslash and this one stand for.
char escaped(char letter) {
    switch (letter) {
    case 's':
        return ' ';
    case 'n':
        return '\n';
    case 't':
        return '\t';
    case 'r':
        return '\r';
    default:
        return letter; // "\\", and "\;" in a list
    }
}

bool isKnownEscape(char letter, bool inList) {
    return std::string_view("sntr\\").find(letter) != std::string_view::npos ||
           (inList && letter == ';');
}

} // namespace

KeyFile KeyFile::parse(std::string_view text) {
    KeyFile file;
    Group* current = nullptr;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find('\n'), text.size());
        const std::string_view line = trimmed(text.substr(0, end));
        text.remove_prefix(std::min(end + 1, text.size()));
        if (line.empty() || line.front() == '#')
            continue;
        if (line.front() == '[') {
            const std::size_t close = line.find(']');
            current = close == std::string_view::npos
                          ? nullptr
                          : &file.groups_[std::string(line.substr(1, close - 1))];
            continue;
        }
        const std::size_t equals = line.find('=');
        if (!current || equals == std::string_view::npos)
            continue;
        current->insert_or_assign(std::string(trimmed(line.substr(0, equals))),
                                  std::string(trimmed(line.substr(equals + 1))));
    }
    return file;
}

const KeyFile::Group* KeyFile::group(std::string_view name) const {
    const auto found = groups_.find(name);
    return found == groups_.end() ? nullptr : &found->second;
}

std::optional<std::string> KeyFile::text(const Group& group, std::string_view key) {
    const auto found = group.find(key);
    if (found == group.end())
        return std::nullopt;
    const std::string& raw = found->second;
    std::string out;
    for (std::size_t i = 0; i < raw.size(); ++i) {
        if (raw[i] == '\\' && i + 1 < raw.size() && isKnownEscape(raw[i + 1], false))
            out += escaped(raw[++i]);
        else
            out += raw[i];
    }
    return out;
}

std::optional<std::string> KeyFile::localizedText(const Group& group, const std::string& key,
                                                  const std::vector<std::string>& locales) {
    for (const std::string& locale : locales)
        if (auto found = text(group, key + '[' + locale + ']'); found && !found->empty())
            return found;
    return text(group, key);
}

bool KeyFile::flag(const Group& group, std::string_view key) {
    const auto found = group.find(key);
    return found != group.end() && (found->second == "true" || found->second == "1");
}

std::vector<std::string> KeyFile::list(const Group& group, std::string_view key) {
    std::vector<std::string> parts;
    const auto found = group.find(key);
    if (found == group.end())
        return parts;
    const std::string& raw = found->second;
    std::string part;
    const auto finish = [&] {
        if (const std::string_view whole = trimmed(part); !whole.empty())
            parts.emplace_back(whole);
        part.clear();
    };
    for (std::size_t i = 0; i < raw.size(); ++i) {
        if (raw[i] == ';')
            finish();
        else if (raw[i] == '\\' && i + 1 < raw.size() && isKnownEscape(raw[i + 1], true))
            part += escaped(raw[++i]);
        else
            part += raw[i];
    }
    finish();
    return parts;
}

std::vector<std::string> localeNames(std::string_view locale) {
    const std::size_t at = locale.find('@');
    const std::string modifier(at == std::string_view::npos ? "" : locale.substr(at));
    const std::string_view plain = locale.substr(0, locale.find_first_of(".@"));
    if (plain.empty() || plain == "C" || plain == "POSIX")
        return {};
    const std::string whole(plain);
    const std::string language(plain.substr(0, plain.find('_')));
    std::vector<std::string> names;
    if (!modifier.empty() && whole != language)
        names.push_back(whole + modifier);
    if (whole != language)
        names.push_back(whole);
    if (!modifier.empty())
        names.push_back(language + modifier);
    names.push_back(language);
    return names;
}

} // namespace platform
