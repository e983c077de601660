// Random operations on several lists and on a plain model of them. After every one: status, both
// error texts, every parameter, cursor, spare slots, and the invariants of the record, which is
// compared in whatever state it is; now and then it is handed out and must be settled.
#include <gtest/gtest.h>

#include <algorithm>
#include <cfloat>
#include <climits>
#include <cmath>
#include <map>
#include <random>

#include "lists/directory.h"
#include "lists/name_index.h"
#include "lists/settle.h"
#include "support/param_def.h"
#include "support/temp_file.h"

namespace {

constexpr int kInitial = 3;
constexpr int kIncrement = 2;
constexpr int kRoom = 40;  // for any value

// By type, from PF_TYPE_INT on.
const std::vector<Def> kInitialDefaults = {{PF_TYPE_INT, "", "", {}, 0, INT_MAX, INT_MIN},
                                           {PF_TYPE_REAL, "", "", {}, 0, FLT_MAX, -FLT_MAX},
                                           {PF_TYPE_STRING},
                                           {PF_TYPE_DOUBLE, "", "", {}, 0, DBL_MAX, -DBL_MAX},
                                           {PF_TYPE_SHORT, "", "", {}, 0, SHRT_MAX, SHRT_MIN}};

struct ModelList {
  std::vector<Def> params;
  std::int32_t cursor = -1;
  std::int32_t free = kInitial;
  std::vector<Def> defaults = kInitialDefaults;

  std::int32_t count() const { return static_cast<std::int32_t>(params.size()); }
  Def& at(std::int32_t position) { return params[static_cast<std::size_t>(position)]; }
  Def& default_of(std::int32_t type) { return defaults[std::size_t(type - PF_TYPE_INT)]; }
};

class ListModel : public TempFileTest {
 protected:
  void run(int steps) {
    using M = ListModel;
    // clang-format off
    static constexpr void (M::*operations[])() = {
        &M::add, &M::add, &M::add, &M::add, &M::add, &M::remove, &M::redefine, &M::redefine,
        &M::rename, &M::move, &M::change_value, &M::change_value, &M::value, &M::value,
        &M::definition, &M::definition, &M::definition, &M::sizes, &M::sizes, &M::inquire,
        &M::set_cursor, &M::reset, &M::inquire_default, &M::set_default, &M::replace,
        &M::reopen, &M::hand_out, &M::walk};
    // clang-format on
    for (int step = 0; step < steps && !HasFailure(); ++step) {
      name_ = chance(2) ? "alpha" : "beta";
      model_ = &lists_[name_];
      wanted_ = known_name();
      found_ = find(wanted_);
      asked_ = any_position();
      const std::size_t operation = below(std::size(operations));
      SCOPED_TRACE("step " + std::to_string(step) + ", operation " + std::to_string(operation) +
                   " in " + name_);
      (this->*operations[operation])();
      for (auto& [name, model] : lists_) compare(name, model);
    }
  }

  static void create(const std::string& name, ModelList& model) {
    model = {};
    ASSERT_EQ(TEV8R1_PF_create_elem(name.c_str(), "", PF_ELEM_LIST), PF_NORMAL);
    std::strcpy(list(name).RESERVED, "carried");
  }

  std::map<std::string, ModelList> lists_{{"alpha", {}}, {"beta", {}}};
  int tables_seen_ = 0, blocks_seen_ = 0, keys_seen_ = 0;

 private:
  // ---- chance

  std::size_t below(std::size_t n) { return random_() % n; }
  bool chance(std::size_t n) { return below(n) == 0; }
  int number(int from, int to) { return from + int(below(std::size_t(to - from + 1))); }
  std::string letters(std::size_t longest, const char* of) {
    std::string text(below(longest + 1), ' ');
    for (char& c : text) c = of[below(std::strlen(of))];
    return text;
  }
  // Few enough to be met again, some of them patterns, blank in front, or too long.
  // Those of beta usually begin alike.
  std::string any_name() {
    if (chance(12)) return std::string(18, 'l') + letters(6, "lm*");
    if (name_ == "beta" && !chance(60)) return std::string(14, 'l') + letters(4, "abc\xE9");
    return (chance(10) ? " " : "") + letters(3, "abc\xE9") + (chance(12) ? "*" : "");
  }
  std::string known_name() {
    return model_->params.empty() || chance(6) ? any_name()
                                               : model_->params[below(model_->params.size())].name;
  }
  std::int32_t any_position() { return chance(8) ? PF_END_POS : number(-2, model_->count() + 2); }
  double any_value(std::int32_t type) {
    if (!tevpf::is_floating_type(type)) return number(-12, 12);
    return chance(20) ? std::nan("") : number(-12, 12) + 0.5;
  }
  Def any_def(std::string name) {
    Def def{chance(10) ? number(9, 17) : number(PF_TYPE_INT, PF_TYPE_SHORT), std::move(name),
            letters(9, "m/s")};
    if (chance(2)) def.description = letters(30, "word ");
    def.value = any_value(def.type);
    def.max = chance(20) ? any_value(def.type) : number(0, 14);
    def.min = chance(20) ? any_value(def.type) : number(-14, 1);
    def.precision = number(0, 8);
    def.text = letters(12, "text*");
    def.length = number(-5, 30);
    return def;
  }

