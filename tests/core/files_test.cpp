// Open files: which one is current, names, access, and saving when the disk does not play along.
#include <dlfcn.h>
#include <gtest/gtest.h>
#include <sched.h>
#include <sys/mount.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <cstdlib>
#include <filesystem>
#include <functional>

#include "support/temp_file.h"

namespace {
int syncs_before_failure = -1, sync_error = EIO, closes_before_failure = -1;
}

// In the place of the system's, for the whole program: these report a disk that fails.
extern "C" int fsync(int) {
  if (syncs_before_failure-- != 0) return 0;
  errno = sync_error;
  return -1;
}
extern "C" int fclose(std::FILE* stream) {
  static const auto real = reinterpret_cast<decltype(&fclose)>(dlsym(RTLD_NEXT, "fclose"));
  const int status = real(stream);
  return closes_before_failure-- == 0 ? EOF : status;
}

namespace {

namespace fs = std::filesystem;

class FilesTest : public LibraryTest {
 protected:
  std::string at(const std::string& name) const { return dir_ / name; }
  static TEVPF_STATUS open(const std::string& name) { return TEV8R1_PF_open(name.c_str()); }
  static TEVPF_STATUS save(const std::string& name) { return TEV8R1_PF_save(name.c_str()); }
  static TEVPF_STATUS add_list(const char* name = "L") {
    return TEV8R1_PF_create_elem(name, "", PF_ELEM_LIST);
  }
  // The current file's name without its folder; "" when none is current.
  static std::string current() {
    char name[TEVPF_FILE_NAME_SIZE] = "";
    TEV8R1_PF_inq_current_file(name);
    EXPECT_EQ(error_texts(), kEmpty);
    return fs::path(name).filename();
  }
  // A file with one list, 120 bytes, saved and closed.
  static void make(const std::string& path) {
    ASSERT_EQ(open(path), PF_NEWFILE);
    ASSERT_EQ(add_list(), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_close(1), PF_NORMAL);
    ASSERT_EQ(read_file(path).size(), 120u);
  }
  // Saved where it is, as so many lists of 120 bytes.
  static void expect_saved(const std::string& path, std::size_t lists) {
    EXPECT_EQ(TEV8R1_PF_save(nullptr), PF_NORMAL);
    EXPECT_EQ(read_file(path).size(), 120 * lists);
  }
  static void set_mode(const std::string& path, mode_t mode) {
    EXPECT_EQ(chmod(path.c_str(), mode), 0);
  }

