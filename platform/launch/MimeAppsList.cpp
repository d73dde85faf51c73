#include "platform/launch/MimeAppsList.h"

#include "platform/launch/KeyFile.h"

namespace platform {

MimeAppsList MimeAppsList::parse(std::string_view text) {
    constexpr std::string_view suffix = ".desktop";
    MimeAppsList list;
    const KeyFile file = KeyFile::parse(text);
    for (const auto& [kind, name] : {std::pair(Kind::defaults, "Default Applications"),
                                     std::pair(Kind::added, "Added Associations"),
                                     std::pair(Kind::removed, "Removed Associations")}) {
        const KeyFile::Group* const group = file.group(name);
        if (!group)
            continue;
        for (const auto& [type, value] : *group)
            for (std::string& id : KeyFile::list(*group, type))
                if (id.size() > suffix.size() && id.ends_with(suffix))
                    list.associations_[kind][type].push_back(
                        id.substr(0, id.size() - suffix.size()));
    }
    return list;
}

std::vector<std::string>
MimeAppsList::applications(Kind kind, const std::vector<std::string>& typeNames) const {
    std::vector<std::string> ids;
    const auto associations = associations_.find(kind);
    if (associations == associations_.end())
        return ids;
    for (const std::string& name : typeNames)
        if (const auto found = associations->second.find(name); found != associations->second.end())
            ids.insert(ids.end(), found->second.begin(), found->second.end());
    return ids;
}

} // namespace platform
