// Takes its input for operations on several open files: elements, parameters, columns and rows come, change,
// move and go; files are saved, closed, opened again and made current; names, types, positions and values are
// often wrong, and now and then memory runs out. Beside the library a shadow counts what each file holds, on
// the disk and in memory, and says which statuses are possible.
#include <unistd.h>

#include <array>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <iterator>
#include <map>
#include <string>
#include <vector>

#include "core/base/heap.h"
#include "include/tevpf.h"
#include "include/tevpf_access.h"
#include "include/tevpf_message.h"
#include "support/drive.h"
#include "support/read_file.h"

namespace {

constexpr int kFiles = 3;
constexpr std::size_t kMostOperations = 400;

const char* const kNames[] = {"a", "ab", "b", "exactly 19 letters.", "z", " blank", "a*"};
const char* const kTexts[] = {"", "t", "text", "\xC3\xA9t\xC3\xA9", "longer than any column", "t*"};

// What a file holds: how many parameters or rows each list and table has.
struct Shadow {
  std::map<std::string, std::int32_t> lists, tables;
  bool operator==(const Shadow&) const = default;
};

struct Slot {
  std::string path;
  bool is_open = false, is_on_disk = false;
  Shadow now, saved;
};

class Session {
 public:
  Session(std::string folder, const std::uint8_t* data, std::size_t size)
      : choose_{{reinterpret_cast<const char*>(data), size}}, folder_(std::move(folder)) {
    for (int i = 0; i < kFiles; ++i) slots_[i].path = folder_ + "/" + std::to_string(i);
    open();
  }

  void run() {
    for (std::size_t i = 0; i < kMostOperations && !choose_.bytes.empty(); ++i) {
      step();
      check_current();
    }
    for (Slot& slot : slots_) {
      if (!slot.is_open) continue;
      require(TEV8R1_PF_change_file(slot.path.c_str()) == PF_NORMAL,
              "an open file becomes current");
      current_ = &slot;
      check_elements();
      walk_all();
      close(false);
    }
  }

 private:
  // ---- Choices ----

  const char* name() { return kNames[choose_.next() % std::size(kNames)]; }
  const char* text() { return kTexts[choose_.next() % std::size(kTexts)]; }
  std::int32_t number() { return static_cast<std::int8_t>(choose_.next()); }
  // Mostly a position, sometimes none.
  std::int32_t position() {
    const std::int32_t some = number();
    return some == 127 ? PF_END_POS : some == -128 ? INT32_MIN : some / 2;
  }
  std::int32_t type() { return PF_TYPE_INT + choose_.next() % 6; }

  // A status of the library, which has a name and a sentence; after a failed allocation, PF_NOMEM.
  TEVPF_STATUS noted(TEVPF_STATUS status) {
    out_of_memory_ = tevpf::heap_fail_off() && status == PF_NOMEM;
    char sentence[200];
    require(std::strcmp(tevpf_status_name(status), "unknown status") != 0,
            "a status of the library");
    require(tevpf_message(status, sentence, sizeof sentence) > 0, "a sentence for each status");
    return status;
  }
  bool done(TEVPF_STATUS status) { return noted(status) == PF_NORMAL; }
  void expect(TEVPF_STATUS status, TEVPF_STATUS expected, const char* what) {
    require(noted(status) == expected || out_of_memory_, what);
  }

  // ---- Files ----

  void open() {
    Slot& slot = slots_[choose_.next() % kFiles];
    const TEVPF_STATUS status = noted(TEV8R1_PF_open(slot.path.c_str()));
    if (slot.is_open) return require(status == PF_FILEOPEN, "an open file is not opened again");
    require(status == (slot.is_on_disk ? PF_NORMAL : PF_NEWFILE), "opening");
    slot.now = slot.is_on_disk ? slot.saved : Shadow{};
    slot.is_open = true;
    current_ = &slot;
    check_elements();
  }