  // Calls in a child process, as an ordinary user when the tests run as root.
  static int in_child(const std::function<void()>& body, bool as_user) {
    const pid_t child = fork();
    if (child == 0) {
      if (as_user && getuid() == 0 && (setgid(65534) != 0 || setuid(65534) != 0)) _exit(2);
      body();
      std::fflush(nullptr);
      _exit(HasFailure() ? 1 : 0);
    }
    int status = -1;
    waitpid(child, &status, 0);
    return status;
  }
};

TEST_F(FilesTest, ClosingMakesTheNeighbourCurrent) {
  // The files opened, the one made current, and those current after each close.
  const std::string cases[][3] = {
      {"ABC", "B", "AC"}, {"ABC", "A", "BC"}, {"ABC", "C", "BA"}, {"A", "A", ""}, {"AB", "A", "B"}};
  for (const auto& [opened, chosen, then] : cases) {
    SCOPED_TRACE(opened + chosen);
    for (const char name : opened) {
      EXPECT_EQ(open(at({name})), PF_NEWFILE);
      EXPECT_EQ(current(), std::string{name});
    }
    set_error_texts();
    expect_answer(TEV8R1_PF_change_file(at(chosen).c_str()), PF_NORMAL, kEmpty);
    for (const char name : then) {
      EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
      EXPECT_EQ(current(), std::string{name});
    }
    EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
    EXPECT_EQ(tevpf::library.num_files, 0);
    EXPECT_EQ(tevpf::library.last_file, nullptr);
    EXPECT_TRUE(dir_.entries().empty());  // new files that were never saved are gone
  }
}

TEST_F(FilesTest, AnOpenFileIsNotOpenedAgain) {
  make(at("a"));
  write_file(at("empty"), "");
  write_file(at("text"), "Dear reader");
  expect_answer(open(at("a")), PF_NORMAL);
  expect_answer(open(at("b")), PF_NEWFILE);
  expect_answer(open(at("a")), PF_FILEOPEN, kEmpty);
  EXPECT_EQ(current(), "b");
  EXPECT_EQ(TEV8R1_PF_change_file("a"), PF_NOFILE);  // not by another name
  EXPECT_EQ(open(at("empty")), PF_NORMAL);
  EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  EXPECT_EQ(read_file(at("empty")), "");
  // A file that is none: closed again, not deleted, and its neighbour is current.
  expect_answer(open(at("text")), PF_BADFILE, {at("text"), ""});
  EXPECT_EQ(current(), "b");
  EXPECT_EQ(read_file(at("text")), "Dear reader");
}

// Neither waited for nor made nor emptied: a folder, a pipe without a writer, a device, and a link that
// leads nowhere.
TEST_F(FilesTest, OnlyRegularFilesAreOpened) {
  ASSERT_EQ(mkfifo(at("pipe").c_str(), 0666), 0);
  fs::create_symlink("nowhere", at("link"));
  for (const std::string& path : {dir_.path(), at("pipe"), at("link"), std::string("/dev/null")}) {
    expect_answer(open(path), PF_OPENFAIL, {path, ""});
  }
  EXPECT_EQ(dir_.entries(), (std::set<std::string>{"link", "pipe"}));
}

// Somebody else's file under the name of a new one that was never saved.
TEST_F(FilesTest, ANewFileThatWasReplacedIsNotRemoved) {
  ASSERT_EQ(open(at("a")), PF_NEWFILE);
  fs::remove(at("a"));
  write_file(at("a"), "Dear reader");
  EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  EXPECT_EQ(read_file(at("a")), "Dear reader");
}

// Once the file cannot be flushed and stays the old one, once its folder, when it is the new one.
TEST_F(FilesTest, AFailedFlushIsAFailedSave) {
  make(at("a"));
  ASSERT_EQ(open(at("a")), PF_NORMAL);
  ASSERT_EQ(add_list("L2"), PF_NORMAL);
  for (const int syncs : {0, 1}) {
    syncs_before_failure = syncs;
    expect_answer(TEV8R1_PF_save(nullptr), PF_OPENFAIL, {at("a"), ""});
    EXPECT_EQ(read_file(at("a")).size(), syncs == 0 ? 120u : 240u);
  }
  ASSERT_EQ(add_list("L3"), PF_NORMAL);
  syncs_before_failure = 0;
  sync_error = EINVAL;  // a file system that has nothing to flush
  expect_saved(at("a"), 3);
  EXPECT_EQ(dir_.entries(), std::set<std::string>{"a"});
}

// Some disks say only then that they are full.
TEST_F(FilesTest, AFailedCloseIsAFailedSave) {
  ASSERT_EQ(open(at("a")), PF_NEWFILE);
  for (int i = 0; i < 2; ++i) {  // a new copy, then one in its place
    closes_before_failure = 0;
    expect_answer(save(at("copy")), PF_OPENFAIL, {at("copy"), ""});
  }
  closes_before_failure = 1;  // the old stream's does not matter
  expect_answer(TEV8R1_PF_close(1), PF_OPENFAIL, {at("a"), ""});
  EXPECT_EQ(current(), "");
}

TEST_F(FilesTest, NamesAreLookedUpAndHaveUpTo257Characters) {
  const std::string folder = at(std::string(100, 'd'));
  const std::string longest = folder + "/" + std::string(256 - folder.size(), 'f');
  fs::create_directory(folder);
  setenv("PF.DIR", "/nowhere", 1);  // the "$" is part of the name
  expect_answer(open("$PF.DIR/a"), PF_OPENFAIL, {"$PF.DIR/a", kUntouched.value});
  const struct {
    std::string value, name, found;
    TEVPF_STATUS status;
  } cases[] = {{dir_.path(), "$PF.DIR/a", "a", PF_NEWFILE},
               {dir_.path(), "$PF.DIR/a", "a", PF_FILEOPEN},
               {at("whole"), "$PF.DIR", "whole", PF_NEWFILE},
               {std::string(300, 'v'), "$PF.DIR/a", std::string(256, 'v'), PF_OPENFAIL},
               {"", longest, fs::path(longest).filename(), PF_NEWFILE},
               {"", longest + "f", longest.substr(0, 256), PF_OPENFAIL}};
  for (const auto& c : cases) {
    SCOPED_TRACE(c.name);
    setenv("$PF.DIR", c.value.c_str(), 1);
    set_error_texts();
    EXPECT_EQ(open(c.name), c.status);
    EXPECT_EQ(c.status == PF_OPENFAIL ? error_texts().item : current(), c.found);
    EXPECT_EQ(TEV8R1_PF_change_file("$PF.DIR/a"), PF_NOFILE);
  }
  expect_answer(TEV8R1_add_file(stdin, (longest + "f").c_str(), 0), PF_OPENFAIL,
                {longest.substr(0, 256), ""});
  unsetenv("$PF.DIR");
  unsetenv("PF.DIR");
  EXPECT_EQ(TEV8R1_PF_save(nullptr), PF_NORMAL);
}

TEST_F(FilesTest, InitialisingTwiceKeepsTheFiles) {
  EXPECT_EQ(open(at("a")), PF_NEWFILE);
  expect_answer(TEV8R1_PF_init(), PF_INITDONE);
  EXPECT_EQ(current(), "a");
  const auto first_init_drops_files = [] {
    tevpf::library.init_done = 0;
    EXPECT_EQ(TEV8R1_PF_init(), PF_NORMAL);
    EXPECT_EQ(TEV8R1_PF_close(0), PF_NOFILE);
  };
  EXPECT_EQ(in_child(first_init_drops_files, false), 0);
}

TEST_F(FilesTest, AllocationSettings) {
  const std::int32_t cases[][4] = {{-1, 5, 25, 5}, {3, INT32_MIN, 3, 5}, {0, 0, 25, 10}};
  for (const auto& [initial, increment, initial_then, increment_then] : cases) {
    expect_answer(TEV8R1_PF_set_memory_allocation(initial, increment),
                  initial < 0 || increment < 0 ? PF_BADARG : PF_NORMAL);
    EXPECT_EQ(tevpf::library.alloc_initial, initial_then);
    EXPECT_EQ(tevpf::library.alloc_increment, increment_then);
  }
}

TEST_F(FilesTest, AReadOnlyFileStaysOpenRatherThanBeSaved) {
  make(at("a"));
  write_file(at("blind"), "Dear reader");
  set_mode(dir_.path(), 0777);
  set_mode(at("a"), 0444);
  set_mode(at("blind"), 0222);
  const auto body = [&] {
    std::int32_t access = 7;
    ASSERT_EQ(open(at("a")), PF_NORMAL);
    EXPECT_EQ(TEV8R1_PF_inq_file_access(&access), PF_NORMAL);
    EXPECT_EQ(access, 0);
    const ErrorTexts texts{at("a"), ""};
    expect_answer(TEV8R1_PF_save(nullptr), PF_NOPRIV, texts);
    expect_answer(save(at("a")), PF_NOPRIV, texts);
    expect_answer(TEV8R1_PF_close(1), PF_NOPRIV, texts);
    EXPECT_EQ(current(), "a");
    EXPECT_EQ(save(at("copy")), PF_NORMAL);
    set_mode(at("copy"), 0444);
    expect_answer(save(at("copy")), PF_NOPRIV, {at("copy"), ""});
    EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
    // What may be written but not read is emptied and new.
    EXPECT_EQ(open(at("blind")), PF_NEWFILE);
    EXPECT_EQ(save(at("blind")), PF_NORMAL);
    EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  };
  EXPECT_EQ(in_child(body, true), 0);
  EXPECT_EQ(read_file(at("copy")), read_file(at("a")));
  EXPECT_EQ(fs::file_size(at("blind")), 0u);
}

TEST_F(FilesTest, ReplacingKeepsModeOwnerAndLinks) {
  make(at("a"));
  set_mode(at("a"), 04640);
  EXPECT_EQ(chown(at("a").c_str(), 12, 34) == 0, getuid() == 0);
  set_mode(at("a"), 04640);
  fs::create_symlink("a", at("link"));
  struct stat before, after;
  stat(at("a").c_str(), &before);
  ASSERT_EQ(open(at("link")), PF_NORMAL);
  ASSERT_EQ(add_list("L2"), PF_NORMAL);
  expect_saved(at("a"), 2);
  stat(at("a").c_str(), &after);
  EXPECT_NE(after.st_ino, before.st_ino);
  EXPECT_EQ(after.st_mode, before.st_mode);
  EXPECT_EQ(after.st_uid, before.st_uid);
  EXPECT_EQ(after.st_gid, before.st_gid);
  EXPECT_TRUE(fs::is_symlink(at("link")));
  // A file of two names is written where it stands.
  fs::create_hard_link(at("a"), at("second"));
  ASSERT_EQ(add_list("L3"), PF_NORMAL);
  expect_saved(at("second"), 3);
  EXPECT_EQ(dir_.entries(), (std::set<std::string>{"a", "link", "second"}));
}

TEST_F(FilesTest, AFileThatMayNotBeWrittenIsNotReplaced) {
  make(at("a"));
  set_mode(dir_.path(), 0777);
  set_mode(at("a"), 0666);
  const auto adds_a_list = [&] {
    ASSERT_EQ(open(at("a")), PF_NORMAL);
    ASSERT_EQ(add_list("L2"), PF_NORMAL);
    expect_saved(at("a"), 2);  // another's file, in a folder for all
  };
  EXPECT_EQ(in_child(adds_a_list, true), 0);
  fs::resize_file(at("a"), 120);  // without the second list
  set_mode(dir_.path(), 0555);    // no place for a new image
  EXPECT_EQ(in_child(adds_a_list, true), 0);
  set_mode(dir_.path(), 0777);

  const auto locked = [&] {
    ASSERT_EQ(open(at("mine")), PF_NEWFILE);
    ASSERT_EQ(add_list(), PF_NORMAL);
    set_mode(at("mine"), 0444);
    for (int i = 0; i < 2; ++i) {
      expect_answer(TEV8R1_PF_save(nullptr), PF_OPENFAIL, {at("mine"), ""});
      EXPECT_EQ(read_file(at("mine")), "");
    }
    set_mode(at("mine"), 0644);
    expect_saved(at("mine"), 1);
    set_mode(at("mine"), 0444);
    ASSERT_EQ(add_list("L2"), PF_NORMAL);
    EXPECT_EQ(TEV8R1_PF_close(1), PF_OPENFAIL);
    EXPECT_EQ(current(), "");
    EXPECT_EQ(read_file(at("mine")).size(), 120u);
  };
  EXPECT_EQ(in_child(locked, true), 0);
  EXPECT_EQ(dir_.entries(), (std::set<std::string>{"a", "mine"}));
}

// Small disks of the child's own, where the system lets it mount them: full, and without room for one
// more file.
TEST_F(FilesTest, AFullDiskKeepsTheOldFile) {
  constexpr int kNotAllowed = 77;
  fs::create_directory(at("disk"));
  const auto body = [&](const char* size) {
    if (unshare(CLONE_NEWNS) != 0 || mount("", "/", "", MS_REC | MS_PRIVATE, nullptr) != 0 ||
        mount("tmpfs", at("disk").c_str(), "tmpfs", 0, size) != 0) {
      _exit(kNotAllowed);
    }
    make(at("disk/a"));
    const std::string old = read_file(at("disk/a"));
    ASSERT_EQ(open(at("disk/a")), PF_NORMAL);
    ASSERT_EQ(save(at("disk/copy")), PF_NORMAL);
    for (int i = 0; i < 1000; ++i) {
      ASSERT_EQ(TEV8R1_PF_create_elem(std::to_string(i).c_str(), "", PF_ELEM_TABLE), PF_NORMAL);
    }
    for (int i = 0; i < 2; ++i) {
      expect_answer(TEV8R1_PF_save(nullptr), PF_OPENFAIL, {at("disk/a"), ""});
      EXPECT_EQ(read_file(at("disk/a")), old);
      for (const std::string& path : {at("disk/copy"), at("disk/new")}) {
        expect_answer(save(path), PF_OPENFAIL, {path, ""});
      }
      EXPECT_EQ(read_file(at("disk/copy")), old);
      EXPECT_EQ(std::distance(fs::directory_iterator(at("disk")), {}), 2);
    }
    EXPECT_EQ(save(at("copy")), PF_NORMAL);
    EXPECT_EQ(read_file(at("copy")).size(), 120u + 1000 * 132);
    EXPECT_EQ(TEV8R1_PF_close(1), PF_OPENFAIL);
    EXPECT_EQ(read_file(at("disk/a")), old);
  };
  for (const char* size : {"size=64k", "size=1m,nr_inodes=3"}) {
    SCOPED_TRACE(size);
    const int status = in_child([&] { body(size); }, false);
    if (WIFEXITED(status) && WEXITSTATUS(status) == kNotAllowed) GTEST_SKIP() << "no mounting";
    EXPECT_EQ(status, 0);
  }
}

// The name stands for no file any more, or for a folder: what is in memory is what it shall hold.
TEST_F(FilesTest, AFileChangedUnderneathIsWrittenAgain) {
  make(at("a"));
  ASSERT_EQ(open(at("a")), PF_NORMAL);
  fs::remove(at("a"));
  expect_saved(at("a"), 1);
  fs::remove(at("a"));
  fs::create_directory(at("a"));
  for (const std::string& path : {at("a"), at("no/folder"), std::string("/dev/full")}) {
    expect_answer(save(path), PF_OPENFAIL, {path, ""});
  }
  EXPECT_EQ(save(at("copy")), PF_NORMAL);
  EXPECT_EQ(read_file(at("copy")).size(), 120u);
  // A new file whose folder is gone: tried once, and not deleted at its end.
  const std::string away = at("folder");
  fs::create_directory(away);
  ASSERT_EQ(open(away + "/b"), PF_NEWFILE);
  EXPECT_EQ(save(at("empty")), PF_NORMAL);
  EXPECT_EQ(tevpf::library.current_file->new_file, 1);  // a copy leaves the file as it is
  fs::remove_all(away);
  EXPECT_EQ(TEV8R1_PF_save(nullptr), PF_OPENFAIL);
  EXPECT_EQ(tevpf::library.current_file->new_file, 0);
  EXPECT_EQ(TEV8R1_PF_close(0), PF_NORMAL);
  EXPECT_EQ(dir_.entries(), (std::set<std::string>{"a", "copy", "empty"}));
}

}  // namespace
