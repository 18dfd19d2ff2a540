#pragma once

#include "host/sqlite/database.h"

namespace host {

/// Sets up a connection that has just been opened, makes the tables (docs/index.md) in an empty file where
/// the mode is `create`, and verifies that they are ours: `damaged` for another version or application. On
/// failure the connection is to be closed.
DatabaseResult prepare_index_tables(Connection& connection, Connection::Mode mode);

} // namespace host