  void change_file() {
    Slot& slot = slots_[choose_.next() % kFiles];
    const TEVPF_STATUS status = noted(TEV8R1_PF_change_file(slot.path.c_str()));
    require(status == (slot.is_open ? PF_NORMAL : PF_NOFILE), "changing the file");
    if (!slot.is_open) return;
    current_ = &slot;
    check_elements();
  }

  void close(bool saves) {
    if (current_ == nullptr) return expect(TEV8R1_PF_close(saves), PF_NOFILE, "closing nothing");
    expect(TEV8R1_PF_close(saves), PF_NORMAL, "closing");
    if (saves) note_saved();
    current_->is_open = false;
    require(std::filesystem::exists(current_->path) == current_->is_on_disk,
            "a new file that was never saved is removed");
    find_current();
  }

  // The library chooses which file is current after one was closed.
  void find_current() {
    char path[TEVPF_FILE_NAME_SIZE];
    current_ = nullptr;
    if (noted(TEV8R1_PF_inq_current_file(path)) != PF_NORMAL) return;
    for (Slot& slot : slots_) {
      if (slot.is_open && slot.path == path) current_ = &slot;
    }
    require(current_ != nullptr, "the current file is an open one");
  }

  void note_saved() {
    current_->saved = current_->now;
    current_->is_on_disk = true;
  }

  void save() {
    expect(TEV8R1_PF_save(nullptr), current_ == nullptr ? PF_NOFILE : PF_NORMAL, "saving");
    if (current_ != nullptr && !out_of_memory_) note_saved();
  }

  // A copy holds the same and is saved to the same bytes.
  void save_copy() {
    if (current_ == nullptr) return;
    const std::string copy = folder_ + "/copy", again = folder_ + "/again";
    const std::string own = current_->path;
    expect(TEV8R1_PF_save(copy.c_str()), PF_NORMAL, "saving a copy");
    expect(TEV8R1_PF_open(copy.c_str()), PF_NORMAL, "opening a copy");
    check_elements();
    expect(TEV8R1_PF_save(again.c_str()), PF_NORMAL, "saving a copy of it");
    require(read_file(copy) == read_file(again), "a copy of a copy");
    expect(TEV8R1_PF_close(0), PF_NORMAL, "closing a copy");
    expect(TEV8R1_PF_change_file(own.c_str()), PF_NORMAL, "back to the file");
    for (const std::string& path : {copy, again}) std::filesystem::remove(path);
  }

  // ---- Checks ----

  void check_current() {
    char path[TEVPF_FILE_NAME_SIZE];
    const TEVPF_STATUS status = TEV8R1_PF_inq_current_file(path);
    require(status == (current_ == nullptr ? PF_NOFILE : PF_NORMAL), "the current file");
    require(current_ == nullptr || current_->path == path, "the name of the current file");
    if (current_ == nullptr) return;
    std::int32_t count = -1;
    for (const auto& [list, params] : current_->now.lists) {
      require(TEV8R1_PF_inq_num_params(list.c_str(), &count) == PF_NORMAL && count == params,
              "the number of parameters");
    }
    for (const auto& [table, rows] : current_->now.tables) {
      require(TEV8R1_PF_inq_num_rows(table.c_str(), &count) == PF_NORMAL && count == rows,
              "the number of rows");
    }
  }

  void check_elements() {
    std::int32_t counts[2] = {};
    std::array<char(*)[TEVPF_NAME_SIZE], 2> names{};
    std::array<char(*)[TEVPF_DESC_SIZE], 2> descs{};
    char path[TEVPF_FILE_NAME_SIZE];
    require(TEV8R1_PF_inq_file_elements(path, &counts[0], &names[0], &descs[0], &counts[1],
                                        &names[1], &descs[1]) == PF_NORMAL,
            "the elements of a file");
    const std::map<std::string, std::int32_t>* const all[] = {&current_->now.lists,
                                                              &current_->now.tables};
    for (int kind = 0; kind < 2; ++kind) {
      bool same = static_cast<std::size_t>(counts[kind]) == all[kind]->size();
      for (std::int32_t i = 0; same && i < counts[kind]; ++i)
        same = all[kind]->count(names[kind][i]) == 1;
      std::free(names[kind]);
      std::free(descs[kind]);
      require(same, "each file has its own elements");
    }
  }

