#pragma once

#include "platform/cloud/KeptFolder.h"
#include "tests/cloud/StoreFixture.h"
#include "tests/webdav/WebDavFixture.h"

#include <map>

namespace test {

/// A store on a device of its own, with the account on a server, and words for what its user does.
struct Device : StoreFixture {
    explicit Device(const std::string& url) { remote = remoteAt(url, clock, signedIn()); }
    void TestBody() override {}

    std::string pathOf(const std::string& path) const { return layout.root() + '/' + path; }
    void erase(const std::string& path) const {
        EXPECT_EQ(platform::FileManager::removeItem(url(path)), std::nullopt);
    }
    void rename(const std::string& from, const std::string& to) const {
        EXPECT_EQ(platform::FileManager::moveItem(url(from), url(to)), std::nullopt);
    }
    /// Documents of the device with their contents; nothing for those that are promises.
    std::map<std::string, std::optional<std::string>> documents(const std::string& folder = "") {
        std::map<std::string, std::optional<std::string>> found;
        const auto entries = platform::FileManager::entries(pathOf(folder));
        if (!entries)
            return found;
        for (const platform::DirectoryEntry& entry : *entries) {
            const std::string path = folder.empty() ? entry.name : folder + '/' + entry.name;
            const auto attributes =
                platform::FileManager::attributes(pathOf(path), platform::FollowLinks::no);
            if (attributes && attributes->kind == platform::FileKind::directory)
                found.merge(documents(path));
            else if (entry.name.starts_with('.') && entry.name.ends_with(".promise"))
                found[path.substr(0, path.size() - entry.name.size()) +
                      entry.name.substr(1, entry.name.size() - 9)];
            else if (!entry.name.starts_with(".pelmora"))
                found[path] = local(path);
        }
        return found;
    }
    /// Fetches everything.
    void fetchAll() {
        for (const auto& [path, content] : documents())
            if (!content) {
                const platform::Failure failure = fetch(path);
                EXPECT_EQ(failure, std::nullopt) << path << ": " << wordsOf(failure);
            }
    }
    /// Contents that the engine replaced or deleted here.
    std::string kept() const {
        return run({{"/bin/sh", "-c", "find '" + layout.kept() + "' -type f -exec cat {} +"}})
            .output;
    }
};

} // namespace test
