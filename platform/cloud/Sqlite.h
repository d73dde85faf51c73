#pragma once

#include "platform/base/Result.h"
#include "platform/base/Value.h"

#include <cstdint>
#include <optional>
#include <sqlite3.h>
#include <string>
#include <string_view>
#include <type_traits>
#include <utility>

// Private to platform/cloud: a thin, exception-free skin over the database library. A fault is kept
// by the connection until somebody asks for it, so that a batch of steps needs one test.

namespace platform::sqlite {

class Connection;

/// Names are bytes: bound as a blob so that no text encoding is applied to them.
struct Name {
    std::string_view text;
};

/// A prepared statement. Bind from 1, step, read columns from 0, reset happens by itself.
class Statement {
public:
    Statement() = default;
    Statement(Connection& connection, const char* text);
    ~Statement() { sqlite3_finalize(statement_); }
    Statement(Statement&& other) noexcept
        : connection_(other.connection_), statement_(std::exchange(other.statement_, nullptr)) {}
    Statement& operator=(Statement&& other) noexcept {
        std::swap(connection_, other.connection_);
        std::swap(statement_, other.statement_);
        return *this;
    }

    /// Starts over with these values.
    template<class... Args>
    Statement& with(const Args&... args) {
        sqlite3_reset(statement_);
        int position = 0;
        (bind(++position, args), ...);
        return *this;
    }
    /// Answers true when there is a row. At the end, and on a fault, the statement is reset.
    bool step();
    /// For statements without rows. False on a fault.
    bool run();

    std::int64_t integer(int column) const { return sqlite3_column_int64(statement_, column); }
    bool isNull(int column) const { return sqlite3_column_type(statement_, column) == SQLITE_NULL; }
    std::string text(int column) const;
    Bytes bytes(int column) const;
    void reset() { sqlite3_reset(statement_); }

private:
    template<class T>
    void bind(int position, const T& value) {
        if constexpr (std::is_same_v<T, std::nullopt_t>)
            sqlite3_bind_null(statement_, position);
        else if constexpr (std::is_integral_v<T> || std::is_enum_v<T>)
            sqlite3_bind_int64(statement_, position, static_cast<std::int64_t>(value));
        else if constexpr (std::is_same_v<T, Bytes>)
            bindBlob(position, value.data(), value.size());
        else if constexpr (std::is_same_v<T, Name>)
            bindBlob(position, value.text.data(), value.text.size());
        else
            bindText(position, value);
    }
    template<class T>
    void bind(int position, const std::optional<T>& value) {
        if (value)
            bind(position, *value);
        else
            sqlite3_bind_null(statement_, position);
    }
    void bindText(int position, std::string_view text);
    void bindBlob(int position, const void* data, std::size_t size);

    Connection* connection_ = nullptr;
    sqlite3_stmt* statement_ = nullptr;
};

class Connection {
public:
    Connection() = default;
    ~Connection();
    Connection(const Connection&) = delete;
    Connection& operator=(const Connection&) = delete;

    enum class Access {
        write,
        read,
        /// Where nobody can write, and nothing waits beside it to be taken in.
        readOfFixed
    };
    bool open(const std::string& path, Access access);
    /// Runs statements without rows.
    bool execute(const char* text);
    sqlite3* handle() const { return handle_; }

    /// The first fault since the last call; none when there was none.
    Failure takeFault();
    void noteFault();
    bool hasFault() const { return fault_.has_value(); }

private:
    sqlite3* handle_ = nullptr;
    std::string path_;
    std::optional<Error> fault_;
};

} // namespace platform::sqlite
