#include "platform/documents/preview/SyntaxColors.h"

namespace platform {
namespace {

struct Pair {
    Color onLight;
    Color onDark;
};

constexpr Pair pairOf(SyntaxKind kind) {
    switch (kind) {
    case SyntaxKind::comment:
        return {Color::hex(0x66707F), Color::hex(0x929DAD)};
    case SyntaxKind::string:
        return {Color::hex(0x1B7540), Color::hex(0x86D49B)};
    case SyntaxKind::keyword:
        return {Color::hex(0x1D5FC4), Color::hex(0x7FB2FF)};
    case SyntaxKind::number:
        return {Color::hex(0xA8480A), Color::hex(0xF0A766)};
    case SyntaxKind::name:
        return {Color::hex(0x7D3C98), Color::hex(0xD5A0EC)};
    case SyntaxKind::directive:
        return {Color::hex(0x0F6E7C), Color::hex(0x6FCBD8)};
    }
    return {Color::black, Color::white};
}

} // namespace

Color syntaxColor(SyntaxKind kind, const Color& ground) {
    const double light = 0.2126 * ground.red + 0.7152 * ground.green + 0.0722 * ground.blue;
    const Pair pair = pairOf(kind);
    return light > 0.5 ? pair.onLight : pair.onDark;
}

} // namespace platform
