// What a sync brings to a simulated disk, and what a loss of power leaves of the rest.

#include "tests/simulation/machine/Disk.h"

#include <algorithm>

namespace simulation {
namespace {

constexpr std::size_t sector = 512;

} // namespace

void Disk::note(Change change) {
    pending_.push_back(std::move(change));
}

void Disk::apply(const Change& change) {
    const auto erase = [this](NodeId folder, const std::string& name, NodeId id) {
        auto& names = node(folder).keptNames;
        if (const auto found = names.find(name); found != names.end() && found->second == id)
            names.erase(found);
    };
    switch (change.kind) {
    case Change::Kind::link:
        node(change.folder).keptNames[change.name] = change.node;
        break;
    case Change::Kind::unlink:
        erase(change.folder, change.name, change.node);
        break;
    case Change::Kind::rename:
        erase(change.folder, change.name, change.node);
        node(change.toFolder).keptNames[change.toName] = change.node;
        break;
    case Change::Kind::exchange:
        node(change.folder).keptNames[change.name] = change.toNode;
        node(change.toFolder).keptNames[change.toName] = change.node;
        break;
    }
}

void Disk::keep(const std::vector<bool>& chosen) {
    std::vector<Change> rest;
    for (std::size_t i = 0; i < pending_.size(); ++i)
        if (chosen[i])
            apply(pending_[i]);
        else
            rest.push_back(std::move(pending_[i]));
    if (rest.size() != pending_.size())
        ++syncs_;
    pending_ = std::move(rest);
    if (nodes_.size() > remembered_ * 2 + 64)
        forgetUnreachable();
}

/// Of a loose journal: everything that touches the folder, what that builds upon, and what makes
/// the folder itself be there.
void Disk::keepNamesOf(NodeId folder) {
    std::set<std::pair<NodeId, std::string>> names;
    std::set<NodeId> folders{folder};
    std::vector<bool> chosen(pending_.size());
    for (std::size_t i = pending_.size(); i-- > 0;) {
        const Change& change = pending_[i];
        const bool wanted = change.touches(folder) || names.contains({change.folder, change.name}) ||
                            names.contains({change.toFolder, change.toName}) ||
                            folders.contains(change.node) || folders.contains(change.toNode);
        if (!wanted)
            continue;
        chosen[i] = true;
        names.insert({change.folder, change.name});
        folders.insert(change.folder);
        if (change.toFolder != 0) {
            names.insert({change.toFolder, change.toName});
            folders.insert(change.toFolder);
        }
    }
    keep(chosen);
}

void Disk::keepContent(Node& node) {
    if (node.dirty) {
        if (node.dirtyFrom < node.dirtyTo && node.keptData.size() >= node.dirtyFrom) {
            node.keptData.resize(node.data.size());
            const std::size_t count = std::min(node.dirtyTo, node.data.size()) - node.dirtyFrom;
            node.keptData.replace(node.dirtyFrom, count, node.data, node.dirtyFrom, count);
        } else {
            node.keptData = node.data;
        }
        ++syncs_;
    }
    if (node.dirtyAttributes)
        ++syncs_;
    node.keptAttributes = node.attributes;
    node.keptModified = node.modified;
    node.dirtyFrom = SIZE_MAX;
    node.dirtyTo = 0;
    node.dirty = node.emptied = node.dirtyAttributes = false;
}

void Disk::sync(NodeId id) {
    if (node(id).kind != NodeKind::folder)
        keepContent(node(id));
    if (setup_.journal == Journal::ordered)
        keep(std::vector<bool>(pending_.size(), true));
    else if (node(id).kind == NodeKind::folder)
        keepNamesOf(id);
}

void Disk::syncAll() {
    for (auto& [id, node] : nodes_)
        keepContent(node);
    keep(std::vector<bool>(pending_.size(), true));
}

void Disk::forgetUnreachable() {
    std::set<NodeId> used{rootId};
    for (const auto& [id, node] : nodes_) {
        if (node.links > 0 || node.opens > 0)
            used.insert(id);
        for (const auto& [name, child] : node.keptNames)
            used.insert(child);
    }
    for (const Change& change : pending_)
        used.insert({change.folder, change.node, change.toFolder, change.toNode});
    std::erase_if(nodes_, [&](const auto& one) { return !used.contains(one.first); });
    remembered_ = nodes_.size();
}

bool Disk::keptLeads(NodeId from, NodeId to) const {
    std::vector<NodeId> waiting{from};
    while (!waiting.empty()) {
        const NodeId id = waiting.back();
        waiting.pop_back();
        if (id == to)
            return true;
        for (const auto& [name, child] : node(id).keptNames)
            if (node(child).kind == NodeKind::folder)
                waiting.push_back(child);
    }
    return false;
}

/// Decides which of the names' changes are on the disk after all.
void Disk::chooseChanges(Luck& luck) {
    const std::size_t prefix = luck.below(pending_.size() + 1);
    const unsigned chance = static_cast<unsigned>(luck.below(101));
    std::set<std::pair<NodeId, std::string>> lost;
    for (std::size_t i = 0; i < pending_.size(); ++i) {
        const Change& change = pending_[i];
        const bool loose = setup_.journal == Journal::loose;
        bool survives = loose ? luck.percent(chance) : i < prefix;
        const bool builds = lost.contains({change.folder, change.name}) ||
                            lost.contains({change.toFolder, change.toName});
        // Nobody moves a thing into a folder that is not there, or that is inside the thing.
        const bool nowhere = !keptLeads(rootId, change.folder) ||
                             (change.toFolder != 0 && (!keptLeads(rootId, change.toFolder) ||
                                                       keptLeads(change.node, change.toFolder)));
        if (builds || nowhere)
            survives = false;
        if (survives) {
            apply(change);
            continue;
        }
        lost.insert({change.folder, change.name});
        if (change.toFolder != 0)
            lost.insert({change.toFolder, change.toName});
    }
    pending_.clear();
}

void Disk::chooseContent(Node& node, Luck& luck) {
    if (node.dirtyAttributes && luck.percent(50))
        node.keptAttributes = node.attributes;
    if (node.dirty) {
        const std::string fresh = node.data;
        switch (luck.below(node.emptied ? 5 : 4)) {
        case 0: // nothing of it arrived
            break;
        case 1:
            node.keptData = fresh;
            node.keptModified = node.modified;
            break;
        case 2: // its length and its first pieces arrived
            node.keptData = fresh.substr(0, luck.below(fresh.size() / sector + 1) * sector);
            node.keptData.resize(fresh.size());
            node.keptModified = node.modified;
            break;
        case 3: { // some pieces arrived
            std::string& kept = node.keptData;
            kept.resize(std::max(kept.size(), fresh.size()));
            for (std::size_t at = node.dirtyFrom / sector * sector; at < fresh.size(); at += sector)
                if (luck.percent(50))
                    kept.replace(at, std::min(sector, fresh.size() - at), fresh, at, sector);
            kept.resize(luck.percent(50) ? fresh.size() : kept.size());
            break;
        }
        default: // the name and no content, as after a rename with delayed writing
            node.keptData.clear();
            node.keptModified = node.modified;
            break;
        }
    }
    node.data = node.keptData;
    node.attributes = node.keptAttributes;
    node.modified = node.keptModified;
}

/// What is kept becomes what is seen.
void Disk::beginAnew() {
    for (auto& [id, node] : nodes_) {
        node.links = id == rootId ? 1 : 0;
        node.opens = 0;
        node.names = node.keptNames;
        node.content = 0;
        keepContent(node);
    }
    std::vector<NodeId> waiting{rootId};
    while (!waiting.empty()) {
        const NodeId id = waiting.back();
        waiting.pop_back();
        for (const auto& [name, childId] : node(id).names) {
            Node& child = node(childId);
            ++child.links;
            child.parent = id;
            child.name = name;
            if (child.kind == NodeKind::folder)
                waiting.push_back(childId);
        }
    }
    std::set<std::uint64_t> inodes;
    used_ = 0;
    std::erase_if(nodes_, [](const auto& one) { return one.second.links == 0; });
    std::map<NodeId, Node*> inOrder;
    for (auto& [id, node] : nodes_)
        inOrder[id] = &node;
    for (auto& [id, node] : inOrder) {
        while (!inodes.insert(node->inode).second)
            node->inode = ++lastInode_;
        used_ += 512 + node->data.size();
    }
    std::erase_if(freeInodes_, [&](std::uint64_t inode) { return inodes.contains(inode); });
}

Disk Disk::afterPowerCut(Luck& luck) const {
    Disk disk = *this;
    disk.chooseChanges(luck);
    std::map<NodeId, Node*> inOrder; // chance must not depend on the order of a hash table
    for (auto& [id, node] : disk.nodes_)
        inOrder[id] = &node;
    for (auto& [id, node] : inOrder)
        disk.chooseContent(*node, luck);
    disk.beginAnew();
    return disk;
}

Disk Disk::afterKill() const {
    Disk disk = *this;
    for (auto& [id, node] : disk.nodes_) {
        if (node.links == 0 && node.opens > 0)
            disk.freeInodes_.insert(node.inode);
        node.opens = 0;
    }
    disk.forgetUnreachable();
    return disk;
}

} // namespace simulation
