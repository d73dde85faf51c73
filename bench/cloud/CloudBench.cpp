// Measures the store against what people know: `cp`, and the bare system calls. Prints each
// figure's median and the ratio; wants a folder on the disk that is meant, with 4 GiB free.
//
//   cloud_bench FOLDER [listing|download|attributes|uploads|notice|unchanged]...

#include "platform/base/Runtime.h"
#include "platform/cloud/AccountFile.h"
#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/CloudService.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/StateDatabase.h"
#include "platform/cloud/SyncPlan.h"
#include "platform/cloud/Tokens.h"
#include "platform/files/ContentProvider.h"
#include "platform/files/DirectoryWatcher.h"
#include "platform/files/Progress.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <functional>
#include <future>
#include <string>
#include <sys/resource.h>
#include <sys/stat.h>
#include <sys/xattr.h>
#include <unistd.h>
#include <vector>

namespace {

using namespace platform;
namespace fs = std::filesystem;

constexpr int rounds = 3;
constexpr int folders = 100;
constexpr int filesInFolder = 1000;
constexpr int idleSeconds = 20;
constexpr std::uint64_t largeFile = 1ULL << 30;

double secondsOf(const std::function<void()>& work) {
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

double median(std::vector<double> figures) {
    std::sort(figures.begin(), figures.end());
    return figures[figures.size() / 2];
}

void report(const char* what, const std::vector<double>& ours, const char* otherName,
            const std::vector<double>& other) {
    std::printf("%-28s %8.3f s   %-22s %8.3f s   ratio %.2f\n", what, median(ours), otherName,
                median(other), median(ours) / median(other));
    std::fflush(stdout);
}

void run(const std::string& command) {
    if (std::system(command.c_str()) != 0)
        std::fprintf(stderr, "failed: %s\n", command.c_str());
}

/// A service on a home of its own, signed in to `remote`.
class Service {
public:
    Service(const std::string& home, const std::string& remote)
        : folders_{home,        home + "/config", home + "/data", home + "/state", home + "/cache",
                   std::nullopt},
          clock_(makeRealClock()),
          main_(*clock_),
          runtime_{*clock_, main_, notifications_, folders_} {
        Runtime::install(&runtime_);
        if (writeAccount(folders_, {"folder", remote, "bench", randomBytes(16), {}, {}}))
            std::abort();
        cloud_ = std::make_unique<CloudService>(CloudService::Parts{*clock_, main_, notifications_,
                                                                    watcher_, progress_, folders_,
                                                                    false, nullptr, nullptr});
    }
    ~Service() {
        cloud_.reset();
        Runtime::install(nullptr);
    }
    void readAll() {
        std::promise<Failure> done;
        cloud_->refresh(std::nullopt, [&](const Failure& failure) { done.set_value(failure); });
        if (done.get_future().get())
            std::abort();
    }
    /// The signing-in has set the listing going.
    void waitUntilListed() {
        while (!cloud_->status())
            usleep(1000);
        const auto reader = StateReader::open(cloud_->status()->folder + "/state.db");
        while (!(*reader)->ask([](StateQueries& queries) {
            return queries.scan(rootItem, Side::remote).complete &&
                   queries.unfinishedScans(Side::remote).empty();
        }))
            usleep(5000);
    }
    void sync() {
        std::promise<Failure> done;
        cloud_->sync([&](const Failure& failure) { done.set_value(failure); });
        if (done.get_future().get())
            std::abort();
    }
    CloudService& cloud() { return *cloud_; }
    Url url(const std::string& path) {
        return Url::file(cloud_->documents().shelfroot()->path() + '/' + path);
    }

private:
    Folders folders_;
    std::unique_ptr<Clock> clock_;
    MainQueue main_;
    NotificationCenter notifications_;
    Runtime runtime_;
    DirectoryWatcher watcher_;
    FileProgressSubscription progress_;
    std::unique_ptr<CloudService> cloud_;
};

void makeMany(const std::string& remote) {
    for (int folder = 0; folder < folders; ++folder) {
        const std::string path = remote + "/Library/Folder " + std::to_string(folder);
        fs::create_directories(path);
        for (int i = 0; i < filesInFolder; ++i)
            std::ofstream(path + "/Document " + std::to_string(i) + ".pdf");
    }
}

/// Both sides make new files only: inodes that were just freed make the disk slow for a while.
void listing(const std::string& base) {
    const std::string remote = base + "/many";
    makeMany(remote);
    std::vector<double> ours;
    std::vector<double> copies;
    for (int round = 0; round < rounds; ++round) {
        const std::string number = std::to_string(round);
        copies.push_back(
            secondsOf([&] { run("cp -r " + remote + ' ' + base + "/copy" + number); }));
        std::optional<Service> service;
        ours.push_back(secondsOf([&] {
            service.emplace(base + "/home" + number, remote);
            service->waitUntilListed();
        }));
    }
    report("first listing, 100,000", ours, "cp -r", copies);
}

void download(const std::string& base) {
    const std::string remote = base + "/large";
    fs::create_directories(remote + "/Library");
    std::vector<char> block(1 << 20);
    std::ofstream out(remote + "/Library/large.bin", std::ios::binary);
    unsigned state = 1;
    for (std::uint64_t written = 0; written < largeFile; written += block.size()) {
        for (std::size_t i = 0; i < block.size(); i += 64)
            block[i] = static_cast<char>(state = state * 1664525 + 1013904223);
        out.write(block.data(), static_cast<std::streamsize>(block.size()));
    }
    out.close();
    run("sync");
    std::vector<double> ours;
    std::vector<double> copies;
    for (int round = 0; round < rounds; ++round) {
        const std::string home = base + "/large-home" + std::to_string(round);
        {
            Service service(home, remote);
            service.readAll();
            CancelFlag cancel;
            ours.push_back(secondsOf([&] {
                if (service.cloud().contents().makeLocal(service.url("Library/large.bin"), cancel))
                    std::abort();
            }));
        }
        copies.push_back(secondsOf([&] {
            run("cp " + remote + "/Library/large.bin " + home + "/copy && sync " + home + "/copy");
        }));
        fs::remove_all(home);
    }
    report("download, 1 GiB", ours, "cp and sync", copies);
}

/// Old enough for the engine to believe that nobody writes to it any more.
void writeOld(const std::string& path, const std::string& content) {
    std::ofstream(path) << content;
    const timespec times[2] = {{0, UTIME_OMIT}, {1'600'000'000, 5}};
    utimensat(AT_FDCWD, path.c_str(), times, 0);
}

void uploads(const std::string& base) {
    constexpr int files = 10'000;
    std::vector<double> ours;
    std::vector<double> copies;
    for (int round = 0; round < rounds; ++round) {
        const std::string number = std::to_string(round);
        const std::string remote = base + "/up" + number;
        fs::create_directories(remote + "/Library");
        Service service(base + "/up-home" + number, remote);
        service.sync();
        const std::string folder = service.url("Library").path();
        for (int i = 0; i < files; ++i)
            writeOld(folder + '/' + std::to_string(i), std::string(4096, 'x'));
        ours.push_back(secondsOf([&] { service.sync(); }));
        const std::string copy = base + "/up-copy" + number;
        copies.push_back(
            secondsOf([&] { run("cp -r " + folder + ' ' + copy + " && sync -f " + copy); }));
    }
    report("upload, 10,000 of 4 KiB", ours, "cp -r and sync", copies);
}

double millisecondsUntil(const std::function<bool()>& holds) {
    return 1000 * secondsOf([&] {
        while (!holds())
            usleep(500);
    });
}

double processorSeconds() {
    rusage used{};
    getrusage(RUSAGE_SELF, &used);
    const auto seconds = [](const timeval& time) {
        return static_cast<double>(time.tv_sec) + static_cast<double>(time.tv_usec) / 1e6;
    };
    return seconds(used.ru_utime) + seconds(used.ru_stime);
}

/// In a store of 100,000: from a change here until it is known, and until the account has it, with
/// nobody asking for it; and what the engine uses while nothing happens.
void notice(const std::string& base) {
    const std::string remote = base + "/notice";
    makeMany(remote);
    Service service(base + "/notice-home", remote);
    service.sync();
    const auto reader = StateReader::open(service.cloud().status()->folder + "/state.db");
    if (!reader)
        std::abort();
    sleep(5); // what the start has set going comes to its end
    const double before = processorSeconds();
    sleep(idleSeconds);
    std::printf("idle for %d s: %.0f ms of processor time\n", idleSeconds,
                1000 * (processorSeconds() - before));
    std::vector<double> known;
    std::vector<double> sent;
    std::vector<double> fresh;
    std::vector<double> removed;
    for (int round = 0; round < 5 * rounds; ++round) {
        const std::string name = "Library/Folder 7/" + std::to_string(round);
        const std::string path = service.url(name).path();
        writeOld(path, "content");
        known.push_back(millisecondsUntil([&] {
            return (*reader)->ask([&](StateQueries& queries) {
                return queries.itemAtPath(name).has_value();
            });
        }));
        sent.push_back(known.back() +
                       millisecondsUntil([&] { return fs::exists(remote + '/' + name); }));
        std::ofstream(path + 'f') << "content";
        fresh.push_back(
            millisecondsUntil([&] { return fs::exists(remote + '/' + name + 'f'); }));
        fs::remove(path);
        removed.push_back(
            millisecondsUntil([&] { return !fs::exists(remote + '/' + name); }));
    }
    for (const auto& [what, figures] :
         {std::pair("known after", &known), {"sent after", &sent},
          {"sent, written just now", &fresh}, {"deletion sent after", &removed}})
        std::printf("%-28s %8.0f ms   worst %8.0f ms\n", what, median(*figures),
                    *std::max_element(figures->begin(), figures->end()));
    std::fflush(stdout);
}

/// A whole look at both sides that finds nothing; and what of it is finding out what to do.
void unchanged(const std::string& base) {
    const std::string remote = base + "/same";
    makeMany(remote);
    Service service(base + "/same-home", remote);
    service.sync();
    const auto reader = StateReader::open(service.cloud().status()->folder + "/state.db");
    if (!reader)
        std::abort();
    std::vector<double> whole;
    std::vector<double> planning;
    for (int round = 0; round < rounds; ++round) {
        whole.push_back(secondsOf([&] { service.sync(); }));
        planning.push_back(secondsOf([&] {
            std::vector<ItemState> states =
                (*reader)->ask([](StateQueries& queries) { return queries.disagreements(); });
            if (!planSync(SyncTrees(std::move(states))).empty())
                std::abort();
        }));
    }
    report("sync of 100,000 unchanged", whole, "planning alone", planning);
}

void attributes(const std::string& base) {
    const std::string remote = base + "/few";
    fs::create_directories(remote + "/Library");
    std::ofstream(remote + "/Library/one.pdf") << "content";
    Service service(base + "/few-home", remote);
    service.readAll();
    const Url url = service.url("Library/one.pdf");
    CancelFlag cancel;
    if (service.cloud().contents().makeLocal(url, cancel))
        std::abort();
    static constexpr std::array keys{ResourceKey::name,
                                     ResourceKey::localizedName,
                                     ResourceKey::typeIdentifier,
                                     ResourceKey::localizedTypeDescription,
                                     ResourceKey::fileSize,
                                     ResourceKey::creationDate,
                                     ResourceKey::contentModificationDate,
                                     ResourceKey::isDirectory,
                                     ResourceKey::isPackage,
                                     ResourceKey::hasHiddenExtension,
                                     ResourceKey::parentDirectoryUrl,
                                     ResourceKey::isShared,
                                     ResourceKey::sharedItemRole,
                                     ResourceKey::downloadingStatus};
    constexpr int calls = 100'000;
    std::vector<double> ours;
    std::vector<double> bare;
    for (int round = 0; round < rounds; ++round) {
        ours.push_back(secondsOf([&] {
            for (int i = 0; i < calls; ++i)
                if (!service.cloud().documents().promisedItemAttributes(url, keys))
                    std::abort();
        }));
        bare.push_back(secondsOf([&] {
            for (int i = 0; i < calls; ++i) {
                struct statx status {};
                statx(AT_FDCWD, url.path().c_str(), AT_SYMLINK_NOFOLLOW,
                      STATX_BASIC_STATS | STATX_BTIME, &status);
                getxattr(url.path().c_str(), "user.pelmora.hidden-extension", nullptr, 0);
            }
        }));
    }
    report("attributes, 100,000 times", ours, "statx and getxattr", bare);
}

} // namespace

int main(int argc, char** argv) {
    if (argc < 2) {
        std::fputs(
            "usage: cloud_bench FOLDER [listing|download|attributes|uploads|notice|unchanged]...\n",
            stderr);
        return 2;
    }
    std::string base = std::string(argv[1]) + "/cloud-bench-XXXXXX";
    if (!mkdtemp(base.data()))
        return 1;
    const std::vector<std::string> chosen(argv + 2, argv + argc);
    const auto wanted = [&](const char* name) {
        return chosen.empty() || std::find(chosen.begin(), chosen.end(), name) != chosen.end();
    };
    if (wanted("attributes"))
        attributes(base);
    if (wanted("download"))
        download(base);
    if (wanted("uploads"))
        uploads(base);
    if (wanted("notice"))
        notice(base);
    if (wanted("unchanged"))
        unchanged(base);
    if (wanted("listing"))
        listing(base);
    fs::remove_all(base);
    return 0;
}
