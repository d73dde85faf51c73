// One story, told from outside: the built program on a desk of its own, driven by what its
// accessibility tree shows and offers. Prints its steps; where it ends early, a picture of the
// screen and the tree as text are left in the folder that it is given.

#include "tests/acceptance/Visitor.h"

#include <QCoreApplication>

#include <cstdio>
#include <exception>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <stdexcept>

namespace test {
namespace {

namespace fs = std::filesystem;

/// Above the size from which on a document waits to be asked for.
constexpr std::uintmax_t panoramaSize = 6'291'456;

class Story {
public:
    explicit Story(const Desk& desk) : desk_(desk), person_(desk) {}

    void tell() {
        beginWithNobody();
        signIn();
        browse();
        openDocument();
        cancelDownload();
        download();
        rename();
        moveIntoNewFolder();
        moveOntoTakenName();
        removeOne();
        followAddress();
        killAndComeBack();
        changeAccounts();
    }
    const Visitor& person() const { return person_; }

private:
    void step(const char* what) {
        std::printf("%3d. %s\n", ++steps_, what);
        std::fflush(stdout);
    }
    void pelmora(const std::vector<std::string>& arguments) const {
        const Outcome outcome = desk_.run("pelmora", arguments);
        if (outcome.status != 0)
            throw std::runtime_error("pelmora " + arguments.front() + " failed");
    }
    /// Something in the account's own folder.
    std::string remote(const std::string& path) const { return desk_.home() / "Sample/" + path; }
    /// Something in the store on this device.
    std::string local(const std::string& path) const {
        for (const auto& each : fs::directory_iterator(desk_.data() + "/pelmora"))
            if (fs::exists(each.path() / "Shelfroot" / "Letters"))
                return (each.path() / "Shelfroot" / path).string();
        throw std::runtime_error("there is no store on this device");
    }
    void untilRemoteHas(const std::string& path, bool has = true) const {
        person_.until("the account to " + std::string(has ? "get “" : "lose “") + path + "”",
                      [&] { return fs::exists(remote(path)) == has; });
    }

    void beginWithNobody() {
        step("Starts Tavrin with nobody signed in: it says what to do.");
        person_.launch();
        person_.reads("Pelmora is not enabled");
        person_.reads("Your documents can be on a server");
    }

    void signIn() {
        step("Makes a sample and signs in to it: its libraries appear in the open window.");
        pelmora({"sample", remote("")});
        pelmora({"sign-in", "folder", remote(""), "--name", "Sample", "--rate-limit", "3M",
                 "--quota", "1G"});
        for (const char* const library : {"Documents", "Invoices", "Letters", "Travel"})
            person_.row(library);
        person_.reads("Sample");
        person_.reads(" available");
    }

    void browse() {
        step("Browses: into a library, back, and into another.");
        person_.open("Letters");
        person_.seesTitle("Letters");
        person_.row("Birthday.txt");
        person_.goBack();
        person_.open("Documents");
        person_.seesTitle("Documents");
        person_.row("House Rules.pdf");
    }

    void openDocument() {
        step("Opens a small document: its content comes by itself and can be read.");
        person_.open("Shopping.txt");
        person_.seesTitle("Shopping.txt");
        person_.reads("nails, 40 mm");
        person_.goBack();
        person_.seesTitle("Documents");
    }

    void cancelDownload() {
        step("Starts to download a large document and cancels: nothing of it stays.");
        person_.open("Coast Panorama.png");
        person_.pressButton("Download to View");
        person_.reads(" of 6");
        person_.pressButton("Cancel Download");
        person_.sees("push button", "Download to View");
        if (fs::exists(local("Documents/Coast Panorama.png")))
            throw std::runtime_error("a part of the cancelled download stayed");
    }

    void download() {
        step("Downloads it whole: it is shown.");
        person_.pressButton("Download to View");
        person_.seesNo("push button", "Cancel Download");
        person_.until("the whole document on the device", [this] {
            std::error_code none;
            return fs::file_size(local("Documents/Coast Panorama.png"), none) == panoramaSize;
        });
        person_.seesNo("push button", "Download to View");
        person_.goBack();
    }

    void rename() {
        step("Renames a document by its row's action: the account follows.");
        person_.choose("Rename", "Shopping.txt");
        person_.type("Groceries.txt");
        person_.pressButton("Done");
        person_.row("Groceries.txt");
        person_.seesNo("list item", "Shopping.txt");
        untilRemoteHas("Documents/Groceries.txt");
        untilRemoteHas("Documents/Shopping.txt", false);
    }

    void moveIntoNewFolder() {
        step("Selects three documents and moves them into a folder made on the way.");
        person_.pressButton("Select");
        person_.seesTitle("Select Items");
        person_.select({"Budget 2026.csv", "Empty Note.txt", "Groceries.txt"});
        person_.seesTitle("3 Items Selected");
        person_.pressButton("Move");
        person_.pressButton("New Folder");
        person_.type("Spring");
        person_.pressButton("Create");
        person_.seesTitle("Spring");
        person_.pressButton("Move Here");
        person_.seesNo("list item", "Groceries.txt");
        person_.open("Spring");
        for (const char* const moved : {"Budget 2026.csv", "Empty Note.txt", "Groceries.txt"}) {
            person_.row(moved);
            untilRemoteHas(std::string("Documents/Spring/") + moved);
        }
        person_.goBack();
    }

