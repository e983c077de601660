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

void check_length(const std::string& path) {
  if (library_name(path).size() < TEVPF_FILE_NAME_SIZE) return;
  throw Failure(kRefused, visible(path) + ": the path has more than " +
                              std::to_string(TEVPF_FILE_NAME_SIZE - 1) +
                              " characters; go to its folder and use the short name");
}

[[noreturn]] void no_such_file(const std::string& path) {
  throw Failure(kUnreadable, visible(path) + ": there is no such file; 'tevpf new' makes one");
}

[[noreturn]] void cannot_read(const std::string& path, const std::error_code& error) {
  throw Failure(kUnreadable, visible(path) + ": it cannot be read: " + error.message());
}

// Opening with the library creates a file that is not there, and empties one that it may write but
// not read. Neither may happen by looking at it.
void require_readable(const std::string& path) {
  std::error_code error;
  const fs::file_status status = fs::status(path, error);
  if (status.type() == fs::file_type::not_found) no_such_file(path);
  if (error) cannot_read(path, error);
  if (status.type() != fs::file_type::regular) {
    throw Failure(kUnreadable, visible(path) + ": it is not a regular file; name a parameter file");
  }
  std::FILE* readable = std::fopen(path.c_str(), "rb");
  if (readable == nullptr) cannot_read(path, last_error());
  std::fclose(readable);
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

void append(std::vector<Element>& elements, Kind kind, std::int32_t count,
            const char (*names)[TEVPF_NAME_SIZE], const char (*descriptions)[TEVPF_DESC_SIZE]) {
  for (std::int32_t i = 0; i < count; ++i) elements.push_back({kind, names[i], descriptions[i]});
}

}  // namespace

const char* kind_word(Kind kind) {
  return kind == Kind::kList ? "list" : kind == Kind::kTable ? "table" : "list or table";
}

PfFile::PfFile(std::string path) : path_(std::move(path)) {
  check_length(path_);
  TEV8R1_PF_init();
}

// The object exists from the start, so its destructor closes what this leaves open by throwing.
PfFile::PfFile(std::string path, Use use) : PfFile(std::move(path)) {
  if (use == Use::kCreate) {
    create_beside();
  } else {
    load();
  }
  if (use == Use::kChange) refuse_changes();
}

TEVPF_STATUS PfFile::open(const std::string& path) {
  const TEVPF_STATUS status = TEV8R1_PF_open(library_name(path).c_str());
  // A file that could not be loaded whole is open with a part of it; closing none does no harm.
  open_ = status != PF_BADFILE && status != PF_OPENFAIL;
  return status;
}

void PfFile::load() {
  const TEVPF_STATUS status = open(path_);
  switch (status) {
    case PF_NORMAL:
      return;
    case PF_NEWFILE:  // it has just gone; closing removes the one that opening has created
      no_such_file(path_);
    case PF_OPENFAIL:
      throw Failure(kUnreadable,
                    visible(path_) + ": it cannot be opened or read to its end; check its disk");
    case PF_BADFILE:
      throw Failure(kUnreadable, visible(path_) + ": " + reason(status));
    case PF_BADFORMAT:
    case PF_BADTYPE:
    case PF_DUPLICATE:
      damage_ = find_damage(status);
      return;
    default:
      throw library_failure(status, path_, "open it");
  }
}

// The library creates a file when it opens it; an empty one must not be seen under its final name.
void PfFile::create_beside() {
  const HoldInterrupts hold;  // until the file is known as one to remove
  const std::string path = unused_path_beside(path_);
  if (open(path) != PF_NEWFILE) {
    throw Failure(kCannotWrite,
                  visible(path_) + ": it cannot be created; make room or choose another folder");
  }
  temp_.emplace(path);
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
  require_readable(path);
  return {path, Use::kRead};
}

PfFile PfFile::open_to_change(const std::string& path) {
  require_readable(path);
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
  const auto fail = [&](const std::string& obstacle) {
    // A file that cannot be replaced in one step was written over.
    const bool touched = !temp_ && Stamp(path_) != before;
    throw Failure(kCannotWrite, visible(path_) + ": it cannot be saved: " + obstacle +
                                    (touched ? "; it may hold only a part of its new content"
                                             : "; it is as it was before"));
  };
  const TEVPF_STATUS status = TEV8R1_PF_save(nullptr);
  if (status == PF_OPENFAIL) fail("its new content could not be written; make room");
  if (status != PF_NORMAL) fail(reason(status));
  close();
  if (!temp_) return;
  if (!rename_to_new(temp_->path(), path_)) fail(last_error().message());
  temp_->forget();
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
