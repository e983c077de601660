// Random operations on several lists and on a plain model of them. After every one: status, both error
// texts, every parameter, cursor, spare slots, and the invariants of the record.
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <cfloat>
#include <climits>
#include <map>
#include <random>

#include "support/param_def.h"
#include "support/temp_file.h"

namespace {

constexpr int kInitial = 3;
constexpr int kIncrement = 2;

std::array<Def, 5> initial_defaults() {
  std::array<Def, 5> defaults;
  const double highest[] = {INT_MAX, FLT_MAX, 0, DBL_MAX, SHRT_MAX};
  const double lowest[] = {INT_MIN, -FLT_MAX, 0, -DBL_MAX, SHRT_MIN};
  for (std::int32_t i = 0; i < 5; ++i) {
    const auto slot = static_cast<std::size_t>(i);
    defaults[slot] = Def{PF_TYPE_INT + i, "", "", {}, 0, highest[i], lowest[i]};
  }
  return defaults;
}

struct ModelList {
  std::vector<Def> params;
  std::int32_t cursor = -1;
  std::int32_t free = kInitial;
  std::array<Def, 5> defaults = initial_defaults();

  std::int32_t count() const { return static_cast<std::int32_t>(params.size()); }
  Def& at(std::int32_t position) { return params[static_cast<std::size_t>(position)]; }
};

bool matches(const std::string& name, const std::string& wanted) {
  const bool pattern = !wanted.empty() && wanted.find('*') == wanted.size() - 1;
  return pattern ? name.compare(0, wanted.size() - 1, wanted, 0, wanted.size() - 1) == 0
                 : name == wanted;
}

class ListModel : public TempFileTest {
 protected:
  void run(unsigned seed, int steps) {
    using M = ListModel;
    // clang-format off
    static constexpr void (M::*operations[])() = {
        &M::add, &M::add, &M::add, &M::add, &M::add, &M::remove, &M::redefine, &M::redefine,
        &M::rename, &M::move, &M::change_value, &M::change_value, &M::get_value, &M::next_value,
        &M::next_def, &M::previous_def, &M::def_by_name, &M::def_by_position, &M::sizes,
        &M::inquire, &M::set_cursor, &M::reset, &M::inquire_default, &M::set_default,
        &M::replace_by_copy, &M::reopen};
    // clang-format on
    random_.seed(seed);
    lists_.clear();
    for (const char* name : {"alpha", "beta"}) {
      ASSERT_EQ(TEV8R1_PF_create_elem(name, "", PF_ELEM_LIST), PF_NORMAL);
      lists_[name];
    }
    set_error_texts(texts_ = kUntouched);
    for (int step = 0; step < steps; ++step) {
      name_ = chance(2) ? "alpha" : "beta";
      model_ = &lists_[name_];
      const std::size_t operation = below(std::size(operations));
      SCOPED_TRACE("seed " + std::to_string(seed) + ", step " + std::to_string(step) +
                   ", operation " + std::to_string(operation) + " in " + name_);
      (this->*operations[operation])();
      for (auto& [name, model] : lists_) compare(name, model);
      if (HasFailure()) return;
    }
  }

  int tables_seen_ = 0;

 private:
  // ---- chance

