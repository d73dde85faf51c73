#pragma once

#include "items/VXItem.h"
#include "platform/ui/StackView.h"
#include "platform/ui/StyledText.h"
#include "preview/FileInfoCell.h"

#include <memory>
#include <optional>
#include <string>
#include <string_view>

namespace tavrin {

/// The rows of information about a file; a row is there only when its value is. Chooses the longest
/// style in which both dates fit. Main thread.
class FileInfoStackView : public platform::StackView {
public:
    explicit FileInfoStackView(platform::Rect frame = {});

    std::shared_ptr<FileInfoCell> addCell(std::string_view name, std::string_view value,
                                          int maxLines);
    const std::shared_ptr<VXItem>& item() const { return item_; }
    /// Rebuilds the rows; with no item the rows stay.
    void setItem(const std::shared_ptr<VXItem>& item);
    /// The item's tags, each a coloured dot before its name; none without tags.
    static std::optional<platform::StyledText>
    buildTagsWithImagesString(const VXItem& item, const platform::Font& font);

    const std::shared_ptr<FileInfoCell>& creationDateCell() const { return creationDateCell_; }
    const std::shared_ptr<FileInfoCell>& modifiedDateCell() const { return modifiedDateCell_; }

protected:
    void layoutSubviews() override;

private:
    void removeRows();
    void addRow(const char* nameKey, const std::optional<std::string>& value, int maxLines = 1);

    std::shared_ptr<VXItem> item_;
    std::shared_ptr<FileInfoCell> creationDateCell_;
    std::shared_ptr<FileInfoCell> modifiedDateCell_;
};

} // namespace tavrin
