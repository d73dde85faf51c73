#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/SyncTimes.h"
#include "platform/cloud/Synchronizer.h"

#include <algorithm>
#include <charconv>
#include <set>

namespace platform {
namespace {

// More than this vanishing at once is a disk that was not mounted, or a hand that slipped, before
// it is anybody's wish: half of all that both sides have; or, of one folder, a third and not few.
constexpr std::int64_t fewItems = 50;
/// Of accounts with next to nothing in them, half is no alarm.
constexpr std::int64_t smallestAlarm = 3;

constexpr std::string_view questionKey = "question";
// What the user answered, for the side that it was asked of.
constexpr std::string_view permissionKey = "deletions";
constexpr std::string_view putBackKey = "putBack";
/// With the side behind it: how many were deleted of late, and when the last ones were.
constexpr std::string_view deletedKey = "deleted.";

std::string_view nameOf(Side side) {
    return side == Side::local ? "local" : "remote";
}

std::string recordOf(const DeletionQuestion& question) {
    return std::string(nameOf(question.side)) + ' ' + std::to_string(question.items) + ' ' +
           std::to_string(question.lost);
}

} // namespace

std::string textOf(const DeletionQuestion& question) {
    if (question.lost > 0)
        return localizedFormat(
            "%1$@ items have vanished from your account. Nothing is deleted on this device until "
            "you say so. %2$@ of them have no copy on this device and cannot be brought back.",
            std::to_string(question.items), std::to_string(question.lost));
    return localizedFormat(question.side == Side::local
                               ? "%1$@ items have vanished from this device. Nothing is deleted on "
                                 "your account until you say so."
                               : "%1$@ items have vanished from your account. Nothing is deleted "
                                 "on this device until you say so.",
                           std::to_string(question.items));
}

std::optional<DeletionQuestion> Synchronizer::question(StateQueries& queries) {
    const std::string text = queries.meta(questionKey);
    const std::size_t blank = text.find(' ');
    if (blank == std::string::npos)
        return std::nullopt;
    DeletionQuestion question{text.starts_with("local") ? Side::local : Side::remote, 0, 0};
    const char* const end = text.data() + text.size();
    const auto items = std::from_chars(text.data() + blank + 1, end, question.items);
    if (items.ptr != end)
        std::from_chars(items.ptr + 1, end, question.lost);
    return question;
}

Failure Synchronizer::ask(const DeletionQuestion& question, Report& report) {
    report.question = question;
    platformLog(LogLevel::warning, "cloud: %@ items have vanished from %@; the user is asked",
                question.items, question.side == Side::local ? "the device" : "the account");
    return context_.database.transaction([&]() -> Failure {
        context_.database.setMeta(questionKey, recordOf(question));
        return std::nullopt;
    });
}

bool Synchronizer::isAnswered(Side side) {
    StateDatabase& database = context_.database;
    return database.meta(permissionKey) == nameOf(side) ||
           database.meta(putBackKey) == nameOf(side) ||
           // Nothing counts as deleted.
           (side == Side::local && !database.meta(restoredKey).empty());
}

std::int64_t Synchronizer::recentlyDeleted(Side side) {
    const std::string text =
        context_.database.meta(std::string(deletedKey) + std::string(nameOf(side)));
    std::int64_t items = 0;
    std::int64_t at = 0;
    const std::size_t blank = text.find(' ');
    if (blank == std::string::npos)
        return 0;
    std::from_chars(text.data(), text.data() + blank, items);
    std::from_chars(text.data() + blank + 1, text.data() + text.size(), at);
    const Duration age(context_.clock.now().nanoseconds - at);
    return age >= Duration::zero() && age < deletionMemory ? items : 0;
}

/// Within a transaction.
void Synchronizer::countDeleted(Side side, std::int64_t items) {
    context_.database.setMeta(std::string(deletedKey) + std::string(nameOf(side)),
                              std::to_string(items) + ' ' +
                                  std::to_string(context_.clock.now().nanoseconds));
}

bool Synchronizer::isSteady(Side side, const std::vector<ItemId>& vanished, Report& report) {
    const Duration now = context_.clock.monotonic();
    Vanishing& before = vanishing_[side];
    const bool more = std::any_of(vanished.begin(), vanished.end(),
                                  [&](ItemId item) { return !before.items.contains(item); });
    if (more)
        before.since = now;
    before.items = std::set<ItemId>(vanished.begin(), vanished.end());
    const Duration left = secondLookDelay - (now - before.since);
    if (left <= Duration::zero()) {
        vanishing_.erase(side);
        return true;
    }
    report.settle(left);
    return false;
}

/// A look at some folders misses them. Whether they are anywhere, a look at all tells once nothing
/// more vanishes.
void Synchronizer::noteVanished(const std::vector<ItemId>& vanished, Report& report) {
    if (vanished.empty())
        return;
    Vanishing& before = vanishing_[Side::local];
    for (const ItemId item : vanished)
        if (before.items.insert(item).second)
            before.since = context_.clock.monotonic();
    report.settle(secondLookDelay);
}

bool Synchronizer::isVanishingDue() {
    const Vanishing& vanishing = vanishing_[Side::local];
    return !vanishing.items.empty() &&
           context_.clock.monotonic() - vanishing.since >= secondLookDelay;
}

bool Synchronizer::isAlarming(const std::vector<ItemId>& items, Side side) {
    if (isAnswered(side))
        return false;
    StateDatabase& database = context_.database;
    const std::int64_t before = recentlyDeleted(side);
    std::int64_t count = before;
    std::map<ItemId, std::int64_t> inFolder{{rootItem, before}};
    for (const ItemId item : items) {
        std::optional<ItemState> state = database.state(item);
        if (!state || !state->base)
            continue; // the other side never had it
        ++count;
        for (int depth = 0; state && state->base && depth < 4096; ++depth) {
            ++inFolder[state->base->place.parent];
            state = database.state(state->base->place.parent);
        }
    }
    if (count == before)
        return false;
    if (count >= smallestAlarm && count * 2 > database.agreedItems() + before)
        return true;
    for (const auto& [folder, gone] : inFolder)
        if (gone > fewItems &&
            gone * 3 > database.agreedItemsIn(folder) + (folder == rootItem ? before : 0))
            return true;
    return false;
}

/// Nothing is missing on that side any more: neither a question nor an answer stands.
Failure Synchronizer::withdraw(Side side) {
    StateDatabase& database = context_.database;
    const std::optional<DeletionQuestion> asked = question(database);
    const bool stands = asked && asked->side == side;
    const bool restored = side == Side::local && !database.meta(restoredKey).empty();
    if (!stands && !restored && database.meta(permissionKey) != nameOf(side) &&
        database.meta(putBackKey) != nameOf(side))
        return std::nullopt;
    return database.transaction([&]() -> Failure {
        if (stands)
            database.setMeta(questionKey, "");
        forgetAnswer(side);
        return std::nullopt;
    });
}

void Synchronizer::forgetAnswer(Side side) {
    if (side == Side::local && !context_.database.meta(restoredKey).empty())
        context_.database.setMeta(restoredKey, "");
    for (const std::string_view key : {permissionKey, putBackKey})
        if (context_.database.meta(key) == nameOf(side))
            context_.database.setMeta(key, "");
}

Failure Synchronizer::settleLocal(const std::vector<ItemId>& vanished, Report& report) {
    Failure failure;
    context_.queue.sync([&] {
        StateDatabase& database = context_.database;
        if (vanished.empty()) {
            vanishing_.erase(Side::local);
            failure = withdraw(Side::local);
            return;
        }
        if (isAlarming(vanished, Side::local)) {
            vanishing_.erase(Side::local); // the question waits; the looks need not
            failure = ask({Side::local, static_cast<std::int64_t>(vanished.size()), 0}, report);
            return;
        }
        const bool answered = isAnswered(Side::local);
        if (answered)
            vanishing_.erase(Side::local);
        if (!answered && !isSteady(Side::local, vanished, report))
            return;
        const std::int64_t all =
            answered ? 0
                     : recentlyDeleted(Side::local) + static_cast<std::int64_t>(vanished.size());
        failure = database.transaction([&]() -> Failure {
            const bool putBack = database.meta(putBackKey) == nameOf(Side::local) ||
                                 !database.meta(restoredKey).empty();
            for (const ItemId item : vanished) {
                database.removeLocal(item);
                database.setItemPlace(item, std::nullopt);
                if (putBack) // nothing was agreed on: what the remote has arrives anew
                    database.removeBase(item);
            }
            forgetAnswer(Side::local);
            countDeleted(Side::local, all);
            return std::nullopt;
        });
    });
    return failure;
}

Failure Synchronizer::settleRemote(bool commanded, Report& report) {
    std::set<ItemId> again;
    context_.queue.sync([&] {
        for (const ItemId item : context_.database.missingFromRemote(1))
            if (const std::optional<ItemState> state = context_.database.state(item);
                state && state->remote)
                again.insert(state->remote->place.parent);
    });
    if (again.empty()) {
        vanishing_.erase(Side::remote);
        Failure failure;
        context_.queue.sync([&] { failure = withdraw(Side::remote); });
        return failure;
    }
    if (commanded)
        if (Failure failure = list({again.begin(), again.end()}, false, report))
            return failure;
    Failure failure;
    context_.queue.sync([&] {
        StateDatabase& database = context_.database;
        std::set<ItemId> gone;
        for (const ItemId item : database.missingFromRemote(2))
            for (const ItemId each : database.treeOf(item, Side::remote))
                gone.insert(each);
        report.secondLook =
            database.missingFromRemote(1).size() > database.missingFromRemote(2).size();
        if (gone.empty())
            return;
        const std::vector<ItemId> items(gone.begin(), gone.end());
        if (isAlarming(items, Side::remote)) {
            const auto lost = std::count_if(items.begin(), items.end(), [&](ItemId item) {
                const std::optional<ItemState> state = database.state(item);
                return state && state->item.kind == ItemKind::file &&
                       (!state->local || state->local->promise);
            });
            failure = ask({Side::remote, static_cast<std::int64_t>(items.size()), lost}, report);
            return;
        }
        const bool answered = isAnswered(Side::remote);
        if (!answered && !isSteady(Side::remote, database.missingFromRemote(1), report)) {
            report.secondLook = true;
            return;
        }
        const std::int64_t all =
            answered ? 0 : recentlyDeleted(Side::remote) + static_cast<std::int64_t>(items.size());
        failure = database.transaction([&]() -> Failure {
            const bool putBack = database.meta(putBackKey) == nameOf(Side::remote);
            for (const ItemId item : items) {
                database.removeRemote(item);
                if (putBack)
                    database.removeBase(item);
            }
            forgetAnswer(Side::remote);
            countDeleted(Side::remote, all);
            return std::nullopt;
        });
    });
    return failure;
}

Failure Synchronizer::answer(DeletionAnswer answer) {
    StateDatabase& database = context_.database;
    const std::optional<DeletionQuestion> asked = question(database);
    if (!asked)
        return std::nullopt;
    return database.transaction([&]() -> Failure {
        database.setMeta(questionKey, "");
        database.setMeta(answer == DeletionAnswer::deleteThem ? permissionKey : putBackKey,
                         nameOf(asked->side));
        return std::nullopt;
    });
}

} // namespace platform
