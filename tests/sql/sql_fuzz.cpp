// Opens arbitrary bytes as a parameter file and reads and changes by SQL whatever was loaded. Nothing may
// crash, hang or leak; an index must not hide rows; what is undone must be as it was.
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <set>
#include <string>
#include <string_view>
#include <tevpf.hpp>

#include "core/base/heap.h"
#include "lists/settle.h"
#include "sql/database.h"
#include "support/list_check.h"

namespace {

void require(bool holds, const std::string& what) {
  if (holds) return;
  std::fprintf(stderr, "%s\n", what.c_str());
  std::abort();
}

std::string run(sql::Database& database, const std::string& text) {
  std::string result;
  try {
    auto statement = database.prepare_one(text);
    while (statement.step()) {
      for (int c = 0; c < statement.columns(); ++c) result += statement.text(c) + '|';
      result += '\n';
    }
  } catch (const sql::Error& error) {
    return std::string("refused: ") + error.what();
  }
  return result;
}

void drive(sql::Database& database, const std::string& table, const std::string& column) {
  const std::string by = "\"" + column + "\"";
  const std::string one = "(SELECT " + by + " FROM " + table + " LIMIT 1)";
  for (const char* operation : {" = ", " >= ", " < "}) {
    const std::string narrowed = by + operation + one;
    require(run(database, "SELECT count(*) FROM " + table + " WHERE " + narrowed) ==
                run(database, "SELECT count(*) FROM " + table + " WHERE +" + narrowed),
            "an index hides rows");
  }
  require(run(database, "SELECT " + by + " FROM " + table + " ORDER BY " + by) ==
              run(database, "SELECT " + by + " FROM " + table + " ORDER BY +" + by),
          "an index has another order");
}

// Whether a list is one that the library could have made. A damaged file may hold two parameters of one
// name, values out of range, or a name index that is not in order. Such a list may refuse to be put back, or be
// put back in another order.
bool is_sound(tevpf::File& file, const std::string& name) {
  static constexpr const char* kCopy = "made for comparison";
  tevpf::List copy = file.create_list(kCopy);
  TEVPF_LIST* record = nullptr;
  bool is_whole =
      TEV8R1_get_list_ptr(name.c_str(), &record) == PF_NORMAL && broken_rule(*record) == nullptr;
  try {
    for (const tevpf::Parameter& parameter : file.list(name)) copy.add(parameter);
  } catch (const tevpf::Error&) {
    is_whole = false;
  }
  file.remove_list(kCopy);
  return is_whole;
}

void change(sql::Database& database, const std::string& table, bool is_list, bool is_sound) {
  const std::string all = "SELECT * FROM " + table;
  const std::string before = run(database, all);
  run(database, "BEGIN");
  run(database, "UPDATE " + table + " SET " + (is_list ? "value = value" : "rowid = rowid"));
  run(database, "DELETE FROM " + table + " WHERE rowid % 2 = 1");
  run(database, "INSERT INTO " + table + " " + all + " LIMIT 3");
  run(database, "ROLLBACK");
  const std::string after = run(database, all);
  require(after == before || !is_sound, "a change was not undone: " + before + after);
}

void read_all(sql::Database& database, tevpf::File& file, const std::set<std::string>& damaged) {
  run(database, "SELECT * FROM tevpf_elements");
  run(database, "SELECT * FROM tevpf_columns");
  std::int64_t tables = 0;  // tevpf_elements lists them first, in the same order
  for (const tevpf::Element& element : file.elements()) {
    const std::string table = database.table(element);
    const bool is_list = element.kind == tevpf::Kind::list;
    run(database, "SELECT * FROM " + table);
    if (!is_list) {
      auto columns = database.prepare_one(
          "SELECT replace(name, '\"', '\"\"') FROM tevpf_columns WHERE indexed AND table_name = "
          "(SELECT name FROM tevpf_elements WHERE kind = 'table' AND rowid = ?)");
      columns.bind(1, ++tables);
      while (columns.step()) drive(database, table, columns.text(0));
    }
    if (!file.damage() && !file.is_read_only()) {
      change(database, table, is_list, !is_list || damaged.count(element.name) == 0);
    }
  }
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size == 0) return 0;
  const std::string folder = "/dev/shm/tevpf_sql_" + std::to_string(getpid());
  const std::string path = folder + "/file";
  std::filesystem::create_directory(folder);
  // The corpus has some bytes in front that choose changes.
  const std::string_view input(reinterpret_cast<const char*>(data), size);
  const std::string_view choices = input.substr(1, data[0]);
  std::ofstream(path, std::ios::binary) << input.substr(1 + choices.size());
  tevpf::heap_fail_above(4 << 20);
  try {
    tevpf::File file = tevpf::File::recover(path);
    std::set<std::string> damaged;  // lists
    for (const tevpf::Element& element : file.elements()) {
      const bool is_list = element.kind == tevpf::Kind::list;
      if (is_list && !is_sound(file, element.name)) damaged.insert(element.name);
    }
    sql::Database database;
    database.attach(file);
    read_all(database, file, damaged);
  } catch (const tevpf::Error&) {    // not a parameter file
  } catch (const std::bad_alloc&) {  // rows wider than memory
  }
  tevpf::heap_fail_above(UINT64_MAX);
  std::filesystem::remove_all(folder);
  return 0;
}
