#include "platform/cloud/Sqlite.h"

#include "platform/base/Text.h"

namespace platform::sqlite {
namespace {

/// How long a writer of another process (a listing in a terminal) is waited for.
constexpr int busyMilliseconds = 10'000;

Error errorFor(int code, int systemNumber, const std::string& path, const char* reason) {
    const Url file = Url::file(path);
    Error error = makeError(ErrorCode::databaseUnusable);
    switch (code & 0xFF) {
    case SQLITE_FULL:
        error = makeError(ErrorCode::outOfSpace, file.lastPathComponent());
        break;
    case SQLITE_CORRUPT:
    case SQLITE_NOTADB:
        error = makeError(ErrorCode::readCorrupt, file.lastPathComponent());
        break;
    case SQLITE_BUSY:
    case SQLITE_LOCKED:
        error = makeError(ErrorCode::itemBusy, file.lastPathComponent());
        break;
    case SQLITE_READONLY:
        error = makeError(ErrorCode::writeNoPermission, file.lastPathComponent());
        break;
    case SQLITE_IOERR:
    case SQLITE_CANTOPEN:
        if (systemNumber != 0)
            error = posixError(systemNumber, file, true);
        break;
    default:
        break;
    }
    error.localizedFailureReason = reason;
    return error;
}

} // namespace

Statement::Statement(Connection& connection, const char* text) : connection_(&connection) {
    if (sqlite3_prepare_v3(connection.handle(), text, -1, SQLITE_PREPARE_PERSISTENT, &statement_,
                           nullptr) != SQLITE_OK)
        connection.noteFault();
}

bool Statement::step() {
    if (!statement_)
        return false;
    const int result = sqlite3_step(statement_);
    if (result == SQLITE_ROW)
        return true;
    if (result != SQLITE_DONE)
        connection_->noteFault();
    sqlite3_reset(statement_);
    return false;
}

bool Statement::run() {
    if (!statement_)
        return false;
    const int result = sqlite3_step(statement_);
    if (result != SQLITE_DONE && result != SQLITE_ROW)
        connection_->noteFault();
    sqlite3_reset(statement_);
    return result == SQLITE_DONE || result == SQLITE_ROW;
}

std::string Statement::text(int column) const {
    const void* data = sqlite3_column_blob(statement_, column);
    const int size = sqlite3_column_bytes(statement_, column);
    return data ? std::string(static_cast<const char*>(data), static_cast<std::size_t>(size))
                : std::string();
}

Bytes Statement::bytes(int column) const {
    const auto* data = static_cast<const std::byte*>(sqlite3_column_blob(statement_, column));
    const int size = sqlite3_column_bytes(statement_, column);
    return data ? Bytes(data, data + size) : Bytes();
}

void Statement::bindText(int position, std::string_view text) {
    sqlite3_bind_text64(statement_, position, text.data() ? text.data() : "", text.size(),
                        SQLITE_STATIC, SQLITE_UTF8);
}

void Statement::bindBlob(int position, const void* data, std::size_t size) {
    sqlite3_bind_blob64(statement_, position, size ? data : "", size, SQLITE_STATIC);
}

Connection::~Connection() {
    sqlite3_close_v2(handle_);
}

bool Connection::open(const std::string& path, Access access) {
    path_ = path;
    const int flags = access == Access::write ? SQLITE_OPEN_READWRITE | SQLITE_OPEN_CREATE
                                              : SQLITE_OPEN_READONLY | SQLITE_OPEN_URI;
    const std::string name = access == Access::readOfFixed
                                 ? Url::file(path).absoluteString() + "?immutable=1"
                                 : path;
    const int result = sqlite3_open_v2(
        name.c_str(), &handle_, flags | SQLITE_OPEN_NOMUTEX | SQLITE_OPEN_EXRESCODE, nullptr);
    if (result != SQLITE_OK) {
        noteFault();
        return false;
    }
    sqlite3_busy_timeout(handle_, busyMilliseconds);
    return true;
}

bool Connection::execute(const char* text) {
    if (sqlite3_exec(handle_, text, nullptr, nullptr, nullptr) == SQLITE_OK)
        return true;
    noteFault();
    return false;
}

Failure Connection::takeFault() {
    return std::exchange(fault_, std::nullopt);
}

void Connection::noteFault() {
    if (fault_)
        return;
    fault_ = errorFor(handle_ ? sqlite3_extended_errcode(handle_) : SQLITE_NOMEM,
                      handle_ ? sqlite3_system_errno(handle_) : 0, path_,
                      handle_ ? sqlite3_errmsg(handle_) : "no memory");
}

} // namespace platform::sqlite
