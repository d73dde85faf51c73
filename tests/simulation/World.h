#pragma once

#include "platform/base/WorkQueue.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/cloud/Synchronizer.h"
#include "platform/cloud/Transfers.h"
#include "platform/files/Progress.h"
#include "tests/simulation/DiskTrouble.h"
#include "tests/simulation/far/SimRemote.h"
#include "tests/simulation/machine/Disk.h"

#include <map>
#include <memory>
#include <optional>
#include <set>
#include <string>
#include <vector>

namespace simulation {

/// One seed: a device with its disk, a far side, their users, and what goes wrong. Every content is
/// written once and never again, so that each can be followed wherever it goes.
class World {
public:
    explicit World(std::uint64_t seed);
    ~World();
    World(const World&) = delete;
    World& operator=(const World&) = delete;

    /// What the engine got wrong; none when nothing.
    std::optional<std::string> run();
    /// What happened, a line each.
    const std::vector<std::string>& story() const { return story_; }

private:
    // Users.
    void act();
    /// While the engine works: between any two of its steps.
    void actMeanwhile();
    bool holdsPromise(const std::string& path) const;
    void actHere();
    void actThere();
    void writeHere(const std::string& path);
    std::string freshContent();
    std::string somePath();
    std::vector<std::string> filesHere() const;
    void release(const std::string& content);
    void releaseTreeHere(const std::string& path);
    void releaseTreeThere(const std::string& path);

    // The device.
    void open();
    void close();
    /// Looks at the whole disk, or at what notices tell of.
    enum class Look { all, marked };
    platform::Synchronizer::Report synchronize(Look look, std::size_t turnsUntilStop = 0);
    Look someLook() { return luck_.percent(50) ? Look::all : Look::marked; }
    void noticed(const std::string& path);
    void deliverNotices();
    void fetchOne();
    void crash();

    // What goes wrong; see WorldFaults.cpp.
    void chooseFaults();
    void endFaults();
    void harmDatabase();
    void copyDatabase(const std::string& from, const std::string& to);

    // The oracle.
    std::optional<std::string> settle();
    std::optional<std::string> missingContent(bool atRest);
    std::optional<std::string> difference();
    std::string records(bool disagreeing);
    void collect(const std::string& folder, std::set<std::string>& contents) const;
    void listHere(const std::string& folder, const std::string& shown,
                  std::map<std::string, std::string>& tree) const;
    void tell(std::string line) { story_.push_back(std::move(line)); }

    Luck luck_;
    std::shared_ptr<Disk> disk_;
    std::unique_ptr<FarSide> far_;
    FarLine line_;
    std::vector<std::string> story_;
    DiskTrouble trouble_;
    bool busyUsers_ = false;                       // they do not wait until the engine rests
    unsigned lostNotices_ = 0;                     // of a hundred
    std::set<std::string> notices_;                // folders that were changed
    bool hasYesterday_ = false;                    // a copy of the database
    std::set<std::string> wanted_;                 // contents that nobody gave up
    std::map<std::string, std::string> lastThere_; // contents of the far side after the last run
    int lastContent_ = 0;
    bool off_ = false;

    platform::StoreLayout layout_{"/sim/home/store"};
    platform::FileProgressSubscription progress_;
    std::unique_ptr<platform::StoreFileSystem> files_;
    std::unique_ptr<SimRemote> remote_;
    std::unique_ptr<platform::CancelFlag> cancel_;
    std::optional<platform::OpenedStore> store_;
    std::unique_ptr<platform::WorkQueue> queue_;
    std::optional<platform::StoreContext> context_;
    std::unique_ptr<platform::Transfers> transfers_;
    std::unique_ptr<platform::Synchronizer> synchronizer_;
};

} // namespace simulation
