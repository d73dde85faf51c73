// Measures thumbnails: a frame of a folder of pictures that is scrolled while they are made, with
// all that the main thread does for them between two frames, beside the same folder when all have
// been made; and the large thumbnail of a document that has one, beside a bare decode of its PNG.
// Wants a folder on the disk that is meant.
//
//   TMPDIR=FOLDER QT_QPA_PLATFORM=offscreen thumbnails_bench [PICTURES]

#include "bench/documents/References.h"
#include "items/VXItem.h"
#include "platform/documents/DocumentThumbnail.h"
#include "platform/documents/ListScreen.h"
#include "platform/documents/list/ListWidget.h"
#include "platform/launch/ThumbnailCache.h"
#include "tests/documents/SampleDocuments.h"
#include "tests/documents/ScreenHouse.h"

#include <QImage>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <ctime>
#include <filesystem>
#include <vector>

namespace {

using namespace platform;
namespace fs = std::filesystem;

constexpr int frames = 600;
constexpr int rounds = 60;

double at(std::vector<double> figures, double share) {
    std::sort(figures.begin(), figures.end());
    return figures[static_cast<std::size_t>(share * static_cast<double>(figures.size() - 1))];
}

void print(const char* what, const std::vector<double>& ours, const char* reference,
           const std::vector<double>& bare) {
    std::printf("| %s | %.2f ms, 99 of 100 within %.2f ms | %s %.2f ms | %.2f |\n", what,
                at(ours, 0.5), at(ours, 0.99), reference, at(bare, 0.5),
                at(ours, 0.5) / at(bare, 0.5));
}

void dateBack(const std::string& file) {
    fs::last_write_time(file, fs::file_time_type::clock::now() - std::chrono::hours(24));
}

struct Scrolled {
    std::vector<double> times;
    /// What the frames cost the main thread itself, however busy the machine is.
    std::vector<double> work;
    std::size_t pictures = 0;
};

double workOfThread() {
    timespec time{};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &time);
    return static_cast<double>(time.tv_sec) * 1e3 + static_cast<double>(time.tv_nsec) / 1e6;
}

/// Scrolls on by half a row a frame; what came in between is part of the frame.
Scrolled scroll(test::ScreenHouse& house, ListWidget& widget) {
    Scrolled scrolled;
    widget.state().scrolling.jumpTo(0);
    for (int i = 0; i < frames; ++i) {
        const auto start = SteadyClock::now();
        const double work = workOfThread();
        house.runPending();
        widget.state().scrolling.jumpTo(widget.state().scrolling.offset() + 32);
        widget.repaint();
        scrolled.times.push_back(millisecondsSince(start));
        scrolled.work.push_back(workOfThread() - work);
        const ListState& state = widget.state();
        for (std::size_t row = state.firstInView(); row < state.endInView(); ++row)
            scrolled.pictures += state.lookOf(row).thumbnail.empty() ? 0 : 1;
    }
    return scrolled;
}

void measureScrolling(test::ScreenHouse& house, int count) {
    const std::string photo = test::turnedPhoto(1600, 1200);
    for (int i = 0; i < count; ++i)
        dateBack(house.givenFile("Pictures/IMG " + std::to_string(i) + ".jpg", photo));
    const auto list = house.showList("Pictures");
    house.until([&] { return list->containedItemCount() == static_cast<std::size_t>(count); });
    house.settle();
    ListWidget& widget = list->impl().list->widget();
    const Scrolled making = scroll(house, widget);
    for (std::size_t row = 0; row < static_cast<std::size_t>(frames) / 2; row += 8) {
        widget.state().scrolling.jumpTo(static_cast<double>(row) * 64);
        house.until([&] { return !widget.state().lookOf(row + 4).thumbnail.empty(); });
    }
    const Scrolled made = scroll(house, widget);
    print("a frame scrolled on while thumbnails are made", making.times, "when they are made",
          made.times);
    print("its processor time", making.work, "when they are made", made.work);
    std::printf(
        "pictures seen meanwhile: %zu, afterwards %zu; then 99 of 100 frames within %.2f ms\n",
        making.pictures, made.pictures, at(made.times, 0.99));
}

void measureCached(test::ScreenHouse& house) {
    const std::string file = house.givenFile("Coast.png", test::pngPicture(1600, 1200));
    dateBack(file);
    tavrin::VXItem item(Url::file(file));
    bool there = false;
    const DocumentThumbnail making(*item.resolvedURL(), *item.contentModificationDate(),
                                   *item.typeIdentifier(), [&](const Image&) { there = true; });
    house.until([&] { return there; });
    const auto folder =
        fs::path(static_cast<std::string>(house.home / "cache/thumbnails/xx-large"));
    const QString png = QString::fromStdString(fs::directory_iterator(folder)->path().string());
    std::vector<double> ours;
    std::vector<double> bare;
    for (int i = 0; i < rounds; ++i) {
        auto start = SteadyClock::now();
        item.setThumbnailFetched(false);
        if (item.thumbnail().empty())
            std::exit(1);
        ours.push_back(millisecondsSince(start));
        start = SteadyClock::now();
        if (QImage(png).isNull())
            std::exit(1);
        bare.push_back(millisecondsSince(start));
    }
    print("a large thumbnail that was made before", ours, "bare decode of its PNG", bare);
}

} // namespace

int main(int argc, char** argv) {
    test::ScreenHouse house;
    house.signIn();
    house.openWindow({1024, 768});
    measureCached(house);
    measureScrolling(house, argc > 1 ? std::atoi(argv[1]) : 5'000);
    return 0;
}
