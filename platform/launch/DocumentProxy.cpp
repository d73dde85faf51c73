#include "platform/launch/DocumentProxy.h"

#include "platform/launch/DocumentIcons.h"
#include "platform/launch/TypeRegistry.h"
#include "platform/ui/Theme.h"

namespace platform {
namespace {

/// Large enough to stand alone on a screen, small enough for a phone with the details below it.
constexpr double largeDocumentIcon = 192;

double pointsOf(IconFormat format) {
    return format == IconFormat::largeDocument ? largeDocumentIcon : Theme::rowIcon;
}

} // namespace

Image DocumentProxy::icon(IconFormat format) const {
    std::string type = type_;
    if (type.empty() && mime_)
        type = TypeRegistry::identifierForMimeType(*mime_);
    if (type.empty() || type == types::data)
        type = TypeRegistry::identifierForFileName(name_);
    // What conforms to a folder but is a document of its own has the icon of its type.
    if (TypeRegistry::conformsTo(type, types::folder))
        return DocumentIcons::folder(pointsOf(format));
    return DocumentIcons::forType(type, pointsOf(format));
}

} // namespace platform
