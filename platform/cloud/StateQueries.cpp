#include "platform/cloud/NameFolding.h"
#include "platform/cloud/StateHandles.h"

#include <algorithm>
#include <charconv>
#include <unistd.h>

namespace platform {
namespace {

using sqlite::Name;
using sqlite::Statement;

/// The columns of a whole state, in the order in which readState takes them.
#define STATE_COLUMNS                                                                              \
    "SELECT i.id, i.kind, i.parent, i.name,"                                                       \
    " r.parent, r.name, r.etag, r.size, r.mtime, r.created, r.remote_id, r.role, r.tags, r.gen,"   \
    " l.parent, l.name, l.dev, l.ino, l.btime, l.size, l.mtime_ns, l.ctime_ns, l.promise, l.gen,"  \
    " b.parent, b.name, b.etag, b.size, b.hash, b.dev, b.ino, b.btime, b.mtime_ns, b.ctime_ns"     \
    " FROM item i LEFT JOIN remote r ON r.item = i.id LEFT JOIN local l ON l.item = i.id"          \
    " LEFT JOIN base b ON b.item = i.id "

SharedRole roleOf(std::string_view text) {
    if (text == "owner")
        return SharedRole::owner;
    return text == "participant" ? SharedRole::participant : SharedRole::none;
}

RemoteRow readRemote(const Statement& row, int at) {
    RemoteRow remote;
    remote.place = {row.integer(at), row.text(at + 1)};
    remote.etag = row.text(at + 2);
    remote.size = static_cast<std::uint64_t>(row.integer(at + 3));
    remote.modified = {row.integer(at + 4)};
    if (!row.isNull(at + 5))
        remote.created = Date{row.integer(at + 5)};
    remote.remoteId = row.text(at + 6);
    remote.role = roleOf(row.text(at + 7));
    remote.tags = row.text(at + 8);
    remote.generation = row.integer(at + 9);
    return remote;
}

LocalRow readLocal(const Statement& row, int at) {
    LocalRow local;
    local.place = {row.integer(at), row.text(at + 1)};
    local.identity = {static_cast<std::uint64_t>(row.integer(at + 2)),
                      static_cast<std::uint64_t>(row.integer(at + 3)), row.integer(at + 4)};
    local.size = static_cast<std::uint64_t>(row.integer(at + 5));
    local.modified = {row.integer(at + 6)};
    local.changed = {row.integer(at + 7)};
    local.promise = row.integer(at + 8) != 0;
    local.generation = row.integer(at + 9);
    return local;
}

BaseRow readBase(const Statement& row, int at) {
    BaseRow base;
    base.place = {row.integer(at), row.text(at + 1)};
    base.etag = row.text(at + 2);
    base.size = static_cast<std::uint64_t>(row.integer(at + 3));
    base.hash = row.bytes(at + 4);
    base.identity = {static_cast<std::uint64_t>(row.integer(at + 5)),
                     static_cast<std::uint64_t>(row.integer(at + 6)), row.integer(at + 7)};
    base.modified = {row.integer(at + 8)};
    base.changed = {row.integer(at + 9)};
    return base;
}

ItemState readState(const Statement& row) {
    ItemState state;
    state.item.id = row.integer(0);
    state.item.kind = static_cast<ItemKind>(row.integer(1));
    if (!row.isNull(2) && !row.isNull(3))
        state.item.place = Place{row.integer(2), row.text(3)};
    if (!row.isNull(4))
        state.remote = readRemote(row, 4);
    if (!row.isNull(14))
        state.local = readLocal(row, 14);
    if (!row.isNull(24))
        state.base = readBase(row, 24);
    return state;
}

std::vector<ItemState> readStates(Statement& rows) {
    std::vector<ItemState> states;
    while (rows.step())
        states.push_back(readState(rows));
    return states;
}

std::optional<std::int64_t> firstItem(Statement& row) {
    if (!row.step())
        return std::nullopt;
    const std::int64_t number = row.integer(0);
    row.reset();
    return number;
}

/// Deeper than any path that the system takes; a circle of damaged rows ends here.
constexpr int deepest = 4096;

/// Follows `parents` (columns parent, name of one item) up to the root.
std::optional<std::string> pathUpwards(Statement& parents, ItemId item) {
    std::string path;
    for (int depth = 0; item != rootItem; ++depth) {
        if (depth == deepest || !parents.with(item).step() || parents.isNull(0) ||
            parents.isNull(1))
            return std::nullopt;
        path.insert(0, path.empty() ? parents.text(1) : parents.text(1) + '/');
        item = parents.integer(0);
        parents.reset();
    }
    return path;
}

} // namespace

StateQueries::StateQueries(std::unique_ptr<Handles> handles) : handles_(std::move(handles)) {
}
StateQueries::~StateQueries() = default;

Failure StateQueries::takeFault() {
    return handles_->connection.takeFault();
}

std::optional<ItemState> StateQueries::state(ItemId item) {
    Statement& row = handles_->prepared(STATE_COLUMNS "WHERE i.id = ?1");
    if (!row.with(item).step())
        return std::nullopt;
    ItemState state = readState(row);
    row.reset();
    return state;
}

std::vector<ItemState> StateQueries::childrenOf(ItemId folder) {
    return readStates(handles_
                          ->prepared(STATE_COLUMNS
                                     "WHERE i.id IN (SELECT id FROM item WHERE parent = ?1"
                                     " UNION SELECT item FROM remote WHERE parent = ?1"
                                     " UNION SELECT item FROM local WHERE parent = ?1)")
                          .with(folder));
}

std::optional<ItemId> StateQueries::itemAt(const Place& place) {
    Statement& row = handles_->prepared("SELECT id FROM item WHERE parent = ?1 AND name = ?2");
    if (!row.with(place.parent, Name{place.name}).step())
        return std::nullopt;
    const ItemId item = row.integer(0);
    row.reset();
    return item;
}

std::optional<ItemId> StateQueries::itemAtPath(std::string_view path) {
    ItemId item = rootItem;
    while (!path.empty()) {
        const std::size_t slash = path.find('/');
        const std::optional<ItemId> next = itemAt({item, std::string(path.substr(0, slash))});
        if (!next)
            return std::nullopt;
        item = *next;
        path.remove_prefix(slash == std::string_view::npos ? path.size() : slash + 1);
    }
    return item;
}

std::optional<std::string> StateQueries::pathOf(ItemId item) {
    return pathUpwards(handles_->prepared("SELECT parent, name FROM item WHERE id = ?1"), item);
}

std::optional<std::string> StateQueries::remotePathOf(ItemId item) {
    return pathUpwards(handles_->prepared("SELECT parent, name FROM remote WHERE item = ?1"), item);
}

std::vector<ItemId> StateQueries::itemsNamed(std::string_view text, std::size_t limit) {
    Statement& rows = handles_->prepared(
        "SELECT id FROM item WHERE name IS NOT NULL AND id <> 1 AND instr(folded, ?1) LIMIT ?2");
    const std::string folded = foldedName(text);
    rows.with(folded, limit);
    std::vector<ItemId> items;
    while (rows.step())
        items.push_back(rows.integer(0));
    return items;
}

ScanRow StateQueries::scan(ItemId folder, Side side) {
    Statement& row =
        handles_->prepared("SELECT gen, complete FROM folder_scan WHERE item = ?1 AND side = ?2");
    if (!row.with(folder, side).step())
        return {};
    const ScanRow scan{row.integer(0), row.integer(1) != 0};
    row.reset();
    return scan;
}

std::vector<ItemId> StateQueries::unfinishedScans(Side side) {
    Statement& rows = handles_->prepared(
        "SELECT item FROM folder_scan WHERE side = ?1 AND complete = 0 ORDER BY item");
    rows.with(side);
    std::vector<ItemId> items;
    while (rows.step())
        items.push_back(rows.integer(0));
    return items;
}

std::vector<OpRow> StateQueries::operations() {
    Statement& rows =
        handles_->prepared("SELECT id, item, kind, phase, staged, expect_etag, hash, offset, tries,"
                           " next_at, error FROM op ORDER BY id");
    rows.with();
    std::vector<OpRow> operations;
    while (rows.step()) {
        OpRow op{rows.integer(0),
                 rows.integer(1),
                 rows.text(2),
                 rows.text(3),
                 rows.text(4),
                 rows.text(5),
                 rows.bytes(6),
                 static_cast<std::uint64_t>(rows.integer(7)),
                 static_cast<int>(rows.integer(8)),
                 std::nullopt,
                 rows.text(10)};
        if (!rows.isNull(9))
            op.nextAt = Date{rows.integer(9)};
        operations.push_back(std::move(op));
    }
    return operations;
}

std::vector<RefusedRow> StateQueries::refused(ItemId folder, Side side) {
    Statement& rows = handles_->prepared(
        "SELECT name, reason FROM refused WHERE folder = ?1 AND side = ?2 ORDER BY name");
    rows.with(folder, side);
    std::vector<RefusedRow> refused;
    while (rows.step())
        refused.push_back({rows.text(0), rows.text(1)});
    return refused;
}

// As isAgreed() has it, for the database to find out.
std::vector<ItemState> StateQueries::disagreements() {
    return readStates(
        handles_
            ->prepared(STATE_COLUMNS
                       "WHERE i.id <> 1 AND (r.item IS NULL OR l.item IS NULL OR b.item IS NULL"
                       " OR l.parent <> b.parent OR l.name <> b.name"
                       " OR r.parent <> b.parent OR r.name <> b.name"
                       " OR (i.kind = 0 AND (r.etag <> b.etag OR (l.promise = 0 AND ("
                       "   b.hash IS NULL OR l.ino <> b.ino OR l.dev <> b.dev OR"
                       "   l.btime <> b.btime OR l.size <> b.size OR"
                       "   l.mtime_ns <> b.mtime_ns OR l.ctime_ns <> b.ctime_ns)))))")
            .with());
}

std::optional<ItemId> StateQueries::localItemAt(const Place& place) {
    Statement& row = handles_->prepared("SELECT item FROM local WHERE parent = ?1 AND name = ?2");
    return firstItem(row.with(place.parent, Name{place.name}));
}

std::optional<ItemId> StateQueries::remoteItemAt(const Place& place) {
    Statement& row = handles_->prepared("SELECT item FROM remote WHERE parent = ?1 AND name = ?2");
    return firstItem(row.with(place.parent, Name{place.name}));
}

std::optional<ItemId> StateQueries::itemOfRemoteId(std::string_view remoteId) {
    Statement& row = handles_->prepared("SELECT item FROM remote WHERE remote_id = ?1");
    return firstItem(row.with(remoteId));
}

std::vector<ItemState> StateQueries::localItems() {
    return readStates(handles_->prepared(STATE_COLUMNS "WHERE l.item IS NOT NULL").with());
}

std::vector<ItemState> StateQueries::localItemsIn(ItemId folder) {
    return readStates(handles_
                          ->prepared(STATE_COLUMNS
                                     "WHERE i.id IN (SELECT item FROM local WHERE parent = ?1)")
                          .with(folder));
}

std::vector<ItemState> StateQueries::localItemsOf(const FileIdentity& identity) {
    return readStates(
        handles_
            ->prepared(STATE_COLUMNS "WHERE i.id IN (SELECT item FROM local WHERE ino = ?1"
                                     " AND dev = ?2 AND btime = ?3 AND promise = 0)")
            .with(identity.inode, identity.device, identity.birthNanoseconds));
}

std::optional<std::string> StateQueries::localPathOf(ItemId item) {
    return pathUpwards(handles_->prepared("SELECT parent, name FROM local WHERE item = ?1"), item);
}

std::vector<ItemId> StateQueries::missingFromRemote(int listings) {
    Statement& rows = handles_->prepared(
        "SELECT r.item FROM remote r JOIN folder_scan s ON s.item = r.parent AND s.side = 0"
        " WHERE s.complete = 1 AND r.gen <= s.gen - ?1 ORDER BY r.item");
    rows.with(listings);
    std::vector<ItemId> items;
    while (rows.step())
        items.push_back(rows.integer(0));
    return items;
}

std::vector<ItemId> StateQueries::treeOf(ItemId item, Side side) {
    Statement& rows = handles_->prepared(
        side == Side::remote
            ? "WITH RECURSIVE tree(id) AS (SELECT ?1 UNION SELECT remote.item FROM remote JOIN"
              " tree ON remote.parent = tree.id) SELECT id FROM tree"
            : "WITH RECURSIVE tree(id) AS (SELECT ?1 UNION SELECT local.item FROM local JOIN"
              " tree ON local.parent = tree.id) SELECT id FROM tree");
    rows.with(item);
    std::vector<ItemId> items;
    while (rows.step())
        items.push_back(rows.integer(0));
    return items;
}

std::int64_t StateQueries::refusedCount(Side side) {
    return firstItem(handles_->prepared("SELECT count(*) FROM refused WHERE side = ?1").with(side))
        .value_or(0);
}

std::vector<RefusedRow> StateQueries::refusedPaths(std::size_t limit) {
    struct Found {
        ItemId folder;
        RefusedRow row;
    };
    std::vector<Found> found;
    Statement& rows = handles_->prepared(
        "SELECT folder, name, reason FROM refused ORDER BY folder, name LIMIT ?1");
    rows.with(static_cast<std::int64_t>(limit));
    while (rows.step())
        found.push_back({rows.integer(0), {rows.text(1), rows.text(2)}});
    std::vector<RefusedRow> refused;
    for (Found& each : found) {
        const std::string folder = pathOf(each.folder).value_or("");
        if (!folder.empty())
            each.row.name = folder + '/' + each.row.name;
        refused.push_back(std::move(each.row));
    }
    return refused;
}

std::vector<std::pair<ItemId, std::string>> StateQueries::remoteFolders() {
    Statement& rows = handles_->prepared(
        "WITH RECURSIVE tree(id, path) AS (SELECT 1, '' UNION ALL SELECT r.item,"
        " CASE tree.path WHEN '' THEN '' ELSE tree.path || '/' END || CAST(r.name AS TEXT)"
        " FROM remote r JOIN item i ON i.id = r.item JOIN tree ON r.parent = tree.id"
        " WHERE i.kind = 1) SELECT id, path FROM tree");
    rows.with();
    std::vector<std::pair<ItemId, std::string>> folders;
    while (rows.step())
        folders.emplace_back(rows.integer(0), rows.text(1));
    return folders;
}

std::int64_t StateQueries::agreedItems() {
    return firstItem(handles_->prepared("SELECT count(*) FROM base").with()).value_or(0);
}

std::int64_t StateQueries::agreedItemsIn(ItemId folder) {
    return firstItem(
               handles_
                   ->prepared("WITH RECURSIVE tree(id) AS (SELECT item FROM base WHERE parent = ?1"
                              " UNION SELECT base.item FROM base JOIN tree ON base.parent ="
                              " tree.id) SELECT count(*) FROM tree")
                   .with(folder))
        .value_or(0);
}

std::vector<ItemState> StateQueries::sharedItems() {
    return readStates(
        handles_->prepared(STATE_COLUMNS "WHERE r.shared = 1 AND l.item IS NOT NULL").with());
}

StoreCounts StateQueries::counts() {
    StoreCounts counts;
    Statement& row = handles_->prepared(
        "SELECT (SELECT count(*) FROM item WHERE kind = 1 AND id <> 1),"
        " (SELECT count(*) FROM item WHERE kind = 0),"
        " (SELECT count(*) FROM local WHERE promise = 1),"
        " (SELECT coalesce(sum(r.size), 0) FROM remote r JOIN item i ON i.id = r.item"
        "  WHERE i.kind = 0),"
        " (SELECT count(*) FROM refused)");
    if (row.with().step()) {
        counts = {row.integer(0), row.integer(1), row.integer(2), row.integer(3), row.integer(4)};
        row.reset();
    }
    return counts;
}

std::string StateQueries::meta(std::string_view name) {
    Statement& row = handles_->prepared("SELECT value FROM meta WHERE name = ?1");
    if (!row.with(name).step())
        return {};
    std::string value = row.text(0);
    row.reset();
    return value;
}

class StateReader::Queries final : public StateQueries {
public:
    explicit Queries(std::unique_ptr<Handles> handles) : StateQueries(std::move(handles)) {}

