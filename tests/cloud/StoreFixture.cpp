#include "tests/cloud/StoreFixture.h"

#include "platform/cloud/SyncTimes.h"
#include "platform/files/PathText.h"

#include <sys/wait.h>
#include <unistd.h>

namespace test {
namespace {

using namespace platform;

/// Hands everything on; what changes the disk goes through step() before and after.
class SteppingFileSystem : public StoreFileSystem {
public:
    virtual Failure before(const char* what) = 0;
    virtual void after() {}

    Result<FileAttributes> attributes(const std::string& path) override {
        return real_->attributes(path);
    }
    Result<std::vector<DirectoryEntry>> entries(const std::string& path) override {
        return real_->entries(path);
    }
    Failure makeFolder(const std::string& path) override {
        return run("folder", [&] { return real_->makeFolder(path); });
    }
    Result<FileAttributes> makeSidecar(const std::string& path, const std::string& mark) override {
        if (Failure failure = before("sidecar"))
            return *failure;
        auto made = real_->makeSidecar(path, mark);
        after();
        return made;
    }
    Failure setMark(const std::string& path, const std::string& mark) override {
        return run("mark", [&] { return real_->setMark(path, mark); });
    }
    Failure rename(const std::string& from, const std::string& to) override {
        return run("rename", [&] { return real_->rename(from, to); });
    }
    Failure exchange(const std::string& a, const std::string& b) override {
        return run("exchange", [&] { return real_->exchange(a, b); });
    }
    Failure removeFile(const std::string& path) override {
        return run("remove", [&] { return real_->removeFile(path); });
    }
    Failure removeFolder(const std::string& path) override {
        return run("remove", [&] { return real_->removeFolder(path); });
    }
    Result<std::unique_ptr<OpenContent>> openContent(const std::string& path) override {
        return real_->openContent(path);
    }
    Result<std::uint64_t> freeBytes(const std::string& path) override {
        return real_->freeBytes(path);
    }
    Result<std::unique_ptr<StagedFile>> stage(const std::string& path,
                                              std::uint64_t size) override {
        if (Failure failure = before("stage"))
            return *failure;
        auto file = real_->stage(path, size);
        after();
        if (!file)
            return file;
        return std::unique_ptr<StagedFile>(std::make_unique<Staged>(*this, std::move(*file)));
    }
    Failure writeSmallFile(const std::string& path, std::string_view content) override {
        return run("small", [&] { return real_->writeSmallFile(path, content); });
    }
    Failure syncFolder(const std::string& path) override {
        return run("sync", [&] { return real_->syncFolder(path); });
    }
    Failure syncAll(const std::string& path) override {
        return run("sync", [&] { return real_->syncAll(path); });
    }

private:
    class Staged final : public StagedFile {
    public:
        Staged(SteppingFileSystem& owner, std::unique_ptr<StagedFile> real)
            : owner_(owner), real_(std::move(real)) {}
        Failure write(std::span<const std::byte> piece) override {
            return owner_.run("write", [&] { return real_->write(piece); });
        }
        Failure finish(Date modified, const std::string& tags) override {
            return owner_.run("finish", [&] { return real_->finish(modified, tags); });
        }
        Failure sync() override {
            return owner_.run("sync", [&] { return real_->sync(); });
        }

    private:
        SteppingFileSystem& owner_;
        std::unique_ptr<StagedFile> real_;
    };

    Failure run(const char* what, const std::function<Failure()>& change) {
        if (Failure failure = before(what))
            return failure;
        Failure failure = change();
        after();
        return failure;
    }

