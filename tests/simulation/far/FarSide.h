#pragma once

#include "tests/simulation/machine/Luck.h"

#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <vector>

namespace simulation {

/// How a server behaves where servers differ.
struct FarHabits {
    bool ids = true;           // items have an identity that outlives moves
    bool keepsTimes = true;    // the uploaded modification time is the item's
    bool moveChangesEtag = false;
    bool folderEtags = false;  // a folder's etag changes with what is directly in it
    bool checksInSteps = false; // a replacement is made in steps with a trash
    bool youngEtags = false;   // versions of one second may share an etag, and are told as young
    bool ignoresCase = false;
    bool refusesNames = false; // ":" anywhere, a dot at the end, more than 100 bytes
};

struct FarItem {
    std::uint64_t id = 0;
    bool folder = false;
    std::uint64_t parent = 0;
    std::string name;
    std::string content;
    std::string tags;
    std::uint64_t version = 0;
    std::int64_t modified = 0; // nanoseconds, as is the next
    std::int64_t stored = 0;
};

/// Who makes a change on the far side.
enum class Actor { user, engine };

/// Hears of what happens there, before it does.
class FarListener {
public:
    virtual ~FarListener() = default;
    virtual void farAppears(const std::string& path, const std::string& content, Actor actor) = 0;
    virtual void farVanishes(const std::string& path, const std::string& content, Actor actor) = 0;
};

/// A server's tree of items, as its other users change it. Remote calls reach it through
/// SimRemote. Paths have no slash at the beginning; "" is the root.
class FarSide {
public:
    FarSide(const FarHabits& habits, std::function<std::int64_t()> wall);

    const FarHabits& habits() const { return habits_; }
    void setListener(FarListener* listener) { listener_ = listener; }
    void setQuota(std::optional<std::uint64_t> bytes) { quota_ = bytes; }
    std::optional<std::uint64_t> free() const;

    const FarItem* find(std::string_view path) const;
    std::string pathOf(const FarItem& item) const;
    std::vector<const FarItem*> children(const FarItem& folder) const;
    std::string etagOf(const FarItem& item) const;
    bool isYoung(const FarItem& item) const;
    bool refuses(std::string_view name) const;
    const std::vector<std::string>& trash() const { return trash_; }

    /// What keeps a change from being made.
    enum class Obstacle { none, missing, exists, notEmpty, refused, quota, invalid };
    Obstacle write(const std::string& path, const std::string& content, std::int64_t modified,
                   const std::string& tags, Actor actor);
    Obstacle makeFolder(const std::string& path, Actor actor);
    /// Never replaces.
    Obstacle move(const std::string& from, const std::string& to, Actor actor);
    /// A folder only when it is empty.
    Obstacle remove(const std::string& path, Actor actor);
    /// Out of sight, for a step of a change that is under way.
    std::uint64_t setAside(const std::string& path);
    Obstacle putBack(std::uint64_t id, const std::string& path);
    /// What was set aside is not wanted any more.
    void discard(std::uint64_t id, Actor actor);

    void visit(const std::function<void(const std::string& path, const FarItem& item)>& visit) const;
    const FarItem& item(std::uint64_t id) const { return items_.at(id); }
    std::uint64_t used() const;

private:
    static constexpr std::uint64_t rootId = 1;
    static constexpr std::uint64_t asideId = 2;

    struct Spot {
        std::uint64_t folder = 0;
        std::string name;
    };
    std::optional<Spot> spotOf(const std::string& path) const;
    std::uint64_t childNamed(std::uint64_t folder, std::string_view name) const;
    void touch(FarItem& item);
    void touchFolder(std::uint64_t folder);
    std::string folded(std::string_view name) const;

    FarHabits habits_;
    std::function<std::int64_t()> wall_;
    FarListener* listener_ = nullptr;
    std::optional<std::uint64_t> quota_;
    std::map<std::uint64_t, FarItem> items_;
    std::uint64_t lastId_ = 100;
    std::uint64_t lastVersion_ = 0;
    std::vector<std::string> trash_;
};

} // namespace simulation
