#include "platform/base/Log.h"
#include "platform/base/Text.h"
#include "tools/pelmora/Command.h"

#include <array>
#include <cstdio>
#include <cstdlib>

namespace pelmora {
namespace {

constexpr std::array<Command, 15> table{{
    {"sign-in",
     "sign-in folder PATH | webdav URL --user USER [--ca FILE] [--keep-in-file] [--name NAME]\n"
     "                  [--rate-limit BYTES] [--quota BYTES]",
     "Signs in to the account whose documents are in the folder PATH, or on the WebDAV server at\n"
     "URL. An account that was signed in before finds its store again. The password of a server is\n"
     "asked for (without a terminal: the first line of standard input) and goes into the keyring.\n"
     "  --user USER         who signs in to the server\n"
     "  --ca FILE           certificate authorities to trust beside the system's, for a server with\n"
     "                      a certificate of one's own\n"
     "  --keep-in-file      where there is no keyring: the password goes into a file that you\n"
     "                      alone may read; it is not encrypted\n"
     "  --name NAME         what the account is called\n"
     "  --rate-limit BYTES  bytes a second that transfers may take (suffixes K, M, G)\n"
     "  --quota BYTES       size of the account (suffixes K, M, G)\n",
     &signIn},
    {"accounts", "accounts",
     "Lists the accounts that are signed in to; \"*\" marks the active one, whose documents are\n"
     "shown.\n",
     &listAccounts},
    {"use", "use NAME", "Makes the account NAME the active one.\n", &useStoredAccount},
    {"sign-out", "sign-out [NAME] [--remove-files]",
     "Signs out of the active account, or of the one called NAME. The store and everything in it\n"
     "stay on the disk, and are found again when the same account signs in.\n"
     "  --remove-files  takes the documents off this device; refused while the account does not\n"
     "                  have all of them\n",
     &signOut},
    {"status", "status", "Tells who is signed in, where the store is, and what is in it.\n",
     &showStatus},
    {"ls", "ls [PATH]",
     "Lists a folder of the store (the whole store's top without PATH). PATH is absolute or\n"
     "relative to the store. A \"-\" before the size marks what is only promised.\n",
     &listItems},
    {"refresh", "refresh [PATH]",
     "Brings in what is new on the account: in the folder PATH, or everywhere.\n", &refresh},
    {"download", "download PATH...",
     "Fetches the contents of documents; of a folder, of everything below it. PATH is absolute or\n"
     "relative to the store. Ctrl-C stops; what is not whole leaves nothing behind.\n",
     &download},
    {"tag", "tag PATH [NAME...]",
     "Gives the document PATH those tags in place of the ones that it had; without NAME it has\n"
     "none then.\n",
     &tagItem},
    {"tags", "tags [NAME COLOUR | --remove NAME]",
     "Lists the account's tags with their colours, gives one a colour (and the account the tag), "
     "or\n"
     "takes one out of the list. Colours: none, grey, green, purple, blue, yellow, red, orange.\n",
     &tags},
    {"sync", "sync [--delete | --put-back]",
     "Makes both sides agree: what changed here goes to the account, and what changed there comes\n"
     "here. Tells what could not be done, and why. When so much has vanished from one side that "
     "it\n"
     "may be an accident, nothing is done until it is told what that means:\n"
     "  --delete    it is deleted on the other side as well, recoverably\n"
     "  --put-back  it comes back from the other side\n",
     &synchronize},
    {"evict", "evict PATH...",
     "Frees the room of documents: leaves of each but a promise on this device. Refused while the\n"
     "account does not surely have the same content.\n",
     &evict},
    {"conflicts", "conflicts",
     "Lists documents that were changed on both sides, under the names that tell of it.\n",
     &listConflicts},
    {"kept", "kept",
     "Lists the folder of local contents that were replaced or deleted. Copy out of it what you\n"
     "want back. \"only here\" marks what the account is not known to have.\n",
     &listKept},
    {"sample", "sample PATH",
     "Makes a folder PATH with documents of many kinds, to sign in to and try things with. PATH\n"
     "must not exist yet, or be empty.\n",
     &makeSample},
}};

void printOverview(std::FILE* out) {
    std::fputs("usage: pelmora COMMAND ...\n\n", out);
    for (const Command& command : table)
        std::fprintf(out, "  pelmora %s\n", std::string(command.usage).c_str());
    std::fputs("\n\"pelmora COMMAND --help\" tells more about a command.\n"
               "Exit codes: 0 done, 1 failed, 2 wrong usage, 3 no usable account, 4 the store is\n"
               "in use by another program, 130 interrupted.\n",
               out);
}

int runCommand(const Command& command, const std::vector<std::string>& arguments) {
    for (const std::string& argument : arguments)
        if (argument == "--help") {
            std::printf("usage: pelmora %s\n\n%s", std::string(command.usage).c_str(),
                        std::string(command.help).c_str());
            return done;
        }
    return command.run(arguments);
}

} // namespace

std::span<const Command> commands() {
    return table;
}

void complain(std::string_view message) {
    std::fprintf(stderr, "pelmora: %s\n", std::string(message).c_str());
}

int usageFault(std::string_view command, std::string_view message) {
    complain(message);
    for (const Command& each : table)
        if (each.name == command)
            std::fprintf(stderr, "usage: pelmora %s\n", std::string(each.usage).c_str());
    return badUsage;
}

} // namespace pelmora

int main(int argc, char** argv) {
    using namespace pelmora;
    platform::loadLocalizedTexts(platform::systemLanguage());
    // What a command has to say it says itself; the log is for those who look for a fault.
    const bool verbose = std::getenv("PELMORA_VERBOSE") != nullptr;
    platform::setLogSink({[verbose](int) { return verbose; },
                          [](int, const std::string& message, const std::source_location&) {
                              std::fprintf(stderr, "%s\n", message.c_str());
                          }});
    std::vector<std::string> arguments(argv + 1, argv + argc);
    if (arguments.empty() || arguments.front() == "--help") {
        printOverview(arguments.empty() ? stderr : stdout);
        return arguments.empty() ? badUsage : done;
    }
    const std::string name = arguments.front();
    arguments.erase(arguments.begin());
    for (const Command& command : commands())
        if (command.name == name)
            return runCommand(command, arguments);
    complain("there is no command “" + name + "”; see \"pelmora --help\"");
    return badUsage;
}
