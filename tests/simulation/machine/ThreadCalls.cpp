// pthreads on the fibers of the simulated machine: threads, mutexes, condition variables, and the
// futex calls that the C++ library makes for futures. Without a run, nobody contends, and a mutex is
// only marked.

#include "tests/simulation/machine/Fibers.h"
#include "tests/simulation/machine/Machine.h"
#include "tests/simulation/machine/RealCall.h"

#include <cerrno>
#include <cstdarg>
#include <ctime>
#include <linux/futex.h>
#include <map>
#include <pthread.h>
#include <sys/syscall.h>
#include <unistd.h>

namespace simulation {
namespace {

Fibers& fibers() {
    return Fibers::shared();
}

int ownNumber() {
    return static_cast<int>(fibers().numberOf(fibers().current()));
}

int lockMutex(pthread_mutex_t* mutex, std::optional<Fibers::Nanoseconds> until, bool wait) {
    auto& data = mutex->__data;
    const int own = ownNumber();
    fibers().interrupt();
    while (data.__lock != 0) {
        if (data.__owner == own) {
            if ((data.__kind & 3) != PTHREAD_MUTEX_RECURSIVE_NP && wait)
                fibers().wait(mutex, "a mutex of its own");
            if ((data.__kind & 3) != PTHREAD_MUTEX_RECURSIVE_NP)
                return EBUSY;
            ++data.__count;
            return 0;
        }
        if (!wait)
            return EBUSY;
        if (!fibers().wait(mutex, "a mutex", until) && data.__lock != 0)
            return ETIMEDOUT;
    }
    data.__lock = 1;
    data.__owner = own;
    data.__count = 1;
    return 0;
}

int unlockMutex(pthread_mutex_t* mutex) {
    auto& data = mutex->__data;
    if (data.__count > 1) {
        --data.__count;
        return 0;
    }
    data.__lock = 0;
    data.__owner = 0;
    data.__count = 0;
    if (fibers().active())
        fibers().wakeAll(mutex);
    return 0;
}

std::optional<Fibers::Nanoseconds> monotonicDeadline(clockid_t clock, const timespec* until) {
    timespec now{};
    clock_gettime(clock, &now);
    const auto nanoseconds = [](const timespec& time) {
        return std::chrono::seconds(time.tv_sec) + std::chrono::nanoseconds(time.tv_nsec);
    };
    return Machine::shared().monotonic() + (nanoseconds(*until) - nanoseconds(now));
}

int waitForCondition(pthread_cond_t* condition, pthread_mutex_t* mutex,
                     std::optional<Fibers::Nanoseconds> until) {
    const unsigned count = mutex->__data.__count;
    mutex->__data.__count = 1;
    unlockMutex(mutex);
    const bool woken = fibers().wait(condition, "a condition", until);
    lockMutex(mutex, {}, true);
    mutex->__data.__count = count;
    return woken ? 0 : ETIMEDOUT;
}

/// Of shared mutexes, by address: how many read, or -1 for one that writes.
std::map<const void*, int>& sharedHolders() {
    static auto* const holders = new std::map<const void*, int>();
    return *holders;
}

int lockShared(pthread_rwlock_t* lock, bool write) {
    int& holders = sharedHolders()[lock];
    while (write ? holders != 0 : holders < 0)
        fibers().wait(lock, "a shared mutex");
    holders = write ? -1 : holders + 1;
    return 0;
}

long futex(int* word, int operation, int value, const timespec* time) {
    switch (operation & FUTEX_CMD_MASK) {
    case FUTEX_WAIT:
    case FUTEX_WAIT_BITSET: {
        if (*word != value) {
            errno = EAGAIN;
            return -1;
        }
        std::optional<Fibers::Nanoseconds> until;
        if (time && (operation & FUTEX_CMD_MASK) == FUTEX_WAIT)
            until = Machine::shared().monotonic() + std::chrono::seconds(time->tv_sec) +
                    std::chrono::nanoseconds(time->tv_nsec);
        else if (time)
            until = monotonicDeadline(
                operation & FUTEX_CLOCK_REALTIME ? CLOCK_REALTIME : CLOCK_MONOTONIC, time);
        if (fibers().wait(word, "a future", until))
            return 0;
        errno = ETIMEDOUT;
        return -1;
    }
    case FUTEX_WAKE:
    case FUTEX_WAKE_BITSET:
        fibers().wake(word, static_cast<std::size_t>(value));
        return 0;
    default:
        errno = ENOSYS;
        return -1;
    }
}

void sleepFor(const timespec& time) {
    const auto length = std::chrono::seconds(time.tv_sec) + std::chrono::nanoseconds(time.tv_nsec);
    static char place;
    fibers().wait(&place, "time to pass", Machine::shared().monotonic() + length);
}

} // namespace
} // namespace simulation

using namespace simulation; // NOLINT: the calls below belong to the C library's namespace

SIMULATED(int, pthread_create, pthread_t* thread, const pthread_attr_t* attributes,
          void* (*body)(void*), void* argument) {
    if (!fibers().active())
        return realCall<int(pthread_t*, const pthread_attr_t*, void* (*)(void*), void*)>(
            "pthread_create")(thread, attributes, body, argument);
    Fiber* const fiber = fibers().start([body, argument] { body(argument); });
    *thread = reinterpret_cast<pthread_t>(fiber);
    return 0;
}

