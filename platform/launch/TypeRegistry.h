#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// Identifiers of the type system's roots and families, in reverse-domain form.
namespace types {
inline constexpr std::string_view data = "public.data";
inline constexpr std::string_view content = "public.content";
inline constexpr std::string_view item = "public.item";
inline constexpr std::string_view folder = "public.folder";
inline constexpr std::string_view directory = "public.directory";
inline constexpr std::string_view package = "public.package";
inline constexpr std::string_view text = "public.text";
inline constexpr std::string_view plainText = "public.plain-text";
inline constexpr std::string_view image = "public.image";
inline constexpr std::string_view movie = "public.movie";
inline constexpr std::string_view audio = "public.audio";
inline constexpr std::string_view audiovisual = "public.audiovisual-content";
inline constexpr std::string_view archive = "public.archive";
inline constexpr std::string_view compositeContent = "public.composite-content";
inline constexpr std::string_view pdf = "public.pdf";
inline constexpr std::string_view svg = "public.svg-image";
inline constexpr std::string_view html = "public.html";
inline constexpr std::string_view sourceCode = "public.source-code";
inline constexpr std::string_view csv = "public.comma-separated-values-text";
inline constexpr std::string_view markdown = "public.markdown";
} // namespace types

/// The type system, over the desktop's shared MIME database: every type is an identifier in
/// reverse-domain form; families conform to one another. The well-known have names of their own
/// ("public.png"), the others "org.freedesktop.mime." with the MIME type's two parts. By name
/// alone, so that a promised file has its type without its content. A type that is merely stored in
/// an archive's format (a text document, a book) is no archive. Safe from any thread.
class TypeRegistry {
public:
    /// The identifier for a file-name extension (without its dot, any letter case). An extension
    /// that nobody knows gets a made-up one ("dyn.EXT") that conforms to public.data; none for "".
    static std::optional<std::string> preferredIdentifierForExtension(std::string_view extension);
    /// By the whole file name (for names such as "Makefile" or "x.tar.gz"). A package's name
    /// answers the package's type; one that nobody knows is as its extension says, or public.data.
    static std::string identifierForFileName(std::string_view name);
    /// By what stands there: a file's name, then its content's first bytes; folders by their names.
    static std::string identifierForFile(std::string_view path);
    static std::string identifierForMimeType(std::string_view mimeType);
    /// "application/octet-stream" when there is none.
    static std::string mimeTypeForIdentifier(std::string_view identifier);

    /// True when `identifier` is `family` or below it.
    static bool conformsTo(std::string_view identifier, std::string_view family);
    /// In the user's language ("PDF document"); none when the type system has no words for it.
    static std::optional<std::string> localizedDescription(std::string_view identifier);
    /// Whether a folder of that name is shown as one document.
    static bool isPackageName(std::string_view name);
    /// The names under which icon themes draw the type, best first.
    static std::vector<std::string> iconNames(std::string_view identifier);
};

} // namespace platform