  void walk_all() {
    for (const auto& [list, count] : current_->now.lists) walk_list(list.c_str(), count);
    for (const auto& [table, count] : current_->now.tables) walk_table(table.c_str(), count);
  }

  // Each parameter comes once, and is found by its name and its position.
  void walk_list(const char* list, std::int32_t count) {
    std::int32_t type, size, desc_size, at;
    char name[TEVPF_NAME_SIZE];
    TEV8R1_PF_reset_param(list);
    for (std::int32_t i = 0; i < count; ++i) {
      require(TEV8R1_PF_inq_next_param_size(list, &type, &size, &desc_size) == PF_NORMAL, "a size");
      std::vector<char> value(size), again(size);
      require(TEV8R1_PF_get_next_param(list, name, value.data()) == PF_NORMAL, "a parameter");
      if (std::strchr(name, '*') != nullptr) continue;
      require(TEV8R1_inq_param_pos(list, name, &at) == PF_NORMAL && at == i, "its position");
      require(TEV8R1_PF_get_param_value(list, name, again.data()) == PF_NORMAL && again == value,
              "its value by its name");
    }
    require(TEV8R1_PF_inq_next_param_size(list, &type, &size, &desc_size) == PF_NOMORE, "the end");
  }

  struct Shape {
    std::int32_t columns = 0, rows = 0, width = 0, dsp_wid = 0, cur_row = 0;
    explicit Shape(const char* table) {
      require(
          TEV8R1_PF_inq_table_info(table, &columns, &rows, &width, &dsp_wid, &cur_row) == PF_NORMAL,
          "a table");
    }
  };

  // In storage order and in the order of each index: each row once, integers ascending.
  void walk_table(const char* table, std::int32_t count) {
    const Shape shape(table);
    std::vector<unsigned char> row(static_cast<std::size_t>(shape.width) + 1);
    for (std::int32_t c = -1; c < shape.columns; ++c) {
      TEVPF_COL_DEF def{};
      if (c >= 0) require(TEV8R1_PF_inq_col_def_by_pos(table, c, &def) == PF_NORMAL, "a column");
      std::free(def.description);
      const TEVPF_STATUS status = TEV8R1_PF_define_table_search(table, c < 0 ? nullptr : def.name);
      require(status == (c < 0 || def.idx_flag != 0 ? PF_NORMAL : PF_BADSEARCH), "a search column");
      if (status != PF_NORMAL) continue;
      TEV8R1_PF_reset_table(table);
      std::vector<bool> seen(count);
      std::int64_t last = INT64_MIN;
      for (std::int32_t i = 0; i < count; ++i) {
        require(TEV8R1_PF_get_next_row(table, row.data()) == PF_NORMAL, "a row that is counted");
        const std::int32_t number = TEV8R1_convert_row(table, i);
        require(number >= 0 && number < count && !seen[number], "each row once");
        seen[number] = true;
        if (def.type == PF_TYPE_INT) last = check_order(table, def.name, row.data(), last);
      }
      require(TEV8R1_PF_get_next_row(table, row.data()) == PF_NOMORE, "no row behind the last");
    }
    TEV8R1_PF_define_table_search(table, nullptr);
    TEV8R1_PF_reset_table(table);
  }

  std::int64_t check_order(const char* table, const char* column, const unsigned char* row,
                           std::int64_t last) {
    std::int32_t count = 0, *offsets = nullptr, value = 0;
    char(*names)[TEVPF_NAME_SIZE] = nullptr;
    TEV8R1_PF_inq_col_names(table, &count, &names);
    TEV8R1_PF_inq_col_offsets(table, &count, &offsets);
    for (std::int32_t i = 0; i < count; ++i) {
      if (std::strcmp(names[i], column) == 0) std::memcpy(&value, row + offsets[i], sizeof value);
    }
    std::free(names);
    std::free(offsets);
    require(value >= last, "an index of integers ascends");
    return value;
  }

  // ---- Elements ----

