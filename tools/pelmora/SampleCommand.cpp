#include "platform/files/FileManager.h"
#include "tools/pelmora/Command.h"
#include "tools/pelmora/SampleStore.h"

#include <QGuiApplication>

#include <cstdio>
#include <filesystem>

namespace pelmora {

using namespace platform;

int makeSample(const std::vector<std::string>& arguments) {
    if (arguments.size() != 1 || arguments.front().empty())
        return usageFault("sample", "sample wants one path");
    std::error_code fault;
    const std::filesystem::path root = std::filesystem::absolute(arguments.front(), fault);
    if (std::filesystem::exists(root, fault) && !std::filesystem::is_empty(root, fault)) {
        complain("“" + root.string() + "” is there already and not an empty folder");
        return failed;
    }
    // Pages and pictures are drawn without a screen, whatever the session has.
    qputenv("QT_QPA_PLATFORM", "offscreen");
    int count = 1;
    std::string name = "pelmora";
    char* names[] = {name.data(), nullptr};
    const QGuiApplication application(count, names);
    if (const Failure failure = makeSampleStore(root.string())) {
        complain(failure->localizedDescription.value_or("the sample cannot be written"));
        return failed;
    }
    std::printf("Made a sample in %s\nSign in to it with: pelmora sign-in folder %s\n",
                root.c_str(), root.c_str());
    return done;
}

} // namespace pelmora
