#include "platform/documents/preview/ContentsList.h"

#include "platform/documents/list/RowPainter.h"
#include "platform/ui/Application.h"
#include "platform/ui/Direction.h"
#include "platform/ui/Theme.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/TouchEvents.h"
#include "platform/ui/qt/ViewWidget.h"

#include <QKeyEvent>
#include <QPainter>
#include <QScrollBar>
#include <QStyledItemDelegate>

#include <algorithm>
#include <cmath>

namespace platform {
namespace {

constexpr Color hoverFill = Color::hex(0xF3F5F8);
constexpr Color pressedFill = Color::hex(0xE9ECF1);
constexpr double slop = 10;
constexpr double chevronEdge = 16;
constexpr double indent = 20;
/// Deeper rows would have no room for their names on a phone.
constexpr double mostIndent = 5 * indent;
/// As many rows open by themselves when they are all there is.
constexpr std::size_t fewItems = 24;
/// Of one folder: so few leave room for what is in the next one.
constexpr std::size_t fewRows = 4;

/// Tells the view how high its rows are; they are painted by the view itself.
class RowHeight final : public QStyledItemDelegate {
public:
    using QStyledItemDelegate::QStyledItemDelegate;
    QSize sizeHint(const QStyleOptionViewItem& /*option*/,
                   const QModelIndex& /*index*/) const override {
        return {1, static_cast<int>(std::lround(RowStyle::current().rowHeight))};
    }
};

} // namespace

/// Where one is in the list, by names: the numbers are others after a reload.
struct ContentsList::Place {
    std::set<std::string> open;
    std::string top;
    int above = 0;
    std::string current;
};

ContentsList::ContentsList()
    : style_(RowStyle::current()),
      flinger_([this](Point stretch) { return scrollBy(-stretch.y); }) {
    setModel(&model_);
    setItemDelegate(new RowHeight(this));
    setHeaderHidden(true);
    setFrameShape(QFrame::NoFrame);
    setUniformRowHeights(true);
    setExpandsOnDoubleClick(false);
    setVerticalScrollMode(QAbstractItemView::ScrollPerPixel);
    setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    setSelectionMode(QAbstractItemView::NoSelection);
    setMouseTracking(true);
    viewport()->setAttribute(Qt::WA_AcceptTouchEvents);
    QPalette colors = palette();
    colors.setColor(QPalette::Base, toQt(Theme::page));
    setPalette(colors);
    connect(this, &QTreeView::expanded, this,
            [this](const QModelIndex& row) { open_.insert(model_.numberAt(row)); });
    connect(this, &QTreeView::collapsed, this,
            [this](const QModelIndex& row) { open_.erase(model_.numberAt(row)); });
}

ContentsList::~ContentsList() {
    setModel(nullptr); // the model goes first
}

void ContentsList::setTree(std::shared_ptr<const ContentsTree> tree) {
    const Place before = place();
    hovered_ = pressed_ = QModelIndex();
    open_.clear();
    model_.set(std::move(tree));
    verticalScrollBar()->setSingleStep(static_cast<int>(style_.rowHeight / 2));
    if (std::exchange(shown_, true))
        restore(before);
    else
        openWhatIsAlone();
}

ContentsList::Place ContentsList::place() const {
    Place place;
    const ContentsTree& tree = model_.tree();
    for (const std::uint32_t number : open_)
        place.open.insert(tree.pathOf(number));
    if (const QModelIndex top = indexAt({1, 1}); top.isValid()) {
        place.top = tree.pathOf(model_.numberAt(top));
        place.above = visualRect(top).top();
    }
    if (currentIndex().isValid())
        place.current = tree.pathOf(model_.numberAt(currentIndex()));
    return place;
}

void ContentsList::restore(const Place& place) {
    const ContentsTree& tree = model_.tree();
    for (const std::string& path : place.open)
        if (const auto number = tree.find(path))
            expand(model_.indexOf(*number));
    if (const auto number = tree.find(place.current); number && !place.current.empty())
        setCurrentIndex(model_.indexOf(*number));
    if (const auto number = tree.find(place.top); number && !place.top.empty()) {
        scrollTo(model_.indexOf(*number), PositionAtTop);
        verticalScrollBar()->setValue(verticalScrollBar()->value() - place.above);
    }
}

/// A folder around everything says nothing, and a few rows are seen at a glance.
void ContentsList::openWhatIsAlone() {
    const ContentsTree& tree = model_.tree();
    if (tree.count() <= fewItems) {
        for (std::uint32_t i = 1; i <= tree.count(); ++i)
            expand(model_.indexOf(i));
        return;
    }
    const auto isFolder = [&](std::uint32_t number) { return tree.node(number).item.folder; };
    const std::vector<std::uint32_t>* rows = &tree.node(ContentsTree::root).children;
    // Folders stand first.
    while (rows->size() <= fewRows && std::count_if(rows->begin(), rows->end(), isFolder) == 1) {
        const std::uint32_t folder = rows->front();
        expand(model_.indexOf(folder));
        rows = &tree.node(folder).children;
    }
}

void ContentsList::toggle(const QModelIndex& row) {
    if (model_.rowCount(row) > 0)
        setExpanded(row, !isExpanded(row));
}

double ContentsList::indentOf(const QModelIndex& index) const {
    double width = 0;
    for (QModelIndex at = index.parent(); at.isValid() && width < mostIndent; at = at.parent())
        width += indent;
    return width;
}

void ContentsList::drawRow(QPainter* painter, const QStyleOptionViewItem& option,
                           const QModelIndex& index) const {
    const QRectF row = option.rect;
    if (index == pressed_ && !dragging_)
        painter->fillRect(row, toQt(pressedFill));
    else if (index == hovered_)
        painter->fillRect(row, toQt(hoverFill));
    const double start = indentOf(index);
    const bool folder = model_.rowCount(index) > 0;
    const double end = folder ? style_.margin + chevronEdge : 0;
    const auto part = [&](const Rect& rect) {
        return toQt(mirrored(rect, row.width())).translated(row.topLeft());
    };
    RowLook look;
    look.lastRow = look.aside = true; // the line and the chevron are those of a tree
    RowContent& content = model_.contentAt(index);
    painter->save();
    paintRow(*painter, part({start, 0, row.width() - start - end, row.height()}), content, look,
             style_);
    painter->restore();
    const double line = start + style_.margin + Theme::rowIcon + Theme::iconGap;
    painter->fillRect(part({line, row.height() - 1, row.width() - line, 1}), toQt(Theme::hairline));
    if (folder)
        paintChevron(
            *painter,
            part({row.width() - end, (row.height() - chevronEdge) / 2, chevronEdge, chevronEdge}),
            isExpanded(index));
    if (keys_ && hasFocus() && index == currentIndex())
        paintFocusRing(*painter, row.adjusted(2, 1, -2, -2), Theme::buttonCorner);
}

/// Points to where reading goes; down once the folder is open.
void ContentsList::paintChevron(QPainter& painter, const QRectF& place, bool open) const {
    constexpr double reach = 5;
    painter.save();
    painter.setRenderHint(QPainter::Antialiasing);
    painter.setPen(QPen(toQt(Theme::badge), 1.6, Qt::SolidLine, Qt::RoundCap, Qt::RoundJoin));
    painter.translate(place.center());
    painter.rotate(open ? 90 : readingSign() < 0 ? 180 : 0);
    const QPointF points[] = {{-reach / 2, -reach}, {reach / 2, 0}, {-reach / 2, reach}};
    painter.drawPolyline(points, 3);
    painter.restore();
}

bool ContentsList::viewportEvent(QEvent* event) {
    if (QTouchEvent* const fingers = touchOf(event))
        return touch(*fingers);
    if (event->type() == QEvent::Leave)
        setHovered({});
    return QTreeView::viewportEvent(event);
}

bool ContentsList::touch(QTouchEvent& event) {
    event.accept();
    if (!event.points().isEmpty())
        drag(event.points()[0].position(), event.type() == QEvent::TouchBegin,
             event.type() == QEvent::TouchEnd || event.type() == QEvent::TouchCancel);
    return true;
}

/// A finger that stays where it came down opens or closes the folder under it.
void ContentsList::drag(QPointF point, bool first, bool last) {
    if (first) {
        // What came to lie under the finger that stops a fling was not meant.
        dragging_ = flinger_.isMoving();
        flinger_.stop();
        flinger_.forget();
        start_ = point;
        keys_ = false;
        pressed_ = indexAt(point.toPoint());
    } else if (dragging_ || std::abs(point.y() - start_.y()) >= slop) {
        if (std::exchange(dragging_, true))
            scrollBy(dragged_.y() - point.y());
    }
    dragged_ = point;
    flinger_.track({point.x(), point.y()});
    if (last && !dragging_ && pressed_.isValid() && pressed_ == indexAt(point.toPoint()))
        toggle(pressed_);
    if (last) {
        pressed_ = QModelIndex();
        if (std::exchange(dragging_, false))
            flinger_.release();
    }
    viewport()->update();
}

bool ContentsList::scrollBy(double distance) {
    QScrollBar& bar = *verticalScrollBar();
    rest_ += distance;
    const int whole = static_cast<int>(rest_);
    rest_ -= whole;
    const int wanted = bar.value() + whole;
    bar.setValue(wanted);
    return bar.value() == wanted;
}

void ContentsList::setHovered(const QModelIndex& row) {
    if (hovered_ == row)
        return;
    hovered_ = row;
    viewport()->update();
}

void ContentsList::mousePressEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton)
        drag(event->position(), true, false);
}

