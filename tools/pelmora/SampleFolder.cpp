#include "tools/pelmora/SampleFolder.h"

#include "platform/files/FileDescriptor.h"
#include "platform/files/FileManager.h"
#include "platform/files/PathText.h"

#include <cerrno>
#include <ctime>
#include <fcntl.h>
#include <sys/stat.h>

namespace pelmora {

using namespace platform;

std::string SampleFolder::makeFolder(std::string_view path) {
    std::string full = absolute(path);
    if (!failure_)
        failure_ = FileManager::createDirectory(Url::file(full), true);
    return full;
}

std::string SampleFolder::write(std::string_view path, std::string_view content) {
    std::string full = absolute(path);
    if (!failure_)
        failure_ = FileManager::createDirectory(Url::file(folderOf(full)), true);
    if (!failure_)
        failure_ = FileManager::writeAtomically(Url::file(full), content);
    return full;
}

void SampleFolder::writeSparse(std::string_view path, std::uint64_t size) {
    const std::string full = write(path, "");
    if (!failure_ && truncate(full.c_str(), static_cast<off_t>(size)) != 0)
        failure_ = posixError(errno, Url::file(full), true);
}

void SampleFolder::setAttribute(std::string_view path, const char* name, std::string_view value) {
    const Failure failure = setExtendedAttribute(Url::file(absolute(path)), name, value);
    // A disk without attributes has a sample without tags and shared items.
    if (failure && !failure->is(ErrorCode::unsupportedOperation) && !failure_)
        failure_ = failure;
}

void SampleFolder::tag(std::string_view path, std::string_view tags) {
    setAttribute(path, "user.xdg.tags", tags);
}

void SampleFolder::share(std::string_view path, std::string_view role) {
    setAttribute(path, "user.pelmora.shared", role);
}

void SampleFolder::date(std::string_view path, int year, int month, int day) {
    std::tm time{};
    time.tm_year = year - 1900;
    time.tm_mon = month - 1;
    time.tm_mday = day;
    time.tm_hour = 8 + day % 11;
    time.tm_min = day * 7 % 60;
    timespec times[2] = {};
    times[0].tv_nsec = UTIME_OMIT;
    times[1].tv_sec = timegm(&time);
    const std::string full = absolute(path);
    if (!failure_ && utimensat(AT_FDCWD, full.c_str(), times, 0) != 0)
        failure_ = posixError(errno, Url::file(full), true);
}

} // namespace pelmora
