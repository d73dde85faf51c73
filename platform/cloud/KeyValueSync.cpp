#include "platform/cloud/KeyValueSync.h"

#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "platform/cloud/StoreFileSystem.h"
#include "platform/system/ValueJson.h"

#include <algorithm>
#include <cstring>

namespace platform {
namespace {

constexpr std::string_view fileName = "keyvalue.json";
constexpr std::uint64_t largestFile = std::uint64_t{4} * 1024 * 1024;
/// How often another device may write between our reading and our writing before we leave it for
/// later.
constexpr int attempts = 5;

// The keys of the store's own file.
constexpr std::string_view valuesKey = "values";
constexpr std::string_view settingsKey = "set";
constexpr std::string_view removalsKey = "removed";

Value::Map mapAt(const Value::Map& map, std::string_view key) {
    const auto found = map.find(key);
    const Value::Map* inner = found == map.end() ? nullptr : found->second.map();
    return inner ? *inner : Value::Map();
}

struct RemoteValues {
    Value::Map values;
    RemoteCondition condition;
};

Result<RemoteValues> readRemote(Remote& remote, CancelFlag& cancel) {
    std::string text;
    const Result<RemoteEntry> entry = remote.read(
        KeyValueSync::remotePath(),
        [&](std::span<const std::byte> piece) -> Failure {
            if (text.size() + piece.size() > largestFile)
                return makeError(ErrorCode::readCorrupt, fileName);
            text.append(reinterpret_cast<const char*>(piece.data()), piece.size());
            return std::nullopt;
        },
        cancel);
    if (!entry && entry.error().is(ErrorCode::noSuchItem))
        return RemoteValues{{}, RemoteCondition::nameFree()};
    if (!entry)
        return entry.error();
    std::optional<Value::Map> values = mapFromJsonText(text);
    if (!values) // never replaced by ours: somebody may be able to repair it
        return makeErrorWithText(
            ErrorCode::readCorrupt,
            localizedFormat("The file “%1$@” of the account is damaged. Repair or remove it.",
                            KeyValueSync::remotePath()));
    return RemoteValues{std::move(*values), RemoteCondition::version(entry->etag)};
}

Result<RemoteEntry> writeRemote(Remote& remote, const Value::Map& values, Date now,
                                const RemoteCondition& condition, CancelFlag& cancel) {
    const std::string text = jsonTextFromMap(values);
    RemoteUpload upload{text.size(), now, {}, {}};
    upload.read = [&](std::uint64_t offset, std::span<std::byte> buffer) -> Result<std::size_t> {
        const std::size_t count = std::min(buffer.size(), text.size() - offset);
        std::memcpy(buffer.data(), text.data() + offset, count);
        return count;
    };
    return remote.write(KeyValueSync::remotePath(), upload, condition, cancel);
}

} // namespace

std::string KeyValueSync::remotePath() {
    return std::string(remoteServiceFolder) + '/' + std::string(fileName);
}

KeyValueSync::KeyValueSync(std::string file, StoreFileSystem& disk, Clock& clock,
                           std::function<void()> changedElsewhere)
    : file_(std::move(file)),
      disk_(disk),
      clock_(clock),
      changedElsewhere_(std::move(changedElsewhere)) {
    load();
}

void KeyValueSync::load() {
    const Result<Bytes> content = FileManager::contents(Url::file(file_), largestFile);
    if (!content)
        return;
    const std::optional<Value::Map> map =
        mapFromJsonText({reinterpret_cast<const char*>(content->data()), content->size()});
    if (!map) {
        platformLog(LogLevel::warning, "cloud: %@ is damaged; the account's values are read anew",
                    file_);
        return;
    }
    values_ = mapAt(*map, valuesKey);
    pending_ = mapAt(*map, settingsKey);
    for (const auto& [key, unused] : mapAt(*map, removalsKey))
        pending_.insert_or_assign(key, Value());
}

Failure KeyValueSync::save() const {
    if (!open_)
        return std::nullopt;
    Value::Map settings;
    Value::Map removals;
    for (const auto& [key, value] : pending_)
        (value.isNone() ? removals : settings).emplace(key, value.isNone() ? Value(true) : value);
    Value::Map map;
    map.emplace(valuesKey, Value(values_));
    map.emplace(settingsKey, Value(std::move(settings)));
    map.emplace(removalsKey, Value(std::move(removals)));
    return disk_.writeSmallFile(file_, jsonTextFromMap(map));
}

void KeyValueSync::open() {
    const std::lock_guard lock(mutex_);
    const Value::Map set = std::exchange(pending_, {});
    load(); // the program that had the store before may have written
    for (const auto& [key, value] : set)
        pending_.insert_or_assign(key, value);
    open_ = true;
    if (const Failure failure = set.empty() ? Failure() : save())
        platformLog(LogLevel::error, "cloud: cannot write %@: %@", file_, *failure);
}

void KeyValueSync::close() {
    const std::lock_guard lock(mutex_);
    open_ = false;
}

Value KeyValueSync::value(std::string_view key) const {
    const std::lock_guard lock(mutex_);
    for (const Value::Map* map : {&pending_, &values_})
        if (const auto found = map->find(key); found != map->end())
            return found->second;
    return {};
}

Failure KeyValueSync::setValue(std::string_view key, Value value) {
    const std::lock_guard lock(mutex_);
    pending_.insert_or_assign(std::string(key), std::move(value));
    return save();
}

Value::Map KeyValueSync::merged(const Value::Map& from) const {
    Value::Map map = from;
    for (const auto& [key, value] : pending_)
        if (value.isNone())
            map.erase(key);
        else
            map.insert_or_assign(key, value);
    return map;
}

Failure KeyValueSync::exchange(Remote& remote, CancelFlag& cancel) {
    const std::lock_guard one(exchanging_);
    Failure failure;
    for (int attempt = 0; attempt < attempts; ++attempt) {
        const Result<RemoteValues> there = readRemote(remote, cancel);
        failure = there ? Failure() : Failure(there.error());
        if (failure && failure->is(ErrorCode::changedWhileRead))
            continue;
        if (failure)
            return failure;
        Value::Map sent;
        Value::Map wanted;
        {
            const std::lock_guard lock(mutex_);
            sent = pending_;
            wanted = merged(there->values);
        }
        if (wanted != there->values) {
            const Result<RemoteEntry> written =
                writeRemote(remote, wanted, clock_.now(), there->condition, cancel);
            failure = written ? Failure() : Failure(written.error());
        }
        if (!failure)
            return adopt(std::move(wanted), sent);
        if (!failure->is(ErrorCode::changedRemotely) && !failure->is(ErrorCode::fileExists))
            return failure;
    }
    return failure;
}

Failure KeyValueSync::adopt(Value::Map values, const Value::Map& sent) {
    Failure failure;
    bool news = false;
    {
        const std::lock_guard lock(mutex_);
        const Value::Map before = merged(values_);
        if (values == values_ && sent.empty())
            return std::nullopt;
        values_ = std::move(values);
        for (const auto& [key, value] : sent)
            if (const auto found = pending_.find(key);
                found != pending_.end() && found->second == value)
                pending_.erase(found);
        news = merged(values_) != before;
        failure = save();
    }
    if (news && changedElsewhere_)
        changedElsewhere_();
    return failure;
}

} // namespace platform
