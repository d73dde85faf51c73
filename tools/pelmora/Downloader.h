#pragma once

#include "tools/pelmora/Session.h"

#include <string>

namespace pelmora {

/// Fetches documents one after the other, with a line that shows how far each is where there is a
/// terminal to show it on.
class Downloader {
public:
    explicit Downloader(Session& session);
    /// The document, or everything below the folder. The first failure, after trying the rest.
    [[nodiscard]] platform::Failure fetch(const platform::Url& url);

private:
    platform::Failure fetchFolder(const platform::Url& folder);
    platform::Failure fetchDocument(const platform::Url& document);
    void show(const std::string& name, const platform::Progress& progress);

    Session& session_;
    const bool terminal_;
    int lastShown_ = -1;
};

} // namespace pelmora
