#include "platform/files/FileCoordinator.h"
#include "platform/base/Describe.h"

#include "tests/files/FakeProvider.h"
#include "tests/files/Worker.h"
#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <array>
#include <filesystem>
#include <random>

using platform::ErrorCode;
using platform::Failure;
using platform::FileCoordinator;
using platform::ReadingOptions;
using platform::Url;
using platform::WritingOptions;
using test::Event;
using test::Worker;

namespace {

constexpr auto metadataOnly = ReadingOptions::immediatelyAvailableMetadataOnly;

Url at(std::string_view path) {
    return Url::file(path);
}

std::string codeOf(const Failure& failure) {
    return failure ? std::to_string(failure->code) : "granted";
}

/// Reads or writes with a coordinator of its own; answers the error's code, or "granted".
std::string read(const Url& item, ReadingOptions options = ReadingOptions::none,
                 const std::function<void()>& inside = {}) {
    FileCoordinator coordinator;
    return codeOf(coordinator.coordinateReading(item, options, [&](const Url&) {
        if (inside)
            inside();
    }));
}
std::string write(const Url& item, WritingOptions options = WritingOptions::forReplacing,
                  const std::function<void()>& inside = {}) {
    FileCoordinator coordinator;
    return codeOf(coordinator.coordinateWriting(item, options, [&](const Url&) {
        if (inside)
            inside();
    }));
}

/// Stays inside an access on a thread of its own until told to leave.
struct Holder {
    Event inside;
    Event leave;
    Worker worker;

