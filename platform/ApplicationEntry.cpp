#include "platform/ApplicationEntry.h"

#include "platform/base/Runtime.h"
#include "platform/base/Text.h"
#include "platform/system/DeskNotice.h"
#include "platform/system/UrlScheme.h"
#include "platform/ui/Application.h"

#include <cstdio>
#include <utility>
#include <vector>

namespace platform {
namespace {

constexpr int handedOver = 0;
constexpr int notTaken = 1;
constexpr int notPassedOn = 2;

/// A desk that gives the focus gives it sooner than this.
constexpr auto activationPatience = std::chrono::milliseconds(500);

} // namespace

/// Requests on their way to the application. Addresses wait until it is active: what it looks after
/// at that moment (another account) may rebuild its screens, and would take away what was opened.
class ApplicationEntry::Requests : public std::enable_shared_from_this<Requests> {
public:
    explicit Requests(Application& application)
        : application_(application),
          activated_(Runtime::current().notifications.observe(
              applicationDidBecomeActiveNotification,
              [this](const Notification&) { openSoon(); })) {}

    void take(const OpenRequest& request) {
        application_.bringForward(request.activationToken);
        waiting_.push_back(request);
        if (application_.isActive())
            openSoon();
        else if (!limit_)
            limit_ = Runtime::current().mainQueue.timer(activationPatience, [this] { openAll(); });
    }

private:
    /// After all others who hear of the activity.
    void openSoon() {
        Runtime::current().mainQueue.async([weak = weak_from_this()] {
            if (const auto self = weak.lock())
                self->openAll();
        });
    }

    void openAll() {
        limit_ = Timer();
        for (const OpenRequest& request : std::exchange(waiting_, {})) {
            OpenUrlOptions options;
            if (request.source)
                options.emplace(sourceApplicationKey, *request.source);
            for (const std::string& url : request.urls)
                application_.openUrl(url, options);
        }
    }

    Application& application_;
    std::vector<OpenRequest> waiting_;
    Timer limit_;
    Observation activated_;
};

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
    if (!instance_)
        return;
    requests_ = std::make_shared<Requests>(application);
    instance_->setHandler(
        Runtime::current().mainQueue,
        [requests = requests_](const OpenRequest& request) { requests->take(request); });
}

void ApplicationEntry::stopServing() {
    if (instance_)
        instance_->stop();
    requests_.reset();
}

} // namespace platform
