#include "bench/layout/Screens.h"

#include <benchmark/benchmark.h>

#include <algorithm>
#include <cstdio>
#include <iostream>
#include <map>

namespace {

using bench::Screen;
using platform::LayoutEngine;

using MakeScreen = std::unique_ptr<Screen> (*)(std::size_t views);

/// From nothing to every frame: what a new screen costs. Making views and constraints is not part
/// of it.
void wholePass(benchmark::State& state, MakeScreen make) {
    const auto screen = make(static_cast<std::size_t>(state.range(0)));
    for (auto _ : state) {
        LayoutEngine engine;
        screen->addTo(engine);
        engine.solve();
    }
}

void resize(benchmark::State& state, MakeScreen make) {
    const auto screen = make(static_cast<std::size_t>(state.range(0)));
    LayoutEngine engine;
    screen->addTo(engine);
    engine.solve();
    double by = 0;
    for (auto _ : state) {
        by = by < 60 ? by + 7 : 0;
        engine.setRootSize({screen->size.width - by, screen->size.height - by});
        engine.solve();
    }
}

void changeConstant(benchmark::State& state, MakeScreen make) {
    const auto screen = make(static_cast<std::size_t>(state.range(0)));
    LayoutEngine engine;
    screen->addTo(engine);
    engine.solve();
    const double constant = screen->changing->constant();
    double by = 0;
    for (auto _ : state) {
        by = by < 10 ? by + 1 : 0;
        screen->changing->setConstant(constant + by);
        engine.solve();
    }
}

void changeContent(benchmark::State& state, MakeScreen make) {
    const auto screen = make(static_cast<std::size_t>(state.range(0)));
    LayoutEngine engine;
    screen->addTo(engine);
    engine.solve();
    const bench::Size natural = screen->changingContent->natural;
    double by = 0;
    for (auto _ : state) {
        by = by < 10 ? by + 1 : 0;
        screen->changingContent->natural = {natural.width + by, natural.height + by};
        engine.itemChanged(*screen->changingContent);
        engine.solve();
    }
}

/// A view leaves the window and comes back.
void leaveAndReturn(benchmark::State& state, MakeScreen make) {
    const auto screen = make(static_cast<std::size_t>(state.range(0)));
    LayoutEngine engine;
    screen->addTo(engine);
    engine.solve();
    for (auto _ : state) {
        engine.removeItem(*screen->changingContent);
        engine.solve();
        engine.addItem(*screen->changingContent);
        engine.solve();
    }
}

void byHand(benchmark::State& state) {
    for (auto _ : state)
        benchmark::DoNotOptimize(
            bench::listOfRowsByHand(static_cast<std::size_t>(state.range(0)), {360, 640}));
}

constexpr int few = 40;
constexpr int many = 500;

/// Prints as usual, and after all what a view more costs: linear growth would be many / few.
class Growth : public benchmark::ConsoleReporter {
public:
    void ReportRuns(const std::vector<Run>& runs) override {
        ConsoleReporter::ReportRuns(runs);
        for (const Run& run : runs)
            if (run.run_type == Run::RT_Iteration)
                times_[run.run_name.function_name][std::stoi(run.run_name.args)].push_back(
                    run.GetAdjustedRealTime());
    }
    void Finalize() override {
        std::printf("\n%-34s %10s %10s %8s   (linear: %.1f)\n", "median, us", "40 views",
                    "500 views", "ratio", double(many) / few);
        for (const auto& [name, bySize] : times_) {
            if (!bySize.contains(few) || !bySize.contains(many))
                continue;
            const double small = median(bySize.at(few));
            const double large = median(bySize.at(many));
            std::printf("%-34s %10.1f %10.1f %8.1f\n", name.c_str(), small, large, large / small);
        }
    }

private:
    static double median(std::vector<double> values) {
        std::sort(values.begin(), values.end());
        return values[values.size() / 2];
    }
    std::map<std::string, std::map<int, std::vector<double>>> times_;
};

/// The benchmark's reference has to lay out what the engine lays out.
bool isSameAsByHand(std::size_t views) {
    const auto screen = bench::listOfRows(views);
    LayoutEngine engine;
    screen->addTo(engine);
    engine.solve();
    const auto frames = bench::listOfRowsByHand(views, screen->size);
    for (std::size_t i = 0; i < frames.size(); ++i)
        if (!(frames[i] == screen->boxes[i]->frame))
            return false;
    return frames.size() == screen->boxes.size();
}

} // namespace

int main(int argc, char** argv) {
    if (!isSameAsByHand(few) || !isSameAsByHand(many)) {
        std::cerr << "The engine and the arithmetic disagree\n";
        return 1;
    }
    const std::vector<std::pair<std::string, MakeScreen>> screens = {
        {"rows", bench::listOfRows},
        {"longNames", bench::listOfLongNames},
        {"texts", bench::listOfTexts},
        {"oneStack", bench::oneStack},
        {"overfullStack", bench::overfullStack},
        {"equalShares", bench::equalShares},
        {"stacksInStacks", bench::stacksInStacks}};
    const std::vector<std::pair<std::string, void (*)(benchmark::State&, MakeScreen)>> works = {
        {"whole", wholePass},
        {"resize", resize},
        {"constant", changeConstant},
        {"content", changeContent},
        {"return", leaveAndReturn}};
    const auto configure = [](benchmark::internal::Benchmark* made) {
        made->Arg(few)->Arg(many)->Unit(benchmark::kMicrosecond);
    };
    for (const auto& [screenName, make] : screens)
        for (const auto& [workName, work] : works)
            configure(
                benchmark::RegisterBenchmark((screenName + "_" + workName).c_str(), work, make));
    configure(benchmark::RegisterBenchmark("rows_byHand", byHand));
    benchmark::Initialize(&argc, argv);
    Growth growth;
    benchmark::RunSpecifiedBenchmarks(&growth);
    benchmark::Shutdown();
    return 0;
}