  using Elements = std::map<std::string, std::int32_t>;
  Elements& elements(bool is_list) { return is_list ? current_->now.lists : current_->now.tables; }

  void create(bool is_list, const char* name) {
    const TEVPF_STATUS status =
        noted(TEV8R1_PF_create_elem(name, text(), is_list ? PF_ELEM_LIST : PF_ELEM_TABLE));
    if (current_ == nullptr) return require(status == PF_NOFILE, "no file to create in");
    Elements& all = elements(is_list);
    if (out_of_memory_) {  // a new list stays
      const bool is_there =
          (is_list ? TEV8R1_check_list_unique : TEV8R1_check_table_unique)(name) != PF_NORMAL;
      if (is_there) all.try_emplace(name, 0);
      return;
    }
    const TEVPF_STATUS expected = name[0] == ' '         ? PF_BADNAME
                                  : all.count(name) != 0 ? PF_DUPLICATE
                                                         : PF_NORMAL;
    require(status == expected, "creating");
    if (status == PF_NORMAL) all[name] = 0;
  }

  void remove(bool is_list, const char* name) {
    const TEVPF_STATUS status = (is_list ? TEV8R1_PF_delete_list : TEV8R1_PF_delete_table)(name);
    if (current_ == nullptr) return expect(status, PF_NOFILE, "no file to delete from");
    expect(status, elements(is_list).erase(name) != 0 ? PF_NORMAL : PF_NOELEM, "deleting");
  }

  void copy(bool is_list, const char* name, const char* other) {
    const bool is_done = done((is_list ? TEV8R1_PF_copy_list : TEV8R1_PF_copy_table)(name, other));
    if (current_ == nullptr) return require(!is_done, "no file to copy in");
    Elements& all = elements(is_list);
    const bool possible = all.count(name) != 0 && all.count(other) == 0 && other[0] != ' ';
    require(is_done == possible || out_of_memory_, "copying");
    if (is_done) all[other] = all[name];
  }

  void rename(bool is_list, const char* name, const char* other) {
    const bool is_done =
        done(TEV8R1_modify_elem_name(is_list ? PF_ELEM_LIST : PF_ELEM_TABLE, name, other));
    if (current_ == nullptr || std::strcmp(name, other) == 0) return;
    Elements& all = elements(is_list);
    const bool possible = all.count(name) != 0 && all.count(other) == 0 && other[0] != ' ';
    require(is_done == possible, "renaming");
    if (!is_done) return;
    all[other] = all[name];
    all.erase(name);
  }

  // ---- Parameters ----

  TEVPF_PARAM_DEF parameter(const char* name) {
    TEVPF_PARAM_DEF def{};
    def.type = type();
    std::strcpy(def.name, name);
    if (choose_.next() % 2 != 0) def.description = const_cast<char*>(text());
    const std::int32_t value = number(), least = number() - 100;
    const auto fill = [&](auto& part) {
      part.value = static_cast<decltype(part.value)>(value);
      part.min = static_cast<decltype(part.min)>(least);
      part.max = static_cast<decltype(part.max)>(least + 230);
    };
    switch (def.type) {
      case PF_TYPE_INT:
        fill(def.part.i32);
        break;
      case PF_TYPE_SHORT:
        fill(def.part.i16);
        break;
      case PF_TYPE_REAL:
        fill(def.part.f32);
        def.part.f32.precision = value;
        break;
      case PF_TYPE_DOUBLE:
        fill(def.part.f64);
        def.part.f64.precision = value;
        break;
      default:
        def.part.str.value = const_cast<char*>(text());
        break;
    }
    return def;
  }

