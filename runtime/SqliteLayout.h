// The table of a storage file: how it is made, brought up to date and spoken to.
#pragma once

#include "runtime/SqliteDatabase.h"

namespace runtime {

/// Makes the table in an empty database.
/// @return false after a failure, with nothing changed; the database tells why.
bool makeTable(SqliteDatabase& database);

/// Brings the table of an earlier layout up to date: its values get their check sums as they are.
/// @return false after a failure, with nothing changed; the database tells why.
bool updateTable(SqliteDatabase& database);

/// Prepares the database's statements.
/// @param withSums  false for a table of layout 1, which may only be read: every value counts as
/// it is.
/// @return an SQLite result code.
int prepareStatements(SqliteDatabase& database, bool withSums);

}  // namespace runtime
