#include "platform/cloud/AccountPasswords.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/AccountBook.h"

namespace platform {

std::optional<WebDavCredentials> AccountPasswords::credentials(const AccountRecord& account,
                                                               bool refused) {
    if (account.user.empty())
        return std::nullopt;
    const std::string name = secretNameOf(account);
    const Result<std::optional<std::string>> kept = secrets_->lookUp(name);
    Known known;
    {
        const std::lock_guard lock(mutex_);
        known = known_[name];
    }
    if (!kept || !*kept) {
        if (!kept)
            platformLog(LogLevel::warning, "cloud: the password of “%@” cannot be read: %@",
                        account.name, kept.error());
        note(name, {known.given, known.refused,
                    kept ? localized("No password is kept here for this account.")
                         : kept.error().localizedDescription});
        return std::nullopt;
    }
    const bool same = **kept == known.given;
    if (same && (refused || known.refused)) {
        if (refused && !known.refused)
            platformLog(LogLevel::warning, "cloud: the password of “%@” was refused", account.name);
        note(name, {known.given, true,
                    localized("The server does not accept the password that is kept here. "
                              "Nothing is sent or received before it has the right one.")});
        return std::nullopt;
    }
    note(name, {**kept, false, std::nullopt});
    return WebDavCredentials{account.user, **kept};
}

std::optional<std::string> AccountPasswords::whyWanted(const AccountRecord& account) const {
    const std::lock_guard lock(mutex_);
    const auto found = known_.find(secretNameOf(account));
    return found == known_.end() ? std::nullopt : found->second.wanted;
}

void AccountPasswords::tryAgain() {
    const std::lock_guard lock(mutex_);
    for (auto& [name, known] : known_) {
        known.given.clear();
        known.refused = false;
    }
}

void AccountPasswords::note(const std::string& name, Known known) {
    bool news = false;
    {
        const std::lock_guard lock(mutex_);
        Known& before = known_[name];
        news = before.wanted != known.wanted;
        before = std::move(known);
    }
    if (news)
        changed_();
}

} // namespace platform
