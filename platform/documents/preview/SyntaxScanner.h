#pragma once

#include "platform/documents/preview/SyntaxLanguage.h"

#include <QStringView>

#include <cstdint>
#include <vector>

namespace platform {

enum class SyntaxKind : std::uint8_t {
    comment,
    string,
    keyword,
    number,
    /// Of a value, a tag, an attribute.
    name,
    /// What is not for the language itself: preprocessor lines, declarations of markup.
    directive
};

struct SyntaxSpan {
    int start = 0;
    int length = 0;
    SyntaxKind kind = SyntaxKind::comment;
    bool operator==(const SyntaxSpan&) const = default;
};

/// What a line begins in, because an earlier one opened it; 0 in nothing.
using SyntaxState = std::uint8_t;

/// What is to be coloured in a line (or a piece of one), in its order. `state` is what the line
/// begins in and, afterwards, what the next one does. Takes time in proportion to the line alone.
std::vector<SyntaxSpan> scanSyntax(const SyntaxLanguage& language, QStringView line,
                                   SyntaxState& state);

} // namespace platform
