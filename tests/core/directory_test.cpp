// The directory: random operations against a plain model, and the statuses of each.
#include <gtest/gtest.h>

#include <algorithm>
#include <cstdlib>
#include <random>
#include <vector>

#include "support/temp_file.h"

namespace {

struct Element {
  std::string name, desc;
  bool operator==(const Element&) const = default;
};

using DirectoryTest = TempFileTest;

TEVPF_FILE& file() { return *tevpf::library.current_file; }

// The two kinds of elements through one set of operations.
struct Kind {
  std::int32_t type;
  const char* word;
  TEVPF_STATUS (*copy)(const char*, const char*);
  TEVPF_STATUS (*remove)(const char*);
  TEVPF_STATUS (*check_unique)(const char*);

  TEVPF_STATUS create(const std::string& name, const std::string& desc = "") const {
    return TEV8R1_PF_create_elem(name.c_str(), desc.c_str(), type);
  }
  // The element's position in the directory, through both lookups; -1 when there is none.
  std::int32_t find(const std::string& name) const {
    std::int32_t pos = -1;
    TEVPF_LIST* list;
    TEVPF_TABLE* table;
    if (type == PF_ELEM_LIST && TEV8R1_get_list_ptr(name.c_str(), &list) == PF_NORMAL)
      TEV8R1_get_list_array_pos(list, &pos);
    if (type == PF_ELEM_TABLE && TEV8R1_get_table_ptr(name.c_str(), &table) == PF_NORMAL)
      TEV8R1_get_table_array_pos(table, &pos);
    return pos;
  }
};
const Kind kKinds[] = {
    {PF_ELEM_LIST, "list", TEV8R1_PF_copy_list, TEV8R1_PF_delete_list, TEV8R1_check_list_unique},
    {PF_ELEM_TABLE, "table", TEV8R1_PF_copy_table, TEV8R1_PF_delete_table,
     TEV8R1_check_table_unique}};

// The directory as it is handed out; the arrays are the caller's, whatever the status.
struct Elements {
  char file[TEVPF_FILE_NAME_SIZE];
  std::int32_t counts[2];
  char (*names[2])[TEVPF_NAME_SIZE] = {};
  char (*descs[2])[TEVPF_DESC_SIZE] = {};
  TEVPF_STATUS status = TEV8R1_PF_inq_file_elements(file, &counts[0], &names[0], &descs[0],
                                                    &counts[1], &names[1], &descs[1]);
  Elements() {}
  Elements(const Elements&) = delete;
  ~Elements() {
    for (auto* block : names) std::free(block);
    for (auto* block : descs) std::free(block);
  }
};

// One random operation on the model and on the library: they must agree on whether it is done.
class Model {
 public:
  void step() {
    const std::size_t k = pick(2);
    const Kind& kind = kKinds[k];
    std::vector<Element>& model = elements_[k];
    const std::string name = some_name(), other = some_name();
    const auto at = find(model, name), at_other = find(model, other);
    const bool known = at != model.end(), taken = at_other != model.end();
    const TEVPF_STATUS found = known ? PF_NORMAL : PF_NOELEM;
    switch (pick(8)) {
      case 3:
        EXPECT_EQ(kind.remove(name.c_str()), found);
        if (known) model.erase(at);
        break;
      case 4:
        EXPECT_EQ(TEV8R1_modify_elem_name(kind.type, name.c_str(), other.c_str()),
                  name == other ? TEVPF_STATUS{PF_NORMAL}
                  : taken       ? PF_DUPLICATE
                                : found);
        if (known && !taken) at->name = other;
        break;
      case 5:
        EXPECT_EQ(TEV8R1_modify_elem_desc(kind.type, name.c_str(), other.c_str()), found);
        if (known) at->desc = other;
        break;
      case 6:
        EXPECT_EQ(kind.copy(name.c_str(), other.c_str()),
                  known && taken ? TEVPF_STATUS{PF_DUPLICATE} : found);
        if (known && !taken) append(k, {other, Element(*at).desc});
        break;
      case 7:
        EXPECT_EQ(kind.find(name), known ? at - model.begin() : -1);
        break;
      default:
        EXPECT_EQ(kind.create(name, "first"), known ? PF_DUPLICATE : PF_NORMAL);
        if (!known) append(k, {name, "first"});
    }
  }

  void compare() const {
    const Elements kept;
    ASSERT_EQ(kept.status, PF_NORMAL);
    for (int k = 0; k < 2; ++k) {
      std::vector<Element> found;
      for (int i = 0; i < kept.counts[k]; ++i)
        found.push_back({kept.names[k][i], kept.descs[k][i]});
      EXPECT_EQ(found, elements_[k]);
    }
    EXPECT_EQ(broken_rules(), "");
    for (int k = 0; k < 2; ++k) {
      const tevpf::Directory& directory = file().directories[k];
      EXPECT_EQ(directory.free_slots, free_slots_[k]);
      EXPECT_LE(directory.count + directory.free_slots, directory.room);
    }
  }

  void reopened() {
    for (int k = 0; k < 2; ++k) free_slots_[k] = (100 - elements_[k].size() % 100) % 100;
  }

 private:
  std::size_t pick(std::size_t n) { return random_() % n; }
  // From few names, so that they meet; now some, now so many that they are hashed.
  std::string some_name() { return "N" + std::to_string(pick(pick(3) == 0 ? 10 : 300)); }
  static std::vector<Element>::iterator find(std::vector<Element>& model, const std::string& name) {
    return std::find_if(model.begin(), model.end(),
                        [&](const Element& e) { return e.name == name; });
  }
  void append(std::size_t k, const Element& element) {
    elements_[k].push_back(element);
    free_slots_[k] = free_slots_[k] == 0 ? 99 : free_slots_[k] - 1;
  }

