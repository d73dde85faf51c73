#pragma once

#include "platform/base/Result.h"
#include "platform/base/Url.h"
#include "platform/documents/preview/PictureFile.h"

class QFile;

namespace platform {

class PreviewToken;

/// Draws a picture of lines and areas (SVG, packed or not) sharp enough to be enlarged, with so
/// many pixels at most, in a process of its own. Ends when nobody wants it any more; one that takes
/// too long or unpacks to too much is an error that says so. Within Work.
Result<Picture> drawVectorPicture(const Url& file, QFile& content, double mostPixels,
                                  PreviewToken& token);

} // namespace platform