  std::size_t below(std::size_t n) {
    return std::uniform_int_distribution<std::size_t>(0, n - 1)(random_);
  }
  bool chance(std::size_t n) { return below(n) == 0; }
  std::int32_t number(std::int32_t from, std::int32_t to) {
    return std::uniform_int_distribution<std::int32_t>(from, to)(random_);
  }
  std::string letters(std::size_t longest, const char* of) {
    std::string text(below(longest + 1), ' ');
    for (char& c : text) c = of[below(std::strlen(of))];
    return text;
  }
  // Few enough to be met again, some of them patterns, blank in front, or too long.
  std::string any_name() {
    if (chance(12)) return std::string(18, 'l') + letters(6, "lm*");
    return (chance(20) ? " " : "") + letters(3, "abc\xE9") + (chance(12) ? "*" : "");
  }
  std::string known_name() {
    return model_->params.empty() || chance(6) ? any_name()
                                               : model_->params[below(model_->params.size())].name;
  }
  std::int32_t any_position() { return chance(8) ? PF_END_POS : number(-2, model_->count() + 2); }
  double any_value(std::int32_t type) {
    return number(-12, 12) + (tevpf::is_floating_type(type) ? 0.5 : 0.0);
  }
  Def any_def(std::string name) {
    Def def{chance(20) ? number(9, 17) : number(PF_TYPE_INT, PF_TYPE_SHORT), std::move(name),
            letters(9, "m/s")};
    if (chance(2)) def.description = letters(30, "word ");
    def.value = any_value(def.type);
    def.max = number(0, 14);
    def.min = number(-14, 1);
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
  static std::string shown(std::int32_t type, double value) {
    char text[40];
    std::snprintf(text, sizeof text, tevpf::is_floating_type(type) ? "%g" : "%.0f", value);
    return text;
  }
  // The position of the first match in name order among all parameters but one; -1.
  std::int32_t find_in_model(const std::string& wanted, std::int32_t without = -1) {
    std::int32_t found = -1;
    for (std::int32_t i = 0; i < model_->count(); ++i) {
      if (i == without || !matches(model_->at(i).name, wanted)) continue;
      if (found < 0 || model_->at(i).name < model_->at(found).name) found = i;
    }
    return found;
  }
  std::int32_t find(const std::string& wanted) {
    const std::int32_t found = find_in_model(wanted);
    if (found < 0) refuse(PF_NOPARAM, wanted);
    return found;
  }
  TEVPF_STATUS check(const Def& def) {
    if (def.name[0] == ' ') return refuse(PF_BADNAME, "");
    if (!tevpf::is_value_type(def.type)) {
      return refuse(PF_BADTYPE, "parameter", std::to_string(def.type));
    }
    if (def.type == PF_TYPE_STRING) return PF_NORMAL;
    if (def.max < def.min) return PF_BADRANGE;
    if (def.value > def.max || def.value < def.min) {
      return refuse(PF_RANGE, shown(def.type, def.value));
    }
    if (tevpf::is_floating_type(def.type) && def.precision < 1) {
      return refuse(PF_BADPREC, std::to_string(def.precision), def.name.substr(0, 19));
    }
    return PF_NORMAL;
  }
  static std::int32_t value_size(const Def& def) {
    return static_cast<std::int32_t>(tevpf::value_size(def.type, def.length));
  }
  static std::int32_t desc_size(const Def& def) {
    return static_cast<std::int32_t>(def.description.value_or("").size()) + 1;
  }

  // ---- comparing

  void expect(TEVPF_STATUS actual, TEVPF_STATUS expected) {
    EXPECT_EQ(actual, expected);
    EXPECT_EQ(error_texts(), texts_);
  }
  void compare(const std::string& name, ModelList& model) {
    const TEVPF_LIST& record = list(name);
    tables_seen_ += record.names.slots != nullptr;
    ASSERT_EQ(broken_rule(record), nullptr) << name;
    ASSERT_EQ(record.num_params, model.count());
    EXPECT_EQ(record.cur_param, model.cursor);
    EXPECT_EQ(record.free_params, model.free);
    for (std::int32_t i = 0; i < model.count(); ++i) {
      EXPECT_EQ(text_of(record.param_ptr[i].def), text_of(model.at(i))) << "position " << i;
    }
  }
  void compare_delivered(std::int32_t position, const DefBuffers& out) {
    Def expected = model_->at(position);
    expected.description = expected.description.value_or("");
    EXPECT_TRUE(out.c.description == out.description.data()) << "the caller's pointer stays";
    if (expected.type == PF_TYPE_STRING) {
      EXPECT_TRUE(out.c.part.str.value == out.value.data());
    }
    EXPECT_EQ(text_of(out.c), text_of(expected));
    model_->cursor = position;
  }
  void compare_value(std::int32_t position, const std::vector<char>& value) {
    if (position < 0) return;
    const TEVPF_PARAM_DEF c = to_c(model_->at(position));
    std::vector<char> wanted(value.size());
    TEV8R1_load_param_value(&c, wanted.data());
    EXPECT_EQ(value, wanted);
    model_->cursor = position;
  }
  std::vector<char> buffer_for_value(std::int32_t position) {
    return std::vector<char>(std::size_t(position < 0 ? 1 : value_size(model_->at(position))));
  }
  std::int32_t next() const {
    return model_->cursor < model_->count() - 1 ? model_->cursor + 1 : -1;
  }

  // ---- operations

  void add() {
    const Def def = any_def(any_name());
    const TEVPF_PARAM_DEF c = to_c(def);
    const std::int32_t position = any_position();
    const TEVPF_STATUS actual = TEV8R1_PF_add_param(list_name(), &c, position);
    if (model_->free == 0) model_->free = kIncrement;
    const std::string kept = def.name.substr(0, 19);
    if (find(kept) >= 0) {
      return expect(actual, refuse(PF_DUPLICATE, "parameter " + kept, "list " + name_));
    }
    const TEVPF_STATUS expected = check(def);
    expect(actual, expected);
    if (expected != PF_NORMAL) return;
    model_->params.insert(model_->params.begin() + std::clamp(position, 0, model_->count()),
                          as_kept(def));
    --model_->free;
  }
  void remove() {
    const std::string name = known_name();
    const TEVPF_STATUS actual = TEV8R1_PF_delete_param(list_name(), name.c_str());
    const std::int32_t position = find(name);
    expect(actual, position < 0 ? PF_NOPARAM : PF_NORMAL);
    if (position < 0) return;
    model_->params.erase(model_->params.begin() + position);
    ++model_->free;
  }
  void redefine() {
    const Def def = any_def(known_name());
    const TEVPF_STATUS actual = TEV8R1_PF_modify_param_def(list_name(), to_c(def));
    const std::int32_t position = find(def.name.substr(0, 19));
    const TEVPF_STATUS expected = position < 0 ? TEVPF_STATUS{PF_NOPARAM} : check(def);
    expect(actual, expected);
    if (expected != PF_NORMAL) return;
    const std::string name = model_->at(position).name;
    model_->at(position) = as_kept(def);
    model_->at(position).name = name;
  }
  void rename() {
    const std::string name = known_name();
    const std::string new_name = chance(4) ? known_name() : any_name();
    const TEVPF_STATUS actual =
        TEV8R1_PF_modify_param_name(list_name(), name.c_str(), new_name.c_str());
    const std::int32_t position = find(name);
    if (position < 0) return expect(actual, PF_NOPARAM);
    if (find_in_model(new_name.substr(0, 19), position) >= 0) {
      return expect(actual, refuse(PF_DUPLICATE, "parameter " + new_name, "list " + name_));
    }
    refuse(PF_NOPARAM, new_name);
    expect(actual, PF_NORMAL);
    model_->at(position).name = new_name.substr(0, 19);
  }
  void move() {
    const std::string name = known_name();
    std::int32_t to = any_position();
    const TEVPF_STATUS actual = TEV8R1_PF_move_param(list_name(), name.c_str(), to);
    const std::int32_t from = find(name);
    if (from < 0) return expect(actual, PF_NOPARAM);
    if (to == PF_END_POS) to = model_->count() - 1;
    if (to < 0 || to >= model_->count()) return expect(actual, PF_BADPOS);
    expect(actual, PF_NORMAL);
    const Def moved = model_->at(from);
    model_->params.erase(model_->params.begin() + from);
    model_->params.insert(model_->params.begin() + to, moved);
  }
  void change_value() {
    const std::string name = known_name();
    const std::int32_t position = find_in_model(name);
    Def changed = position < 0 ? Def{} : model_->at(position);
    changed.value = any_value(changed.type);
    changed.text = letters(16, "value");
    const TEVPF_PARAM_DEF c = to_c(changed);
    char value[32];
    TEV8R1_load_param_value(&c, value);
    const TEVPF_STATUS actual = TEV8R1_PF_modify_param(list_name(), name.c_str(), value);
    if (find(name) < 0) return expect(actual, PF_NOPARAM);
    const bool number = changed.type != PF_TYPE_STRING;
    if (number && (changed.value > changed.max || changed.value < changed.min)) {
      return expect(actual, refuse(PF_RANGE, shown(changed.type, changed.value)));
    }
    expect(actual, PF_NORMAL);
    model_->at(position) = as_kept(changed);
  }
  void get_value() {
    const std::string name = known_name();
    const std::int32_t position = find(name);
    std::vector<char> value = buffer_for_value(position);
    expect(TEV8R1_PF_get_param_value(list_name(), name.c_str(), value.data()),
           position < 0 ? PF_NOPARAM : PF_NORMAL);
    compare_value(position, value);
  }
  void next_value() {
    const std::int32_t position = next();
    char name[TEVPF_NAME_SIZE] = "?";
    std::vector<char> value = buffer_for_value(position);
    expect(TEV8R1_PF_get_next_param(list_name(), name, value.data()),
           position < 0 ? PF_NOMORE : PF_NORMAL);
    EXPECT_EQ(name, position < 0 ? "?" : model_->at(position).name);
    if (position < 0) ++model_->cursor;
    compare_value(position, value);
  }
  // One operation delivers the definition at a position, or refuses where there is none.
  template <class Operation>
  void deliver(std::int32_t position, TEVPF_STATUS refusal, const Operation& operation) {
    const Def def = position < 0 ? Def{} : model_->at(position);
    DefBuffers out(value_size(def), desc_size(def));
    expect(operation(&out.c), position < 0 ? refusal : PF_NORMAL);
    if (position >= 0) compare_delivered(position, out);
  }
  void next_def() {
    deliver(next(), PF_NOMORE,
            [&](auto* out) { return TEV8R1_PF_get_next_param_def(list_name(), out); });
  }
  void previous_def() {
    deliver(std::min(std::max(model_->cursor, 0), model_->count()) - 1, PF_NOMORE,
            [&](auto* out) { return TEV8R1_PF_get_prev_param_def(list_name(), out); });
  }
  void def_by_name() {
    const std::string name = known_name();
    deliver(find(name), PF_NOPARAM,
            [&](auto* out) { return TEV8R1_PF_get_param_def(list_name(), name.c_str(), out); });
  }
  // The position if there is a parameter at it; -1.
  std::int32_t inside(std::int32_t position) {
    if (position >= 0 && position < model_->count()) return position;
    refuse(PF_BADPOS, std::to_string(position), std::to_string(model_->count()));
    return -1;
  }
  void def_by_position() {
    const std::int32_t position = any_position();
    deliver(inside(position), PF_BADPOS,
            [&](auto* out) { return TEV8R1_PF_get_param_def_by_pos(list_name(), position, out); });
  }
  void sizes() {
    std::int32_t type = -1, value = -1, description = -1;
    const std::string name = known_name();
    std::int32_t position = any_position();
    TEVPF_STATUS actual, refusal;
    if (chance(3)) {
      position = find(name);
      refusal = PF_NOPARAM;
      actual = TEV8R1_PF_inq_param_size(list_name(), name.c_str(), &type, &value, &description);
    } else if (chance(2)) {
      refusal = PF_BADPOS;
      actual = TEV8R1_PF_inq_param_size_by_pos(list_name(), position, &type, &value, &description);
      position = inside(position);
    } else {
      position = next();
      refusal = PF_NOMORE;
      actual = TEV8R1_PF_inq_next_param_size(list_name(), &type, &value, &description);
    }
    expect(actual, position < 0 ? refusal : PF_NORMAL);
    EXPECT_EQ(type, position < 0 ? -1 : model_->at(position).type);
    EXPECT_EQ(value, position < 0 ? -1 : value_size(model_->at(position)));
    EXPECT_EQ(description, position < 0 ? -1 : desc_size(model_->at(position)));
  }
  void inquire() {
    std::int32_t count = -1, position = -1, type = -1;
    expect(TEV8R1_PF_inq_num_params(list_name(), &count), PF_NORMAL);
    EXPECT_EQ(count, model_->count());
    const std::string name = known_name();
    const std::int32_t found = find(name);
    const TEVPF_STATUS expected = found < 0 ? PF_NOPARAM : PF_NORMAL;
    expect(TEV8R1_inq_param_pos(list_name(), name.c_str(), &position), expected);
    EXPECT_EQ(position, found);
    expect(TEV8R1_inq_param_exists(list_name(), name.c_str()), expected);
    expect(TEV8R1_get_param_type(list_name(), name.c_str(), &type), expected);
    EXPECT_EQ(type, found < 0 ? -1 : model_->at(found).type);
  }
  void set_cursor() {
    const std::int32_t position = any_position();
    const bool inside = position >= 0 && position < model_->count();
    expect(TEV8R1_set_cur_param(list_name(), position), inside ? PF_NORMAL : PF_BADPOS);
    if (inside) model_->cursor = position;
  }
  void reset() {
    if (!chance(4)) return;
    expect(TEV8R1_PF_reset_param(list_name()), PF_NORMAL);
    model_->cursor = -1;
  }
  void inquire_default() {
    const std::int32_t type = number(10, 16);
    TEVPF_PARAM_DEF out{};
    const TEVPF_STATUS actual = TEV8R1_PF_inq_param_dft(list_name(), type, &out);
    if (!tevpf::is_value_type(type)) {
      return expect(actual, refuse(PF_BADTYPE, "function call", std::to_string(type)));
    }
    expect(actual, PF_NORMAL);
    EXPECT_EQ(text_of(out),
              text_of(model_->defaults[static_cast<std::size_t>(type - PF_TYPE_INT)]));
    std::free(out.description);
    if (type == PF_TYPE_STRING) std::free(out.part.str.value);
  }
  void set_default() {
    const Def def = any_def(any_name());
    const TEVPF_STATUS expected = check(def);
    expect(TEV8R1_PF_set_param_dft(list_name(), to_c(def)), expected);
    if (expected != PF_NORMAL) return;
    Def& slot = model_->defaults[static_cast<std::size_t>(def.type - PF_TYPE_INT)];
    slot = as_kept(def);
    if (def.type == PF_TYPE_STRING) slot.length = def.length;
  }
  void replace_by_copy() {
    if (!chance(10)) return;
    const std::string source = name_ == "alpha" ? "beta" : "alpha";
    expect(TEV8R1_PF_delete_list(list_name()), PF_NORMAL);
    expect(TEV8R1_PF_copy_list(source.c_str(), list_name()), PF_NORMAL);
    *model_ = lists_[source];
    model_->free = 0;
    if (model_->params.empty()) model_->defaults = initial_defaults();
  }
  void reopen() {
    if (!chance(10)) return;
    save_and_reopen();
    set_error_texts(texts_);
    for (auto& [name, model] : lists_) {
      model.cursor = -1;
      model.free = 0;
      model.defaults = initial_defaults();
    }
  }

  const char* list_name() const { return name_.c_str(); }

  std::mt19937 random_;
  std::map<std::string, ModelList> lists_;
  std::string name_;
  ModelList* model_ = nullptr;
  ErrorTexts texts_;
};

TEST_F(ListModel, RandomSequences) {
  ASSERT_EQ(TEV8R1_PF_set_memory_allocation(kInitial, kIncrement), PF_NORMAL);
  for (const unsigned seed : {1U, 2U, 3U}) {
    run(seed, 5000);
    if (HasFailure()) return;
    for (const char* name : {"alpha", "beta"}) TEV8R1_PF_delete_list(name);
  }
  EXPECT_GT(tables_seen_, 1000) << "names were to be looked up through the table, too";
}

}  // namespace