    explicit Holder(const std::function<void(const std::function<void()>&)>& access)
        : worker([this, access] {
              access([this] {
                  inside.signal();
                  leave.wait();
              });
          }) {
        inside.wait();
    }
    ~Holder() {
        if (!leave.happened())
            leave.signal();
    }
    void end() {
        leave.signal();
        worker.join();
    }
};

TEST(Coordination, ReadersShareAndAWriterIsAloneAboveAndBelowItsItem) {
    Holder reader([](const auto& inside) { read(at("/t/a/b"), ReadingOptions::none, inside); });
    EXPECT_EQ(read(at("/t/a/b")), "granted");
    EXPECT_EQ(write(at("/t/a/bc")), "granted") << "only the text begins alike";
    std::string log;
    std::mutex mutex;
    const auto note = [&](const char* text) {
        const std::lock_guard lock(mutex);
        log += text;
    };
    std::vector<std::unique_ptr<Worker>> writers;
    for (const char* path : {"/t/a", "/t/a/b/c", "/t/./a//b"})
        writers.push_back(std::make_unique<Worker>(
            [&, path] { write(at(path), WritingOptions::forReplacing, [&] { note("w"); }); }));
    for (auto& writer : writers)
        writer->untilBlocked();
    note("r");
    reader.end();
    writers.clear();
    EXPECT_EQ(log, "rwww");
}

TEST(Coordination, WhoComesFirstIsServedFirst) {
    Holder reader([](const auto& inside) { read(at("/t/a"), ReadingOptions::none, inside); });
    std::string log;
    Worker writer([&] { write(at("/t/a"), WritingOptions::none, [&] { log += "w"; }); });
    writer.untilBlocked();
    Worker later([&] { read(at("/t/a"), ReadingOptions::none, [&] { log += "r"; }); });
    later.untilBlocked();
    EXPECT_FALSE(later.done()) << "a stream of readers would starve the writer";
    reader.end();
    writer.join();
    later.join();
    EXPECT_EQ(log, "wr");
}

TEST(Coordination, AttributesDoNotWaitForContentNorForThoseWhoWaitForIt) {
    Holder writer([](const auto& inside) { write(at("/t/a"), WritingOptions::none, inside); });
    EXPECT_EQ(read(at("/t/a"), metadataOnly), "granted");
    Worker mover([] { write(at("/t/a"), WritingOptions::forMoving); });
    mover.untilBlocked();
    EXPECT_EQ(read(at("/t/a"), metadataOnly), "granted");
    writer.end();
}

TEST(Coordination, AttributesWaitWhileTheItemItselfIsMovedOrDeleted) {
    Holder mover([](const auto& inside) { write(at("/t/a"), WritingOptions::forMoving, inside); });
    EXPECT_EQ(read(at("/t"), metadataOnly), "granted") << "the folder's own can be read";
    EXPECT_EQ(read(at("/t/b"), metadataOnly), "granted");
    Worker reader([] { read(at("/t/a/below"), metadataOnly); });
    reader.untilBlocked();
    EXPECT_FALSE(reader.done());
    mover.end();
}

TEST(Coordination, AMoverIsNotStarvedByReadersOfAttributes) {
    Holder reader([](const auto& inside) { read(at("/t/a"), metadataOnly, inside); });
    Worker mover([] { write(at("/t/a"), WritingOptions::forMoving); });
    mover.untilBlocked();
    Worker later([] { read(at("/t/a"), metadataOnly); });
    later.untilBlocked();
    EXPECT_FALSE(later.done());
    reader.end();
    mover.join();
}

TEST(Coordination, AThreadDoesNotWaitForItself) {
    FileCoordinator outer;
    std::string log;
    const Failure failure = outer.coordinateReading(at("/t/a"), {}, [&](const Url& url) {
        log +=
            codeOf(outer.coordinateWriting(url, WritingOptions::forReplacing, [](const Url&) {}));
        log += write(at("/t"), WritingOptions::forMoving, [&] { log += read(url, metadataOnly); });
    });
    EXPECT_FALSE(failure);
    EXPECT_EQ(log, "grantedgrantedgranted");
}

TEST(Coordination, TwoWhoWantWhatTheOtherHasDoNotWaitForEver) {
    Event bothInside;
    std::atomic<int> inside{0};
    std::array<std::string, 2> results;
    const auto run = [&](std::size_t me) {
        const Url mine = at(me == 0 ? "/t/a" : "/t/b");
        const Url other = at(me == 0 ? "/t/b" : "/t/a");
        write(mine, WritingOptions::forReplacing, [&] {
            if (++inside == 2)
                bothInside.signal();
            bothInside.wait();
            results[me] = write(other);
        });
    };
    Worker first([&] { run(0); });
    Worker second([&] { run(1); });
    first.join();
    second.join();
    std::sort(results.begin(), results.end());
    EXPECT_EQ(results[0], std::to_string(static_cast<int>(ErrorCode::itemBusy)));
    EXPECT_EQ(results[1], "granted") << "the other one went on";
}

TEST(Coordination, ACancelledCoordinatorEndsItsWaitAndRefusesFromThenOn) {
    Holder writer([](const auto& inside) { write(at("/t/a"), WritingOptions::none, inside); });
    FileCoordinator coordinator;
    std::string result;
    Worker reader([&] {
        result = codeOf(coordinator.coordinateReading(at("/t/a"), {}, [](const Url&) { FAIL(); }));
    });
    reader.untilBlocked();
    coordinator.cancel();
    reader.join();
    EXPECT_EQ(result, "3072");
    EXPECT_EQ(codeOf(coordinator.coordinateWriting(at("/t/z"), WritingOptions::none,
                                                   [](const Url&) { FAIL(); })),
              "3072");
    writer.end();
    EXPECT_EQ(write(at("/t/a")), "granted") << "nothing of the cancelled claim is left";
}

TEST(Coordination, WhoWaitsForAMovedItemGetsItsNewPlace) {
    FileCoordinator mover;
    Event moving;
    Event go;
    Worker move([&] {
        (void)mover.coordinateWriting(at("/t/a"), WritingOptions::forMoving, at("/t/b"),
                                      WritingOptions::forReplacing,
                                      [&](const Url& from, const Url& to) {
                                          moving.signal();
                                          go.wait();
                                          mover.itemAtURLDidMoveToURL(from, to);
                                      });
    });
    moving.wait();
    std::string seen;
    Worker reader([&] {
        FileCoordinator coordinator;
        (void)coordinator.coordinateReading(at("/t/a/x"), {},
                                            [&](const Url& url) { seen = url.path(); });
    });
    reader.untilBlocked();
    Worker maker([&] { // wants something new at the old place, wherever the old one went
        FileCoordinator coordinator;
        (void)coordinator.coordinateWriting(at("/t/a"), WritingOptions::forReplacing,
                                            [&](const Url& url) { EXPECT_EQ(url.path(), "/t/a"); });
    });
    maker.untilBlocked();
    go.signal();
    reader.join();
    EXPECT_EQ(seen, "/t/b/x");
}

TEST(Coordination, ASymbolicLinkIsResolvedOnlyWhenAskedFor) {
    const test::TemporaryFolder folder;
    std::filesystem::create_symlink("second", folder / "first");
    std::filesystem::create_symlink("sub/../promised.pdf", folder / "second");
    std::filesystem::create_symlink("loop", folder / "loop");
    const auto seen = [&](const char* name, ReadingOptions options) {
        std::string path;
        FileCoordinator coordinator;
        const Failure failure = coordinator.coordinateReading(
            at(folder / name), options, [&](const Url& url) { path = url.path(); });
        return failure ? "failed" : path;
    };
    EXPECT_EQ(seen("first", ReadingOptions::none), folder / "first");
    EXPECT_EQ(seen("first", ReadingOptions::resolvesSymbolicLink), folder / "promised.pdf");
    EXPECT_EQ(seen("loop", ReadingOptions::resolvesSymbolicLink), "failed");
}

struct Promises : ::testing::Test {
    test::FakeProvider provider;
    FileCoordinator coordinator;
    const Url item = at("/t/Report.pdf");
    std::string result;
    std::string seen;

