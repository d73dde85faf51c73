#include "tests/acceptance/Desk.h"

#include <QDBusMessage>
#include <QGuiApplication>
#include <QPixmap>
#include <QScreen>

#include <array>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <stdexcept>
#include <utility>

namespace test {
namespace {

namespace fs = std::filesystem;

void setVariable(const char* name, const std::string& value) {
    ::setenv(name, value.c_str(), 1);
}

} // namespace

Desk::Desk() : programs_(fs::read_symlink("/proc/self/exe").parent_path()) {
    furnish();
    openScreen();
    openBuses();
}

Desk::~Desk() {
    QDBusConnection::disconnectFromBus(QStringLiteral("accessibility"));
    accessibility_.reset();
    session_.reset();
    // Asked to go, for it takes its lock and its socket with it.
    screen_->kill(SIGTERM);
    screen_->wait();
}

void Desk::furnish() const {
    for (const auto& [variable, folder] :
         {std::pair("XDG_CONFIG_HOME", "config"), {"XDG_DATA_HOME", "data"},
          {"XDG_STATE_HOME", "state"}, {"XDG_CACHE_HOME", "cache"}, {"XDG_RUNTIME_DIR", "run"}}) {
        setVariable(variable, home_.makeFolder(folder));
        fs::permissions(home_ / folder, fs::perms::owner_all);
    }
    // Types, pictures and settings of the system, but none of its applications: documents stay here.
    const std::string system = home_.makeFolder("system");
    for (const char* const part : {"mime", "icons", "fonts", "glib-2.0"})
        fs::create_symlink(std::string("/usr/share/") + part, system + "/" + part);
    setVariable("XDG_DATA_DIRS", system);
    setVariable("XDG_CONFIG_DIRS", system);
    setVariable("HOME", home_.path());
    setVariable("LC_ALL", "C.UTF-8");
    setVariable("QT_QPA_PLATFORM", "xcb");
    setVariable("QT_SCALE_FACTOR", "1");
    setVariable("QT_LINUX_ACCESSIBILITY_ALWAYS_ON", "1");
    setVariable("PELMORA_NETWORK", "wifi");
    setVariable("PELMORA_DEVICE", "tablet");
    for (const char* const foreign : {"WAYLAND_DISPLAY", "XAUTHORITY", "DBUS_SYSTEM_BUS_ADDRESS",
                                      "AT_SPI_BUS_ADDRESS", "LANGUAGE", "QT_ACCESSIBILITY"})
        ::unsetenv(foreign);
}

void Desk::openScreen() {
    screen_ = std::make_unique<Program>(Program::Start{{"Xvfb", "-displayfd", "1", "-screen", "0",
                                                        "1280x900x24", "-nolisten", "tcp",
                                                        "-noreset"}});
    const std::optional<std::string> number = screen_->readLine();
    if (!number)
        throw std::runtime_error("Xvfb does not start (package xvfb)");
    setVariable("DISPLAY", ":" + *number);
}

void Desk::openBuses() {
    session_ = std::make_unique<PrivateBus>(home_ / "run");
    if (!session_->works())
        throw std::runtime_error("dbus-daemon does not start (package dbus)");
    setVariable("DBUS_SESSION_BUS_ADDRESS", session_->address());
    QDBusConnection session = QDBusConnection::connectToBus(
        QString::fromStdString(session_->address()), QStringLiteral("session of the story"));
    // The first who asks makes the session bus start it.
    const QDBusMessage answer = session.call(QDBusMessage::createMethodCall(
        QStringLiteral("org.a11y.Bus"), QStringLiteral("/org/a11y/bus"),
        QStringLiteral("org.a11y.Bus"), QStringLiteral("GetAddress")));
    QDBusConnection::disconnectFromBus(session.name());
    if (answer.type() != QDBusMessage::ReplyMessage)
        throw std::runtime_error("the accessibility bus does not start (package at-spi2-core): " +
                                 answer.errorMessage().toStdString());
    accessibility_ = QDBusConnection::connectToBus(answer.arguments().front().toString(),
                                                   QStringLiteral("accessibility"));
}

std::unique_ptr<Program> Desk::start(const std::string& program,
                                     const std::vector<std::string>& arguments) const {
    std::vector<std::string> line{programs_ + "/" + program};
    line.insert(line.end(), arguments.begin(), arguments.end());
    return std::make_unique<Program>(Program::Start{std::move(line)});
}

Outcome Desk::run(const std::string& program, const std::vector<std::string>& arguments) const {
    std::vector<std::string> line{programs_ + "/" + program};
    line.insert(line.end(), arguments.begin(), arguments.end());
    return test::run({std::move(line)});
}

void Desk::savePicture(const std::string& file) const {
    run("acceptance_tests", {pictureCommand, file});
}

int Desk::takePicture(const std::string& file) {
    int count = 1;
    std::string name = "camera";
    std::array<char*, 2> names{name.data(), nullptr};
    const QGuiApplication camera(count, names.data());
    const QPixmap picture = QGuiApplication::primaryScreen()->grabWindow(0);
    return picture.save(QString::fromStdString(file)) ? 0 : 1;
}

} // namespace test
