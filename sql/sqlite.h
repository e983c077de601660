// SQLite's interface: as the tool links it, or as a loadable extension receives it.
#pragma once

#ifdef TEVPF_SQL_EXTENSION
#include <sqlite3ext.h>
extern const sqlite3_api_routines* sqlite3_api;
#else
#include <sqlite3.h>
#endif