  void change_list(const char* list) {
    const auto found = current_->now.lists.find(list);
    const bool is_there = found != current_->now.lists.end();
    std::int32_t none = 0, *const count = is_there ? &found->second : &none;
    const char* const param = name();
    std::int32_t at = 0;
    switch (choose_.next() % 8) {
      case 0:
      case 1:
      case 2: {
        const TEVPF_PARAM_DEF def = parameter(param);
        const std::int32_t where = position();
        if (!done(TEV8R1_PF_add_param(list, &def, where))) break;
        require(is_there, "a list to add to");
        ++*count;
        require(TEV8R1_inq_param_exists(list, param) == PF_NORMAL, "a parameter that was added");
        break;
      }
      case 3:
        if (done(TEV8R1_PF_delete_param(list, param))) --*count;
        break;
      case 4:
        (void)done(TEV8R1_PF_modify_param_def(list, parameter(param)));
        break;
      case 5:
        (void)done(TEV8R1_PF_modify_param_name(list, param, name()));
        break;
      case 6: {
        const std::int32_t where = position();
        if (!done(TEV8R1_PF_move_param(list, param, where))) break;
        const std::int32_t expected = where == PF_END_POS ? *count - 1 : where;
        require(TEV8R1_inq_param_pos(list, param, &at) == PF_NORMAL, "a parameter that was moved");
        require(at == expected || std::strchr(param, '*') != nullptr, "its new position");
        break;
      }
      default: {
        std::array<char, 32> value{};
        std::strncpy(value.data(), text(), value.size() - 1);
        (void)done(TEV8R1_PF_modify_param(list, param, value.data()));
        break;
      }
    }
    if (is_there && choose_.next() % 8 == 0) walk_list(list, *count);
  }

  // ---- Columns and rows ----

  TEVPF_COL_DEF column(const char* name) {
    TEVPF_COL_DEF def{};
    def.type = type();
    std::strcpy(def.name, name);
    const std::uint8_t flags = choose_.next();
    def.idx_flag = flags & 1;
    def.unq_flag = static_cast<std::int8_t>(flags >> 1 & 1);
    def.width = number() % 24;
    if ((flags & 4) != 0) def.description = const_cast<char*>(text());
    const auto fill = [&](auto& limits) {
      limits.max = 120;
      limits.min = static_cast<decltype(limits.min)>((flags & 8) != 0 ? -128 : 0);
    };
    switch (def.type) {
      case PF_TYPE_INT:
        fill(def.limits.i32);
        break;
      case PF_TYPE_SHORT:
        fill(def.limits.i16);
        break;
      case PF_TYPE_REAL:
        fill(def.limits.f32);
        def.limits.f32.precision = 1 + flags % 3;
        break;
      case PF_TYPE_DOUBLE:
        fill(def.limits.f64);
        def.limits.f64.precision = 1 + flags % 3;
        break;
      default:
        break;
    }
    return def;
  }

  void change_columns(const char* table) {
    const char* const column_name = name();
    switch (choose_.next() % 4) {
      case 0:
      case 1:
        (void)done(TEV8R1_PF_def_column(table, column(column_name)));
        break;
      case 2:
        if (choose_.next() % 2 != 0) {
          (void)done(TEV8R1_PF_modify_col_def(table, column_name, column(name())));
        } else {
          (void)done(
              TEV8R1_PF_move_col(table, column_name, choose_.next() % 2 != 0 ? name() : nullptr));
        }
        break;
      default: {
        const Shape before(table);
        if (done(TEV8R1_PF_delete_col(table, column_name)) && before.columns == 1) {
          current_->now.tables[table] = 0;
        }
        break;
      }
    }
  }

  // The default row with a few values in it, each at the offset of its column.
  std::vector<unsigned char> some_row(const char* table, const Shape& shape) {
    std::vector<unsigned char> row(static_cast<std::size_t>(shape.width) + 8);
    TEV8R1_PF_inq_dft_row(table, row.data());
    std::int32_t count = 0, *offsets = nullptr;
    TEV8R1_PF_inq_col_offsets(table, &count, &offsets);
    for (std::int32_t i = 0; i < count; ++i) {
      TEVPF_COL_DEF def{};
      TEV8R1_PF_inq_col_def_by_pos(table, i, &def);
      std::free(def.description);
      if (def.type == PF_TYPE_STRING) {
        std::strncpy(reinterpret_cast<char*>(row.data()) + offsets[i], text(),
                     static_cast<std::size_t>(def.width) + 1);
      } else {
        const std::string digits = std::to_string(number());
        require(TEV8R1_from_char(def.type, digits.c_str(), row.data() + offsets[i]) == PF_NORMAL,
                "a small number of any type");
      }
    }
    std::free(offsets);
    return row;
  }

