#include "files.h"

#include <cstdio>
#include <filesystem>
#include <optional>
#include <system_error>
#include <utility>

#include "output.h"
#include "platform.h"
#include "text.h"

namespace fs = std::filesystem;

namespace tool {
namespace {

void check_length(const std::string& path) {
  if (path.size() < TEVPF_FILE_NAME_SIZE) return;
  throw Failure(kRefused, visible(path) + ": the path has more than " +
                              std::to_string(TEVPF_FILE_NAME_SIZE - 1) +
                              " characters; go to its folder and use the short name");
}

// Why the library could not open a file.
std::string obstacle_to_opening(const std::string& path) {
  std::error_code error;
  const fs::file_type type = fs::status(path_of(path), error).type();
  if (type == fs::file_type::not_found) return "there is no such file; 'tevpf new' makes one";
  if (!error && type != fs::file_type::regular) {
    return "it is not a regular file; name a parameter file";
  }
  if (!error) {
    if (std::FILE* const readable = open_file(path_of(path), "rb")) {
      std::fclose(readable);
      return "it cannot be opened or read to its end; check its disk";
    }
    error = last_error();
  }
  return "it cannot be read: " + error.message();
}

tevpf::File open(const std::string& path) {
  check_length(path);
  try {
    return tevpf::File::recover(path_of(path));
  } catch (const tevpf::Error& error) {
    throw Failure(kUnreadable,
                  visible(path) + ": " +
                      (error.status() == PF_OPENFAIL ? obstacle_to_opening(path)
                       : error.status() == PF_BADFILE
                           ? "it is not a parameter file, or not even its first element is whole"
                           : visible(error.what())));
  }
}

// Where a file ends, or contradicts itself.
std::string place_of(const tevpf::Error& damage) {
  static constexpr std::string_view kIndex = " index";
  const std::string& part = damage.item();
  const std::string& owner = damage.value();
  if (part == "table data") return "the rows of table " + in_quotes(owner);
  if (part == "list index") return "the name index of list " + in_quotes(owner);
  if (!owner.empty()) {
    return "the index of column " + in_quotes(part.substr(0, part.size() - kIndex.size())) +
           " of table " + in_quotes(owner);
  }
  return part.empty() ? "the head of an element" : "element " + in_quotes(part);
}

// What tells whether a file on the disk has been touched.
struct Stamp {
  std::uintmax_t size;
  fs::file_time_type written;
  explicit Stamp(const std::string& path) {
    std::error_code ignored;
    size = fs::file_size(path_of(path), ignored);
    written = fs::last_write_time(path_of(path), ignored);
  }
  bool operator==(const Stamp&) const = default;
};

enum class OnDisk { kAsBefore, kTouched };

Failure save_failure(const std::string& path, const std::string& obstacle, OnDisk state) {
  return {kCannotWrite,
          visible(path) + ": it cannot be saved: " + obstacle +
              (state == OnDisk::kTouched ? "; it may hold only a part of its new content"
                                         : "; it is as it was before")};
}

std::string obstacle_to_saving(const tevpf::Error& error) {
  if (error.status() == PF_OPENFAIL) return "its new content could not be written; make room";
  return visible(error.what());
}

void refuse_damage(const tevpf::File& file, const std::string& path, const char* consequence) {
  if (!file.damage()) return;
  throw Failure(kUnreadable, visible(path) + ": it is damaged: " + damage_of(file) + consequence);
}

[[noreturn]] void refuse_new_file(const std::string& path, const std::error_code& error) {
  throw save_failure(path, error.message(), OnDisk::kAsBefore);
}

}  // namespace

tevpf::File open_to_read(const std::string& path) { return open(path); }

ExitStatus finish_reading(const tevpf::File& file) {
  if (!file.damage()) return kDone;
  std::fprintf(stderr, "tevpf: %s: it is damaged: %s; shown is what could be read\n",
               visible(file.name()).c_str(), damage_of(file).c_str());
  return kUnreadable;
}

tevpf::File open_undamaged(const std::string& path) {
  tevpf::File file = open(path);
  refuse_damage(file, path, "; nothing was copied, because what cannot be read would be lost");
  return file;
}

void refuse_same_file(const std::string& read, const std::string& changed) {
  std::error_code ignored;
  if (!fs::equivalent(path_of(read), path_of(changed), ignored)) return;
  throw Failure(kRefused,
                visible(read) + " and " + visible(changed) + " are one file; name another one");
}

tevpf::File open_to_change(const std::string& path) {
  tevpf::File file = open(path);
  refuse_damage(file, path, "; it was not changed, because what cannot be read would be lost");
  if (file.is_read_only()) {
    throw Failure(kCannotWrite, visible(path) +
                                    ": it may only be read; change its permissions or "
                                    "work on a copy");
  }
  return file;
}

void save(tevpf::File& file) {
  const HoldInterrupts hold;
  const Stamp before(file.name());
  try {
    file.save();
  } catch (const tevpf::Error& error) {
    // A file that cannot be replaced in one step was written over.
    const bool is_touched = Stamp(file.name()) != before;
    throw save_failure(file.name(), obstacle_to_saving(error),
                       is_touched ? OnDisk::kTouched : OnDisk::kAsBefore);
  }
}

void take_lock(const std::string& path, std::optional<FileLock>& lock) {
  lock.emplace(path_of(path), [&] {
    if (!is_terminal(stderr)) return;
    std::fprintf(stderr, "tevpf: %s: another program changes it; waiting\n", visible(path).c_str());
  });
  switch (lock->state()) {
    case FileLock::State::kHeld:
      return;
    case FileLock::State::kNoFile:
      throw Failure(kUnreadable, visible(path) + ": " + obstacle_to_opening(path));
    case FileLock::State::kRefused:
      throw Failure(kCannotWrite,
                    visible(path) + ": it cannot be locked: " + lock->error().message() +
                        "; --no-lock changes it without a lock, when no other program does");
  }
}

bool exists(const std::string& path) {
  std::error_code ignored;
  return fs::symlink_status(path_of(path), ignored).type() != fs::file_type::not_found;
}

bool change_file(const Target& target, Missing missing,
                 const std::function<void(tevpf::File& file)>& change) {
  while (missing == Missing::kMade && !exists(target.path)) {
    NewFile made = NewFile::create(target.path);
    change(made.file());
    const std::error_code error = made.save();
    if (!error) return true;
    if (!exists(target.path)) refuse_new_file(target.path, error);
  }
  check_length(target.path);
  std::optional<FileLock> lock;
  if (target.is_locked) take_lock(target.path, lock);
  tevpf::File file = open_to_change(target.path);
  change(file);
  save(file);
  return false;
}

void report(const Target& target, const std::string& done) {
  try {
    print(done + "\n");
  } catch (const Failure& failure) {
    throw Failure(failure.status(),
                  visible(target.path) + " is changed: " + done + "; but " + failure.what());
  }
}

// The library creates a file when it opens it; an empty one must not be seen under its final name.
NewFile NewFile::create(const std::string& path) {
  check_length(path);
  std::error_code error;
  if (fs::symlink_status(path_of(path), error).type() != fs::file_type::not_found) {
    throw Failure(kRefused, visible(path) + ": it " +
                                (error ? "cannot be looked at: " + error.message()
                                       : "exists already; choose another name or remove it first"));
  }
  const HoldInterrupts hold;  // until the file is known as one to remove
  try {
    return {path, tevpf::File::create(unused_path_beside(path_of(path)))};
  } catch (const tevpf::Error&) {
    throw Failure(kCannotWrite,
                  visible(path) + ": it cannot be created; make room or choose another folder");
  }
}

NewFile::NewFile(const std::string& path, tevpf::File file)
    : path_(path), temp_(path_of(file.name())), file_(std::move(file)) {}

std::error_code NewFile::save() {
  const HoldInterrupts hold;
  try {
    file_.save();
  } catch (const tevpf::Error& error) {
    throw save_failure(path_, obstacle_to_saving(error), OnDisk::kAsBefore);
  }
  file_.close();
  if (!rename_to_new(temp_.path(), path_of(path_))) {
    const std::error_code error = last_error();
    if (error == std::errc::file_exists) return error;
    throw save_failure(path_, error.message(), OnDisk::kAsBefore);
  }
  temp_.forget();
  return {};
}

std::string damage_of(const tevpf::File& file) {
  const tevpf::Error& damage = *file.damage();
  switch (damage.status()) {
    case PF_BADFORMAT:
      return "it ends inside " + place_of(damage) + ", or contradicts itself there";
    case PF_DUPLICATE:
      return visible(damage.item()) + " is in it twice";
    default:
      return visible(damage.what());
  }
}

std::uintmax_t size_on_disk(const tevpf::File& file) {
  std::error_code error;
  const std::uintmax_t bytes = fs::file_size(path_of(file.name()), error);
  return error ? 0 : bytes;
}

}  // namespace tool
