#pragma once

#include "platform/documents/list/RowContents.h"
#include "platform/documents/preview/ContentsTree.h"

#include <QAbstractItemModel>

#include <memory>
#include <unordered_map>

namespace platform {

/// A tree of names for Qt's tree view. Belongs to the main thread.
class ContentsModel final : public QAbstractItemModel {
public:
    void set(std::shared_ptr<const ContentsTree> tree);
    const ContentsTree& tree() const { return *tree_; }
    std::uint32_t numberAt(const QModelIndex& index) const;
    QModelIndex indexOf(std::uint32_t number) const;
    /// What is drawn of a row, made ready once.
    RowContent& contentAt(const QModelIndex& index);

    QModelIndex index(int row, int column, const QModelIndex& parent) const override;
    QModelIndex parent(const QModelIndex& index) const override;
    int rowCount(const QModelIndex& parent) const override;
    int columnCount(const QModelIndex& parent) const override;
    QVariant data(const QModelIndex& index, int role) const override;

private:
    QString spokenText(const ContentsTree::Node& node) const;

    std::shared_ptr<const ContentsTree> tree_ = std::make_shared<ContentsTree>();
    std::unordered_map<std::uint32_t, RowContent> contents_;
};

} // namespace platform
