#include "platform/documents/list/RowText.h"

#include "platform/base/ByteCount.h"
#include "platform/base/DateFormat.h"
#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/Settings.h"

#include <QStringList>

namespace platform {
namespace {

/// An extension that takes more of the line than this is only a dot in a long name.
constexpr double largestExtensionShare = 0.45;

const QString separator = QStringLiteral(" – ");

QString sizeText(std::uint64_t bytes) {
    return toQt(byteCountText(bytes, ByteCountStyle::file));
}

QString countText(std::size_t items) {
    return toQt(localizedPlural(".DICT.ITEMS.%d", static_cast<long long>(items)));
}

/// "Documents › Trips", with each name in its own direction and their order in the program's.
QString placeText(const std::string& place) {
    const QString arrow = QStringLiteral(" › ");
    const QChar outer(isRightToLeft() ? 0x2067 : 0x2066);
    QStringList names = shownName(place).split(arrow);
    for (QString& name : names)
        name = isolated(name);
    return outer + names.join(arrow) + QChar(0x2069);
}

} // namespace

RowName rowName(const DocumentEntry& entry) {
    // Only documents have extensions; a folder's dot is a part of its name.
    if (!isDocument(entry.kind))
        return {shownName(entry.title()), {}};
    const std::string& title = entry.title();
    const std::string_view extension = pathExtensionOf(title);
    if (extension.empty())
        return {shownName(title), {}};
    const std::size_t dot = title.size() - extension.size() - 1;
    return {shownName(std::string_view(title).substr(0, dot)),
            shownName(std::string_view(title).substr(dot))};
}

QString elidedName(const RowName& name, const QFontMetricsF& metrics, double width) {
    const QString whole = isolated(name.whole());
    if (metrics.horizontalAdvance(whole) <= width)
        return whole;
    const double extension = metrics.horizontalAdvance(name.extension);
    if (extension > width * largestExtensionShare)
        return isolated(metrics.elidedText(name.whole(), Qt::ElideRight, width));
    return isolated(metrics.elidedText(name.stem, Qt::ElideMiddle, width - extension) +
                    name.extension);
}

std::vector<QString> rowDetails(const DocumentEntry& entry, const EntryDetails* details,
                                const std::string& place) {
    QStringList longest;
    QStringList shorter;
    const auto add = [&](const QString& part, const QString& brief) {
        longest.append(isolated(part));
        shorter.append(isolated(brief));
    };
    if (!place.empty())
        add(placeText(place), placeText(place));
    if (details && !isDocument(entry.kind) && details->itemCount)
        add(countText(*details->itemCount), countText(*details->itemCount));
    if (details && isDocument(entry.kind)) {
        if (details->modified)
            add(toQt(localizedDayText(*details->modified, DateStyle::medium)),
                toQt(localizedDayText(*details->modified, DateStyle::shortStyle)));
        if (details->size)
            add(sizeText(*details->size), sizeText(*details->size));
    }
    if (details && details->shared)
        add(toQt(localized("Shared")), toQt(localized("Shared")));
    std::vector<QString> forms;
    for (; !longest.isEmpty(); longest.removeLast(), shorter.removeLast()) {
        forms.push_back(longest.join(separator));
        forms.push_back(shorter.join(separator));
    }
    return forms;
}

QString fittingForm(const std::vector<QString>& forms, const QFontMetricsF& metrics, double width) {
    if (forms.empty())
        return {};
    for (const QString& form : forms)
        if (metrics.horizontalAdvance(form) <= width)
            return form;
    return metrics.elidedText(forms.back(), Qt::ElideRight, width);
}

} // namespace platform
