#pragma once

#include "platform/base/Url.h"

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

struct DesktopEntry;

/// The command of a desktop entry, taken apart by the entry's own rules of quoting. No shell ever
/// sees it, so nothing in a document's name can become a command. A value.
class ExecLine {
public:
    /// None when the line is empty, a quotation does not end, or it has a field that nobody knows.
    static std::optional<ExecLine> parse(std::string_view line);

    const std::string& program() const { return words_.front(); }
    /// Whether the line says where a document belongs.
    bool takesDocument() const;
    /// The arguments, the program first. A document for which the line has no place comes last, as
    /// every desktop does it.
    std::vector<std::string> arguments(const DesktopEntry& entry,
                                       const std::optional<Url>& document) const;

private:
    std::vector<std::string> words_; // never empty
};

} // namespace platform
