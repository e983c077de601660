// Files on Windows: names, and saving over files that are open, locked or read-only.
#include <gtest/gtest.h>
#include <windows.h>

#include <cstdlib>
#include <filesystem>

#include "support/temp_file.h"

namespace {

namespace fs = std::filesystem;

class WindowsFilesTest : public LibraryTest {
 protected:
  std::string at(const std::string& name) const { return dir_ / name; }
  static void make(const std::string& path) {
    ASSERT_EQ(TEV8R1_PF_open(path.c_str()), PF_NEWFILE);
    add_list("L");
    ASSERT_EQ(TEV8R1_PF_close(1), PF_NORMAL);
    ASSERT_EQ(fs::file_size(wide(path)), 120u);
  }
  static fs::path wide(const std::string& name) {
    return fs::path(std::u8string(name.begin(), name.end()));
  }
  static void add_list(const char* name) {
    ASSERT_EQ(TEV8R1_PF_create_elem(name, "", PF_ELEM_LIST), PF_NORMAL);
  }
};

// Names are UTF-8, with either slash; a variable may hold one.
TEST_F(WindowsFilesTest, NamesAreUtf8) {
  const std::string folder = at("M\xC3\xBCller \xE6\xB8\xAC"), name = "\xCE\xBC.pf";
  fs::create_directory(wide(folder));
  make(folder + "/" + name);
  _wputenv((L"$PFDIR=" + wide(folder).wstring()).c_str());
  for (const std::string& path : {folder + "\\" + name, "$PFDIR/" + name}) {
    ASSERT_EQ(TEV8R1_PF_open(path.c_str()), PF_NORMAL) << path;
    ASSERT_EQ(TEV8R1_PF_save(nullptr), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_dump_file((folder + "/\xE6\x96\x87").c_str()), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  }
  _wputenv(L"$PFDIR=");
  EXPECT_EQ(std::distance(fs::directory_iterator(wide(folder)), {}), 2);
  expect_answer(TEV8R1_PF_open(at("\xFF").c_str()), PF_OPENFAIL, {at("\xFF"), ""});
}

// The file is never empty in between: the new one takes its place, and stays open for the next save.
TEST_F(WindowsFilesTest, SavingReplacesTheFile) {
  make(at("a"));
  ASSERT_EQ(TEV8R1_PF_open(at("a").c_str()), PF_NORMAL);
  for (const char* name : {"L2", "L3"}) {
    add_list(name);
    ASSERT_EQ(TEV8R1_PF_save(nullptr), PF_NORMAL);
    EXPECT_EQ(dir_.entries(), std::set<std::string>{"a"});
  }
  EXPECT_EQ(read_file(at("a")).size(), 3 * 120u);
  ASSERT_EQ(TEV8R1_PF_save(at("copy").c_str()), PF_NORMAL);
  ASSERT_EQ(TEV8R1_PF_save(at("copy").c_str()), PF_NORMAL);
  EXPECT_EQ(read_file(at("copy")), read_file(at("a")));
}

// Another program may look at the file while it is saved, and keep it from being replaced.
TEST_F(WindowsFilesTest, AFileThatIsInUseIsWrittenPlainly) {
  make(at("a"));
  ASSERT_EQ(TEV8R1_PF_open(at("a").c_str()), PF_NORMAL);
  add_list("L2");
  const HANDLE other =
      CreateFileA(at("a").c_str(), GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE, nullptr,
                  OPEN_EXISTING, 0, nullptr);
  ASSERT_NE(other, INVALID_HANDLE_VALUE);
  EXPECT_EQ(TEV8R1_PF_save(nullptr), PF_NORMAL);
  CloseHandle(other);
  EXPECT_EQ(read_file(at("a")).size(), 240u);
  EXPECT_EQ(dir_.entries(), std::set<std::string>{"a"});
}

TEST_F(WindowsFilesTest, AReadOnlyFileIsNotSaved) {
  make(at("a"));
  SetFileAttributesA(at("a").c_str(), FILE_ATTRIBUTE_READONLY);
  if (std::ofstream(at("a"), std::ios::app)) GTEST_SKIP() << "Wine lets the administrator write it";
  ASSERT_EQ(TEV8R1_PF_open(at("a").c_str()), PF_NORMAL);
  expect_answer(TEV8R1_PF_save(nullptr), PF_NOPRIV, {at("a"), ""});
  ASSERT_EQ(TEV8R1_PF_save(at("copy").c_str()), PF_NORMAL);
  SetFileAttributesA(at("a").c_str(), FILE_ATTRIBUTE_NORMAL);
  expect_answer(TEV8R1_PF_open(dir_.path().c_str()), PF_OPENFAIL, {dir_.path(), ""});
}

}  // namespace
