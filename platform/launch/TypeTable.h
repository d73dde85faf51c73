#pragma once

#include <span>
#include <string_view>

namespace platform {

/// What the type system knows of its own, beside the desktop's MIME database. Constant data.

/// A type that has an identifier of its own in place of the systematic one.
struct NamedType {
    std::string_view identifier;
    /// The MIME database's canonical name.
    std::string_view mimeType;
};
std::span<const NamedType> namedTypes();

/// "`identifier` is a `parent`": the families, and the types that the MIME database places wrongly
/// or not at all (what it says of their parents does not count then).
struct TypeParent {
    std::string_view identifier;
    std::string_view parent;
};
std::span<const TypeParent> typeParents();

/// A folder whose name ends so is shown as one document.
struct PackageType {
    std::string_view extension;
    std::string_view identifier;
};
std::span<const PackageType> packageTypes();

/// English words of the types that only we know, as keys of the text table.
struct TypeWords {
    std::string_view identifier;
    std::string_view words;
};
std::span<const TypeWords> typeWords();

/// MIME types of program text that the database knows as text only.
bool isSourceCodeMimeType(std::string_view mimeType);

} // namespace platform
