#include "platform/cloud/Synchronizer.h"

#include "platform/base/Describe.h"
#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/LocalScanner.h"
#include "platform/cloud/SyncTimes.h"

#include <algorithm>

namespace platform {
namespace {

/// Plans that one run carries out: more than any tree is deep, and an end where something moves to
/// and fro.
constexpr int roundsAtMost = 300;
/// How often in one run a step is made again that only came too late.
constexpr int triesAtOnce = 3;
/// How often a tree that changes while it is looked at is looked at again before that waits.
constexpr int looksAtOnce = 4;
constexpr const char* troubleKind = "sync";
constexpr const char* damageKind = "damaged";

bool onlyCameTooLate(const Error& error) {
    return error.is(ErrorCode::changedRemotely) || error.is(ErrorCode::changedWhileRead) ||
           error.is(ErrorCode::fileExists) || error.is(ErrorCode::noSuchItem) ||
           error.is(ErrorCode::folderNotEmpty);
}

} // namespace

Synchronizer::Synchronizer(StoreContext& context, TransferQueue& transfers, RateLimiter& limiter,
                           CancelFlag& cancel, bool afterCrash, RemoteLister::Written written)
    : context_(context),
      cancel_(cancel),
      written_(std::move(written)),
      executor_(context, transfers, limiter),
      afterCrash_(afterCrash) {
    // Whatever failed for the program before is tried anew.
    for (const OpRow& op : context_.database.operations())
        if (op.kind == damageKind)
            damaged_.emplace(op.item, op.id);
        else if (op.kind == troubleKind)
            troubles_.emplace(op.item, Trouble{Backoff(static_cast<std::uint64_t>(op.item)), op.id,
                                               op.tries, 0, Date{}});
}

Synchronizer::Report Synchronizer::run(const Request& request) {
    Report report;
    commanded_ = request.commanded;
    for (auto& [item, trouble] : troubles_) {
        trouble.triesInThisRun = 0;
        if (request.commanded) {
            trouble.backoff.reset();
            trouble.nextAt = {};
        }
    }
    if (DirtyFolders::Marks marks = marksOf(request); !marks.empty())
        report.failure = look(std::move(marks), report);
    if (!report.failure && !report.question)
        report.failure = list(request.folders, request.everything, report);
    if (!report.failure && !report.question)
        report.failure = settleRemote(request.commanded || request.lookAgain, report);
    context_.queue.sync([&] {
        if (!report.question)
            report.question = question(context_.database);
    });
    if (!report.failure && !report.question)
        report.failure = carryOutAll(report);
    if (!report.failure && !report.question)
        for (const auto& [item, trouble] : troubles_)
            if (!report.retryAt || trouble.nextAt < *report.retryAt)
                report.retryAt = trouble.nextAt;
    if (!report.failure)
        report.failure = report.incomplete;
    report.waiting = troubles_.size() + waitingForNetwork().size();
    return report;
}

DirtyFolders::Marks Synchronizer::marksOf(const Request& request) {
    DirtyFolders::Marks marks = dirty_.take();
    bool asked = false;
    context_.queue.sync([&] {
        const std::optional<DeletionQuestion> open = question(context_.database);
        asked = open && open->side == Side::local; // what is back again is asked about no longer
    });
    marks.everything = marks.everything || request.lookAtDisk || !lookedAtAll_ || afterCrash_ ||
                       (asked && !marks.folders.empty()) || isVanishingDue();
    return marks;
}

Failure Synchronizer::look(DirtyFolders::Marks marks, Report& report) {
    const Duration begun = context_.clock.monotonic();
    Failure failure;
    bool settled = false;
    for (int attempt = 1; !failure && !settled; ++attempt) {
        LocalScanner scanner(context_, cancel_);
        failure = marks.everything ? scanner.lookAtAll() : scanner.lookAt(marks.folders);
        if (failure || (scanner.again() && attempt < looksAtOnce)) {
            marks.everything = marks.everything || scanner.wantsAll();
            continue;
        }
        settled = true;
        if (scanner.again()) { // it changes all the time
            dirty_.add(marks);
            report.settle(settleTime);
        }
        failure = settleLook(scanner, marks.everything, report);
    }
    if (failure)
        dirty_.add(marks);
    report.looked += context_.clock.monotonic() - begun;
    return failure;
}

Failure Synchronizer::settleLook(const LocalScanner& scanner, bool whole, Report& report) {
    report.folders.insert(report.folders.end(), scanner.folders().begin(),
                          scanner.folders().end());
    report.allFolders = report.allFolders || whole;
    report.settle(scanner.settlesIn(), scanner.youngFile());
    if (scanner.unreadable())
        report.unreadable = scanner.unreadable();
    for (const std::string& folder : scanner.unsettled())
        dirty_.add(folder);
    if (scanner.again())
        return std::nullopt;
    if (!whole) {
        std::erase_if(vanishing_[Side::local].items,
                      [&](ItemId item) { return scanner.saw(item); });
        noteVanished(scanner.vanished(), report);
        return std::nullopt;
    }
    lookedAtAll_ = true;
    if (afterCrash_)
        if (Failure failure = noteDamage())
            return failure;
    return settleLocal(scanner.vanished(), report);
}

Failure Synchronizer::list(const std::vector<ItemId>& folders, bool everything, Report& report) {
    if (!everything && folders.empty())
        return std::nullopt;
    RemoteLister lister(context_, cancel_, written_);
    Failure failure = everything ? lister.run({rootItem}, RemoteLister::Depth::everything)
                                 : lister.run(folders, RemoteLister::Depth::newFolders);
    if (!failure || RemoteLister::stopsEverything(*failure))
        return failure;
    report.incomplete = std::move(failure);
    return std::nullopt;
}

std::vector<SyncStep> Synchronizer::plan() {
    if (!damaged_.empty())
        forgetRepaired();
    PlanOptions options;
    for (const auto& [item, op] : damaged_)
        options.damaged.insert(item);
    std::vector<SyncStep> steps = planSync(trees(), options);
    std::set<ItemId> wanted;
    for (const SyncStep& step : steps)
        wanted.insert(step.item);
    std::vector<ItemId> over; // what failed, and need not be done any more
    for (const auto& [item, trouble] : troubles_)
        if (!wanted.contains(item))
            over.push_back(item);
    for (const ItemId item : over)
        forgetTrouble(item);
    const std::set<ItemId>& vanishing = vanishing_[Side::local].items;
    std::erase_if(steps, [&](const SyncStep& step) {
        // Of what vanished only the records still say that it is there.
        return !mayTry(step.item) || vanishing.contains(step.item) ||
               vanishing.contains(step.other);
    });
    leaveTransfers(steps);
    return steps;
}

void Synchronizer::leaveTransfers(std::vector<SyncStep>& steps) {
    std::vector<PendingWork> left;
    if (metered_ && !commanded_)
        std::erase_if(steps, [&](const SyncStep& step) {
            const bool transfers =
                step.kind == StepKind::upload || step.kind == StepKind::uploadChange ||
                step.kind == StepKind::download || step.kind == StepKind::reconcile;
            if (transfers)
                left.push_back({step.item, std::string(nameOf(step.kind)), {}, 0, {}, {}});
            return transfers;
        });
    if (!left.empty())
        context_.queue.sync([&] {
            for (PendingWork& work : left)
                work.path = context_.database.localPathOf(work.item).value_or("");
        });
    for (PendingWork& work : left)
        work.cause = localized("Waits for a network that is not metered. “Sync Now” does not wait.");
    const std::lock_guard lock(waitingMutex_);
    waiting_ = std::move(left);
}

std::vector<PendingWork> Synchronizer::waitingForNetwork() const {
    const std::lock_guard lock(waitingMutex_);
    return waiting_;
}

/// What disagrees, with all folders above it and whoever has a place that it wants.
SyncTrees Synchronizer::trees() {
    std::vector<ItemState> items;
    context_.queue.sync([&] {
        StateDatabase& database = context_.database;
        items = database.disagreements();
        std::set<ItemId> seen{rootItem};
        for (const ItemState& state : items)
            seen.insert(state.item.id);
        const auto want = [&](std::optional<ItemId> item) {
            if (!item || !seen.insert(*item).second)
                return;
            if (std::optional<ItemState> state = database.state(*item))
                items.push_back(std::move(*state));
        };
        for (std::size_t i = 0; i < items.size(); ++i) {
            const std::optional<Place> here =
                items[i].local ? std::optional(items[i].local->place) : std::nullopt;
            const std::optional<Place> there =
                items[i].remote ? std::optional(items[i].remote->place) : std::nullopt;
            if (here) {
                want(here->parent);
                want(database.remoteItemAt(*here));
            }
            if (there) {
                want(there->parent);
                want(database.localItemAt(*there));
            }
        }
    });
    return SyncTrees(std::move(items));
}

Failure Synchronizer::carryOutAll(Report& report) {
    bool listed = false;
    context_.queue.sync([&] { listed = context_.database.scan(rootItem, Side::remote).complete; });
    for (int round = 0; listed && round < roundsAtMost; ++round) {
        const std::vector<SyncStep> steps = plan();
        if (steps.empty())
            break;
        SyncExecutor::Outcome outcome = executor_.run(steps);
        report.changes += outcome.done;
        if (Failure failure = digest(outcome, steps, report))
            return failure;
        if (report.question || (outcome.done == 0 && outcome.failed.empty()))
            break;
        if (outcome.settlesIn && outcome.done + outcome.failed.size() == steps.size())
            break; // what is being written to is all that is left
    }
    return std::nullopt;
}

Failure Synchronizer::noteDamage() {
    Failure failure;
    context_.queue.sync([&] {
        StateDatabase& database = context_.database;
        const std::vector<ItemState> states = database.disagreements();
        failure = database.transaction([&]() -> Failure {
            for (const ItemState& state : states)
                if (looksDamaged(state) && isChangedHere(state) &&
                    !damaged_.contains(state.item.id))
                    damaged_[state.item.id] = database.putOperation(
                        {0, state.item.id, damageKind, "", "", "", {}, 0, 0, {}, {}});
            return std::nullopt;
        });
    });
    if (!failure)
        afterCrash_ = false;
    return failure;
}

void Synchronizer::forgetRepaired() {
    context_.queue.sync([&] {
        StateDatabase& database = context_.database;
        std::erase_if(damaged_, [&](const auto& damaged) {
            const std::optional<ItemState> state = database.state(damaged.first);
            if (state && looksDamaged(*state))
                return false;
            return !database.transaction([&]() -> Failure {
                database.removeOperation(damaged.second);
                return std::nullopt;
            });
        });
    });
}

Failure Synchronizer::digest(SyncExecutor::Outcome& outcome, const std::vector<SyncStep>& steps,
                             Report& report) {
    report.settle(outcome.settlesIn, outcome.youngFile);
    for (const SyncStep& step : steps)
        if (const auto failed = outcome.failed.find(step.item); failed != outcome.failed.end())
            noteTrouble(step, failed->second);
        else if (!outcome.stopped)
            forgetTrouble(step.item);
    if (outcome.stopped)
        return outcome.stopped;
    if (!outcome.disturbed.empty())
        if (Failure failure = look({false, outcome.disturbed}, report))
            return failure;
    if (report.question)
        return std::nullopt;
    return list({outcome.outdated.begin(), outcome.outdated.end()}, false, report);
}

bool Synchronizer::mayTry(ItemId item) {
    const auto found = troubles_.find(item);
    if (found == troubles_.end())
        return true;
    const Trouble& trouble = found->second;
    return trouble.nextAt <= context_.clock.now() && trouble.triesInThisRun < triesAtOnce;
}

void Synchronizer::noteTrouble(const SyncStep& step, const Error& error) {
    const auto [found, fresh] = troubles_.try_emplace(
        step.item, Trouble{Backoff(static_cast<std::uint64_t>(step.item)), 0, 0, 0, Date{}});
    Trouble& trouble = found->second;
    ++trouble.tries;
    ++trouble.triesInThisRun;
    const bool again = onlyCameTooLate(error) && trouble.triesInThisRun < triesAtOnce;
    const Date now = context_.clock.now();
    if (!again)
        trouble.nextAt = Date{now.nanoseconds + trouble.backoff.next().count()};
    context_.queue.sync([&] {
        const Failure ignored = context_.database.transaction([&]() -> Failure {
            if (context_.database.state(step.item))
                trouble.op = context_.database.putOperation(
                    {trouble.op,
                     step.item,
                     troubleKind,
                     std::string(nameOf(step.kind)),
                     "",
                     "",
                     {},
                     0,
                     trouble.tries,
                     trouble.nextAt,
                     error.localizedDescription.value_or(description(error))});
            return std::nullopt;
        });
    });
}

void Synchronizer::forgetTrouble(ItemId item) {
    const auto found = troubles_.find(item);
    if (found == troubles_.end())
        return;
    context_.queue.sync([&] {
        const Failure ignored = context_.database.transaction([&]() -> Failure {
            context_.database.removeOperation(found->second.op);
            return std::nullopt;
        });
    });
    troubles_.erase(found);
}

std::vector<PendingWork> Synchronizer::pending(StateQueries& queries) {
    std::vector<PendingWork> work;
    for (const OpRow& op : queries.operations())
        if (op.kind == troubleKind)
            work.push_back(
                {op.item, op.phase,
                 queries.localPathOf(op.item).value_or(queries.remotePathOf(op.item).value_or("")),
                 op.tries, op.nextAt.value_or(Date{}), op.error});
    return work;
}

} // namespace platform