  // ---- the model's answers

  TEVPF_STATUS refuse(TEVPF_STATUS status, std::string item, std::string value = "") {
    texts_ = {std::move(item), std::move(value)};
    return status;
  }
  TEVPF_STATUS refuse_duplicate(const std::string& name) {
    return refuse(PF_DUPLICATE, "parameter " + name, "list " + name_);
  }
  static std::string shown(std::int32_t type, double value) {
    char text[40];
    std::snprintf(text, sizeof text, tevpf::is_floating_type(type) ? "%g" : "%.0f", value);
    return text;
  }
  // The position of the first match in name order among all parameters but one; -1.
  std::int32_t find(const std::string& wanted, std::int32_t without = -1) {
    std::int32_t found = -1;
    for (std::int32_t i = 0; i < model_->count(); ++i) {
      const std::string& name = model_->at(i).name;
      if (i == without || TEV8R1_string_compare(name.c_str(), wanted.c_str()) != PF_NORMAL)
        continue;
      if (found < 0 || name < model_->at(found).name) found = i;
    }
    return found;
  }
  TEVPF_STATUS find_wanted() { return found_ < 0 ? refuse(PF_NOPARAM, wanted_) : PF_NORMAL; }
  bool is_inside(std::int32_t position) { return position >= 0 && position < model_->count(); }
  TEVPF_STATUS check(const Def& def) {
    if (def.name[0] == ' ') return refuse(PF_BADNAME, "");
    if (!tevpf::is_value_type(def.type)) {
      return refuse(PF_BADTYPE, "parameter", std::to_string(def.type));
    }
    if (def.type == PF_TYPE_STRING) return PF_NORMAL;
    if (!(def.max >= def.min)) return PF_BADRANGE;
    if (def.value > def.max || def.value < def.min) {
      return refuse(PF_RANGE, shown(def.type, def.value));
    }
    if (tevpf::is_floating_type(def.type) && def.precision < 1) {
      return refuse(PF_BADPREC, std::to_string(def.precision), def.name.substr(0, 19));
    }
    return PF_NORMAL;
  }
  // ---- comparing

  // Whether the operation was to be done.
  bool expect(TEVPF_STATUS actual, TEVPF_STATUS expected) {
    expect_answer(actual, expected, texts_);
    texts_ = kUntouched;
    return expected == PF_NORMAL;
  }
  void compare(const std::string& name, ModelList& model) {
    const TEVPF_LIST& record = unsettled(name);
    const tevpf::SequenceBlocks* const blocks = record.index.order.blocks;
    tables_seen_ += record.names.entries != nullptr;
    blocks_seen_ += record.slots.order.blocks != nullptr;
    keys_seen_ += blocks != nullptr && blocks->key_size > 0 && record.index.beginning_length > 12;
    ASSERT_STREQ(broken_rule(record), nullptr) << name;
    ASSERT_EQ(record.num_params, model.count());
    EXPECT_EQ(record.cur_param, model.cursor);
    EXPECT_EQ(record.free_params, model.free);
    EXPECT_STREQ(record.RESERVED, "carried");
    for (std::int32_t i = 0; i < model.count(); ++i) {
      EXPECT_EQ(text_of(tevpf::param_at(record, i).def), text_of(model.at(i))) << "position " << i;
    }
  }
  // A text as it stands in a buffer that was full of question marks.
  static std::vector<char> in_room(const std::string& text) {
    std::vector<char> room(text.c_str(), text.c_str() + text.size() + 1);
    room.resize(kRoom, '?');
    return room;
  }
  std::int32_t next() const {
    return model_->cursor < model_->count() - 1 ? model_->cursor + 1 : -1;
  }

  // ---- operations

