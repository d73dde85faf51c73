#include "platform/cloud/StateHandles.h"

namespace platform {

// Names are blobs: bytes, compared as bytes. Times are nanoseconds since 1970. An item is who it
// is; remote, local and base each say where and what it was when that side was last seen whole.
const char* const stateSchema = R"sql(
CREATE TABLE meta(name TEXT PRIMARY KEY, value TEXT NOT NULL) WITHOUT ROWID;
CREATE TABLE capability(name TEXT PRIMARY KEY, value TEXT NOT NULL) WITHOUT ROWID;
CREATE TABLE item(
    id INTEGER PRIMARY KEY,
    parent INTEGER REFERENCES item(id),
    name BLOB,
    folded TEXT,
    kind INTEGER NOT NULL,
    UNIQUE(parent, name));
CREATE INDEX item_folded ON item(folded);
CREATE TABLE remote(
    item INTEGER PRIMARY KEY REFERENCES item(id) ON DELETE CASCADE,
    parent INTEGER NOT NULL,
    name BLOB NOT NULL,
    etag TEXT NOT NULL,
    size INTEGER NOT NULL,
    mtime INTEGER NOT NULL,
    created INTEGER,
    remote_id TEXT,
    shared INTEGER NOT NULL DEFAULT 0,
    role TEXT,
    tags TEXT,
    gen INTEGER NOT NULL,
    UNIQUE(parent, name));
CREATE INDEX remote_identity ON remote(remote_id) WHERE remote_id IS NOT NULL;
CREATE INDEX remote_shared ON remote(item) WHERE shared = 1;
CREATE TABLE local(
    item INTEGER PRIMARY KEY REFERENCES item(id) ON DELETE CASCADE,
    parent INTEGER NOT NULL,
    name BLOB NOT NULL,
    dev INTEGER NOT NULL,
    ino INTEGER NOT NULL,
    btime INTEGER NOT NULL,
    size INTEGER NOT NULL,
    mtime_ns INTEGER NOT NULL,
    ctime_ns INTEGER NOT NULL,
    promise INTEGER NOT NULL,
    gen INTEGER NOT NULL,
    UNIQUE(parent, name));
CREATE INDEX local_identity ON local(ino, dev, btime);
CREATE TABLE base(
    item INTEGER PRIMARY KEY REFERENCES item(id) ON DELETE CASCADE,
    parent INTEGER NOT NULL,
    name BLOB NOT NULL,
    etag TEXT NOT NULL,
    size INTEGER NOT NULL,
    hash BLOB,
    dev INTEGER NOT NULL,
    ino INTEGER NOT NULL,
    btime INTEGER NOT NULL,
    mtime_ns INTEGER NOT NULL DEFAULT 0,
    ctime_ns INTEGER NOT NULL DEFAULT 0);
CREATE INDEX base_parent ON base(parent);
CREATE TABLE op(
    id INTEGER PRIMARY KEY AUTOINCREMENT,
    item INTEGER NOT NULL REFERENCES item(id) ON DELETE CASCADE,
    kind TEXT NOT NULL,
    phase TEXT NOT NULL,
    staged TEXT,
    expect_etag TEXT,
    hash BLOB,
    offset INTEGER NOT NULL DEFAULT 0,
    tries INTEGER NOT NULL DEFAULT 0,
    next_at INTEGER,
    error TEXT);
CREATE INDEX op_item ON op(item);
CREATE TABLE folder_scan(
    item INTEGER NOT NULL REFERENCES item(id) ON DELETE CASCADE,
    side INTEGER NOT NULL,
    gen INTEGER NOT NULL,
    complete INTEGER NOT NULL,
    PRIMARY KEY(item, side)) WITHOUT ROWID;
CREATE TABLE refused(
    folder INTEGER NOT NULL REFERENCES item(id) ON DELETE CASCADE,
    side INTEGER NOT NULL,
    name BLOB NOT NULL,
    reason TEXT NOT NULL,
    PRIMARY KEY(folder, side, name)) WITHOUT ROWID;
INSERT INTO item(id, parent, name, folded, kind) VALUES(1, NULL, x'', '', 1);
)sql";

// A record of what was agreed on had no times; the disk was last looked at in that moment.
const char* const stateMigrationToSecond = R"sql(
ALTER TABLE base ADD COLUMN mtime_ns INTEGER NOT NULL DEFAULT 0;
ALTER TABLE base ADD COLUMN ctime_ns INTEGER NOT NULL DEFAULT 0;
CREATE INDEX base_parent ON base(parent);
UPDATE base SET mtime_ns = l.mtime_ns, ctime_ns = l.ctime_ns FROM local l WHERE l.item = base.item;
)sql";

} // namespace platform
