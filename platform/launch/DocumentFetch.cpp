#include "platform/launch/DocumentFetch.h"

#include "platform/Platform.h"
#include "platform/base/OperationQueue.h"
#include "platform/base/Runtime.h"
#include "platform/files/FileCoordinator.h"
#include "platform/files/FileManager.h"
#include "platform/files/Progress.h"
#include "platform/launch/Alerts.h"
#include "platform/ui/Theme.h"

#include <QCoreApplication>
#include <QPointer>

#include <algorithm>
#include <atomic>
#include <memory>
#include <mutex>
#include <utility>
#include <vector>

namespace platform {
namespace {

constexpr unsigned mostAtOnce = 8;

OperationQueue& fetchQueue() {
    static OperationQueue queue("platform.launch.fetch", mostAtOnce, WorkPriority::userInitiated);
    return queue;
}

/// What the reading thread and the main thread share.
class Reading {
public:
    explicit Reading(MainQueue& main) : main_(&main) {}

    /// On the reading thread. Answers where the document lies.
    Result<Url> read(const Url& document) {
        Url found = document;
        Failure missing;
        const Failure failure = coordinator_.coordinateReading(
            document, ReadingOptions::withoutChanges, [&](const Url& url) {
                found = url;
                if (const auto there = FileManager::attributes(url.path(), FollowLinks::yes);
                    !there)
                    missing = there.error();
            });
        if (failure || missing)
            return failure ? *failure : *missing;
        return found;
    }
    void cancel() { coordinator_.cancel(); }

    /// From any thread; nothing is done any more once the main thread has left.
    void toMain(Job job) {
        const std::lock_guard lock(mutex_);
        if (main_)
            main_->async(std::move(job));
    }
    void leave() {
        {
            const std::lock_guard lock(mutex_);
            main_ = nullptr;
        }
        cancel();
    }

private:
    FileCoordinator coordinator_;
    std::mutex mutex_;
    MainQueue* main_; // guarded by mutex_
};

/// One document on its way. Belongs to the running fetches.
class Fetch : public std::enable_shared_from_this<Fetch> {
public:
    explicit Fetch(DocumentFetch::Request request)
        : request_(std::move(request)),
          reading_(std::make_shared<Reading>(Runtime::current().mainQueue)) {}
    ~Fetch() { reading_->leave(); }
    Fetch(const Fetch&) = delete;
    Fetch& operator=(const Fetch&) = delete;

    bool isFor(const DocumentFetch::Request& other) const {
        return request_.document == other.document && request_.purpose == other.purpose;
    }
    void begin();

private:
    void subscribe();
    void showAlert();
    void showProgress(const std::shared_ptr<Progress>& progress);
    void forget();
    void arrived(const Result<Url>& document);

    DocumentFetch::Request request_;
    std::shared_ptr<Reading> reading_;
    Timer alertDelay_;
    FileProgressSubscription::Token subscription_;
    std::unique_ptr<ProgressAlert> alert_;
    std::shared_ptr<Progress> progress_;
};

/// Ends with the application, and gives up what is under way then.
class RunningFetches : public QObject {
public:
    static RunningFetches& shared() {
        static QPointer<RunningFetches> one;
        if (!one)
            one = new RunningFetches(QCoreApplication::instance());
        return *one;
    }
    std::vector<std::shared_ptr<Fetch>> fetches;

private:
    using QObject::QObject;
};

void Fetch::begin() {
    const ContentProvider* const provider = FileCoordinator::contentProvider();
    if (provider && provider->isPromised(request_.document)) {
        subscribe();
        alertDelay_ =
            Runtime::current().mainQueue.timer(Theme::loadingDelay, [this] { showAlert(); });
    }
    fetchQueue().async([reading = reading_, document = request_.document, weak = weak_from_this()] {
        const Result<Url> found = reading->read(document);
        reading->toMain([weak, found] {
            if (const auto fetch = weak.lock())
                fetch->arrived(found);
        });
    });
}

void Fetch::subscribe() {
    if (!Platform::installed())
        return;
    // A fast download reports far more often than anybody can look: one look at a time is enough.
    const auto looking = std::make_shared<std::atomic<bool>>(false);
    const auto look = [reading = reading_, weak = weak_from_this(),
                       looking](const std::shared_ptr<Progress>& progress) {
        if (looking->exchange(true))
            return;
        reading->toMain([weak, looking, progress] {
            looking->store(false);
            if (const auto fetch = weak.lock())
                fetch->showProgress(progress);
        });
    };
    subscription_ = Platform::current().fileProgress().addSubscriber(
        request_.document, [look](const std::shared_ptr<Progress>& progress) {
            const Progress::ObserverId id =
                progress->addObserver([look, weak = std::weak_ptr(progress)](const Progress&) {
                    if (const auto observed = weak.lock())
                        look(observed);
                });
            look(progress); // it may have begun before
            return [progress, id] { progress->removeObserver(id); };
        });
}

void Fetch::showAlert() {
    alert_ = std::make_unique<ProgressAlert>(request_.document.lastPathComponent(),
                                             [weak = weak_from_this()] {
                                                 if (const auto fetch = weak.lock())
                                                     fetch->forget();
                                             });
    if (progress_)
        showProgress(progress_);
    alert_->present();
}

void Fetch::showProgress(const std::shared_ptr<Progress>& progress) {
    progress_ = progress;
    if (alert_)
        alert_->setProgress(progress->completedUnitCount(), progress->totalUnitCount());
}

/// What was under way is given up with the last reference.
void Fetch::forget() {
    std::erase(RunningFetches::shared().fetches, shared_from_this());
}

void Fetch::arrived(const Result<Url>& document) {
    const auto self = shared_from_this();
    forget();
    alertDelay_.cancel();
    subscription_.reset();
    // When the user has just chosen to cancel, the alert is on its way out and tells nobody.
    const auto tell = [request = request_, document] {
        if (document)
            request.ready(*document);
        else if (!document.error().is(ErrorCode::userCancelled))
            showFailure(request.failureTitle, document.error());
    };
    if (alert_)
        alert_->finish(tell);
    else
        tell();
}

} // namespace

void DocumentFetch::start(Request request) {
    auto& fetches = RunningFetches::shared().fetches;
    if (std::ranges::any_of(fetches, [&](const auto& each) { return each->isFor(request); }))
        return;
    fetches.push_back(std::make_shared<Fetch>(std::move(request)));
    const auto started = fetches.back();
    started->begin();
}

} // namespace platform