  void add() {
    const Def def = any_def(any_name());
    const TEVPF_PARAM_DEF c = to_c(def);
    const TEVPF_STATUS actual = TEV8R1_PF_add_param(list_name(), &c, asked_);
    if (model_->free == 0) model_->free = kIncrement;
    const std::string kept = def.name.substr(0, 19);
    const bool known = find(kept) >= 0;
    refuse(PF_NOPARAM, kept);  // which is what adding looks for, and is glad not to find
    if (!expect(actual, known ? refuse_duplicate(kept) : check(def))) return;
    model_->params.insert(model_->params.begin() + std::clamp(asked_, 0, model_->count()),
                          as_kept(def));
    --model_->free;
  }
  void remove() {
    if (!expect(TEV8R1_PF_delete_param(list_name(), wanted()), find_wanted())) return;
    model_->params.erase(model_->params.begin() + found_);
    ++model_->free;
  }
  void redefine() {
    const Def def = any_def(wanted_);
    const TEVPF_STATUS actual = TEV8R1_PF_modify_param_def(list_name(), to_c(def));
    wanted_ = wanted_.substr(0, 19);
    found_ = find(wanted_);
    if (!expect(actual, found_ < 0 ? find_wanted() : check(def))) return;
    const std::string name = model_->at(found_).name;
    model_->at(found_) = as_kept(def);
    model_->at(found_).name = name;
  }
  void rename() {
    const std::string name = chance(4) ? known_name() : any_name();
    const TEVPF_STATUS actual = TEV8R1_PF_modify_param_name(list_name(), wanted(), name.c_str());
    TEVPF_STATUS expected = find_wanted();
    if (found_ >= 0) {
      const bool taken = find(name.substr(0, 19), found_) >= 0;
      refuse(PF_NOPARAM, name);
      if (taken) expected = refuse_duplicate(name);
    }
    if (expect(actual, expected)) model_->at(found_).name = name.substr(0, 19);
  }
  void move() {
    const std::int32_t to = asked_ == PF_END_POS ? model_->count() - 1 : asked_;
    const TEVPF_STATUS expected = found_ < 0 || is_inside(to) ? find_wanted() : PF_BADPOS;
    if (!expect(TEV8R1_PF_move_param(list_name(), wanted(), asked_), expected)) return;
    const Def moved = model_->at(found_);
    model_->params.erase(model_->params.begin() + found_);
    model_->params.insert(model_->params.begin() + to, moved);
  }
  void change_value() {
    Def changed = found_ < 0 ? Def{} : model_->at(found_);
    if (found_ >= 0 && changed.type != PF_TYPE_STRING && chance(10)) {
      std::swap(changed.max, changed.min);  // as only a file may have them
      if (tevpf::is_floating_type(changed.type) && chance(4)) changed.max = NAN;
      model_->at(found_) = changed;
      tevpf::param_at(unsettled(name_), found_).def.part = to_c(changed).part;
    }
    changed.value = any_value(changed.type);
    if (changed.type == PF_TYPE_DOUBLE && chance(4)) {
      changed.value = std::nextafter(changed.max, chance(2) ? 1e9 : -1e9);
    }
    changed.text = letters(16, "value");
    const TEVPF_PARAM_DEF c = to_c(changed);
    char value[32];
    TEV8R1_load_param_value(&c, value);
    TEVPF_STATUS expected = find_wanted();
    if (found_ >= 0 && changed.type != PF_TYPE_STRING) {
      if (changed.max < changed.min) {
        expected = PF_BADRANGE;
      } else if (!(changed.value <= changed.max && changed.value >= changed.min)) {
        expected = refuse(PF_RANGE, shown(changed.type, changed.value));
      }
    }
    const TEVPF_STATUS actual = TEV8R1_PF_modify_param(list_name(), wanted(), value);
    if (expect(actual, expected)) model_->at(found_) = as_kept(changed);
  }
  // A value by name, or the next one.
  void value() {
    const bool by_name = chance(2);
    const std::int32_t position = by_name ? found_ : next();
    std::string value(kRoom, '?'), expected = value;
    char name[TEVPF_NAME_SIZE] = "?";
    const TEVPF_STATUS refusal = by_name ? find_wanted() : PF_NOMORE;
    expect(by_name ? TEV8R1_PF_get_param_value(list_name(), wanted(), value.data())
                   : TEV8R1_PF_get_next_param(list_name(), name, value.data()),
           position < 0 ? refusal : PF_NORMAL);
    EXPECT_EQ(name, by_name || position < 0 ? "?" : model_->at(position).name);
    if (position >= 0) {
      const TEVPF_PARAM_DEF c = to_c(model_->at(position));
      TEV8R1_load_param_value(&c, expected.data());
      model_->cursor = position;
    } else if (!by_name && model_->cursor < INT_MAX) {
      ++model_->cursor;
    }
    EXPECT_EQ(value, expected);
  }

