#include "platform/cloud/SyncNames.h"
#include "platform/cloud/SyncPlan.h"

#include <gtest/gtest.h>

#include <cstdlib>
#include <random>
#include <set>

using namespace platform;

namespace {

constexpr ItemId one = 10;
constexpr ItemId two = 11;
constexpr ItemId folderA = 20;
constexpr ItemId folderB = 21;

/// A content is told by a letter.
Bytes hashOf(char content) {
    return {static_cast<std::byte>(content)};
}

Date timeOf(char content) {
    return Date::fromSeconds(1000 + content);
}

/// An item, word by word.
struct Item {
    ItemState state;

    Item& here(ItemId folder, const std::string& name, char content) {
        state.local = LocalRow{{folder, name}, {1, 5, 1}, 1, timeOf(content), {}, false, 0};
        return *this;
    }
    Item& promisedHere(ItemId folder, const std::string& name) {
        state.local = LocalRow{{folder, name}, {1, 6, 1}, 0, {}, {}, true, 0};
        return *this;
    }
    Item& there(ItemId folder, const std::string& name, char content) {
        state.remote = RemoteRow{};
        state.remote->place = {folder, name};
        state.remote->etag = content;
        state.remote->size = 1;
        return *this;
    }
    Item& agreed(ItemId folder, const std::string& name, char content, bool promise = false) {
        state.base = BaseRow{{folder, name}, std::string(1, content), 1, hashOf(content),
                             {1, 5, 1},      timeOf(content),         {}};
        if (promise)
            state.base->hash.clear();
        return *this;
    }
};

Item file(ItemId id) {
    return {{{id, ItemKind::file, {}}, {}, {}, {}}};
}
Item folder(ItemId id) {
    return {{{id, ItemKind::folder, {}}, {}, {}, {}}};
}

std::vector<std::string> planOf(const std::vector<Item>& items, const PlanOptions& options = {}) {
    std::vector<ItemState> states;
    for (const Item& item : items)
        states.push_back(item.state);
    std::vector<std::string> plan;
    for (const SyncStep& step : planSync(SyncTrees(std::move(states)), options)) {
        std::string text(nameOf(step.kind));
        text += ' ' + std::to_string(step.item);
        if (step.kind == StepKind::moveHere || step.kind == StepKind::moveThere)
            text += " to " + (isTemporaryName(step.to.name) ? "a waiting name" : step.to.name);
        plan.push_back(text);
    }
    return plan;
}

using Plan = std::vector<std::string>;
constexpr ItemId r = rootItem;

TEST(Plan, OfOneFileFollowsTheTable) {
    struct Row {
        const char* what;
        Item item;
        Plan plan;
    };
    const Row rows[] = {
        {"nothing new", file(one).here(r, "x", 'a').there(r, "x", 'a').agreed(r, "x", 'a'), {}},
        {"new there", file(one).there(r, "x", 'a'), {"arrive 10"}},
        {"new here", file(one).here(r, "x", 'a'), {"upload 10"}},
        {"new on both", file(one).here(r, "x", 'a').there(r, "x", 'b'), {"reconcile 10"}},
        {"edited here",
         file(one).here(r, "x", 'b').there(r, "x", 'a').agreed(r, "x", 'a'),
         {"upload change 10"}},
        {"edited there",
         file(one).here(r, "x", 'a').there(r, "x", 'b').agreed(r, "x", 'a'),
         {"download 10"}},
        {"edited there, a promise",
         file(one).promisedHere(r, "x").there(r, "x", 'b').agreed(r, "x", 'a', true),
         {"adopt 10"}},
        {"edited on both",
         file(one).here(r, "x", 'b').there(r, "x", 'c').agreed(r, "x", 'a'),
         {"reconcile 10"}},
        {"moved there",
         file(one).here(r, "x", 'a').there(r, "y", 'a').agreed(r, "x", 'a'),
         {"move here 10 to y"}},
        {"moved here",
         file(one).here(r, "y", 'a').there(r, "x", 'a').agreed(r, "x", 'a'),
         {"move there 10 to y"}},
        {"moved on both",
         file(one).here(r, "y", 'a').there(r, "z", 'a').agreed(r, "x", 'a'),
         {"move here 10 to z"}},
        {"moved alike",
         file(one).here(r, "y", 'a').there(r, "y", 'a').agreed(r, "x", 'a'),
         {"adopt 10"}},
        {"moved here, edited there",
         file(one).here(r, "y", 'a').there(r, "x", 'b').agreed(r, "x", 'a'),
         {"move there 10 to y"}},
        {"deleted there", file(one).here(r, "x", 'a').agreed(r, "x", 'a'), {"keep 10"}},
        {"deleted there, a promise",
         file(one).promisedHere(r, "x").agreed(r, "x", 'a', true),
         {"keep 10"}},
        {"deleted there, edited here",
         file(one).here(r, "x", 'b').agreed(r, "x", 'a'),
         {"upload 10"}},
        {"deleted here", file(one).there(r, "x", 'a').agreed(r, "x", 'a'), {"remove 10"}},
        {"deleted here, edited there",
         file(one).there(r, "x", 'b').agreed(r, "x", 'a'),
         {"arrive 10"}},
        {"deleted here, moved there",
         file(one).there(r, "y", 'a').agreed(r, "x", 'a'),
         {"remove 10"}},
        {"deleted on both", file(one).agreed(r, "x", 'a'), {"forget 10"}},
        {"a promise and the user's own file",
         file(one).here(r, "x", 'b').there(r, "x", 'a').agreed(r, "x", 'a', true),
         {"reconcile 10"}},
    };
    for (const Row& row : rows)
        EXPECT_EQ(planOf({row.item}), row.plan) << row.what;
}

TEST(Plan, AFileThatLostItsBytesInACrashIsNoEdit) {
    Item item = file(one).here(r, "x", 'b').there(r, "x", 'a').agreed(r, "x", 'a');
    item.state.local->size = 0;
    EXPECT_EQ(planOf({item}, {{10}}), Plan{"download 10"});
    EXPECT_EQ(planOf({item}, {}), Plan{"upload change 10"});
}

TEST(Plan, FoldersAreMadeBeforeAndDeletedAfterWhatIsInThem) {
    EXPECT_EQ(planOf({file(one).here(folderB, "x", 'a'), folder(folderA).here(r, "A", ' '),
                      folder(folderB).here(folderA, "B", ' ')}),
              (Plan{"make folder 20", "make folder 21", "upload 10"}));
    EXPECT_EQ(planOf({file(one).there(folderB, "x", 'a'), folder(folderB).there(folderA, "B", ' '),
                      folder(folderA).there(r, "A", ' ')}),
              (Plan{"arrive 20", "arrive 21", "arrive 10"}));
    EXPECT_EQ(planOf({folder(folderA).here(r, "A", ' ').agreed(r, "A", ' '),
                      folder(folderB).here(folderA, "B", ' ').agreed(folderA, "B", ' '),
                      file(one).here(folderB, "x", 'a').agreed(folderB, "x", 'a')}),
              (Plan{"keep 10", "keep 21", "keep 20"}));
}

TEST(Plan, AFolderWithASurvivingChildStays) {
    const Item deletedThere = folder(folderA).here(r, "A", ' ').agreed(r, "A", ' ');
    EXPECT_EQ(planOf({deletedThere, file(one).here(folderA, "x", 'b').agreed(folderA, "x", 'a'),
                      file(two).here(folderA, "y", 'a').agreed(folderA, "y", 'a')}),
              (Plan{"make folder 20", "upload 10", "keep 11"}));
    const Item deletedHere = folder(folderA).there(r, "A", ' ').agreed(r, "A", ' ');
    EXPECT_EQ(planOf({deletedHere, file(one).there(folderA, "x", 'b').agreed(folderA, "x", 'a'),
                      file(two).there(folderA, "y", 'a').agreed(folderA, "y", 'a')}),
              (Plan{"arrive 20", "arrive 10", "remove 11"}));
}

TEST(Plan, NamesAreFreedBeforeTheyAreTakenAndSwapsGoThroughAWaitingName) {
    EXPECT_EQ(planOf({file(one).here(r, "x", 'a').there(r, "y", 'a').agreed(r, "x", 'a'),
                      file(two).here(r, "y", 'b').there(r, "z", 'b').agreed(r, "y", 'b')}),
              (Plan{"move here 11 to z", "move here 10 to y"}));
    EXPECT_EQ(planOf({file(one).here(r, "x", 'a').there(r, "y", 'a').agreed(r, "x", 'a'),
                      file(two).here(r, "y", 'b').there(r, "x", 'b').agreed(r, "y", 'b')}),
              (Plan{"move here 11 to a waiting name", "move here 10 to y"}));
    EXPECT_EQ(planOf({file(one).here(r, "y", 'a').there(r, "x", 'a').agreed(r, "x", 'a'),
                      file(two).here(r, "x", 'b').there(r, "y", 'b').agreed(r, "y", 'b')}),
              (Plan{"move there 11 to a waiting name", "move there 10 to y"}));
    EXPECT_EQ(
        planOf({file(one).here(r, temporaryName(one), 'a').there(r, "y", 'a').agreed(r, "x", 'a')}),
        Plan{"move here 10 to y"});
}

TEST(Plan, TheRemoteKeepsANameThatBothWant) {
    EXPECT_EQ(planOf({file(one).here(r, "x", 'a').there(r, "y", 'a').agreed(r, "x", 'a'),
                      file(two).here(r, "y", 'b')}),
              (Plan{"step aside 11"}));
    EXPECT_EQ(planOf({file(one).there(r, "x", 'a'), file(two).here(r, "x", 'b')}),
              Plan{"merge 11"});
    EXPECT_EQ(planOf({file(one).there(r, "x", 'a'), folder(two).here(r, "x", ' ')}),
              Plan{"step aside 11"});
}

TEST(Plan, FoldersMovedIntoEachOtherFollowTheRemote) {
    EXPECT_EQ(
        planOf({folder(folderA).here(folderB, "A", ' ').there(r, "A", ' ').agreed(r, "A", ' '),
                folder(folderB).here(r, "B", ' ').there(folderA, "B", ' ').agreed(r, "B", ' ')}),
        (Plan{"move here 20 to A"}))
        << "and then the other one";
}

/// Carries plans out as a faultless disk and remote would.
class Perfect {
public:
    explicit Perfect(unsigned seed) : random_(seed) { scatter(); }

