#include "platform/cloud/CloudDocumentService.h"
#include "platform/files/FileManager.h"
#include "tools/pelmora/Command.h"
#include "tools/pelmora/Session.h"

#include <algorithm>
#include <cstdio>
#include <future>

namespace pelmora {
namespace {

using namespace platform;

Failure syncAndWait(CloudService& cloud) {
    std::promise<Failure> ended;
    cloud.sync([&](const Failure& failure) { ended.set_value(failure); });
    return ended.get_future().get();
}

int tellQuestion(const DeletionQuestion& question) {
    const bool here = question.side == Side::local;
    complain(std::to_string(question.items) + " items have vanished from " +
             (here ? "this device" : "the account") +
             "; nothing was changed. Say \"pelmora sync --delete\" to delete them on " +
             (here ? "the account" : "this device") +
             " as well, or \"pelmora sync --put-back\" to bring them back" +
             (question.lost == 0 ? "" : "; " + std::to_string(question.lost) +
                                            " of them have no copy here and cannot come back"));
    return failed;
}

int tellPending(CloudService& cloud) {
    int result = done;
    for (const PendingWork& work : cloud.pending()) {
        complain(work.path + ": " + work.cause);
        result = failed;
    }
    return result;
}

/// Every file below the folder, as a path relative to the one above.
void printFiles(const std::string& folder, const std::string& shown) {
    const Result<std::vector<DirectoryEntry>> entries = FileManager::entries(folder);
    if (!entries)
        return;
    std::vector<DirectoryEntry> sorted = *entries;
    std::sort(sorted.begin(), sorted.end(),
              [](const DirectoryEntry& a, const DirectoryEntry& b) { return a.name < b.name; });
    for (const DirectoryEntry& entry : sorted)
        if (entry.kind == FileKind::directory)
            printFiles(folder + '/' + entry.name, shown + entry.name + '/');
        else
            std::printf("%s%s\n", shown.c_str(), entry.name.c_str());
}

} // namespace

int synchronize(const std::vector<std::string>& arguments) {
    std::optional<DeletionAnswer> answer;
    for (const std::string& argument : arguments) {
        if (answer || (argument != "--delete" && argument != "--put-back"))
            return usageFault("sync", "sync does not know “" + argument + "”");
        answer = argument == "--delete" ? DeletionAnswer::deleteThem : DeletionAnswer::putBack;
    }
    Session session(Session::Purpose::change);
    if (const std::optional<int> code = session.complaint())
        return *code;
    if (answer)
        if (const Failure failure = session.cloud().answer(*answer))
            return complainOf(*failure);
    const Failure failure = syncAndWait(session.cloud());
    const int result = failure ? complainOf(*failure) : done;
    const std::optional<CloudStatus> status = session.cloud().status();
    if (status && status->question)
        return tellQuestion(*status->question);
    const int pending = tellPending(session.cloud());
    return result == done ? pending : result;
}

int evict(const std::vector<std::string>& arguments) {
    if (arguments.empty())
        return usageFault("evict", "evict wants a path");
    Session session(Session::Purpose::change);
    if (const std::optional<int> code = session.complaint())
        return *code;
    if (const std::optional<int> code = session.bringIn())
        return *code;
    int result = done;
    for (const std::string& path : arguments)
        if (const Failure failure = session.cloud().documents().evictItem(session.urlOf(path)))
            result = complainOf(*failure);
    return result;
}

int listConflicts(const std::vector<std::string>& arguments) {
    if (!arguments.empty())
        return usageFault("conflicts", "conflicts takes no arguments");
    Session session(Session::Purpose::look);
    if (const std::optional<int> code = session.complaint())
        return *code;
    for (const std::string& path : session.cloud().conflicts())
        std::printf("%s\n", path.c_str());
    return done;
}

int listKept(const std::vector<std::string>& arguments) {
    if (!arguments.empty())
        return usageFault("kept", "kept takes no arguments");
    Session session(Session::Purpose::look);
    if (const std::optional<int> code = session.complaint())
        return *code;
    const std::optional<CloudStatus> status = session.cloud().status();
    if (!status)
        return done;
    const std::string folder = status->folder + "/kept";
    std::printf("%s:\n", folder.c_str());
    printFiles(folder, "");
    return done;
}

} // namespace pelmora
