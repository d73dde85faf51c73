#pragma once

#include "platform/documents/preview/TextFile.h"

#include <cstdint>
#include <map>
#include <vector>

namespace platform {

/// Knows for the lines of a program text which number they have and what they begin in, wherever
/// one looks first. Belongs to the queue of its file, which outlives it.
class SourceIndex {
public:
    SourceIndex(const TextFile& file, const SyntaxLanguage& language);

    /// Fills in numbers and colours of lines that the file gave, joined and in their order.
    void describe(std::vector<TextLine>& lines);

private:
    /// What is known of the place between two lines, or two pieces of one.
    struct Place {
        /// Of the line that begins here; 0 when it was not counted.
        std::uint64_t number = 1;
        SyntaxState state = 0;
        bool withinLine = false;
    };

    Place placeAt(std::uint64_t offset);
    Place afterJump(std::uint64_t from, std::uint64_t to, const Place& start) const;
    /// Over the line; answers its spans.
    std::vector<SyntaxSpan> pass(const TextLine& line, Place& place) const;

    const TextFile& file_;
    const SyntaxLanguage& language_;
    /// By offset; a place for each window that was read.
    std::map<std::uint64_t, Place> places_;
};

} // namespace platform
