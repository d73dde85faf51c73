#include "platform/ApplicationEntry.h"

#include "platform/base/Runtime.h"
#include "platform/base/Text.h"
#include "platform/system/DeskNotice.h"
#include "platform/system/UrlScheme.h"
#include "platform/ui/Application.h"

#include <cstdio>
#include <utility>

namespace platform {
namespace {

constexpr int handedOver = 0;
constexpr int notTaken = 1;
constexpr int notPassedOn = 2;

void open(Application& application, const OpenRequest& request) {
    application.bringForward(request.activationToken);
    OpenUrlOptions options;
    if (request.source)
        options.emplace(sourceApplicationKey, *request.source);
    for (const std::string& url : request.urls)
        application.openUrl(url, options);
}

} // namespace

ApplicationEntry::ApplicationEntry(int argc, const char* const* argv)
    : ApplicationEntry(SingleInstance::Options::ofThisProcess(),
                       std::vector<std::string>(argv + (argc > 0 ? 1 : 0), argv + argc)) {
}

ApplicationEntry::ApplicationEntry(SingleInstance::Options options,
                                   std::vector<std::string> arguments)
    : busAddress_(options.busAddress) {
    std::erase_if(arguments, [](const std::string& each) { return !hasUrlScheme(each); });
    auto claimed = SingleInstance::claim(
        std::move(options), {std::move(arguments), {}, activationTokenOfThisProcess()});
    if (!claimed)
        exitStatus_ = statusOf(claimed.error());
    else if (instance_ = *std::move(claimed); !instance_) {
        std::printf("%s\n",
                    localized("Tavrin runs already and was asked to come forward.").c_str());
        exitStatus_ = handedOver;
    }
}

ApplicationEntry::~ApplicationEntry() = default;

int ApplicationEntry::statusOf(const Error& error) const {
    sayStartFailed("tavrin", error, busAddress_);
    return error.is(ErrorCode::invalidArgument) ? notPassedOn : notTaken;
}

int ApplicationEntry::run(Application& application,
                          const std::shared_ptr<ApplicationDelegate>& delegate) {
    application.launch(delegate);
    serve(application);
    const int status = application.exec();
    stopServing();
    return status;
}

void ApplicationEntry::serve(Application& application) {
    if (instance_)
        instance_->setHandler(
            Runtime::current().mainQueue,
            [&application](const OpenRequest& request) { open(application, request); });
}

void ApplicationEntry::stopServing() {
    if (instance_)
        instance_->stop();
}

} // namespace platform
