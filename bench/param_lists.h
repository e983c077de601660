// The lists of the list workloads, ours and SQLite's, and the parameters that go into them.
#pragma once

#include "common.h"

namespace bench {

// The name of parameter i, random; the names of the first n.
std::string name_of(std::int32_t i);
std::vector<std::string> names(std::int64_t n);

// Parameter i: the five types in turn, every second one with a description.
TEVPF_PARAM_DEF definition(std::int32_t i, const std::string& name);

// ---- Ours: lists of the current file ----

void add_to_list(const char* list, std::int32_t i, const std::string& name,
                 std::int32_t position = PF_END_POS);

// A list of these parameters, filled in name order, which is the cheap way.
void fill_list(const char* list, std::span<const std::string> all);

// ---- SQLite's: the table p of a database ----

inline constexpr char kInsertParam[] = "INSERT INTO p VALUES(?,?,?,?,?,?,?,?,?)";

void insert(Statement& into, std::int64_t list, std::int32_t i, const std::string& name);
void fill_database(Database& db, std::span<const std::string> all, std::int64_t lists = 1);

}  // namespace bench
