#include "platform/cloud/SyncPlan.h"

#include "platform/cloud/SyncNames.h"

#include <algorithm>
#include <map>
#include <optional>
#include <set>

namespace platform {
namespace {

class Planner {
public:
    Planner(const SyncTrees& trees, const PlanOptions& options)
        : trees_(trees), options_(options) {}

    std::vector<SyncStep> run();

private:
    using Wish = std::optional<SyncStep>;

    // What an item asks for, whatever stands in its way.
    Wish wishOf(const ItemState& state) const;
    Wish wishOfFile(const ItemState& state) const;
    Wish wishOfFolder(const ItemState& state) const;
    Wish wishOfBoth(const ItemState& state) const;
    Wish wishOfPlace(const ItemState& state) const;
    bool survivesHere(const ItemState& folder) const;
    bool survivesThere(const ItemState& folder) const;
    bool isDamaged(const ItemState& state) const;

    /// Adds the item's step behind all that has to be done before it; nothing while it has to wait.
    void emit(const ItemState& state);
    void emitFolder(ItemId folder, StepKind making);
    bool clearHere(const ItemState& state, const SyncStep& step);
    bool clearThere(const ItemState& state, const SyncStep& step);
    bool leavesHere(const ItemState& state) const;
    bool leavesThere(const ItemState& state) const;
    void add(SyncStep step);
    void leaveWhatGoes();
    void addDeletions();
    std::size_t depthOf(const ItemState& state) const;

