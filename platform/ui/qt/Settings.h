#pragma once

namespace platform {

/// What the running application says of how to show things; the designed values while there is no
/// application. For sources of the toolkit, which may run before and after it.
bool reducesMotion();
bool isRightToLeft();
double textScale();
/// The pointer is one that can stand over a thing without pressing it; a finger is not.
bool pointerHovers();
/// The keyboard was used last, so the focus must be seen.
bool showsKeyboardFocus();

} // namespace platform