    void moveOntoTakenName() {
        step("Another device adds a document; moved onto a taken name it gets another.");
        std::ofstream(remote("Documents/Groceries.txt")) << "from the other device\n";
        person_.row("Groceries.txt");
        person_.pressButton("Select");
        person_.select({"Groceries.txt", "Reading List.html"});
        person_.pressButton("Move");
        person_.seesTitle("Documents");
        person_.open("Spring");
        person_.seesTitle("Spring");
        person_.pressButton("Move Here");
        person_.seesNo("list item", "Reading List.html");
        person_.open("Spring");
        person_.row("Groceries 2.txt");
        person_.row("Reading List.html");
    }

    void removeOne() {
        step("Deletes one: asked once, gone on the device and in the account.");
        untilRemoteHas("Documents/Spring/Groceries 2.txt");
        person_.pressButton("Select");
        person_.select({"Groceries 2.txt"});
        person_.pressButton("Delete");
        person_.pressButton("Delete from Tavrin");
        person_.seesNo("list item", "Groceries 2.txt");
        person_.row("Groceries.txt");
        untilRemoteHas("Documents/Spring/Groceries 2.txt", false);
    }

    void followAddress() {
        step("Follows an address from outside: the details of a document, with its library below.");
        const Outcome opened = desk_.run(
            "tavrin-open", {"tavrinapp://" + local("Letters/Birthday.txt") + "?mode=details"});
        if (opened.status != 0)
            throw std::runtime_error("tavrin-open failed");
        person_.sees("push button", "Birthday.txt");
        person_.reads("Plain text document");
        person_.goBack();
        person_.seesTitle("Letters");
    }

    void killAndComeBack() {
        step("Reads a document when the power goes; meanwhile the account fills up.");
        const std::string before = person_.reads(" available");
        person_.open("Draft.md");
        person_.seesTitle("Draft.md");
        person_.reads("Draft\n");
        person_.until("the place to be noted", [this] { return isNoted("Draft.md"); });
        person_.killProgram();
        const std::string fill = remote("Travel/Film.mov");
        std::ofstream(fill).put('x');
        fs::resize_file(fill, 400'000'000);
        step("Starts again: the document is open, and the free space is the new one.");
        person_.launch();
        person_.seesTitle("Draft.md");
        person_.goBack();
        person_.row("Documents");
        const std::string after = person_.reads(" available");
        if (after.substr(after.find(',')) == before.substr(before.find(',')))
            throw std::runtime_error("the status line still says " + after);
    }

    void changeAccounts() {
        step("Another account signs in while a document is open: its own store is shown.");
        person_.open("Letters");
        person_.open("Birthday.txt");
        person_.seesTitle("Birthday.txt");
        const std::string other = desk_.home() / "Other";
        fs::create_directories(other + "/Documents");
        fs::create_directories(other + "/Boats");
        pelmora({"sign-in", "folder", other, "--name", "Other"});
        person_.row("Boats");
        person_.seesNo("list item", "Letters");
        person_.seesNo("heading", "Birthday.txt");
        person_.reads("Other");
        step("Nobody is signed in any more: it says so.");
        pelmora({"sign-out"});
        person_.reads("Pelmora is not enabled");
        person_.seesNo("list item", "Boats");
    }

    /// What the screens were is on the disk.
    bool isNoted(const std::string& item) const {
        std::ifstream file(desk_.state() + "/com.pelmora.tavrin/restoration.json");
        const std::string text{std::istreambuf_iterator<char>(file), {}};
        return text.find(item) != std::string::npos;
    }

    const Desk& desk_;
    Visitor person_;
    int steps_ = 0;
};

int tellOn(const Desk& desk, const std::string& evidence) {
    Story story(desk);
    try {
        story.tell();
        return 0;
    } catch (const std::exception& fault) {
        const std::string place = evidence + "/acceptance-failure";
        std::printf("FAILED: %s\nSee %s.png and %s.txt\n", fault.what(), place.c_str(),
                    place.c_str());
        desk.savePicture(place + ".png");
        std::ofstream(place + ".txt") << fault.what() << "\n\n" << story.person().tree();
        return 1;
    }
}

} // namespace
} // namespace test

int main(int argc, char** argv) {
    if (argc > 2 && std::string(argv[1]) == test::Desk::pictureCommand)
        return test::Desk::takePicture(argv[2]);
    const QCoreApplication application(argc, argv);
    try {
        const test::Desk desk;
        return test::tellOn(desk, argc > 1 ? argv[1] : ".");
    } catch (const std::exception& fault) {
        std::printf("FAILED: %s\n", fault.what());
        return 1;
    }
}
