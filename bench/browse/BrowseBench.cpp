// Measures what managing many items costs: moving files between two folders, beside `mv`; deleting
// a folder, beside `rm -r`; and the title and the buttons of edit mode while very many items are
// selected. The references run in the same moment, on files of the same kind on the same disk.
//
//   QT_QPA_PLATFORM=offscreen browse_bench [ROUNDS]

#include "items/FileUtils.h"
#include "platform/cloud/CloudService.h"
#include "tests/product/ProgramHouse.h"

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <unistd.h>
#include <vector>

namespace {

using namespace platform;
namespace fs = std::filesystem;

constexpr int movedFiles = 1'000;
constexpr int deletedFiles = 10'000;
constexpr int selectedItems = 100'000;
int rounds = 15;

double milliseconds(const std::function<void()>& work) {
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start)
        .count();
}

double at(std::vector<double> figures, double share) {
    std::sort(figures.begin(), figures.end());
    return figures[static_cast<std::size_t>(share * static_cast<double>(figures.size() - 1))];
}

void report(const char* what, const std::vector<double>& ours, const char* reference,
            const std::vector<double>& theirs) {
    std::printf("%-42s %8.2f ms (worst %.2f)   %-8s %8.2f ms   ratio %.2f\n", what, at(ours, 0.5),
                at(ours, 1), reference, at(theirs, 0.5), at(ours, 0.5) / at(theirs, 0.5));
}

void makeFiles(const std::string& folder, int count) {
    fs::create_directories(folder);
    for (int i = 0; i < count; ++i) {
        const std::string file = folder + "/Holiday photo " + std::to_string(i) + ".jpg";
        const int made = ::open(file.c_str(), O_CREAT | O_WRONLY | O_CLOEXEC, 0644);
        if (::write(made, "picture", 7) != 7)
            std::exit(1);
        ::close(made);
    }
}

void shell(const std::string& line) {
    if (std::system(line.c_str()) != 0)
        std::exit(1);
}

/// The program with its window on a store, and a folder outside it for the references.
struct Bench : test::ProgramHouse {
    Bench() {
        signIn();
        fs::create_directories(other);
        launch();
    }
    /// Until the account has all that is in the store.
    void sendAll() {
        const auto sent = std::make_shared<bool>(false);
        platform->cloud().sync([this, sent](const Failure&) {
            platform->mainQueue().async([sent] { *sent = true; });
        });
        while (!until([&] { return *sent; }))
            ;
    }
    std::vector<Url> children(const std::string& folder, int count) const {
        std::vector<Url> urls;
        for (int i = 0; i < count; ++i)
            urls.push_back(url(folder + "/Holiday photo " + std::to_string(i) + ".jpg"));
        return urls;
    }
    const std::string other = home / "other";
};

/// To and fro between two folders that the account knows.
void measureMoving(Bench& bench) {
    makeFiles(bench.path("Here"), movedFiles);
    fs::create_directories(bench.path("There"));
    makeFiles(bench.other + "/Here", movedFiles);
    fs::create_directories(bench.other + "/There");
    bench.sendAll();
    std::vector<double> ours;
    std::vector<double> theirs;
    std::string from = "Here";
    std::string to = "There";
    for (int round = 0; round < rounds; ++round) {
        const std::vector<Url> items = bench.children(from, movedFiles);
        const Url target = bench.url(to);
        ours.push_back(milliseconds([&] {
            if (!tavrin::NavController::moveItemsToDirectory(items, target).empty())
                std::exit(1);
        }));
        theirs.push_back(milliseconds(
            [&] { shell("cd '" + bench.other + "/" + from + "' && mv -- * ../" + to); }));
        bench.sendAll();
        std::swap(from, to);
    }
    report("moving 1,000 files", ours, "mv", theirs);
}

void measureDeleting(Bench& bench) {
    std::vector<double> ours;
    std::vector<double> theirs;
    for (int round = 0; round < std::max(1, rounds / 3); ++round) {
        makeFiles(bench.path("Big"), deletedFiles);
        makeFiles(bench.other + "/Big", deletedFiles);
        bench.sendAll();
        ours.push_back(milliseconds([&] {
            if (tavrin::FileUtils::remove(bench.url("Big")))
                std::exit(1);
        }));
        theirs.push_back(milliseconds([&] { shell("rm -r '" + bench.other + "/Big'"); }));
        bench.sendAll();
    }
    report("deleting a folder of 10,000 files", ours, "rm -r", theirs);
}

void measureSelecting(Bench& bench) {
    makeFiles(bench.path("Huge"), selectedItems);
    bench.open("Documents");
    bench.open("Huge");
    bench.until([&] { return bench.list()->containedItemCount() == selectedItems; });
    bench.nav().beginEditMode();
    const double all = milliseconds([&] { bench.list()->performKeyCommand(KeyCommand::selectAll); });
    bench.settle();
    std::vector<double> updates;
    for (int i = 0; i < 20 * rounds; ++i)
        updates.push_back(milliseconds([&] { bench.nav().updateStatusUI(nullptr); }));
    std::printf("%-42s %8.3f ms, 99 of 100 within %.3f ms\n", "edit title of 100,000 selected items",
                at(updates, 0.5), at(updates, 0.99));
    std::printf("%-42s %8.2f ms\n", "selecting them with Ctrl+A", all);
}

} // namespace

int main(int argc, char** argv) {
    std::setvbuf(stdout, nullptr, _IOLBF, 0);
    if (argc > 1)
        rounds = std::max(1, std::atoi(argv[1]));
    Bench bench;
    measureMoving(bench);
    measureDeleting(bench);
    measureSelecting(bench);
    return 0;
}
