# Looks for SQLite, for sql/: TEVPF_SQLITE_WORKS says whether programs can be linked with it, and
# tevpf_sqlite3 is what they link: the static library unless TEVPF_LINK_SHARED is on, so that they run
# without it.
find_package(SQLite3 3.38 QUIET)
find_package(Threads QUIET)
set(TEVPF_SQLITE_WORKS OFF)
if(PROJECT_IS_TOP_LEVEL AND SQLite3_FOUND AND Threads_FOUND AND UNIX)
  find_library(TEVPF_SQLITE_ARCHIVE libsqlite3.a)
  mark_as_advanced(TEVPF_SQLITE_ARCHIVE)
  set(libraries "${SQLite3_LIBRARIES}")
  if(TEVPF_SQLITE_ARCHIVE AND NOT TEVPF_LINK_SHARED)
    set(libraries "${TEVPF_SQLITE_ARCHIVE}" m ${CMAKE_DL_LIBS})
  endif()
  list(APPEND libraries Threads::Threads)

  # A library for another machine is found, too, when cross-compiling.
  include(CheckSymbolExists)
  set(CMAKE_REQUIRED_LIBRARIES "${libraries}")
  set(CMAKE_REQUIRED_INCLUDES "${SQLite3_INCLUDE_DIRS}")
  check_symbol_exists(sqlite3_vtab_rhs_value sqlite3.h TEVPF_SQLITE_LINKS)
  unset(CMAKE_REQUIRED_LIBRARIES)
  unset(CMAKE_REQUIRED_INCLUDES)
  if(TEVPF_SQLITE_LINKS)
    set(TEVPF_SQLITE_WORKS ON)
    add_library(tevpf_sqlite3 INTERFACE)
    target_include_directories(tevpf_sqlite3 SYSTEM INTERFACE "${SQLite3_INCLUDE_DIRS}")
    target_link_libraries(tevpf_sqlite3 INTERFACE ${libraries})
  endif()
endif()