  enum Way { kNext, kByName, kByPosition, kPrevious };
  // The position that one of these ways leads to; -1, and then why.
  std::int32_t select(Way way, TEVPF_STATUS& expected) {
    expected = PF_NOMORE;
    std::int32_t position = -1;
    if (way == kNext) position = next();
    if (way == kPrevious) position = std::clamp(model_->cursor, 0, model_->count()) - 1;
    if (way == kByName) {
      position = found_;
      expected = find_wanted();
    } else if (way == kByPosition && is_inside(asked_)) {
      position = asked_;
    } else if (way == kByPosition) {
      expected = refuse(PF_BADPOS, std::to_string(asked_), std::to_string(model_->count()));
    }
    if (position >= 0) expected = PF_NORMAL;
    return position;
  }
  void sizes() {
    const char* const list = list_name();
    const Way way = Way(below(3));
    std::int32_t type = -1, value = -1, text = -1;
    TEVPF_STATUS expected;
    const std::int32_t position = select(way, expected);
    expect(way == kNext     ? TEV8R1_PF_inq_next_param_size(list, &type, &value, &text)
           : way == kByName ? TEV8R1_PF_inq_param_size(list, wanted(), &type, &value, &text)
                            : TEV8R1_PF_inq_param_size_by_pos(list, asked_, &type, &value, &text),
           expected);
    EXPECT_EQ(type < 0 && value < 0 && text < 0, position < 0);
    if (position < 0) return;
    const Def& def = model_->at(position);
    EXPECT_EQ(type, def.type);
    EXPECT_EQ(value, tevpf::value_size(def.type, def.length));
    EXPECT_EQ(text, std::ssize(def.description.value_or("")) + 1);
  }
  void definition() {
    const char* const list = list_name();
    const Way way = Way(below(4));
    DefBuffers out(kRoom, kRoom);
    TEVPF_STATUS expected;
    const std::int32_t position = select(way, expected);
    const TEVPF_STATUS actual = way == kNext       ? TEV8R1_PF_get_next_param_def(list, &out.c)
                                : way == kPrevious ? TEV8R1_PF_get_prev_param_def(list, &out.c)
                                : way == kByName
                                    ? TEV8R1_PF_get_param_def(list, wanted(), &out.c)
                                    : TEV8R1_PF_get_param_def_by_pos(list, asked_, &out.c);
    EXPECT_TRUE(out.c.description == out.description.data()) << "the caller's pointer stays";
    if (!expect(actual, expected)) return;
    Def def = model_->at(position);
    def.description = def.description.value_or("");
    EXPECT_EQ(text_of(out.c), text_of(def));
    EXPECT_EQ(out.description, in_room(*def.description));
    EXPECT_TRUE(def.type != PF_TYPE_STRING || out.value == in_room(def.text));
    model_->cursor = position;
  }

