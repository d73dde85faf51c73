#include "platform/documents/list/ListAccessible.h"

#include "platform/base/Text.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/ui/qt/Bridge.h"
#include "platform/ui/qt/FocusOrder.h"

#include <QAccessible>
#include <QAccessibleWidget>

#include <unordered_map>
#include <utility>

namespace platform {
namespace {

constexpr QAccessible::Id noId = 0;

/// A row. It may outlive the row itself in the hands of a screen reader; then it is nothing.
class RowAccessible final : public QAccessibleInterface, public QAccessibleActionInterface {
public:
    RowAccessible(ListWidget& list, RowId row) : list_(&list), row_(row) {}

    void detach() { list_ = nullptr; }

    bool isValid() const override { return index().has_value(); }
    QObject* object() const override { return nullptr; }
    QAccessibleInterface* parent() const override {
        return list_ ? QAccessible::queryAccessibleInterface(list_) : nullptr;
    }
    QAccessibleInterface* child(int) const override { return nullptr; }
    int childCount() const override { return 0; }
    int indexOfChild(const QAccessibleInterface*) const override { return -1; }
    QAccessibleInterface* childAt(int, int) const override { return nullptr; }
    QAccessible::Role role() const override { return QAccessible::ListItem; }
    void setText(QAccessible::Text, const QString&) override {}

    QString text(QAccessible::Text kind) const override {
        const std::optional<std::size_t> at = index();
        if (!at)
            return {};
        RowContent& content = listState().contents.at(listState().model, *at);
        if (kind == QAccessible::Name)
            return content.name.whole();
        if (kind == QAccessible::Description)
            return description(content);
        return {};
    }

    QRect rect() const override {
        const std::optional<std::size_t> at = index();
        if (!at)
            return {};
        const QRect area = toQt(listState().rowRect(*at)).toAlignedRect();
        return {list_->mapToGlobal(area.topLeft()), area.size()};
    }

    QAccessible::State state() const override {
        QAccessible::State result;
        const std::optional<std::size_t> at = index();
        if (!at) {
            result.invalid = true;
            return result;
        }
        const ListState& list = listState();
        result.disabled = !list.allows(*at) || !isWithinReach(*list_);
        result.focusable = !result.disabled;
        result.focused = list.hasFocus && list.current == row_;
        result.selectable = list.editing;
        result.selected = list.editing && list.selection.contains(row_);
        const Rect area = list.rowRect(*at);
        result.offscreen = area.maxY() <= 0 || area.y >= list.size.height;
        return result;
    }

    void* interface_cast(QAccessible::InterfaceType type) override {
        return type == QAccessible::ActionInterface ? static_cast<QAccessibleActionInterface*>(this)
                                                    : nullptr;
    }

    QStringList actionNames() const override {
        const std::optional<std::size_t> at = index();
        if (!at || !listState().allows(*at))
            return {};
        QStringList names{pressAction()};
        if (listState().editing || listState().client->listActions() == 0)
            return names;
        names.append(showMenuAction());
        for (const int action : offeredActions(listState().client->listActions()))
            names.append(toQt(actionTitle(action)));
        return names;
    }

    void doAction(const QString& name) override {
        const std::optional<std::size_t> at = index();
        if (!at || !listState().allows(*at) || !isWithinReach(*list_))
            return;
        ListState& list = listState();
        list.reveal(*at, false);
        list.setCurrent(*at);
        if (name == pressAction()) {
            list.activate(*at);
        } else if (name == showMenuAction()) {
            list.askForActions(*at, list.moreRect(*at));
        } else {
            for (const int action : offeredActions(list.client->listActions()))
                if (toQt(actionTitle(action)) == name) {
                    list.chooseAction(action, *at, list.moreRect(*at));
                    return;
                }
        }
    }
    QStringList keyBindingsForAction(const QString&) const override { return {}; }

private:
    ListState& listState() const { return list_->state(); }
    std::optional<std::size_t> index() const {
        return list_ ? list_->state().model.indexOf(row_) : std::nullopt;
    }
    QString description(const RowContent& content) const {
        QStringList parts;
        if (content.kind == EntryKind::folder || content.kind == EntryKind::container)
            parts.append(toQt(localized("Folder")));
        if (!content.details.empty())
            parts.append(content.details.front());
        const auto progress = listState().arriving.find(row_);
        if (progress != listState().arriving.end())
            parts.append(toQt(localized("Downloading")));
        else if (content.promised)
            parts.append(toQt(localized("Not downloaded")));
        return parts.join(QStringLiteral(", "));
    }

