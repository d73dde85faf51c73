#include "tests/simulation/World.h"

#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"
#include "tests/simulation/machine/Fibers.h"
#include "tests/simulation/machine/Machine.h"

#include <algorithm>
#include <cstdlib>
#include <fcntl.h>
#include <thread>
#include <unistd.h>

namespace simulation {
namespace {

using namespace platform;

constexpr std::size_t turnsAtMost = 3'000'000;
constexpr int runsUntilRest = 20;
constexpr auto between = std::chrono::minutes(6);

Machine& machine() {
    return Machine::shared();
}

FarHabits habitsOf(Luck& luck) {
    FarHabits habits;
    habits.ids = luck.percent(70);
    habits.keepsTimes = luck.percent(80);
    habits.moveChangesEtag = luck.percent(40);
    habits.folderEtags = luck.percent(30);
    habits.checksInSteps = luck.percent(40);
    habits.youngEtags = luck.percent(20);
    return habits;
}

std::string readAll(const std::string& path) {
    const Result<Bytes> bytes = FileManager::contents(Url::file(path), 1U << 20U);
    return bytes ? std::string(reinterpret_cast<const char*>(bytes->data()), bytes->size())
                 : std::string();
}

} // namespace

World::World(std::uint64_t seed) : luck_(seed) {
    Fibers& fibers = Fibers::shared();
    fibers.begin(seed);
    fibers.reseed(luck_.next(), 20 + static_cast<unsigned>(luck_.below(200)));
    fibers.setLimit(turnsAtMost);
    machine().luck() = luck_.split();
    fibers.setIdle([&fibers] {
        std::optional<std::chrono::nanoseconds> due = fibers.nextDue();
        if (const auto alarm = machine().time().nextDue(); alarm && (!due || *alarm < *due))
            due = alarm;
        if (!due)
            return false;
        machine().time().moveTo(*due);
        while (Job job = machine().time().takeDue())
            job();
        fibers.wakeDue(*due);
        return true;
    });
    Disk::Setup setup;
    setup.journal = luck_.percent(50) ? Journal::ordered : Journal::loose;
    setup.nameOrder = luck_.next();
    setup.attributes = luck_.percent(90);
    disk_ = std::make_shared<Disk>(setup, [] { return machine().stamp(); });
    machine().mount("/sim/home", disk_);
    machine().setListener(&trouble_);
    trouble_.follow = [this](const std::string& path) { noticed(path); };
    far_ = std::make_unique<FarSide>(habitsOf(luck_), [] { return machine().wall(); });
    line_.luck = luck_.split();
    line_.keepsLog = true;
    line_.pauses = static_cast<unsigned>(luck_.below(400));
    line_.machineIsOff = [this] { return off_; };
    files_ = makeRealStoreFileSystem();
    remote_ = std::make_unique<SimRemote>(*far_, line_);
    for (int i = 0; i < 6; ++i)
        actThere();
    open();
}

World::~World() {
    close();
    machine().setListener(nullptr);
    files_.reset();
    machine().unmountAll();
    machine().time().forgetAlarms();
    Fibers::shared().end();
}

void World::open() {
    cancel_ = std::make_unique<CancelFlag>();
    Result<OpenedStore> store = openStore(layout_, *files_, machine().time());
    if (!store) {
        tell("cannot open: " + store.error().localizedDescription.value_or(""));
        return;
    }
    store_.emplace(std::move(*store));
    queue_ = std::make_unique<WorkQueue>("store");
    context_.emplace(StoreContext{layout_, store_->mark, *files_, *remote_, machine().time(),
                                  *queue_, *store_->database});
    queue_->sync([&] { Transfers::recover(*context_); });
    transfers_ = std::make_unique<Transfers>(*context_, progress_, 0, nullptr);
    queue_->sync([&] {
        synchronizer_ =
            std::make_unique<Synchronizer>(*context_, transfers_->queue(), transfers_->limiter(),
                                           *cancel_, store_->lock.afterCrash(), nullptr);
    });
}

void World::close() {
    if (cancel_)
        cancel_->cancel();
    if (synchronizer_)
        synchronizer_->cancel();
    if (transfers_)
        transfers_->stop();
    synchronizer_.reset();
    transfers_.reset();
    queue_.reset();
    context_.reset();
    store_.reset();
}

/// As the kernel does, who tells of the engine's own changes as well.
void World::noticed(const std::string& path) {
    const std::string root = layout_.root() + '/';
    if (path.starts_with(root) && !luck_.percent(lostNotices_))
        notices_.insert(path.substr(0, std::max(path.rfind('/'), root.size() - 1)));
}

void World::deliverNotices() {
    for (const std::string& folder : std::exchange(notices_, {}))
        synchronizer_->changedOnDisk(
            folder.substr(std::min(folder.size(), layout_.root().size() + 1)));
}

Synchronizer::Report World::synchronize(Look look, std::size_t turnsUntilStop) {
    Synchronizer::Report report;
    if (!synchronizer_)
        return report;
    deliverNotices();
    bool ended = false;
    std::thread thread([&] {
        const Result<std::string> mark = remote_->connect(*cancel_);
        if (!mark)
            report.failure = mark.error();
        else if (*mark != SimRemote::mark) // as the owner of the engine sees to
            report.failure = makeError(ErrorCode::serverNotAvailable);
        else
            report = synchronizer_->run({true, look == Look::all, {}, true, false});
        ended = true;
    });
    if (turnsUntilStop > 0) {
        Fibers::shared().run(turnsUntilStop, [&] { return ended; });
        if (!ended) {
            machine().stopNow(luck_.percent(70) ? Machine::Stop::power : Machine::Stop::kill);
            off_ = true;
            cancel_->cancel();
            synchronizer_->cancel();
        }
    }
    while (busyUsers_ && !ended && !off_) {
        Fibers::shared().run(1 + luck_.below(2000), [&] { return ended; });
        if (!ended && luck_.percent(30))
            actMeanwhile();
        else if (Fibers::shared().allWait())
            break;
        if (luck_.percent(50))
            deliverNotices();
    }
    thread.join();
    for (std::string& change : line_.log)
        tell("  on the far side: " + std::move(change));
    line_.log.clear();
    for (std::string& call : std::exchange(trouble_.failed, {}))
        tell("  failed: " + std::move(call));
    return report;
}

void World::crash() {
    tell("the machine stops in the middle of a run");
    synchronize(someLook(), 1 + luck_.below(luck_.percent(50) ? 300 : 5000));
    close();
    if (off_) {
        machine().restart();
        disk_ = machine().disk("/sim/home");
    }
    off_ = false;
    open();
}

void World::fetchOne() {
    if (!transfers_)
        return;
    std::vector<std::string> promises;
    disk_->visit(disk_->root(), [&](const std::string& path, const Node& node) {
        if (path.starts_with("/store/Shelfroot/") && node.kind == NodeKind::file &&
            hasSidecarForm(nameOf(path)))
            promises.push_back(path);
    });
    if (promises.empty())
        return;
    const std::string& sidecar = luck_.of(promises);
    std::string name(nameOf(sidecar));
    name = name.substr(1, name.size() - 1 - std::string_view(".promise").size());
    const std::string path = "/sim/home" + std::string(folderOf(sidecar)) + '/' + name;
    tell("fetch " + path);
    std::thread thread([&] {
        CancelFlag own;
        const Failure ignored = transfers_->fetch(Url::file(path), own);
    });
    thread.join();
}

std::optional<std::string> World::run() {
    const int rounds = 2 + static_cast<int>(luck_.below(6));
    for (int round = 0; round < rounds; ++round) {
        for (std::uint64_t i = luck_.below(7); i > 0; --i)
            act();
        if (!store_)
            open();
        chooseFaults();
        if (luck_.percent(25)) {
            crash();
        } else {
            const Look look = someLook();
            tell(look == Look::all ? "run" : "run for what was noticed");
            synchronize(look);
        }
        endFaults();
        machine().time().creep(std::chrono::milliseconds(luck_.below(4000)));
        if (luck_.percent(5)) {
            tell("the clock is set");
            machine().time().jump(std::chrono::seconds(luck_.between(-40000, 40000)));
        }
        if (luck_.percent(8))
            harmDatabase();
        if (auto lost = missingContent(false))
            return lost;
    }
    return settle();
}

std::optional<std::string> World::settle() {
    tell("nothing fails any more");
    for (int run = 0; run < runsUntilRest; ++run) {
        machine().time().creep(between);
        if (!store_)
            open();
        if (!store_)
            return "the store cannot be opened";
        // What notices told of brings nearly everything; that nothing is left a look at all proves.
        const Look look = run % 2 == 1 ? Look::all : Look::marked;
        const Synchronizer::Report report = synchronize(look);
        if (report.failure)
            tell("run: " + report.failure->localizedDescription.value_or("") + " " +
                 report.failure->localizedFailureReason.value_or(""));
        if (report.question) {
            const bool away = luck_.percent(50);
            tell(away ? "answer: delete them" : "answer: put them back");
            queue_->sync([&] {
                const Failure ignored = synchronizer_->answer(away ? DeletionAnswer::deleteThem
                                                                   : DeletionAnswer::putBack);
            });
            continue;
        }
        bool agreed = false;
        queue_->sync([&] { agreed = store_->database->disagreements().empty(); });
        if (look == Look::all && !report.failure && !report.settlesIn && !report.secondLook && report.changes == 0 &&
            agreed) {
            if (auto lost = missingContent(true))
                return lost;
            auto differs = difference();
            return differs ? *differs + '\n' + records(false) : differs;
        }
    }
    return "does not come to rest\n" + records(true);
}

/// What the engine has written down: what both sides do not agree on, or all.
std::string World::records(bool disagreeing) {
    std::string text;
    queue_->sync([&] {
        StateDatabase& database = *store_->database;
        for (const ItemState& state :
             disagreeing ? database.disagreements() : database.localItems()) {
            const auto place = [](const auto& row) {
                return row ? std::to_string(row->place.parent) + '/' + row->place.name : "-";
            };
            text += std::to_string(state.item.id) + ": " + place(state.local) + " | " +
                    place(state.remote) + " | " + place(state.base) + '\n';
        }
        for (const PendingWork& work : Synchronizer::pending(database))
            text += work.kind + ' ' + work.path + ": " + work.cause + '\n';
    });
    return text;
}

void World::collect(const std::string& folder, std::set<std::string>& contents) const {
    const auto entries = FileManager::entries(folder);
    if (!entries)
        return;
    for (const DirectoryEntry& entry : *entries)
        if (entry.kind == FileKind::directory)
            collect(folder + '/' + entry.name, contents);
        else
            contents.insert(readAll(folder + '/' + entry.name));
}

std::optional<std::string> World::missingContent(bool atRest) {
    std::set<std::string> found;
    for (const std::string& folder : {layout_.root(), layout_.kept()})
        collect(folder, found);
    if (!atRest)
        collect(layout_.staging(), found);
    far_->visit([&](const std::string&, const FarItem& item) { found.insert(item.content); });
    lastThere_.clear();
    far_->visit([&](const std::string& path, const FarItem& item) {
        if (!item.folder)
            lastThere_[path] = item.content;
    });
    for (const std::string& content : wanted_)
        if (!found.contains(content))
            return "lost: " + content;
    return std::nullopt;
}

void World::listHere(const std::string& folder, const std::string& shown,
                     std::map<std::string, std::string>& tree) const {
    const auto entries = FileManager::entries(folder);
    if (!entries)
        return;
    for (const DirectoryEntry& entry : *entries) {
        const std::string path = folder + '/' + entry.name;
        if (entry.name == ".pelmora-root")
            continue;
        if (entry.kind == FileKind::directory) {
            tree[shown + entry.name + '/'] = "";
            listHere(path, shown + entry.name + '/', tree);
        } else if (const auto mark = readMark(path, store_->mark)) {
            tree[shown + promisedName(entry.name, *mark)] = "a promise";
        } else {
            tree[shown + entry.name] = readAll(path);
        }
    }
}

std::optional<std::string> World::difference() {
    std::map<std::string, std::string> here;
    std::map<std::string, std::string> there;
    listHere(layout_.root(), "", here);
    far_->visit([&](const std::string& path, const FarItem& item) {
        if (!path.empty() && !path.starts_with(".pelmora"))
            there[item.folder ? path + '/' : path] = item.content;
    });
    for (const auto& [path, content] : here)
        if (!there.contains(path))
            return "only here: " + path;
        else if (content != "a promise" && content != there[path])
            return "differs: " + path + ": " + content + " and " + there[path];
    for (const auto& [path, content] : there)
        if (!here.contains(path))
            return "only there: " + path;
    return std::nullopt;
}

} // namespace simulation
