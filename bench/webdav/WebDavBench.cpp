// Measures the WebDAV remote against the bare library, on a real server on loopback that it starts
// itself. Each figure stands beside a reference of the same moment; prints medians and the ratio.
// TMPDIR says which disk; it wants 4 GiB free there.
//
//   webdav_bench apache|lighttpd [large|small|listing]...

#include "platform/base/Clock.h"
#include "platform/files/FileDescriptor.h"
#include "tests/webdav/WebDavFixture.h"

#include <algorithm>
#include <atomic>
#include <chrono>
#include <curl/curl.h>
#include <expat.h>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <functional>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

namespace {

using namespace platform;
namespace fs = std::filesystem;

constexpr int rounds = 3;
constexpr std::uint64_t largeSize = 1ULL << 30;
constexpr int smallFiles = 10'000;
constexpr int smallSize = 4096;
constexpr int lanes = 8;
/// As many changes as the engine brings to the disk with one sync.
constexpr int batch = 256;
constexpr int listedFiles = 100'000;

double secondsOf(const std::function<void()>& work) {
    const auto start = std::chrono::steady_clock::now();
    work();
    return std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
}

double median(std::vector<double> figures) {
    std::sort(figures.begin(), figures.end());
    return figures[figures.size() / 2];
}

void report(const char* what, const std::vector<double>& ours, const std::vector<double>& other) {
    std::printf("%-34s %8.3f s   reference %8.3f s   ratio %.2f\n", what, median(ours),
                median(other), median(ours) / median(other));
    std::fflush(stdout);
}

void shell(const std::string& command) {
    if (std::system(command.c_str()) != 0)
        std::fprintf(stderr, "failed: %s\n", command.c_str());
}

void need(const Failure& failure) {
    if (!failure)
        return;
    std::fprintf(stderr, "%s\n", test::wordsOf(failure).c_str());
    std::exit(1);
}
template<class T>
void need(const Result<T>& result) {
    need(result ? Failure() : Failure(result.error()));
}

struct Bench {
    test::DavHost host;
    test::TemporaryFolder home;
    std::unique_ptr<Clock> clock = makeRealClock();
    CancelFlag cancel;
    std::unique_ptr<WebDavRemote> remote = test::remoteAt(host.url(), *clock, test::signedIn());

    explicit Bench(test::DavHost::Kind kind) : host(kind) {
        need(remote->connect(cancel));
        std::printf("%s\n", remote->capabilities()->description().c_str());
    }
    std::string curl() const { return "curl -s --anyauth -u user:secret "; }

    void download(const std::string& path, const std::string& place) {
        const FileDescriptor file(
            open(place.c_str(), O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0600));
        need(remote->read(
            path,
            [&](std::span<const std::byte> piece) -> Failure {
                return write(file.get(), piece.data(), piece.size()) ==
                               static_cast<ssize_t>(piece.size())
                           ? Failure()
                           : Failure(makeError(ErrorCode::outOfSpace));
            },
            cancel));
    }
    void upload(const std::string& path, const std::string& place) {
        const FileDescriptor file(open(place.c_str(), O_RDONLY | O_CLOEXEC));
        RemoteUpload content{fs::file_size(place), {}, {}, {}};
        content.read = [&](std::uint64_t offset,
                           std::span<std::byte> buffer) -> Result<std::size_t> {
            const ssize_t got = pread(file.get(), buffer.data(), buffer.size(),
                                      static_cast<off_t>(offset));
            if (got < 0)
                return makeError(ErrorCode::unknownIo);
            return static_cast<std::size_t>(got);
        };
        need(remote->write(path, content, RemoteCondition::nameFree(), cancel));
    }
};

void measureLarge(Bench& bench) {
    const std::string source = bench.home / "source";
    const std::string target = bench.home / "target";
    shell("head -c " + std::to_string(largeSize) + " /dev/urandom > " + source + "; sync");
    std::vector<double> up, upByCurl, down, downByCurl;
    for (int round = 0; round < rounds; ++round) {
        const std::string name = "large" + std::to_string(round);
        upByCurl.push_back(secondsOf([&] {
            shell(bench.curl() + "-o /dev/null -T " + source + ' ' + bench.host.url() + name + "c");
        }));
        up.push_back(secondsOf([&] { bench.upload(name, source); }));
        downByCurl.push_back(secondsOf([&] {
            shell(bench.curl() + "-o " + target + ' ' + bench.host.url() + name + "c; sync " + target);
        }));
        fs::remove(target);
        down.push_back(secondsOf([&] {
            bench.download(name, target);
            shell("sync " + target);
        }));
        fs::remove(target);
        shell("rm -f " + bench.host.folder() + "/large*");
    }
    report("PUT 1 GiB; curl", up, upByCurl);
    report("GET 1 GiB to disk; curl", down, downByCurl);
}

/// The bare loop: so many transfers at once, and a sync of the disk for each batch of files.
struct BareLoop {
    struct Transfer {
        CURL* easy = nullptr;
        FILE* file = nullptr;
        std::string content;
        std::size_t sent = 0;
    };
    std::string url;
    std::string folder;
    bool up = false;
    int next = 0;
    int done = 0;

