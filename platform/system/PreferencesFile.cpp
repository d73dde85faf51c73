#include "platform/system/PreferencesFile.h"

#include "platform/base/Log.h"
#include "platform/base/Process.h"
#include "platform/files/PathText.h"
#include "platform/system/ValueJson.h"

#include <cerrno>
#include <cstdio>
#include <fcntl.h>
#include <sys/file.h>
#include <sys/stat.h>

namespace platform {
namespace {

/// Far more than settings need; a larger file is none of ours.
constexpr std::uint64_t sizeLimit = 16UL * 1024 * 1024;
constexpr int damagedFilesKept = 100;

/// A file name for any text: nothing in it leads to another folder.
std::string fileNameFor(std::string_view text) {
    std::string name = percentEncoded(text);
    if (name.find_first_not_of('.') == std::string::npos)
        name.insert(0, "%");
    return name;
}

/// FNV-1a: tells containers apart in a file name, the same in every process.
std::string shortDigest(std::string_view text) {
    std::uint64_t hash = 14695981039346656037U;
    for (const char c : text)
        hash = (hash ^ static_cast<unsigned char>(c)) * 1099511628211U;
    char digits[17];
    std::snprintf(digits, sizeof digits, "%016llx", static_cast<unsigned long long>(hash));
    return digits;
}

bool makeFolder(const std::string& path) {
    const std::string folder(folderOf(path));
    if (FileManager::exists(folder))
        return true;
    if (FileManager::createDirectory(Url::file(folder), true))
        return false;
    ::chmod(folder.c_str(), 0700); // what people set is their own business
    return true;
}

bool sameFile(const FileAttributes& a, const FileAttributes& b) {
    return a.identity == b.identity && a.size == b.size && a.modified == b.modified &&
           a.changed == b.changed;
}

} // namespace

std::string preferencesPath(const std::string& configFolder, const PreferencesDomain& domain) {
    std::string path = configFolder + '/' + fileNameFor(domain.application) + "/preferences";
    if (!domain.containerPath.empty())
        path += '-' + shortDigest(Url::file(domain.containerPath).standardized().path());
    if (domain.user == PreferencesUser::any)
        path += "-any-user";
    if (domain.host == PreferencesHost::current)
        path += "-on-" + fileNameFor(hostName().value_or("unknown"));
    return path + ".json";
}

PreferencesFile::Content PreferencesFile::read(Value::Map& out) {
    const Result<FileAttributes> attributes = FileManager::attributes(path_, FollowLinks::yes);
    if (!attributes) {
        known_.reset();
        return attributes.error().is(ErrorCode::noSuchItem) ? Content::missing
                                                            : Content::unreadable;
    }
    if (known_ && sameFile(*known_, *attributes))
        return Content::unchanged;
    const Result<Bytes> content = FileManager::contents(Url::file(path_), sizeLimit);
    if (!content)
        return content.error().is(ErrorCode::noSuchItem) ? Content::missing : Content::unreadable;
    std::optional<Value::Map> values = mapFromJsonText(
        std::string_view(reinterpret_cast<const char*>(content->data()), content->size()));
    if (!values)
        return Content::damaged;
    // Attributes of before the reading: a change in between is read the next time.
    known_ = *attributes;
    out = std::move(*values);
    return Content::read;
}

bool PreferencesFile::write(const Value::Map& values) {
    if (!makeFolder(path_))
        return false;
    if (const Failure failure =
            FileManager::writeAtomically(Url::file(path_), jsonTextFromMap(values), 0600)) {
        platformLogLater(LogLevel::error, "Cannot write the preferences %@: %@", path_, *failure);
        return false;
    }
    known_.reset(); // whoever edits the file by hand right now is read the next time
    return true;
}

bool PreferencesFile::setAside() {
    for (int i = 1; i <= damagedFilesKept; ++i) {
        const std::string target = path_ + ".damaged" + (i == 1 ? "" : '-' + std::to_string(i));
        const Failure failure = FileManager::moveItem(Url::file(path_), Url::file(target));
        if (failure && failure->is(ErrorCode::fileExists))
            continue;
        if (failure)
            break;
        platformLogLater(LogLevel::error, "The preferences %@ are damaged and were set aside as %@",
                         path_, target);
        return true;
    }
    platformLogLater(LogLevel::error, "The preferences %@ are damaged", path_);
    return false;
}

PreferencesLock::PreferencesLock(const std::string& path) {
    if (!makeFolder(path))
        return;
    descriptor_ = ::open(PathText(path + ".lock").c_str(), O_RDWR | O_CREAT | O_CLOEXEC, 0600);
    while (descriptor_ >= 0 && ::flock(descriptor_, LOCK_EX) != 0 && errno == EINTR) {
    }
}

PreferencesLock::~PreferencesLock() {
    if (descriptor_ >= 0)
        ::close(descriptor_);
}

} // namespace platform