    /// An error also when it is none of this version's.
    static Result<std::unique_ptr<StateQueries>> open(const std::string& path,
                                                      sqlite::Connection::Access access) {
        auto handles = std::make_unique<Handles>();
        if (!handles->connection.open(path, access))
            return *handles->connection.takeFault();
        auto queries = std::make_unique<Queries>(std::move(handles));
        const std::string schema = queries->meta("schema");
        if (schema.empty())
            return queries->takeFault().value_or(makeError(ErrorCode::databaseUnusable));
        int version = 0;
        std::from_chars(schema.data(), schema.data() + schema.size(), version);
        if (version > stateSchemaVersion)
            return makeError(ErrorCode::databaseFromLaterVersion);
        return std::unique_ptr<StateQueries>(std::move(queries));
    }
};

StateReader::StateReader() = default;
StateReader::~StateReader() = default;

Result<std::shared_ptr<StateReader>> StateReader::open(const std::string& path) {
    using Access = sqlite::Connection::Access;
    Result<std::unique_ptr<StateQueries>> queries = Queries::open(path, Access::read);
    // On a disk that takes no changes there can be no lock and no index beside the database.
    if (!queries && !queries.error().is(ErrorCode::databaseFromLaterVersion) &&
        ::access(path.c_str(), R_OK) == 0 && ::access(path.c_str(), W_OK) != 0 &&
        ::access((path + "-wal").c_str(), F_OK) != 0)
        queries = Queries::open(path, Access::readOfFixed);
    if (!queries)
        return queries.error();
    std::shared_ptr<StateReader> reader(new StateReader());
    reader->queries_ = std::move(*queries);
    return reader;
}

} // namespace platform