    std::unique_ptr<StoreFileSystem> real_ = makeRealStoreFileSystem();
};

class DyingFileSystem final : public SteppingFileSystem {
public:
    DyingFileSystem(int step, bool after) : step_(step), dieAfter_(after) {}
    Failure before(const char*) override {
        ++count_;
        if (count_ == step_ && !dieAfter_)
            _exit(diedOnTheWay);
        return std::nullopt;
    }
    void after() override {
        if (count_ >= step_)
            _exit(diedOnTheWay);
    }

private:
    std::atomic<int> count_{0};
    const int step_;
    const bool dieAfter_;
};

class MeddlingFileSystem final : public SteppingFileSystem {
public:
    MeddlingFileSystem(std::string kind, std::function<void()> act)
        : kind_(std::move(kind)), act_(std::move(act)) {}
    Failure before(const char* what) override {
        if (what == kind_)
            if (const auto act = std::exchange(act_, nullptr))
                act();
        return std::nullopt;
    }

private:
    const std::string kind_;
    std::function<void()> act_;
};

class FullFileSystem final : public SteppingFileSystem {
public:
    Failure before(const char* what) override {
        const std::string_view step = what;
        if (step == "sidecar" || step == "stage" || step == "write")
            return makeError(ErrorCode::outOfSpace, "disk");
        return std::nullopt;
    }
};

} // namespace

std::unique_ptr<StoreFileSystem> dyingFileSystem(int step, bool after) {
    return std::make_unique<DyingFileSystem>(step, after);
}

std::unique_ptr<StoreFileSystem> meddlingFileSystem(std::string kind, std::function<void()> act) {
    return std::make_unique<MeddlingFileSystem>(std::move(kind), std::move(act));
}

std::unique_ptr<StoreFileSystem> fullFileSystem() {
    return std::make_unique<FullFileSystem>();
}

int inAnotherProcess(const std::function<int()>& work) {
    const pid_t child = fork();
    if (child == 0)
        _exit(work());
    int status = 0;
    waitpid(child, &status, 0);
    return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
}

Failure StoreFixture::open() {
    Result<OpenedStore> opened = openStore(layout, *disk, clock);
    if (!opened)
        return opened.error();
    store.emplace(std::move(*opened));
    queue = std::make_unique<WorkQueue>("store");
    context.emplace(
        StoreContext{layout, store->mark, *disk, *remote, clock, *queue, *store->database});
    queue->sync([&] { Transfers::recover(*context); });
    transfers = std::make_unique<Transfers>(*context, progress, rateLimit, nullptr);
    queue->sync([&] {
        synchronizer =
            std::make_unique<Synchronizer>(*context, transfers->queue(), transfers->limiter(),
                                           cancel, store->lock.afterCrash(), nullptr);
    });
    const Result<std::string> mark = remote->connect(cancel);
    return mark ? Failure() : Failure(mark.error());
}

void StoreFixture::close() {
    synchronizer.reset();
    transfers.reset();
    queue.reset();
    context.reset();
    store.reset();
}

Failure StoreFixture::list() {
    std::vector<ItemId> folders;
    queue->sync([&] {
        StateDatabase& database = *store->database;
        const bool first = database.scan(rootItem, Side::remote).generation == 0;
        const Failure failure = database.transaction([&]() -> Failure {
            if (first)
                database.putScan(rootItem, Side::remote, {0, false});
            return std::nullopt;
        });
        EXPECT_EQ(failure, std::nullopt);
        folders = database.unfinishedScans(Side::remote);
    });
    return RemoteLister(*context, cancel, nullptr).run(folders, RemoteLister::Depth::newFolders);
}

Failure StoreFixture::refresh() {
    return RemoteLister(*context, cancel, nullptr).run({rootItem}, RemoteLister::Depth::everything);
}

Synchronizer::Report StoreFixture::sync() {
    if (!store) {
        const Failure failure = open();
        EXPECT_EQ(failure, std::nullopt);
    }
    std::size_t changes = 0;
    for (int run = 1;; ++run) { // as the command does: until everything has settled
        Synchronizer::Report report = synchronizer->run({true, true, {}, true});
        report.changes = changes += report.changes;
        if (report.failure || report.question || run == 5 ||
            (!report.settlesIn && !report.secondLook))
            return report;
        clock.advance(secondLookDelay);
    }
}

void StoreFixture::synced() {
    const Synchronizer::Report report = sync();
    EXPECT_FALSE(report.failure) << report.failure->localizedDescription.value_or("")
                                 << report.failure->localizedFailureReason.value_or("");
    EXPECT_FALSE(report.question);
    queue->sync([&] {
        for (const PendingWork& work : Synchronizer::pending(*store->database))
            ADD_FAILURE() << work.kind << ' ' << work.path << ": " << work.cause;
        EXPECT_TRUE(store->database->disagreements().empty());
    });
}

Failure StoreFixture::fetch(const std::string& path) {
    CancelFlag own;
    return transfers->fetch(url(path), own);
}

Failure StoreFixture::move(const std::string& from, const std::string& to) {
    Failure failure;
    queue->sync([&] { failure = StoreMoves(*context).move(url(from), url(to)); });
    return failure;
}

Url StoreFixture::url(const std::string& path) const {
    return Url::file(path.starts_with('/') ? path : layout.root() + '/' + path);
}

std::optional<FoundSidecar> StoreFixture::sidecar(const std::string& path) const {
    const std::string full = url(path).path();
    return findSidecar(std::string(folderOf(full)), nameOf(full),
                       readRootMark(layout).value_or("?"));
}

bool StoreFixture::isPromised(const std::string& path) const {
    return !local(path) && sidecar(path).has_value();
}

std::optional<std::string> StoreFixture::local(const std::string& path) const {
    const Result<Bytes> content = FileManager::contents(url(path), 64U << 20U);
    if (!content)
        return std::nullopt;
    return std::string(reinterpret_cast<const char*>(content->data()), content->size());
}

std::optional<ItemState> StoreFixture::state(const std::string& path) {
    std::optional<ItemState> found;
    queue->sync([&] {
        if (const auto item = store->database->itemAtPath(path))
            found = store->database->state(*item);
    });
    return found;
}

std::vector<std::string> StoreFixture::refused(const std::string& folder) {
    std::vector<std::string> names;
    queue->sync([&] {
        if (const auto item = store->database->itemAtPath(folder))
            for (const RefusedRow& row : store->database->refused(*item, Side::remote))
                names.push_back(row.name);
    });
    return names;
}

std::size_t StoreFixture::stagedFiles() const {
    const auto entries = FileManager::entries(layout.staging());
    return entries ? entries->size() : 0;
}

} // namespace test
