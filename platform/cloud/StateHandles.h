#pragma once

#include "platform/cloud/Sqlite.h"
#include "platform/cloud/StateDatabase.h"

#include <map>

// Private to the state database's sources.

namespace platform {

struct StateQueries::Handles {
    sqlite::Connection connection;
    std::map<const char*, sqlite::Statement> statements;

    ~Handles() { statements.clear(); }
    /// The statement of that literal, prepared at its first use.
    sqlite::Statement& prepared(const char* text) {
        auto found = statements.find(text);
        if (found == statements.end())
            found = statements.emplace(text, sqlite::Statement(connection, text)).first;
        return found->second;
    }
};

/// The tables of a new database.
extern const char* const stateSchema;
inline constexpr int stateSchemaVersion = 2;
/// Brings the tables of version 1 to version 2.
extern const char* const stateMigrationToSecond;

} // namespace platform
