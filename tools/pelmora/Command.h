#pragma once

#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace pelmora {

/// How a command ends, for scripts; docs/store.md lists them.
enum ExitCode {
    done = 0,
    failed = 1,
    badUsage = 2,
    noAccount = 3,
    storeInUse = 4,
    interrupted = 130,
};

/// One word of the command line behind the program's name.
struct Command {
    std::string_view name;
    std::string_view usage;
    std::string_view help;
    int (*run)(const std::vector<std::string>& arguments);
};

/// One line to standard error: what went wrong.
void complain(std::string_view message);
/// The same, with the command's usage behind it; answers badUsage.
int usageFault(std::string_view command, std::string_view message);

int signIn(const std::vector<std::string>& arguments);
int listAccounts(const std::vector<std::string>& arguments);
int useStoredAccount(const std::vector<std::string>& arguments);
int signOut(const std::vector<std::string>& arguments);
int showStatus(const std::vector<std::string>& arguments);
int listItems(const std::vector<std::string>& arguments);
int refresh(const std::vector<std::string>& arguments);
int download(const std::vector<std::string>& arguments);
int tagItem(const std::vector<std::string>& arguments);
int tags(const std::vector<std::string>& arguments);
int synchronize(const std::vector<std::string>& arguments);
int evict(const std::vector<std::string>& arguments);
int listConflicts(const std::vector<std::string>& arguments);
int listKept(const std::vector<std::string>& arguments);
int makeSample(const std::vector<std::string>& arguments);

std::span<const Command> commands();

} // namespace pelmora
