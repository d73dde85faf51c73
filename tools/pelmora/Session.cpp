#include "tools/pelmora/Session.h"

#include "platform/base/Describe.h"
#include "tools/pelmora/Command.h"

#include <csignal>
#include <future>
#include <thread>

namespace pelmora {
namespace {

using namespace platform;

/// A thread of its own waits for Ctrl-C: a signal handler could not take locks. Blocks the signal
/// for the threads that start later.
void cancelOnInterrupt(const std::shared_ptr<CancelFlag>& flag) {
    sigset_t signals;
    sigemptyset(&signals);
    sigaddset(&signals, SIGINT);
    sigaddset(&signals, SIGTERM);
    pthread_sigmask(SIG_BLOCK, &signals, nullptr);
    std::thread([flag, signals] {
        int signal = 0;
        sigwait(&signals, &signal);
        flag->cancel();
        sigwait(&signals, &signal); // who asks twice means it
        std::_Exit(interrupted);
    }).detach();
}

} // namespace

Session::Session(Purpose purpose)
    : cancel_(std::make_shared<CancelFlag>()),
      clock_(makeRealClock()),
      main_(*clock_),
      runtime_{*clock_, main_, notifications_, Folders::fromProcessEnvironment()} {
    Runtime::install(&runtime_);
    if (purpose == Purpose::change)
        cancelOnInterrupt(cancel_);
    cloud_ = std::make_unique<CloudService>(
        CloudService::Parts{*clock_, main_, notifications_, watcher_, progress_, runtime_.folders,
                            purpose == Purpose::look, nullptr, nullptr});
}

Session::~Session() {
    cloud_.reset();
    Runtime::install(nullptr);
}

std::optional<int> Session::complaint() {
    if (cloud_->accounts().identityToken())
        return std::nullopt;
    complain(cloud_->accounts().problem().value_or("there is no usable account"));
    return noAccount;
}

std::optional<int> Session::bringIn() {
    const std::optional<CloudStatus> status = cloud_->status();
    if (status && status->listed)
        return std::nullopt;
    const Failure failure = refreshAndWait(*cloud_, std::nullopt);
    const std::optional<CloudStatus> after = cloud_->status();
    if (!failure || (after && after->listed))
        return std::nullopt;
    return complainOf(*failure);
}

Url Session::urlOf(const std::string& path) const {
    const std::optional<Url> root = cloud_->documents().shelfroot();
    std::string full = path;
    if (!path.starts_with('/') && root)
        full = root->path() + '/' + path;
    return Url::file(full).standardized();
}

Failure refreshAndWait(CloudService& cloud, const std::optional<Url>& folder) {
    std::promise<Failure> ended;
    cloud.refresh(folder, [&](const Failure& failure) { ended.set_value(failure); });
    return ended.get_future().get();
}

int complainOf(const Error& error) {
    complain(error.localizedDescription.value_or(description(error)));
    if (error.is(ErrorCode::userCancelled))
        return interrupted;
    if (error.is(ErrorCode::itemBusy))
        return storeInUse;
    return error.is(ErrorCode::noAccount) ? noAccount : failed;
}

} // namespace pelmora
