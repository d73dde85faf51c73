#include "platform/base/AlarmList.h"

namespace platform {

Clock::AlarmId AlarmList::add(Duration due, Job job) {
    const Clock::AlarmId id = ++last_;
    alarms_.emplace(Key(due, id), std::move(job));
    dues_.emplace(id, due);
    return id;
}

void AlarmList::cancel(Clock::AlarmId id) {
    const auto found = dues_.find(id);
    if (found == dues_.end())
        return;
    alarms_.erase(Key(found->second, id));
    dues_.erase(found);
}

std::optional<Duration> AlarmList::nextDue() const {
    return alarms_.empty() ? std::nullopt : std::optional(alarms_.begin()->first.first);
}

Job AlarmList::takeDue(Duration now) {
    if (alarms_.empty() || alarms_.begin()->first.first > now)
        return {};
    const auto first = alarms_.begin();
    Job job = std::move(first->second);
    dues_.erase(first->first.second);
    alarms_.erase(first);
    return job;
}

} // namespace platform
