#pragma once

#include "tests/support/PrivateBus.h"
#include "tests/support/Program.h"
#include "tests/support/TemporaryFolder.h"

#include <QDBusConnection>

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace test {

/// A desk of its own: a screen that nobody sees, a session bus, the accessibility bus on it, and a
/// home folder. Programs that are started on it find nothing of the desk that the test runs on.
/// There is one a process, for it is the process's own environment.
class Desk {
public:
    Desk();
    ~Desk();
    Desk(const Desk&) = delete;
    Desk& operator=(const Desk&) = delete;

    const TemporaryFolder& home() const { return home_; }
    /// Where programs keep a user's data, settings and state.
    std::string data() const { return home_ / "data"; }
    std::string state() const { return home_ / "state"; }
    const QDBusConnection& accessibility() const { return *accessibility_; }
    /// A program of the build, running.
    std::unique_ptr<Program> start(const std::string& program,
                                   const std::vector<std::string>& arguments = {}) const;
    /// The same to its end.
    Outcome run(const std::string& program, const std::vector<std::string>& arguments) const;
    /// What the screen shows, as a PNG. Another process takes it: the toolkit wants to find the
    /// screen when it starts.
    void savePicture(const std::string& file) const;
    static constexpr const char* pictureCommand = "--picture";
    /// What that process does; answers its exit status.
    static int takePicture(const std::string& file);

private:
    void furnish() const;
    void openScreen();
    void openBuses();

    TemporaryFolder home_;
    std::string programs_; // the folder of the build's programs
    std::unique_ptr<Program> screen_;
    std::unique_ptr<PrivateBus> session_;
    std::optional<QDBusConnection> accessibility_;
};

} // namespace test
