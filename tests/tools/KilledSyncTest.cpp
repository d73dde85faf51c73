#include "platform/cloud/Sidecar.h"
#include "tests/support/TemporaryFolder.h"

#include <gtest/gtest.h>

#include <csignal>
#include <fcntl.h>
#include <filesystem>
#include <fstream>
#include <map>
#include <poll.h>
#include <random>
#include <set>
#include <spawn.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

namespace fs = std::filesystem;

namespace {

std::string contentOf(const fs::path& file) {
    std::ifstream stream(file);
    return {std::istreambuf_iterator<char>(stream), {}};
}

/// The program, killed without a warning at any moment of its work, between edits on both sides.
/// Every content is written once, so that each can be followed wherever it goes.
struct KilledSync : ::testing::Test {
    test::TemporaryFolder home;
    std::mt19937 luck{7};
    std::set<std::string> wanted; // contents that nobody gave up
    int lastContent = 0;

    int below(int count) { return std::uniform_int_distribution<int>(0, count - 1)(luck); }

    pid_t start(std::vector<std::string> arguments) {
        std::vector<std::string> environment{"HOME=" + home.path(), "PATH=/usr/bin:/bin"};
        arguments.insert(arguments.begin(), PELMORA_PROGRAM);
        std::vector<char*> argv;
        std::vector<char*> envp;
        for (std::string& word : arguments)
            argv.push_back(word.data());
        for (std::string& word : environment)
            envp.push_back(word.data());
        argv.push_back(nullptr);
        envp.push_back(nullptr);
        posix_spawn_file_actions_t actions;
        posix_spawn_file_actions_init(&actions);
        posix_spawn_file_actions_addopen(&actions, 2, (home / "err").c_str(),
                                         O_WRONLY | O_CREAT | O_TRUNC, 0600);
        pid_t pid = -1;
        EXPECT_EQ(posix_spawn(&pid, argv[0], &actions, nullptr, argv.data(), envp.data()), 0);
        posix_spawn_file_actions_destroy(&actions);
        return pid;
    }
    static int end(pid_t pid) {
        int status = 0;
        waitpid(pid, &status, 0);
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }
    int run(const std::vector<std::string>& arguments) { return end(start(arguments)); }

    /// True when it was still at work.
    bool killedInTheMiddle() {
        const pid_t pid = start({"sync"});
        pollfd ended{static_cast<int>(syscall(SYS_pidfd_open, pid, 0)), POLLIN, 0};
        const bool working = poll(&ended, 1, below(120)) == 0;
        kill(pid, SIGKILL);
        close(ended.fd);
        end(pid);
        return working;
    }

    fs::path remote() const { return home / "remote"; }
    fs::path folder() const {
        for (const auto& entry : fs::directory_iterator(home / ".local/share/pelmora"))
            return entry.path();
        return {};
    }
    fs::path somePath() {
        static const std::vector<std::string> names{"Letters/a", "Letters/b.txt", "Letters/in/c",
                                                    "Notes/d",   "Notes/e.txt",   "Notes/f"};
        return names[static_cast<std::size_t>(below(static_cast<int>(names.size())))];
    }
    void write(const fs::path& file) {
        if (fs::is_directory(file) || fs::is_regular_file(file.parent_path()))
            return;
        fs::create_directories(file.parent_path());
        wanted.erase(contentOf(file));
        const std::string content = "content " + std::to_string(++lastContent);
        std::ofstream(file) << content;
        wanted.insert(content);
    }
    void edit() {
        const fs::path side = below(2) == 0 ? remote() : folder() / "Shelfroot";
        const fs::path file = side / somePath();
        const fs::path other = side / somePath();
        const int what = below(10);
        if (what < 6) {
            write(file);
        } else if (what < 8 && fs::is_regular_file(file) && !fs::exists(other)) {
            fs::create_directories(other.parent_path());
            fs::rename(file, other);
        } else if (what == 8 && fs::is_regular_file(file)) {
            wanted.erase(contentOf(file));
            fs::remove(file);
        }
    }

    /// What people see on a side; promises as such.
    std::map<std::string, std::string> tree(const fs::path& root, bool promises) const {
        std::map<std::string, std::string> found;
        for (auto at = fs::recursive_directory_iterator(root);
             at != fs::recursive_directory_iterator(); ++at) {
            const std::string name = at->path().filename();
            const fs::path shown = fs::relative(at->path(), root);
            if (name.starts_with(".pelmora"))
                at.disable_recursion_pending();
            else if (promises && platform::hasSidecarForm(name))
                found[shown.parent_path() / name.substr(1, name.size() - 9)] = "";
            else if (at->is_regular_file())
                found[shown] = contentOf(at->path());
        }
        return found;
    }
    bool sidesAgree() const {
        auto here = tree(folder() / "Shelfroot", true);
        auto there = tree(remote(), false);
        for (auto& [path, content] : there)
            if (here.contains(path) && here[path].empty())
                content.clear();
        return here == there;
    }
    std::string lost() const {
        std::set<std::string> found;
        for (const fs::path& root : {folder() / "Shelfroot", folder() / "kept", remote()})
            for (const auto& [path, content] : tree(root, false))
                found.insert(content);
        std::string missing;
        for (const std::string& content : wanted)
            missing += found.contains(content) ? "" : content + "; ";
        return missing;
    }
};

TEST_F(KilledSync, LosesNothingAndComesToItsEnd) {
    for (int i = 0; i < 20; ++i)
        write(remote() / ("Rest/" + std::to_string(i)));
    ASSERT_EQ(run({"sign-in", "folder", remote(), "--name", "Nora"}), 0);
    ASSERT_EQ(run({"sync"}), 0) << home.read("err");
    int killed = 0;
    for (int round = 0; round < 40; ++round) {
        for (int i = below(5); i >= 0; --i)
            edit();
        killed += killedInTheMiddle() ? 1 : 0;
    }
    EXPECT_GT(killed, 5);
    for (int i = 0; i < 6 && (run({"sync"}) != 0 || !sidesAgree()); ++i) {
    }
    EXPECT_EQ(lost(), "");
    EXPECT_EQ(run({"sync"}), 0) << home.read("err");
    EXPECT_TRUE(sidesAgree());
}

} // namespace
