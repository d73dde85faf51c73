#include "platform/files/Progress.h"
#include "platform/files/ProgressCallback.h"

#include <algorithm>
#include <condition_variable>
#include <unordered_map>
#include <utility>

namespace platform {
namespace {

struct Subscriber;

/// What one subscriber was told of one progress. Told at most once, taken back at most once.
struct Link {
    enum class Stage { waiting, telling, told, ended };
    std::shared_ptr<Progress> progress;
    std::shared_ptr<Subscriber> subscriber;
    Stage stage = Stage::waiting;
    /// The progress was withdrawn, or the subscriber left, while the link was told.
    bool over = false;
    FileProgressSubscription::Unpublished unpublished;
};
using Links = std::vector<std::shared_ptr<Link>>;

struct Subscriber {
    FileProgressSubscription::Published handler;
    /// Handlers of this subscriber that run just now or are about to.
    int running = 0;
};

/// All that concerns one file. `links` holds every pair of its subscribers and progresses.
struct Topic {
    std::vector<std::shared_ptr<Subscriber>> subscribers;
    std::vector<std::shared_ptr<Progress>> progresses;
    Links links;
};

template<class T>
void eraseOne(std::vector<T>& list, const T& one) {
    if (const auto found = std::find(list.begin(), list.end(), one); found != list.end())
        list.erase(found);
}

} // namespace

/// The lock is never held while a handler runs. A link goes through its stages under the lock; the
/// thread that moves it on calls the handler.
struct FileProgressSubscription::State {
    std::mutex mutex;
    std::condition_variable quiet;
    std::unordered_map<Url, Topic> topics;

    void tell(const Links& links) {
        for (const auto& link : links)
            tell(*link);
    }

    void tell(Link& link) {
        {
            const std::lock_guard lock(mutex);
            if (link.stage != Link::Stage::waiting)
                return;
            link.stage = Link::Stage::telling;
            ++link.subscriber->running;
        }
        Unpublished unpublished;
        {
            const ProgressCallbackScope inCallback;
            unpublished = link.subscriber->handler(link.progress);
        }
        std::unique_lock lock(mutex);
        link.stage = link.over ? Link::Stage::ended : Link::Stage::told;
        if (link.over)
            call(lock, std::move(unpublished));
        else
            link.unpublished = std::move(unpublished);
        finished(*link.subscriber);
    }

    /// Takes unlinked links back. One that is being told just now is taken back by who tells it.
    void end(const Links& links) {
        for (const auto& link : links) {
            std::unique_lock lock(mutex);
            link->over = true;
            const Link::Stage stage = link->stage;
            if (stage != Link::Stage::telling)
                link->stage = Link::Stage::ended;
            if (stage == Link::Stage::told)
                call(lock, std::exchange(link->unpublished, nullptr));
            finished(*link->subscriber);
        }
    }

    void addSubscriber(const Url& key, const std::shared_ptr<Subscriber>& subscriber) {
        Links links;
        {
            const std::lock_guard lock(mutex);
            Topic& topic = topics[key];
            topic.subscribers.push_back(subscriber);
            for (const auto& progress : topic.progresses)
                links.push_back(link(topic, progress, subscriber));
        }
        tell(links);
    }

    /// May be called again, also from within a handler that this calls.
    void removeSubscriber(const Url& key, const std::shared_ptr<Subscriber>& subscriber) {
        end(unlink(key, [&](Topic& topic, const Link* link) {
            if (link)
                return link->subscriber == subscriber;
            eraseOne(topic.subscribers, subscriber);
            ++subscriber->running; // until all its links have ended
            return false;
        }));
        std::unique_lock lock(mutex);
        finished(*subscriber);
        if (ProgressCallbackScope::active())
            return;
        quiet.wait(lock, [&] { return subscriber->running == 0; });
        const Published released = std::exchange(subscriber->handler, nullptr);
        lock.unlock();
    }

