#include "platform/files/PathText.h"
#include "tests/webdav/Device.h"
#include "tests/webdav/FaultProxy.h"

#include <cstdlib>
#include <iostream>

using namespace platform;

namespace {

constexpr int spoiltOfThousand = 120;

/// Two devices, of which one reaches the server through something that spoils what passes.
struct FaultsOn : ::testing::TestWithParam<test::DavHost::Kind> {
    const unsigned seed = std::getenv("TAVRIN_WEBDAV_SEED")
                              ? static_cast<unsigned>(std::atoi(std::getenv("TAVRIN_WEBDAV_SEED")))
                              : std::random_device{}();
    std::mt19937 random{seed};
    test::DavHost host{GetParam()};
    test::FaultProxy proxy{host.authority(), seed};
    test::Device a{proxy.url()};
    test::Device b{host.url()};
    /// Contents that nobody has replaced or deleted on purpose.
    std::set<std::string> alive;
    int written = 0;

    FaultsOn() { std::cout << "TAVRIN_WEBDAV_SEED=" << seed << std::endl; }

    std::string freshContent() {
        std::string text = "<content " + std::to_string(++written) + '>';
        if (random() % 8 == 0)
            text += std::string(300'000, '.');
        return text;
    }
    static std::string markOf(const std::string& content) {
        return content.substr(0, content.find('>') + 1);
    }
    std::string anyPath() {
        constexpr const char* folders[] = {"", "A/", "A/in é/", "B/"};
        return folders[random() % 4] + std::string("file ") + std::to_string(random() % 5);
    }
    std::optional<std::string> anyDocument(test::Device& device) {
        const auto documents = device.documents();
        if (documents.empty())
            return std::nullopt;
        return std::next(documents.begin(), static_cast<long>(random() % documents.size()))->first;
    }
    void replaced(test::Device& device, const std::string& path) {
        if (const auto before = device.local(path))
            alive.erase(markOf(*before));
    }
    void act(test::Device& device) {
        const std::optional<std::string> path = anyDocument(device);
        const auto what = random() % 10;
        if (what < 5 || !path) {
            const std::string place = anyPath();
            if (device.isPromised(place) || FileManager::exists(device.pathOf(place) + "/."))
                return;
            replaced(device, place);
            const std::string content = freshContent();
            device.givenLocal(place, content);
            alive.insert(markOf(content));
        } else if (what < 7 && device.local(*path)) {
            replaced(device, *path);
            device.erase(*path);
        } else if (what < 9 && device.local(*path)) {
            const std::string place = anyPath();
            if (!FileManager::exists(device.pathOf(place)) && !device.isPromised(place) &&
                FileManager::exists(device.pathOf(std::string(folderOf('/' + place))) + "/."))
                device.rename(*path, place);
        } else {
            const Failure ignored = device.fetch(*path);
        }
    }
};
INSTANTIATE_TEST_SUITE_P(Servers, FaultsOn, test::everyServer, test::nameOfCase);

TEST_P(FaultsOn, NothingIsLostAndBothSidesAgreeInTheEnd) {
    for (int i = 0; i < 8; ++i) // so that a few deletions are no alarm
        b.givenLocal("Rest/" + std::to_string(i), "rest");
    b.synced();
    ASSERT_EQ(a.open(), std::nullopt);
    proxy.spoil(spoiltOfThousand);
    const int rounds = GetParam() == test::DavHost::Kind::nginx ? 2 : 6; // it counts in seconds
    for (int round = 0; round < rounds; ++round) {
        for (test::Device* device : {&a, &b}) {
            for (int i = 0; i < 4; ++i)
                act(*device);
            device->clock.advance(std::chrono::seconds(2));
            if (!device->remote->connect(device->cancel))
                continue; // it did not get through
            device->sync();
        }
    }
    proxy.spoil(0);
    for (int round = 0; round < 3; ++round)
        for (test::Device* device : {&a, &b}) {
            device->clock.advance(std::chrono::minutes(10));
            ASSERT_TRUE(test::went(device->remote->connect(device->cancel)));
            if (device->sync().question)
                device->queue->sync([&] {
                    EXPECT_EQ(device->synchronizer->answer(DeletionAnswer::putBack), std::nullopt);
                });
        }
    a.synced();
    b.synced();
    a.fetchAll();
    b.fetchAll();
    EXPECT_EQ(a.documents(), b.documents());
    std::string all = a.kept() + b.kept();
    for (const auto& [path, content] : a.documents())
        all += content.value_or("");
    for (const std::string& content : alive)
        EXPECT_NE(all.find(content), std::string::npos) << content;
    EXPECT_GT(proxy.faults(), 0);
}

} // namespace
