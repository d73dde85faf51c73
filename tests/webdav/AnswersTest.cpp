#include "platform/cloud/webdav/WebDavAccount.h"
#include "tests/webdav/HttpHost.h"
#include "tests/webdav/WebDavFixture.h"

#include <mutex>

using namespace platform;
using test::endedWith;
using test::WireReply;
using test::WireRequest;

namespace {

std::string itemXml(const std::string& href, const std::string& properties) {
    return "<d:response><d:href>" + href + "</d:href><d:propstat><d:prop>" + properties +
           "</d:prop><d:status>HTTP/1.1 200 OK</d:status></d:propstat></d:response>";
}
std::string folderXml(const std::string& href, const std::string& more = "") {
    return itemXml(href, "<d:resourcetype><d:collection/></d:resourcetype>" + more);
}
std::string fileXml(const std::string& href, std::size_t size, const std::string& more = "") {
    return itemXml(href, "<d:resourcetype/><d:getcontentlength>" + std::to_string(size) +
                             "</d:getcontentlength><d:getetag>\"e\"</d:getetag>" + more);
}
WireReply listing(const std::string& items) {
    return {207,
            {"Content-Type: application/xml"},
            "<?xml version=\"1.0\"?><d:multistatus xmlns:d=\"DAV:\" "
            "xmlns:o=\"http://owncloud.org/ns\">" +
                items + "</d:multistatus>"};
}

/// A server of which a test says what it answers; it takes no changes.
struct Answers : ::testing::Test {
    std::mutex mutex;
    std::map<std::string, WireReply> told; // by "METHOD target"
    std::vector<WireRequest> asked;
    test::HttpHost host{[this](const WireRequest& request) {
        const std::lock_guard lock(mutex);
        asked.push_back(request);
        const auto found = told.find(request.method + ' ' + request.target);
        return found == told.end() ? WireReply{request.method == "GET" ? 404 : 403}
                                   : found->second;
    }};
    ManualClock clock;
    CancelFlag cancel;
    std::unique_ptr<WebDavRemote> remote = test::remoteAt(host.url(), clock, test::signedIn());

