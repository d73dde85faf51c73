#pragma once

#include "platform/base/Url.h"

#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace platform {

struct DesktopEntry;

/// What an application is to open.
struct ExecTarget {
    ExecTarget(const Url& document) // NOLINT: a document is one
        : address(document.absoluteString()), path(document.path()), isFile(document.isFile()) {}
    /// An address just as it was written: put together anew from its parts it may mean another
    /// place.
    explicit ExecTarget(std::string written)
        : address(std::move(written)), path(address), isFile(false) {}

    std::string address;
    std::string path;
    bool isFile;
};

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
                                       const std::optional<ExecTarget>& document) const;

private:
    std::vector<std::string> words_; // never empty
};

} // namespace platform
