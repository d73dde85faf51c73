#include "platform/ui/Direction.h"

#include "platform/ui/Application.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Settings.h"

namespace platform {

Rect mirrored(Rect rect, double containerWidth) {
    if (isRightToLeft())
        rect.x = containerWidth - rect.maxX();
    return rect;
}

double pageMargin() {
    return Application::shared().idiom() == DeviceIdiom::tablet ? Theme::tabletMargin
                                                                : Theme::phoneMargin;
}

double readingSign() {
    return isRightToLeft() ? -1 : 1;
}

} // namespace platform
