#include "platform/cloud/StateDatabase.h"

#include "platform/base/Log.h"
#include "platform/cloud/NameFolding.h"
#include "platform/cloud/StateHandles.h"
#include "platform/cloud/Tokens.h"

#include <algorithm>
#include <charconv>

namespace platform {
namespace {

using sqlite::Name;
using sqlite::Statement;

// Numbers of items are kept ahead of their use, in the database: a promise may be on the disk
// before its item is written down, and after a stop its number must not be given to another item.
constexpr std::string_view nextItemKey = "nextItem";
constexpr std::int64_t numbersAtOnce = 16384;
/// What may be given out between two transactions: two batches of a listing, and some more.
constexpr std::int64_t numbersOnTheWay = 12288;

std::int64_t numberOf(std::string_view text) {
    std::int64_t number = 0;
    std::from_chars(text.data(), text.data() + text.size(), number);
    return number;
}

std::string displacedName(ItemId item) {
    return std::string(1, displacedMark) + std::to_string(item);
}

const char* roleText(SharedRole role) {
    return role == SharedRole::owner         ? "owner"
           : role == SharedRole::participant ? "participant"
                                             : "";
}

/// Identifiers of a database start at a random place, so that promises that outlive a lost database
/// are never taken for items of the one that follows it.
std::string newEpoch() {
    const Bytes random = randomBytes(4);
    std::uint64_t epoch = 0;
    for (const std::byte byte : random)
        epoch = epoch << 8 | std::to_integer<std::uint64_t>(byte);
    return std::to_string((epoch & 0x3fffffff) + 1);
}

} // namespace

StateDatabase::StateDatabase(std::unique_ptr<Handles> handles) : StateQueries(std::move(handles)) {
}

Result<std::unique_ptr<StateDatabase>> StateDatabase::open(const std::string& path, bool thorough) {
    auto handles = std::make_unique<Handles>();
    if (!handles->connection.open(path, sqlite::Connection::Access::write))
        return *handles->connection.takeFault();
    std::unique_ptr<StateDatabase> database(new StateDatabase(std::move(handles)));
    if (Failure failure = database->prepareSchema(thorough))
        return *failure;
    return database;
}

Failure StateDatabase::prepareSchema(bool thorough) {
    sqlite::Connection& connection = handles_->connection;
    bool fresh = true;
    {
        Statement tables(connection, "SELECT 1 FROM sqlite_master LIMIT 1");
        fresh = !tables.step();
    }
    if (Failure fault = takeFault())
        return fault;
    const std::int64_t version = fresh ? stateSchemaVersion : numberOf(meta("schema"));
    if (version > stateSchemaVersion)
        return makeError(ErrorCode::databaseFromLaterVersion);
    connection.execute("PRAGMA journal_mode = WAL; PRAGMA synchronous = FULL;"
                       "PRAGMA foreign_keys = ON; PRAGMA temp_store = MEMORY;"
                       "PRAGMA cache_size = -32000; PRAGMA wal_autocheckpoint = 4000");
    if (fresh) {
        if (Failure failure = transaction([&]() -> Failure {
                connection.execute(stateSchema);
                setMeta("schema", std::to_string(stateSchemaVersion));
                setMeta("epoch", newEpoch());
                return std::nullopt;
            }))
            return failure;
    } else if (version == 1) {
        if (Failure failure = transaction([&]() -> Failure {
                connection.execute(stateMigrationToSecond);
                setMeta("schema", std::to_string(stateSchemaVersion));
                return std::nullopt;
            }))
            return failure;
    } else if (thorough) {
        Statement check(connection, "PRAGMA quick_check(1)");
        if (check.step() && check.text(0) != "ok")
            return makeError(ErrorCode::readCorrupt, "state.db");
    }
    if (Failure fault = takeFault())
        return fault;
    const std::int64_t first = numberOf(meta("epoch")) << 32;
    if (first <= 0) // tables without what every database has since it was made
        return takeFault().value_or(makeError(ErrorCode::readCorrupt, "state.db"));
    Statement last(connection, "SELECT max(id) FROM item WHERE id >= ?1 AND id < ?2");
    next_ = std::max(first + 1, numberOf(meta(nextItemKey)));
    if (last.with(first, first + (1LL << 32)).step() && !last.isNull(0))
        next_ = std::max(next_.load(), last.integer(0) + 1);
    if (Failure fault = takeFault())
        return fault;
    return transaction([] { return Failure(); }); // keeps numbers for this run
}

Failure StateDatabase::beginNewNumbers() {
    const std::string epoch = newEpoch();
    next_ = (numberOf(epoch) << 32) + 1;
    keptUntil_ = 0;
    return transaction([&]() -> Failure {
        setMeta("epoch", epoch);
        return std::nullopt;
    });
}

std::optional<std::int64_t> StateDatabase::keepNumbers() {
    const std::int64_t next = next_.load();
    if (next + numbersOnTheWay <= keptUntil_)
        return std::nullopt;
    const std::int64_t until = next + numbersAtOnce;
    setMeta(nextItemKey, std::to_string(until));
    return until;
}

Failure StateDatabase::transaction(const std::function<Failure()>& work) {
    sqlite::Connection& connection = handles_->connection;
    connection.takeFault(); // of an earlier question that nobody asked about
    if (!connection.execute("BEGIN IMMEDIATE"))
        return takeFault();
    Failure failure = work();
    const std::optional<std::int64_t> kept =
        failure || connection.hasFault() ? std::nullopt : keepNumbers();
    if (!failure && !connection.hasFault() && connection.execute("COMMIT")) {
        keptUntil_ = kept.value_or(keptUntil_);
        return std::nullopt;
    }
    if (!failure)
        failure = takeFault();
    // Some faults (a full disk) have rolled back already; a second time is harmless.
    connection.execute("ROLLBACK");
    connection.takeFault();
    return failure;
}

void StateDatabase::insertItem(const ItemRow& item) {
    std::optional<ItemId> parent;
    std::optional<Name> name;
    std::optional<std::string> folded;
    if (item.place) {
        parent = item.place->parent;
        name = Name{item.place->name};
        folded = foldedName(item.place->name);
    }
    handles_
        ->prepared("INSERT INTO item(id, parent, name, folded, kind) VALUES(?1, ?2, ?3, ?4, ?5)")
        .with(item.id, parent, name, folded, item.kind)
        .run();
}

void StateDatabase::setItemPlace(ItemId item, const std::optional<Place>& place) {
    Statement& update =
        handles_->prepared("UPDATE item SET parent = ?2, name = ?3, folded = ?4 WHERE id = ?1");
    if (place)
        update.with(item, place->parent, Name{place->name}, foldedName(place->name)).run();
    else
        update.with(item, std::nullopt, std::nullopt, std::nullopt).run();
}

void StateDatabase::putRemote(ItemId item, const RemoteRow& row) {
    std::optional<std::int64_t> created;
    if (row.created)
        created = row.created->nanoseconds;
    std::optional<std::string_view> remoteId;
    if (!row.remoteId.empty())
        remoteId = row.remoteId;
    handles_
        ->prepared("INSERT INTO remote(item, parent, name, etag, size, mtime, created, "
                   "remote_id, shared, role, tags, gen) VALUES(?1, ?2, ?3, ?4, ?5, ?6, ?7, ?8, "
                   "?9, ?10, ?11, ?12) ON CONFLICT(item) DO UPDATE SET parent = "
                   "excluded.parent, name = excluded.name, etag = excluded.etag, size = "
                   "excluded.size, mtime = excluded.mtime, created = excluded.created, "
                   "remote_id = excluded.remote_id, shared = excluded.shared, role = "
                   "excluded.role, tags = excluded.tags, gen = excluded.gen")
        .with(item, row.place.parent, Name{row.place.name}, row.etag, row.size,
              row.modified.nanoseconds, created, remoteId, row.role != SharedRole::none,
              roleText(row.role), row.tags, row.generation)
        .run();
}

void StateDatabase::setRemoteGeneration(ItemId item, std::int64_t generation) {
    handles_->prepared("UPDATE remote SET gen = ?2 WHERE item = ?1").with(item, generation).run();
}

void StateDatabase::putLocal(ItemId item, const LocalRow& row) {
    handles_
        ->prepared("INSERT INTO local(item, parent, name, dev, ino, btime, size, mtime_ns, "
                   "ctime_ns, promise, gen) VALUES(?1, ?2, ?3, ?4, ?5, ?6, ?7, ?8, ?9, ?10, "
                   "?11) ON CONFLICT(item) DO UPDATE SET parent = excluded.parent, name = "
                   "excluded.name, dev = excluded.dev, ino = excluded.ino, btime = "
                   "excluded.btime, size = excluded.size, mtime_ns = excluded.mtime_ns, "
                   "ctime_ns = excluded.ctime_ns, promise = excluded.promise, gen = "
                   "excluded.gen")
        .with(item, row.place.parent, Name{row.place.name}, row.identity.device, row.identity.inode,
              row.identity.birthNanoseconds, row.size, row.modified.nanoseconds,
              row.changed.nanoseconds, row.promise, row.generation)
        .run();
}

void StateDatabase::removeLocal(ItemId item) {
    handles_->prepared("DELETE FROM local WHERE item = ?1").with(item).run();
}

// Of the item as the user sees it: its folder and its parts.
#define SHOWN_TREE                                                                                 \
    "WITH RECURSIVE tree(id) AS (SELECT ?1 UNION"                                                  \
    " SELECT item.id FROM item JOIN tree ON item.parent = tree.id) "

void StateDatabase::forgetLocalTree(ItemId item) {
    // The tree is told by the places that it is about to lose.
    handles_->prepared("CREATE TEMP TABLE IF NOT EXISTS gone(id INTEGER PRIMARY KEY)").with().run();
    handles_->prepared("DELETE FROM gone").with().run();
    handles_->prepared("INSERT INTO gone " SHOWN_TREE "SELECT id FROM tree").with(item).run();
    handles_->prepared("DELETE FROM local WHERE item IN (SELECT id FROM gone)").with().run();
    handles_
        ->prepared("UPDATE item SET parent = NULL, name = NULL, folded = NULL"
                   " WHERE id IN (SELECT id FROM gone)")
        .with()
        .run();
    handles_
        ->prepared("DELETE FROM item WHERE id IN (SELECT id FROM gone)"
                   " AND id NOT IN (SELECT item FROM remote) AND id NOT IN (SELECT item FROM base)")
        .with()
        .run();
}

void StateDatabase::removeItem(ItemId item) {
    handles_
        ->prepared("UPDATE item SET parent = NULL, name = NULL, folded = NULL WHERE parent = ?1")
        .with(item)
        .run();
    handles_->prepared("DELETE FROM item WHERE id = ?1").with(item).run();
}

void StateDatabase::displaceRemote(ItemId item) {
    handles_->prepared("UPDATE remote SET name = ?2, gen = gen - 1 WHERE item = ?1")
        .with(item, Name{displacedName(item)})
        .run();
}

void StateDatabase::displaceRemote(ItemId item, ItemId folder) {
    handles_->prepared("UPDATE remote SET parent = ?2, name = ?3, gen = ?4 WHERE item = ?1")
        .with(item, folder, Name{displacedName(item)}, scan(folder, Side::remote).generation - 1)
        .run();
}

void StateDatabase::removeRemote(ItemId item) {
    handles_->prepared("DELETE FROM remote WHERE item = ?1").with(item).run();
}

void StateDatabase::putBase(ItemId item, const BaseRow& row) {
    std::optional<Bytes> hash;
    if (!row.hash.empty())
        hash = row.hash;
    handles_
        ->prepared("INSERT OR REPLACE INTO base(item, parent, name, etag, size, hash, dev, ino,"
                   " btime, mtime_ns, ctime_ns)"
                   " VALUES(?1, ?2, ?3, ?4, ?5, ?6, ?7, ?8, ?9, ?10, ?11)")
        .with(item, row.place.parent, Name{row.place.name}, row.etag, row.size, hash,
              row.identity.device, row.identity.inode, row.identity.birthNanoseconds,
              row.modified.nanoseconds, row.changed.nanoseconds)
        .run();
}

void StateDatabase::removeBase(ItemId item) {
    handles_->prepared("DELETE FROM base WHERE item = ?1").with(item).run();
}

void StateDatabase::moveLocalChildren(ItemId from, ItemId to) {
    handles_->prepared("UPDATE item SET parent = ?2 WHERE parent = ?1").with(from, to).run();
    handles_->prepared("UPDATE local SET parent = ?2 WHERE parent = ?1").with(from, to).run();
}

void StateDatabase::putScan(ItemId folder, Side side, const ScanRow& scan) {
    handles_
        ->prepared("INSERT OR REPLACE INTO folder_scan(item, side, gen, complete)"
                   " VALUES(?1, ?2, ?3, ?4)")
        .with(folder, side, scan.generation, scan.complete)
        .run();
}

void StateDatabase::clearRefused(Side side) {
    handles_->prepared("DELETE FROM refused WHERE side = ?1").with(side).run();
}

void StateDatabase::setRefused(ItemId folder, Side side, const std::vector<RefusedRow>& rows) {
    handles_->prepared("DELETE FROM refused WHERE folder = ?1 AND side = ?2")
        .with(folder, side)
        .run();
    for (const RefusedRow& row : rows)
        handles_
            ->prepared("INSERT OR REPLACE INTO refused(folder, side, name, reason)"
                       " VALUES(?1, ?2, ?3, ?4)")
            .with(folder, side, Name{row.name}, row.reason)
            .run();
}

std::int64_t StateDatabase::putOperation(const OpRow& row) {
    std::optional<std::int64_t> id;
    if (row.id != 0)
        id = row.id;
    std::optional<std::int64_t> nextAt;
    if (row.nextAt)
        nextAt = row.nextAt->nanoseconds;
    handles_
        ->prepared("INSERT OR REPLACE INTO op(id, item, kind, phase, staged, expect_etag, hash,"
                   " offset, tries, next_at, error)"
                   " VALUES(?1, ?2, ?3, ?4, ?5, ?6, ?7, ?8, ?9, ?10, ?11)")
        .with(id, row.item, row.kind, row.phase, row.staged, row.expectEtag, row.hash, row.offset,
              row.tries, nextAt, row.error)
        .run();
    return sqlite3_last_insert_rowid(handles_->connection.handle());
}

void StateDatabase::removeOperation(std::int64_t id) {
    handles_->prepared("DELETE FROM op WHERE id = ?1").with(id).run();
}

void StateDatabase::setMeta(std::string_view name, std::string_view value) {
    handles_->prepared("INSERT OR REPLACE INTO meta(name, value) VALUES(?1, ?2)")
        .with(name, value)
        .run();
}

void StateDatabase::replaceDevice(const std::string& before, const std::string& now) {
    if (!before.empty()) {
        handles_->prepared("UPDATE local SET dev = ?2 WHERE dev = ?1")
            .with(numberOf(before), numberOf(now))
            .run();
        handles_->prepared("UPDATE base SET dev = ?2 WHERE dev = ?1")
            .with(numberOf(before), numberOf(now))
            .run();
    }
    setMeta("device", now);
}

} // namespace platform
