#include "tests/documents/ListFixture.h"

#include <QtTest/QTest>

namespace test {

using namespace platform;
using namespace std::chrono_literals;

namespace {

QPoint toPoint(Point point) {
    return {static_cast<int>(point.x), static_cast<int>(point.y)};
}

QPointingDevice* finger() {
    static QPointingDevice* const device = QTest::createTouchDevice();
    return device;
}

} // namespace

void ListFixture::open(Size size) {
    house.signIn();
    house.openWindow(size);
}

void ListFixture::showList(std::string_view folder) {
    list = house.showList(folder);
    list->setDelegate(delegate);
    list->setAvailableActions(15);
    ASSERT_TRUE(house.until([this] { return list->impl().model->state() != ModelState::loading; }));
    house.advance(1s);
}

void ListFixture::givenFiles(int count, const std::string& folder) {
    for (int i = 0; i < count; ++i)
        house.givenFile(folder + "File " + std::to_string(i) + ".txt");
}

std::vector<std::string> ListFixture::shown() const {
    std::vector<std::string> names;
    for (const Url& url : list->containedItems())
        names.emplace_back(url.lastPathComponent());
    return names;
}

bool ListFixture::untilShown(const std::vector<std::string>& names) {
    const bool came = house.until([&] { return shown() == names; });
    EXPECT_THAT(shown(), ::testing::ElementsAreArray(names));
    return came;
}

std::vector<std::string> ListFixture::selected() const {
    std::vector<std::string> names;
    for (const Url& url : list->selectedItems())
        names.emplace_back(url.lastPathComponent());
    return names;
}

std::size_t ListFixture::rowNamed(std::string_view name) const {
    const RowModel& model = state().model;
    for (std::size_t i = 0; i < model.count(); ++i)
        if (model.entryAt(i).title() == name)
            return i;
    ADD_FAILURE() << "no row " << name;
    return 0;
}

std::string ListFixture::currentName() const {
    const auto index = state().indexOf(state().current);
    return index ? state().model.entryAt(*index).title() : std::string();
}

std::string ListFixture::nameAtTop() const {
    return state().model.entryAt(state().firstInView()).title();
}

Point ListFixture::middleOf(std::string_view name) const {
    return state().rowRect(rowNamed(name)).center();
}

void ListFixture::tap(Point point, Qt::KeyboardModifiers modifiers) {
    QTest::mouseClick(&widget(), Qt::LeftButton, modifiers, toPoint(point));
    house.settle();
}

void ListFixture::press(int key, Qt::KeyboardModifiers modifiers) {
    QTest::keyClick(&widget(), static_cast<Qt::Key>(key), modifiers);
    house.settle();
}

void ListFixture::type(const std::string& text) {
    for (const char each : text)
        QTest::keyClick(&widget(), each);
    house.settle();
}

void ListFixture::fingerDown(Point point) {
    QTest::touchEvent(&widget(), finger()).press(0, toPoint(point), &widget());
}

void ListFixture::fingerTo(Point point) {
    QTest::touchEvent(&widget(), finger()).move(0, toPoint(point), &widget());
}

void ListFixture::fingerUp(Point point) {
    QTest::touchEvent(&widget(), finger()).release(0, toPoint(point), &widget());
    house.settle();
}

void ListFixture::drag(Point from, Point to, Duration step) {
    constexpr int steps = 10;
    fingerDown(from);
    for (int i = 1; i <= steps; ++i) {
        house.clock->advance(step);
        const double share = static_cast<double>(i) / steps;
        fingerTo({from.x + (to.x - from.x) * share, from.y + (to.y - from.y) * share});
    }
    fingerUp(to);
}

void ListFixture::swipe(std::string_view name, double distance, Duration step) {
    const Point middle = middleOf(name);
    const double way = state().style.rightToLeft ? distance : -distance;
    drag({middle.x - way / 2, middle.y}, {middle.x + way / 2, middle.y}, step);
    house.advance(1s);
}

QAccessibleInterface* ListFixture::accessibleRow(std::string_view name) const {
    return QAccessible::queryAccessibleInterface(&widget())->child(
        static_cast<int>(rowNamed(name)));
}

} // namespace test
