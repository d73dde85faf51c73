#include "platform/system/CallerIdentity.h"

#include "platform/files/PathText.h"
#include "platform/system/PeerProcess.h"
#include "platform/system/SourceApplications.h"

#include <array>
#include <climits>

namespace platform {
namespace {

constexpr std::string_view openerName = "/tavrin-open";
constexpr std::string_view testRunnerName = "/tavrin-test-runner";

bool isSameFile(const struct stat& a, const struct stat& b) {
    return a.st_dev == b.st_dev && a.st_ino == b.st_ino;
}

/// Whoever may write the file may write this program's own as well, and could as easily have
/// changed what is decided here.
bool isAsSafeAsThisProgram(const struct stat& file) {
    struct stat own {};
    if (::stat("/proc/self/exe", &own) != 0 || !S_ISREG(file.st_mode))
        return false;
    if (file.st_uid != own.st_uid || (file.st_mode & S_IWOTH) != 0)
        return false;
    return (file.st_mode & S_IWGRP) == 0 ||
           ((own.st_mode & S_IWGRP) != 0 && own.st_gid == file.st_gid);
}

bool runs(const PeerProcess::Executable& executable, const std::string& known) {
    struct stat installed {};
    return !known.empty() && ::stat(PathText(known).c_str(), &installed) == 0 &&
           isSameFile(executable.file, installed) && isAsSafeAsThisProgram(installed);
}

} // namespace

KnownCallers KnownCallers::besideThisProgram() {
    const std::string own = executablePath();
    if (own.empty())
        return {};
    const std::string folder(folderOf(own));
    return {std::string(folder).append(openerName), std::string(folder).append(testRunnerName)};
}

std::string executablePath() {
    std::array<char, PATH_MAX> path{};
    const ssize_t length = ::readlink("/proc/self/exe", path.data(), path.size());
    return length > 0 ? std::string(path.data(), static_cast<std::size_t>(length)) : std::string();
}

std::optional<std::string> identityOf(const PeerProcess& process, const KnownCallers& callers) {
    const std::optional<PeerProcess::Executable> executable = process.executable();
    if (!executable)
        return std::nullopt;
    if (runs(*executable, callers.opener))
        return std::string(homeScreenApplicationIdentifier);
    if (runs(*executable, callers.testRunner))
        return std::string(testRunnerApplicationIdentifier);
    return executable->path;
}

} // namespace platform
