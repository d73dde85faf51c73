#pragma once

#include "platform/documents/list/RowStyle.h"
#include "platform/documents/list/RowText.h"
#include "platform/documents/model/RowModel.h"
#include "platform/ui/Image.h"

#include <QString>

#include <optional>
#include <unordered_map>
#include <vector>

namespace platform {

/// What is drawn of one row, made ready once.
struct RowContent {
    RowName name;
    /// See rowDetails.
    std::vector<QString> details;
    Image icon;
    EntryKind kind = EntryKind::file;
    bool promised = false;
    /// Name and details as they fit into the width that was painted last.
    QString fittingName;
    QString fittingDetails;
    double fittingFor = -1;
};

/// See rowDetails for `place`. The icon is the default one of the entry's kind or type.
RowContent makeRowContent(const DocumentEntry& entry, const EntryDetails* details,
                          const std::string& place);

/// The contents of the rows around the view.
class RowContents {
public:
    RowContent& at(const RowModel& model, std::size_t index);
    void forget(const std::vector<RowId>& rows);
    void clear() { contents_.clear(); }

private:
    std::unordered_map<RowId, RowContent> contents_;
};

/// The edge of a row's picture in points.
double rowIconEdge(EntryKind kind);

} // namespace platform
