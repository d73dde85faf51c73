#include "tests/launch/Desk.h"

#include "platform/base/Process.h"

#include <filesystem>
#include <fstream>

namespace test {

using namespace platform;

namespace {

/// The machine's types, but none of its applications. Whoever has read them comes back to them.
std::string typesAlone() {
    static const TemporaryFolder folder;
    static const bool linked = [] {
        std::filesystem::create_symlink("/usr/share/mime", folder / "mime");
        return true;
    }();
    return linked ? folder.path() : "";
}

} // namespace

Desk::Desk() {
    house.home.makeFolder("bin");
    set("XDG_DATA_DIRS", house.home / "system" + ":" + typesAlone());
    set("XDG_CONFIG_DIRS", house.home / "etc");
    set("XDG_CURRENT_DESKTOP", "Quiet:Calm");
    set("PATH", house.home / "bin" + ":/usr/bin:/bin");
    set("LC_ALL", "C.UTF-8");
}

Desk::~Desk() {
    for (auto each = former_.rbegin(); each != former_.rend(); ++each)
        setEnvironmentVariable(each->first, each->second);
}

void Desk::set(const char* variable, const std::optional<std::string>& value) {
    former_.emplace_back(variable, environmentVariable(variable));
    setEnvironmentVariable(variable, value);
}

void Desk::givenApplication(const std::string& id, const std::string& name,
                            const std::string& lines, const std::string& place) {
    house.home.write(place + "/applications/" + id + ".desktop",
                     "[Desktop Entry]\nType=Application\nName=" + name + "\n" + lines + "\n");
}

std::string Desk::givenProgram(const std::string& name, int status) {
    // Renamed into place, so that whoever finds it finds it whole.
    const std::string path = house.home.write(
        "bin/" + name,
        "#!/bin/sh\nprintf '%s\\n' \"$@\" > \"$0.part\"\n/bin/mv \"$0.part\" \"$0.said\"\n"
        "exit " +
            std::to_string(status) + "\n");
    std::filesystem::permissions(path, std::filesystem::perms::owner_all);
    return path;
}

std::optional<std::vector<std::string>> Desk::argumentsOf(const std::string& name) {
    const std::string path = "bin/" + name + ".said";
    // The end of a program wakes the loop.
    if (!house.until([&] { return house.home.has(path); }))
        return std::nullopt;
    std::vector<std::string> lines;
    std::ifstream said(house.home / path);
    for (std::string line; std::getline(said, line);)
        lines.push_back(line);
    return lines;
}

void Desk::open(Size size) {
    house.signIn();
    house.openWindow(size);
    auto screen = std::make_shared<ViewController>();
    screen->setTitle("Documents");
    house.show({screen});
}

} // namespace test
