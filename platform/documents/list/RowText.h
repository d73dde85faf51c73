#pragma once

#include "platform/documents/model/DocumentEntry.h"

#include <QFontMetricsF>
#include <QString>

#include <string>
#include <vector>

namespace platform {

/// A row's name in its two parts; the second is the extension with its dot, or "".
struct RowName {
    QString stem;
    QString extension;
    QString whole() const { return stem + extension; }
};
RowName rowName(const DocumentEntry& entry);

/// The name in at most `width` points: its middle gives way, its extension never does unless there
/// is no room for anything else.
QString elidedName(const RowName& name, const QFontMetricsF& metrics, double width);

/// The second line, "date – size" or "12 items", from its whole form to ever shorter ones; none
/// while the details are not known. `place` stands first when it is not empty.
std::vector<QString> rowDetails(const DocumentEntry& entry, const EntryDetails* details,
                                const std::string& place);

/// The first of the forms that fits; the last one, cut, when none does.
QString fittingForm(const std::vector<QString>& forms, const QFontMetricsF& metrics, double width);

} // namespace platform
