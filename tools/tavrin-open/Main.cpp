#include "platform/base/Text.h"
#include "platform/system/BusConnection.h"
#include "platform/system/DeskNotice.h"
#include "tools/tavrin-open/Opener.h"

namespace {

constexpr int notBrought = 1;
constexpr int notPassedOn = 2;

int fail(const platform::Error& error, int status) {
    platform::sayStartFailed("tavrin-open", error, platform::sessionBusAddress());
    return status;
}

} // namespace

/// What the desktop entry starts: asks Tavrin, running or not, to show the addresses given, or
/// without any to come forward. Exit status 0: taken; 1: Tavrin could not be reached; 2: there was
/// something among the arguments that is not passed on.
int main(int argc, char** argv) {
    platform::loadLocalizedTexts(platform::systemLanguage());
    const auto request = opener::requestOf({argv + (argc > 0 ? 1 : 0), argv + argc});
    if (!request)
        return fail(request.error(), notPassedOn);
    const platform::Failure failure = opener::bring(*request);
    return failure ? fail(*failure, notBrought) : 0;
}
