#pragma once

#include "tests/simulation/machine/Disk.h"
#include "tests/simulation/machine/Time.h"

#include <deque>
#include <memory>
#include <string>
#include <string_view>
#include <sys/stat.h>
#include <sys/types.h>
#include <utility>
#include <vector>

struct pollfd;

namespace simulation {

/// A call that a program made of a simulated disk.
struct DiskCall {
    std::string_view name;
    std::string path;
    std::string to; // of a rename or a link
    bool changes = false;
    bool replaces = true; // of a rename
};

/// Hears of every call; decides whether it fails.
class DiskListener {
public:
    virtual ~DiskListener() = default;
    /// Answers the errno to fail with, or 0.
    virtual int before(const DiskCall& call) = 0;
    virtual void after(const DiskCall& call, long result) = 0;
};

/// The simulated machine: disks at paths, open files, folder notices and time. FileCalls.cpp leads
/// the C library's calls for such paths and descriptors here, so that the code under test, the
/// database library included, runs on it unchanged. Answers are those of system calls: an errno
/// below zero.
class Machine {
public:
    /// Below it are the simulated paths; everything else is the real file system.
    static constexpr std::string_view prefix = "/sim/";

    static Machine& shared();

    Time& time() { return time_; }
    std::int64_t wall() const { return time_.wall(); }
    std::chrono::nanoseconds monotonic() const { return time_.monotonic(); }
    void setTick(std::int64_t nanoseconds) { tick_ = nanoseconds; }
    /// What a file is stamped with now.
    std::int64_t stamp() const { return wall() / tick_ * tick_; }

    Luck& luck() { return luck_; }
    void setListener(DiskListener* listener) { listener_ = listener; }
    /// A folder's names come in portions of at most this many, as from a large folder.
    void setNamesAtOnce(std::size_t count) { namesAtOnce_ = count; }

    /// `path` has no slash at its end.
    void mount(const std::string& path, std::shared_ptr<Disk> disk);
    std::shared_ptr<Disk> disk(std::string_view path) const;
    const std::vector<std::pair<std::string, std::shared_ptr<Disk>>>& mounts() const {
        return mounts_;
    }
    void unmountAll();

    /// Decides what the disks are after a loss of power, or the death of the programs, at this
    /// moment. What runs goes on, on disks that nobody will ever see, until restart().
    enum class Stop { power, kill };
    void stopNow(Stop how);
    bool stopped() const { return !survivors_.empty(); }
    /// The survivors take the disks' places. Nothing may have a file open any more.
    void restart();
    std::size_t openFiles() const;

    // Folder notices.
    struct Notices {
        bool lost = false; // the queue ran over
        std::size_t room = 1024;
        unsigned late = 0; // of a hundred, how many are not there at once
    };
    Notices& notices() { return notices_; }
    /// The queue runs over now, whatever is in it.
    void overflowNotices();
    /// Notices that were late are there.
    void deliverNotices();

    // The calls. `folder` is a simulated descriptor or AT_FDCWD.
    static bool ownsPath(const char* path);
    bool ownsFile(int file) const { return file >= firstFile; }
    int open(int folder, const std::string& path, int flags, mode_t mode);
    int close(int file);
    ssize_t read(int file, void* buffer, std::size_t size, std::int64_t offset); // -1: where it is
    ssize_t write(int file, const void* buffer, std::size_t size, std::int64_t offset);
    std::int64_t seek(int file, std::int64_t offset, int whence);
    long truncate(int file, std::uint64_t size);
    long reserve(int file, std::uint64_t size);
    long sync(int file, bool everything);
    /// `info` is a struct statx.
    long attributes(int folder, const std::string& path, int flags, void* info);
    long makeFolder(int folder, const std::string& path, mode_t mode);
    long remove(int folder, const std::string& path, bool asFolder);
    long rename(int fromFolder, const std::string& from, int toFolder, const std::string& to,
                unsigned flags);
    long link(int fromFolder, const std::string& from, int toFolder, const std::string& to,
              int flags);
    long symlink(const std::string& target, int folder, const std::string& path);
    ssize_t readLink(int folder, const std::string& path, char* buffer, std::size_t size);
    ssize_t names(int file, void* buffer, std::size_t size);
    long setTimes(int folder, const std::string& path, const timespec* times, int flags);
    ssize_t attribute(int file, const std::string& path, bool follow, const char* name,
                      void* value, std::size_t size);
    ssize_t attributeNames(int file, const std::string& path, bool follow, char* list,
                           std::size_t size);
    long setAttribute(int file, const std::string& path, const char* name, std::string_view value,
                      int flags);
    long removeAttribute(int file, const std::string& path, const char* name);
    long room(const std::string& path, int file, std::uint64_t& free, std::uint64_t& total);
    std::uint64_t device(int file) const;