    Answers() { tell("PROPFIND /", listing(folderXml("/"))); }
    void tell(const std::string& what, WireReply reply) {
        const std::lock_guard lock(mutex);
        told[what] = std::move(reply);
    }
    int timesAsked(const std::string& method) {
        const std::lock_guard lock(mutex);
        return static_cast<int>(
            std::count_if(asked.begin(), asked.end(),
                          [&](const WireRequest& request) { return request.method == method; }));
    }
    void givenConnection() { ASSERT_TRUE(test::went(remote->connect(cancel))); }
    Result<std::string> content(const std::string& path) {
        std::string text;
        const auto read = remote->read(
            path,
            [&](std::span<const std::byte> piece) -> Failure {
                text.append(reinterpret_cast<const char*>(piece.data()), piece.size());
                return std::nullopt;
            },
            cancel);
        return read ? Result<std::string>(text) : read.error();
    }
};

TEST_F(Answers, AListingThatIsNotWholeAndSaneConcludesNothing) {
    givenConnection();
    const std::string good = folderXml("/f/") + fileXml("/f/a", 1);
    tell("PROPFIND /f/", listing(good));
    ASSERT_EQ(remote->list("f", cancel)->entries.size(), 1U);
    const std::string whole = listing(good).body;
    std::vector<WireReply> bad;
    for (std::size_t size : {std::size_t{0}, std::size_t{30}, whole.size() / 2, whole.size() - 1})
        bad.push_back({207, {}, whole.substr(0, size)});
    bad.push_back({207, {}, whole, whole.size()}); // the connection ends early
    bad.push_back({207, {}, whole + "<error/>"});
    bad.push_back({207, {}, "garbage"});
    bad.push_back({207, {}, "<html><body>Welcome</body></html>"});
    bad.push_back({200, {}, whole});
    bad.push_back({207, {}, "<!DOCTYPE a [<!ENTITY b \"c\">]>" + whole});
    std::string bomb = "<!DOCTYPE m [<!ENTITY a0 \"ha\">";
    for (int i = 1; i < 40; ++i)
        bomb += "<!ENTITY a" + std::to_string(i) + " \"&a" + std::to_string(i - 1) + ";&a" +
                std::to_string(i - 1) + ";\">";
    bad.push_back({207, {}, bomb + "]><m>&a39;</m>"});
    bad.push_back(listing(fileXml("/f/a", 1)));                          // not the folder itself
    bad.push_back(listing(good + fileXml("/f/%61", 1)));                 // a name twice
    bad.push_back(listing(good + fileXml("/elsewhere/b", 1)));           // of another folder
    bad.push_back(listing(good + fileXml("/f/a/b", 1)));                 // deeper
    bad.push_back(listing(folderXml("/f/") + "<d:response><d:href>/f/a</d:href>"
                                             "<d:status>HTTP/1.1 500 No</d:status></d:response>"));
    bad.push_back(listing(folderXml("/f/") + "<d:response></d:response>"));
    bad.push_back({207, {}, std::string(whole).replace(whole.find("/f/a"), 4, "/f/\xFF")});
    for (std::size_t i = 0; i < bad.size(); ++i) {
        tell("PROPFIND /f/", bad[i]);
        const auto listed = remote->list("f", cancel);
        EXPECT_FALSE(listed) << i;
        if (!listed) {
            EXPECT_FALSE(listed.error().is(ErrorCode::noSuchItem)) << i;
            EXPECT_NE(listed.error().localizedDescription, std::nullopt) << i;
        }
    }
    tell("PROPFIND /f/", listing(folderXml("/f/") + fileXml("/f/%2e%2e", 1) +
                                 fileXml("/f/x%2fy", 1) + fileXml("/f/%ff", 1) +
                                 itemXml("/f/sizeless", "<d:resourcetype/>")));
    const auto refused = remote->list("f", cancel);
    ASSERT_TRUE(test::went(refused));
    EXPECT_EQ(refused->entries.size(), 0U);
    EXPECT_EQ(refused->refused.size(), 4U);
}

TEST_F(Answers, EachRefusalHasACodeAndWords) {
    givenConnection();
    const std::map<int, ErrorCode> codes = {
        {400, ErrorCode::serverRefused},    {403, ErrorCode::readNoPermission},
        {405, ErrorCode::serverRefused},    {409, ErrorCode::serverRefused},
        {423, ErrorCode::serverRefused},    {500, ErrorCode::serverRefused},
        {502, ErrorCode::timedOut},         {507, ErrorCode::quotaExceeded},
        {404, ErrorCode::noSuchItem}};
    for (const auto& [status, code] : codes) {
        tell("PROPFIND /x", {status});
        EXPECT_TRUE(endedWith(code, remote->entry("x", cancel))) << status;
    }
    EXPECT_TRUE(endedWith(ErrorCode::writeNoPermission, remote->makeFolder("y", cancel)));
}

TEST_F(Answers, AServerThatAsksToWaitIsLeftAlone) {
    givenConnection();
    tell("PROPFIND /x", {503, {"Retry-After: 30"}});
    EXPECT_TRUE(endedWith(ErrorCode::serverNotAvailable, remote->entry("x", cancel)));
    const int before = timesAsked("PROPFIND");
    tell("PROPFIND /x", listing(fileXml("/x", 1)));
    EXPECT_TRUE(endedWith(ErrorCode::serverNotAvailable, remote->entry("x", cancel)));
    EXPECT_EQ(timesAsked("PROPFIND"), before);
    clock.advance(std::chrono::seconds(31));
    EXPECT_TRUE(test::went(remote->entry("x", cancel)));
}

TEST_F(Answers, ADownloadIsTakenUpWhereItBrokeAndOnlyInTheSameVersion) {
    tell("PROPFIND /x", listing(fileXml("/x", 10)));
    givenConnection();
    // Without a HEAD that could be believed the listing's size counts.
    tell("GET /x", {200, {"ETag: \"e\""}, "0123456789", 60});
    EXPECT_FALSE(content("x"));
    {
        const std::lock_guard lock(mutex);
        EXPECT_EQ(asked.back().method, "PROPFIND"); // whether it is still there
        const auto ranged = std::find_if(asked.rbegin(), asked.rend(), [](const WireRequest& r) {
            return !r.header("Range").empty();
        });
        ASSERT_NE(ranged, asked.rend());
        EXPECT_EQ(ranged->header("If-Range"), "\"e\"");
    }
    tell("GET /x", {200, {"ETag: \"e\""}, "012345678"});
    EXPECT_TRUE(endedWith(ErrorCode::changedWhileRead, content("x"))) << "shorter than it is";
    tell("GET /x", {200, {"ETag: \"e\"", "Content-Encoding: gzip"}, "0123456789"});
    EXPECT_FALSE(content("x"));
    tell("GET /x", {200, {"ETag: \"e\""}, "0123456789"});
    EXPECT_EQ(content("x").toOptional(), "0123456789");
    tell("GET /x",
         {200, {"ETag: \"e\"", "OC-Checksum: SHA256:" + std::string(64, '0')}, "0123456789"});
    EXPECT_FALSE(content("x")) << "it is not what the server says it is";
}

TEST_F(Answers, ASilentServerIsGivenUpAndACancelledWaitEnds) {
    givenConnection();
    WireReply silent;
    silent.silent = true;
    tell("PROPFIND /x", silent);
    EXPECT_TRUE(endedWith(ErrorCode::timedOut, remote->entry("x", cancel)));
    std::thread other([&] {
        while (timesAsked("PROPFIND") < 4)
            std::this_thread::yield();
        cancel.cancel();
    });
    tell("PROPFIND /y", silent);
    EXPECT_TRUE(endedWith(ErrorCode::userCancelled, remote->entry("y", cancel)));
    other.join();
}

TEST_F(Answers, RicherServersTellMore) {
    tell("PROPFIND /", listing(folderXml("/", "<o:id>root</o:id><o:permissions>RDNVCK"
                                              "</o:permissions><d:quota-available-bytes>1000"
                                              "</d:quota-available-bytes>")));
    tell("PROPFIND /f/", listing(folderXml("/f/") +
                                 fileXml("/f/shared", 1,
                                         "<o:id>7</o:id><o:permissions>SRD</o:permissions>")));
    givenConnection();
    const auto listed = remote->list("f", cancel);
    ASSERT_TRUE(test::went(listed));
    EXPECT_EQ(listed->entries.at(0).remoteId, "7");
    EXPECT_EQ(listed->entries.at(0).role, SharedRole::participant);
    EXPECT_EQ(remote->freeBytes(cancel)->value(), 1000U);
}

TEST_F(Answers, ARefusedPasswordIsAskedForOnceMoreAndNeverSentElsewhere) {
    int questions = 0;
    HttpOptions options;
    options.credentials = [&](bool refused) {
        ++questions;
        return std::optional(WebDavCredentials{"user", refused ? "newer" : "older"});
    };
    remote = test::remoteAt(host.url(), clock, options);
    tell("PROPFIND /", {401, {"WWW-Authenticate: Basic realm=\"r\""}});
    EXPECT_TRUE(endedWith(ErrorCode::authenticationFailed, remote->connect(cancel)));
    EXPECT_EQ(questions, 2);
    test::HttpHost other([](const WireRequest&) { return WireReply{500}; });
    bool reached = false;
    test::HttpHost thief([&](const WireRequest& request) {
        reached = reached || !request.header("Authorization").empty();
        return listing(folderXml("/"));
    });
    tell("PROPFIND /", {302, {"Location: " + thief.url()}});
    EXPECT_TRUE(endedWith(ErrorCode::serverNotAvailable, remote->connect(cancel)));
    EXPECT_FALSE(reached);
    tell("PROPFIND /", {301, {"Location: /dav/"}});
    tell("PROPFIND /dav/", listing(folderXml("/dav/")));
    ASSERT_TRUE(test::went(remote->connect(cancel)));
    EXPECT_EQ(remote->address().folder, "/dav");
}

TEST_F(Answers, TheCauseIsSaidWhyNobodyCanSignInThere) {
    const auto problem = [&](const std::string& address, const std::string& password = "secret",
                             const std::string& authorities = "") {
        const WebDavAnswer answer =
            probeWebDav(address, {"user", password}, authorities, clock, cancel);
        EXPECT_EQ(answer.failure.has_value(), answer.problem != WebDavProblem::none);
        EXPECT_EQ(test::wordsOf(answer.failure).find(password), std::string::npos);
        return answer.problem;
    };
    EXPECT_EQ(problem("ftp://x/"), WebDavProblem::address);
    EXPECT_EQ(problem("http://user:pw@127.0.0.1/"), WebDavProblem::address);
    EXPECT_EQ(problem("http://127.0.0.1:" + std::to_string(test::freePort()) + "/"),
              WebDavProblem::unreachable);
    EXPECT_EQ(problem(host.url()), WebDavProblem::none);
    tell("PROPFIND /", {404});
    EXPECT_EQ(problem(host.url()), WebDavProblem::notFound);
    tell("PROPFIND /", {200, {}, "<html/>"});
    EXPECT_EQ(problem(host.url()), WebDavProblem::notWebDav);
    tell("PROPFIND /", {405});
    EXPECT_EQ(problem(host.url()), WebDavProblem::notWebDav);
    const test::DavHost encrypted(test::DavHost::Kind::apache, true);
    EXPECT_EQ(problem(encrypted.url()), WebDavProblem::certificate);
    EXPECT_EQ(problem(encrypted.url(), "wrong", encrypted.certificate()), WebDavProblem::password);
    EXPECT_EQ(problem(encrypted.url(), "secret", encrypted.certificate()), WebDavProblem::none);
}

} // namespace