SIMULATED(int, pthread_join, pthread_t thread, void** result) {
    if (!fibers().active())
        return realCall<int(pthread_t, void**)>("pthread_join")(thread, result);
    fibers().join(reinterpret_cast<Fiber*>(thread));
    return 0;
}

SIMULATED(int, pthread_detach, pthread_t thread) {
    if (!fibers().active())
        return realCall<int(pthread_t)>("pthread_detach")(thread);
    fibers().detach(reinterpret_cast<Fiber*>(thread));
    return 0;
}

SIMULATED(pthread_t, pthread_self, void) {
    static auto* const real = realCall<pthread_t()>("pthread_self");
    return fibers().isDriver() ? real() : reinterpret_cast<pthread_t>(fibers().current());
}

SIMULATED(int, pthread_setname_np, pthread_t, const char*) {
    return 0;
}

SIMULATED(int, pthread_mutex_lock, pthread_mutex_t* mutex) {
    return lockMutex(mutex, {}, true);
}

SIMULATED(int, pthread_mutex_trylock, pthread_mutex_t* mutex) {
    return lockMutex(mutex, {}, false);
}

SIMULATED(int, pthread_mutex_timedlock, pthread_mutex_t* mutex, const timespec* until) {
    return lockMutex(mutex, monotonicDeadline(CLOCK_REALTIME, until), true);
}

SIMULATED(int, pthread_mutex_clocklock, pthread_mutex_t* mutex, clockid_t clock,
          const timespec* until) {
    return lockMutex(mutex, monotonicDeadline(clock, until), true);
}

SIMULATED(int, pthread_mutex_unlock, pthread_mutex_t* mutex) {
    return unlockMutex(mutex);
}

SIMULATED(int, pthread_cond_wait, pthread_cond_t* condition, pthread_mutex_t* mutex) {
    return waitForCondition(condition, mutex, {});
}

SIMULATED(int, pthread_cond_timedwait, pthread_cond_t* condition, pthread_mutex_t* mutex,
          const timespec* until) {
    return waitForCondition(condition, mutex, monotonicDeadline(CLOCK_REALTIME, until));
}

SIMULATED(int, pthread_cond_clockwait, pthread_cond_t* condition, pthread_mutex_t* mutex,
          clockid_t clock, const timespec* until) {
    return waitForCondition(condition, mutex, monotonicDeadline(clock, until));
}

SIMULATED(int, pthread_cond_signal, pthread_cond_t* condition) {
    fibers().wake(condition, 1);
    return 0;
}

SIMULATED(int, pthread_cond_broadcast, pthread_cond_t* condition) {
    fibers().wakeAll(condition);
    return 0;
}

SIMULATED(int, pthread_cond_destroy, pthread_cond_t*) {
    return 0;
}

SIMULATED(int, pthread_rwlock_rdlock, pthread_rwlock_t* lock) {
    return lockShared(lock, false);
}

SIMULATED(int, pthread_rwlock_wrlock, pthread_rwlock_t* lock) {
    return lockShared(lock, true);
}

SIMULATED(int, pthread_rwlock_unlock, pthread_rwlock_t* lock) {
    int& holders = sharedHolders()[lock];
    holders = holders < 0 ? 0 : holders - 1;
    fibers().wakeAll(lock);
    return 0;
}

SIMULATED(long, syscall, long number, ...) {
    va_list list;
    va_start(list, number);
    const long a = va_arg(list, long);
    const long b = va_arg(list, long);
    const long c = va_arg(list, long);
    const long d = va_arg(list, long);
    const long e = va_arg(list, long);
    const long f = va_arg(list, long);
    va_end(list);
    if (number == SYS_futex && fibers().active())
        return futex(reinterpret_cast<int*>(a), static_cast<int>(b), static_cast<int>(c),
                     reinterpret_cast<const timespec*>(d));
    static auto* const real = realCall<long(long, ...)>("syscall");
    return real(number, a, b, c, d, e, f);
}

/// Only the simulated machine has priorities; the one thread keeps its own.
SIMULATED(int, setpriority, int which, unsigned who, int priority) {
    if (!fibers().active())
        return realCall<int(int, unsigned, int)>("setpriority")(which, who, priority);
    return 0;
}

SIMULATED(int, clock_gettime, clockid_t clock, timespec* time) {
    static auto* const real = realCall<int(clockid_t, timespec*)>("clock_gettime");
    if (!fibers().active())
        return real(clock, time);
    const bool wall = clock == CLOCK_REALTIME || clock == CLOCK_REALTIME_COARSE;
    const std::int64_t now =
        wall ? Machine::shared().wall() : Machine::shared().monotonic().count();
    time->tv_sec = now / 1'000'000'000;
    time->tv_nsec = now % 1'000'000'000;
    return 0;
}

SIMULATED(int, nanosleep, const timespec* time, timespec* rest) {
    if (!fibers().active())
        return realCall<int(const timespec*, timespec*)>("nanosleep")(time, rest);
    sleepFor(*time);
    return 0;
}

SIMULATED(int, usleep, unsigned microseconds) {
    const timespec time{microseconds / 1'000'000, static_cast<long>(microseconds % 1'000'000) * 1000};
    return nanosleep(&time, nullptr);
}
