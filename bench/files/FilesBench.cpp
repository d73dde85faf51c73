// What the file floor costs over the bare system calls.
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"

#include "tests/support/TemporaryFolder.h"

#include <benchmark/benchmark.h>

#include <dirent.h>
#include <fcntl.h>
#include <map>
#include <memory>
#include <sys/stat.h>
#include <unistd.h>

using platform::FileCoordinator;
using platform::FileManager;
using platform::FollowLinks;
using platform::ReadingOptions;
using platform::Url;

namespace {

/// A folder with that many empty files; made once.
const std::string& folderOf(std::int64_t count) {
    static std::map<std::int64_t, std::unique_ptr<test::TemporaryFolder>> folders;
    auto& folder = folders[count];
    if (!folder) {
        folder = std::make_unique<test::TemporaryFolder>();
        for (std::int64_t i = 0; i < count; ++i)
            ::close(::creat((*folder / ("Document " + std::to_string(i) + ".pdf")).c_str(), 0600));
    }
    return folder->path();
}

template<class Take>
void bareEntries(const std::string& path, const Take& take) {
    const int folder = ::open(path.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    static char buffer[256 * 1024];
    for (ssize_t length; (length = ::getdents64(folder, buffer, sizeof buffer)) > 0;)
        for (ssize_t at = 0; at < length;) {
            const auto* entry = reinterpret_cast<const dirent64*>(buffer + at);
            at += entry->d_reclen;
            take(folder, entry->d_name);
        }
    ::close(folder);
}

void bareNames(benchmark::State& state) {
    const std::string& path = folderOf(state.range(0));
    for (auto _ : state)
        bareEntries(path, [](int, const char* name) { benchmark::DoNotOptimize(name); });
}
void entries(benchmark::State& state) {
    const std::string& path = folderOf(state.range(0));
    for (auto _ : state)
        benchmark::DoNotOptimize(FileManager::entries(path));
}
void enumerate(benchmark::State& state) {
    const std::string& path = folderOf(state.range(0));
    for (auto _ : state)
        benchmark::DoNotOptimize(FileManager::enumerate(path, [](const auto& entry) {
            benchmark::DoNotOptimize(&entry);
            return true;
        }));
}
void bareNamesAndAttributes(benchmark::State& state) {
    const std::string& path = folderOf(state.range(0));
    for (auto _ : state)
        bareEntries(path, [](int folder, const char* name) {
            struct statx info {};
            ::statx(folder, name, AT_SYMLINK_NOFOLLOW, STATX_BASIC_STATS | STATX_BTIME, &info);
            benchmark::DoNotOptimize(info);
        });
}
void enumerateWithAttributes(benchmark::State& state) {
    const std::string& path = folderOf(state.range(0));
    for (auto _ : state)
        benchmark::DoNotOptimize(FileManager::enumerate(path, [&path](const auto& entry) {
            benchmark::DoNotOptimize(
                FileManager::attributes(path + '/' + entry.name, FollowLinks::no));
            return true;
        }));
}
#define FOLDER_SIZES Arg(10'000)->Arg(100'000)->Unit(benchmark::kMillisecond)
BENCHMARK(bareNames)->FOLDER_SIZES;
BENCHMARK(enumerate)->FOLDER_SIZES;
BENCHMARK(entries)->FOLDER_SIZES;
BENCHMARK(bareNamesAndAttributes)->FOLDER_SIZES;
BENCHMARK(enumerateWithAttributes)->FOLDER_SIZES;

void bareStatx(benchmark::State& state) {
    const std::string path = folderOf(10) + "/Document 1.pdf";
    for (auto _ : state) {
        struct statx info {};
        ::statx(AT_FDCWD, path.c_str(), AT_SYMLINK_NOFOLLOW, STATX_BASIC_STATS | STATX_BTIME,
                &info);
        benchmark::DoNotOptimize(info);
    }
}
void attributes(benchmark::State& state) {
    const std::string path = folderOf(10) + "/Document 1.pdf";
    for (auto _ : state)
        benchmark::DoNotOptimize(FileManager::attributes(path, FollowLinks::no));
}
void coordinatedAttributes(benchmark::State& state) {
    const Url item = Url::file(folderOf(10) + "/Document 1.pdf");
    for (auto _ : state) {
        FileCoordinator coordinator;
        benchmark::DoNotOptimize(coordinator.coordinateReading(
            item, ReadingOptions::immediatelyAvailableMetadataOnly, [](const Url& url) {
                benchmark::DoNotOptimize(FileManager::attributes(url.path(), FollowLinks::no));
            }));
    }
}
BENCHMARK(bareStatx);
BENCHMARK(attributes);
BENCHMARK(coordinatedAttributes)->ThreadRange(1, 2);

void coordinatedEmptyWrite(benchmark::State& state) {
    const Url item = Url::file(folderOf(10) + "/Document 1.pdf");
    for (auto _ : state) {
        FileCoordinator coordinator;
        benchmark::DoNotOptimize(coordinator.coordinateWriting(
            item, platform::WritingOptions::forReplacing, [](const Url&) {}));
    }
}
BENCHMARK(coordinatedEmptyWrite);

void removeTree(benchmark::State& state) {
    for (auto _ : state) {
        state.PauseTiming();
        test::TemporaryFolder folder;
        for (int i = 0; i < 10'000; ++i)
            ::close(::creat((folder / ("Document " + std::to_string(i))).c_str(), 0600));
        state.ResumeTiming();
        benchmark::DoNotOptimize(FileManager::removeItem(Url::file(folder.path())));
    }
}
BENCHMARK(removeTree)->Unit(benchmark::kMillisecond)->Iterations(5);

} // namespace