  std::mt19937 random_{20260};
  std::vector<Element> elements_[2];
  std::size_t free_slots_[2] = {};  // added by the hundred, not won back by deletions
};

TEST_F(DirectoryTest, AgreesWithAPlainModel) {
  Model model;
  for (int i = 0; i < 6000 && !HasFailure(); ++i) {
    model.step();
    if (i % 7 == 0) model.compare();
    if (i % 1500 != 1499) continue;
    save_and_reopen();
    model.reopened();
    model.compare();
  }
  EXPECT_GT(file().directories[0].count, 16);  // names were hashed
}

TEST_F(DirectoryTest, NamesAreCutAndComparedAsTheyAreKept) {
  const std::string kept(19, 'k'), longer = kept + "more", alike = kept + "other";
  for (const Kind& kind : kKinds) {
    const std::string word = kind.word;
    const ErrorTexts taken{word + " " + alike, "the file"};
    EXPECT_EQ(kind.create(longer, std::string(90, 'd')), PF_NORMAL);
    EXPECT_EQ(kind.find(kept), 0);
    EXPECT_EQ(kind.find(longer), -1);
    EXPECT_EQ(error_texts(), (ErrorTexts{word, longer}));
    expect_answer(kind.create(alike), PF_DUPLICATE, {word + " " + kept, "the file"});
    expect_answer(kind.check_unique(alike.c_str()), PF_DUPLICATE, taken);
    expect_answer(kind.copy(kept.c_str(), alike.c_str()), PF_DUPLICATE, taken);
    expect_answer(TEV8R1_modify_elem_name(kind.type, "nobody", alike.c_str()), PF_DUPLICATE, taken);
    for (const std::int32_t type : {kind.type, 7}) {
      expect_answer(TEV8R1_modify_elem_name(type, longer.c_str(), alike.c_str()), PF_NORMAL);
    }
    EXPECT_EQ(kind.create(""), PF_NORMAL);
    EXPECT_EQ(kind.find(""), 1);
  }
  EXPECT_EQ(file().directories[0].entries[0]->elem_desc, std::string(79, 'd'));
  // Likewise among so many that names are hashed.
  for (int i = 0; i < 20; ++i) EXPECT_EQ(kKinds[0].create("N" + std::to_string(i)), PF_NORMAL);
  expect_answer(kKinds[0].create(alike), PF_DUPLICATE, {"list " + kept, "the file"});
  expect_answer(kKinds[0].check_unique(alike.c_str()), PF_DUPLICATE, {"list " + alike, "the file"});
  EXPECT_EQ(kKinds[0].find(longer), -1);
  // What stands behind a terminator is zero.
  EXPECT_EQ(TEV8R1_modify_elem_name(PF_ELEM_LIST, kept.c_str(), "x"), PF_NORMAL);
  const char* name = file().directories[0].entries[0]->elem_name;
  EXPECT_EQ(std::string(name, TEVPF_NAME_SIZE), "x" + std::string(19, '\0'));
}

// Callers outside append records and name them afterwards, among so many that names are hashed.
TEST_F(DirectoryTest, RecordsNamedAfterwardsAreFound) {
  for (int i = 0; i < 40; ++i) {
    const std::string name = "N" + std::to_string(i);
    if (i % 3 == 0) {
      TEVPF_LIST* list;
      ASSERT_EQ(TEV8R1_insert_list(&list), PF_NORMAL);
      std::strcpy(list->header.elem_name, name.c_str());
    } else {
      ASSERT_EQ(TEV8R1_PF_create_elem(name.c_str(), "", PF_ELEM_LIST), PF_NORMAL);
    }
    for (int k = 0; k <= i; ++k) EXPECT_EQ(kKinds[0].find("N" + std::to_string(k)), k);
  }
  // Their texts may fill the fields.
  TEVPF_ELEM_HEADER full{};
  std::memset(full.elem_name, 'n', sizeof full.elem_name);
  std::memset(full.elem_desc, 'd', sizeof full.elem_desc);
  TEVPF_TABLE* table;
  ASSERT_EQ(TEV8R1_create_table(full, &table), PF_NORMAL);
  EXPECT_EQ(table->header.elem_name, std::string(19, 'n'));
  EXPECT_EQ(table->header.elem_desc, std::string(79, 'd'));
}

TEST_F(DirectoryTest, RefusalsSayWhyAndChangeNothing) {
  ASSERT_EQ(TEV8R1_PF_create_elem("A", "a", PF_ELEM_LIST), PF_NORMAL);
  std::int32_t pos = 7;
  const std::string before = snapshot(true);
  expect_answer(TEV8R1_PF_create_elem(" x", "", 3), PF_BADNAME, kEmpty);
  expect_answer(TEV8R1_PF_create_elem("x", "", 3), PF_BADTYPE, {"function call ", "3"});
  expect_answer(TEV8R1_modify_elem_name(3, "x", " y"), PF_BADNAME, kEmpty);
  expect_answer(TEV8R1_modify_elem_name(-1, "x", "y"), PF_BADTYPE, {"function call", "-1"});
  expect_answer(TEV8R1_modify_elem_name(2, "A", "B"), PF_NOELEM, {"table", "A"});
  expect_answer(TEV8R1_modify_elem_desc(0, "A", "B"), PF_BADTYPE, {"function call", "0"});
  expect_answer(TEV8R1_modify_elem_desc(1, "a", "B"), PF_NOELEM, {"list", "a"});
  expect_answer(TEV8R1_PF_copy_list("A", " x"), PF_BADNAME);
  expect_answer(TEV8R1_get_list_array_pos(nullptr, &pos), PF_NOELEM);
  EXPECT_EQ(snapshot(true), before);
  EXPECT_EQ(pos, 7);
}

}  // namespace
