#pragma once

#include "tests/documents/StoreHouse.h"

#include <functional>
#include <string>

namespace test {

/// A store under the program's own code, without a window: the log is kept, the network is played.
struct ProductHouse : StoreHouse {
    ProductHouse();
    ~ProductHouse();

    /// "wifi", "cellular" or "offline", from now on.
    void givenNetwork(const std::string& state) const;
    /// Somebody else signs in, with a store of his own, or nobody is signed in any more. Answers
    /// when the platform has said so.
    void signInAs(const std::string& name, const std::string& remoteFolder);
    void signOut();
    /// The same as until for what other queues do without a word to the main one: looks again and
    /// again.
    bool untilElsewhere(const std::function<bool()>& condition);
    /// From now on the log keeps what is said at any level, while this house stands.
    static void listenClosely();
    /// A library of the store that has a rule file.
    void givenContainer(const std::string& name, const std::string& description) const;

private:
    void awaitIdentityChange(const std::function<void()>& change);
};

} // namespace test