    void SetUp() override { provider.promise(item); }
    void startReading(std::optional<Worker>& worker) {
        worker.emplace([this] {
            result = codeOf(coordinator.coordinateReading(
                item, {}, [this](const Url& url) { seen = url.path(); }));
        });
        provider.waitForDownloads(1);
    }
};

TEST_F(Promises, AReadOfContentBringsItAndNobodyIsHeldUpMeanwhile) {
    std::optional<Worker> reader;
    startReading(reader);
    EXPECT_EQ(read(item, metadataOnly), "granted");
    EXPECT_EQ(write(at("/t"), WritingOptions::forMoving), "granted");
    provider.finish(1);
    reader.reset();
    EXPECT_EQ(result, "granted");
    EXPECT_EQ(seen, item.path());
    EXPECT_EQ(provider.started(), 1);
}

TEST_F(Promises, OnlyWhoChangesContentNeedsItFirst) {
    for (const auto options :
         {WritingOptions::forDeleting, WritingOptions::forMoving, WritingOptions::forReplacing})
        EXPECT_EQ(write(item, options), "granted");
    EXPECT_EQ(provider.started(), 0);
    provider.finish(1);
    EXPECT_EQ(write(item, WritingOptions::none), "granted");
    EXPECT_EQ(provider.started(), 1);
}

TEST_F(Promises, ACancelledDownloadIsToldAsSuch) {
    std::optional<Worker> reader;
    startReading(reader);
    coordinator.cancel();
    reader.reset();
    EXPECT_EQ(result, "3072");
    EXPECT_EQ(seen, "");
    EXPECT_TRUE(provider.isPromised(item));
}

TEST_F(Promises, AFailedDownloadIsTheReadsError) {
    std::optional<Worker> reader;
    startReading(reader);
    provider.finish(1, makeError(ErrorCode::serverNotAvailable));
    reader.reset();
    EXPECT_EQ(result, "4355");
}

TEST_F(Promises, ADocumentEvictedBeforeItsReadIsFetchedAgain) {
    auto first = std::make_unique<Holder>(
        [&](const auto& inside) { write(item, WritingOptions::forReplacing, inside); });
    std::optional<Worker> reader;
    startReading(reader);
    provider.finish(1);
    reader->untilBlocked(); // it has the content and waits for the writer
    provider.promise(item);
    first.reset();
    provider.waitForDownloads(2);
    Holder second([&](const auto& inside) { write(item, WritingOptions::forReplacing, inside); });
    provider.finish(2);
    while (provider.isPromised(item))
        std::this_thread::yield();
    reader->untilBlocked();
    EXPECT_FALSE(reader->done()) << "it waits again, like anybody";
    EXPECT_EQ(seen, "");
    second.end();
    reader.reset();
    EXPECT_EQ(result, "granted");
    EXPECT_EQ(provider.started(), 2);
}

TEST_F(Promises, AMoveDuringTheDownloadIsFollowed) {
    std::optional<Worker> reader;
    startReading(reader);
    FileCoordinator mover;
    const Url target = at("/t/sub/New.pdf");
    (void)mover.coordinateWriting(item, WritingOptions::forMoving, target,
                                  WritingOptions::forReplacing,
                                  [&](const Url& from, const Url& to) {
                                      provider.promise(target);
                                      mover.itemAtURLDidMoveToURL(from, to);
                                  });
    provider.finish(2);
    reader.reset();
    EXPECT_EQ(result, "granted");
    EXPECT_EQ(seen, target.path());
}

TEST_F(Promises, ReplacingTheProviderEndsItsDownloads) {
    std::optional<Worker> reader;
    startReading(reader);
    FileCoordinator::setContentProvider(nullptr);
    reader.reset();
    EXPECT_EQ(result, "3072");
}

// Threads read, write, move and cancel at random over a small tree. A model of its own checks each
// accessor against those that run at the same time.
struct Model {
    struct Access {
        std::string path;
        char kind; // r, w, s (structural) or m (metadata)
    };
    std::mutex mutex;
    std::vector<Access> running;
    int faults = 0;

