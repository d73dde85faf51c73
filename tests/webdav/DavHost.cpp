#include "tests/webdav/DavHost.h"

#include "tests/webdav/HttpHost.h"

#include <gtest/gtest.h>

#include <poll.h>
#include <unistd.h>

namespace test {
namespace {

constexpr const char* ordinaryUser = "65534";

/// What is made by the superuser belongs to the server's user.
void giveAway(const std::string& path) {
    if (geteuid() == 0)
        run({{"/bin/chown", "-R", std::string(ordinaryUser) + ":" + ordinaryUser, path}});
}

void waitForPort(const std::string& authority) {
    for (int tries = 0; tries < 500; ++tries) {
        if (connectTo(authority))
            return;
        poll(nullptr, 0, 10);
    }
    ADD_FAILURE() << "no server at " << authority;
}

} // namespace

std::string nameOf(DavHost::Kind kind) {
    constexpr const char* names[] = {"apache", "lighttpd", "nginx", "rclone"};
    return names[static_cast<int>(kind)];
}

DavHost::DavHost(Kind kind, bool encrypted)
    : kind_(kind),
      encrypted_(encrypted),
      port_(std::to_string(freePort())),
      authority_("127.0.0.1:" + port_) {
    home_.makeFolder("files");
    home_.makeFolder("run");
    if (encrypted_)
        run({{"/usr/bin/openssl", "req", "-x509", "-newkey", "rsa:2048", "-nodes", "-days", "2",
              "-subj", "/CN=127.0.0.1", "-addext", "subjectAltName=IP:127.0.0.1", "-keyout",
              home_ / "key.pem", "-out", certificate()}});
    Program::Start start = command();
    start.ownGroup = true;
    giveAway(home_.path());
    if (geteuid() == 0) {
        const std::vector<std::string> as = {"/usr/bin/setpriv", "--reuid", ordinaryUser,
                                             "--regid", ordinaryUser, "--clear-groups"};
        start.arguments.insert(start.arguments.begin(), as.begin(), as.end());
    }
    program_ = std::make_unique<Program>(std::move(start));
    waitForPort(authority_);
}

DavHost::~DavHost() = default;

Program::Start DavHost::command() {
    switch (kind_) {
    case Kind::apache:
        configureApache();
        return {{"/usr/sbin/apache2", "-DFOREGROUND", "-f", home_ / "server.conf"}};
    case Kind::lighttpd:
        configureLighttpd();
        return {{"/usr/sbin/lighttpd", "-D", "-f", home_ / "server.conf"}};
    case Kind::nginx:
        configureNginx();
        return {{"/usr/sbin/nginx", "-e", home_ / "run/error.log", "-c", home_ / "server.conf"}};
    case Kind::rclone:
        break;
    }
    return {{"/usr/bin/rclone", "serve", "webdav", folder(), "--addr", authority_, "--user",
             "user", "--pass", "secret", "--dir-cache-time", "1ms", "--config", home_ / "run/rclone.conf"},
            std::vector<std::string>{"HOME=" + home_.path(), "PATH=/usr/bin:/bin"}};
}

void DavHost::configureApache() {
    home_.write("passwords", "user:{SHA}5en6G6MezRroT3XKqkdPOmY/BfQ=\n");
    std::string text = "ServerRoot " + home_.path() + "\nServerName 127.0.0.1\nListen " +
                       authority_ + "\nPidFile run/pid\nErrorLog run/error.log\n" +
                       "DefaultRuntimeDir run\nMutex file:run\nThreadsPerChild 16\n"
                       "ServerLimit 2\nMaxRequestWorkers 32\n";
    for (const char* module :
         {"mpm_event", "authz_core", "authz_user", "authn_core", "authn_file", "auth_basic", "mime",
          "dav", "dav_fs", "socache_shmcb", "ssl"})
        text += std::string("LoadModule ") + module + "_module /usr/lib/apache2/modules/mod_" +
                module + ".so\n";
    text += "TypesConfig /dev/null\nDocumentRoot " + folder() +
            "\nDavLockDB run/locks\n<Directory " + folder() +
            ">\nDav On\nAuthType Basic\nAuthName tests\nAuthUserFile passwords\n"
            "Require valid-user\n</Directory>\n";
    if (encrypted_)
        text += "SSLEngine on\nSSLSessionCache none\nSSLCertificateFile certificate.pem\n"
                "SSLCertificateKeyFile key.pem\n";
    home_.write("server.conf", text);
}

void DavHost::configureLighttpd() {
    // md5("user:tests:secret")
    home_.write("passwords", "user:tests:cb580ba4176a72838aa9419f312a44a9\n");
    home_.write("server.conf",
                "server.modules = (\"mod_auth\", \"mod_authn_file\", \"mod_webdav\")\n"
                "server.stat-cache-engine = \"disable\"\nserver.bind = \"127.0.0.1\"\nserver.port = " +
                    port_ + "\nserver.document-root = \"" + folder() +
                    "\"\nserver.errorlog = \"" + (home_ / "run/error.log") +
                    "\"\nserver.upload-dirs = (\"" + (home_ / "run") +
                    "\")\nmimetype.assign = (\"\" => \"application/octet-stream\")\n"
                    "webdav.activate = \"enable\"\nwebdav.sqlite-db-name = \"" +
                    (home_ / "run/properties.db") +
                    "\"\nauth.backend = \"htdigest\"\nauth.backend.htdigest.userfile = \"" +
                    (home_ / "passwords") +
                    "\"\nauth.require = (\"/\" => (\"method\" => \"digest\", \"realm\" => "
                    "\"tests\", \"require\" => \"valid-user\"))\n");
}

void DavHost::configureNginx() {
    home_.write("passwords", "user:{SHA}5en6G6MezRroT3XKqkdPOmY/BfQ=\n");
    std::string paths;
    for (const char* kind : {"client_body", "proxy", "fastcgi", "uwsgi", "scgi"})
        paths += std::string(kind) + "_temp_path " + (home_ / "run/") + kind + ";\n";
    home_.write("server.conf",
                "load_module /usr/lib/nginx/modules/ngx_http_dav_ext_module.so;\n"
                "daemon off;\nworker_processes 1;\npid " +
                    (home_ / "run/pid") + ";\nevents { worker_connections 256; }\nhttp {\n" +
                    paths + "access_log off;\nserver { listen " + authority_ + "; root " +
                    folder() +
                    ";\nclient_max_body_size 0; keepalive_requests 100000;\n"
                    "auth_basic tests; auth_basic_user_file " +
                    (home_ / "passwords") +
                    ";\nlocation / { dav_methods PUT DELETE MKCOL COPY MOVE; "
                    "dav_ext_methods PROPFIND OPTIONS; } } }\n");
}

} // namespace test
