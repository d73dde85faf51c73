#include "platform/ApplicationEntry.h"
#include "platform/Platform.h"
#include "platform/base/Process.h"
#include "platform/ui/Application.h"
#include "platform/ui/Window.h"

#include <iostream>

using namespace platform;

namespace {

void say(const std::string& text) {
    std::cout << text << std::endl; // the test waits for every line
}

class Writer : public ApplicationDelegate {
public:
    bool applicationWillFinishLaunchingWithOptions(Application& application,
                                                   const LaunchOptions& /*options*/) override {
        window_ = std::make_unique<Window>(application.mainScreenBounds());
        window_->setRootViewController(std::make_shared<ViewController>());
        window_->makeKeyAndVisible();
        say("launched " + std::to_string(processIdentifier()));
        return true;
    }
    bool applicationOpenURLOptions(Application& application, const std::string& url,
                                   const OpenUrlOptions& options) override {
        const auto source = options.find(sourceApplicationKey);
        say((source == options.end() ? "nobody" : *source->second.text()) + " " + url);
        if (url == "tavrinapp:///end")
            application.terminate();
        return true;
    }

private:
    std::unique_ptr<Window> window_;
};

} // namespace

/// Says when it is launched, with its process number, and each address with whoever brought it.
int main(int argc, char** argv) {
    ApplicationEntry entry(argc, argv);
    if (entry.exitStatus())
        return *entry.exitStatus();
    Platform services;
    Application application(argc, argv);
    return entry.run(application, std::make_shared<Writer>());
}
