#include "preview/FileInfoStackView.h"

#include "items/FileTags.h"
#include "items/FileUtils.h"
#include "platform/base/Text.h"
#include "platform/ui/Application.h"
#include "platform/ui/VisualFormat.h"

#include <algorithm>

namespace tavrin {
namespace {

using platform::DateStyle;
using platform::localized;

constexpr double rowSpacing = 10;
constexpr int locationLines = 3;
/// Points between a tag's dot and its name.
constexpr double dotGap = 2;

/// The folders from the outermost on, the arrows between them along the reading direction; each
/// name runs in its own.
std::optional<std::string> locationText(const platform::Url& url) {
    std::optional<std::string> text = FileUtils::displayableLocationForURL(url);
    if (!text || !platform::Application::shared().isRightToLeft())
        return text;
    constexpr std::string_view arrow = " \u25B8 ";
    constexpr std::string_view mirrored = "\u2069 \u25C2 \u2068";
    for (std::size_t at = 0; (at = text->find(arrow, at)) != std::string::npos;
         at += mirrored.size())
        text->replace(at, arrow.size(), mirrored);
    return "\u2067\u2068" + *text + "\u2069\u2069";
}

void showText(const std::shared_ptr<FileInfoCell>& cell, const VXItem::Text& text) {
    if (cell && text && cell->valueLabel()->text() != *text)
        cell->valueLabel()->setText(*text);
}

} // namespace

FileInfoStackView::FileInfoStackView(platform::Rect frame) : StackView(frame) {
    setLaidOutByConstraints(true);
    setAlignment(platform::StackAlignment::leading);
    setDistribution(platform::StackDistribution::fill);
    setSpacing(rowSpacing);
}

std::shared_ptr<FileInfoCell> FileInfoStackView::addCell(std::string_view name,
                                                         std::string_view value, int maxLines) {
    const auto last = arrangedSubviews().empty()
                          ? nullptr
                          : std::dynamic_pointer_cast<FileInfoCell>(arrangedSubviews().back());
    auto cell = std::make_shared<FileInfoCell>(name, value, maxLines);
    addArrangedSubview(cell);
    if (!last)
        return cell;
    // All names form one column.
    const auto sameWidth = platform::constraintsWithVisualFormat(
        "[nameLabel(==lastNameLabel)]",
        {{"nameLabel", cell->nameLabel().get()}, {"lastNameLabel", last->nameLabel().get()}});
    if (sameWidth)
        platform::LayoutConstraint::activate(*sameWidth);
    return cell;
}

void FileInfoStackView::removeRows() {
    const std::vector<std::shared_ptr<platform::View>> rows = arrangedSubviews();
    for (const std::shared_ptr<platform::View>& row : rows)
        removeArrangedSubview(row);
    creationDateCell_.reset();
    modifiedDateCell_.reset();
}

void FileInfoStackView::addRow(const char* nameKey, const std::optional<std::string>& value,
                               int maxLines) {
    if (value)
        addCell(localized(nameKey), *value, maxLines);
}

void FileInfoStackView::setItem(const std::shared_ptr<VXItem>& item) {
    item_ = item;
    if (!item)
        return;
    removeRows();
    addRow("Kind", item->localizedTypeDescription());
    addRow("Size", item->friendlyFileSize());
    if (item->url())
        addRow("Where", locationText(*item->url()), locationLines);
    if (const auto created = item->friendlyCreationDate(DateStyle::longStyle))
        creationDateCell_ = addCell(localized("Created"), *created, 1);
    if (const auto modified = item->friendlyContentModificationDate(DateStyle::longStyle))
        modifiedDateCell_ = addCell(localized("Modified"), *modified, 1);
    if (const auto tags = buildTagsWithImagesString(*item, FileInfoCell::font()))
        addCell(localized("Tags"), "", 1)->valueLabel()->setStyledText(*tags);
}

std::optional<platform::StyledText>
FileInfoStackView::buildTagsWithImagesString(const VXItem& item, const platform::Font& font) {
    if (!item.tags() || item.tags()->empty())
        return std::nullopt;
    const double capHeight = font.capHeight();
    const platform::Size imageSize{capHeight + dotGap, font.lineHeight()};
    // The spare room of the image keeps the dot off its name, which follows to the left or right.
    const double side = platform::Application::shared().isRightToLeft() ? dotGap : 0;
    const platform::Point offset{side, font.ascender() - capHeight + 1};
    platform::StyledText line;
    for (std::size_t i = 0; i < item.tags()->size(); ++i) {
        const std::string& tag = (*item.tags())[i];
        const bool last = i + 1 == item.tags()->size();
        line.runs.push_back({"", FileTags::blipWithTag(tag, imageSize, capHeight, offset), 0});
        line.runs.push_back({last ? tag : tag + " ", {}, -font.descender()});
    }
    return line;
}

void FileInfoStackView::layoutSubviews() {
    StackView::layoutSubviews();
    if (!item_)
        return;
    double available = 0;
    for (const auto& cell : {creationDateCell_, modifiedDateCell_})
        if (cell)
            available = std::max(available, cell->valueLabel()->bounds().width);
    if (available == 0)
        return;
    const platform::Font font = FileInfoCell::font();
    const auto fits = [&](const VXItem::Text& text) {
        return !text || font.width(*text) <= available;
    };
    for (const DateStyle style : {DateStyle::longStyle, DateStyle::medium, DateStyle::shortStyle}) {
        const VXItem::Text created =
            creationDateCell_ ? item_->friendlyCreationDate(style) : std::nullopt;
        const VXItem::Text modified =
            modifiedDateCell_ ? item_->friendlyContentModificationDate(style) : std::nullopt;
        if (style != DateStyle::shortStyle && !(fits(created) && fits(modified)))
            continue;
        showText(creationDateCell_, created);
        showText(modifiedDateCell_, modified);
        return;
    }
}

} // namespace tavrin
