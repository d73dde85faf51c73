// The question for a default application among 400 installed ones, as a tap on a document asks it.
// The reference reads the dates of as many files, which is the least that the answer needs.
#include "platform/base/ManualClock.h"
#include "platform/base/Process.h"
#include "platform/base/Runtime.h"
#include "platform/files/FileManager.h"
#include "platform/launch/ApplicationDatabase.h"
#include "platform/launch/ApplicationFolders.h"
#include "tests/support/TemporaryFolder.h"

#include <benchmark/benchmark.h>

namespace {

using namespace platform;

constexpr int installed = 400;
constexpr int languages = 60;

/// A desk with as many applications as a full desktop has, each with its name in many languages.
struct Desk {
    Desk() {
        setEnvironmentVariable("XDG_CONFIG_DIRS", home / "etc");
        setEnvironmentVariable("XDG_DATA_DIRS", home / "system");
        std::string names;
        for (int i = 0; i < languages; ++i)
            names += "Name[l" + std::to_string(i) + "]=A name\nComment[l" + std::to_string(i) +
                     "]=What this application is good for, in a sentence\n";
        for (int i = 0; i < installed; ++i)
            home.write("system/applications/app" + std::to_string(i) + ".desktop",
                       "[Desktop Entry]\nType=Application\nName=App\n" + names +
                           "Exec=sh %f\nMimeType=text/plain;image/x-kind" + std::to_string(i) +
                           ";\n");
        runtime.folders.config = home / "config";
        runtime.folders.data = home / "data";
        Runtime::install(&runtime);
    }
    ~Desk() { Runtime::install(nullptr); }
    Desk(const Desk&) = delete;
    Desk& operator=(const Desk&) = delete;

    test::TemporaryFolder home;
    ManualClock clock;
    MainQueue mainQueue{clock};
    NotificationCenter notifications;
    Runtime runtime{clock, mainQueue, notifications, Folders::fromProcessEnvironment()};
};

void datesAlone(benchmark::State& state) {
    const Desk desk;
    const std::string folder = desk.home / "system/applications/";
    for (auto _ : state) {
        const Result<std::vector<DirectoryEntry>> entries = FileManager::entries(folder);
        for (const DirectoryEntry& each : *entries)
            benchmark::DoNotOptimize(FileManager::attributes(folder + each.name, FollowLinks::yes));
    }
}
BENCHMARK(datesAlone)->Unit(benchmark::kMicrosecond);

void defaultApplication(benchmark::State& state) {
    const Desk desk;
    ApplicationDatabase& database = ApplicationDatabase::shared();
    for (auto _ : state)
        benchmark::DoNotOptimize(database.defaultFor("text/plain"));
}
BENCHMARK(defaultApplication)->Unit(benchmark::kMicrosecond);

void readingAllOfThem(benchmark::State& state) {
    const Desk desk;
    const ApplicationPlaces places = ApplicationPlaces::current();
    for (auto _ : state)
        benchmark::DoNotOptimize(readLevels(places, applicationFiles(places)));
}
BENCHMARK(readingAllOfThem)->Unit(benchmark::kMicrosecond);

} // namespace
