#include "param_lists.h"

#include <cstring>

namespace bench {

std::string name_of(std::int32_t i) {
  char name[TEVPF_NAME_SIZE];
  std::snprintf(name, sizeof name, "param_%08x", scrambled(static_cast<std::uint32_t>(i)));
  return name;
}

std::vector<std::string> names(std::int64_t n) {
  std::vector<std::string> result;
  for (std::int32_t i = 0; i < n; ++i) result.push_back(name_of(i));
  return result;
}

TEVPF_PARAM_DEF definition(std::int32_t i, const std::string& name) {
  static char description[] = "measured at room temperature";
  static char text[] = "stainless steel";
  TEVPF_PARAM_DEF def{};
  def.type = PF_TYPE_INT + i % 5;
  std::strcpy(def.name, name.c_str());
  std::strcpy(def.units, "mm");
  def.description = i % 2 == 0 ? description : nullptr;
  switch (def.type) {
    case PF_TYPE_INT:
      def.part.i32 = {i, 2'000'000'000, -2'000'000'000};
      break;
    case PF_TYPE_REAL:
      def.part.f32 = {6, 1.5f, 1e6f, -1e6f};
      break;
    case PF_TYPE_STRING:
      def.part.str.value = text;
      break;
    case PF_TYPE_DOUBLE:
      def.part.f64 = {12, i * 0.125, 1e12, -1e12};
      break;
    default:
      def.part.i16 = {static_cast<std::int16_t>(i % 1000), 32000, -32000};
      break;
  }
  return def;
}

void add_to_list(const char* list, std::int32_t i, const std::string& name, std::int32_t position) {
  const TEVPF_PARAM_DEF def = definition(i, name);
  MUST(TEV8R1_PF_add_param(list, &def, position));
}

void fill_list(const char* list, std::span<const std::string> all) {
  MUST(TEV8R1_PF_create_elem(list, "", PF_ELEM_LIST));
  std::vector<std::int32_t> order(all.size());
  std::iota(order.begin(), order.end(), 0);
  std::sort(order.begin(), order.end(),
            [&](std::int32_t a, std::int32_t b) { return all[a] < all[b]; });
  for (const std::int32_t i : order) add_to_list(list, i, all[i]);
}

void insert(Statement& into, std::int64_t list, std::int32_t i, const std::string& name) {
  into.integer(1, list).text(2, name.c_str()).integer(3, PF_TYPE_INT + i % 5).text(4, "mm");
  if (i % 2 == 0) {
    into.text(5, "measured at room temperature");
  } else {
    sqlite3_bind_null(into.get(), 5);
  }
  if (i % 5 == 2) {
    into.text(6, "stainless steel");
  } else {
    into.real(6, i * 0.125);
  }
  into.real(7, 1e12).real(8, -1e12).integer(9, 12);
  into.once();
}

void fill_database(Database& db, std::span<const std::string> all, std::int64_t lists) {
  db.run(
      "CREATE TABLE p(list INTEGER, name TEXT, type INTEGER, units TEXT, description TEXT, value, "
      "max, min, prec INTEGER, PRIMARY KEY(list, name)) WITHOUT ROWID");
  db.run("BEGIN");
  Statement into(db, kInsertParam);
  for (std::int64_t list = 0; list < lists; ++list) {
    for (std::int32_t i = 0; i < std::ssize(all); ++i) insert(into, list, i, all[i]);
  }
  db.run("COMMIT");
}

}  // namespace bench
