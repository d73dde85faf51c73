// Measures the list of a large folder: from the wish to see it to its first rows on screen, against
// the bare system calls that read the same folder; the longest time for which the main thread does
// not answer meanwhile; and a scrolled frame. Wants a folder on the disk that is meant.
//
//   QT_QPA_PLATFORM=offscreen documents_bench FOLDER [ENTRIES]

#include "platform/Platform.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/documents/ListScreen.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/ui/Application.h"
#include "platform/ui/NavigationController.h"
#include "platform/ui/Window.h"

#include <QCoreApplication>
#include <QEvent>
#include <QEventLoop>

#include <algorithm>
#include <atomic>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <dirent.h>
#include <fcntl.h>
#include <filesystem>
#include <memory>
#include <string>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>
#include <vector>

namespace {

using namespace platform;
namespace fs = std::filesystem;
using SteadyClock = std::chrono::steady_clock;

constexpr int rounds = 9;
constexpr int frames = 600;

double millisecondsSince(SteadyClock::time_point start) {
    return std::chrono::duration<double, std::milli>(SteadyClock::now() - start).count();
}

double at(std::vector<double> figures, double share) {
    std::sort(figures.begin(), figures.end());
    return figures[static_cast<std::size_t>(share * static_cast<double>(figures.size() - 1))];
}

/// Names by getdents64, attributes by statx: what any program must at least do to show them all.
double bareReading(const std::string& folder) {
    const auto start = SteadyClock::now();
    const int handle = ::open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC);
    std::vector<char> buffer(256 * 1024);
    std::vector<std::string> names;
    for (;;) {
        const ssize_t length = ::getdents64(handle, buffer.data(), buffer.size());
        if (length <= 0)
            break;
        for (ssize_t i = 0; i < length;) {
            const auto* entry = reinterpret_cast<const dirent64*>(buffer.data() + i);
            i += entry->d_reclen;
            names.emplace_back(entry->d_name);
        }
    }
    std::uint64_t bytes = 0;
    for (const std::string& name : names) {
        struct statx status {};
        if (::statx(handle, name.c_str(), AT_SYMLINK_NOFOLLOW, STATX_BASIC_STATS, &status) == 0)
            bytes += status.stx_size;
    }
    ::close(handle);
    return bytes == ~0ULL ? 0 : millisecondsSince(start);
}

/// Asks the main thread for a sign of life again and again, and notes the longest wait for one.
class Heartbeat {
public:
    Heartbeat() : thread_([this] { run(); }) {}
    double stop() {
        ended_ = true;
        while (!finished_)
            QCoreApplication::processEvents(QEventLoop::AllEvents, 1);
        thread_.join();
        return longest_;
    }

private:
    void run() {
        while (!ended_) {
            const auto asked = SteadyClock::now();
            std::atomic<bool> answered{false};
            QMetaObject::invokeMethod(
                QCoreApplication::instance(), [&answered] { answered = true; },
                Qt::QueuedConnection);
            while (!answered)
                std::this_thread::yield();
            longest_ = std::max(longest_, millisecondsSince(asked));
            std::this_thread::sleep_for(std::chrono::milliseconds(1));
        }
        finished_ = true;
    }
    std::atomic<bool> ended_{false};
    std::atomic<bool> finished_{false};
    double longest_ = 0;
    std::thread thread_;
};

class PaintWatch : public QObject {
public:
    bool eventFilter(QObject*, QEvent* event) override {
        painted = painted || event->type() == QEvent::Paint;
        return false;
    }
    bool painted = false;
};

struct Screen {
    explicit Screen(const std::string& home) {
        PlatformParts parts;
        Folders folders;
        folders.home = home;
        folders.config = home + "/config";
        folders.data = home + "/data";
        folders.state = home + "/state";
        folders.cache = home + "/cache";
        fs::create_directories(home + "/remote/Documents");
        AccountRecord account;
        account.kind = folderAccountKind;
        account.address = home + "/remote";
        account.identity = Bytes(16, std::byte{1});
        if (writeAccount(folders, account))
            std::exit(1);
        parts.folders = folders;
        platform = std::make_unique<Platform>(std::move(parts));
        application = std::make_unique<Application>(count, arguments);
        application->setIdiom(DeviceIdiom::tablet);
        window = std::make_unique<Window>(Rect{0, 0, 1024, 768});
        navigation = std::make_shared<NavigationController>();
        window->setRootViewController(navigation);
        window->makeKeyAndVisible();
        application->processPending();
    }

