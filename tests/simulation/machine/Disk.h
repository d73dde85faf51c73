#pragma once

#include "tests/simulation/machine/Luck.h"

#include <cstdint>
#include <functional>
#include <map>
#include <optional>
#include <set>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace simulation {

using NodeId = std::uint64_t;

enum class NodeKind { file, folder, link, pipe };

/// A file, folder or link of a simulated disk: as everybody sees it, and as a loss of power leaves
/// it for certain (`kept…`).
struct Node {
    NodeId id = 0;
    NodeKind kind = NodeKind::file;
    std::uint64_t inode = 0;
    std::int64_t born = 0; // nanoseconds, as are the next two
    std::int64_t modified = 0;
    std::int64_t changed = 0;
    std::uint32_t mode = 0;
    unsigned links = 0;
    unsigned opens = 0;
    /// Where it was put last.
    NodeId parent = 0;
    std::string name;
    std::string data;  // a file's content, a link's target
    std::map<std::string, std::string> attributes;
    std::map<std::string, NodeId> names;
    /// Nobody but the test may look into it or change it.
    bool denied = false;

    std::string keptData;
    std::map<std::string, std::string> keptAttributes;
    std::map<std::string, NodeId> keptNames;
    std::int64_t keptModified = 0;
    /// Bytes that were written since, from and up to; and whether the file was emptied since.
    std::size_t dirtyFrom = SIZE_MAX;
    std::size_t dirtyTo = 0;
    bool dirty = false;
    bool emptied = false;
    bool dirtyAttributes = false;

    /// For the oracle: what it knows the content as; 0 when it has not looked since a change.
    mutable int content = 0;
};

/// What a loss of power does to names that were not synced.
enum class Journal {
    /// A prefix of all changes survives, and any sync brings everything before it to the disk.
    ordered,
    /// Each change survives or not, as far as later ones need it; a folder's sync keeps its own.
    loose
};

/// A disk in memory with a page cache: names, contents, times, attributes, room, and what a loss of
/// power leaves of them. Answers 0 or a count, or an errno below zero. A value: a copy is another
/// disk with the same things on it.
class Disk {
public:
    struct Setup {
        std::uint64_t device = 1;
        Journal journal = Journal::ordered;
        std::uint64_t nameOrder = 0; // decides in which order a folder lists its names
        bool attributes = true;      // has extended attributes
        bool births = true;          // tells birth times
        std::uint64_t room = UINT64_MAX;
    };
    /// `time` answers the moment that files are stamped with.
    Disk(const Setup& setup, std::function<std::int64_t()> time);

    Setup& setup() { return setup_; }
    const Setup& setup() const { return setup_; }
    NodeId root() const { return rootId; }
    Node& node(NodeId id) { return nodes_.at(id); }
    const Node& node(NodeId id) const { return nodes_.at(id); }
    std::optional<NodeId> child(NodeId folder, const std::string& name) const;
    /// From the root, with a leading slash; "" when nothing leads there any more.
    std::string pathOf(NodeId id) const;

    long make(NodeId folder, const std::string& name, NodeKind kind, std::uint32_t mode,
              NodeId& made);
    long remove(NodeId folder, const std::string& name, bool asFolder);
    /// `flags` as those of renameat2.
    long rename(NodeId from, const std::string& name, NodeId to, const std::string& newName,
                unsigned flags);
    long link(NodeId id, NodeId folder, const std::string& name);
    long write(NodeId id, std::uint64_t offset, std::string_view bytes);
    long resize(NodeId id, std::uint64_t size);
    long setAttribute(NodeId id, const std::string& name, std::string_view value);
    long removeAttribute(NodeId id, const std::string& name);
    void setModified(NodeId id, std::int64_t time);
    void opened(NodeId id) { ++node(id).opens; }
    void closed(NodeId id);

    void sync(NodeId id);
    void syncAll();
    std::uint64_t free() const { return used_ >= setup_.room ? 0 : setup_.room - used_; }

    /// The disk after the power failed now: chance decides about everything that was not synced.
    Disk afterPowerCut(Luck& luck) const;
    /// The disk after every program was killed: nothing is lost.
    Disk afterKill() const;

    /// Every name that can be reached, folders before what is in them.
    using Visit = std::function<void(const std::string& path, const Node& node)>;
    void visit(NodeId from, const Visit& visit) const;
    /// The same of what a loss of power would leave for certain.
    void visitKept(const Visit& visit) const;
    /// Changes with every sync that brought something to the disk.
    std::uint64_t syncs() const { return syncs_; }

private:
    static constexpr NodeId rootId = 1;

    /// A change of names that is not on the disk yet.
    struct Change {
        enum class Kind { link, unlink, rename, exchange };
        Kind kind = Kind::link;
        NodeId folder = 0;
        std::string name;
        NodeId node = 0;
        NodeId toFolder = 0; // of a rename or an exchange, as are the next two
        std::string toName;
        NodeId toNode = 0;
        bool touches(NodeId id) const { return folder == id || toFolder == id; }
    };

    Node& newNode(NodeKind kind, std::uint32_t mode);
    void note(Change change);
    void apply(const Change& change);
    void keep(const std::vector<bool>& chosen);
    void keepNamesOf(NodeId folder);
    void keepContent(Node& node);
    /// Whether the names that are kept lead from the one to the other.
    bool keptLeads(NodeId from, NodeId to) const;
    void unlinked(NodeId id);
    void forgetUnreachable();
    void chooseChanges(Luck& luck);
    void chooseContent(Node& node, Luck& luck);
    void beginAnew();
    void resizeContent(Node& node, std::uint64_t size);
    void touch(Node& node);
    bool isInside(NodeId folder, NodeId ancestor) const;
    void visitFrom(NodeId id, const std::string& path, bool kept, const Visit& visit) const;

    Setup setup_;
    std::function<std::int64_t()> time_;
    std::unordered_map<NodeId, Node> nodes_;
    std::vector<Change> pending_;
    NodeId lastId_ = 0;
    std::set<std::uint64_t> freeInodes_;
    std::uint64_t lastInode_ = 10;
    std::uint64_t used_ = 0;
    std::uint64_t syncs_ = 0;
    std::size_t remembered_ = 0; // nodes that the last tidying left
};

} // namespace simulation
