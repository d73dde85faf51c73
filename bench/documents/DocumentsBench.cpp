// Measures the list of a large folder, each time beside what the machine itself needs in the same
// run: from the wish to see it to its first rows on screen, against the bare system calls that read
// the folder; the longest time for which the main thread does not answer meanwhile, against an idle
// program; a scrolled frame, against the same texts drawn by hand; a change in the folder until it
// is on screen, against the kernel's bare notice of it. Wants a folder on the disk that is meant.
//
//   QT_QPA_PLATFORM=offscreen documents_bench FOLDER [ENTRIES]

#include "bench/documents/References.h"
#include "platform/Platform.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/CloudService.h"
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
#include <fcntl.h>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <thread>
#include <unistd.h>
#include <vector>

namespace {

using namespace platform;
namespace fs = std::filesystem;

constexpr int rounds = 9;
constexpr int frames = 600;
constexpr int changes = 60;

double at(std::vector<double> figures, double share) {
    std::sort(figures.begin(), figures.end());
    return figures[static_cast<std::size_t>(share * static_cast<double>(figures.size() - 1))];
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
                std::this_thread::sleep_for(std::chrono::microseconds(100));
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
        elsewhere = home + "/elsewhere";
        fs::create_directories(elsewhere);
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

    /// Until the account has all of it, so that nothing is sent while the list is measured.
    void sendAll() const {
        std::atomic<bool> sent = false;
        platform->cloud().sync([&](const Failure&) { sent = true; });
        while (!sent)
            QCoreApplication::processEvents(QEventLoop::AllEvents, 50);
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
    /// A folder outside the store.
    std::string elsewhere;
    std::unique_ptr<Platform> platform;
    std::unique_ptr<Application> application;
    std::unique_ptr<Window> window;
    std::shared_ptr<NavigationController> navigation;
    std::shared_ptr<DocumentListController> list;
};

void settle(std::chrono::milliseconds time = std::chrono::milliseconds(300)) {
    const auto start = SteadyClock::now();
    while (SteadyClock::now() - start < time)
        QCoreApplication::processEvents(QEventLoop::AllEvents, 5);
}

/// A row of the table in bench/README.md.
void print(const char* what, const char* reference, const std::vector<double>& ours,
           const std::vector<double>& bare) {
    std::printf("| %s | %.2f ms, 99 of 100 within %.2f ms | %s %.2f ms | %.2f |\n", what,
                at(ours, 0.5), at(ours, 0.99), reference, at(bare, 0.5),
                at(ours, 0.5) / at(bare, 0.5));
}

double frameAt(ListWidget& widget, double offset) {
    const auto start = SteadyClock::now();
    widget.state().scrolling.jumpTo(offset);
    widget.repaint();
    return millisecondsSince(start);
}

void measureOpening(Screen& screen, const std::string& folder) {
    std::vector<double> ours;
    std::vector<double> bare;
    std::vector<double> blocks;
    std::vector<double> idle;
    for (int i = 0; i < rounds; ++i) {
        bare.push_back(bareReading(folder));
        ours.push_back(screen.open(folder));
        settle();
        Heartbeat nothing;
        settle();
        idle.push_back(nothing.stop());
        Heartbeat heartbeat;
        screen.open(folder);
        settle();
        blocks.push_back(heartbeat.stop());
    }
    print("first rows on screen", "getdents64 + statx over it", ours, bare);
    print("longest silence of the main thread meanwhile", "idle", blocks, idle);
}

void measureScrolling(Screen& screen) {
    ListWidget& widget = screen.list->impl().list->widget();
    Scrolling& scrolling = widget.state().scrolling;
    std::vector<double> times;
    std::vector<double> jumps;
    std::vector<double> bare;
    for (int i = 0; i < frames; ++i) {
        times.push_back(frameAt(widget, scrolling.offset() + 37));
        QCoreApplication::processEvents();
        bare.push_back(bareFrame(widget));
    }
    for (int i = 0; i < frames; ++i) {
        jumps.push_back(frameAt(widget, scrolling.maximum() * (i * 7919 % frames) / frames));
        QCoreApplication::processEvents();
    }
    print("a frame scrolled on", "white and the same texts by hand", times, bare);
    print("a frame far away, of rows never seen", "the same", jumps, bare);
}

/// From a change on the disk to the paint that shows it.
double shownChange(Screen& screen, const std::function<void()>& change, std::size_t count) {
    PaintWatch watch;
    screen.list->impl().list->widget().installEventFilter(&watch);
    const auto start = SteadyClock::now();
    change();
    for (;;) {
        QCoreApplication::processEvents(QEventLoop::WaitForMoreEvents);
        if (screen.list->containedItemCount() != count)
            watch.painted = false;
        else if (watch.painted)
            return millisecondsSince(start);
    }
}

void measureChanges(Screen& screen, const std::string& folder) {
    DocumentListController& list = *screen.list;
    const std::size_t count = list.containedItemCount();
    Scrolling& scrolling = list.impl().list->widget().state().scrolling;
    list.setEditing(true, false);
    list.setSelectedItems({list.impl().model->urlAt(count / 2)});
    scrolling.jumpTo(scrolling.maximum() / 2);
    settle();
    const RowId top = list.impl().model->idAt(list.impl().list->widget().state().firstInView());
    const std::string file = folder + "/A new one.jpg";
    std::vector<double> made;
    std::vector<double> gone;
    std::vector<double> bare;
    for (int i = 0; i < changes; ++i) {
        made.push_back(shownChange(
            screen, [&] { ::close(::open(file.c_str(), O_CREAT | O_WRONLY | O_CLOEXEC, 0644)); },
            count + 1));
        settle(std::chrono::milliseconds(30));
        gone.push_back(shownChange(
            screen, [&] { ::unlink(file.c_str()); }, count));
        settle(std::chrono::milliseconds(30));
        bare.push_back(bareChange(screen.elsewhere, screen.elsewhere + "/new.jpg"));
    }
    print("a new file on screen", "creat until inotify tells", made, bare);
    print("a file gone from the screen", "the same", gone, bare);
    const RowId now = list.impl().model->idAt(list.impl().list->widget().state().firstInView());
    std::printf("scroll place %s, selection %s\n", now == top ? "kept" : "LOST",
                list.selectedItemCount() == 1 ? "kept" : "LOST");
    list.setEditing(false, false);
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
        screen.sendAll();
        std::printf("%d entries\n", entries);
        screen.open(folder);
        measureOpening(screen, folder);
        measureScrolling(screen);
        measureChanges(screen, folder);
    }
    fs::remove_all(home);
    return 0;
}
