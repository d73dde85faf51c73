#include "tests/simulation/machine/Machine.h"

#include "tests/simulation/machine/Fibers.h"

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <sys/inotify.h>

namespace simulation {

Machine::Machine() = default;

Machine& Machine::shared() {
    static Machine* const machine = new Machine(); // lives as long as the process
    return *machine;
}

bool Machine::ownsPath(const char* path) {
    return path && std::string_view(path).starts_with(prefix);
}

void Machine::mount(const std::string& path, std::shared_ptr<Disk> disk) {
    mounts_.emplace_back(path, std::move(disk));
}

void Machine::unmountAll() {
    mounts_.clear();
    survivors_.clear();
    queue_.clear();
    watches_.clear();
}

std::shared_ptr<Disk> Machine::disk(std::string_view path) const {
    for (const auto& [at, disk] : mounts_)
        if (path == at || path.starts_with(at + '/'))
            return disk;
    return nullptr;
}

void Machine::stopNow(Stop how) {
    for (const auto& [path, disk] : mounts_)
        survivors_.push_back(std::make_shared<Disk>(how == Stop::power ? disk->afterPowerCut(luck_)
                                                                       : disk->afterKill()));
}

void Machine::restart() {
    for (std::size_t i = 0; i < survivors_.size(); ++i)
        mounts_[i].second = survivors_[i];
    survivors_.clear();
    std::erase_if(files_, [](const auto& one) { return one.second.kind == File::Kind::node; });
    queue_.clear();
    watches_.clear();
    ++boots_;
}

std::size_t Machine::openFiles() const {
    return static_cast<std::size_t>(std::count_if(files_.begin(), files_.end(), [](const auto& one) {
        return one.second.kind == File::Kind::node;
    }));
}

std::uint64_t Machine::device(int file) const {
    // The database library remembers files by device and number for as long as the process lives;
    // after a restart they are others to it.
    return files_.at(file).disk->setup().device + (boots_ << 8U);
}

// Finding.

long Machine::find(int folder, const std::string& path, bool follow, Place& place, int depth) {
    if (!path.starts_with('/')) {
        const auto file = files_.find(folder);
        if (file == files_.end())
            return -EBADF;
        place = {file->second.disk, file->second.id, {}, {}, file->second.path};
        return findOnDisk(place, path, follow, depth);
    }
    for (const auto& [at, disk] : mounts_) {
        if (path != at && !path.starts_with(at + '/'))
            continue;
        place = {disk, disk->root(), {}, disk->root(), at};
        return findOnDisk(place, path.substr(at.size()), follow, depth);
    }
    return -ENOENT;
}

long Machine::findOnDisk(Place& place, std::string rest, bool follow, int depth) {
    place.id = place.folder;
    place.name.clear();
    for (;;) {
        const std::size_t begin = rest.find_first_not_of('/');
        if (begin == std::string::npos)
            return 0;
        const std::size_t end = std::min(rest.find('/', begin), rest.size());
        const std::string name = rest.substr(begin, end - begin);
        rest.erase(0, end);
        if (!place.id)
            return -ENOENT;
        const Node& folder = place.disk->node(*place.id);
        if (folder.kind != NodeKind::folder)
            return -ENOTDIR;
        if (folder.denied && !Fibers::shared().isDriver())
            return -EACCES;
        if (name == ".")
            continue;
        if (name == "..") {
            place.id = place.folder = folder.parent ? folder.parent : folder.id;
            place.name.clear();
            continue;
        }
        place.folder = folder.id;
        place.name = name;
        place.path += '/' + name;
        place.id = place.disk->child(folder.id, name);
        const bool last = rest.find_first_not_of('/') == std::string::npos;
        if (!place.id || place.disk->node(*place.id).kind != NodeKind::link || (last && !follow))
            continue;
        if (depth > 8)
            return -ELOOP;
        const std::string& target = place.disk->node(*place.id).data;
        if (target.starts_with('/'))
            return ownsPath(target.c_str()) ? find(-1, target + rest, follow, place, depth + 1)
                                            : -ENOENT;
        place.path.resize(place.path.size() - name.size() - 1);
        return findOnDisk(place, target + rest, follow, depth + 1);
    }
}

long Machine::findExisting(int folder, const std::string& path, bool follow, Place& place) {
    if (const long number = find(folder, path, follow, place))
        return number;
    return place.id ? 0 : -ENOENT;
}

long Machine::locate(int file, const std::string& path, bool follow, Place& place) {
    if (file < 0)
        return findExisting(-1, path, follow, place);
    const File& opened = files_.at(file);
    place = {opened.disk, 0, {}, opened.id, opened.path};
    return 0;
}

bool Machine::denied(const Place& place) const {
    return place.id && place.disk->node(*place.id).denied && !Fibers::shared().isDriver();
}

std::uint64_t Machine::orderOf(const Disk& disk, const std::string& name) const {
    std::uint64_t hash = 0xCBF29CE484222325ULL;
    for (const char letter : name)
        hash = (hash ^ static_cast<unsigned char>(letter)) * 0x100000001B3ULL;
    return mixed(hash, disk.setup().nameOrder) | 1U;
}

int Machine::add(File file) {
    files_[++lastFile_] = std::move(file);
    return lastFile_;
}

// Notices.

void Machine::queueNotice(Notice notice) {
    notice.late = luck_.percent(notices_.late);
    if (queue_.size() >= notices_.room) {
        overflowNotices();
        return;
    }
    const bool repeated = !queue_.empty() && queue_.back().watch == notice.watch &&
                          queue_.back().mask == notice.mask && queue_.back().name == notice.name &&
                          queue_.back().cookie == notice.cookie;
    if (!repeated)
        queue_.push_back(std::move(notice));
    Fibers::shared().wakeAll(&queue_);
}

void Machine::overflowNotices() {
    if (watches_.empty())
        return;
    if (queue_.empty() || queue_.back().mask != IN_Q_OVERFLOW)
        queue_.push_back({-1, IN_Q_OVERFLOW, 0, {}, false});
    Fibers::shared().wakeAll(&queue_);
}

void Machine::deliverNotices() {
    for (Notice& notice : queue_)
        notice.late = false;
    Fibers::shared().wakeAll(&queue_);
}

void Machine::tell(const Disk* disk, NodeId folder, std::uint32_t mask, const std::string& name,
                   std::uint32_t cookie) {
    for (const auto& [number, watched] : watches_)
        if (watched.disk.get() == disk && watched.id == folder && (watched.mask & mask))
            queueNotice({number, mask, cookie, name, false});
}

void Machine::tellSelf(const Disk* disk, NodeId id, std::uint32_t mask) {
    for (const auto& [number, watched] : std::map<int, Watched>(watches_)) {
        if (watched.disk.get() != disk || watched.id != id)
            continue;
        if (watched.mask & mask)
            queueNotice({number, mask, 0, {}, false});
        if (mask & IN_DELETE_SELF) {
            queueNotice({number, IN_IGNORED, 0, {}, false});
            watches_.erase(number);
        }
    }
}

void Machine::tellRename(const Place& from, const Place& to, bool exchange) {
    const bool folder = from.disk->node(*from.id).kind == NodeKind::folder;
    const std::uint32_t flag = folder ? IN_ISDIR : 0;
    ++lastCookie_;
    tell(from.disk.get(), from.folder, IN_MOVED_FROM | flag, from.name, lastCookie_);
    tell(to.disk.get(), to.folder, IN_MOVED_TO | flag, to.name, lastCookie_);
    tellSelf(from.disk.get(), *from.id, IN_MOVE_SELF);
    if (to.id && !exchange)
        tellSelf(to.disk.get(), *to.id, IN_DELETE_SELF);
    else if (to.id)
        tellRename({to.disk, to.folder, to.name, to.id, {}},
                   {from.disk, from.folder, from.name, {}, {}}, false);
}

bool Machine::readable(const File& file) const {
    if (file.kind == File::Kind::event)
        return file.count > 0;
    if (file.kind == File::Kind::notices)
        return !queue_.empty() && !queue_.front().late;
    return true;
}

ssize_t Machine::readNotices(void* buffer, std::size_t size) {
    std::size_t used = 0;
    while (!queue_.empty() && !queue_.front().late) {
        const Notice& notice = queue_.front();
        const std::size_t room = notice.name.empty() ? 0 : (notice.name.size() + 16) / 16 * 16;
        if (used + sizeof(inotify_event) + room > size)
            break;
        inotify_event head{};
        head.wd = notice.watch;
        head.mask = notice.mask;
        head.cookie = notice.cookie;
        head.len = static_cast<std::uint32_t>(room);
        char* const at = static_cast<char*>(buffer) + used;
        std::copy_n(reinterpret_cast<const char*>(&head), sizeof head, at);
        std::fill_n(at + sizeof head, room, '\0');
        std::copy(notice.name.begin(), notice.name.end(), at + sizeof head);
        used += sizeof head + room;
        queue_.pop_front();
    }
    return used == 0 ? -EAGAIN : static_cast<ssize_t>(used);
}

int Machine::makeEvent() {
    return add({File::Kind::event, nullptr, 0, {}, 0, 0, 0, 0});
}

int Machine::makeNotices() {
    return add({File::Kind::notices, nullptr, 0, {}, 0, 0, 0, 0});
}

int Machine::watch(int, const std::string& path, std::uint32_t mask) {
    Place place;
    if (const long number = findExisting(-1, path, true, place))
        return static_cast<int>(number);
    if ((mask & IN_ONLYDIR) && place.disk->node(*place.id).kind != NodeKind::folder)
        return -ENOTDIR;
    if (denied(place))
        return -EACCES;
    for (const auto& [number, watched] : watches_)
        if (watched.disk == place.disk && watched.id == *place.id)
            return number;
    watches_[++lastWatch_] = {place.disk, *place.id, mask};
    return lastWatch_;
}

long Machine::unwatch(int, int watch) {
    if (watches_.erase(watch) == 0)
        return -EINVAL;
    queueNotice({watch, IN_IGNORED, 0, {}, false});
    return 0;
}

} // namespace simulation
