#include "bench/preview/PreviewBench.h"
#include "platform/Platform.h"
#include "platform/base/WorkQueue.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/files/Progress.h"
#include "preview/PreviewDownloadViewController.h"
#include "preview/PreviewItemManager.h"
#include "tests/documents/ScreenHouse.h"

#include <QCoreApplication>
#include <QEventLoop>

#include <atomic>
#include <cstdio>
#include <cstdlib>
#include <filesystem>

namespace {

using namespace platform;

constexpr int cancels = 50;

/// There and back: a queue, and the main queue again.
double bareHop(WorkQueue& queue, MainQueue& main) {
    bool back = false;
    const auto start = SteadyClock::now();
    queue.async([&] { main.async([&] { back = true; }); });
    while (!back)
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
    return millisecondsSince(start);
}

/// Files of downloads that did not end.
std::size_t partialFiles(const test::ScreenHouse& house) {
    std::size_t files = 0;
    for (const auto& entry :
         std::filesystem::recursive_directory_iterator(house.home / "data/pelmora"))
        files += entry.path().parent_path().filename() == "staging" ? 1 : 0;
    return files;
}

struct Ending {
    /// Until the button's action returned.
    double pressed = 0;
    /// Until the download was over and its end was told on the main thread.
    double over = 0;
};

class Downloads {
public:
    explicit Downloads(test::ScreenHouse& house)
        : house_(house), manager_(tavrin::PreviewItemManager::create()) {
        manager_->setNavigationController(house.navigation);
        item_ = std::make_shared<tavrin::VXItem>(house.url("Large.bin"));
        house.show({manager_->prepareToPreviewItem(item_)});
    }

    /// Lets the download run for so long after its first bytes, then presses the button.
    Ending cancelAfter(std::chrono::milliseconds time) {
        std::atomic<bool> running{false};
        const auto subscriber = house_.platform->fileProgress().addSubscriber(
            *item_->resolvedURL(), [&](const std::shared_ptr<Progress>& progress) {
                const auto observer = progress->addObserver([&](const Progress& each) {
                    if (each.completedUnitCount() > 0)
                        running = true;
                });
                return [progress, observer] { progress->removeObserver(observer); };
            });
        bool over = false;
        Failure result;
        const auto screen = manager_->downloadViewController();
        screen->setDownloading(true);
        manager_->startDownloading([&](const auto&, const auto&, const Failure& failure) {
            over = true;
            result = failure;
        });
        while (!running)
            QCoreApplication::processEvents(QEventLoop::AllEvents, 5);
        settle(time);
        Ending ending;
        const auto start = SteadyClock::now();
        screen->downloadView()->cancelDownloading();
        ending.pressed = millisecondsSince(start);
        while (!over)
            QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
        ending.over = millisecondsSince(start);
        house_.platform->fileProgress().removeSubscriber(subscriber);
        if (!result || !result->is(ErrorCode::userCancelled))
            std::abort();
        if (!house_.documents().isPromised(*item_->resolvedURL()) || partialFiles(house_) > 0)
            ++leftOvers_;
        return ending;
    }
    int leftOvers() const { return leftOvers_; }

private:
    test::ScreenHouse& house_;
    std::shared_ptr<tavrin::PreviewItemManager> manager_;
    std::shared_ptr<tavrin::VXItem> item_;
    int leftOvers_ = 0;
};

} // namespace

void measureCancelling(test::ScreenHouse& house) {
    WorkQueue queue("bench");
    Downloads downloads(house);
    std::vector<double> pressed;
    std::vector<double> over;
    std::vector<double> hops;
    for (int i = 0; i < cancels; ++i) {
        // At all moments of the 125 milliseconds for which the remote holds back each portion.
        const Ending ending = downloads.cancelAfter(std::chrono::milliseconds(i * 37 % 250));
        pressed.push_back(ending.pressed);
        over.push_back(ending.over);
        hops.push_back(bareHop(queue, house.platform->mainQueue()));
    }
    print("a press of Cancel Download until it returns", pressed, "to a queue and back", hops,
          "< 100 ms");
    print("until the download is over, nothing left of it", over, "the same", hops, "< 100 ms");
    std::printf("cancels that took longest: %.2f ms; promises lost or partial files left: %d\n",
                at(over, 1), downloads.leftOvers());
}
