#pragma once

#include "tests/simulation/machine/Luck.h"

#include <chrono>
#include <cstddef>
#include <cstdint>
#include <deque>
#include <functional>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace simulation {

struct Fiber;

/// The threads of the simulated machine. All of them run on the one real thread, one at a time;
/// who is next at each place where a thread may be interrupted or has to wait is decided by chance
/// from a seed. The driver (the real thread's own stack) runs when it is its turn: it lets the
/// others go on for a number of turns, and gets control back then, or earlier when all of them
/// wait.
///
/// ThreadCalls.cpp maps pthreads onto this, so the code under test needs to know nothing of it.
class Fibers {
public:
    using Nanoseconds = std::chrono::nanoseconds;

    /// The only one of the process.
    static Fibers& shared();

    /// Whether threads are simulated now. Off: starting a thread, or waiting for one, is a fault of
    /// the test.
    bool active() const { return active_; }
    void begin(std::uint64_t seed);
    /// Every fiber must have ended or wait for ever; those that wait are forgotten.
    void end();
    /// Chance from here on; `interruption` is how many of a thousand calls let another one run.
    void reseed(std::uint64_t seed, unsigned interruption);
    Luck& luck() { return luck_; }

    Fiber* current() const { return current_; }
    bool isDriver() const { return current_ == driver_; }
    std::uint64_t numberOf(const Fiber* fiber) const;

    Fiber* start(std::function<void()> body);
    void join(Fiber* fiber);
    void detach(Fiber* fiber);

    /// Lets others run first, if chance wants it.
    void interrupt();
    /// The same, whatever chance wants.
    void giveWay();
    /// Waits on `place` (any address) until somebody wakes it, or until that moment of the
    /// monotonic clock; false then. Nothing but the waker proves that what was waited for is true.
    bool wait(const void* place, const char* reason, std::optional<Nanoseconds> until = {});
    void wake(const void* place, std::size_t count);
    void wakeAll(const void* place) { wake(place, SIZE_MAX); }

    /// For the driver: the others run for so many turns, or until all of them wait. Answers how
    /// many turns were used. `stop` is asked after each of them.
    std::size_t run(std::size_t turns, const std::function<bool()>& stop = {});
    bool allWait() const { return runnable_.empty(); }
    /// Waits that end by time, and what makes time pass when the driver itself waits.
    std::optional<Nanoseconds> nextDue() const;
    void wakeDue(Nanoseconds now);
    /// Called when nobody can run and the driver waits as well; answers false when nothing can
    /// change that, which is a deadlock and ends the process.
    void setIdle(std::function<bool()> idle) { idle_ = std::move(idle); }

    /// Where everybody stands, for a failure's report.
    std::string describe() const;
    std::uint64_t turns() const { return turns_; }
    /// A run that takes more turns than this never comes to rest: the process ends with a report.
    void setLimit(std::uint64_t turns) { limit_ = turns; }

    /// What belongs to a thread and is global here: saved and restored at every switch.
    struct Local {
        std::function<std::uint64_t()> save;
        std::function<void(std::uint64_t)> restore;
    };
    void addLocal(Local local) { locals_.push_back(std::move(local)); }

private:
    Fibers();
    ~Fibers();
    static void enter();
    Fiber* pick();
    void switchTo(Fiber* next);
    void leave();
    void makeRunnable(Fiber* fiber);
    void collect();
    [[noreturn]] void giveUp(const char* why);

    bool active_ = false;
    Luck luck_;
    unsigned interruption_ = 0;
    std::unique_ptr<Fiber> own_; // the driver's
    Fiber* driver_ = nullptr;
    Fiber* current_ = nullptr;
    std::vector<std::unique_ptr<Fiber>> fibers_;
    std::vector<Fiber*> runnable_;
    std::vector<void*> stacks_; // free ones
    std::vector<Fiber*> ended_;
    std::size_t budget_ = 0;
    bool driverLends_ = false; // the driver is in run()
    std::function<bool()> stop_;
    std::function<bool()> idle_;
    std::uint64_t turns_ = 0;
    std::uint64_t limit_ = 0;
    std::uint64_t lastNumber_ = 0;
    std::vector<Local> locals_;
};

} // namespace simulation
