// What the product's log call costs its caller, against one comparison of integers and against
// another asynchronous logger; and what the record of an item costs, against the system calls that
// it cannot do without. The figures of two rows compare within one run:
//
//   product_bench --benchmark_repetitions=21 --benchmark_enable_random_interleaving=true
//                 --benchmark_report_aggregates_only=true 2>/dev/null
#include "app/VXLogging.h"
#include "items/VXItem.h"
#include "platform/files/FileManager.h"
#include "platform/system/JotService.h"
#include "tests/documents/StoreHouse.h"

#include <benchmark/benchmark.h>
#include <spdlog/async.h>
#include <spdlog/sinks/null_sink.h>

#include <atomic>
#include <chrono>
#include <ctime>
#include <fcntl.h>
#include <memory>
#include <string>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <thread>

using namespace tavrin;

namespace {

/// Takes connections and makes no records: the log queue has nothing to do but the echo.
struct NullJot : platform::JotService {
    platform::JotHandle open(std::string_view /*sender*/, std::string_view /*facility*/,
                             std::uint32_t /*options*/) override {
        return 1;
    }
    void setFilter(platform::JotHandle /*handle*/, std::uint32_t /*mask*/) override {}
    std::unique_ptr<platform::JotRecord> createRecord() override { return nullptr; }
    void send(platform::JotHandle /*handle*/, const platform::JotRecord& /*record*/) override {}
    void close(platform::JotHandle /*handle*/) override {}
};

/// A store with one tagged file on the device; for the whole run.
test::StoreHouse& house() {
    static const auto made = [] {
        auto store = std::make_unique<test::StoreHouse>();
        store->adjustParts = [](platform::PlatformParts& parts) {
            parts.jot = std::make_unique<NullJot>();
            parts.markerExists = [](const std::string&) { return false; };
        };
        store->signIn();
        const std::string file = store->givenFile("Notes/Report.pdf", std::string(70'000, 'x'));
        if (platform::setExtendedAttribute(platform::Url::file(file), "user.xdg.tags", "Red,Work"))
            std::abort();
        return store;
    }();
    return *made;
}

constexpr int calls = 256;

void oneComparison(benchmark::State& state) {
    static std::atomic<int> threshold{6};
    for (auto _ : state)
        for (int i = 0; i < calls; ++i)
            if (threshold.load(std::memory_order_relaxed) >= vxDebug)
                benchmark::DoNotOptimize(i);
    state.SetItemsProcessed(state.iterations() * calls);
}
BENCHMARK(oneComparison);

void droppedCall(benchmark::State& state) {
    house();
    VXSetLogLevel(vxInfo);
    const std::string name = "Report.pdf";
    for (auto _ : state)
        for (int i = 0; i < calls; ++i)
            VXLOG(vxDebug, "Item %d is %@", i, name);
    state.SetItemsProcessed(state.iterations() * calls);
}
BENCHMARK(droppedCall);

double threadSeconds() {
    timespec time{};
    ::clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) * 1e-9;
}

/// Times `calls` calls; what they left to the other thread is waited for outside. The counter tells
/// the processor's time alone, for a machine that has other things to do.
template<class Call, class Drain>
void timeCalls(benchmark::State& state, const Call& call, const Drain& drain) {
    double processor = 0;
    for (auto _ : state) {
        const double before = threadSeconds();
        const auto start = std::chrono::steady_clock::now();
        for (int i = 0; i < calls; ++i)
            call(i);
        const std::chrono::duration<double> time = std::chrono::steady_clock::now() - start;
        processor += threadSeconds() - before;
        state.SetIterationTime(time.count());
        drain();
    }
    state.SetItemsProcessed(state.iterations() * calls);
    state.counters["processor_ns"] =
        processor * 1e9 / static_cast<double>(state.iterations() * calls);
}

void acceptedCall(benchmark::State& state) {
    house();
    VXSetLogLevel(vxInfo);
    const std::string name = "Report.pdf";
    timeCalls(
        state, [&](int i) { VXLOG(vxInfo, "Item %d is %@", i, name); },
        [] { VXJotClient::JotClient()->logQueue()->sync([] {}); });
}
BENCHMARK(acceptedCall)->UseManualTime();

void acceptedCallOfSpdlog(benchmark::State& state) {
    static const auto logger = [] {
        spdlog::init_thread_pool(8192, 1);
        return spdlog::create_async<spdlog::sinks::null_sink_mt>("bench");
    }();
    const std::string name = "Report.pdf";
    timeCalls(
        state,
        [&](int i) {
            logger->log(spdlog::source_loc{__FILE__, __LINE__, __func__}, spdlog::level::info,
                        "Item {} is {}", i, name);
        },
        [] {
            while (spdlog::thread_pool()->queue_size() != 0)
                std::this_thread::yield();
        });
}
BENCHMARK(acceptedCallOfSpdlog)->UseManualTime();

/// Kind, size, dates and identity; whether the extension is hidden; the tags. Names, type, parent
/// and container follow from the path, the download state from the file's being there.
void bareCallsOfAnItem(benchmark::State& state) {
    const std::string path = house().path("Notes/Report.pdf");
    for (auto _ : state) {
        struct statx info {};
        char tags[256];
        benchmark::DoNotOptimize(::statx(AT_FDCWD, path.c_str(), AT_SYMLINK_NOFOLLOW,
                                         STATX_BASIC_STATS | STATX_BTIME, &info));
        benchmark::DoNotOptimize(
            ::getxattr(path.c_str(), "user.pelmora.hidden-extension", nullptr, 0));
        benchmark::DoNotOptimize(::getxattr(path.c_str(), "user.xdg.tags", tags, sizeof tags));
    }
}
BENCHMARK(bareCallsOfAnItem);

void itemOfALocalFile(benchmark::State& state) {
    const platform::Url url = house().url("Notes/Report.pdf");
    for (auto _ : state) {
        const VXItem item(url);
        benchmark::DoNotOptimize(&item);
    }
}
BENCHMARK(itemOfALocalFile);

} // namespace

BENCHMARK_MAIN();
