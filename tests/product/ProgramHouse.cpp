#include "tests/product/ProgramHouse.h"

#include "platform/ui/NavigationController.h"

#include <QCoreApplication>
#include <QEventLoop>
#include <QTimer>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <stdexcept>

namespace test {
namespace {

int argumentCount = 1;
char programName[] = "tavrin";
char* arguments[] = {programName, nullptr};

} // namespace

ProgramHouse::ProgramHouse() {
    runPending = [this] {
        if (application)
            application->processPending();
        else
            platform->mainQueue().drainAll();
    };
    waitForWork = [] {
        // The limit ends a wait for what never comes.
        QTimer limit;
        limit.setSingleShot(true);
        limit.start(std::chrono::seconds(20));
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    };
}

ProgramHouse::~ProgramHouse() {
    delegate.reset();
    if (platform)
        platform->mainQueue().drainAll();
    application.reset();
}

void ProgramHouse::launch(platform::Size size) {
    if (!platform)
        withoutAccount();
    if (!application)
        application = std::make_unique<platform::Application>(argumentCount, arguments);
    application->setIdiom(std::min(size.width, size.height) < 600 ? platform::DeviceIdiom::phone
                                                                  : platform::DeviceIdiom::tablet);
    delegate = std::make_shared<tavrin::AppDelegate>();
    application->launch(delegate);
    window().resize(size);
    application->setActive(true);
    advance(1s);
}

void ProgramHouse::relaunch() {
    const platform::Size size = window().size();
    delegate.reset();
    launch(size);
}

void ProgramHouse::advance(platform::Duration time) {
    settle();
    clock->advance(time, [this] { settle(); });
    settle();
}

tavrin::NavController& ProgramHouse::nav() const {
    return dynamic_cast<tavrin::NavController&>(*delegate->mainWindow()->rootViewController());
}

std::vector<std::string> ProgramHouse::shown() const {
    std::vector<std::string> names;
    if (const auto top = list())
        for (const platform::Url& url : top->containedItems())
            names.emplace_back(url.lastPathComponent());
    return names;
}

bool ProgramHouse::untilShows(const std::string& name) {
    return until([&] {
        const std::vector<std::string> names = shown();
        return std::ranges::find(names, name) != names.end();
    });
}

void ProgramHouse::calmDown() {
    for (int quiet = 0; quiet < 3; ++quiet) {
        QTimer limit;
        limit.setSingleShot(true);
        limit.start(std::chrono::milliseconds(40));
        while (limit.isActive())
            QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
        advance(20ms);
    }
}

std::vector<std::string> ProgramHouse::titles() const {
    std::vector<std::string> titles;
    for (const auto& screen : nav().viewControllers())
        titles.push_back(screen->title());
    return titles;
}

platform::Url ProgramHouse::row(const std::string& name) const {
    for (const platform::Url& url : list()->containedItems())
        if (url.lastPathComponent() == name)
            return url;
    throw std::runtime_error("there is no row " + name);
}

void ProgramHouse::open(const std::string& name) {
    if (!untilShows(name))
        throw std::runtime_error("there is no row " + name);
    const platform::Url url = row(name);
    if (std::filesystem::is_directory(url.path()))
        nav().documentListControllerDidSelectContainerWithViewController(
            *list(), platform::DocumentListController::createForURL(url));
    else
        nav().documentListControllerDidSelectItemAtURL(*list(), url);
    advance(1s);
}

platform::AlertController* ProgramHouse::alert() {
    settle();
    return dynamic_cast<platform::AlertController*>(topPresented().get());
}

std::string ProgramHouse::alertText() {
    const platform::AlertController* const shown = alert();
    return shown ? shown->alertTitle() + ": " + shown->message() : "";
}

void ProgramHouse::savePicture(const std::string& file, double scale) {
    std::filesystem::create_directories(std::filesystem::path(file).parent_path());
    const platform::Bytes png = window().snapshotPng(scale);
    std::ofstream(file, std::ios::binary)
        .write(reinterpret_cast<const char*>(png.data()), static_cast<std::streamsize>(png.size()));
}

} // namespace test
