#include "tests/cloud/ServiceFixture.h"

#include "platform/cloud/CloudDocumentService.h"
#include "platform/cloud/Remote.h"
#include "platform/cloud/Tokens.h"

#include <future>

namespace test {

using namespace platform;

ServiceFixture::ServiceFixture() {
    Runtime::install(&runtime);
    watcher = std::make_unique<DirectoryWatcher>();
    home.makeFolder("remote");
    main.setWake([this] {
        const std::lock_guard lock(mutex_);
        awake_ = true;
        woken_.notify_all();
    });
}

ServiceFixture::~ServiceFixture() {
    cloud.reset();
    main.setWake({});
    watcher.reset();
    Runtime::install(nullptr);
}

AccountRecord ServiceFixture::account(const std::string& folder) const {
    return {"folder", home / folder, "Nora", randomBytes(16), {}, {}};
}

void ServiceFixture::signIn(const AccountRecord& record) const {
    EXPECT_EQ(writeAccount(folders, record), std::nullopt);
}

void ServiceFixture::start(bool readOnly) {
    cloud = std::make_unique<CloudService>(CloudService::Parts{
        clock, main, notifications, *watcher, progress, folders, readOnly, nullptr, nullptr});
}

Failure ServiceFixture::readAll() {
    std::promise<Failure> done;
    cloud->refresh(std::nullopt, [&](const Failure& failure) { done.set_value(failure); });
    return done.get_future().get();
}

void ServiceFixture::givenStore() {
    signIn(account());
    start();
    ASSERT_EQ(readAll(), std::nullopt);
}

Url ServiceFixture::url(const std::string& path) const {
    return Url::file(cloud->documents().shelfroot()->path() + '/' + path);
}

void ServiceFixture::runUntil(const std::function<bool()>& holds) {
    while (true) {
        main.drainAll();
        if (holds())
            return;
        std::unique_lock lock(mutex_);
        woken_.wait(lock, [&] { return awake_; });
        awake_ = false;
    }
}

} // namespace test
