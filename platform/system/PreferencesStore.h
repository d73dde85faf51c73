#pragma once

#include "platform/base/Value.h"

#include <memory>
#include <string>
#include <string_view>

namespace platform {

enum class PreferencesUser { current, any };
enum class PreferencesHost { current, any };

/// Where preferences are addressed: application, user, host and the container's path map to one
/// file, whichever process asks.
struct PreferencesDomain {
    std::string application;
    PreferencesUser user = PreferencesUser::current;
    PreferencesHost host = PreferencesHost::any;
    /// The application's data container; "" for the standard place.
    std::string containerPath;
    bool operator==(const PreferencesDomain&) const = default;
};

/// Small per-user settings in files of the configuration folder. A value that managed settings give
/// (an administrator's file for the whole machine) wins over the user's. Safe from any thread.
class PreferencesStore {
public:
    virtual ~PreferencesStore() = default;

    /// Writes what was set and reads what others wrote. False when either failed; nothing that was
    /// set is lost then, it is written by the next successful call.
    virtual bool synchronize(const PreferencesDomain& domain) = 0;
    /// None when there is no such key.
    virtual Value value(const PreferencesDomain& domain, std::string_view key) = 0;
    /// A none value removes the key. Kept in memory until synchronize().
    virtual void setValue(const PreferencesDomain& domain, std::string_view key, Value value) = 0;
};

/// Files below `configFolder`, one a domain, written whole or not at all and one process at a time;
/// a damaged one is set aside as "….damaged" and made anew from what is known. `managedFile` holds
/// the administrator's values (may be missing): a JSON object of keys and values for every domain.
std::unique_ptr<PreferencesStore> makeFilePreferences(std::string configFolder,
                                                      std::string managedFile);

/// The application's standard preferences: its own domain, synchronised on every write.
class StandardPreferences {
public:
    explicit StandardPreferences(PreferencesStore& store);
    bool synchronize();
    Value value(std::string_view key);
    /// 0 when the key is absent or no number; a number with decimals is truncated.
    std::int64_t integer(std::string_view key);
    void setValue(std::string_view key, Value value);
    void removeValue(std::string_view key) { setValue(key, {}); }

private:
    PreferencesStore& store_;
    PreferencesDomain domain_;
};

} // namespace platform
