#include "platform/documents/preview/ContentsModel.h"

#include "platform/base/Text.h"
#include "platform/documents/DisplayName.h"

namespace platform {
namespace {

/// Several screens of rows.
constexpr std::size_t mostContents = 512;

EntryDetails detailsOf(const ContentsTree::Node& node) {
    EntryDetails details;
    details.size = node.item.size;
    details.modified = node.item.modified;
    details.promised = node.item.promised;
    if (node.item.folder)
        details.itemCount = node.children.size();
    return details;
}

/// What is special about it, in words.
std::string remarkOn(const ContentsTree::Item& item) {
    if (item.encrypted)
        return localized("Encrypted");
    return item.link ? localized("Link") : std::string();
}

} // namespace

void ContentsModel::set(std::shared_ptr<const ContentsTree> tree) {
    beginResetModel();
    tree_ = std::move(tree);
    contents_.clear();
    endResetModel();
}

std::uint32_t ContentsModel::numberAt(const QModelIndex& index) const {
    return index.isValid() ? static_cast<std::uint32_t>(index.internalId()) : ContentsTree::root;
}

QModelIndex ContentsModel::indexOf(std::uint32_t number) const {
    if (number == ContentsTree::root)
        return {};
    return createIndex(static_cast<int>(tree_->node(number).row), 0, quintptr{number});
}

RowContent& ContentsModel::contentAt(const QModelIndex& index) {
    const std::uint32_t number = numberAt(index);
    if (const auto found = contents_.find(number); found != contents_.end())
        return found->second;
    if (contents_.size() >= mostContents)
        contents_.clear();
    const ContentsTree::Node& node = tree_->node(number);
    const EntryDetails details = detailsOf(node);
    return contents_.emplace(number, makeRowContent(node.entry(), &details, remarkOn(node.item)))
        .first->second;
}

QModelIndex ContentsModel::index(int row, int column, const QModelIndex& parent) const {
    const ContentsTree::Node& folder = tree_->node(numberAt(parent));
    if (column != 0 || row < 0 || static_cast<std::size_t>(row) >= folder.children.size())
        return {};
    return createIndex(row, 0, quintptr{folder.children[static_cast<std::size_t>(row)]});
}

QModelIndex ContentsModel::parent(const QModelIndex& index) const {
    return index.isValid() ? indexOf(tree_->node(numberAt(index)).parent) : QModelIndex();
}

int ContentsModel::rowCount(const QModelIndex& parent) const {
    return static_cast<int>(tree_->node(numberAt(parent)).children.size());
}

int ContentsModel::columnCount(const QModelIndex& /*parent*/) const {
    return 1;
}

QVariant ContentsModel::data(const QModelIndex& index, int role) const {
    if (!index.isValid())
        return {};
    const ContentsTree::Node& node = tree_->node(numberAt(index));
    if (role == Qt::DisplayRole)
        return shownName(node.name);
    return role == Qt::AccessibleTextRole ? spokenText(node) : QVariant();
}

QString ContentsModel::spokenText(const ContentsTree::Node& node) const {
    const DocumentEntry entry = node.entry();
    const EntryDetails details = detailsOf(node);
    const std::vector<QString> forms = rowDetails(entry, &details, remarkOn(node.item));
    return forms.empty() ? shownName(node.name)
                         : shownName(node.name) + QStringLiteral(", ") + forms.front();
}

} // namespace platform
