#pragma once

#include <map>
#include <string>
#include <string_view>
#include <vector>

namespace platform {

/// One list of associations: which applications open which types, by the choice of the user, of the
/// administrator or of the distribution. Identifiers are without ".desktop". A value.
class MimeAppsList {
public:
    static MimeAppsList parse(std::string_view text);

    enum class Kind { defaults, added, removed };
    /// The identifiers for a type that goes by these names, in the list's order.
    std::vector<std::string> applications(Kind kind,
                                          const std::vector<std::string>& typeNames) const;

private:
    using Associations = std::map<std::string, std::vector<std::string>, std::less<>>;
    std::map<Kind, Associations> associations_;
};

} // namespace platform
