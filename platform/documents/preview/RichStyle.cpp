#include "platform/documents/preview/RichStyle.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"

#include <cmath>

namespace platform {

int richLetterSize(TextStyle style, double scale) {
    return static_cast<int>(std::lround(Font::preferred(style).pointSize() * scale));
}

QString richStyleSheet(double scale) {
    const auto size = [scale](TextStyle style, double factor = 1) {
        return richLetterSize(style, scale * factor);
    };
    return QStringLiteral(
               "body{color:%1} p,li,dd,dt{line-height:135%} "
               "p{margin-top:0;margin-bottom:%2px}"
               "h1{font-size:%3px;font-weight:600;margin-top:%2px;margin-bottom:%2px}"
               "h2{font-size:%4px;font-weight:600;margin-top:%5px;margin-bottom:%2px}"
               "h3{font-size:%6px;font-weight:600;margin-top:%5px;margin-bottom:%7px}"
               "h4,h5,h6{font-size:%8px;font-weight:600;margin-top:%5px;margin-bottom:%7px}"
               "ul,ol{margin-top:0;margin-bottom:%2px} li{margin-bottom:%7px}"
               "a{color:%9;text-decoration:none}")
               .arg(toQt(Theme::text).name())
               .arg(size(TextStyle::body, 0.65))
               .arg(size(TextStyle::title2, 1.1))
               .arg(size(TextStyle::title2, 0.9))
               .arg(size(TextStyle::body, 1.2))
               .arg(size(TextStyle::headline, 1.05))
               .arg(size(TextStyle::body, 0.3))
               .arg(size(TextStyle::subheadline))
               .arg(toQt(Theme::accent).name()) +
           QStringLiteral("code{font-family:monospace;font-size:%1px;background-color:%2}"
                          "pre{font-family:monospace;font-size:%1px;white-space:pre-wrap;"
                          "line-height:130%;margin-top:0;margin-bottom:0}"
                          "blockquote{color:%3;margin-left:%4px;margin-right:%4px;"
                          "margin-top:0;margin-bottom:0}"
                          "th{font-weight:600;background-color:%2}"
                          "table{margin-top:4px;margin-bottom:12px}"
                          "table.grid{border-collapse:collapse;border-color:%5;border-style:solid}"
                          "table.code{background-color:%2;border-style:none}")
               .arg(size(TextStyle::footnote))
               .arg(toQt(Theme::bar).name(), toQt(Theme::secondaryText).name())
               .arg(size(TextStyle::body))
               .arg(toQt(Theme::hairline).name());
}

} // namespace platform
