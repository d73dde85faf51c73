#include "platform/launch/ApplicationDatabase.h"

#include "platform/base/Identity.h"
#include "platform/launch/ApplicationFolders.h"
#include "platform/launch/TypeRegistry.h"

#include <QMimeDatabase>
#include <QMimeType>

#include <algorithm>
#include <set>

namespace platform {
namespace {

using Entry = ApplicationDatabase::Entry;
using Names = std::vector<std::string>;

constexpr std::string_view anything = "application/octet-stream";

Names namesOf(const QMimeType& type) {
    Names names{type.name().toStdString()};
    for (const QString& alias : type.aliases())
        names.push_back(alias.toStdString());
    return names;
}

/// A packed container tells how such a type is stored, not what it is.
bool isMerelyStorage(const std::string& parent, const QMimeType& type) {
    const std::string identifier = TypeRegistry::identifierForMimeType(type.name().toStdString());
    return TypeRegistry::conformsTo(TypeRegistry::identifierForMimeType(parent), types::archive) &&
           !TypeRegistry::conformsTo(identifier, types::archive);
}

/// The type by all its names, then what it is a kind of, from the near to the far.
std::vector<Names> typesToTry(std::string_view mimeType) {
    const QMimeType type = QMimeDatabase().mimeTypeForName(
        QString::fromUtf8(mimeType.data(), static_cast<qsizetype>(mimeType.size())));
    if (!type.isValid())
        return {{std::string(mimeType)}};
    std::vector<Names> out{namesOf(type)};
    for (const QString& ancestor : type.allAncestors()) {
        const std::string name = ancestor.toStdString();
        if (name != anything && !isMerelyStorage(name, type))
            out.push_back(namesOf(QMimeDatabase().mimeTypeForName(ancestor)));
    }
    return out;
}

bool isOurselves(const DesktopEntry& entry) {
    return entry.id == applicationIdentifier;
}

} // namespace

struct ApplicationDatabase::State {
    ApplicationPlaces places;
    std::vector<ApplicationFile> files;
    std::vector<ApplicationLevel> levels;

    /// The first of that name counts, also when it hides those that come later.
    Entry find(const std::string& id) const {
        for (const ApplicationLevel& level : levels)
            if (const auto found = level.entries.find(id); found != level.entries.end())
                return found->second;
        return nullptr;
    }

    std::vector<Entry> associated(const Names& type) const;
    Entry chosen(const Names& type, const std::vector<Entry>& associated) const;
};

/// Who takes the type, the preferred first, also those that cannot run (which takes looking). What
/// a list adds or removes concerns the applications of its own folder and of those that come later.
std::vector<Entry> ApplicationDatabase::State::associated(const Names& type) const {
    using enum MimeAppsList::Kind;
    std::vector<Entry> out;
    std::set<std::string> settled;
    const auto add = [&](const std::string& id) {
        if (!settled.insert(id).second)
            return;
        if (Entry entry = find(id))
            out.push_back(std::move(entry));
    };
    for (const ApplicationLevel& level : levels) {
        for (const std::string& id : level.list.applications(added, type))
            add(id);
        for (const std::string& id : level.list.applications(removed, type))
            settled.insert(id);
        for (const auto& [id, entry] : level.entries)
            if (entry->takes(type))
                add(id);
        for (const auto& [id, entry] : level.entries)
            settled.insert(id);
    }
    return out;
}

Entry ApplicationDatabase::State::chosen(const Names& type,
                                         const std::vector<Entry>& associated) const {
    const auto firstOf = [&](const MimeAppsList& list) -> Entry {
        for (const std::string& id : list.applications(MimeAppsList::Kind::defaults, type))
            if (const auto found = std::ranges::find(associated, id, &DesktopEntry::id);
                found != associated.end() && (*found)->canRun())
                return *found;
        return nullptr;
    };
    for (const ApplicationLevel& level : levels) {
        for (const MimeAppsList& list : level.desktopLists)
            if (Entry entry = firstOf(list))
                return entry;
        if (Entry entry = firstOf(level.list))
            return entry;
    }
    return nullptr;
}

ApplicationDatabase::ApplicationDatabase() : state_(std::make_unique<State>()) {
}

ApplicationDatabase::~ApplicationDatabase() = default;

ApplicationDatabase& ApplicationDatabase::shared() {
    static ApplicationDatabase database;
    return database;
}

const ApplicationDatabase::State& ApplicationDatabase::upToDate() {
    ApplicationPlaces places = ApplicationPlaces::current();
    std::vector<ApplicationFile> files = applicationFiles(places);
    if (places != state_->places || files != state_->files) {
        state_->levels = readLevels(places, files);
        state_->places = std::move(places);
        state_->files = std::move(files);
    }
    return *state_;
}

Entry ApplicationDatabase::defaultFor(std::string_view mimeType) {
    const State& state = upToDate();
    Entry ourselves;
    for (const Names& type : typesToTry(mimeType)) {
        const std::vector<Entry> associated = state.associated(type);
        if (Entry entry = state.chosen(type, associated))
            return entry;
        for (const Entry& entry : associated) {
            if (!entry->isFor(state.places.desktops) || !entry->canRun())
                continue;
            if (!isOurselves(*entry))
                return entry;
            ourselves = entry;
        }
    }
    return ourselves;
}

std::vector<Entry> ApplicationDatabase::applicationsFor(std::string_view mimeType) {
    const Entry first = defaultFor(mimeType);
    std::vector<Entry> out;
    if (first && !isOurselves(*first))
        out.push_back(first);
    for (const Names& type : typesToTry(mimeType))
        for (const Entry& entry : state_->associated(type))
            if (!entry->noDisplay && entry->isFor(state_->places.desktops) &&
                !isOurselves(*entry) && std::ranges::find(out, entry) == out.end() &&
                entry->canRun())
                out.push_back(entry);
    return out;
}

Entry ApplicationDatabase::handlerOfScheme(std::string_view scheme) {
    return defaultFor("x-scheme-handler/" + std::string(scheme));
}

} // namespace platform