    static bool below(const std::string& a, const std::string& b) {
        return (a + "/").rfind(b + "/", 0) == 0;
    }
    static bool clash(const Access& a, const Access& b) {
        if (a.kind == 'm' || b.kind == 'm') {
            const Access& m = a.kind == 'm' ? a : b;
            const Access& other = a.kind == 'm' ? b : a;
            return other.kind == 's' && below(m.path, other.path);
        }
        const bool writes = a.kind != 'r' || b.kind != 'r';
        return writes && (below(a.path, b.path) || below(b.path, a.path));
    }
    void during(const std::vector<Access>& accesses) {
        {
            const std::lock_guard lock(mutex);
            for (const Access& mine : accesses)
                for (const Access& other : running)
                    faults += clash(mine, other);
            running.insert(running.end(), accesses.begin(), accesses.end());
        }
        std::this_thread::yield();
        const std::lock_guard lock(mutex);
        for (const Access& mine : accesses)
            running.erase(std::find_if(running.begin(), running.end(), [&](const Access& one) {
                return one.path == mine.path && one.kind == mine.kind;
            }));
    }
};

TEST(Coordination, ManyThreadsNeverMeetAWriter) {
    constexpr std::array paths = {"/t", "/t/a", "/t/a/x", "/t/a/y", "/t/b", "/t/b/x", "/u"};
    Model model;
    std::atomic<int> granted{0};
    const auto work = [&](unsigned seed) {
        std::mt19937 random(seed);
        const auto any = [&] { return std::string(paths[random() % paths.size()]); };
        for (int i = 0; i < 1500; ++i) {
            const std::string a = any();
            const std::string b = any();
            FileCoordinator coordinator;
            const auto run = [&](std::vector<Model::Access> accesses) {
                ++granted;
                model.during(accesses);
            };
            switch (random() % 5) {
            case 0:
                (void)coordinator.coordinateWriting(at(a), WritingOptions::none, [&](const Url&) {
                    run({{a, 'w'}});
                });
                break;
            case 1:
                if (Model::below(a, b) || Model::below(b, a))
                    break;
                (void)coordinator.coordinateWriting(at(a), WritingOptions::forMoving, at(b),
                                                    WritingOptions::forReplacing,
                                                    [&](const Url&, const Url&) {
                                                        run({{a, 's'}, {b, 'w'}});
                                                    });
                break;
            case 2: {
                Worker canceller([&] { coordinator.cancel(); });
                (void)coordinator.coordinateReading(at(a), {}, [&](const Url&) {
                    run({{a, 'r'}});
                });
                break;
            }
            case 3:
                (void)coordinator.coordinateReading(at(a), metadataOnly, [&](const Url&) {
                    run({{a, 'm'}});
                });
                break;
            default:
                (void)coordinator.coordinateReading(at(a), {}, [&](const Url&) {
                    run({{a, 'r'}});
                });
            }
        }
    };
    std::vector<std::thread> threads;
    for (unsigned seed = 1; seed <= 6; ++seed)
        threads.emplace_back(work, seed);
    for (std::thread& thread : threads)
        thread.join();
    EXPECT_EQ(model.faults, 0);
    EXPECT_GT(granted, 5000);
}

} // namespace
