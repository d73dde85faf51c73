#include "platform/system/Keyring.h"

#include "platform/base/Identity.h"
#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/system/BusConnection.h"

#include <libsecret/secret.h>

#include <condition_variable>
#include <cstring>
#include <dlfcn.h>
#include <functional>
#include <memory>
#include <mutex>
#include <thread>

namespace platform {
namespace {

constexpr const char* secretService = "org.freedesktop.secrets";
constexpr const char* libraryName = "libsecret-1.so.0";
constexpr const char* accountAttribute = "account";
constexpr Duration busPatience = std::chrono::seconds(3);

/// The library's functions; those of the libraries below it are found through it.
struct SecretLibrary {
    void* handle = ::dlopen(libraryName, RTLD_NOW | RTLD_LOCAL);
    decltype(&secret_password_lookup_sync) lookUp = nullptr;
    decltype(&secret_password_store_sync) store = nullptr;
    decltype(&secret_password_clear_sync) clear = nullptr;
    decltype(&secret_password_free) freePassword = nullptr;
    decltype(&g_bus_get_sync) sessionBus = nullptr;
    decltype(&g_dbus_connection_set_exit_on_close) setExitOnClose = nullptr;
    decltype(&g_cancellable_new) newCancellable = nullptr;
    decltype(&g_cancellable_cancel) cancel = nullptr;
    decltype(&g_object_unref) unref = nullptr;
    decltype(&g_error_free) freeError = nullptr;

