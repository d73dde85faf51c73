#include "tests/simulation/machine/Disk.h"

#include <algorithm>
#include <cerrno>
#include <cstdio> // RENAME_NOREPLACE
#include <sys/stat.h>

namespace simulation {
namespace {

/// What a file takes besides its bytes.
constexpr std::uint64_t nodeCost = 512;

} // namespace

Disk::Disk(const Setup& setup, std::function<std::int64_t()> time)
    : setup_(setup), time_(std::move(time)) {
    Node& root = newNode(NodeKind::folder, 0755);
    root.parent = root.id;
    root.links = 1;
}

Node& Disk::newNode(NodeKind kind, std::uint32_t mode) {
    const NodeId id = ++lastId_;
    Node& node = nodes_[id];
    node.id = id;
    node.kind = kind;
    node.mode = mode;
    // The number of what was deleted last is the first to be used again.
    if (freeInodes_.empty()) {
        node.inode = ++lastInode_;
    } else {
        node.inode = *freeInodes_.begin();
        freeInodes_.erase(freeInodes_.begin());
    }
    node.born = node.modified = node.changed = node.keptModified = time_();
    used_ += nodeCost;
    return node;
}

std::optional<NodeId> Disk::child(NodeId folder, const std::string& name) const {
    const Node& parent = node(folder);
    const auto found = parent.names.find(name);
    return found == parent.names.end() ? std::nullopt : std::optional(found->second);
}

std::string Disk::pathOf(NodeId id) const {
    if (id == rootId)
        return "";
    const Node& node = this->node(id);
    return node.links == 0 ? "" : pathOf(node.parent) + '/' + node.name;
}

void Disk::touch(Node& node) {
    node.modified = node.changed = time_();
    if (node.kind == NodeKind::folder)
        node.keptModified = node.modified;
}

bool Disk::isInside(NodeId folder, NodeId ancestor) const {
    for (; folder != rootId; folder = node(folder).parent)
        if (folder == ancestor)
            return true;
    return ancestor == rootId;
}

long Disk::make(NodeId folder, const std::string& name, NodeKind kind, std::uint32_t mode,
                NodeId& made) {
    if (node(folder).links == 0)
        return -ENOENT;
    if (child(folder, name))
        return -EEXIST;
    if (name.size() > 255)
        return -ENAMETOOLONG;
    if (free() < nodeCost)
        return -ENOSPC;
    Node& node = newNode(kind, mode);
    node.links = 1;
    node.parent = folder;
    node.name = name;
    made = node.id;
    this->node(folder).names[name] = made;
    touch(this->node(folder));
    note({Change::Kind::link, folder, name, made, 0, {}, 0});
    return 0;
}

long Disk::remove(NodeId folder, const std::string& name, bool asFolder) {
    const std::optional<NodeId> found = child(folder, name);
    if (!found)
        return -ENOENT;
    const Node& gone = node(*found);
    if (asFolder != (gone.kind == NodeKind::folder))
        return asFolder ? -ENOTDIR : -EISDIR;
    if (!gone.names.empty())
        return -ENOTEMPTY;
    node(folder).names.erase(name);
    touch(node(folder));
    note({Change::Kind::unlink, folder, name, *found, 0, {}, 0});
    unlinked(*found);
    return 0;
}

void Disk::unlinked(NodeId id) {
    Node& gone = node(id);
    gone.changed = time_();
    if (--gone.links == 0 && gone.opens == 0) {
        freeInodes_.insert(gone.inode);
        used_ -= std::min(used_, nodeCost + gone.data.size());
    }
}

void Disk::closed(NodeId id) {
    Node& node = this->node(id);
    if (--node.opens == 0 && node.links == 0) {
        freeInodes_.insert(node.inode);
        used_ -= std::min(used_, nodeCost + node.data.size());
    }
}

long Disk::rename(NodeId from, const std::string& name, NodeId to, const std::string& newName,
                  unsigned flags) {
    const std::optional<NodeId> moved = child(from, name);
    const std::optional<NodeId> standing = child(to, newName);
    if (!moved || node(to).links == 0)
        return -ENOENT;
    if (newName.size() > 255)
        return -ENAMETOOLONG;
    if (standing && (flags & RENAME_NOREPLACE))
        return -EEXIST;
    if (!standing && (flags & RENAME_EXCHANGE))
        return -ENOENT;
    if (standing == moved)
        return 0;
    const auto isFolder = [this](NodeId id) { return node(id).kind == NodeKind::folder; };
    if ((isFolder(*moved) && isInside(to, *moved)) ||
        ((flags & RENAME_EXCHANGE) && isFolder(*standing) && isInside(from, *standing)))
        return -EINVAL;
    const bool exchange = (flags & RENAME_EXCHANGE) != 0;
    if (standing && !exchange) {
        if (isFolder(*standing) != isFolder(*moved))
            return isFolder(*standing) ? -EISDIR : -ENOTDIR;
        if (!node(*standing).names.empty())
            return -ENOTEMPTY;
    }
    if (exchange)
        node(from).names[name] = *standing;
    else
        node(from).names.erase(name);
    node(to).names[newName] = *moved;
    node(*moved).parent = to;
    node(*moved).name = newName;
    if (exchange) {
        node(*standing).parent = from;
        node(*standing).name = name;
    }
    node(*moved).changed = time_();
    touch(node(from));
    touch(node(to));
    note({exchange ? Change::Kind::exchange : Change::Kind::rename, from, name, *moved, to, newName,
          standing.value_or(0)});
    if (standing && !exchange)
        unlinked(*standing);
    return 0;
}

long Disk::link(NodeId id, NodeId folder, const std::string& name) {
    if (node(id).kind == NodeKind::folder)
        return -EPERM;
    if (child(folder, name))
        return -EEXIST;
    node(folder).names[name] = id;
    ++node(id).links;
    node(id).parent = folder;
    node(id).name = name;
    node(id).changed = time_();
    touch(node(folder));
    note({Change::Kind::link, folder, name, id, 0, {}, 0});
    return 0;
}

void Disk::resizeContent(Node& node, std::uint64_t size) {
    used_ = used_ - std::min<std::uint64_t>(used_, node.data.size()) + size;
    node.dirtyFrom = std::min({node.dirtyFrom, node.data.size(), static_cast<std::size_t>(size)});
    node.data.resize(size);
    node.dirtyTo = std::min<std::size_t>(std::max(node.dirtyTo, size), size);
    node.dirty = true;
    node.emptied |= size == 0;
    node.content = 0;
    touch(node);
}

long Disk::write(NodeId id, std::uint64_t offset, std::string_view bytes) {
    Node& node = this->node(id);
    const std::uint64_t end = offset + bytes.size();
    if (end > node.data.size()) {
        const std::uint64_t growth = end - node.data.size();
        if (growth > free()) {
            const std::uint64_t room = bytes.size() > growth ? bytes.size() - growth + free() : free();
            if (room == 0 || offset > node.data.size())
                return -ENOSPC;
            return write(id, offset, bytes.substr(0, std::min<std::size_t>(room, bytes.size() - 1)));
        }
        resizeContent(node, end);
    }
    node.data.replace(offset, bytes.size(), bytes);
    node.dirtyFrom = std::min<std::size_t>(node.dirtyFrom, offset);
    node.dirtyTo = std::max<std::size_t>(node.dirtyTo, end);
    node.dirty = true;
    node.content = 0;
    touch(node);
    return static_cast<long>(bytes.size());
}

long Disk::resize(NodeId id, std::uint64_t size) {
    Node& node = this->node(id);
    if (size > node.data.size() && size - node.data.size() > free())
        return -ENOSPC;
    if (size != node.data.size())
        resizeContent(node, size);
    return 0;
}

long Disk::setAttribute(NodeId id, const std::string& name, std::string_view value) {
    if (!setup_.attributes)
        return -EOPNOTSUPP;
    if (free() == 0)
        return -ENOSPC;
    node(id).attributes[name] = value;
    node(id).changed = time_();
    node(id).dirtyAttributes = true;
    return 0;
}

long Disk::removeAttribute(NodeId id, const std::string& name) {
    if (!setup_.attributes)
        return -EOPNOTSUPP;
    if (node(id).attributes.erase(name) == 0)
        return -ENODATA;
    node(id).changed = time_();
    node(id).dirtyAttributes = true;
    return 0;
}

void Disk::setModified(NodeId id, std::int64_t time) {
    node(id).modified = time;
    node(id).changed = time_();
    node(id).dirtyAttributes = true;
}

void Disk::visitFrom(NodeId id, const std::string& path, bool kept, const Visit& visit) const {
    const Node& node = this->node(id);
    for (const auto& [name, childId] : kept ? node.keptNames : node.names) {
        const Node& child = this->node(childId);
        const std::string childPath = path + '/' + name;
        visit(childPath, child);
        if (child.kind == NodeKind::folder)
            visitFrom(childId, childPath, kept, visit);
    }
}

void Disk::visit(NodeId from, const Visit& visit) const {
    visitFrom(from, pathOf(from), false, visit);
}

void Disk::visitKept(const Visit& visit) const {
    visitFrom(rootId, "", true, visit);
}

} // namespace simulation