    std::set<char> contents() const {
        std::set<char> found;
        for (const auto& [id, item] : items_) {
            if (item.local && item.item.kind == ItemKind::file && !item.local->promise)
                found.insert(contentHere(item));
            if (item.remote && item.item.kind == ItemKind::file)
                found.insert(item.remote->etag[0]);
        }
        found.insert(kept_.begin(), kept_.end());
        return found;
    }
    /// The rounds until nothing is left to do; 0 when that never comes.
    int settle() {
        for (int round = 1; round < 40; ++round) {
            const std::vector<SyncStep> plan = planSync(trees());
            if (plan.empty())
                return round;
            for (const SyncStep& step : plan)
                carryOut(step);
        }
        return 0;
    }
    bool agrees() const {
        return std::all_of(items_.begin(), items_.end(),
                           [](const auto& each) { return isAgreed(each.second); });
    }
    std::string describe() const {
        std::string text;
        for (const auto& [id, item] : items_) {
            const auto place = [](const auto& row) {
                return row ? std::to_string(row->place.parent) + "/" + row->place.name : "-";
            };
            text += std::to_string(id) + ": " + place(item.local) + " | " + place(item.remote) +
                    " | " + place(item.base) + '\n';
        }
        for (const SyncStep& step : planSync(trees()))
            text += std::string(nameOf(step.kind)) + ' ' + std::to_string(step.item) + '\n';
        return text;
    }

private:
    int upTo(int n) { return static_cast<int>(random_() % static_cast<unsigned>(n)); }
    static char contentHere(const ItemState& item) {
        return static_cast<char>(item.local->modified.wholeSeconds() - 1000);
    }
    char fresh() { return next_++; }