  void change_rows(const char* table, std::int32_t& count) {
    const Shape shape(table);
    if (shape.columns == 0) return;
    std::vector<unsigned char> row = some_row(table, shape), other = row;
    switch (choose_.next() % 8) {
      case 0:
      case 1:
      case 2:
        if (done(TEV8R1_PF_add_row_by_pos(table, row.data(), position()))) ++count;
        break;
      case 3:
        if (done(TEV8R1_PF_get_row_by_pos(table, position(), other.data()))) {
          if (done(TEV8R1_PF_delete_row(table))) --count;
        }
        break;
      case 4:
        if (done(TEV8R1_PF_get_next_row(table, other.data()))) {
          (void)done(TEV8R1_PF_replace_row(table, row.data()));
        }
        break;
      case 5:
        (void)done(TEV8R1_PF_move_row(table, number(), position()));
        break;
      case 6: {
        const char* const key = name();
        (void)done(TEV8R1_PF_define_table_search(table, key));
        TEV8R1_PF_reset_table(table);
        const std::int8_t mode = static_cast<std::int8_t>(choose_.next() % 3);
        std::array<char, 64> value{};
        std::memcpy(value.data(), row.data(), std::min(row.size(), value.size() - 1));
        (void)done(TEV8R1_PF_get_row_by_value(table, mode, key, value.data(), other.data()));
        break;
      }
      default:
        (void)done(TEV8R1_PF_set_dft_row(table, row.data()));
        break;
    }
    if (choose_.next() % 8 == 0) walk_table(table, count);
  }

  void change_table(const char* table) {
    const auto found = current_->now.tables.find(table);
    if (found == current_->now.tables.end()) {
      std::array<unsigned char, 8> row{};
      return require(TEV8R1_PF_add_row(table, row.data()) == PF_NOELEM, "no table to add to");
    }
    choose_.next() % 4 == 0 ? change_columns(table) : change_rows(table, found->second);
  }

  // ---- Steps ----

  void step() {
    const std::uint8_t what = choose_.next();
    if (what % 16 == 15) tevpf::heap_fail_at(what / 16);
    if (what < 200 && current_ != nullptr) {
      const char* const element = kNames[choose_.next() % 3];
      what % 3 == 0 ? change_list(element) : change_table(element);
    } else {
      change_files_or_elements(what % 14);
    }
    tevpf::heap_fail_off();
  }

  void change_files_or_elements(int what) {
    const bool is_list = choose_.next() % 3 == 0;
    if (what < 5) tevpf::heap_fail_off();  // what is left of a file then is another subject
    switch (what) {
      case 0:
        return open();
      case 1:
        return change_file();
      case 2:
        return close(choose_.next() % 2 != 0);
      case 3:
        return save();
      case 4:
        return save_copy();
      case 5:
        return remove(is_list, name());
      case 6:
      case 7:
        return copy(is_list, name(), name());
      case 8:
        return rename(is_list, name(), name());
      case 9:
        (void)TEV8R1_PF_set_memory_allocation(number(), number());
        return;
      case 10:
        // Without checks of values.
        (void)TEV8R1_set_interactive_table(name());
        return;
      case 11:
        (void)TEV8R1_turn_off_interactive();
        return;
      default:
        return create(is_list, kNames[choose_.next() % (choose_.next() % 4 == 0 ? 6 : 3)]);
    }
  }

  Choices choose_;
  std::string folder_;
  std::array<Slot, kFiles> slots_;
  Slot* current_ = nullptr;
  bool out_of_memory_ = false;
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  const std::string folder = "/dev/shm/tevpf_operations_" + std::to_string(getpid());
  std::filesystem::create_directory(folder);
  TEV8R1_PF_init();
  Session(folder, data, size).run();
  TEV8R1_turn_off_interactive();
  TEV8R1_PF_set_memory_allocation(0, 0);
  std::filesystem::remove_all(folder);
  return 0;
}
