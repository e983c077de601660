// A list that is longer than what is read ahead, with texts that are: opened, changed where its texts
// lie in one block, cut off, read from a pipe.
#include "core/reader.h"
#include "support/list_check.h"
#include "support/param_def.h"
#include "support/temp_file.h"

namespace {

std::string text(std::size_t length, char letter) { return std::string(length, letter); }

// Some 400 KB: texts of many lengths, one of them longer than all that is read ahead at once.
std::vector<Def> long_list() {
  std::vector<Def> all;
  for (int i = 0; i < 1500; ++i) {
    Def def{.type = PF_TYPE_INT + i % 5, .name = "p" + std::to_string(i)};
    const std::size_t length = static_cast<std::size_t>(i == 700 ? 150'000 : i * 7 % 331);
    if (i % 3 != 0) def.description = text(length, 'd');
    if (def.type == PF_TYPE_STRING) def.text = text(i == 702 ? 70'000 : length / 2, 'v');
    all.push_back(as_kept(def));
  }
  return all;
}

class LongListTest : public TempFileTest {
 protected:
  void expect_list(const std::vector<Def>& expected) {
    const TEVPF_LIST& found = list("long");
    ASSERT_EQ(broken_rule(found), nullptr) << broken_rule(found);
    ASSERT_EQ(found.num_params, static_cast<std::int32_t>(expected.size()));
    for (std::size_t i = 0; i < expected.size(); ++i) {
      ASSERT_EQ(text_of(found.param_ptr[i].def), text_of(expected[i]));
    }
  }
};

TEST_F(LongListTest, OpensAndChangesLikeAnyOther) {
  std::vector<Def> all = long_list();
  make_list("long", "", all);
  save_and_reopen();
  expect_list(all);
  const std::string image = read_file(path_);

  // Shorter, as long, longer; to a type without text and back; gone.
  for (int round = 0; round < 2; ++round) {
    for (std::size_t i = 0; i < all.size(); i += 7) {
      Def& def = all[i];
      def.type = PF_TYPE_INT + static_cast<int>(i + static_cast<std::size_t>(round)) % 5;
      def.text = def.type == PF_TYPE_STRING ? text(i % 90, 'n') : "";
      def.description = i % 2 == 0 ? std::optional(text(i % 200, 'm')) : std::nullopt;
      def = as_kept(def);
      ASSERT_EQ(TEV8R1_PF_modify_param_def("long", to_c(def)), PF_NORMAL);
    }
    ASSERT_EQ(TEV8R1_PF_copy_list("long", "copy"), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_delete_param("long", all[700].name.c_str()), PF_NORMAL);
    all.erase(all.begin() + 700);
    expect_list(all);
    ASSERT_EQ(TEV8R1_PF_delete_list("copy"), PF_NORMAL);
  }

  // An index that holds a position twice is made anew.
  ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  write_file(path_, image.substr(0, image.size() - 4) + image.substr(image.size() - 8, 4));
  ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), PF_NORMAL);
  expect_list(long_list());

  for (std::size_t size = image.size() - 1; size > 108; size -= std::min<std::size_t>(size, 9973)) {
    TEV8R1_PF_close(0);  // of one that was refused there is nothing to close
    write_file(path_, image.substr(0, size));
    const bool in_index = size >= image.size() - 4 * 1500;  // of a list that is whole
    ASSERT_EQ(TEV8R1_PF_open(path_.c_str()), in_index ? PF_BADFORMAT : PF_BADFILE) << size;
    const ErrorTexts texts{in_index ? "list index" : path_, ""};
    ASSERT_EQ(error_texts(), texts);
  }
}

#ifndef _WIN32
// With a table as long behind it, from a stream that does not say how long it is.
TEST_F(LongListTest, ComesThroughAPipe) {
  const std::vector<Def> all = long_list();
  make_list("long", "", all);
  ASSERT_EQ(TEV8R1_PF_create_elem("rows", "", PF_ELEM_TABLE), PF_NORMAL);
  const TEVPF_COL_DEF column = tevpf::indexed(tevpf::col("i", PF_TYPE_INT, 6, {0, 1e6}));
  ASSERT_EQ(TEV8R1_PF_def_column("rows", column), PF_NORMAL);
  for (std::int32_t i = 0; i < 100'000; ++i) ASSERT_EQ(TEV8R1_PF_add_row("rows", &i), PF_NORMAL);
  save_and_reopen();
  expect_list(all);
  const std::string pipe = dir_ / "pipe", copy = dir_ / "copy";
  const std::string writes = "mkfifo " + pipe + "; cat " + path_ + " > " + pipe + " &";
  ASSERT_EQ(std::system(writes.c_str()), 0);
  ASSERT_EQ(TEV8R1_add_file(std::fopen(pipe.c_str(), "rb"), "pipe", 1), PF_NORMAL);
  EXPECT_EQ(tevpf::load_file(*tevpf::library.current_file), PF_NORMAL);
  expect_list(all);
  EXPECT_EQ(TEV8R1_PF_save(copy.c_str()), PF_NORMAL);
  EXPECT_TRUE(read_file(copy) == read_file(path_));
}
#endif

}  // namespace
