#pragma once

#include <map>
#include <set>
#include <string>
#include <vector>

namespace test {

/// What the program's sources ask of the text table.
struct SourceKeys {
    /// Every key with the file that asks for it.
    std::map<std::string, std::string> files;
    /// Files that ask for a key that is no literal: the table or the function from which it comes
    /// must be known to readSourceKeys().
    std::set<std::string> indirect;
    /// Tables of keys that are no longer where they were.
    std::vector<std::string> lost;
};

/// Reads the folders of the product and the platform below `root`.
SourceKeys readSourceKeys(const std::string& root);

/// One entry of a translation file: its forms, one unless the entry is a plural.
using Translations = std::map<std::string, std::vector<std::string>>;
Translations readTranslations(const std::string& file);

} // namespace test
