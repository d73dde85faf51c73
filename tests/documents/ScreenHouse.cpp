#include "tests/documents/ScreenHouse.h"

#include <QCoreApplication>
#include <QEventLoop>
#include <QTimer>

#include <algorithm>
#include <filesystem>
#include <fstream>

namespace test {
namespace {

int argumentCount = 1;
char programName[] = "documents";
char* arguments[] = {programName, nullptr};

} // namespace

ScreenHouse::ScreenHouse() {
    runPending = [this] { application->processPending(); };
    waitForWork = [] {
        // The limit ends a wait for what never comes.
        QTimer limit;
        limit.setSingleShot(true);
        limit.start(std::chrono::seconds(20));
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    };
}

ScreenHouse::~ScreenHouse() {
    navigation.reset();
    window.reset();
    if (platform)
        platform->mainQueue().drainAll();
    application.reset();
}

void ScreenHouse::openWindow(platform::Size size) {
    if (!application)
        application = std::make_unique<platform::Application>(argumentCount, arguments);
    application->setIdiom(std::min(size.width, size.height) < 600 ? platform::DeviceIdiom::phone
                                                                  : platform::DeviceIdiom::tablet);
    window = std::make_unique<platform::Window>(platform::Rect{0, 0, size.width, size.height});
    window->setStatusStrip({"anna@example.org", "Wi-Fi", false});
    navigation = std::make_shared<platform::NavigationController>();
    navigation->setToolbarHidden(false, false);
    window->setRootViewController(navigation);
    window->makeKeyAndVisible();
    settle();
}

std::shared_ptr<platform::DocumentListController> ScreenHouse::showList(std::string_view folder) {
    const auto list = platform::DocumentListController::createForURL(url(folder));
    show({list});
    return list;
}

void ScreenHouse::show(std::vector<std::shared_ptr<platform::ViewController>> screens) {
    navigation->setViewControllers(std::move(screens), false);
    settle();
}

void ScreenHouse::advance(platform::Duration time) {
    settle();
    clock->advance(time, [this] { settle(); });
    settle();
}

void ScreenHouse::settle() {
    application->processPending();
}

void ScreenHouse::waitBriefly() {
    QTimer limit;
    limit.setSingleShot(true);
    limit.start(std::chrono::milliseconds(20));
    QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
}

void ScreenHouse::savePicture(const std::string& file, double scale) const {
    std::filesystem::create_directories(std::filesystem::path(file).parent_path());
    const platform::Bytes png = window->snapshotPng(scale);
    std::ofstream(file, std::ios::binary)
        .write(reinterpret_cast<const char*>(png.data()), static_cast<std::streamsize>(png.size()));
}

} // namespace test
