#include "platform/documents/preview/PreviewKinds.h"

#include "platform/documents/preview/OfficeConverter.h"

#include <array>

namespace platform {
namespace {

/// The first that fits is taken: special kinds before general ones.
constexpr std::array kinds{
    &archivePreview,  //
    &packagePreview,  //
    &pdfPreview,      //
    &imagePreview,    //
    &officePreview,   //
    &mediaPreview,    //
    &tablePreview,    //
    &markdownPreview, //
    &htmlPreview,     //
    &sourcePreview,   //
    &textPreview,     //
};

} // namespace

const PreviewKind* previewKindFor(std::string_view typeIdentifier) {
    // Some are written as text that says nothing to a reader.
    if (isOfficeType(typeIdentifier) && !officePreview.shows(typeIdentifier))
        return nullptr;
    for (const PreviewKind* const kind : kinds)
        if (kind->shows(typeIdentifier))
            return kind;
    return nullptr;
}

} // namespace platform
