#include "platform/launch/TypeNameRules.h"

#include <QFile>
#include <QStandardPaths>
#include <algorithm>
#include <fnmatch.h>
#include <fstream>

namespace platform {

std::string lowercase(std::string_view text) {
    std::string out(text);
    for (char& c : out)
        if (c >= 'A' && c <= 'Z')
            c = static_cast<char>(c - 'A' + 'a');
    return out;
}

const TypeNameRules& TypeNameRules::shared() {
    static const TypeNameRules rules;
    return rules;
}

TypeNameRules::TypeNameRules() {
    const QStringList files = QStandardPaths::locateAll(QStandardPaths::GenericDataLocation,
                                                        QStringLiteral("mime/globs2"));
    for (const QString& file : files)
        readPatterns(QFile::encodeName(file).toStdString());
}

/// Lines of weight, type, pattern and flags, with colons between.
void TypeNameRules::readPatterns(const std::string& path) {
    std::ifstream file(path);
    for (std::string line; std::getline(file, line);) {
        if (line.starts_with('#'))
            continue;
        const std::size_t type = line.find(':');
        const std::size_t start = line.find(':', type + 1);
        if (type == std::string::npos || start == std::string::npos)
            continue;
        known_ = true;
        const std::string pattern =
            lowercase(line.substr(start + 1, line.find(':', start + 1) - start - 1));
        const bool plainEnd =
            pattern.starts_with("*.") && pattern.find_first_of("*?[", 1) == std::string::npos;
        if (plainEnd && pattern.find('.', 2) != std::string::npos)
            longEnds_.insert(pattern.substr(1));
        else if (pattern.find_first_of("*?[") == std::string::npos)
            wholeNames_.insert(pattern);
        else if (!plainEnd)
            otherPatterns_.push_back(pattern);
    }
}

std::optional<std::string_view> TypeNameRules::decidingEnd(std::string_view name) const {
    const std::string lower = lowercase(name);
    if (!known_ || wholeNames_.contains(lower) ||
        std::any_of(otherPatterns_.begin(), otherPatterns_.end(), [&](const std::string& pattern) {
            return ::fnmatch(pattern.c_str(), lower.c_str(), 0) == 0;
        }))
        return std::nullopt;
    const std::size_t last = lower.rfind('.');
    if (last == std::string::npos)
        return std::string_view();
    for (std::size_t dot = lower.find('.'); dot < last; dot = lower.find('.', dot + 1))
        if (longEnds_.contains(lower.substr(dot)))
            return name.substr(dot);
    return name.substr(last);
}

} // namespace platform
