#pragma once

#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// The format of desktop entries and of the lists of associations: groups of keys with values, a
/// key perhaps in several languages. Reading never fails: a line that says nothing is passed over,
/// and of a key given twice the later one counts. A value.
class KeyFile {
public:
    using Group = std::map<std::string, std::string, std::less<>>;

    static KeyFile parse(std::string_view text);

    /// The keys with their values as they are written; none when there is no such group.
    const Group* group(std::string_view name) const;

    /// A value with its escapes undone; none when the key is not there.
    static std::optional<std::string> text(const Group& group, std::string_view key);
    /// The same in the first of the locales that the key has, else as it stands without one.
    static std::optional<std::string> localizedText(const Group& group, const std::string& key,
                                                    const std::vector<std::string>& locales);
    static bool flag(const Group& group, std::string_view key);
    /// The parts of a list, which semicolons separate.
    static std::vector<std::string> list(const Group& group, std::string_view key);

private:
    std::map<std::string, Group, std::less<>> groups_;
};

/// The names under which a key may have the texts of a locale such as "sr_RS.UTF-8@latin", best
/// first; none for "C".
std::vector<std::string> localeNames(std::string_view locale);

} // namespace platform
