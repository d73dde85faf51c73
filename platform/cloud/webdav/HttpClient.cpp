#include "platform/cloud/webdav/HttpClient.h"

#include "platform/cloud/webdav/HttpErrors.h"
#include "platform/cloud/webdav/HttpExchange.h"
#include "platform/cloud/webdav/WebDavAddress.h"

#include <algorithm>
#include <csignal>
#include <curl/curl.h>

namespace platform {
namespace {

/// How soon a cancelled wait ends.
constexpr int pollMilliseconds = 50;
constexpr int pauseSlices = 4;
constexpr long connectSeconds = 20;
constexpr long curlPieceSize = 512L * 1024;
constexpr int redirectsAtMost = 5;
/// Longer than that nobody is left alone on a server's word.
constexpr std::int64_t longestWait = 3600;

void prepareLibrary() {
    static const bool once = [] {
        curl_global_init(CURL_GLOBAL_ALL);
        // A connection that the other side closed is an error of the write and no end of the
        // program.
        if (struct sigaction now {}; sigaction(SIGPIPE, nullptr, &now) == 0 &&
                                     now.sa_handler == SIG_DFL)
            std::signal(SIGPIPE, SIG_IGN);
        return true;
    }();
    static_cast<void>(once);
}

bool changesNothing(const std::string& method) {
    return method == "GET" || method == "HEAD" || method == "PROPFIND";
}

} // namespace

struct HttpClient::Lane {
    std::unique_ptr<CURLM, CurlCloser<&curl_multi_cleanup>> multi{curl_multi_init()};
    std::unique_ptr<CURL, CurlCloser<&curl_easy_cleanup>> easy{curl_easy_init()};
};

HttpClient::HttpClient(HttpOptions options, Clock& clock)
    : options_(std::move(options)), clock_(clock) {
    prepareLibrary();
}

HttpClient::~HttpClient() = default;

std::unique_ptr<HttpClient::Lane> HttpClient::borrow() {
    {
        const std::lock_guard lock(mutex_);
        if (!idle_.empty()) {
            std::unique_ptr<Lane> lane = std::move(idle_.back());
            idle_.pop_back();
            return lane;
        }
    }
    return std::make_unique<Lane>();
}

void HttpClient::giveBack(std::unique_ptr<Lane> lane) {
    const std::lock_guard lock(mutex_);
    idle_.push_back(std::move(lane));
}

// The handle is not reset between requests: it knows the server's challenge, and every option that
// differs from request to request is set each time.
void HttpClient::prepare(Lane& lane, HttpExchange& exchange) {
    CURL* const easy = lane.easy.get();
    const HttpRequest& request = exchange.request;
    const auto set = [easy](CURLoption option, auto value) {
        curl_easy_setopt(easy, option, value);
    };
    set(CURLOPT_URL, request.url.c_str());
    set(CURLOPT_PROTOCOLS_STR, "http,https");
    set(CURLOPT_HTTP_VERSION, static_cast<long>(CURL_HTTP_VERSION_1_1));
    set(CURLOPT_NOSIGNAL, 1L);
    set(CURLOPT_CONNECTTIMEOUT, connectSeconds);
    set(CURLOPT_LOW_SPEED_LIMIT, 1L);
    set(CURLOPT_LOW_SPEED_TIME,
        static_cast<long>(std::chrono::ceil<std::chrono::seconds>(options_.stall).count()));
    set(CURLOPT_BUFFERSIZE, curlPieceSize);
    set(CURLOPT_UPLOAD_BUFFERSIZE, curlPieceSize);
    set(CURLOPT_SSL_VERIFYPEER, 1L);
    set(CURLOPT_SSL_VERIFYHOST, 2L);
    if (!options_.authorities.empty()) // beside the system's, which stay in their folder
        set(CURLOPT_CAINFO, options_.authorities.c_str());
    set(CURLOPT_ERRORBUFFER, exchange.detail);
    set(CURLOPT_HEADERFUNCTION, &HttpExchange::onHeader);
    set(CURLOPT_HEADERDATA, &exchange);
    set(CURLOPT_WRITEFUNCTION, &HttpExchange::onBody);
    set(CURLOPT_WRITEDATA, &exchange);
    set(CURLOPT_READFUNCTION, &HttpExchange::onRead);
    set(CURLOPT_READDATA, &exchange);
    set(CURLOPT_SEEKFUNCTION, &HttpExchange::onSeek);
    set(CURLOPT_SEEKDATA, &exchange);

    set(CURLOPT_UPLOAD, 0L);
    set(CURLOPT_NOBODY, 0L);
    set(CURLOPT_HTTPGET, 1L);
    set(CURLOPT_CUSTOMREQUEST, static_cast<char*>(nullptr));
    if (request.method == "HEAD") {
        set(CURLOPT_NOBODY, 1L);
    } else if (request.upload) {
        set(CURLOPT_UPLOAD, 1L);
        set(CURLOPT_INFILESIZE_LARGE, static_cast<curl_off_t>(request.upload->size));
    } else if (request.method != "GET") {
        if (!request.body.empty()) {
            set(CURLOPT_POSTFIELDSIZE, static_cast<long>(request.body.size()));
            set(CURLOPT_POSTFIELDS, request.body.c_str());
        }
        set(CURLOPT_CUSTOMREQUEST, request.method.c_str());
    }
    for (const std::string& header : request.headers)
        exchange.headers.reset(curl_slist_append(exchange.headers.release(), header.c_str()));
    set(CURLOPT_HTTPHEADER, exchange.headers.get());

    unsigned long schemes = 0;
    {
        const std::lock_guard lock(mutex_);
        schemes = schemes_;
    }
    exchange.credentials = credentials();
    const std::optional<WebDavCredentials>& who = exchange.credentials;
    set(CURLOPT_HTTPAUTH, schemes != 0 ? schemes : CURLAUTH_BASIC | CURLAUTH_DIGEST);
    set(CURLOPT_USERNAME, who ? who->user.c_str() : nullptr);
    set(CURLOPT_PASSWORD, who ? who->password.c_str() : nullptr);
}

HttpResult HttpClient::once(const HttpRequest& request,
                            std::optional<WebDavCredentials>& who, CancelFlag& cancel) {
    HttpExchange exchange{request, cancel};
    if (request.upload && request.upload->size == 0)
        if (Failure failure = exchange.checkEnd())
            return {HttpTrouble::caller, std::move(failure), {}};
    std::unique_ptr<Lane> lane = borrow();
    CURLM* const multi = lane->multi.get();
    CURL* const easy = lane->easy.get();
    prepare(*lane, exchange);
    curl_multi_add_handle(multi, easy);
    int running = 1;
    while (running > 0 && !exchange.failure) {
        if (curl_multi_perform(multi, &running) != CURLM_OK)
            break;
        if (running > 0 && !cancel.isCancelled())
            curl_multi_poll(multi, nullptr, 0, pollMilliseconds, nullptr);
        if (cancel.isCancelled())
            exchange.stop({});
    }
    CURLcode code = CURLE_ABORTED_BY_CALLBACK;
    for (int left = 0; const CURLMsg* message = curl_multi_info_read(multi, &left);)
        if (message->msg == CURLMSG_DONE)
            code = message->data.result;
    long offered = 0;
    curl_easy_getinfo(easy, CURLINFO_HTTPAUTH_AVAIL, &offered);
    curl_multi_remove_handle(multi, easy); // closes the connection of a request that is not over
    giveBack(std::move(lane));

    if (exchange.failure)
        return {HttpTrouble::caller, std::move(exchange.failure), {}};
    if (code != CURLE_OK)
        return brokenResult(code, exchange.detail, request.url);
    if (offered != 0) {
        // Without being asked the password goes along where nobody can read it on the way, or where
        // the server takes nothing else.
        const bool basic = (offered & static_cast<long>(CURLAUTH_BASIC)) != 0;
        const bool digest = (offered & static_cast<long>(CURLAUTH_DIGEST)) != 0;
        const std::lock_guard lock(mutex_);
        if (basic && (!digest || request.url.starts_with("https:")))
            schemes_ = CURLAUTH_BASIC;
        else if (digest)
            schemes_ = CURLAUTH_DIGEST;
    }
    who = std::move(exchange.credentials);
    return {{}, {}, std::move(exchange.reply)};
}

HttpResult HttpClient::perform(const HttpRequest& request, CancelFlag& cancel) {
    HttpRequest sent = request;
    bool again = false;
    for (int redirects = 0;;) {
        if (cancel.isCancelled())
            return {HttpTrouble::caller, makeError(ErrorCode::userCancelled), {}};
        if (std::optional<HttpResult> waiting = mustWait())
            return std::move(*waiting);
        std::optional<WebDavCredentials> who;
        HttpResult result = once(sent, who, cancel);
        if (!result.ok())
            return result;
        const HttpReply& reply = result.reply;
        noteReply(reply);
        if (reply.status == 401) {
            if (again || !renewCredentials(who)) {
                const std::lock_guard lock(asking_);
                asked_ = false; // the next request asks anew: somebody may have signed in by then
                return passwordResult();
            }
            again = true;
            continue;
        }
        if (reply.status == 429 || reply.status == 503) {
            noteWait(reply);
            if (std::optional<HttpResult> waiting = mustWait())
                return std::move(*waiting);
        }
        const bool sentOn = reply.status >= 301 && reply.status <= 308 && reply.status != 304;
        if (!sentOn) {
            result.reply.url = std::move(sent.url);
            return result;
        }
        const std::string where(reply.header("location"));
        const Result<WebDavAddress> from = WebDavAddress::parse(sent.url);
        const Result<WebDavAddress> to =
            WebDavAddress::parse(where.starts_with('/') && from ? from->origin + where : where);
        if (!from || !to || from->origin != to->origin || !changesNothing(sent.method) ||
            ++redirects > redirectsAtMost)
            return elsewhereResult(where);
        sent.url = to->urlOf("", where.ends_with('/'));
        if (!where.ends_with('/') && !to->folder.empty())
            sent.url.pop_back();
    }
}

bool HttpClient::pause(CancelFlag& cancel) {
    std::unique_ptr<Lane> lane = borrow();
    for (int slice = 0; slice < pauseSlices && !cancel.isCancelled(); ++slice)
        curl_multi_poll(lane->multi.get(), nullptr, 0, pollMilliseconds, nullptr);
    giveBack(std::move(lane));
    return !cancel.isCancelled();
}

std::optional<WebDavCredentials> HttpClient::credentials() {
    const std::lock_guard lock(asking_);
    if (!std::exchange(asked_, true) && options_.credentials)
        credentials_ = options_.credentials(false);
    return credentials_;
}

bool HttpClient::renewCredentials(const std::optional<WebDavCredentials>& refused) {
    const std::lock_guard lock(asking_);
    if (credentials_ != refused) // another request has asked meanwhile
        return credentials_.has_value();
    if (!options_.credentials)
        return false;
    std::optional<WebDavCredentials> fresh = options_.credentials(true);
    if (!fresh)
        return false;
    credentials_ = std::move(fresh);
    return true;
}

void HttpClient::noteReply(const HttpReply& reply) {
    const std::optional<Date> date = reply.date();
    if (!date)
        return;
    const std::lock_guard lock(mutex_);
    serverOffset_ = Duration(date->nanoseconds) - clock_.monotonic();
}

Date HttpClient::serverNow() const {
    const std::lock_guard lock(mutex_);
    return serverOffset_ ? Date{(clock_.monotonic() + *serverOffset_).count()} : clock_.now();
}

void HttpClient::noteWait(const HttpReply& reply) {
    std::int64_t seconds = 0;
    if (const std::optional<std::uint64_t> told = reply.number("retry-after"))
        seconds = static_cast<std::int64_t>(std::min<std::uint64_t>(*told, longestWait));
    else if (const auto until = dateOfHttpText(reply.header("retry-after")))
        seconds = static_cast<std::int64_t>(until->secondsSince(reply.date().value_or(*until)));
    seconds = std::clamp<std::int64_t>(seconds, 1, longestWait);
    const std::lock_guard lock(mutex_);
    notBefore_ = clock_.monotonic() + std::chrono::seconds(seconds);
}

std::optional<HttpResult> HttpClient::mustWait() {
    const std::lock_guard lock(mutex_);
    const Duration left = notBefore_ - clock_.monotonic();
    if (left <= Duration::zero())
        return std::nullopt;
    return waitResult(std::chrono::ceil<std::chrono::seconds>(left).count());
}

} // namespace platform
