#pragma once

#include <optional>
#include <string>
#include <string_view>
#include <unordered_set>
#include <vector>

namespace platform {

/// Which part of a file name its type depends on, by the MIME database's own list of patterns: a
/// folder of 100,000 pictures then asks the database once. Immutable.
class TypeNameRules {
public:
    static const TypeNameRules& shared();

    /// The end of the name that decides (".tar.gz"): equal ends have equal types. None when the
    /// whole name has to be looked at.
    std::optional<std::string_view> decidingEnd(std::string_view name) const;

private:
    TypeNameRules();
    void readPatterns(const std::string& path);

    bool known_ = false;
    /// In lower case: ends with several dots, whole names, and what is neither.
    std::unordered_set<std::string> longEnds_;
    std::unordered_set<std::string> wholeNames_;
    std::vector<std::string> otherPatterns_;
};

/// ASCII letters only; other bytes stay.
std::string lowercase(std::string_view text);

} // namespace platform