    int makeEvent();
    int makeNotices();
    int watch(int file, const std::string& path, std::uint32_t mask);
    long unwatch(int file, int watch);
    int poll(pollfd* files, std::size_t count, int timeout);

private:
    static constexpr int firstFile = 1 << 20;

    struct Place {
        std::shared_ptr<Disk> disk;
        NodeId folder = 0;
        std::string name;        // "" for the folder itself
        std::optional<NodeId> id; // what stands there
        std::string path;        // of the machine
    };
    struct File {
        enum class Kind { node, event, notices };
        Kind kind = Kind::node;
        std::shared_ptr<Disk> disk;
        NodeId id = 0;
        std::string path;
        int flags = 0;
        std::uint64_t offset = 0;
        std::uint64_t lastName = 0; // of a folder that is being read: the order of the last one
        std::uint64_t count = 0;    // of an event
    };
    struct Notice {
        int watch = 0;
        std::uint32_t mask = 0;
        std::uint32_t cookie = 0;
        std::string name;
        bool late = false;
    };
    struct Watched {
        std::shared_ptr<Disk> disk;
        NodeId id = 0;
        std::uint32_t mask = 0;
    };

    Machine();
    /// Answers 0 and the place; fails when a folder on the way is missing.
    long find(int folder, const std::string& path, bool follow, Place& place, int depth = 0);
    long findOnDisk(Place& place, std::string rest, bool follow, int depth);
    long findExisting(int folder, const std::string& path, bool follow, Place& place);
    int add(File file);
    std::string pathOf(const File& file) const;
    long locate(int file, const std::string& path, bool follow, Place& place);
    std::uint64_t orderOf(const Disk& disk, const std::string& name) const;

    /// The one way in and out of every call: lets others run, asks whether it fails, counts.
    template<class Work>
    long call(const DiskCall& what, const Work& work);
    bool denied(const Place& place) const;

    void tell(const Disk* disk, NodeId folder, std::uint32_t mask, const std::string& name,
              std::uint32_t cookie = 0);
    void tellRename(const Place& from, const Place& to, bool exchange);
    void queueNotice(Notice notice);
    void tellSelf(const Disk* disk, NodeId id, std::uint32_t mask);
    bool readable(const File& file) const;
    ssize_t readNotices(void* buffer, std::size_t size);

    Time time_;
    std::int64_t tick_ = 4'000'000;
    Luck luck_;
    DiskListener* listener_ = nullptr;
    std::size_t namesAtOnce_ = SIZE_MAX;
    std::vector<std::pair<std::string, std::shared_ptr<Disk>>> mounts_;
    std::vector<std::shared_ptr<Disk>> survivors_;
    std::map<int, File> files_;
    int lastFile_ = firstFile;
    Notices notices_;
    std::deque<Notice> queue_;
    std::map<int, Watched> watches_;
    int lastWatch_ = 0;
    std::uint32_t lastCookie_ = 0;
    std::uint64_t boots_ = 0;
};

} // namespace simulation
