#include "platform/ui/Font.h"

#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/Settings.h"
#include "platform/ui/qt/TextMetrics.h"

#include <QFontDatabase>
#include <QFontMetricsF>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

QStringList chosenFamilies;

} // namespace

Font Font::preferred(TextStyle style) {
    const Theme::TextShape shape = Theme::shapeOf(style);
    return {style, shape.points, shape.weight};
}

Font Font::withSize(TextStyle style, double points) {
    return {style, points, Theme::shapeOf(style).weight};
}

double Font::pointSize() const {
    return points_ * textScale();
}

double Font::lineHeight() const {
    return lineMetrics(*this).height;
}

double Font::ascender() const {
    return lineMetrics(*this).ascent;
}

double Font::descender() const {
    return -lineMetrics(*this).descent;
}

double Font::capHeight() const {
    return QFontMetricsF(toQt(*this)).capHeight();
}

double Font::width(std::string_view text) const {
    return QFontMetricsF(toQt(*this)).horizontalAdvance(toQt(text));
}

LineMetrics lineMetrics(const Font& font) {
    const QFontMetricsF natural(toQt(font));
    const double height = std::round(font.pointSize() * Theme::lineHeightFactor);
    const double leading = height - natural.ascent() - natural.descent();
    const double ascent = std::round(natural.ascent() + leading / 2);
    return {height, ascent, height - ascent};
}

const QStringList& fontFamilies() {
    if (chosenFamilies.isEmpty())
        chooseFontFamilies();
    return chosenFamilies;
}

void chooseFontFamilies() {
    const QStringList installed = QFontDatabase::families();
    chosenFamilies.clear();
    for (const char* const wanted : {"Inter", "Noto Sans"})
        if (installed.contains(QLatin1String(wanted)))
            chosenFamilies.append(QLatin1String(wanted));
    // Last, and first where neither is there: what the system takes for its own texts.
    chosenFamilies.append(QFontDatabase::systemFont(QFontDatabase::GeneralFont).family());
}

QFont toQt(const Font& font) {
    QFont result;
    result.setFamilies(fontFamilies());
    result.setPixelSize(std::max(1, static_cast<int>(std::lround(font.pointSize()))));
    result.setWeight(static_cast<QFont::Weight>(font.weight()));
    // Unhinted advances grow evenly, so a text that fits at one scale fits at every scale.
    result.setHintingPreference(QFont::PreferNoHinting);
    return result;
}

} // namespace platform
