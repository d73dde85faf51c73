#include "tests/simulation/far/SimRemote.h"

#include "tests/simulation/machine/Fibers.h"
#include "tests/simulation/machine/Machine.h"

#include <algorithm>

namespace simulation {

using namespace platform;

namespace {

Error errorOf(FarSide::Obstacle obstacle, const std::string& path) {
    switch (obstacle) {
    case FarSide::Obstacle::exists:
        return makeError(ErrorCode::fileExists, path);
    case FarSide::Obstacle::notEmpty:
        return makeError(ErrorCode::folderNotEmpty, path);
    case FarSide::Obstacle::refused:
        return makeError(ErrorCode::nameRefused, path);
    case FarSide::Obstacle::quota:
        return makeError(ErrorCode::quotaExceeded, path);
    case FarSide::Obstacle::invalid:
        return makeError(ErrorCode::invalidArgument, path);
    case FarSide::Obstacle::none:
    case FarSide::Obstacle::missing:
        break;
    }
    return makeError(ErrorCode::noSuchItem, path);
}

constexpr std::int64_t lateAnswer = 40'000'000'000;

} // namespace

void SimRemote::note(std::string what) {
    ++line_.changes;
    if (line_.keepsLog)
        line_.log.push_back(std::move(what));
}

void SimRemote::waitFor(std::int64_t nanoseconds, CancelFlag& cancel) {
    const int place = 0;
    const auto until = Machine::shared().monotonic() + std::chrono::nanoseconds(nanoseconds);
    cancel.setHandler([&place] { Fibers::shared().wakeAll(&place); });
    while (!cancel.isCancelled() && !line_.machineIsOff() &&
           Fibers::shared().wait(&place, "an answer", until)) {
    }
    cancel.setHandler({});
}

void SimRemote::pause(CancelFlag& cancel) {
    if (line_.latency > 0)
        waitFor(line_.latency, cancel);
    for (int i = 0; i < 3; ++i)
        if (line_.luck.perMille(line_.pauses))
            Fibers::shared().giveWay();
}

Failure SimRemote::begin(Call& call, CancelFlag& cancel) {
    if (line_.machineIsOff())
        return makeError(ErrorCode::serverNotAvailable);
    ++line_.calls;
    std::map<std::uint64_t, FarFault> later;
    for (const auto& [number, fault] : line_.faults)
        if (number == 0)
            call.fault = fault;
        else
            later[number - 1] = fault;
    line_.faults = std::move(later);
    pause(cancel);
    if (call.is(FarFault::Kind::late))
        waitFor(lateAnswer, cancel);
    if (line_.machineIsOff() || line_.away)
        return makeError(ErrorCode::serverNotAvailable);
    if (cancel.isCancelled())
        return makeError(ErrorCode::userCancelled);
    if (call.is(FarFault::Kind::failBefore))
        return makeError(call.fault->error);
    return std::nullopt;
}

Failure SimRemote::finish(const Call& call, CancelFlag& cancel) {
    pause(cancel);
    if (call.is(FarFault::Kind::failAfter) || line_.machineIsOff())
        return makeError(call.fault ? call.fault->error : ErrorCode::serverNotAvailable);
    return std::nullopt;
}

RemoteEntry SimRemote::entryOf(const FarItem& item) {
    RemoteEntry entry;
    entry.name = item.name;
    entry.kind = item.folder ? ItemKind::folder : ItemKind::file;
    entry.size = item.content.size();
    entry.modified = Date{item.modified};
    entry.etag = far_.etagOf(item);
    entry.young = far_.isYoung(item);
    entry.remoteId = far_.habits().ids ? "id" + std::to_string(item.id) : "";
    entry.tags = item.tags;
    if (!item.folder)
        line_.told.insert(item.content);
    return entry;
}

Result<std::string> SimRemote::connect(CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return *failure;
    if (Failure failure = finish(call, cancel))
        return *failure;
    return std::string(line_.otherDisk ? "another far side" : mark);
}

Result<RemoteListing> SimRemote::list(const std::string& path, CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return *failure;
    const FarItem* const folder = far_.find(path);
    const bool empty = line_.otherDisk || line_.muddled || call.is(FarFault::Kind::emptyList);
    if (!folder || !folder->folder || (empty && !path.empty() && !call.fault))
        return makeError(ErrorCode::noSuchItem, path);
    RemoteListing listing;
    if (!empty)
        for (const FarItem* const item : far_.children(*folder))
            listing.entries.push_back(entryOf(*item));
    if (call.is(FarFault::Kind::shortList) && !listing.entries.empty())
        listing.entries.erase(listing.entries.begin() + static_cast<std::ptrdiff_t>(line_.luck.below(
                                                            listing.entries.size())));
    for (std::size_t i = listing.entries.size(); i > 1; --i)
        std::swap(listing.entries[i - 1], listing.entries[line_.luck.below(i)]);
    if (Failure failure = finish(call, cancel))
        return *failure;
    return listing;
}

Result<RemoteEntry> SimRemote::answer(const std::string& path, const Call& call,
                                      std::uint64_t version, CancelFlag& cancel) {
    if (Failure failure = finish(call, cancel))
        return *failure;
    const FarItem* const item = far_.find(path);
    // Somebody was quicker than the look back: what became of the change cannot be told.
    if (!item || (version != 0 && item->version != version))
        return makeError(ErrorCode::unknownIo, path);
    return entryOf(*item);
}

Result<RemoteEntry> SimRemote::entry(const std::string& path, CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return *failure;
    const FarItem* const item = far_.find(path);
    if (!item || ((line_.otherDisk || line_.muddled) && !path.empty()))
        return makeError(ErrorCode::noSuchItem, path);
    RemoteEntry found = entryOf(*item);
    if (Failure failure = finish(call, cancel))
        return *failure;
    return found;
}

Result<RemoteEntry> SimRemote::read(const std::string& path, const Sink& sink, CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return *failure;
    const FarItem* const found = far_.find(path);
    if (!found || found->folder || line_.otherDisk || line_.muddled)
        return makeError(ErrorCode::noSuchItem, path);
    const FarItem item = *found;
    const RemoteEntry version = entryOf(item);
    const std::size_t largest = line_.luck.percent(50) ? 64 : 4096;
    const std::size_t end = call.is(FarFault::Kind::cut) ? line_.luck.below(item.content.size() + 1)
                                                         : item.content.size();
    for (std::size_t at = 0; at < end;) {
        const std::size_t size = std::min(end - at, 1 + line_.luck.below(largest));
        if (Failure failure = sink(std::as_bytes(std::span(item.content).subspan(at, size))))
            return *failure;
        at += size;
        pause(cancel);
        if (cancel.isCancelled())
            return makeError(ErrorCode::userCancelled);
        if (line_.machineIsOff() || line_.away)
            return makeError(ErrorCode::serverNotAvailable);
    }
    if (call.is(FarFault::Kind::cut))
        return makeError(call.fault->error);
    if (Failure failure = finish(call, cancel))
        return *failure;
    const FarItem* const now = far_.find(path);
    if (!now || now->version != item.version)
        return makeError(ErrorCode::changedWhileRead, path);
    return version;
}

Result<std::string> SimRemote::receive(const RemoteUpload& upload, const Call& call,
                                       CancelFlag& cancel) {
    std::string content;
    const std::uint64_t cut = line_.luck.below(upload.size + 1);
    std::vector<std::byte> buffer(line_.luck.percent(50) ? 100 : 8192);
    for (;;) {
        const Result<std::size_t> got = upload.read(content.size(), buffer);
        if (!got)
            return got.error();
        if (*got == 0)
            break;
        content.append(reinterpret_cast<const char*>(buffer.data()), *got);
        pause(cancel);
        if (cancel.isCancelled())
            return makeError(ErrorCode::userCancelled);
        if (line_.machineIsOff() || line_.away)
            return makeError(ErrorCode::serverNotAvailable);
        if (call.is(FarFault::Kind::cut) && content.size() >= cut)
            return makeError(call.fault->error);
    }
    if (content.size() != upload.size)
        return makeError(ErrorCode::changedWhileRead);
    return content;
}

Failure SimRemote::check(const std::string& path, const RemoteCondition& condition) {
    const FarItem* const standing = far_.find(path);
    if (!condition.etag)
        return standing ? Failure(makeError(ErrorCode::fileExists, path)) : std::nullopt;
    if (!standing)
        return makeError(line_.luck.percent(50) ? ErrorCode::noSuchItem : ErrorCode::changedRemotely,
                         path);
    if (standing->folder || far_.etagOf(*standing) != *condition.etag)
        return makeError(ErrorCode::changedRemotely, path);
    return std::nullopt;
}

/// As on a server that checks nothing: the new content lies aside, the standing one is set aside and
/// looked at, and the new one takes the name when it is free. Others may come between any two steps.
Failure SimRemote::replaceInSteps(const std::string& path, const std::string& content,
                                  const RemoteUpload& upload, const RemoteCondition& condition,
                                  const Call& call, CancelFlag& cancel) {
    if (condition.etag) {
        pause(cancel);
        const std::uint64_t aside = far_.setAside(path);
        if (aside == 0)
            return makeError(ErrorCode::changedRemotely, path);
        pause(cancel);
        if (far_.etagOf(far_.item(aside)) != *condition.etag) {
            if (far_.putBack(aside, path) != FarSide::Obstacle::none)
                (void)far_.putBack(aside, path + " (displaced " + std::to_string(aside) + ")");
            return makeError(ErrorCode::changedRemotely, path);
        }
        if (call.is(FarFault::Kind::cut)) // the worst moment
            return far_.putBack(aside, path) == FarSide::Obstacle::none && line_.luck.percent(50)
                       ? makeError(call.fault->error)
                       : (far_.discard(aside, Actor::engine), makeError(call.fault->error));
        if (far_.find(path)) {
            (void)far_.putBack(aside, path + " (displaced " + std::to_string(aside) + ")");
            return makeError(ErrorCode::changedRemotely, path);
        }
        const FarSide::Obstacle obstacle = far_.write(path, content, upload.modified.nanoseconds,
                                                      upload.tags, Actor::engine);
        if (obstacle != FarSide::Obstacle::none) {
            (void)far_.putBack(aside, path);
            return errorOf(obstacle, path);
        }
        far_.discard(aside, Actor::engine);
        return std::nullopt;
    }
    if (far_.find(path))
        return makeError(ErrorCode::fileExists, path);
    const FarSide::Obstacle obstacle =
        far_.write(path, content, upload.modified.nanoseconds, upload.tags, Actor::engine);
    return obstacle == FarSide::Obstacle::none ? std::nullopt : Failure(errorOf(obstacle, path));
}

Result<RemoteEntry> SimRemote::write(const std::string& path, const RemoteUpload& upload,
                                     const RemoteCondition& condition, CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return *failure;
    if (line_.otherDisk || line_.muddled)
        return makeError(ErrorCode::serverNotAvailable);
    const Result<std::string> content = receive(upload, call, cancel);
    if (!content)
        return content.error();
    if (far_.habits().checksInSteps) {
        if (Failure failure = replaceInSteps(path, *content, upload, condition, call, cancel))
            return *failure;
    } else {
        if (Failure failure = check(path, condition))
            return *failure;
        const FarSide::Obstacle obstacle = far_.write(path, *content, upload.modified.nanoseconds,
                                                      upload.tags, Actor::engine);
        if (obstacle != FarSide::Obstacle::none)
            return errorOf(obstacle, path);
    }
    note("write " + path);
    return answer(path, call, far_.find(path)->version, cancel);
}

Result<RemoteEntry> SimRemote::makeFolder(const std::string& path, CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return *failure;
    if (const auto obstacle = far_.makeFolder(path, Actor::engine);
        obstacle != FarSide::Obstacle::none)
        return errorOf(obstacle, path);
    note("makeFolder " + path);
    return answer(path, call, 0, cancel);
}

Result<RemoteEntry> SimRemote::move(const std::string& from, const std::string& to,
                                    const std::string& etag, CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return *failure;
    const FarItem* const source = far_.find(from);
    if (!source)
        return makeError(ErrorCode::noSuchItem, from);
    if (!etag.empty() && !source->folder && far_.etagOf(*source) != etag)
        return makeError(ErrorCode::changedRemotely, from);
    const std::uint64_t id = source->id;
    if (const auto obstacle = far_.move(from, to, Actor::engine);
        obstacle != FarSide::Obstacle::none)
        return errorOf(obstacle, to);
    note("move " + from + " -> " + to);
    return answer(to, call, far_.item(id).version, cancel);
}

Failure SimRemote::remove(const std::string& path, ItemKind kind, const std::string& etag,
                          CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return failure;
    const FarItem* const item = far_.find(path);
    if (!item)
        return makeError(ErrorCode::noSuchItem, path);
    if (item->folder != (kind == ItemKind::folder) ||
        (!item->folder && far_.etagOf(*item) != etag))
        return makeError(ErrorCode::changedRemotely, path);
    if (const auto obstacle = far_.remove(path, Actor::engine);
        obstacle != FarSide::Obstacle::none)
        return errorOf(obstacle, path);
    note("remove " + path);
    return finish(call, cancel);
}

Failure SimRemote::sync(CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return failure;
    return finish(call, cancel);
}

Result<std::optional<std::uint64_t>> SimRemote::freeBytes(CancelFlag& cancel) {
    Call call;
    if (Failure failure = begin(call, cancel))
        return *failure;
    if (Failure failure = finish(call, cancel))
        return *failure;
    return far_.free();
}

} // namespace simulation
