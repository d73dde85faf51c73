#pragma once

#include "platform/documents/preview/PreviewRenderer.h"

namespace platform {

extern const PreviewKind htmlPreview;
extern const PreviewKind imagePreview;
extern const PreviewKind markdownPreview;
extern const PreviewKind pdfPreview;
extern const PreviewKind sourcePreview;
extern const PreviewKind tablePreview;
extern const PreviewKind textPreview;
extern const PreviewKind archivePreview;
extern const PreviewKind packagePreview;
extern const PreviewKind officePreview;
extern const PreviewKind mediaPreview;

} // namespace platform