    std::string bigFolder(int entries) const {
        const std::string folder = platform->documents().shelfroot()->path() + "/Documents/Big";
        fs::create_directories(folder);
        for (int i = 0; i < entries; ++i) {
            const std::string file =
                folder + "/Holiday photo " + std::to_string(i * 7919 % entries) + ".jpg";
            ::close(::open(file.c_str(), O_CREAT | O_WRONLY | O_CLOEXEC, 0644));
        }
        return folder;
    }

    /// To the first paint with rows in it.
    double open(const std::string& folder) {
        const auto start = SteadyClock::now();
        list = DocumentListController::createForURL(Url::file(folder, true));
        navigation->setViewControllers({list}, false);
        PaintWatch watch;
        list->impl().list->widget().installEventFilter(&watch);
        for (;;) {
            QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
            if (list->containedItemCount() == 0)
                watch.painted = false;
            else if (watch.painted)
                return millisecondsSince(start);
        }
    }

    int count = 1;
    char name[6] = "bench";
    char* arguments[2] = {name, nullptr};
    std::unique_ptr<Platform> platform;
    std::unique_ptr<Application> application;
    std::unique_ptr<Window> window;
    std::shared_ptr<NavigationController> navigation;
    std::shared_ptr<DocumentListController> list;
};

void settle() {
    const auto start = SteadyClock::now();
    while (millisecondsSince(start) < 300)
        QCoreApplication::processEvents(QEventLoop::AllEvents, 20);
}

void measureOpening(Screen& screen, const std::string& folder) {
    std::vector<double> ours;
    std::vector<double> bare;
    std::vector<double> blocks;
    for (int i = 0; i < rounds; ++i) {
        bare.push_back(bareReading(folder));
        ours.push_back(screen.open(folder));
        settle();
        Heartbeat heartbeat;
        screen.open(folder);
        settle();
        blocks.push_back(heartbeat.stop());
    }
    std::printf("first rows on screen   median %7.1f ms   (getdents64 + statx %7.1f ms, ratio "
                "%.2f)\n",
                at(ours, 0.5), at(bare, 0.5), at(ours, 0.5) / at(bare, 0.5));
    std::printf("longest silence of the main thread   median %.1f ms, worst %.1f ms\n",
                at(blocks, 0.5), at(blocks, 1));
}

void measureScrolling(Screen& screen) {
    ListWidget& widget = screen.list->impl().list->widget();
    Scrolling& scrolling = widget.state().scrolling;
    std::vector<double> times;
    for (int i = 0; i < frames; ++i) {
        const auto start = SteadyClock::now();
        scrolling.jumpTo(scrolling.offset() + 37);
        widget.repaint();
        times.push_back(millisecondsSince(start));
        QCoreApplication::processEvents();
    }
    std::printf("a scrolled frame       median %7.2f ms, 95 of 100 within %.2f ms\n", at(times, 0.5),
                at(times, 0.95));
}

} // namespace

int main(int argc, char** argv) {
    if (argc < 2) {
        std::fprintf(stderr, "usage: documents_bench FOLDER [ENTRIES]\n");
        return 2;
    }
    const std::string home = std::string(argv[1]) + "/documents-bench";
    const int entries = argc > 2 ? std::atoi(argv[2]) : 100'000;
    {
        Screen screen(home);
        const std::string folder = screen.bigFolder(entries);
        std::printf("%d entries\n", entries);
        screen.open(folder);
        measureOpening(screen, folder);
        measureScrolling(screen);
    }
    fs::remove_all(home);
    return 0;
}