    /// Agreed trees, and then each side goes its own way.
    void scatter() {
        const char* const names[] = {"p", "q", "s", "t"};
        std::vector<ItemId> folders{r};
        for (ItemId id = 2; id < 12; ++id) {
            Item item{{{id, upTo(3) == 0 ? ItemKind::folder : ItemKind::file, {}}, {}, {}, {}}};
            const ItemId in =
                folders[static_cast<std::size_t>(upTo(static_cast<int>(folders.size())))];
            const std::string name = names[upTo(4)];
            if (freeAt(Side::local, {in, name}) && freeAt(Side::remote, {in, name})) {
                const char content = fresh();
                item.here(in, name, content).there(in, name, content).agreed(in, name, content);
                if (item.state.item.kind == ItemKind::folder)
                    folders.push_back(id);
                items_.emplace(id, item.state);
            }
        }
        for (int change = upTo(12); change > 0; --change)
            disturb(upTo(2) == 0 ? Side::local : Side::remote,
                    {upTo(2) ? r : folders.back(), names[upTo(4)]});
    }
    bool freeAt(Side side, const Place& place) const {
        const SyncTrees now = trees();
        return side == Side::local ? !now.localAt(place) : !now.remoteAt(place);
    }
    bool has(Side side, const ItemState& item) const {
        return side == Side::local ? item.local.has_value() : item.remote.has_value();
    }
    void disturb(Side side, const Place& place) {
        const auto found = std::next(items_.begin(), upTo(static_cast<int>(items_.size())));
        ItemState& item = found->second;
        const bool reachable = place.parent == r || (items_.contains(place.parent) &&
                                                     has(side, items_.at(place.parent)));
        const int what = upTo(4);
        if (what == 0 && reachable && freeAt(side, place)) { // new
            Item made = upTo(3) ? file(last_) : folder(last_);
            ++last_;
            side == Side::local ? made.here(place.parent, place.name, fresh())
                                : made.there(place.parent, place.name, fresh());
            items_.emplace(made.state.item.id, made.state);
        } else if (what == 1 && has(side, item) && reachable && freeAt(side, place) &&
                   !trees().isInside(place, item.item.id, side) && item.item.id != place.parent) {
            (side == Side::local ? item.local->place : item.remote->place) = place;
        } else if (what == 2 && has(side, item) && item.item.kind == ItemKind::file) {
            if (side == Side::local)
                item.local->modified = timeOf(fresh());
            else
                item.remote->etag = fresh();
        } else if (what == 3 && has(side, item)) {
            drop(side, item.item.id);
        }
    }
    /// Knowingly, by a user: what is deleted there is nobody's any more.
    void drop(Side side, ItemId id) {
        const SyncTrees now = trees();
        for (const ItemState* child :
             side == Side::local ? now.localChildren(id) : now.remoteChildren(id))
            drop(side, child->item.id);
        if (side == Side::local)
            items_.at(id).local.reset();
        else
            items_.at(id).remote.reset();
    }
    SyncTrees trees() const {
        std::vector<ItemState> states;
        for (const auto& [id, item] : items_)
            states.push_back(item);
        return SyncTrees(std::move(states));
    }
    void agree(ItemState& item) {
        item.base = BaseRow{item.remote->place,   item.remote->etag,    1, {},
                            item.local->identity, item.local->modified, {}};
        if (item.item.kind == ItemKind::file && !item.local->promise)
            item.base->hash = hashOf(contentHere(item));
    }
    void carryOut(const SyncStep& step) {
        ItemState& item = items_.at(step.item);
        const Place own = item.local ? item.local->place : Place();
        switch (step.kind) {
        case StepKind::adopt:
            agree(item);
            break;
        case StepKind::merge:
            items_.at(step.other).local = item.local;
            for (auto& [id, child] : items_)
                if (child.local && child.local->place.parent == step.item)
                    child.local->place.parent = step.other;
            items_.erase(step.item);
            break;
        case StepKind::forget:
            items_.erase(step.item);
            break;
        case StepKind::arrive:
            item.local = LocalRow{step.to, {}, 0, {}, {}, item.item.kind == ItemKind::file, 0};
            EXPECT_TRUE(step.to.parent == r || items_.at(step.to.parent).local);
            agree(item);
            break;
        case StepKind::moveHere:
            EXPECT_TRUE(freeAt(Side::local, step.to));
            item.local->place = step.to;
            break;
        case StepKind::moveThere:
            EXPECT_TRUE(freeAt(Side::remote, step.to));
            item.remote->place = step.to;
            break;
        case StepKind::stepAside:
            item.local->place.name += " (conflict " + std::to_string(++aside_) + ")";
            break;
        case StepKind::keep:
            if (item.item.kind == ItemKind::folder && !trees().localChildren(step.item).empty())
                break;
            if (item.item.kind == ItemKind::file && !item.local->promise)
                kept_.insert(contentHere(item));
            item.local.reset();
            break;
        case StepKind::remove:
            if (trees().remoteChildren(step.item).empty())
                item.remote.reset();
            break;
        case StepKind::makeFolder:
            EXPECT_TRUE(freeAt(Side::remote, step.to));
            item.remote = RemoteRow{};
            item.remote->place = step.to;
            agree(item);
            break;
        case StepKind::upload:
        case StepKind::uploadChange:
            if (step.kind == StepKind::upload) {
                EXPECT_TRUE(freeAt(Side::remote, own));
                item.remote = RemoteRow{};
                item.remote->place = own;
            }
            item.remote->etag = contentHere(item);
            agree(item);
            break;
        case StepKind::download:
            kept_.insert(contentHere(item));
            item.local->modified = timeOf(item.remote->etag[0]);
            agree(item);
            break;
        case StepKind::reconcile: {
            Item ours = file(last_);
            ++last_;
            ours.here(own.parent, own.name + " (conflict " + std::to_string(++aside_) + ")",
                      contentHere(item));
            items_.emplace(ours.state.item.id, ours.state);
            item.local->modified = timeOf(item.remote->etag[0]);
            agree(item);
            break;
        }
        }
    }

    std::mt19937 random_;
    std::map<ItemId, ItemState> items_;
    std::set<char> kept_;
    ItemId last_ = 100;
    char next_ = 'A';
    int aside_ = 0;
};

TEST(Plan, AnyTwoTreesAgreeAfterAFewRoundsAndNoContentIsLost) {
    const char* more = std::getenv("TAVRIN_SEEDS");
    const unsigned seeds = more ? static_cast<unsigned>(std::strtoul(more, nullptr, 10)) : 5000;
    for (unsigned seed = 0; seed < seeds; ++seed) {
        Perfect world(seed);
        const std::set<char> before = world.contents();
        EXPECT_NE(world.settle(), 0) << "seed " << seed << '\n' << world.describe();
        EXPECT_TRUE(world.agrees()) << "seed " << seed << '\n' << world.describe();
        const std::set<char> after = world.contents();
        // What one side deleted unchanged goes from the other as well, and that is its user's wish.
        for (const char content : before)
            EXPECT_TRUE(after.contains(content) || content < 'A' + 10) << "seed " << seed;
        if (HasFailure())
            return;
    }
}

} // namespace
