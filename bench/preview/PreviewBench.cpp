// Measures the preview, each time beside what the machine itself needs in the same run: from the
// wish to see a document to its first page on screen, against a bare decode of that page; what the
// progress of a download costs the main thread; how soon a cancelled download is over. Makes its
// documents itself, in a folder of its own below TMPDIR.
//
//   TMPDIR=FOLDER QT_QPA_PLATFORM=offscreen preview_bench [opening|reports|cancel]...

#include "bench/preview/PreviewBench.h"

#include "app/VXLogging.h"
#include "tests/documents/ScreenHouse.h"

#include <QCoreApplication>
#include <QEventLoop>

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <string>

namespace {

/// Slow enough that a download is still under way when it is cancelled.
constexpr std::uint64_t bytesPerSecond = 4 << 20;

} // namespace

double millisecondsSince(SteadyClock::time_point start) {
    return std::chrono::duration<double, std::milli>(SteadyClock::now() - start).count();
}

double at(std::vector<double> figures, double share) {
    std::sort(figures.begin(), figures.end());
    return figures[static_cast<std::size_t>(share * static_cast<double>(figures.size() - 1))];
}

void print(const char* what, const std::vector<double>& ours, const char* reference,
           const std::vector<double>& bare, const char* goal) {
    std::printf("| %s | %.2f ms, 99 of 100 within %.2f ms | %s %.2f ms | %.2f | %s |\n", what,
                at(ours, 0.5), at(ours, 0.99), reference, at(bare, 0.5),
                at(ours, 0.5) / at(bare, 0.5), goal);
    std::fflush(stdout);
}

void settle(std::chrono::milliseconds time) {
    const auto start = SteadyClock::now();
    while (SteadyClock::now() - start < time)
        QCoreApplication::processEvents(QEventLoop::AllEvents, 5);
}

int main(int argc, char** argv) {
    const std::vector<std::string> chosen(argv + 1, argv + argc);
    const auto wanted = [&](const char* name) {
        return chosen.empty() || std::find(chosen.begin(), chosen.end(), name) != chosen.end();
    };
    {
        test::ScreenHouse house;
        // On the machine's own clock: here it is time that counts.
        house.adjustParts = [](platform::PlatformParts& parts) { parts.clock.reset(); };
        house.rateLimit = bytesPerSecond;
        house.givenRemote("Large.bin", "");
        std::filesystem::resize_file(house.remote + "/Documents/Large.bin", 1ULL << 30);
        house.signIn();
        house.openWindow({1024, 768});
        if (wanted("opening"))
            measureOpening(house);
        if (wanted("reports"))
            measureReports(house);
        if (wanted("cancel"))
            measureCancelling(house);
        tavrin::VXJotClient::JotClient()->close();
    }
    return 0;
}