void ContentsList::mouseMoveEvent(QMouseEvent* event) {
    if (event->buttons().testFlag(Qt::LeftButton))
        drag(event->position(), false, false);
    else if (Application::shared().idiom() != DeviceIdiom::phone)
        setHovered(indexAt(event->position().toPoint()));
}

void ContentsList::mouseReleaseEvent(QMouseEvent* event) {
    if (event->button() == Qt::LeftButton)
        drag(event->position(), false, true);
}

void ContentsList::mouseDoubleClickEvent(QMouseEvent* event) {
    mousePressEvent(event);
}

void ContentsList::keyPressEvent(QKeyEvent* event) {
    keys_ = true;
    viewport()->update();
    // Alt+Left, for one, is the screen's.
    if (event->modifiers() & (Qt::AltModifier | Qt::MetaModifier)) {
        event->ignore();
        return;
    }
    switch (event->key()) {
    case Qt::Key_Return:
    case Qt::Key_Enter:
    case Qt::Key_Space:
        toggle(currentIndex());
        return;
    case Qt::Key_Escape:
        event->ignore();
        return;
    default:
        QTreeView::keyPressEvent(event);
    }
}

void ContentsList::changeEvent(QEvent* event) {
    QTreeView::changeEvent(event);
    if (event->type() == QEvent::LayoutDirectionChange || event->type() == QEvent::FontChange)
        style_ = RowStyle::current();
}

} // namespace platform
