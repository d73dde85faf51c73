#include "platform/documents/DisplayName.h"

namespace platform {
namespace {

constexpr char16_t controlPictures = 0x2400;
constexpr char16_t deletePicture = 0x2421;

bool changesDirection(char16_t unit) {
    return (unit >= 0x202A && unit <= 0x202E) || (unit >= 0x2066 && unit <= 0x2069);
}

bool endsLine(char16_t unit) {
    return unit == 0x2028 || unit == 0x2029 || unit == 0x0085;
}

QChar shownUnit(QChar unit) {
    const char16_t code = unit.unicode();
    if (code < 0x20)
        return QChar(static_cast<char16_t>(controlPictures + code));
    if (code == 0x7F)
        return QChar(deletePicture);
    if ((code > 0x7F && code < 0xA0) || changesDirection(code) || endsLine(code))
        return QChar::ReplacementCharacter;
    return unit;
}

} // namespace

QString shownName(std::string_view bytes) {
    QString text = QString::fromUtf8(bytes.data(), static_cast<qsizetype>(bytes.size()));
    for (QChar& unit : text)
        if (const QChar shown = shownUnit(unit); shown != unit)
            unit = shown;
    return text;
}

std::string displayName(std::string_view bytes) {
    return shownName(bytes).toStdString();
}

QString isolated(const QString& text) {
    return QChar(0x2068) + text + QChar(0x2069);
}

} // namespace platform
