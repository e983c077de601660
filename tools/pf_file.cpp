#include "pf_file.h"

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <memory>
#include <system_error>
#include <utility>

#include "failure.h"
#include "messages.h"
#include "platform.h"
#include "temp_file.h"
#include "text.h"

namespace fs = std::filesystem;

namespace tool {
namespace {

struct FreeBlock {
  void operator()(void* block) const { std::free(block); }
};
template <class T>
using Block = std::unique_ptr<T[], FreeBlock>;

// The library would take a leading "$" for the name of an environment variable; the shell has
// expanded those already.
std::string library_name(const std::string& path) {
  return path.starts_with('$') ? "./" + path : path;
}

struct CloseStream {
  void operator()(std::FILE* stream) const { std::fclose(stream); }
};
using Stream = std::unique_ptr<std::FILE, CloseStream>;

[[noreturn]] void cannot_read(const std::string& path, const std::error_code& error) {
  throw Failure(kUnreadable, visible(path) + ": it cannot be read: " + error.message());
}

// Opening with the library creates a file that is not there, and empties one that it may write but
// not read. Neither may happen by looking at it.
Stream open_readable(const std::string& path) {
  std::error_code error;
  const fs::file_status status = fs::status(path, error);
  if (status.type() == fs::file_type::not_found) {
    throw Failure(kUnreadable, visible(path) + ": there is no such file; 'tevpf new' makes one");
  }
  if (error) cannot_read(path, error);
  if (status.type() != fs::file_type::regular) {
    throw Failure(kUnreadable, visible(path) + ": it is not a regular file; name a parameter file");
  }
  Stream stream(std::fopen(path.c_str(), "rb"));
  if (!stream) cannot_read(path, last_error());
  return stream;
}

void read_to_the_end(const std::string& path) {
  const Stream stream = open_readable(path);
  std::vector<char> block(std::size_t{1} << 20U);
  while (std::fread(block.data(), 1, block.size(), stream.get()) == block.size()) {
  }
  if (std::ferror(stream.get()) != 0) cannot_read(path, last_error());
}

bool means_damage(TEVPF_STATUS status) {
  return status == PF_BADFORMAT || status == PF_BADTYPE || status == PF_DUPLICATE ||
         status == PF_BADFILE;
}

// What tells whether a file on the disk has been touched.
struct Stamp {
  std::uintmax_t size;
  fs::file_time_type written;
  explicit Stamp(const std::string& path) {
    std::error_code ignored;
    size = fs::file_size(path, ignored);
    written = fs::last_write_time(path, ignored);
  }
  bool operator==(const Stamp&) const = default;
};

void check_length(const std::string& path) {
  if (library_name(path).size() < TEVPF_FILE_NAME_SIZE) return;
  throw Failure(kRefused, visible(path) + ": the path has more than " +
                              std::to_string(TEVPF_FILE_NAME_SIZE - 1) +
                              " characters; go to its folder and use the short name");
}

void append(std::vector<Element>& elements, Kind kind, std::int32_t count,
            const char (*names)[TEVPF_NAME_SIZE], const char (*descriptions)[TEVPF_DESC_SIZE]) {
  for (std::int32_t i = 0; i < count; ++i) elements.push_back({kind, names[i], descriptions[i]});
}

// Gives what stood in the way, or nothing.
std::string save_in_place() {
  const TEVPF_STATUS status = TEV8R1_PF_save(nullptr);
  if (status == PF_OPENFAIL) return "its new content could not be written; make room";
  return status == PF_NORMAL ? "" : reason(status);
}

std::string save_as_new(const std::string& path) {
  TempFile file(path);
  const TEVPF_STATUS status = TEV8R1_PF_save(file.path_for_library().c_str());
  if (status != PF_NORMAL) return "it could not be written; make room";
  const std::error_code error = file.become_target();
  return error ? error.message() : "";
}

}  // namespace

const char* kind_word(Kind kind) {
  return kind == Kind::kList ? "list" : kind == Kind::kTable ? "table" : "list or table";
}

PfFile::PfFile(std::string path, Use use) : path_(std::move(path)), new_(use == Use::kCreate) {
  check_length(path_);
  TEV8R1_PF_init();
  // The library would make a new file at once and leave it there, empty, if it were killed.
  const std::string name = new_ ? empty_device() : library_name(path_);
  TEVPF_STATUS status = load(name);
  if (means_damage(status)) {
    // A failed read looks like the end of the file to it: damage is what stays when all can be read.
    close();
    read_to_the_end(path_);
    status = load(name);
  }
  if (status == PF_BADFILE) throw Failure(kUnreadable, visible(path_) + ": " + reason(status));
  if (means_damage(status)) {
    damage_ = find_damage(status);
  } else if (status != PF_NORMAL) {
    close();
    throw library_failure(status, path_, "open it");
  }
  if (use != Use::kChange) return;
  try {
    refuse_changes();
  } catch (...) {
    close();
    throw;
  }
}

TEVPF_STATUS PfFile::load(const std::string& name) {
  const TEVPF_STATUS status = TEV8R1_PF_open(name.c_str());
  // A file that could not be loaded whole is open with a part of it; closing none does no harm.
  open_ = status != PF_BADFILE && status != PF_OPENFAIL;
  return status;
}

std::string PfFile::find_damage(TEVPF_STATUS status) const {
  std::string last_list, last_table;
  for (const Element& element : elements()) {
    (element.kind == Kind::kList ? last_list : last_table) = element.name;
  }
  return tool::damage(status, last_list, last_table);
}

void PfFile::refuse_changes() const {
  if (!damage_.empty()) {
    throw Failure(kUnreadable,
                  visible(path_) + ": it is damaged: " + damage_ +
                      "; it was not changed, because what cannot be read would be lost");
  }
  std::int32_t writable = 0;
  require(TEV8R1_PF_inq_file_access(&writable), path_, "change it");
  if (writable == 0) {
    throw Failure(kCannotWrite, visible(path_) +
                                    ": it may only be read; change its permissions or "
                                    "work on a copy");
  }
}

PfFile::~PfFile() { close(); }

void PfFile::close() {
  if (open_) TEV8R1_PF_close(0);
  open_ = false;
}

PfFile PfFile::open_to_read(const std::string& path) {
  open_readable(path);
  return {path, Use::kRead};
}

PfFile PfFile::open_to_change(const std::string& path) {
  open_readable(path);
  return {path, Use::kChange};
}

PfFile PfFile::create(const std::string& path) {
  std::error_code error;
  const fs::file_type type = fs::symlink_status(path, error).type();
  if (type != fs::file_type::not_found) {
    throw Failure(kRefused, visible(path) + ": it " +
                                (error ? "cannot be looked at: " + error.message()
                                       : "exists already; choose another name or remove it first"));
  }
  return {path, Use::kCreate};
}

PfFile PfFile::open_or_create(const std::string& path) {
  std::error_code ignored;
  const bool is_there = fs::symlink_status(path, ignored).type() != fs::file_type::not_found;
  return is_there ? open_to_change(path) : create(path);
}

std::uintmax_t PfFile::size() const {
  std::error_code error;
  const std::uintmax_t bytes = fs::file_size(path_, error);
  return error ? 0 : bytes;
}

std::vector<Element> PfFile::elements() const {
  std::int32_t num_lists = 0, num_tables = 0;
  char file_name[TEVPF_FILE_NAME_SIZE];
  char(*list_names)[TEVPF_NAME_SIZE] = nullptr, (*table_names)[TEVPF_NAME_SIZE] = nullptr;
  char(*list_descs)[TEVPF_DESC_SIZE] = nullptr, (*table_descs)[TEVPF_DESC_SIZE] = nullptr;
  const TEVPF_STATUS status = TEV8R1_PF_inq_file_elements(
      file_name, &num_lists, &list_names, &list_descs, &num_tables, &table_names, &table_descs);
  const Block<char[TEVPF_NAME_SIZE]> names{list_names}, more_names{table_names};
  const Block<char[TEVPF_DESC_SIZE]> descs{list_descs}, more_descs{table_descs};
  require(status, path_, "read its directory");
  std::vector<Element> result;
  append(result, Kind::kList, num_lists, list_names, list_descs);
  append(result, Kind::kTable, num_tables, table_names, table_descs);
  return result;
}

bool PfFile::has(Kind kind, const std::string& name) const {
  const std::vector<Element> all = elements();
  return std::any_of(all.begin(), all.end(), [&](const Element& element) {
    return element.kind == kind && element.name == name;
  });
}

Element PfFile::find(const std::string& name, Kind kind) const {
  std::vector<Element> found = elements();
  std::erase_if(found, [&](const Element& element) { return element.name != name; });
  const bool other_kind = std::erase_if(found, [&](const Element& element) {
                            return kind != Kind::kAny && element.kind != kind;
                          }) > 0;
  if (found.empty()) {
    throw Failure(
        kRefused,
        visible(path_) + ": there is no " + kind_word(kind) + " " + in_quotes(name) +
            (other_kind
                 ? std::string(", only a ") +
                       kind_word(kind == Kind::kList ? Kind::kTable : Kind::kList) + " of that name"
                 : "") +
            "; 'tevpf info' shows what there is");
  }
  if (found.size() > 1 && kind == Kind::kAny) {
    throw Failure(kRefused, visible(path_) + ": both a list and a table are named " +
                                in_quotes(name) + "; say which with --list or --table");
  }
  return found.front();
}

void PfFile::save() {
  const HoldInterrupts hold;
  const Stamp before(path_);
  const std::string obstacle = new_ ? save_as_new(path_) : save_in_place();
  if (!obstacle.empty()) {
    // A file that cannot be replaced in one step was written over.
    const bool touched = Stamp(path_) != before;
    throw Failure(kCannotWrite, visible(path_) + ": it cannot be saved: " + obstacle +
                                    (touched ? "; only a part of it is on the disk"
                                             : "; it is as it was before"));
  }
  close();
}

void check_new_name(const std::string& name, const std::string& what) {
  if (name.empty()) throw Failure(kRefused, what + " is empty; give it at least one character");
  if (name.size() >= TEVPF_NAME_SIZE) {
    throw Failure(kRefused, what + " " + in_quotes(name) + " has " + std::to_string(name.size()) +
                                " characters; names have at most " +
                                std::to_string(TEVPF_NAME_SIZE - 1));
  }
  if (name.front() == ' ') {
    throw Failure(kRefused, what + " " + in_quotes(name) + " starts with a blank; take it away");
  }
}

}  // namespace tool
