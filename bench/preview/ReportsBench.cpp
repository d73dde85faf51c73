#include "bench/preview/PreviewBench.h"
#include "platform/Platform.h"
#include "platform/files/Progress.h"
#include "preview/PreviewDownloadViewController.h"
#include "preview/PreviewItemManager.h"
#include "tests/documents/ScreenHouse.h"

#include <QCoreApplication>
#include <QEvent>
#include <QEventLoop>
#include <QWidget>

#include <algorithm>
#include <atomic>
#include <cstdio>
#include <ctime>
#include <map>
#include <thread>
#include <utility>

namespace {

using namespace platform;

constexpr int seconds = 4;
constexpr int rounds = 5;
constexpr int framesPerSecond = 60;
constexpr std::int64_t total = 1LL << 30;

/// Counts how often the window is painted anew. One repaint may paint several widgets.
class RepaintWatch : public QObject {
public:
    RepaintWatch() { QCoreApplication::instance()->installEventFilter(this); }
    bool eventFilter(QObject* object, QEvent* event) override {
        if (!object->isWidgetType())
            return false;
        if (event->type() == QEvent::UpdateRequest) {
            turned_ = true;
        } else if (event->type() == QEvent::Paint) {
            ++paints;
            if (std::exchange(turned_, false))
                ++repaints[static_cast<long>(millisecondsSince(start_) * framesPerSecond / 1000)];
        }
        return false;
    }
    std::size_t paints = 0;
    /// By the number of the frame in which they were.
    std::map<long, int> repaints;

private:
    const SteadyClock::time_point start_ = SteadyClock::now();
    bool turned_ = false;
};

/// A download as the transfers report it, from a thread of its own, at an even pace from 0 to 100
/// %.
class Reporter {
public:
    Reporter(Progress& progress, int perSecond)
        : thread_([this, &progress, perSecond] { run(progress, perSecond); }) {}
    ~Reporter() { thread_.join(); }
    bool isOver() const { return over_; }
    /// How many came in a second.
    double rate() const { return rate_; }

private:
    void run(Progress& progress, int perSecond) {
        const auto start = SteadyClock::now();
        const std::int64_t reports = std::int64_t{perSecond} * seconds;
        for (std::int64_t i = 1; i <= reports; ++i) {
            std::this_thread::sleep_until(start +
                                          std::chrono::nanoseconds(1'000'000'000) * i / perSecond);
            progress.update(total / reports * i, total);
        }
        std::this_thread::sleep_until(start + std::chrono::seconds(seconds));
        rate_ = static_cast<double>(reports) * 1000 / millisecondsSince(start);
        over_ = true;
        QMetaObject::invokeMethod(
            QCoreApplication::instance(), [] {}, Qt::QueuedConnection);
    }
    std::atomic<bool> over_{false};
    std::atomic<double> rate_{0};
    std::thread thread_;
};

double processorSeconds() {
    timespec time{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_nsec) / 1e9;
}

struct Cost {
    /// Of the main thread's time, in per cent.
    double share = 0;
    double repaintsPerSecond = 0;
    double paintsPerSecond = 0;
    double reportsPerSecond = 0;
    /// Per cent of the frames.
    double framesWithMore = 0;
};

Cost costOf(test::ScreenHouse& house, const Url& file,
            tavrin::PreviewDownloadViewController& screen, int perSecond) {
    screen.setDownloading(true);
    screen.registerForProgress();
    const auto progress = std::make_shared<Progress>(std::string(fileProgressKind), total);
    const auto published = house.platform->fileProgress().publish(file, progress);
    settle(std::chrono::milliseconds(100));
    RepaintWatch watch;
    const double before = processorSeconds();
    Reporter reporter(*progress, perSecond);
    while (!reporter.isOver())
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    Cost cost;
    cost.share = (processorSeconds() - before) * 100 / seconds;
    cost.reportsPerSecond = reporter.rate();
    cost.paintsPerSecond = static_cast<double>(watch.paints) / seconds;
    int repaints = 0;
    for (const auto& [frame, times] : watch.repaints) {
        repaints += times;
        cost.framesWithMore += times > 1 ? 100.0 / (seconds * framesPerSecond) : 0;
    }
    cost.repaintsPerSecond = static_cast<double>(repaints) / seconds;
    screen.unregisterProgress();
    screen.setDownloading(false);
    settle(std::chrono::milliseconds(100));
    return cost;
}

double median(const std::vector<Cost>& costs, double Cost::*figure) {
    std::vector<double> figures;
    for (const Cost& cost : costs)
        figures.push_back(cost.*figure);
    return at(figures, 0.5);
}

} // namespace

void measureReports(test::ScreenHouse& house) {
    const auto manager = tavrin::PreviewItemManager::create();
    manager->setNavigationController(house.navigation);
    const auto item = std::make_shared<tavrin::VXItem>(house.url("Large.bin"));
    house.show({manager->prepareToPreviewItem(item)});
    const auto screen = manager->downloadViewController();
    std::vector<Cost> many;
    std::vector<Cost> few;
    for (int i = 0; i < rounds; ++i) {
        few.push_back(costOf(house, *item->resolvedURL(), *screen, framesPerSecond));
        many.push_back(costOf(house, *item->resolvedURL(), *screen, 10'000));
    }
    std::printf("| repaints a second at %.0f reports a second | %.1f | at %.0f reports %.1f | %.2f "
                "| ≤ %d |\n",
                median(many, &Cost::reportsPerSecond), median(many, &Cost::repaintsPerSecond),
                median(few, &Cost::reportsPerSecond), median(few, &Cost::repaintsPerSecond),
                median(many, &Cost::repaintsPerSecond) / median(few, &Cost::repaintsPerSecond),
                framesPerSecond);
    std::printf("| processor time of the main thread meanwhile | %.1f %% | at %.0f reports %.1f %% "
                "| %.2f | – |\n",
                median(many, &Cost::share), median(few, &Cost::reportsPerSecond),
                median(few, &Cost::share), median(many, &Cost::share) / median(few, &Cost::share));
    std::printf("frames with more than one repaint: %.1f %%, at %.0f reports %.1f %%; widgets "
                "painted a second: %.1f, %.1f\n",
                median(many, &Cost::framesWithMore), median(few, &Cost::reportsPerSecond),
                median(few, &Cost::framesWithMore), median(many, &Cost::paintsPerSecond),
                median(few, &Cost::paintsPerSecond));
    house.show({std::make_shared<ViewController>()});
}
