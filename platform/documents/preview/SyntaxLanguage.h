#pragma once

#include <string_view>

namespace platform {

/// How a language of programs or data is written, as far as colours need it. Lists are separated
/// by spaces.
struct SyntaxLanguage {
    enum Trait : unsigned {
        /// Keywords in any letter case.
        ignoresCase = 1,
        /// A line that begins with # is for a preprocessor.
        preprocessor = 2,
        /// Tags with attributes between < and >.
        markup = 4,
        /// What stands before : or = names a value.
        namesValues = 8,
        /// A line begins with what happened to it: + or -.
        changes = 16,
        /// [A heading] alone on its line.
        headings = 32,
        /// A quote in a string is written twice, not behind a backslash.
        doublesQuotes = 64,
        /// # begins a comment at the start of a word only.
        wordComments = 128,
        /// $names are values.
        dollarNames = 256
    };

    /// "dyn." and an extension for those that the database does not know.
    std::string_view mimeTypes = {};
    std::string_view keywords = {};
    std::string_view lineComments = {};
    /// What opens and what closes a comment.
    std::string_view blockComment = {};
    /// Each opens and closes a string, which ends with its line.
    std::string_view quotes = {};
    /// Each opens and closes a string of any number of lines.
    std::string_view longQuotes = {};
    unsigned traits = 0;

    bool has(Trait trait) const { return (traits & trait) != 0; }
    bool isKeyword(std::string_view word) const;
};

/// The language of files of that type. One without any rules for program text that nobody knows
/// better; none for what is no program text.
const SyntaxLanguage* syntaxLanguageFor(std::string_view typeIdentifier);

} // namespace platform