    SecretLibrary() {
        const bool whole = find(lookUp, "secret_password_lookup_sync") &&
                           find(store, "secret_password_store_sync") &&
                           find(clear, "secret_password_clear_sync") &&
                           find(freePassword, "secret_password_free") &&
                           find(sessionBus, "g_bus_get_sync") &&
                           find(setExitOnClose, "g_dbus_connection_set_exit_on_close") &&
                           find(newCancellable, "g_cancellable_new") &&
                           find(cancel, "g_cancellable_cancel") &&
                           find(unref, "g_object_unref") && find(freeError, "g_error_free");
        if (!whole)
            handle = nullptr;
    }
    template<class Function>
    bool find(Function& function, const char* name) const {
        void* const address = handle ? ::dlsym(handle, name) : nullptr;
        std::memcpy(&function, &address, sizeof(address));
        return address != nullptr;
    }
    static const SecretLibrary& shared() {
        static const SecretLibrary library;
        return library;
    }
};

/// Only items of this schema are looked for, so that another program's are never taken for ours.
const SecretSchema& schema() {
    static const SecretSchema passwords = [] {
        SecretSchema made{};
        made.name = "com.pelmora.Tavrin.Account";
        made.flags = SECRET_SCHEMA_NONE;
        made.attributes[0] = {accountAttribute, SECRET_SCHEMA_ATTRIBUTE_STRING};
        return made;
    }();
    return passwords;
}

/// What one call shares with the thread that it runs on, which may outlive the caller's patience.
struct KeyringCall {
    std::mutex mutex;
    std::condition_variable ended;
    bool done = false;                 // guarded by mutex, as are the next two
    std::optional<std::string> answer; // of a look-up
    std::optional<std::string> fault;  // in the library's words
    std::string account;
    std::string label;
    std::string secret;
    GCancellable* cancellable = SecretLibrary::shared().newCancellable();
    ~KeyringCall() { SecretLibrary::shared().unref(cancellable); }
};
using Work = std::function<void(KeyringCall& call, const SecretLibrary& library, GError** error)>;

/// A bus that goes away must not take the program with it, as the library would have it.
void outliveBus(const SecretLibrary& library, KeyringCall& call, GError** error) {
    if (GDBusConnection* const bus =
            library.sessionBus(G_BUS_TYPE_SESSION, call.cancellable, error)) {
        library.setExitOnClose(bus, 0);
        library.unref(bus);
    }
}

void runCall(const std::shared_ptr<KeyringCall>& call, const Work& work) {
    const SecretLibrary& library = SecretLibrary::shared();
    GError* error = nullptr;
    outliveBus(library, *call, &error);
    if (!error)
        work(*call, library, &error);
    const std::lock_guard lock(call->mutex);
    if (error) {
        call->fault = error->message ? error->message : "";
        library.freeError(error);
    }
    call->done = true;
    call->ended.notify_all();
}

Failure perform(const std::shared_ptr<KeyringCall>& call, Duration patience, Work work) {
    std::thread([call, work = std::move(work)] { runCall(call, work); }).detach();
    std::unique_lock lock(call->mutex);
    if (!call->ended.wait_for(lock, patience, [&] { return call->done; })) {
        SecretLibrary::shared().cancel(call->cancellable);
        return makeErrorWithText(ErrorCode::timedOut,
                                 localized("The keyring does not answer. Unlock it, or restart its "
                                           "service, and try again."));
    }
    if (!call->fault)
        return std::nullopt;
    platformLog(LogLevel::warning, "secrets: the keyring refused: %@", *call->fault);
    Error error = makeErrorWithText(ErrorCode::readNoPermission,
                                    localizedFormat("The keyring refused (%1$@). Unlock it and try "
                                                    "again.",
                                                    *call->fault));
    error.localizedFailureReason = *call->fault;
    return error;
}

bool isOnBus(sd_bus* bus, const char* question, bool& answered) {
    BusError error;
    sd_bus_message* made = nullptr;
    const bool named = std::strcmp(question, "NameHasOwner") == 0;
    const int result =
        sd_bus_call_method(bus, "org.freedesktop.DBus", "/org/freedesktop/DBus",
                           "org.freedesktop.DBus", question, error.get(), &made,
                           named ? "s" : nullptr, named ? secretService : nullptr);
    const BusMessage reply(made);
    answered = result >= 0;
    if (!answered)
        return false;
    if (named) {
        int owned = 0;
        return sd_bus_message_read(made, "b", &owned) >= 0 && owned != 0;
    }
    const char* name = nullptr;
    bool found = false;
    if (sd_bus_message_enter_container(made, 'a', "s") < 0)
        return false;
    while (sd_bus_message_read(made, "s", &name) > 0)
        found = found || std::strcmp(name, secretService) == 0;
    return found;
}

std::shared_ptr<KeyringCall> callFor(const std::string& account) {
    auto call = std::make_shared<KeyringCall>();
    call->account = account;
    return call;
}

} // namespace

bool keyringIsThere() {
    const Bus bus = connectToBus(sessionBusAddress(), busPatience);
    if (!bus)
        return false;
    bool answered = false;
    const bool there = isOnBus(bus.get(), "NameHasOwner", answered) ||
                       (answered && isOnBus(bus.get(), "ListActivatableNames", answered));
    if (there && !SecretLibrary::shared().handle) {
        platformLog(LogLevel::warning, "secrets: there is a keyring, but no %@ to reach it",
                    libraryName);
        return false;
    }
    return there;
}

Result<std::optional<std::string>> lookUpInKeyring(const std::string& account, Duration patience) {
    const std::shared_ptr<KeyringCall> call = callFor(account);
    const Failure failure = perform(
        call, patience, [](KeyringCall& asked, const SecretLibrary& library, GError** error) {
            char* const found =
                library.lookUp(&schema(), asked.cancellable, error, accountAttribute,
                               asked.account.c_str(), static_cast<char*>(nullptr));
            if (!found)
                return;
            const std::lock_guard lock(asked.mutex);
            asked.answer = found;
            library.freePassword(found);
        });
    if (failure)
        return *failure;
    const std::lock_guard lock(call->mutex);
    return std::move(call->answer);
}

Failure storeInKeyring(const std::string& account, const std::string& label,
                       const std::string& secret, Duration patience) {
    const std::shared_ptr<KeyringCall> call = callFor(account);
    call->label = label;
    call->secret = secret;
    return perform(call, patience,
                   [](KeyringCall& asked, const SecretLibrary& library, GError** error) {
                       library.store(&schema(), SECRET_COLLECTION_DEFAULT, asked.label.c_str(),
                                     asked.secret.c_str(), asked.cancellable, error,
                                     accountAttribute, asked.account.c_str(),
                                     static_cast<char*>(nullptr));
                   });
}

Failure removeFromKeyring(const std::string& account, Duration patience) {
    return perform(callFor(account), patience,
                   [](KeyringCall& asked, const SecretLibrary& library, GError** error) {
                       library.clear(&schema(), asked.cancellable, error, accountAttribute,
                                     asked.account.c_str(), static_cast<char*>(nullptr));
                   });
}

} // namespace platform
