#pragma once

#include "platform/base/Result.h"

#include <cstdint>
#include <string>
#include <string_view>

namespace pelmora {

/// The folder in which the sample grows. The first failure is kept and ends all further work.
class SampleFolder {
public:
    explicit SampleFolder(std::string root) : root_(std::move(root)) {}

    /// Makes missing folders; answers the absolute path.
    std::string write(std::string_view path, std::string_view content);
    std::string makeFolder(std::string_view path);
    /// A file of zeros that takes no room.
    void writeSparse(std::string_view path, std::uint64_t size);

    void tag(std::string_view path, std::string_view tags);
    /// "owner" or "participant".
    void share(std::string_view path, std::string_view role);
    /// Sets when the item was changed last.
    void date(std::string_view path, int year, int month, int day);

    const platform::Failure& failure() const { return failure_; }
    std::string absolute(std::string_view path) const { return root_ + '/' + std::string(path); }

private:
    void setAttribute(std::string_view path, const char* name, std::string_view value);

    std::string root_;
    platform::Failure failure_;
};

} // namespace pelmora
