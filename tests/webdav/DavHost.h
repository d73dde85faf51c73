#pragma once

#include "tests/support/Program.h"
#include "tests/support/TemporaryFolder.h"

#include <memory>
#include <string>

namespace test {

/// A real WebDAV server on loopback with an empty folder, run as an ordinary user from a
/// configuration of its own; ends with the object. Signs in "user" with "secret".
class DavHost {
public:
    enum class Kind { apache, lighttpd, nginx, rclone };
    explicit DavHost(Kind kind, bool encrypted = false);
    ~DavHost();
    DavHost(const DavHost&) = delete;
    DavHost& operator=(const DavHost&) = delete;

    /// "127.0.0.1:PORT"
    const std::string& authority() const { return authority_; }
    std::string url() const { return (encrypted_ ? "https://" : "http://") + authority_ + '/'; }
    /// Where its files lie on the disk.
    std::string folder() const { return home_ / "files"; }
    /// The certificate of an encrypted one, which nobody else trusts.
    std::string certificate() const { return home_ / "certificate.pem"; }

private:
    Program::Start command();
    void configureApache();
    void configureLighttpd();
    void configureNginx();

    TemporaryFolder home_;
    Kind kind_;
    bool encrypted_;
    std::string port_;
    std::string authority_;
    std::unique_ptr<Program> program_;
};

/// As the tests' names tell it.
std::string nameOf(DavHost::Kind kind);

} // namespace test
