#pragma once

#include "platform/documents/list/ListKeys.h"
#include "platform/documents/list/ListPointer.h"
#include "platform/documents/list/ListState.h"

#include <QWidget>

#include <memory>

class QScrollBar;
class QTouchEvent;

namespace platform {

class ListAccessible;

/// The list on screen: paints the rows in view, hands events to those who understand them, and
/// keeps place, selection and focus while the rows change.
class ListWidget final : public QWidget, private RowModelObserver {
public:
    ListWidget(std::shared_ptr<RowModel> model, ListClient& client);
    ~ListWidget() override;

    ListState& state() { return state_; }
    const ListState& state() const { return state_; }
    /// Room above the first row, which scrolls with the rows.
    void setHeaderHeight(double height);
    /// Rows that are to come, in place of none.
    void setShowsPlaceholders(bool shown);
    /// Called before and after changes of the rows, for whoever looks at the same model.
    void setChangeHandlers(std::function<void()> rows, std::function<void()> modelState);
    void askForRefresh();
    bool isRefreshing() const { return refreshing_; }
    /// The share of the way to the point where letting go reads again; and how far it is drawn.
    double pulledShare() const;

protected:
    bool event(QEvent* event) override;
    void paintEvent(QPaintEvent* event) override;
    void resizeEvent(QResizeEvent* event) override;
    void mousePressEvent(QMouseEvent* event) override;
    void mouseMoveEvent(QMouseEvent* event) override;
    void mouseReleaseEvent(QMouseEvent* event) override;
    void leaveEvent(QEvent* event) override;
    void wheelEvent(QWheelEvent* event) override;
    void keyPressEvent(QKeyEvent* event) override;
    void contextMenuEvent(QContextMenuEvent* event) override;
    void focusInEvent(QFocusEvent* event) override;
    void focusOutEvent(QFocusEvent* event) override;
    void changeEvent(QEvent* event) override;

private:
    struct Landmark {
        RowId row;
        double y;
    };

    void rowsWillChange() override;
    void rowsDidChange() override;
    void rowContentDidChange(const std::vector<RowId>& rows) override;
    void modelStateDidChange() override;

    bool touch(QTouchEvent& event);
    void measure();
    void scrolled();
    void updateScrollBar();
    void tellRowsInView();
    void followThumbnails();
    void keepPlace();
    void keepCurrent();
    void paintRows(QPainter& painter, const QRectF& dirty);
    void paintOneRow(QPainter& painter, std::size_t index);
    void paintPlaceholders(QPainter& painter);
    void paintPull(QPainter& painter);
    void spin();

    ListState state_;
    ListPointer pointer_;
    ListKeys keys_;
    QScrollBar* scrollBar_;
    /// Points a step of the scroll bar, whose numbers end where large folders do not.
    double scrollUnit_ = 1;
    bool placeholders_ = false;
    bool refreshing_ = false;
    Animation spinning_;
    double spin_ = 0;
    std::vector<Landmark> landmarks_;
    std::size_t currentIndex_ = 0;
    std::function<void()> rowsChanged_;
    std::function<void()> modelStateChanged_;
    std::shared_ptr<bool> alive_ = std::make_shared<bool>(true);
};

} // namespace platform
