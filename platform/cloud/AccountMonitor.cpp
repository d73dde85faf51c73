#include "platform/cloud/AccountMonitor.h"

#include "platform/base/Log.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"

namespace platform {
namespace {

/// How often the file is looked at where the kernel gives no notices.
constexpr auto pollInterval = std::chrono::seconds(10);

std::string nearestFolder(std::string path) {
    bool directory = false;
    while (path != "/" && !(FileManager::exists(path, &directory) && directory))
        path = std::string(folderOf(path));
    return path;
}

void logReading(const AccountReading& reading) {
    if (reading.account)
        platformLog(LogLevel::info, "cloud: signed in to “%@” (%@)", reading.account->name,
                    reading.account->address);
    else
        platformLog(reading.missing ? LogLevel::info : LogLevel::warning, "cloud: no account: %@",
                    *reading.problem);
}

} // namespace

/// Lets what is queued find out that the monitor has gone.
struct AccountMonitor::Alive {};

AccountMonitor::AccountMonitor(const Folders& folders, MainQueue& main, DirectoryWatcher& watcher,
                               std::function<void()> changed)
    : folders_(folders), main_(main), watcher_(watcher), alive_(std::make_shared<Alive>()) {
    look();
    changed_ = std::move(changed); // the first reading is no change
}

AccountMonitor::~AccountMonitor() = default;

void AccountMonitor::look() {
    watchNearest();
    AccountReading reading = readAccount(folders_);
    if (reading == reading_)
        return;
    reading_ = std::move(reading);
    logReading(reading_);
    if (changed_)
        changed_();
}

void AccountMonitor::watchNearest() {
    const auto lookAgain = [this, alive = std::weak_ptr(alive_)] {
        if (!alive.expired())
            look();
    };
    // The folder may come between looking for it and watching the one above it.
    for (std::string nearest = nearestFolder(accountFolder(folders_));
         nearest != watched_ || !watch_; nearest = nearestFolder(accountFolder(folders_))) {
        watched_ = nearest;
        watch_ =
            watcher_.watch(Url::file(nearest, true), main_,
                           [this, lookAgain, alive = std::weak_ptr(alive_)](const auto& changes) {
                               if (alive.expired())
                                   return;
                               for (const DirectoryChange& change : changes)
                                   if (change.kind == DirectoryChange::Kind::folderGone)
                                       watched_.clear(); // one of the same name is another folder
                               lookAgain();
                           });
        if (!watch_) {
            poll_ = main_.timer(pollInterval, lookAgain);
            return;
        }
    }
}

} // namespace platform
