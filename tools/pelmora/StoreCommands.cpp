#include "platform/base/DateFormat.h"
#include "tools/pelmora/Command.h"
#include "tools/pelmora/Downloader.h"
#include "tools/pelmora/ItemList.h"
#include "tools/pelmora/Session.h"

#include <cstdio>

namespace pelmora {
namespace {

using namespace platform;

void printStatus(const AccountSummary& account, const CloudStatus& status,
                 const std::optional<std::string>& problem) {
    std::printf("Account:   %s\n", account.name.c_str());
    std::printf("Kind:      %s\n", account.kind.c_str());
    std::printf("Address:   %s\n", account.address.c_str());
    std::printf("Store:     %s/Shelfroot\n", status.folder.c_str());
    std::printf("Documents: %lld in %lld folders, %s\n", static_cast<long long>(status.files),
                static_cast<long long>(status.folders), sizeText(status.bytes).c_str());
    std::printf("On device: %lld\n", static_cast<long long>(status.files - status.promises));
    if (status.refused > 0)
        std::printf("Left out:  %lld that this device cannot hold\n",
                    static_cast<long long>(status.refused));
    if (problem)
        std::printf("Problem:   %s\n", problem->c_str());
    if (status.question)
        std::printf("Question:  %lld items have vanished from %s; see \"pelmora sync --help\"\n",
                    static_cast<long long>(status.question->items),
                    status.question->side == Side::local ? "this device" : "the account");
    std::printf("State:     %s\n", status.listed ? "read" : "not read to the end yet");
}

/// A store that nobody has read yet is read now.
std::optional<int> readFirst() {
    Session session(Session::Purpose::change);
    if (const std::optional<int> code = session.complaint())
        return code;
    return session.bringIn();
}

bool wasRead() {
    Session session(Session::Purpose::look);
    const std::optional<CloudStatus> status = session.cloud().status();
    return status && status->listed;
}

} // namespace

int showStatus(const std::vector<std::string>& arguments) {
    if (!arguments.empty())
        return usageFault("status", "status takes no arguments");
    Session session(Session::Purpose::look);
    const std::optional<AccountSummary> account = session.cloud().accounts().account();
    if (!account) {
        complain(session.cloud().accounts().problem().value_or("nobody is signed in"));
        return noAccount;
    }
    const std::optional<CloudStatus> status = session.cloud().status();
    const std::optional<std::string> problem = session.cloud().accounts().problem();
    if (status)
        printStatus(*account, *status, problem);
    else
        std::printf("Account:   %s\nKind:      %s\nAddress:   %s\nStore:     %s\n",
                    account->name.c_str(), account->kind.c_str(), account->address.c_str(),
                    problem.value_or("not set up yet").c_str());
    return done;
}

int listItems(const std::vector<std::string>& arguments) {
    if (arguments.size() > 1)
        return usageFault("ls", "ls takes one path");
    if (!wasRead())
        if (const std::optional<int> code = readFirst())
            return *code;
    Session session(Session::Purpose::look);
    if (const std::optional<int> code = session.complaint())
        return *code;
    const Url url = session.urlOf(arguments.empty() ? "" : arguments.front());
    const Result<std::vector<ListedItem>> items = itemsAt(session.cloud().documents(), url);
    if (!items)
        return complainOf(items.error());
    for (const ListedItem& item : *items)
        std::printf("%c %10s  %-18s %s%s\n", item.promised ? '-' : ' ',
                    item.size ? sizeText(*item.size).c_str() : "",
                    item.modified ? localizedDateText(*item.modified, DateStyle::shortStyle).c_str()
                                  : "",
                    item.name.c_str(), item.folder ? "/" : "");
    return done;
}

int refresh(const std::vector<std::string>& arguments) {
    if (arguments.size() > 1)
        return usageFault("refresh", "refresh takes one path");
    Session session(Session::Purpose::change);
    if (const std::optional<int> code = session.complaint())
        return *code;
    std::optional<Url> folder;
    if (!arguments.empty())
        folder = session.urlOf(arguments.front());
    if (const Failure failure = refreshAndWait(session.cloud(), folder))
        return complainOf(*failure);
    return done;
}

int download(const std::vector<std::string>& arguments) {
    if (arguments.empty())
        return usageFault("download", "download wants a path");
    Session session(Session::Purpose::change);
    if (const std::optional<int> code = session.complaint())
        return *code;
    if (const std::optional<int> code = session.bringIn())
        return *code;
    Downloader downloader(session);
    int result = done;
    for (const std::string& path : arguments) {
        if (const Failure failure = downloader.fetch(session.urlOf(path)))
            result = complainOf(*failure);
        if (session.interruptedByUser())
            return interrupted;
    }
    return result;
}

} // namespace pelmora
