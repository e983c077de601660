// Files on Windows: names, and saving over files that are open, locked or read-only.
#include <gtest/gtest.h>
#include <windows.h>

#include <array>
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <filesystem>
#include <random>
#include <thread>
#include <utility>

#include "support/definitions.h"
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

  // As another program has the file open, which keeps it from being replaced.
  static HANDLE look_at(const std::string& path) {
    const HANDLE file = CreateFileA(path.c_str(), GENERIC_READ, FILE_SHARE_READ | FILE_SHARE_WRITE,
                                    nullptr, OPEN_EXISTING, 0, nullptr);
    EXPECT_NE(file, INVALID_HANDLE_VALUE);
    return file;
  }

  static std::pair<DWORD, DWORD> identity(HANDLE file) {
    BY_HANDLE_FILE_INFORMATION facts{};
    EXPECT_TRUE(GetFileInformationByHandle(file, &facts));
    return {facts.nFileIndexHigh, facts.nFileIndexLow};
  }

  // ---- Saves that are ended ----

  static constexpr const char* kSavesVariable = "TEVPF_TEST_SAVES";
  static constexpr const char* kSavesBegin = "tevpf_test_saves_begin";

  static constexpr std::int32_t kRows = 8192;
  using LargeRow = std::array<char, 1024>;

  // The current file: eight megabytes, so that a save takes many writes.
  static void make_large(const std::string& path) {
    ASSERT_EQ(TEV8R1_PF_open(path.c_str()), PF_NEWFILE);
    ASSERT_EQ(TEV8R1_PF_create_elem("t", "", PF_ELEM_TABLE), PF_NORMAL);
    const TEVPF_COL_DEF column = tevpf::col("s", PF_TYPE_STRING, sizeof(LargeRow) - 1);
    ASSERT_EQ(TEV8R1_PF_def_column("t", column), PF_NORMAL);
    for (std::int32_t i = 0; i < kRows; ++i) {
      LargeRow row{};
      std::snprintf(row.data(), row.size(), "%d", i);
      ASSERT_EQ(TEV8R1_PF_add_row("t", row.data()), PF_NORMAL);
    }
  }
  // Moves all rows but one, which is first or last.
  static TEVPF_STATUS save_the_other_content() {
    LargeRow first{};
    TEV8R1_PF_get_row_by_pos("t", 0, first.data());
    const bool is_first = std::strcmp(first.data(), "0") == 0;
    const TEVPF_STATUS moved =
        is_first ? TEV8R1_PF_move_row("t", 0, PF_END_POS) : TEV8R1_PF_move_row("t", kRows - 1, 0);
    return moved == PF_NORMAL ? TEV8R1_PF_save(nullptr) : moved;
  }

  [[noreturn]] static void save_without_end(const char* path) {
    bool is_well = TEV8R1_PF_open(path) == PF_NORMAL;
    SetEvent(OpenEventA(EVENT_MODIFY_STATE, FALSE, kSavesBegin));
    while (is_well) is_well = save_the_other_content() == PF_NORMAL;
    std::abort();
  }

  // Runs this test in a process of its own, which comes to the function above, and ends it.
  static void end_while_saving(const std::string& path, DWORD milliseconds) {
    char program[MAX_PATH];
    GetModuleFileNameA(nullptr, program, MAX_PATH);
    const HANDLE begins = CreateEventA(nullptr, FALSE, FALSE, kSavesBegin);
    SetEnvironmentVariableA(kSavesVariable, path.c_str());
    char arguments[] = "core_test --gtest_filter=WindowsFilesTest.AnEndedSave*";
    STARTUPINFOA startup{};
    startup.cb = sizeof startup;
    PROCESS_INFORMATION process{};
    ASSERT_TRUE(CreateProcessA(program, arguments, nullptr, nullptr, FALSE, 0, nullptr, nullptr,
                               &startup, &process));
    SetEnvironmentVariableA(kSavesVariable, nullptr);
    EXPECT_EQ(WaitForSingleObject(begins, 30'000), WAIT_OBJECT_0);
    Sleep(milliseconds);
    EXPECT_TRUE(TerminateProcess(process.hProcess, 9));
    EXPECT_EQ(WaitForSingleObject(process.hProcess, 30'000), WAIT_OBJECT_0);
    for (const HANDLE handle : {begins, process.hProcess, process.hThread}) CloseHandle(handle);
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
  const HANDLE other = look_at(at("a"));
  EXPECT_EQ(TEV8R1_PF_save(nullptr), PF_NORMAL);
  CloseHandle(other);
  EXPECT_EQ(read_file(at("a")).size(), 240u);
  EXPECT_EQ(dir_.entries(), std::set<std::string>{"a"});
}

// As virus scanners and indexers do: once it is closed, the file is replaced, not written over.
TEST_F(WindowsFilesTest, AFileThatIsInUseForAMomentIsReplaced) {
  make(at("a"));
  ASSERT_EQ(TEV8R1_PF_open(at("a").c_str()), PF_NORMAL);
  add_list("L2");
  const HANDLE other = look_at(at("a"));
  const auto old_file = identity(other);
  std::thread scanner([&] {
    Sleep(50);
    CloseHandle(other);
  });
  EXPECT_EQ(TEV8R1_PF_save(nullptr), PF_NORMAL);
  scanner.join();
  const HANDLE saved = CreateFileA(at("a").c_str(), 0, 7, nullptr, OPEN_EXISTING, 0, nullptr);
  EXPECT_NE(identity(saved), old_file);
  CloseHandle(saved);
  EXPECT_EQ(read_file(at("a")).size(), 240u);
}

// A process saves a file in turn with two contents, until it is ended at some moment.
TEST_F(WindowsFilesTest, AnEndedSaveLeavesTheOldOrTheNewFile) {
  if (const char* const path = std::getenv(kSavesVariable)) save_without_end(path);

  std::string contents[2];
  make_large(at("a"));
  for (std::string& content : contents) {
    ASSERT_EQ(save_the_other_content(), PF_NORMAL);
    content = read_file(at("a"));
  }
  ASSERT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  ASSERT_NE(contents[0], contents[1]);

  constexpr int kRounds = 40;
  std::mt19937 random(3);
  int outcomes[2] = {}, interrupted = 0;
  for (int round = 0; round < kRounds; ++round) {
    const std::string work = at(std::to_string(round));
    fs::create_directory(work);
    write_file(work + "/a", contents[0]);
    end_while_saving(work + "/a", random() % 200);
    const std::string bytes = read_file(work + "/a");
    ASSERT_TRUE(bytes == contents[0] || bytes == contents[1]) << bytes.size() << " bytes";
    ++outcomes[bytes == contents[0] ? 0 : 1];
    interrupted += std::distance(fs::directory_iterator(work), {}) > 1 ? 1 : 0;
  }
  EXPECT_GT(outcomes[0], 0);
  EXPECT_GT(outcomes[1], 0);
  EXPECT_GT(interrupted, 0) << "no save was ended in its middle";
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
