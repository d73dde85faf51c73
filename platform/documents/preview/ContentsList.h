#pragma once

#include "platform/documents/preview/ContentsModel.h"
#include "platform/documents/preview/Flinger.h"

#include <QPersistentModelIndex>
#include <QTreeView>

#include <memory>
#include <set>

class QTouchEvent;

namespace platform {

/// The names of an archive or a package, drawn as the rows of a list; folders open in their place.
/// Qt's tree view knows which rows there are, the keys and the screen reader.
class ContentsList final : public QTreeView {
public:
    ContentsList();
    ~ContentsList() override;

    /// Folders that were open stay open, and the row at the top stays there, as far as they are
    /// still there.
    void setTree(std::shared_ptr<const ContentsTree> tree);
    const ContentsModel& contents() const { return model_; }

protected:
    void drawRow(QPainter* painter, const QStyleOptionViewItem& option,
                 const QModelIndex& index) const override;
    bool viewportEvent(QEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void mouseDoubleClickEvent(QMouseEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void changeEvent(QEvent* event) override;

private:
    struct Place;
    Place place() const;
    void restore(const Place& place);
    void openWhatIsAlone();
    void toggle(const QModelIndex& row);
    bool touch(QTouchEvent& event);
    void drag(QPointF point, bool first, bool last);
    bool scrollBy(double distance);
    void setHovered(const QModelIndex& row);
    double indentOf(const QModelIndex& index) const;
    void paintChevron(QPainter& painter, const QRectF& place, bool open) const;

    mutable ContentsModel model_;
    RowStyle style_;
    bool shown_ = false;
    /// The numbers of the open folders.
    std::set<std::uint32_t> open_;
    QPersistentModelIndex hovered_;
    QPersistentModelIndex pressed_;
    /// The keyboard was used last: only then is its row marked.
    bool keys_ = false;
    QPointF start_;
    QPointF dragged_;
    bool dragging_ = false;
    double rest_ = 0;
    Flinger flinger_;
};

} // namespace platform
