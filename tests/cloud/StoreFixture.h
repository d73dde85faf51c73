#pragma once

#include "platform/base/ManualClock.h"
#include "platform/base/WorkQueue.h"
#include "platform/cloud/FolderRemote.h"
#include "platform/cloud/RemoteLister.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/StoreMoves.h"
#include "platform/cloud/Synchronizer.h"
#include "platform/cloud/Transfers.h"
#include "platform/files/Progress.h"
#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace test {

/// Hands everything on to another remote; a test changes what it is about.
class ForwardingRemote : public platform::Remote {
public:
    explicit ForwardingRemote(std::unique_ptr<platform::Remote> real) : real_(std::move(real)) {}
    platform::Result<std::string> connect(platform::CancelFlag& cancel) override {
        return real_->connect(cancel);
    }
    platform::Result<platform::RemoteListing> list(const std::string& path,
                                                   platform::CancelFlag& cancel) override {
        return real_->list(path, cancel);
    }
    platform::Result<platform::RemoteEntry> entry(const std::string& path,
                                                  platform::CancelFlag& cancel) override {
        return real_->entry(path, cancel);
    }
    platform::Result<platform::RemoteEntry> read(const std::string& path, const Sink& sink,
                                                 platform::CancelFlag& cancel) override {
        return real_->read(path, sink, cancel);
    }
    platform::Result<platform::RemoteEntry> write(const std::string& path,
                                                  const platform::RemoteUpload& upload,
                                                  const platform::RemoteCondition& condition,
                                                  platform::CancelFlag& cancel) override {
        return real_->write(path, upload, condition, cancel);
    }
    platform::Result<platform::RemoteEntry> makeFolder(const std::string& path,
                                                       platform::CancelFlag& cancel) override {
        return real_->makeFolder(path, cancel);
    }
    platform::Result<platform::RemoteEntry> move(const std::string& from, const std::string& to,
                                                 const std::string& etag,
                                                 platform::CancelFlag& cancel) override {
        return real_->move(from, to, etag, cancel);
    }
    platform::Failure remove(const std::string& path, platform::ItemKind kind,
                             const std::string& etag, platform::CancelFlag& cancel) override {
        return real_->remove(path, kind, etag, cancel);
    }
    platform::Failure sync(platform::CancelFlag& cancel) override { return real_->sync(cancel); }
    platform::Result<std::optional<std::uint64_t>>
    freeBytes(platform::CancelFlag& cancel) override {
        return real_->freeBytes(cancel);
    }

protected:
    std::unique_ptr<platform::Remote> real_;
};

/// A real remote folder and a real store, and words for what is done to both.
struct StoreFixture : ::testing::Test {
    TemporaryFolder home;
    platform::ManualClock clock;
    platform::FileProgressSubscription progress;
    platform::CancelFlag cancel;
    platform::StoreLayout layout{home / "store"};
    /// Bytes a second; 0 for no limit.
    std::uint64_t rateLimit = 0;

    std::unique_ptr<platform::StoreFileSystem> disk = platform::makeRealStoreFileSystem();
    std::unique_ptr<platform::Remote> remote =
        std::make_unique<platform::FolderRemote>(home / "remote", clock);
    std::unique_ptr<platform::WorkQueue> queue;
    std::optional<platform::OpenedStore> store;
    std::optional<platform::StoreContext> context;
    std::unique_ptr<platform::Transfers> transfers;
    std::unique_ptr<platform::Synchronizer> synchronizer;

    StoreFixture() { home.makeFolder("remote"); }
    ~StoreFixture() override { close(); }

    std::string givenRemote(const std::string& path, const std::string& content = "") const {
        return home.write("remote/" + path, content);
    }
    void givenRemoteFolder(const std::string& path) const { home.makeFolder("remote/" + path); }
    std::string givenLocal(const std::string& path, const std::string& content) const {
        return home.write("store/Shelfroot/" + path, content);
    }

    /// Opens the store and finishes what an earlier program left.
    platform::Failure open();
    void close();
    platform::Failure list();
    /// A later look at everything.
    platform::Failure refresh();
    /// Makes both sides agree, as a command of the user's does.
    platform::Synchronizer::Report sync();
    /// The same, and all has gone well.
    void synced();
    platform::Failure fetch(const std::string& path);
    platform::Failure move(const std::string& from, const std::string& to);

    platform::Url url(const std::string& path) const;
    /// The promise of the document, also where its content is there as well.
    std::optional<platform::FoundSidecar> sidecar(const std::string& path) const;
    bool isPromised(const std::string& path) const;
    /// The content on the device; none when there is none.
    std::optional<std::string> local(const std::string& path) const;
    std::optional<platform::ItemState> state(const std::string& path);
    std::vector<std::string> refused(const std::string& folder);
    std::size_t stagedFiles() const;
};

/// Runs `work` in a process of its own and answers its exit code.
int inAnotherProcess(const std::function<int()>& work);

/// A disk that ends its process before or after its n-th change, as a crash would.
std::unique_ptr<platform::StoreFileSystem> dyingFileSystem(int step, bool after);
inline constexpr int diedOnTheWay = 77;

/// A disk where somebody else acts right before the first change of that kind ("rename", "remove").
std::unique_ptr<platform::StoreFileSystem> meddlingFileSystem(std::string kind,
                                                              std::function<void()> act);

/// A disk on which making promises and staging fail as on a full one.
std::unique_ptr<platform::StoreFileSystem> fullFileSystem();

} // namespace test