    const SyncTrees& trees_;
    const PlanOptions& options_;
    std::map<ItemId, SyncStep> wishes_;
    std::set<ItemId> busy_;    // on the way to their step
    std::set<ItemId> emitted_; // have it, or have to wait
    std::set<ItemId> aside_;
    std::set<ItemId> added_;
    std::set<ItemId> madeHere_;
    std::set<ItemId> madeThere_;
    std::vector<SyncStep> steps_;
    std::vector<SyncStep> deletions_;
};

SyncStep step(StepKind kind, const ItemState& state, Place to = {}) {
    return {kind, state.item.id, std::move(to), 0};
}

Planner::Wish Planner::wishOf(const ItemState& state) const {
    if (state.item.id == rootItem || isAgreed(state))
        return std::nullopt;
    if (state.remote && isDisplaced(*state.remote))
        return std::nullopt; // the next listings tell
    if (!state.local && !state.remote)
        return step(StepKind::forget, state);
    if (state.local && state.remote)
        return wishOfBoth(state);
    return state.item.kind == ItemKind::folder ? wishOfFolder(state) : wishOfFile(state);
}

/// One side alone has it.
Planner::Wish Planner::wishOfFile(const ItemState& state) const {
    if (state.local) {
        const bool unsent = isChangedHere(state) && !isDamaged(state);
        return unsent ? step(StepKind::upload, state, state.local->place)
                      : step(StepKind::keep, state);
    }
    if (!state.base || isChangedThere(state))
        return step(StepKind::arrive, state, state.remote->place);
    return step(StepKind::remove, state);
}

Planner::Wish Planner::wishOfFolder(const ItemState& state) const {
    if (state.local)
        return !state.base || survivesHere(state)
                   ? step(StepKind::makeFolder, state, state.local->place)
                   : step(StepKind::keep, state);
    return !state.base || survivesThere(state) ? step(StepKind::arrive, state, state.remote->place)
                                               : step(StepKind::remove, state);
}

Planner::Wish Planner::wishOfBoth(const ItemState& state) const {
    if (Wish place = wishOfPlace(state))
        return place;
    const bool folder = state.item.kind == ItemKind::folder;
    if (folder || state.local->promise) // a promise has no content of its own: the record follows
        return step(StepKind::adopt, state);
    const bool here = isChangedHere(state);
    const bool there = isChangedThere(state);
    // A base without a content is a promise's: the user has not seen what the remote has.
    if (here && !there && !state.base->hash.empty())
        return step(isDamaged(state) ? StepKind::download : StepKind::uploadChange, state);
    if (here)
        return step(isDamaged(state) ? StepKind::download : StepKind::reconcile, state);
    return step(there ? StepKind::download : StepKind::adopt, state);
}

Planner::Wish Planner::wishOfPlace(const ItemState& state) const {
    const Place& here = state.local->place;
    const Place& there = state.remote->place;
    if (here == there)
        return std::nullopt; // where else both were is of no interest any more
    const bool unplacedHere = isTemporaryName(here.name);
    const bool unplacedThere = isTemporaryName(there.name);
    const bool movedThere = !unplacedThere && (!state.base || there != state.base->place);
    const bool follow = unplacedHere || (movedThere && !unplacedThere) ||
                        // What was put into itself on the other side can only go back.
                        trees_.isInside(here, state.item.id, Side::remote);
    return follow ? step(StepKind::moveHere, state, there) : step(StepKind::moveThere, state, here);
}

/// Something in the folder, which the remote deleted, is to be on the remote.
bool Planner::survivesHere(const ItemState& folder) const {
    const auto& children = trees_.localChildren(folder.item.id);
    return std::any_of(children.begin(), children.end(), [&](const ItemState* child) {
        if (child->remote) { // moved here by the user, unless it moves away by the remote's wish
            const Wish wish = wishOfPlace(*child);
            return !wish || wish->kind == StepKind::moveThere;
        }
        const Wish wish =
            child->item.kind == ItemKind::folder ? wishOfFolder(*child) : wishOfFile(*child);
        return wish && wish->kind != StepKind::keep;
    });
}

/// Something in the folder, which the user deleted, is to be on the device.
bool Planner::survivesThere(const ItemState& folder) const {
    const auto& children = trees_.remoteChildren(folder.item.id);
    return std::any_of(children.begin(), children.end(), [&](const ItemState* child) {
        if (child->local) {
            const Wish wish = wishOfPlace(*child);
            return !wish || wish->kind == StepKind::moveHere;
        }
        const Wish wish =
            child->item.kind == ItemKind::folder ? wishOfFolder(*child) : wishOfFile(*child);
        return wish && wish->kind == StepKind::arrive;
    });
}

bool Planner::isDamaged(const ItemState& state) const {
    return options_.damaged.contains(state.item.id) && looksDamaged(state);
}

bool Planner::leavesHere(const ItemState& state) const {
    const auto wish = wishes_.find(state.item.id);
    return wish != wishes_.end() &&
           (wish->second.kind == StepKind::moveHere || wish->second.kind == StepKind::keep);
}

bool Planner::leavesThere(const ItemState& state) const {
    const auto wish = wishes_.find(state.item.id);
    return wish != wishes_.end() &&
           (wish->second.kind == StepKind::moveThere || wish->second.kind == StepKind::remove);
}

void Planner::add(SyncStep step) {
    if (step.kind == StepKind::keep || step.kind == StepKind::remove ||
        step.kind == StepKind::forget) {
        deletions_.push_back(std::move(step));
        return;
    }
    if (step.kind == StepKind::stepAside && !aside_.insert(step.item).second)
        return;
    if (step.kind == StepKind::arrive)
        madeHere_.insert(step.item);
    if (step.kind == StepKind::makeFolder)
        madeThere_.insert(step.item);
    added_.insert(step.item);
    steps_.push_back(std::move(step));
}

/// The folder that the step is for is made first.
void Planner::emitFolder(ItemId folder, StepKind making) {
    const ItemState* state = trees_.find(folder);
    const auto wish = wishes_.find(folder);
    if (state && wish != wishes_.end() && wish->second.kind == making)
        emit(*state);
}

/// Makes room on the disk; false when the step has to wait for a later plan.
bool Planner::clearHere(const ItemState& state, const SyncStep& step) {
    emitFolder(step.to.parent, StepKind::arrive);
    if (!trees_.isOnDisk(step.to.parent) && !madeHere_.contains(step.to.parent))
        return false;
    if (state.local && trees_.isInside(step.to, state.item.id, Side::local))
        return false; // what it is to go into leaves it first
    const ItemState* other = trees_.localAt(step.to);
    if (!other || other == &state)
        return true;
    if (!leavesHere(*other)) {
        const bool same = !other->remote && !other->base && !state.local &&
                          other->item.kind == state.item.kind && !other->local->promise;
        add(same ? SyncStep{StepKind::merge, other->item.id, step.to, state.item.id}
                 : SyncStep{StepKind::stepAside, other->item.id, {}, 0});
        emitted_.insert(other->item.id);
        return false;
    }
    if (busy_.contains(other->item.id)) { // a circle
        const ItemState& waiting = state.local ? state : *other;
        add({StepKind::moveHere,
             waiting.item.id,
             {waiting.local->place.parent, temporaryName(waiting.item.id)},
             0});
        return !state.local;
    }
    if (state.local && wishes_.at(other->item.id).kind == StepKind::keep &&
        trees_.isInside(state.local->place, other->item.id, Side::local)) {
        // Out of the folder that goes, so that it can go and leave its name.
        add({StepKind::moveHere, state.item.id, {step.to.parent, temporaryName(state.item.id)}, 0});
        return false;
    }
    emit(*other);
    if (!steps_.empty() && steps_.back().item == other->item.id &&
        steps_.back().kind == StepKind::moveHere)
        return true;
    const SyncStep& leaving = wishes_.at(other->item.id);
    if (leaving.kind != StepKind::moveHere || trees_.isOnDisk(leaving.to.parent))
        return false;
    // It waits for a folder that may wait for this very place.
    add({StepKind::moveHere,
         other->item.id,
         {other->local->place.parent, temporaryName(other->item.id)},
         0});
    return true;
}

bool Planner::clearThere(const ItemState& state, const SyncStep& step) {
    emitFolder(step.to.parent, StepKind::makeFolder);
    if (!trees_.isOnRemote(step.to.parent) && !madeThere_.contains(step.to.parent))
        return false;
    if (state.remote && trees_.isInside(step.to, state.item.id, Side::remote))
        return false;
    const ItemState* other = trees_.remoteAt(step.to);
    if (!other || other == &state)
        return true;
    if (!leavesThere(*other)) {
        // The remote keeps the name. Two new items of one kind are brought together by the one that
        // arrives.
        const bool same = !state.remote && !state.base && !other->local &&
                          other->item.kind == state.item.kind && !state.local->promise;
        if (!same)
            add({StepKind::stepAside, state.item.id, {}, 0});
        return false;
    }
    if (busy_.contains(other->item.id)) {
        const ItemState& waiting = state.remote ? state : *other;
        add({StepKind::moveThere,
             waiting.item.id,
             {waiting.remote->place.parent, temporaryName(waiting.item.id)},
             0});
        return !state.remote;
    }
    if (state.remote && wishes_.at(other->item.id).kind == StepKind::remove &&
        trees_.isInside(state.remote->place, other->item.id, Side::remote)) {
        add({StepKind::moveThere,
             state.item.id,
             {step.to.parent, temporaryName(state.item.id)},
             0});
        return false;
    }
    emit(*other);
    if (!steps_.empty() && steps_.back().item == other->item.id &&
        steps_.back().kind == StepKind::moveThere)
        return true;
    const SyncStep& leaving = wishes_.at(other->item.id);
    if (leaving.kind != StepKind::moveThere || trees_.isOnRemote(leaving.to.parent))
        return false;
    // It waits for a folder that may wait for this very place.
    add({StepKind::moveThere,
         other->item.id,
         {other->remote->place.parent, temporaryName(other->item.id)},
         0});
    return true;
}

void Planner::emit(const ItemState& state) {
    const ItemId item = state.item.id;
    const auto wish = wishes_.find(item);
    if (wish == wishes_.end() || emitted_.contains(item) || !busy_.insert(item).second)
        return;
    const SyncStep& wanted = wish->second;
    bool ready = true;
    switch (wanted.kind) {
    case StepKind::arrive:
    case StepKind::moveHere:
        ready = clearHere(state, wanted);
        break;
    case StepKind::makeFolder:
    case StepKind::moveThere:
    case StepKind::upload:
        ready = clearThere(state, wanted);
        break;
    default:
        break;
    }
    busy_.erase(item);
    if (emitted_.insert(item).second && ready)
        add(wanted);
}

std::size_t Planner::depthOf(const ItemState& state) const {
    std::size_t depth = 0;
    for (const ItemState* at = &state; at && depth <= trees_.items().size(); ++depth) {
        const Place* place = at->local    ? &at->local->place
                             : at->remote ? &at->remote->place
                             : at->base   ? &at->base->place
                                          : nullptr;
        at = place ? trees_.find(place->parent) : nullptr;
    }
    return depth;
}

/// Last of all, files before folders and inner ones before outer ones.
void Planner::addDeletions() {
    std::vector<std::pair<std::size_t, SyncStep>> ordered;
    for (SyncStep& step : deletions_) {
        const ItemState& state = *trees_.find(step.item);
        const std::size_t depth = state.item.kind == ItemKind::file ? SIZE_MAX : depthOf(state);
        ordered.emplace_back(depth, std::move(step));
    }
    std::stable_sort(ordered.begin(), ordered.end(),
                     [](const auto& a, const auto& b) { return a.first > b.first; });
    for (auto& [depth, step] : ordered)
        steps_.push_back(std::move(step));
}

/// What has to wait for its place, and lies in a folder that is to be deleted, leaves that folder:
/// its place may be waiting for the folder's name.
void Planner::leaveWhatGoes() {
    for (const auto& [item, wish] : wishes_) {
        const bool here = wish.kind == StepKind::moveHere;
        if ((!here && wish.kind != StepKind::moveThere) || added_.contains(item))
            continue;
        const ItemState& state = *trees_.find(item);
        const ItemId in = here ? state.local->place.parent : state.remote->place.parent;
        ItemId folder = in;
        for (std::size_t steps = 0; steps < trees_.items().size(); ++steps) {
            const auto fate = wishes_.find(folder);
            if (fate == wishes_.end() ||
                fate->second.kind != (here ? StepKind::keep : StepKind::remove))
                break;
            const ItemState& going = *trees_.find(folder);
            folder = here ? going.local->place.parent : going.remote->place.parent;
        }
        if (folder != in)
            add({wish.kind, item, {folder, temporaryName(item)}, 0});
    }
}

std::vector<SyncStep> Planner::run() {
    for (const ItemState& state : trees_.items())
        if (Wish wish = wishOf(state))
            wishes_.emplace(state.item.id, std::move(*wish));
    for (const ItemState& state : trees_.items())
        emit(state);
    leaveWhatGoes();
    std::stable_partition(steps_.begin(), steps_.end(),
                          [](const SyncStep& step) { return !isContentStep(step.kind); });
    addDeletions();
    return std::move(steps_);
}

} // namespace

bool looksDamaged(const ItemState& state) {
    return state.local && !state.local->promise && state.local->size == 0 && state.base &&
           !state.base->hash.empty() && state.base->size > 0;
}

std::vector<SyncStep> planSync(const SyncTrees& trees, const PlanOptions& options) {
    return Planner(trees, options).run();
}

std::string_view nameOf(StepKind kind) {
    switch (kind) {
    case StepKind::adopt:
        return "adopt";
    case StepKind::merge:
        return "merge";
    case StepKind::forget:
        return "forget";
    case StepKind::arrive:
        return "arrive";
    case StepKind::moveHere:
        return "move here";
    case StepKind::stepAside:
        return "step aside";
    case StepKind::keep:
        return "keep";
    case StepKind::makeFolder:
        return "make folder";
    case StepKind::moveThere:
        return "move there";
    case StepKind::remove:
        return "remove";
    case StepKind::upload:
        return "upload";
    case StepKind::uploadChange:
        return "upload change";
    case StepKind::download:
        return "download";
    case StepKind::reconcile:
        return "reconcile";
    }
    return "";
}

} // namespace platform
