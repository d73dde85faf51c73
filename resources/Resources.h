#pragma once

namespace platform {

/// Makes the files that are built into the program (":/i18n", ":/icons") readable. May be called
/// more than once.
void initializeResources();

} // namespace platform
