#include "platform/system/PreferencesStore.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/system/PreferencesFile.h"

#include <map>
#include <mutex>

namespace platform {
namespace {

class FilePreferences final : public PreferencesStore {
public:
    FilePreferences(std::string configFolder, std::string managedFile)
        : configFolder_(std::move(configFolder)), managed_(std::move(managedFile)) {}

    bool synchronize(const PreferencesDomain& domain) override {
        const std::lock_guard lock(mutex_);
        readManaged();
        return synchronize(stateOf(domain));
    }

    Value value(const PreferencesDomain& domain, std::string_view key) override {
        const std::lock_guard lock(mutex_);
        State& state = stateOf(domain);
        for (const Value::Map* map : {&managed_.values, &state.unwritten, &state.stored.values})
            if (const auto found = map->find(key); found != map->end())
                return found->second;
        return {};
    }

    void setValue(const PreferencesDomain& domain, std::string_view key, Value value) override {
        const std::lock_guard lock(mutex_);
        stateOf(domain).unwritten.insert_or_assign(std::string(key), std::move(value));
    }

private:
    using Content = PreferencesFile::Content;

    struct Stored {
        explicit Stored(std::string path) : file(std::move(path)) {}
        PreferencesFile file;
        Value::Map values;
    };
    struct State {
        explicit State(std::string path) : stored(std::move(path)) {}
        Stored stored;
        /// Set since the last successful write; a none value removes its key.
        Value::Map unwritten;
    };

    /// A domain that nobody asked for before is read.
    State& stateOf(const PreferencesDomain& domain) {
        std::string path = preferencesPath(configFolder_, domain);
        const auto found = states_.find(path);
        if (found != states_.end())
            return found->second;
        if (states_.empty())
            readManaged();
        State& state = states_.try_emplace(path, path).first->second;
        readStored(state.stored);
        return state;
    }

    static Content readStored(Stored& stored) {
        const Content content = stored.file.read(stored.values);
        if (content == Content::missing)
            stored.values.clear();
        return content;
    }

    void readManaged() {
        // A damaged or unreadable file leaves what the administrator had set before.
        const Content content = readStored(managed_);
        const bool bad = content == Content::damaged || content == Content::unreadable;
        if (bad && !managedIsBad_)
            platformLogLater(LogLevel::error, "The managed settings %@ cannot be read",
                             managed_.file.path());
        managedIsBad_ = bad;
    }

    static bool synchronize(State& state) {
        if (state.unwritten.empty()) {
            const Content content = readStored(state.stored);
            if (content != Content::damaged)
                return content != Content::unreadable;
        }
        const PreferencesLock lock(state.stored.file.path());
        if (!lock) {
            platformLogLater(LogLevel::error, "Cannot lock the preferences %@",
                             state.stored.file.path());
            return false;
        }
        // Read under the lock: what other processes wrote stays, but for the keys that were set.
        // Of a damaged file, what was read of it before stays.
        const Content content = readStored(state.stored);
        if (content == Content::unreadable)
            return false;
        if (content == Content::damaged && !state.stored.file.setAside())
            return false;
        Value::Map values = state.stored.values;
        for (const auto& [key, value] : state.unwritten) {
            if (value.isNone())
                values.erase(key);
            else
                values.insert_or_assign(key, value);
        }
        const bool changed = values != state.stored.values || content == Content::damaged;
        if (changed && !state.stored.file.write(values))
            return false;
        state.stored.values = std::move(values);
        state.unwritten.clear();
        return true;
    }

    std::string configFolder_;
    std::mutex mutex_;
    Stored managed_;
    bool managedIsBad_ = false;
    std::map<std::string, State> states_;
};

} // namespace

std::unique_ptr<PreferencesStore> makeFilePreferences(std::string configFolder,
                                                      std::string managedFile) {
    return std::make_unique<FilePreferences>(std::move(configFolder), std::move(managedFile));
}

StandardPreferences::StandardPreferences(PreferencesStore& store) : store_(store) {
    domain_.application = applicationIdentifier;
}

bool StandardPreferences::synchronize() {
    return store_.synchronize(domain_);
}

Value StandardPreferences::value(std::string_view key) {
    return store_.value(domain_, key);
}

std::int64_t StandardPreferences::integer(std::string_view key) {
    return value(key).integer().value_or(0);
}

void StandardPreferences::setValue(std::string_view key, Value value) {
    store_.setValue(domain_, key, std::move(value));
    synchronize(); // where that fails, it has been logged and the next one writes the value
}

} // namespace platform
