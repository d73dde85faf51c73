#include "resources/Resources.h"

#include <QtCore/qglobal.h>

// The macro declares a function of the global namespace, so it stands outside ours.
static void initializeEmbeddedFiles() {
    Q_INIT_RESOURCE(tavrin);
}

namespace platform {

void initializeResources() {
    initializeEmbeddedFiles();
}

} // namespace platform
