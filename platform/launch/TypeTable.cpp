#include "platform/launch/TypeTable.h"

#include <algorithm>
#include <array>

namespace platform {
namespace {

constexpr NamedType named[] = {
    {"public.data", "application/octet-stream"},
    {"public.folder", "inode/directory"},
    // text
    {"public.plain-text", "text/plain"},
    {"public.rtf", "application/rtf"},
    {"public.html", "text/html"},
    {"public.xhtml", "application/xhtml+xml"},
    {"public.xml", "application/xml"},
    {"public.json", "application/json"},
    {"public.yaml", "application/x-yaml"},
    {"public.comma-separated-values-text", "text/csv"},
    {"public.tab-separated-values-text", "text/tab-separated-values"},
    {"public.markdown", "text/markdown"},
    {"public.css", "text/css"},
    {"public.log", "text/x-log"},
    {"public.vcard", "text/vcard"},
    {"public.calendar-event", "text/calendar"},
    {"public.email-message", "message/rfc822"},
    // program text
    {"public.c-source", "text/x-csrc"},
    {"public.c-header", "text/x-chdr"},
    {"public.c-plus-plus-source", "text/x-c++src"},
    {"public.c-plus-plus-header", "text/x-c++hdr"},
    {"public.javascript", "application/javascript"},
    {"public.java-source", "text/x-java"},
    {"public.python-script", "text/x-python"},
    {"public.perl-script", "application/x-perl"},
    {"public.ruby-script", "application/x-ruby"},
    {"public.php-script", "application/x-php"},
    {"public.shell-script", "application/x-shellscript"},
    {"public.make-source", "text/x-makefile"},
    {"public.rust-source", "text/rust"},
    // images
    {"public.png", "image/png"},
    {"public.jpeg", "image/jpeg"},
    {"public.jpeg-2000", "image/jp2"},
    {"public.gif", "image/gif"},
    {"public.tiff", "image/tiff"},
    {"public.bmp", "image/bmp"},
    {"public.webp", "image/webp"},
    {"public.heif", "image/heif"},
    {"public.avif", "image/avif"},
    {"public.svg-image", "image/svg+xml"},
    // sound and pictures that move
    {"public.mp3", "audio/mpeg"},
    {"public.mpeg-4-audio", "audio/mp4"},
    {"public.aac-audio", "audio/aac"},
    {"public.flac-audio", "audio/flac"},
    {"public.ogg-audio", "audio/ogg"},
    {"public.wave-audio", "audio/x-wav"},
    {"public.aiff-audio", "audio/x-aiff"},
    {"public.midi-audio", "audio/midi"},
    {"public.mpeg-4", "video/mp4"},
    {"public.mpeg", "video/mpeg"},
    {"public.mpeg-2-transport-stream", "video/mp2t"},
    {"public.3gpp", "video/3gpp"},
    {"public.3gpp2", "video/3gpp2"},
    {"public.avi", "video/x-msvideo"},
    {"public.ogg-movie", "video/ogg"},
    {"public.webm", "video/webm"},
    {"public.matroska", "video/x-matroska"},
    // documents
    {"public.pdf", "application/pdf"},
    {"public.postscript", "application/postscript"},
    {"public.epub", "application/epub+zip"},
    {"public.open-document-text", "application/vnd.oasis.opendocument.text"},
    {"public.open-document-spreadsheet", "application/vnd.oasis.opendocument.spreadsheet"},
    {"public.open-document-presentation", "application/vnd.oasis.opendocument.presentation"},
    {"public.open-document-graphics", "application/vnd.oasis.opendocument.graphics"},
    {"public.office-open-xml-text",
     "application/vnd.openxmlformats-officedocument.wordprocessingml.document"},
    {"public.office-open-xml-spreadsheet",
     "application/vnd.openxmlformats-officedocument.spreadsheetml.sheet"},
    {"public.office-open-xml-presentation",
     "application/vnd.openxmlformats-officedocument.presentationml.presentation"},
    // archives
    {"public.zip-archive", "application/zip"},
    {"public.tar-archive", "application/x-tar"},
    {"public.gzip-archive", "application/gzip"},
    {"public.gzip-tar-archive", "application/x-compressed-tar"},
    {"public.bzip2-archive", "application/x-bzip"},
    {"public.xz-archive", "application/x-xz"},
    {"public.zstandard-archive", "application/zstd"},
    {"public.7z-archive", "application/x-7z-compressed"},
    {"public.disk-image", "application/x-cd-image"},
    // fonts
    {"public.truetype-font", "font/ttf"},
    {"public.opentype-font", "font/otf"},
};

constexpr TypeParent parents[] = {
    {"public.data", "public.item"},
    {"public.directory", "public.item"},
    {"public.folder", "public.directory"},
    {"public.package", "public.directory"},
    {"public.text", "public.data"},
    {"public.text", "public.content"},
    {"public.plain-text", "public.text"},
    {"public.source-code", "public.plain-text"},
    {"public.script", "public.source-code"},
    {"public.image", "public.data"},
    {"public.image", "public.content"},
    {"public.audiovisual-content", "public.data"},
    {"public.audiovisual-content", "public.content"},
    {"public.movie", "public.audiovisual-content"},
    {"public.audio", "public.audiovisual-content"},
    {"public.archive", "public.data"},
    {"public.composite-content", "public.content"},
    {"public.font", "public.data"},
    {"public.pdf", "public.composite-content"},
    {"public.rtf", "public.text"},
    {"public.email-message", "public.text"},
    {"public.json", "public.plain-text"},
    {"public.xhtml", "public.html"},
    {"public.rtfd", "public.package"},
    {"public.rtfd", "public.composite-content"},
    {"public.bundle", "public.package"},
    {"public.generic-package", "public.package"},
    {"com.pelmora.tavrin.package", "public.package"},
    {"com.pelmora.tavrin.package", "public.composite-content"},
};

constexpr PackageType packages[] = {
    {"rtfd", "public.rtfd"},
    {"bundle", "public.bundle"},
    {"package", "public.generic-package"},
    {"tavrinpack", "com.pelmora.tavrin.package"},
};

constexpr TypeWords words[] = {
    {"public.data", "Document"},
    {"public.folder", "Folder"},
    {"public.directory", "Folder"},
    {"public.package", "Package"},
    {"public.bundle", "Package"},
    {"public.generic-package", "Package"},
    {"public.rtfd", "Rich text document with attachments"},
    {"com.pelmora.tavrin.package", "Document package"},
    {"public.text", "Text"},
    {"public.source-code", "Source code"},
    {"public.image", "Image"},
    {"public.movie", "Movie"},
    {"public.audio", "Audio"},
    {"public.audiovisual-content", "Audio or video"},
    {"public.archive", "Archive"},
    {"public.font", "Font"},
};

/// Sorted.
constexpr std::string_view sourceCode[] = {
    "text/rust",      "text/x-adasrc",  "text/x-c++hdr",     "text/x-c++src",
    "text/x-chdr",    "text/x-cmake",   "text/x-cobol",      "text/x-common-lisp",
    "text/x-crystal", "text/x-csharp",  "text/x-csrc",       "text/x-dart",
    "text/x-dsrc",    "text/x-eiffel",  "text/x-elixir",     "text/x-emacs-lisp",
    "text/x-erlang",  "text/x-fortran", "text/x-genie",      "text/x-go",
    "text/x-gradle",  "text/x-groovy",  "text/x-haskell",    "text/x-idl",
    "text/x-java",    "text/x-kotlin",  "text/x-lua",        "text/x-makefile",
    "text/x-matlab",  "text/x-meson",   "text/x-modelica",   "text/x-objc++src",
    "text/x-objcsrc", "text/x-ocaml",   "text/x-opencl-src", "text/x-pascal",
    "text/x-python",  "text/x-python3", "text/x-qml",        "text/x-scala",
    "text/x-scheme",  "text/x-svhdr",   "text/x-svsrc",      "text/x-vala",
    "text/x-verilog", "text/x-vhdl",
};

static_assert(std::is_sorted(std::begin(sourceCode), std::end(sourceCode)));

} // namespace

std::span<const NamedType> namedTypes() {
    return named;
}
std::span<const TypeParent> typeParents() {
    return parents;
}
std::span<const PackageType> packageTypes() {
    return packages;
}
std::span<const TypeWords> typeWords() {
    return words;
}

bool isSourceCodeMimeType(std::string_view mimeType) {
    return std::binary_search(std::begin(sourceCode), std::end(sourceCode), mimeType);
}

} // namespace platform
