#include "platform/base/ByteCount.h"

#include "platform/base/Text.h"

#include <QLocale>
#include <QString>
#include <array>
#include <cmath>

namespace platform {
namespace {

struct Unit {
    /// Localised: the number replaces "%@".
    const char* key;
    int decimals;
};

constexpr std::array<Unit, 6> units = {
    {{"%@ KB", 0}, {"%@ MB", 1}, {"%@ GB", 2}, {"%@ TB", 2}, {"%@ PB", 2}, {"%@ EB", 2}}};

double rounded(double number, int decimals) {
    const double scale = std::pow(10.0, decimals);
    return std::round(number * scale) / scale;
}

} // namespace

std::string byteCountText(std::uint64_t bytes, ByteCountStyle style, bool withUnit) {
    const double base = style == ByteCountStyle::binary ? 1024.0 : 1000.0;
    const auto count = static_cast<double>(bytes);
    if (count < base) {
        return withUnit ? localizedPlural(".DICT.BYTES.%d", static_cast<long long>(bytes))
                        : localizedNumberText(count, 0);
    }
    double number = count / base;
    std::size_t unit = 0;
    // A number that rounds up to the base belongs to the next unit: 999,999 bytes are 1 MB.
    while (unit + 1 < units.size() && rounded(number, units[unit].decimals) >= base) {
        number /= base;
        ++unit;
    }
    const std::string text = localizedNumberText(number, units[unit].decimals);
    return withUnit ? localizedFormat(units[unit].key, text) : text;
}

double localizedNumberValue(std::string_view text) {
    bool ok = false;
    const double number = QLocale().toDouble(
        QString::fromUtf8(text.data(), static_cast<qsizetype>(text.size())), &ok);
    return ok ? number : 0;
}

std::string localizedNumberText(double number, int decimals) {
    int needed = 0;
    while (needed < decimals &&
           std::fabs(rounded(number, needed) - rounded(number, decimals)) > 1e-9)
        ++needed;
    return QLocale().toString(number, 'f', needed).toStdString();
}

} // namespace platform