    static std::size_t onRead(char* data, std::size_t, std::size_t size, void* user) {
        auto* const self = static_cast<Transfer*>(user);
        const std::size_t count = std::min(size, self->content.size() - self->sent);
        std::memcpy(data, self->content.data() + self->sent, count);
        self->sent += count;
        return count;
    }
    void begin(CURLM* multi, Transfer& transfer) {
        const std::string name = std::to_string(next++);
        curl_easy_setopt(transfer.easy, CURLOPT_URL, (url + name).c_str());
        curl_easy_setopt(transfer.easy, CURLOPT_PRIVATE, &transfer);
        curl_easy_setopt(transfer.easy, CURLOPT_USERPWD, "user:secret");
        curl_easy_setopt(transfer.easy, CURLOPT_HTTPAUTH, CURLAUTH_BASIC | CURLAUTH_DIGEST);
        if (up) {
            transfer.content.assign(smallSize, 'x');
            transfer.sent = 0;
            curl_easy_setopt(transfer.easy, CURLOPT_UPLOAD, 1L);
            curl_easy_setopt(transfer.easy, CURLOPT_READFUNCTION, &onRead);
            curl_easy_setopt(transfer.easy, CURLOPT_READDATA, &transfer);
            curl_easy_setopt(transfer.easy, CURLOPT_INFILESIZE_LARGE, curl_off_t{smallSize});
            curl_easy_setopt(
                transfer.easy, CURLOPT_WRITEFUNCTION,
                +[](char*, std::size_t, std::size_t size, void*) { return size; });
        } else {
            transfer.file = std::fopen((folder + '/' + name).c_str(), "w");
            curl_easy_setopt(transfer.easy, CURLOPT_WRITEDATA, transfer.file);
        }
        curl_multi_add_handle(multi, transfer.easy);
    }
    void run() {
        CURLM* const multi = curl_multi_init();
        std::vector<Transfer> transfers(lanes);
        for (Transfer& transfer : transfers) {
            transfer.easy = curl_easy_init();
            begin(multi, transfer);
        }
        while (done < smallFiles) {
            int running = 0;
            curl_multi_perform(multi, &running);
            int left = 0;
            while (CURLMsg* const message = curl_multi_info_read(multi, &left)) {
                Transfer* transfer = nullptr;
                curl_easy_getinfo(message->easy_handle, CURLINFO_PRIVATE, &transfer);
                curl_multi_remove_handle(multi, transfer->easy);
                if (transfer->file)
                    std::fclose(std::exchange(transfer->file, nullptr));
                if (++done % batch == 0 && !up)
                    syncDisk(folder);
                if (next < smallFiles)
                    begin(multi, *transfer);
            }
            curl_multi_poll(multi, nullptr, 0, 100, nullptr);
        }
        for (Transfer& transfer : transfers)
            curl_easy_cleanup(transfer.easy);
        curl_multi_cleanup(multi);
    }
    static void syncDisk(const std::string& folder) {
        const FileDescriptor file(open(folder.c_str(), O_RDONLY | O_DIRECTORY | O_CLOEXEC));
        if (syncfs(file.get()) != 0)
            std::perror("syncfs");
    }
};

void measureSmall(Bench& bench) {
    std::vector<double> up, upBare, down, downBare;
    const std::string source = bench.home.write("small", std::string(smallSize, 'x'));
    for (int round = 0; round < rounds; ++round) {
        const std::string folder = "small" + std::to_string(round);
        for (const char* end : {"", "b"})
            need(bench.remote->makeFolder(folder + end, bench.cancel));
        const auto inLanes = [&](const std::function<void(int)>& work,
                                 const std::function<void()>& sync) {
            std::atomic<int> next{0};
            std::atomic<int> done{0};
            std::vector<std::thread> threads;
            for (int lane = 0; lane < lanes; ++lane)
                threads.emplace_back([&] {
                    for (int i = next++; i < smallFiles; i = next++) {
                        work(i);
                        if (++done % batch == 0)
                            sync();
                    }
                });
            for (std::thread& thread : threads)
                thread.join();
        };
        upBare.push_back(secondsOf([&] {
            BareLoop{bench.host.url() + folder + "b/", "", true}.run();
        }));
        up.push_back(secondsOf([&] {
            inLanes([&](int i) { bench.upload(folder + '/' + std::to_string(i), source); },
                    [&] { need(bench.remote->sync(bench.cancel)); });
        }));
        need(bench.remote->list(folder, bench.cancel));
        const std::string bare = bench.home.makeFolder("bare" + std::to_string(round));
        const std::string ours = bench.home.makeFolder("ours" + std::to_string(round));
        downBare.push_back(secondsOf([&] {
            BareLoop{bench.host.url() + folder + '/', bare, false}.run();
        }));
        down.push_back(secondsOf([&] {
            inLanes(
                [&](int i) {
                    const std::string name = '/' + std::to_string(i);
                    bench.download(folder + name, ours + name);
                },
                [&] { BareLoop::syncDisk(ours); });
        }));
    }
    report("10,000 PUTs of 4 KiB; bare loop", up, upBare);
    report("10,000 GETs of 4 KiB; bare loop", down, downBare);
}

double parseBare(const std::string& body) {
    return secondsOf([&] {
        const XML_Parser parser = XML_ParserCreateNS(nullptr, '\n');
        std::size_t elements = 0;
        XML_SetUserData(parser, &elements);
        XML_SetElementHandler(
            parser,
            [](void* count, const XML_Char*, const XML_Char**) {
                ++*static_cast<std::size_t*>(count);
            },
            [](void*, const XML_Char*) {});
        XML_Parse(parser, body.data(), static_cast<int>(body.size()), 1);
        XML_ParserFree(parser);
    });
}

void measureListing(Bench& bench) {
    const std::string folder = bench.host.folder() + "/many";
    fs::create_directory(folder);
    for (int i = 0; i < listedFiles; ++i)
        close(open((folder + "/document " + std::to_string(i) + ".txt").c_str(), O_CREAT | O_WRONLY,
                   0644));
    const std::string body = bench.home / "body.xml";
    const std::string request = bench.home.write(
        "request.xml", "<?xml version=\"1.0\"?><propfind xmlns=\"DAV:\"><prop><resourcetype/>"
                       "<getcontentlength/><getlastmodified/><getetag/>"
                       "<t:tags xmlns:t=\"urn:pelmora:store\"/></prop></propfind>");
    std::vector<double> ours, reference;
    for (int round = 0; round < rounds; ++round) {
        const double server = secondsOf([&] {
            shell(bench.curl() + "-X PROPFIND -H 'Depth: 1' -H 'Content-Type: application/xml' "
                                 "--data-binary @" +
                  request + " -o " + body + ' ' + bench.host.url() + "many/");
        });
        std::string text(fs::file_size(body), '\0');
        FILE* const file = std::fopen(body.c_str(), "r");
        text.resize(std::fread(text.data(), 1, text.size(), file));
        std::fclose(file);
        reference.push_back(server + parseBare(text));
        // In a process of its own, whose memory is the listing's.
        int pipes[2] = {};
        if (pipe(pipes) != 0)
            std::abort();
        const pid_t child = fork();
        if (child == 0) {
            execl("/proc/self/exe", "webdav_bench", "list", bench.host.url().c_str(),
                  std::to_string(pipes[1]).c_str(), nullptr);
            _exit(1);
        }
        double figures[2] = {};
        if (read(pipes[0], figures, sizeof figures) != sizeof figures)
            std::abort();
        waitpid(child, nullptr, 0);
        close(pipes[0]);
        close(pipes[1]);
        ours.push_back(figures[0]);
        if (round == 0)
            std::printf("a listing of %d entries, %.1f MB of XML, took %.1f MB of memory\n",
                        listedFiles, static_cast<double>(text.size()) / 1e6, figures[1] / 1e3);
    }
    report("listing; server and bare expat", ours, reference);
}

/// Of this program alone, and not of the one that started it.
double peakKilobytes() {
    std::ifstream status("/proc/self/status");
    for (std::string line; std::getline(status, line);)
        if (line.starts_with("VmHWM:"))
            return std::atof(line.c_str() + 6);
    return 0;
}

int listOnce(const char* url, int pipe) {
    const std::unique_ptr<Clock> clock = makeRealClock();
    CancelFlag cancel;
    const auto remote = test::remoteAt(url, *clock, test::signedIn());
    need(remote->connect(cancel));
    double figures[2] = {};
    figures[0] = secondsOf([&] {
        const auto listing = remote->list("many", cancel);
        need(listing);
        if (listing->entries.size() != listedFiles)
            std::exit(1);
    });
    figures[1] = peakKilobytes();
    return write(pipe, figures, sizeof figures) == sizeof figures ? 0 : 1;
}

} // namespace

int main(int argc, char** argv) {
    const std::vector<std::string> words(argv + 1, argv + argc);
    if (words.size() == 3 && words[0] == "list")
        return listOnce(argv[2], std::atoi(argv[3]));
    const bool apache = !words.empty() && words[0] == "apache";
    Bench bench(apache ? test::DavHost::Kind::apache : test::DavHost::Kind::lighttpd);
    const auto wanted = [&](const char* what) {
        return words.size() < 2 || std::find(words.begin() + 1, words.end(), what) != words.end();
    };
    if (wanted("large"))
        measureLarge(bench);
    if (wanted("small"))
        measureSmall(bench);
    if (wanted("listing"))
        measureListing(bench);
    return 0;
}
