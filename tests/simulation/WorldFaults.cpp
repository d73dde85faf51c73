#include "platform/files/FileManager.h"
#include "tests/simulation/World.h"
#include "tests/simulation/machine/Machine.h"

#include <cerrno>

namespace simulation {

using namespace platform;

namespace {

constexpr std::uint64_t remoteCalls = 40; // about as many as a run makes, as is the next
constexpr std::uint64_t diskCalls = 400;
constexpr std::uint64_t faultKinds = 6;

} // namespace

void World::chooseFaults() {
    endFaults();
    busyUsers_ = luck_.percent(30);
    for (std::uint64_t i = luck_.percent(50) ? luck_.below(5) : 0; i > 0; --i)
        line_.faults[luck_.below(remoteCalls)] = {
            static_cast<FarFault::Kind>(luck_.below(faultKinds)),
            luck_.percent(50) ? ErrorCode::serverNotAvailable : ErrorCode::timedOut};
    if (luck_.percent(15)) {
        std::map<std::uint64_t, int> faults;
        for (std::uint64_t i = 1 + luck_.below(4); i > 0; --i)
            faults[luck_.below(diskCalls)] = luck_.of(std::vector<int>{EIO, ENOSPC, EACCES});
        tell("calls of the disk fail");
        trouble_.begin(std::move(faults));
    }
    if (luck_.percent(5)) {
        tell("the disk is full");
        disk_->setup().room = 0;
    }
    lostNotices_ = luck_.percent(20) ? static_cast<unsigned>(luck_.below(100)) : 0;
    line_.away = luck_.percent(5);
    line_.otherDisk = luck_.percent(3);
    line_.muddled = luck_.percent(3);
    if (line_.away || line_.otherDisk || line_.muddled)
        tell(line_.away        ? "the far side is away"
             : line_.otherDisk ? "something else is in the far side's place"
                               : "the far side looks empty");
}

void World::endFaults() {
    line_.faults.clear();
    line_.away = line_.otherDisk = line_.muddled = false;
    trouble_.begin({});
    disk_->setup().room = UINT64_MAX;
    busyUsers_ = false;
    lostNotices_ = 0;
}

void World::copyDatabase(const std::string& from, const std::string& to) {
    for (const char* end : {"", "-wal", "-shm"}) {
        const Failure gone = FileManager::removeItem(Url::file(to + end));
        if (const Result<Bytes> bytes = FileManager::contents(Url::file(from + end), SIZE_MAX))
            if (FileManager::writeAtomically(
                    Url::file(to + end),
                    {reinterpret_cast<const char*>(bytes->data()), bytes->size()}))
                tell("the copy of the database failed");
    }
    disk_->syncAll();
}

/// It is lost, or an earlier one takes its place.
void World::harmDatabase() {
    const std::string yesterday = "/sim/home/yesterday.db";
    close();
    if (!hasYesterday_ || luck_.percent(50)) {
        tell("the database is copied");
        copyDatabase(layout_.database(), yesterday);
        hasYesterday_ = true;
    } else if (luck_.percent(50)) {
        tell("the database of yesterday is back");
        copyDatabase(yesterday, layout_.database());
    } else {
        tell("the database is lost");
        copyDatabase("/sim/home/nothing", layout_.database());
    }
    open();
}

} // namespace simulation
