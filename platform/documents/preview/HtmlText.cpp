#include "platform/documents/preview/HtmlText.h"

#include <algorithm>

namespace platform {
namespace {

/// Time for a word grows with the square of its length: longer ones may be broken anywhere.
constexpr int longestWord = 100;
constexpr qsizetype longestEntityName = 32;

/// What the toolkit's documents take for a frame or an object of their own.
bool isStructural(char32_t code) {
    return code == 0 || code == 0xFDD0 || code == 0xFDD1 || code == 0xFFFC || code == 0x2028 ||
           code == 0x2029;
}

} // namespace

void HtmlText::take() {
    const QChar unit = in_.takeUnit();
    if (unit == u'&') {
        entity();
        return;
    }
    const bool breaks = unit.isSpace() || unit == u'-';
    word_ = breaks ? 0 : word_ + 1;
    const char16_t code = unit.unicode();
    const bool shown = code >= 0x20 || unit == u'\n' || unit == u'\t' || unit == u'\r';
    out_ += isStructural(code) || !shown ? QChar(QChar::ReplacementCharacter) : unit;
    breakLongWord(unit);
}

void HtmlText::breakLongWord(QChar last) {
    if (word_ < longestWord || last.isHighSurrogate())
        return;
    out_ += QChar(0x200B);
    word_ = 0;
}

void HtmlText::entity() {
    const QStringView rest = in_.ahead(longestEntityName);
    const qsizetype end = rest.indexOf(u';');
    const QStringView name = end > 0 ? rest.first(end) : QStringView();
    const bool number = name.startsWith(u'#');
    const bool hexadecimal = number && name.size() > 2 && name[1].toLower() == u'x';
    bool known = std::all_of(name.begin() + (number ? 1 : 0), name.end(),
                             [](QChar unit) { return unit.isLetterOrNumber(); }) &&
                 !name.isEmpty();
    if (known && number) {
        const uint code = name.sliced(hexadecimal ? 2 : 1).toUInt(&known, hexadecimal ? 16 : 10);
        if (known && (isStructural(code) || code < 0x20 || code > 0x10FFFF)) {
            out_ += QChar(QChar::ReplacementCharacter);
            in_.skip(end + 1);
            return;
        }
    }
    if (known) {
        out_ += u'&' + name.toString() + u';';
        in_.skip(end + 1);
    } else {
        out_ += QStringLiteral("&amp;");
    }
    ++word_;
    breakLongWord(u';');
}

} // namespace platform
