#include "platform/documents/list/RowStyle.h"

#include "platform/ui/Application.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

/// Between the lines of a row's text, and above and below them.
constexpr double linePadding = 10;

bool isPhone() {
    return Application::shared().idiom() == DeviceIdiom::phone;
}

} // namespace

RowStyle RowStyle::current() {
    const Font nameFont = Font::preferred(TextStyle::body);
    const Font detailsFont = Font::preferred(TextStyle::footnote);
    RowStyle style;
    style.name = toQt(nameFont);
    style.details = toQt(detailsFont);
    style.nameHeight = nameFont.lineHeight();
    style.nameAscent = nameFont.ascender();
    style.detailsHeight = detailsFont.lineHeight();
    style.detailsAscent = detailsFont.ascender();
    const double text = std::ceil(style.nameHeight + style.detailsHeight) + 2 * linePadding;
    style.rowHeight = std::max(Theme::rowHeight, text);
    style.containerHeight = std::max(Theme::containerRowHeight, text);
    style.margin = isPhone() ? Theme::phoneMargin : Theme::tabletMargin;
    style.alwaysShowsMore = isPhone();
    style.rightToLeft = readingSign() < 0;
    style.textScale = Application::shared().textScale();
    return style;
}

bool RowStyle::isCurrent() const {
    return textScale == Application::shared().textScale() && rightToLeft == (readingSign() < 0) &&
           alwaysShowsMore == isPhone();
}

} // namespace platform
