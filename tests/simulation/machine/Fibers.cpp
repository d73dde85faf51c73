#include "tests/simulation/machine/Fibers.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <sys/mman.h>
#include <ucontext.h>
#include <unistd.h>

#if defined(__SANITIZE_ADDRESS__)
#include <pthread.h>
#include <sanitizer/common_interface_defs.h>
#endif

namespace simulation {
namespace {

constexpr std::size_t guardSize = 4096;
#if defined(__SANITIZE_ADDRESS__)
constexpr std::size_t stackSize = 2048UL * 1024;
#else
constexpr std::size_t stackSize = 512UL * 1024;
#endif

void* newStack() {
    void* const memory = mmap(nullptr, stackSize + guardSize, PROT_READ | PROT_WRITE,
                              MAP_PRIVATE | MAP_ANONYMOUS | MAP_NORESERVE | MAP_STACK, -1, 0);
    if (memory == MAP_FAILED || mprotect(memory, guardSize, PROT_NONE) != 0) {
        std::perror("simulation: no memory for a stack");
        std::abort();
    }
    return memory;
}

} // namespace

struct Fiber {
    ucontext_t context{};
    void* stack = nullptr;
    std::function<void()> body;
    std::uint64_t number = 0;
    bool detached = false;
    bool ended = false;
    const void* place = nullptr;
    const char* reason = "";
    std::optional<Fibers::Nanoseconds> until;
    bool timedOut = false;
    int savedErrno = 0;
    std::vector<std::uint64_t> locals;
#if defined(__SANITIZE_ADDRESS__)
    void* fakeStack = nullptr;
    const void* bottom = nullptr;
    std::size_t size = 0;
#endif
};

Fibers::Fibers() : own_(std::make_unique<Fiber>()), driver_(own_.get()), current_(driver_) {
    own_->number = ++lastNumber_;
}

Fibers::~Fibers() = default;

Fibers& Fibers::shared() {
    static Fibers* const fibers = new Fibers(); // lives as long as the process
    return *fibers;
}

void Fibers::begin(std::uint64_t seed) {
    active_ = true;
    turns_ = 0;
    reseed(seed, 0);
}

void Fibers::end() {
    active_ = false;
    idle_ = nullptr;
}

void Fibers::reseed(std::uint64_t seed, unsigned interruption) {
    luck_ = Luck(seed);
    interruption_ = interruption;
}

std::uint64_t Fibers::numberOf(const Fiber* fiber) const {
    return fiber->number;
}

void Fibers::makeRunnable(Fiber* fiber) {
    fiber->place = nullptr;
    fiber->until.reset();
    runnable_.push_back(fiber);
}

Fiber* Fibers::start(std::function<void()> body) {
    collect();
    fibers_.push_back(std::make_unique<Fiber>());
    Fiber* const fiber = fibers_.back().get();
    fiber->number = ++lastNumber_;
    fiber->body = std::move(body);
    fiber->locals.resize(locals_.size());
    if (stacks_.empty()) {
        fiber->stack = newStack();
    } else {
        fiber->stack = stacks_.back();
        stacks_.pop_back();
    }
    getcontext(&fiber->context);
    fiber->context.uc_stack.ss_sp = static_cast<char*>(fiber->stack) + guardSize;
    fiber->context.uc_stack.ss_size = stackSize;
    fiber->context.uc_link = nullptr;
#if defined(__SANITIZE_ADDRESS__)
    fiber->bottom = fiber->context.uc_stack.ss_sp;
    fiber->size = stackSize;
#endif
    makecontext(&fiber->context, &Fibers::enter, 0);
    makeRunnable(fiber);
    return fiber;
}

void Fibers::enter() {
    Fibers& self = shared();
#if defined(__SANITIZE_ADDRESS__)
    __sanitizer_finish_switch_fiber(nullptr, nullptr, nullptr);
#endif
    self.current_->body();
    self.current_->body = nullptr;
    self.leave();
}

void Fibers::leave() {
    Fiber* const self = current_;
    self->ended = true;
    wakeAll(self);
    ended_.push_back(self);
    switchTo(pick());
    std::abort(); // nobody comes back here
}

/// Takes back the stacks of those that have ended. Not by one of them.
void Fibers::collect() {
    std::vector<Fiber*> kept;
    for (Fiber* const fiber : ended_) {
        if (fiber->stack && fiber != current_) {
            stacks_.push_back(fiber->stack);
            fiber->stack = nullptr;
        }
        if (fiber->stack || !fiber->detached)
            kept.push_back(fiber);
        else
            std::erase_if(fibers_, [&](const auto& one) { return one.get() == fiber; });
    }
    ended_ = std::move(kept);
}

void Fibers::join(Fiber* fiber) {
    while (!fiber->ended)
        wait(fiber, "the end of a thread");
    fiber->detached = true;
}

void Fibers::detach(Fiber* fiber) {
    fiber->detached = true;
}

Fiber* Fibers::pick() {
    for (;;) {
        if (limit_ != 0 && turns_ > limit_)
            giveUp("does not come to rest");
        if (driverLends_ && (budget_ == 0 || runnable_.empty() || (stop_ && stop_())))
            return driver_;
        if (!runnable_.empty())
            break;
        if (!idle_ || !idle_())
            giveUp("deadlock: everybody waits");
    }
    if (driverLends_)
        --budget_;
    ++turns_;
    const std::size_t index = luck_.below(runnable_.size());
    Fiber* const next = runnable_[index];
    runnable_.erase(runnable_.begin() + static_cast<std::ptrdiff_t>(index));
    return next;
}

void Fibers::switchTo(Fiber* next) {
    Fiber* const previous = current_;
    if (next == previous)
        return;
    previous->savedErrno = errno;
    previous->locals.resize(locals_.size());
    for (std::size_t i = 0; i < locals_.size(); ++i)
        previous->locals[i] = locals_[i].save();
    current_ = next;
    next->locals.resize(locals_.size());
    for (std::size_t i = 0; i < locals_.size(); ++i)
        locals_[i].restore(next->locals[i]);
#if defined(__SANITIZE_ADDRESS__)
    __sanitizer_start_switch_fiber(previous->ended ? nullptr : &previous->fakeStack, next->bottom,
                                   next->size);
#endif
    if (swapcontext(&previous->context, &next->context) != 0)
        std::abort();
#if defined(__SANITIZE_ADDRESS__)
    __sanitizer_finish_switch_fiber(previous->fakeStack, nullptr, nullptr);
#endif
    collect();
    errno = current_->savedErrno;
}

void Fibers::interrupt() {
    if (!active_ || isDriver() || !luck_.perMille(interruption_))
        return;
    makeRunnable(current_);
    switchTo(pick());
}

void Fibers::giveWay() {
    if (!active_ || isDriver())
        return;
    makeRunnable(current_);
    switchTo(pick());
}

bool Fibers::wait(const void* place, const char* reason, std::optional<Nanoseconds> until) {
    if (!active_) {
        std::fprintf(stderr, "simulation: waits (%s) outside a run\n", reason);
        std::abort();
    }
    Fiber* const self = current_;
    self->place = place;
    self->reason = reason;
    self->until = until;
    self->timedOut = false;
    switchTo(pick());
    return !self->timedOut;
}

void Fibers::wake(const void* place, std::size_t count) {
    std::vector<Fiber*> waiting;
    if (driver_->place == place)
        waiting.push_back(driver_);
    for (const auto& fiber : fibers_)
        if (fiber->place == place)
            waiting.push_back(fiber.get());
    for (; count > 0 && !waiting.empty(); --count) {
        const std::size_t index = luck_.below(waiting.size());
        makeRunnable(waiting[index]);
        waiting.erase(waiting.begin() + static_cast<std::ptrdiff_t>(index));
    }
}

std::size_t Fibers::run(std::size_t turns, const std::function<bool()>& stop) {
    if (runnable_.empty() || turns == 0)
        return 0;
#if defined(__SANITIZE_ADDRESS__)
    if (!driver_->bottom) {
        pthread_attr_t attributes;
        void* bottom = nullptr;
        pthread_getattr_np(pthread_self(), &attributes);
        pthread_attr_getstack(&attributes, &bottom, &driver_->size);
        driver_->bottom = bottom;
        pthread_attr_destroy(&attributes);
    }
#endif
    budget_ = turns;
    stop_ = stop;
    driverLends_ = true;
    switchTo(pick());
    driverLends_ = false;
    stop_ = nullptr;
    return turns - budget_;
}

std::optional<Fibers::Nanoseconds> Fibers::nextDue() const {
    std::optional<Nanoseconds> first = driver_->place ? driver_->until : std::nullopt;
    for (const auto& fiber : fibers_)
        if (fiber->place && fiber->until && (!first || *fiber->until < *first))
            first = fiber->until;
    return first;
}

void Fibers::wakeDue(Nanoseconds now) {
    const auto wakeOne = [&](Fiber& fiber) {
        if (!fiber.place || !fiber.until || *fiber.until > now)
            return;
        fiber.timedOut = true;
        makeRunnable(&fiber);
    };
    wakeOne(*driver_);
    for (const auto& fiber : fibers_)
        wakeOne(*fiber);
}

std::string Fibers::describe() const {
    std::string text;
    const auto add = [&](const Fiber& fiber) {
        if (fiber.ended)
            return;
        text += "  thread " + std::to_string(fiber.number);
        text += &fiber == driver_ ? " (driver)" : "";
        text += &fiber == current_ ? " runs" : "";
        text += fiber.place ? std::string(" waits for ") + fiber.reason : std::string(" can run");
        text += fiber.until ? " until " + std::to_string(fiber.until->count()) + "\n" : "\n";
    };
    add(*driver_);
    for (const auto& fiber : fibers_)
        add(*fiber);
    return text;
}

void Fibers::giveUp(const char* why) {
    std::fprintf(stdout, "simulation: %s\n%s", why, describe().c_str());
    std::fflush(stdout);
    _exit(3);
}

} // namespace simulation
