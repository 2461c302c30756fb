// The tables of the world database and the loading and storing of a
// WorldState. Lists are stored with their position so that the world's order
// survives.
#pragma once

#include <sqlite3.h>

#include "Connection.h"
#include "Model.h"

namespace HyraSim {

// Refuses (with WorldError) a database that holds tables but no world, so
// that nothing else is ever taken over. A world of this layout costs one
// statement.
void RefuseForeignDatabase(sqlite3* db);
// Answers true when the database holds a world of this layout; false when it
// is empty. Throws WorldError for a database of another layout, saying that
// hyrasim init replaces it.
bool HasWorld(sqlite3* db);
// Drops whatever world tables there are and creates empty ones.
void CreateSchema(sqlite3* db);

// The endpoint of a row of the endpoint table whose columns 1 to 7 are
// local_uid, type, lun_id, ip_address, server_mount, accessible, configured.
ProtocolEndpoint EndpointFrom(const Statement& row);

// The whole world, for the operations that show or export it.
WorldState LoadWorld(sqlite3* db);
// Stores world into the empty tables CreateSchema made.
void SaveWorld(sqlite3* db, const WorldState& world);

}  // namespace HyraSim
