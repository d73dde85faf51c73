#pragma once

#include "platform/base/Result.h"

#include <cstddef>
#include <cstdint>
#include <functional>
#include <memory>
#include <optional>
#include <span>
#include <string>

namespace platform {

/// One answer of a multistatus: an item, or why the server does not tell of it.
struct DavItem {
    std::string href;
    /// Of the answer as a whole; 0 where the server tells properties.
    int status = 0;
    /// At least one property was answered with success.
    bool hasProperties = false;
    bool isCollection = false;
    std::optional<std::uint64_t> size;
    /// As the server wrote them.
    std::string modified;
    std::string etag;
    /// The store's own property.
    std::string tags;
    // What richer servers add: an identity for life, and letters for what the user may do.
    std::string id;
    std::string permissions;
    std::optional<std::int64_t> quotaAvailable;
};

/// Reads the body of a 207 while it arrives. Keeps one answer at a time, refuses document types
/// (and with them every entity), and counts as whole only when the document was well-formed to its
/// last byte. One thread.
class MultiStatusParser {
public:
    /// Takes the answers in their order; an error ends the reading with it.
    using Take = std::function<Failure(DavItem item)>;

    explicit MultiStatusParser(Take take);
    ~MultiStatusParser();
    MultiStatusParser(const MultiStatusParser&) = delete;
    MultiStatusParser& operator=(const MultiStatusParser&) = delete;

    /// serverRefused with the reason when this is no multistatus.
    [[nodiscard]] Failure feed(std::span<const std::byte> piece);
    /// The document is at its end.
    [[nodiscard]] Failure finish();

private:
    struct State;
    std::unique_ptr<State> state_;
};

/// The store's own property for an item's tags, and the namespaces that a request has to declare.
inline constexpr const char* storeNamespace = "urn:pelmora:store";
inline constexpr const char* richNamespace = "http://owncloud.org/ns";

} // namespace platform
