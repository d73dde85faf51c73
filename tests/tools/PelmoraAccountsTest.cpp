// Several accounts on the command line, one of them on a real server.

#include "tests/support/TemporaryFolder.h"
#include "tests/webdav/DavHost.h"

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <cstdlib>
#include <filesystem>
#include <string>
#include <sys/stat.h>
#include <sys/wait.h>

using testing::HasSubstr;
using testing::Not;
namespace fs = std::filesystem;

namespace {

struct PelmoraAccounts : ::testing::Test {
    test::TemporaryFolder home;
    std::string out;
    std::string err;

    int run(const std::string& arguments, const std::string& input = "") {
        home.write("in", input);
        const std::string command = "env -i HOME=" + home.path() + " PATH=$PATH " +
                                    PELMORA_PROGRAM + " " + arguments + " >" + (home / "out") +
                                    " 2>" + (home / "err") + " <" + (home / "in");
        const int status = std::system(command.c_str());
        out = home.read("out");
        err = home.read("err");
        return WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }
    std::string store(const std::string& kind) const {
        for (const auto& entry : fs::directory_iterator(home / ".local/share/pelmora"))
            if (entry.path().filename().string().starts_with(kind))
                return entry.path().string();
        return {};
    }
    void writeInStore(const std::string& kind, const std::string& path,
                      const std::string& content) const {
        const std::string below = store(kind).substr(home.path().size() + 1);
        home.write(below + "/Shelfroot/" + path, content);
    }
};

TEST_F(PelmoraAccounts, AServerIsAnAccountLikeAnother) {
    const test::DavHost server(test::DavHost::Kind::lighttpd);
    const std::string there = "sign-in webdav " + server.url() + " --user user";
    EXPECT_EQ(run("sign-in webdav " + server.url()), 2);
    EXPECT_EQ(run(there, "wrong\n"), 1);
    EXPECT_THAT(err, HasSubstr("does not accept"));
    EXPECT_EQ(run("sign-in webdav " + server.url() + "nowhere/ --user user", "secret\n"), 1);
    EXPECT_THAT(err, HasSubstr("There is nothing at"));
    EXPECT_EQ(run(there, "secret\n"), 1) << "nobody has agreed to a file";
    EXPECT_THAT(err, HasSubstr("--keep-in-file"));
    EXPECT_EQ(run("status"), 3);

    ASSERT_EQ(run(there + " --keep-in-file --name Work", "secret\n"), 0) << err;
    EXPECT_THAT(out + err, Not(HasSubstr("secret")));
    struct stat status {};
    ASSERT_EQ(::stat((home / ".config/pelmora/secrets.json").c_str(), &status), 0);
    EXPECT_EQ(status.st_mode & 0777, 0600U);
    ASSERT_EQ(run("refresh"), 0) << err;
    writeInStore("webdav", "Documents/a.txt", "mine");
    ASSERT_EQ(run("sync"), 0) << err;
    EXPECT_TRUE(fs::exists(server.folder() + "/Documents/a.txt"));
}

TEST_F(PelmoraAccounts, OneOfSeveralIsActiveAndEachCanBeLeft) {
    for (const std::string name : {"one", "two"}) {
        home.write(name + "/Notes/" + name + ".txt", name);
        ASSERT_EQ(run("sign-in folder " + (home / name)), 0) << err;
        ASSERT_EQ(run("download Notes"), 0) << err;
    }
    ASSERT_EQ(run("accounts"), 0);
    EXPECT_THAT(out, HasSubstr("  one ("));
    EXPECT_THAT(out, HasSubstr("* two ("));
    ASSERT_EQ(run("use one"), 0) << err;
    EXPECT_EQ(run("ls Notes/one.txt"), 0) << err;
    EXPECT_EQ(run("use three"), 3);

    const std::string one = store("folder-one");
    writeInStore("folder-one", "Notes/unsent.txt", "unsent");
    EXPECT_EQ(run("sign-out one --remove-files"), 1);
    EXPECT_THAT(err, HasSubstr("Notes/unsent.txt"));
    EXPECT_EQ(run("status"), 0) << "nothing was done";
    ASSERT_EQ(run("sync"), 0) << err;
    EXPECT_EQ(run("sign-out one --remove-files"), 0) << err;
    EXPECT_FALSE(fs::exists(one));
    EXPECT_EQ(home.read("one/Notes/unsent.txt"), "unsent");
    EXPECT_EQ(run("sign-out two"), 0) << err;
    EXPECT_TRUE(fs::exists(store("folder-two") + "/Shelfroot/Notes/two.txt"));
    EXPECT_EQ(run("accounts"), 0);
    EXPECT_EQ(out, "");
}

} // namespace
