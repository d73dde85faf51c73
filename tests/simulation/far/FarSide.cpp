#include "tests/simulation/far/FarSide.h"

#include <algorithm>

namespace simulation {
namespace {

constexpr std::int64_t second = 1'000'000'000;

} // namespace

FarSide::FarSide(const FarHabits& habits, std::function<std::int64_t()> wall)
    : habits_(habits), wall_(std::move(wall)) {
    for (const std::uint64_t id : {rootId, asideId}) {
        items_[id].id = id;
        items_[id].folder = true;
    }
}

std::string FarSide::folded(std::string_view name) const {
    std::string text(name);
    if (habits_.ignoresCase)
        for (char& letter : text)
            letter = letter >= 'A' && letter <= 'Z' ? static_cast<char>(letter + 32) : letter;
    return text;
}

std::uint64_t FarSide::childNamed(std::uint64_t folder, std::string_view name) const {
    const std::string wanted = folded(name);
    for (const auto& [id, item] : items_)
        if (item.parent == folder && folded(item.name) == wanted)
            return id;
    return 0;
}

const FarItem* FarSide::find(std::string_view path) const {
    std::uint64_t id = rootId;
    while (!path.empty() && id != 0) {
        const std::size_t slash = std::min(path.find('/'), path.size());
        id = items_.at(id).folder ? childNamed(id, path.substr(0, slash)) : 0;
        path.remove_prefix(std::min(slash + 1, path.size()));
    }
    return id == 0 ? nullptr : &items_.at(id);
}

std::string FarSide::pathOf(const FarItem& item) const {
    if (item.id == rootId)
        return "";
    const std::string parent = pathOf(items_.at(item.parent));
    return parent.empty() ? item.name : parent + '/' + item.name;
}

std::vector<const FarItem*> FarSide::children(const FarItem& folder) const {
    std::vector<const FarItem*> found;
    for (const auto& [id, item] : items_)
        if (item.parent == folder.id)
            found.push_back(&item);
    return found;
}

bool FarSide::isYoung(const FarItem& item) const {
    return habits_.youngEtags && !item.folder && wall_() / second == item.stored / second;
}

std::string FarSide::etagOf(const FarItem& item) const {
    if (item.folder)
        return habits_.folderEtags ? "f" + std::to_string(item.version) : "f";
    if (!habits_.youngEtags)
        return "v" + std::to_string(item.version);
    if (isYoung(item))
        return "W" + std::to_string(item.stored / second) + '-' +
               std::to_string(item.content.size());
    return "s" + std::to_string(item.version);
}

bool FarSide::refuses(std::string_view name) const {
    return habits_.refusesNames && (name.find(':') != std::string_view::npos ||
                                    name.ends_with('.') || name.size() > 100);
}

std::uint64_t FarSide::used() const {
    std::uint64_t bytes = 0;
    for (const auto& [id, item] : items_)
        bytes += item.content.size();
    return bytes;
}

std::optional<std::uint64_t> FarSide::free() const {
    if (!quota_)
        return std::nullopt;
    return *quota_ - std::min(*quota_, used());
}

std::optional<FarSide::Spot> FarSide::spotOf(const std::string& path) const {
    const std::size_t slash = path.rfind('/');
    const FarItem* const folder =
        find(slash == std::string::npos ? std::string_view() : std::string_view(path).substr(0, slash));
    if (!folder || !folder->folder)
        return std::nullopt;
    return Spot{folder->id, slash == std::string::npos ? path : path.substr(slash + 1)};
}

void FarSide::touch(FarItem& item) {
    item.version = ++lastVersion_;
    item.stored = wall_();
}

void FarSide::touchFolder(std::uint64_t folder) {
    if (habits_.folderEtags)
        items_.at(folder).version = ++lastVersion_;
}

FarSide::Obstacle FarSide::write(const std::string& path, const std::string& content,
                                 std::int64_t modified, const std::string& tags, Actor actor) {
    const std::optional<Spot> spot = spotOf(path);
    if (!spot)
        return Obstacle::missing;
    if (refuses(spot->name))
        return Obstacle::refused;
    const FarItem* const standing = find(path);
    if (standing && standing->folder)
        return Obstacle::exists;
    const std::uint64_t now = standing ? standing->content.size() : 0;
    if (const auto room = free(); room && content.size() > *room + now)
        return Obstacle::quota;
    if (listener_) {
        listener_->farAppears(path, content, actor);
        if (standing)
            listener_->farVanishes(path, standing->content, actor);
    }
    FarItem& item = items_[standing ? standing->id : ++lastId_];
    if (!standing) {
        item.id = lastId_;
        item.parent = spot->folder;
        item.name = spot->name;
        touchFolder(spot->folder);
    }
    item.content = content;
    item.tags = tags;
    touch(item);
    item.modified = habits_.keepsTimes ? modified : item.stored;
    return Obstacle::none;
}

FarSide::Obstacle FarSide::makeFolder(const std::string& path, Actor) {
    const std::optional<Spot> spot = spotOf(path);
    if (!spot)
        return Obstacle::missing;
    if (refuses(spot->name))
        return Obstacle::refused;
    if (find(path))
        return Obstacle::exists;
    FarItem& item = items_[++lastId_];
    item.id = lastId_;
    item.folder = true;
    item.parent = spot->folder;
    item.name = spot->name;
    touch(item);
    item.modified = item.stored;
    touchFolder(spot->folder);
    return Obstacle::none;
}

FarSide::Obstacle FarSide::move(const std::string& from, const std::string& to, Actor) {
    const FarItem* const source = find(from);
    const std::optional<Spot> spot = spotOf(to);
    if (!source || !spot)
        return Obstacle::missing;
    if (refuses(spot->name))
        return Obstacle::refused;
    if (const FarItem* const standing = find(to); standing && standing != source)
        return Obstacle::exists;
    for (std::uint64_t id = spot->folder; id != rootId; id = items_.at(id).parent)
        if (id == source->id)
            return Obstacle::invalid;
    FarItem& item = items_.at(source->id);
    touchFolder(item.parent);
    item.parent = spot->folder;
    item.name = spot->name;
    touchFolder(item.parent);
    if (habits_.moveChangesEtag && !item.folder)
        touch(item);
    return Obstacle::none;
}

FarSide::Obstacle FarSide::remove(const std::string& path, Actor actor) {
    const FarItem* const item = find(path);
    if (!item || item->id == rootId)
        return Obstacle::missing;
    if (item->folder && !children(*item).empty())
        return Obstacle::notEmpty;
    if (listener_ && !item->folder)
        listener_->farVanishes(path, item->content, actor);
    if (!item->folder)
        trash_.push_back(item->content);
    touchFolder(item->parent);
    items_.erase(item->id);
    return Obstacle::none;
}

std::uint64_t FarSide::setAside(const std::string& path) {
    const FarItem* const found = find(path);
    if (!found)
        return 0;
    FarItem& item = items_.at(found->id);
    item.parent = asideId;
    item.name = std::to_string(item.id);
    return item.id;
}

FarSide::Obstacle FarSide::putBack(std::uint64_t id, const std::string& path) {
    const std::optional<Spot> spot = spotOf(path);
    if (!spot)
        return Obstacle::missing;
    if (find(path))
        return Obstacle::exists;
    items_.at(id).parent = spot->folder;
    items_.at(id).name = spot->name;
    return Obstacle::none;
}

void FarSide::discard(std::uint64_t id, Actor actor) {
    if (listener_)
        listener_->farVanishes("(aside)", items_.at(id).content, actor);
    trash_.push_back(items_.at(id).content);
    items_.erase(id);
}

void FarSide::visit(
    const std::function<void(const std::string& path, const FarItem& item)>& visit) const {
    for (const auto& [id, item] : items_) {
        std::uint64_t top = id;
        while (items_.at(top).parent != 0)
            top = items_.at(top).parent;
        if (top == rootId && id != rootId)
            visit(pathOf(item), item);
    }
}

} // namespace simulation
