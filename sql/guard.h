// Where SQLite calls C++: exceptions become result codes and messages.
#pragma once

#include <exception>
#include <new>

#include "refusal.h"
#include "sqlite.h"

namespace sql {

inline void set_message(char** message, const char* text) {
  sqlite3_free(*message);
  *message = sqlite3_mprintf("%s", text);
}

template <class Function>
int guarded(char** message, Function function) noexcept {
  try {
    function();
    return SQLITE_OK;
  } catch (const Refusal& refusal) {
    set_message(message, refusal.what());
    return refusal.code();
  } catch (const tevpf::Error& error) {
    set_message(message, error.what());
    return code_of(error);
  } catch (const std::bad_alloc&) {
    return SQLITE_NOMEM;
  } catch (const std::exception& error) {
    set_message(message, error.what());
    return SQLITE_ERROR;
  }
}

}  // namespace sql
