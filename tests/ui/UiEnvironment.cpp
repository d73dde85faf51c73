#include "tests/ui/UiEnvironment.h"

#include <cstdlib>

namespace test {
namespace {

int argumentCount = 1;
char programName[] = "ui";
char* arguments[] = {programName, nullptr};

} // namespace

UiEnvironment::UiEnvironment()
    : runtime{clock, mainQueue, notifications, platform::Folders::fromProcessEnvironment()} {
    platform::Runtime::install(&runtime);
    application = std::make_unique<platform::Application>(argumentCount, arguments);
}

UiEnvironment::~UiEnvironment() {
    mainQueue.drainAll();
    application.reset();
    platform::Runtime::install(nullptr);
}

void UiEnvironment::advance(platform::Duration time) {
    settle();
    clock.advance(time, [this] { settle(); });
}

void UiEnvironment::settle() {
    application->processPending();
}

} // namespace test
