#include "app/AppDelegate.h"
#include "app/VXLogging.h"
#include "items/FileUtils.h"
#include "platform/ApplicationEntry.h"
#include "platform/Platform.h"
#include "platform/base/Text.h"

#include <optional>
#include <string>

int main(int argc, char** argv) {
    platform::loadLocalizedTexts(platform::systemLanguage());
    platform::ApplicationEntry entry(argc, argv);
    if (const std::optional<int> status = entry.exitStatus())
        return *status;
    tavrin::keepPlatformLog();
    platform::Platform services;
    tavrin::connectPlatformLog();
    const std::string program = argc > 0 ? argv[0] : "";
    VXLOG(tavrin::vxInfo, "Running %s", program);
    VXLOG(tavrin::vxInfo, "Built (main) on Jul 31 2015 @ 15:43:04");
    tavrin::FileUtils::logFileAttributes(program);
    int status = 0;
    {
        platform::Application application(argc, argv);
        status = entry.run(application, std::make_shared<tavrin::AppDelegate>());
    }
    // The services go away before the threads that may still log.
    tavrin::VXJotClient::JotClient()->close();
    return status;
}
