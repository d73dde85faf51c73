#include "platform/base/WorkQueue.h"
#include "platform/system/SingleInstance.h"

#include <cstdio>
#include <iostream>
#include <unistd.h>

using namespace platform;

namespace {

int say(const std::string& text) {
    std::cout << text << std::endl; // the test waits for every line
    return 0;
}

int sayError(const Error& error) {
    return say("error " + error.localizedDescription.value_or(""));
}

void sayRequest(const OpenRequest& request) {
    std::string line = "request " + request.source.value_or("nobody");
    for (const std::string& url : request.urls)
        line += ' ' + url;
    say(line);
}

int claim(const SingleInstance::Options& options, const OpenRequest& own) {
    WorkQueue queue("peer");
    const auto claimed = SingleInstance::claim(options, own);
    if (!claimed)
        return sayError(claimed.error());
    if (!*claimed)
        return say("second");
    say("first");
    (*claimed)->setHandler(queue, sayRequest);
    std::string line;
    while (std::getline(std::cin, line)) {
    }
    return 0;
}

} // namespace

/// Another start of the program, as the tests see it: "claim" or "hand", the runtime folder ("" for
/// none), the state folder, the bus ("" for none), the opener, then URLs.
int main(int argc, char** argv) {
    if (argc < 6)
        return 2;
    SingleInstance::Options options;
    if (*argv[2] != '\0')
        options.folders.runtime = argv[2];
    options.folders.state = argv[3];
    options.busAddress = argv[4];
    options.callers.opener = argv[5];
    const OpenRequest own{{argv + 6, argv + argc}};
    if (std::string_view(argv[1]) == "claim")
        return claim(options, own);
    const auto taken = handToRunningInstance(options, own);
    return taken ? say(*taken ? "taken" : "nobody") : sayError(taken.error());
}
