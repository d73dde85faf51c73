#include "platform/documents/preview/PreviewKinds.h"

#include <array>

namespace platform {
namespace {

/// The first that fits is taken: special kinds before general ones.
constexpr std::array kinds{
    &archivePreview, //
    &packagePreview, //
    &pdfPreview,     //
    &imagePreview,   //
    &tablePreview,   //
    &sourcePreview,  //
    &textPreview,    //
};

} // namespace

const PreviewKind* previewKindFor(std::string_view typeIdentifier) {
    for (const PreviewKind* const kind : kinds)
        if (kind->shows(typeIdentifier))
            return kind;
    return nullptr;
}

} // namespace platform
