// The calls that the simulated machine answers for its disks.

#include "tests/simulation/machine/Fibers.h"
#include "tests/simulation/machine/Machine.h"
#include "tests/simulation/machine/RealCall.h"

#include <algorithm>
#include <cerrno>
#include <cstring>
#include <dirent.h>
#include <fcntl.h>
#include <poll.h>
#include <sys/inotify.h>
#include <sys/xattr.h>

namespace simulation {
namespace {

/// What one call takes of the machine's time.
constexpr std::chrono::microseconds callTime(20);

std::uint32_t modeOf(const Node& node) {
    switch (node.kind) {
    case NodeKind::folder:
        return S_IFDIR | node.mode;
    case NodeKind::link:
        return S_IFLNK | 0777;
    case NodeKind::pipe:
        return S_IFIFO | node.mode;
    case NodeKind::file:
        break;
    }
    return S_IFREG | node.mode;
}

unsigned char typeOf(const Node& node) {
    switch (node.kind) {
    case NodeKind::folder:
        return DT_DIR;
    case NodeKind::link:
        return DT_LNK;
    case NodeKind::pipe:
        return DT_FIFO;
    case NodeKind::file:
        break;
    }
    return DT_REG;
}

statx_timestamp stampOf(std::int64_t nanoseconds) {
    statx_timestamp stamp{};
    stamp.tv_sec = nanoseconds / 1'000'000'000;
    stamp.tv_nsec = static_cast<std::uint32_t>(nanoseconds % 1'000'000'000);
    return stamp;
}

ssize_t handOut(std::string_view value, void* buffer, std::size_t size) {
    if (size == 0)
        return static_cast<ssize_t>(value.size());
    if (value.size() > size)
        return -ERANGE;
    std::copy(value.begin(), value.end(), static_cast<char*>(buffer));
    return static_cast<ssize_t>(value.size());
}

} // namespace

template<class Work>
long Machine::call(const DiskCall& what, const Work& work) {
    time_.creep(callTime);
    Fibers::shared().interrupt();
    if (listener_)
        if (const int number = listener_->before(what))
            return -number;
    const long result = work();
    if (listener_)
        listener_->after(what, result);
    return result;
}

int Machine::open(int folder, const std::string& path, int flags, mode_t mode) {
    const bool writes = (flags & O_ACCMODE) != O_RDONLY;
    const bool changes = (flags & (O_CREAT | O_TRUNC)) != 0;
    return static_cast<int>(call({changes ? "create" : "open", path, {}, changes}, [&]() -> long {
        Place place;
        const bool follow = !(flags & O_NOFOLLOW) && !((flags & O_CREAT) && (flags & O_EXCL));
        if (const long number = find(folder, path, follow, place))
            return number;
        if (!place.id) {
            if (!(flags & O_CREAT) || place.name.empty())
                return -ENOENT;
            NodeId made = 0;
            if (const long number = place.disk->make(place.folder, place.name, NodeKind::file,
                                                     mode & 0777, made))
                return number;
            place.id = made;
            tell(place.disk.get(), place.folder, IN_CREATE, place.name);
        } else if ((flags & O_CREAT) && (flags & O_EXCL)) {
            return -EEXIST;
        }
        const Node& node = place.disk->node(*place.id);
        if (node.kind == NodeKind::link && !(flags & O_PATH))
            return -ELOOP;
        if (node.kind == NodeKind::folder && writes)
            return -EISDIR;
        if (node.kind != NodeKind::folder && (flags & O_DIRECTORY))
            return -ENOTDIR;
        if (denied(place) && !(flags & O_PATH))
            return -EACCES;
        if ((flags & O_TRUNC) && writes)
            place.disk->resize(*place.id, 0);
        place.disk->opened(*place.id);
        return add({File::Kind::node, place.disk, *place.id, place.path, flags, 0, 0, 0});
    }));
}

int Machine::close(int number) {
    const auto found = files_.find(number);
    if (found == files_.end())
        return -EBADF;
    const File file = std::move(found->second);
    files_.erase(found);
    if (file.kind != File::Kind::node)
        return 0;
    const Node& node = file.disk->node(file.id);
    if ((file.flags & O_ACCMODE) != O_RDONLY && node.links > 0)
        tell(file.disk.get(), node.parent, IN_CLOSE_WRITE, node.name);
    file.disk->closed(file.id);
    return 0;
}

ssize_t Machine::read(int number, void* buffer, std::size_t size, std::int64_t offset) {
    File& file = files_.at(number);
    if (file.kind == File::Kind::notices)
        return readNotices(buffer, size);
    if (file.kind == File::Kind::event) {
        if (file.count == 0)
            return -EAGAIN;
        const std::uint64_t count = std::exchange(file.count, 0);
        std::memcpy(buffer, &count, sizeof count);
        return sizeof count;
    }
    return call({"read", file.path, {}, false}, [&]() -> long {
        File& open = files_.at(number);
        const Node& node = open.disk->node(open.id);
        if (node.kind == NodeKind::folder)
            return -EISDIR;
        const std::uint64_t at = offset < 0 ? open.offset : static_cast<std::uint64_t>(offset);
        if (at >= node.data.size())
            return 0;
        const std::size_t count = std::min<std::size_t>(size, node.data.size() - at);
        std::copy_n(node.data.data() + at, count, static_cast<char*>(buffer));
        if (offset < 0)
            open.offset += count;
        return static_cast<long>(count);
    });
}

ssize_t Machine::write(int number, const void* buffer, std::size_t size, std::int64_t offset) {
    File& file = files_.at(number);
    if (file.kind == File::Kind::event) {
        ++file.count;
        Fibers::shared().wakeAll(&queue_);
        return static_cast<ssize_t>(size);
    }
    return call({"write", file.path, {}, true}, [&]() -> long {
        File& open = files_.at(number);
        const std::uint64_t at = (open.flags & O_APPEND) ? open.disk->node(open.id).data.size()
                                 : offset < 0            ? open.offset
                                                         : static_cast<std::uint64_t>(offset);
        const long done =
            open.disk->write(open.id, at, {static_cast<const char*>(buffer), size});
        if (done > 0 && offset < 0)
            open.offset = at + static_cast<std::uint64_t>(done);
        const Node& node = open.disk->node(open.id);
        if (done > 0 && node.links > 0)
            tell(open.disk.get(), node.parent, IN_MODIFY, node.name);
        return done;
    });
}

std::int64_t Machine::seek(int number, std::int64_t offset, int whence) {
    File& file = files_.at(number);
    const auto size = static_cast<std::int64_t>(file.disk->node(file.id).data.size());
    const std::int64_t base =
        whence == SEEK_END ? size : whence == SEEK_CUR ? static_cast<std::int64_t>(file.offset) : 0;
    file.offset = static_cast<std::uint64_t>(base + offset);
    file.lastName = 0;
    return base + offset;
}

long Machine::truncate(int number, std::uint64_t size) {
    return call({"truncate", files_.at(number).path, {}, true}, [&]() -> long {
        const File& file = files_.at(number);
        const long result = file.disk->resize(file.id, size);
        const Node& node = file.disk->node(file.id);
        if (node.links > 0)
            tell(file.disk.get(), node.parent, IN_MODIFY, node.name);
        return result;
    });
}

long Machine::reserve(int number, std::uint64_t size) {
    return call({"reserve", files_.at(number).path, {}, true}, [&]() -> long {
        const File& file = files_.at(number);
        const std::uint64_t now = file.disk->node(file.id).data.size();
        return size > now ? file.disk->resize(file.id, size) : 0;
    });
}

long Machine::sync(int number, bool everything) {
    return call({everything ? "syncfs" : "fsync", files_.at(number).path, {}, false},
                [&]() -> long {
                    const File& file = files_.at(number);
                    if (everything)
                        file.disk->syncAll();
                    else
                        file.disk->sync(file.id);
                    return 0;
                });
}

long Machine::attributes(int folder, const std::string& path, int flags, void* out) {
    return call({"stat", path, {}, false}, [&]() -> long {
        Place place;
        const bool own = path.empty() && (flags & AT_EMPTY_PATH);
        const long number = own ? locate(folder, path, false, place)
                                : findExisting(folder, path, !(flags & AT_SYMLINK_NOFOLLOW), place);
        if (number != 0)
            return number;
        const Node& node = place.disk->node(*place.id);
        auto& info = *static_cast<struct statx*>(out);
        info = {};
        info.stx_mask = STATX_BASIC_STATS | STATX_MNT_ID;
        info.stx_blksize = 4096;
        info.stx_nlink = node.links + (node.kind == NodeKind::folder ? 1 : 0);
        info.stx_mode = static_cast<std::uint16_t>(modeOf(node));
        info.stx_ino = node.inode;
        info.stx_size = node.data.size();
        info.stx_blocks = (node.data.size() + 511) / 512;
        info.stx_atime = info.stx_mtime = stampOf(node.modified);
        info.stx_ctime = stampOf(node.changed);
        info.stx_uid = 1000;
        info.stx_gid = 1000;
        info.stx_dev_major = 8;
        info.stx_dev_minor = static_cast<std::uint32_t>(place.disk->setup().device);
        info.stx_mnt_id = place.disk->setup().device;
        if (place.disk->setup().births) {
            info.stx_mask |= STATX_BTIME;
            info.stx_btime = stampOf(node.born);
        }
        return 0;
    });
}

long Machine::makeFolder(int folder, const std::string& path, mode_t mode) {
    return call({"mkdir", path, {}, true}, [&]() -> long {
        Place place;
        if (const long number = find(folder, path, false, place))
            return number;
        if (place.id || place.name.empty())
            return -EEXIST;
        NodeId made = 0;
        const long number =
            place.disk->make(place.folder, place.name, NodeKind::folder, mode & 0777, made);
        if (number == 0)
            tell(place.disk.get(), place.folder, IN_CREATE | IN_ISDIR, place.name);
        return number;
    });
}

long Machine::remove(int folder, const std::string& path, bool asFolder) {
    return call({asFolder ? "rmdir" : "unlink", path, {}, true}, [&]() -> long {
        Place place;
        if (const long number = findExisting(folder, path, false, place))
            return number;
        if (place.name.empty())
            return -EBUSY;
        if (const long number = place.disk->remove(place.folder, place.name, asFolder))
            return number;
        tell(place.disk.get(), place.folder, IN_DELETE | (asFolder ? IN_ISDIR : 0), place.name);
        if (asFolder)
            tellSelf(place.disk.get(), *place.id, IN_DELETE_SELF);
        return 0;
    });
}

long Machine::rename(int fromFolder, const std::string& from, int toFolder, const std::string& to,
                     unsigned flags) {
    const bool replaces = !(flags & (RENAME_NOREPLACE | RENAME_EXCHANGE));
    return call({"rename", from, to, true, replaces}, [&]() -> long {
        Place source;
        Place target;
        if (const long number = findExisting(fromFolder, from, false, source))
            return number;
        if (const long number = find(toFolder, to, false, target))
            return number;
        if (source.name.empty() || target.name.empty())
            return -EBUSY;
        if (source.disk != target.disk)
            return -EXDEV;
        const long number =
            source.disk->rename(source.folder, source.name, target.folder, target.name, flags);
        if (number == 0 && source.id != target.id)
            tellRename(source, target, (flags & RENAME_EXCHANGE) != 0);
        return number;
    });
}

long Machine::link(int fromFolder, const std::string& from, int toFolder, const std::string& to,
                   int flags) {
    return call({"link", from, to, true}, [&]() -> long {
        Place source;
        Place target;
        const bool own = from.empty() && (flags & AT_EMPTY_PATH);
        if (const long number = own ? locate(fromFolder, from, false, source)
                                    : findExisting(fromFolder, from,
                                                   (flags & AT_SYMLINK_FOLLOW) != 0, source))
            return number;
        if (const long number = find(toFolder, to, false, target))
            return number;
        if (source.disk != target.disk)
            return -EXDEV;
        const long number = source.disk->link(*source.id, target.folder, target.name);
        if (number == 0)
            tell(target.disk.get(), target.folder, IN_CREATE, target.name);
        return number;
    });
}

long Machine::symlink(const std::string& text, int folder, const std::string& path) {
    return call({"symlink", path, {}, true}, [&]() -> long {
        Place place;
        if (const long number = find(folder, path, false, place))
            return number;
        NodeId made = 0;
        if (const long number =
                place.disk->make(place.folder, place.name, NodeKind::link, 0777, made))
            return number;
        place.disk->node(made).data = place.disk->node(made).keptData = text;
        tell(place.disk.get(), place.folder, IN_CREATE, place.name);
        return 0;
    });
}

ssize_t Machine::readLink(int folder, const std::string& path, char* buffer, std::size_t size) {
    Place place;
    if (const long number = findExisting(folder, path, false, place))
        return number;
    const Node& node = place.disk->node(*place.id);
    if (node.kind != NodeKind::link)
        return -EINVAL;
    const std::size_t count = std::min(size, node.data.size());
    std::copy_n(node.data.data(), count, buffer);
    return static_cast<ssize_t>(count);
}

ssize_t Machine::names(int number, void* buffer, std::size_t size) {
    return call({"names", files_.at(number).path, {}, false}, [&]() -> long {
        File& file = files_.at(number);
        const Node& folder = file.disk->node(file.id);
        if (folder.kind != NodeKind::folder)
            return -ENOTDIR;
        std::map<std::uint64_t, const std::string*> rest;
        for (const auto& [name, id] : folder.names)
            if (const std::uint64_t order = orderOf(*file.disk, name); order > file.lastName)
                rest[order] = &name;
        std::size_t used = 0;
        std::size_t count = 0;
        for (const auto& [order, name] : rest) {
            const Node& node = file.disk->node(folder.names.at(*name));
            const std::size_t length =
                (offsetof(dirent64, d_name) + name->size() + 1 + 7) / 8 * 8;
            if (used + length > size || count++ >= namesAtOnce_)
                break;
            auto* const entry = reinterpret_cast<dirent64*>(static_cast<char*>(buffer) + used);
            entry->d_ino = node.inode;
            entry->d_off = static_cast<std::int64_t>(order >> 1U);
            entry->d_reclen = static_cast<unsigned short>(length);
            entry->d_type = typeOf(node);
            std::memcpy(entry->d_name, name->c_str(), name->size() + 1);
            used += length;
            file.lastName = order;
        }
        return static_cast<long>(used);
    });
}

long Machine::setTimes(int folder, const std::string& path, const timespec* times, int flags) {
    return call({"utime", path, {}, true}, [&]() -> long {
        Place place;
        const bool own = path.empty();
        const long number = own ? locate(folder, path, false, place)
                                : findExisting(folder, path, !(flags & AT_SYMLINK_NOFOLLOW), place);
        if (number != 0)
            return number;
        const bool now = !times || times[1].tv_nsec == UTIME_NOW;
        if (times && times[1].tv_nsec == UTIME_OMIT)
            return 0;
        place.disk->setModified(*place.id, now ? stamp()
                                               : times[1].tv_sec * 1'000'000'000 + times[1].tv_nsec);
        const Node& node = place.disk->node(*place.id);
        if (node.links > 0)
            tell(place.disk.get(), node.parent, IN_ATTRIB, node.name);
        return 0;
    });
}

ssize_t Machine::attribute(int file, const std::string& path, bool follow, const char* name,
                           void* value, std::size_t size) {
    return call({"getxattr", path, {}, false}, [&]() -> long {
        Place place;
        if (const long number = locate(file, path, follow, place))
            return number;
        if (!place.disk->setup().attributes)
            return -EOPNOTSUPP;
        const Node& node = place.disk->node(*place.id);
        const auto found = node.attributes.find(name);
        if (denied(place))
            return -EACCES;
        return found == node.attributes.end() ? -ENODATA : handOut(found->second, value, size);
    });
}

ssize_t Machine::attributeNames(int file, const std::string& path, bool follow, char* list,
                                std::size_t size) {
    Place place;
    if (const long number = locate(file, path, follow, place))
        return number;
    std::string all;
    for (const auto& [name, value] : place.disk->node(*place.id).attributes)
        all += name + '\0';
    return handOut(all, list, size);
}

long Machine::setAttribute(int file, const std::string& path, const char* name,
                           std::string_view value, int flags) {
    return call({"setxattr", path, {}, true}, [&]() -> long {
        Place place;
        if (const long number = locate(file, path, true, place))
            return number;
        const Node& node = place.disk->node(*place.id);
        const bool has = node.attributes.contains(name);
        if ((flags & XATTR_CREATE) && has)
            return -EEXIST;
        if ((flags & XATTR_REPLACE) && !has)
            return -ENODATA;
        const long number = place.disk->setAttribute(*place.id, name, value);
        if (number == 0 && node.links > 0)
            tell(place.disk.get(), node.parent, IN_ATTRIB, node.name);
        return number;
    });
}

long Machine::removeAttribute(int file, const std::string& path, const char* name) {
    return call({"removexattr", path, {}, true}, [&]() -> long {
        Place place;
        if (const long number = locate(file, path, true, place))
            return number;
        return place.disk->removeAttribute(*place.id, name);
    });
}

long Machine::room(const std::string& path, int file, std::uint64_t& free, std::uint64_t& total) {
    Place place;
    if (const long number = locate(file, path, true, place))
        return number;
    free = place.disk->free();
    total = place.disk->setup().room;
    return 0;
}

int Machine::poll(pollfd* files, std::size_t count, int timeout) {
    static auto* const real = realCall<int(pollfd*, nfds_t, int)>("poll");
    for (;;) {
        int ready = 0;
        for (std::size_t i = 0; i < count; ++i) {
            files[i].revents = 0;
            if (!ownsFile(files[i].fd))
                ready += real(files + i, 1, 0) > 0 ? 1 : 0;
            else if ((files[i].events & POLLIN) && readable(files_.at(files[i].fd))) {
                files[i].revents = POLLIN;
                ++ready;
            }
        }
        if (ready > 0 || timeout == 0)
            return ready;
        Fibers::shared().wait(&queue_, "a notice");
    }
}

} // namespace simulation
