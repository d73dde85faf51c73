#include "platform/launch/ExecLine.h"

#include "platform/launch/DesktopEntry.h"

#include <algorithm>

namespace platform {
namespace {

constexpr std::string_view documentFields = "fFuU";
/// Known of old, and nothing is written for them any more.
constexpr std::string_view formerFields = "dDnNvm";
constexpr std::string_view otherFields = "ick%";

bool contains(std::string_view set, char letter) {
    return set.find(letter) != std::string_view::npos;
}

/// Reads the words of a line one after the other.
class WordReader {
public:
    explicit WordReader(std::string_view line) : line_(line) {}

    /// None when a quotation does not end.
    std::optional<std::vector<std::string>> words() {
        while (at_ < line_.size()) {
            const char letter = line_[at_++];
            if (contains(" \t\n", letter))
                finish();
            else if (letter == '"' || letter == '\'') {
                if (!readQuoted(letter))
                    return std::nullopt;
            } else if (letter == '\\' && at_ < line_.size())
                add(line_[at_++]);
            else
                add(letter);
        }
        finish();
        return std::move(words_);
    }

private:
    bool readQuoted(char quote) {
        started_ = true;
        while (at_ < line_.size()) {
            const char letter = line_[at_++];
            if (letter == quote)
                return true;
            const bool escapes = quote == '"' && letter == '\\' && at_ < line_.size() &&
                                 contains("\"`$\\", line_[at_]);
            add(escapes ? line_[at_++] : letter);
        }
        return false;
    }
    void add(char letter) {
        started_ = true;
        word_ += letter;
    }
    void finish() {
        if (started_)
            words_.push_back(std::move(word_));
        word_.clear();
        started_ = false;
    }

    std::string_view line_;
    std::size_t at_ = 0;
    std::string word_;
    bool started_ = false;
    std::vector<std::string> words_;
};

bool fieldsAreKnown(std::string_view word) {
    for (std::size_t i = 0; i < word.size(); ++i) {
        if (word[i] != '%')
            continue;
        if (++i >= word.size() ||
            !(contains(documentFields, word[i]) || contains(formerFields, word[i]) ||
              contains(otherFields, word[i])))
            return false;
    }
    return true;
}

/// What stands for one field inside a word.
std::string fieldText(char field, const DesktopEntry& entry,
                      const std::optional<ExecTarget>& document) {
    switch (field) {
    case '%':
        return "%";
    case 'c':
        return entry.localizedName;
    case 'k':
        return entry.path;
    case 'f':
    case 'F':
        return document ? document->path : "";
    case 'u':
    case 'U':
        return document ? document->address : "";
    default:
        return {};
    }
}

std::string filled(const std::string& word, const DesktopEntry& entry,
                   const std::optional<ExecTarget>& document) {
    std::string out;
    for (std::size_t i = 0; i < word.size(); ++i) {
        if (word[i] == '%')
            out += fieldText(word[++i], entry, document);
        else
            out += word[i];
    }
    return out;
}

} // namespace

std::optional<ExecLine> ExecLine::parse(std::string_view line) {
    std::optional<std::vector<std::string>> words = WordReader(line).words();
    if (!words || words->empty() || words->front().empty() ||
        !std::ranges::all_of(*words, fieldsAreKnown))
        return std::nullopt;
    ExecLine exec;
    exec.words_ = *std::move(words);
    return exec;
}

bool ExecLine::takesDocument() const {
    return std::ranges::any_of(words_, [](const std::string& word) {
        for (std::size_t i = 0; i + 1 < word.size(); ++i)
            if (word[i] == '%' && contains(documentFields, word[++i]))
                return true;
        return false;
    });
}

std::vector<std::string> ExecLine::arguments(const DesktopEntry& entry,
                                             const std::optional<ExecTarget>& document) const {
    std::vector<std::string> out;
    for (const std::string& word : words_) {
        if (word == "%i") {
            if (!entry.icon.empty())
                out.insert(out.end(), {"--icon", entry.icon});
            continue;
        }
        std::string text = filled(word, entry, document);
        // A field for which there is nothing leaves no empty argument behind.
        if (!text.empty() || word.empty() || word.front() != '%')
            out.push_back(std::move(text));
    }
    if (document && !takesDocument())
        out.push_back(document->isFile ? document->path : document->address);
    return out;
}

} // namespace platform