    void publish(const Url& key, const std::shared_ptr<Progress>& progress) {
        Links links;
        {
            const std::lock_guard lock(mutex);
            Topic& topic = topics[key];
            topic.progresses.push_back(progress);
            for (const auto& subscriber : topic.subscribers)
                links.push_back(link(topic, progress, subscriber));
        }
        tell(links);
    }

    void withdraw(const Url& key, const std::shared_ptr<Progress>& progress) {
        end(unlink(key, [&](Topic& topic, const Link* link) {
            if (link)
                return link->progress == progress;
            eraseOne(topic.progresses, progress);
            return false;
        }));
    }

private:
    static std::shared_ptr<Link> link(Topic& topic, const std::shared_ptr<Progress>& progress,
                                      const std::shared_ptr<Subscriber>& subscriber) {
        topic.links.push_back(std::make_shared<Link>());
        topic.links.back()->progress = progress;
        topic.links.back()->subscriber = subscriber;
        return topic.links.back();
    }

    /// Takes one end (called with no link) and its links out of the file's topic. Each link counts
    /// as running until end() has seen it, so that its subscriber's removal waits for that.
    template<class Match>
    Links unlink(const Url& key, const Match& match) {
        Links taken;
        const std::lock_guard lock(mutex);
        const auto found = topics.try_emplace(key).first;
        Topic& topic = found->second;
        match(topic, nullptr);
        const auto rest =
            std::stable_partition(topic.links.begin(), topic.links.end(),
                                  [&](const auto& one) { return !match(topic, &*one); });
        taken.assign(rest, topic.links.end());
        for (const auto& one : taken)
            ++one->subscriber->running;
        topic.links.erase(rest, topic.links.end());
        if (topic.subscribers.empty() && topic.progresses.empty())
            topics.erase(found);
        return taken;
    }

    /// Calls and releases the handler without the lock: what it holds may come back here.
    static void call(std::unique_lock<std::mutex>& lock, Unpublished unpublished) {
        if (!unpublished)
            return;
        lock.unlock();
        {
            const ProgressCallbackScope inCallback;
            unpublished();
            unpublished = nullptr;
        }
        lock.lock();
    }

    /// Called with the lock held.
    void finished(Subscriber& subscriber) {
        if (--subscriber.running == 0)
            quiet.notify_all();
    }
};

namespace {

/// Two spellings of one path are one file.
Url keyOf(const Url& file) {
    return Url::file(file.standardized().path());
}

/// Runs a job when it goes away.
class Ending {
public:
    explicit Ending(std::function<void()> end) : end_(std::move(end)) {}
    ~Ending() { end_(); }
    Ending(const Ending&) = delete;
    Ending& operator=(const Ending&) = delete;
    void run() const { end_(); }

private:
    std::function<void()> end_;
};

} // namespace

FileProgressSubscription::FileProgressSubscription() : state_(std::make_shared<State>()) {
}

FileProgressSubscription::~FileProgressSubscription() = default;

FileProgressSubscription::Token FileProgressSubscription::addSubscriber(const Url& file,
                                                                        Published handler) {
    auto subscriber = std::make_shared<Subscriber>();
    subscriber->handler = std::move(handler);
    const Url key = keyOf(file);
    auto ending = std::make_shared<Ending>(
        [state = state_, key, subscriber] { state->removeSubscriber(key, subscriber); });
    state_->addSubscriber(key, subscriber);
    return ending;
}

void FileProgressSubscription::removeSubscriber(const Token& token) {
    if (token)
        std::static_pointer_cast<Ending>(token)->run();
}

FileProgressSubscription::Token
FileProgressSubscription::publish(const Url& file, std::shared_ptr<Progress> progress) {
    const Url key = keyOf(file);
    auto ending = std::make_shared<Ending>(
        [state = state_, key, progress] { state->withdraw(key, progress); });
    state_->publish(key, progress);
    return ending;
}

} // namespace platform