  void inquire() {
    std::int32_t count = -1, position = -1, type = -1;
    expect(TEV8R1_PF_inq_num_params(list_name(), &count), PF_NORMAL);
    expect(TEV8R1_inq_param_pos(list_name(), wanted(), &position), find_wanted());
    expect(TEV8R1_inq_param_exists(list_name(), wanted()), find_wanted());
    expect(TEV8R1_get_param_type(list_name(), wanted(), &type), find_wanted());
    EXPECT_EQ(count, model_->count());
    EXPECT_EQ(position, found_);
    EXPECT_EQ(type, found_ < 0 ? -1 : model_->at(found_).type);
  }
  void hand_out() {
    TEVPF_LIST& record = list(name_);
    TEVPF_PARAM* param = nullptr;
    std::int32_t place = -1, same_place = -1;
    ASSERT_STREQ(broken_settled_rule(record), nullptr);
    expect(TEV8R1_list_binary_search(record.param_ptr, record.num_params, record.index_ptr,
                                     wanted(), &place),
           find_wanted());
    expect(TEV8R1_get_param_ptr(&record, wanted(), &param, &same_place), find_wanted());
    EXPECT_EQ(place, same_place);
    EXPECT_EQ(param, found_ < 0 ? nullptr : record.param_ptr + found_);
    // Where it stands in the name index, or where it would be inserted.
    const std::string bound = found_ < 0 ? wanted_ : model_->at(found_).name;
    EXPECT_EQ(place, std::count_if(model_->params.begin(), model_->params.end(),
                                   [&](const Def& def) { return def.name < bound; }));
  }
  void set_cursor() {
    const TEVPF_STATUS expected = is_inside(asked_) ? PF_NORMAL : PF_BADPOS;
    if (expect(TEV8R1_set_cur_param(list_name(), asked_), expected)) model_->cursor = asked_;
  }
  void reset() {
    expect(TEV8R1_PF_reset_param(list_name()), PF_NORMAL);
    model_->cursor = -1;
    if (chance(2)) unsettled(name_).cur_param = model_->cursor = INT_MAX - number(0, 1);
  }
  // From the start to the end, again and again: in the end the list is settled.
  void walk() {
    std::string value(kRoom, '?');
    char name[TEVPF_NAME_SIZE];
    const bool changed = !unsettled(name_).slots.order.is_identity();
    for (int pass = 0; pass < 6; ++pass) {
      expect(TEV8R1_PF_reset_param(list_name()), PF_NORMAL);
      for (std::int32_t i = 0; i < model_->count(); ++i) {
        expect(TEV8R1_PF_get_next_param(list_name(), name, value.data()), PF_NORMAL);
        EXPECT_EQ(name, model_->at(i).name);
      }
    }
    model_->cursor = model_->count() - 1;
    EXPECT_TRUE(!changed || broken_settled_rule(unsettled(name_)) == nullptr);
  }
  void inquire_default() {
    const std::int32_t type = number(10, 16);
    TEVPF_STATUS expected = PF_NORMAL;
    if (!tevpf::is_value_type(type)) {
      expected = refuse(PF_BADTYPE, "function call", std::to_string(type));
    }
    TEVPF_PARAM_DEF out{};
    if (!expect(TEV8R1_PF_inq_param_dft(list_name(), type, &out), expected)) return;
    EXPECT_EQ(text_of(out), text_of(model_->default_of(type)));
    std::free(out.description);
    if (type == PF_TYPE_STRING) std::free(out.part.str.value);
  }
  void set_default() {
    const Def def = any_def(any_name());
    if (!expect(TEV8R1_PF_set_param_dft(list_name(), to_c(def)), check(def))) return;
    model_->default_of(def.type) = as_kept(def);
    model_->default_of(def.type).length = def.length;
  }
  void replace() {
    if (!chance(10)) return;
    const std::string source = name_ == "alpha" ? "beta" : "alpha";
    expect(TEV8R1_PF_delete_list(list_name()), PF_NORMAL);
    if (chance(2)) return create(name_, *model_);
    expect(TEV8R1_PF_copy_list(source.c_str(), list_name()), PF_NORMAL);
    *model_ = lists_[source];
    model_->free = 0;
    if (model_->params.empty()) model_->defaults = kInitialDefaults;
  }
  void reopen() {
    if (!chance(10)) return;
    save_and_reopen();
    set_error_texts();
    for (auto& [name, model] : lists_) {
      model.cursor = -1;
      model.free = 0;
      model.defaults = kInitialDefaults;
    }
  }

  static TEVPF_LIST& unsettled(const std::string& name) {
    TEVPF_LIST* found = nullptr;
    EXPECT_EQ(tevpf::find_list(name.c_str(), found), PF_NORMAL);
    return *found;
  }

  const char* list_name() const { return name_.c_str(); }
  const char* wanted() const { return wanted_.c_str(); }

  std::mt19937 random_{1};
  std::string name_;
  ModelList* model_ = nullptr;
  std::string wanted_;       // a name, perhaps a pattern, of a parameter that is there or not
  std::int32_t found_ = -1;  // its position
  std::int32_t asked_ = 0;   // a position that is there or not
  ErrorTexts texts_ = kUntouched;
};

TEST_F(ListModel, RandomSequences) {
  ASSERT_EQ(TEV8R1_PF_set_memory_allocation(kInitial, kIncrement), PF_NORMAL);
  for (auto& [name, model] : lists_) create(name, model);
  set_error_texts();
  run(8000);
  EXPECT_GT(tables_seen_, 1000) << "names were to be looked up through the table, too";
  EXPECT_GT(blocks_seen_, 1000) << "parameters were to be in order through blocks, too";
  EXPECT_GT(keys_seen_, 500) << "and names to be found through keys behind a long beginning";
}

}  // namespace