    ListWidget* list_;
    const RowId row_;
};

/// The list with its rows, which are made when somebody asks for them.
class WholeList final : public QAccessibleWidget {
public:
    explicit WholeList(ListWidget* list)
        : QAccessibleWidget(list, QAccessible::List), list_(list) {}
    ~WholeList() override {
        for (const auto& [row, id] : rows_)
            drop(id);
    }

    int childCount() const override { return static_cast<int>(list_->state().model.count()); }

    QAccessibleInterface* child(int index) const override {
        const RowModel& model = list_->state().model;
        if (index < 0 || static_cast<std::size_t>(index) >= model.count())
            return nullptr;
        return const_cast<WholeList*>(this)->rowFor(model.idAt(static_cast<std::size_t>(index)));
    }

    QAccessibleInterface* childAt(int x, int y) const override {
        const QPoint at = list_->mapFromGlobal(QPoint(x, y));
        const auto index = list_->state().rowAt(at.y());
        return index && list_->rect().contains(at) ? child(static_cast<int>(*index)) : nullptr;
    }

    int indexOfChild(const QAccessibleInterface* wanted) const override {
        for (const auto& [row, id] : rows_)
            if (QAccessible::accessibleInterface(id) == wanted)
                if (const auto index = list_->state().model.indexOf(row))
                    return static_cast<int>(*index);
        return -1;
    }

    QAccessibleInterface* focusChild() const override {
        const auto index = list_->state().indexOf(list_->state().current);
        return list_->hasFocus() && index ? child(static_cast<int>(*index)) : nullptr;
    }

    QAccessible::State state() const override {
        QAccessible::State state = QAccessibleWidget::state();
        state.focusable = true;
        state.multiSelectable = list_->state().editing;
        return state;
    }

    void forgetGoneRows() {
        std::erase_if(rows_, [this](const auto& entry) {
            if (list_->state().model.contains(entry.first))
                return false;
            drop(entry.second);
            return true;
        });
    }

private:
    QAccessibleInterface* rowFor(RowId row) {
        QAccessible::Id& id = rows_.try_emplace(row, noId).first->second;
        if (id == noId)
            id = QAccessible::registerAccessibleInterface(new RowAccessible(*list_, row));
        return QAccessible::accessibleInterface(id);
    }
    static void drop(QAccessible::Id id) {
        if (auto* const row = static_cast<RowAccessible*>(QAccessible::accessibleInterface(id)))
            row->detach();
        QAccessible::deleteAccessibleInterface(id);
    }

    ListWidget* list_;
    std::unordered_map<RowId, QAccessible::Id> rows_;
};

QAccessibleInterface* makeInterface(const QString& /*className*/, QObject* object) {
    // The class has no meta-object of its own.
    auto* const list = dynamic_cast<ListWidget*>(object);
    return list ? new WholeList(list) : nullptr;
}

} // namespace

void installListAccessibility() {
    // The last factory is asked first, and a new application puts its own behind ours.
    QAccessible::removeFactory(makeInterface);
    QAccessible::installFactory(makeInterface);
}

void announceCurrentRow(ListWidget& list) {
    if (!QAccessible::isActive() || !list.hasFocus())
        return;
    const auto index = list.state().indexOf(list.state().current);
    if (!index)
        return;
    QAccessibleEvent event(&list, QAccessible::Focus);
    event.setChild(static_cast<int>(*index));
    QAccessible::updateAccessibility(&event);
}

void announceRowsChanged(ListWidget& list) {
    if (!QAccessible::isActive())
        return;
    if (auto* const whole = dynamic_cast<WholeList*>(QAccessible::queryAccessibleInterface(&list)))
        whole->forgetGoneRows();
    QAccessibleEvent event(&list, QAccessible::ObjectReorder);
    QAccessible::updateAccessibility(&event);
}

} // namespace platform
