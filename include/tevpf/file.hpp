// Parameter files.
#pragma once

#include <cstdint>
#include <filesystem>
#include <fstream>
#include <memory>
#include <optional>
#include <string>
#include <string_view>
#include <system_error>
#include <utility>
#include <vector>

#include "element.hpp"
#include "list.hpp"
#include "open_file.hpp"
#include "table.hpp"

namespace tevpf {
inline namespace v1 {

// An open parameter file. It is closed when this object goes: changes that were not saved are dropped
// then, and so is a new file that never was. Its lists and tables then throw PF_NOFILE.
//
// Paths are literal; at most 257 characters. Opening one file under two names gives two files in
// memory, of which the one saved last stays.
//
// Several files can be open at once; each operation makes its own file the library's current one.
// Beside what their comments say, operations throw std::bad_alloc, and PF_NOFILE once it is closed.
class File {
 public:
  // Opens an existing file; nothing is ever created or emptied. O(file size).
  //   PF_OPENFAIL   there is no such regular file, or it cannot be read
  //   PF_FILEOPEN   it is open already, under this name
  //   PF_BADFILE    not a parameter file
  //   PF_BADFORMAT, PF_BADTYPE, PF_DUPLICATE  damaged: see recover
  static File open(const std::filesystem::path& path) { return open(path, Damage::refused); }

  // Opens an existing file, of which only a part may be readable: damage() tells. Such a file is not
  // saved in place, which would lose the rest for good; save_copy writes what was read.
  // Otherwise as open.
  static File recover(const std::filesystem::path& path) { return open(path, Damage::accepted); }

  // A new, empty file.   PF_OPENFAIL: there is something of this name, or it cannot be created
  static File create(const std::filesystem::path& path);

  // Opens the file when there is one, else creates it; throws as these two.
  static File open_or_create(const std::filesystem::path& path);

  File(File&& other) noexcept = default;
  File& operator=(File&& other) noexcept {
    if (this != &other) {
      close();
      file_ = std::move(other.file_);
      damage_ = std::move(other.damage_);
      is_new_ = other.is_new_;
      is_read_only_ = other.is_read_only_;
    }
    return *this;
  }
  ~File() { close(); }

  const std::string& name() const noexcept { return file_->name; }  // as the library knows it
  bool is_open() const noexcept { return file_ != nullptr && file_->is_open(); }
  bool is_new() const noexcept { return is_new_; }              // created by opening it
  bool is_read_only() const noexcept { return is_read_only_; }  // may be read, not be written

  // What stopped loading, none in a file that was read whole. For PF_BADFORMAT, item() is the element,
  // "table data", "list index", or a column and " index"; behind an element's body, value() names the
  // table or list.
  const std::optional<Error>& damage() const noexcept { return damage_; }

  // Writes everything. O(file size).
  //   PF_NOPRIV     read-only, or the system refuses access
  //   PF_BADFORMAT  the file is damaged; nothing was written
  //   PF_OPENFAIL   not everything could be written: all is still in memory, and on the disk the old
  //                 file where it can be replaced in one step
  void save();

  // Writes everything to another path; this file stays as unsaved as it was.   PF_NOPRIV, PF_OPENFAIL
  void save_copy(const std::filesystem::path& path) const;

  // Closes the file without saving. Nothing happens when it is closed already.
  void close() noexcept {
    if (file_ != nullptr) file_->close();
  }

  // ---- Elements ----
  // Lists and tables have separate name spaces. Finding one costs O(1).

  // Lists first, each kind in the order in which they were made. O(elements).
  std::vector<Element> elements() const;

  List list(std::string_view name) const;    // PF_NOELEM
  Table table(std::string_view name) const;  // PF_NOELEM; O(columns)
  std::optional<List> find_list(std::string_view name) const;
  std::optional<Table> find_table(std::string_view name) const;

  // New, empty, behind the others; and a whole copy of one. O(its size).
  //   PF_BADNAME    more than 19 characters, a blank at the front
  //   PF_BADARG     the description has more than 79 characters
  //   PF_DUPLICATE  one of this kind has that name
  //   PF_NOELEM     there is none to copy
  List create_list(std::string_view name, std::string_view description = {});
  Table create_table(std::string_view name, std::string_view description = {});
  List copy_list(std::string_view name, std::string_view new_name);
  Table copy_table(std::string_view name, std::string_view new_name);

  // With everything it holds. O(elements).   PF_NOELEM
  void remove_list(std::string_view name);
  void remove_table(std::string_view name);

  // A text file for people to read. O(file size).   PF_OPENFAIL
  void dump(const std::filesystem::path& path) const;

 private:
  enum class Damage { refused, accepted };

  explicit File(std::string name)
      : file_(std::make_shared<detail::OpenFile>(detail::OpenFile{std::move(name), nullptr})) {
    file_->handle = file_.get();
  }

  static File open(const std::filesystem::path& path, Damage damage);
  static bool exists(const std::filesystem::path& path);
  static std::string name_of(const std::filesystem::path& path);
  TEVPF_STATUS open_file();
  void load(TEVPF_STATUS status, Damage damage);
  Error what_stopped_loading(TEVPF_STATUS status) const;
  std::string owner_of(std::string_view part) const;
  bool is_current() const;
  void adopt_current();
  void create_element(const detail::Name& name, std::string_view description, Kind kind);

  std::shared_ptr<detail::OpenFile> file_;  // null in an object that was moved from
  std::optional<Error> damage_;
  bool is_new_ = false;
  bool is_read_only_ = false;
};

// ---- Implementation: opening, saving ------------------------------------------------------------

// The library would read a leading "$" as that of an environment variable.
inline std::string File::name_of(const std::filesystem::path& path) {
  std::string name = detail::name_of(path);
  return name.starts_with('$') ? "./" + name : name;
}

inline bool File::exists(const std::filesystem::path& path) {
  std::error_code error;
  return std::filesystem::symlink_status(path, error).type() !=
         std::filesystem::file_type::not_found;
}

inline TEVPF_STATUS File::open_file() {
  static_cast<void>(TEV8R1_PF_init());  // only the first one does something
  tevpf_clear_error();
  return TEV8R1_PF_open(file_->name.c_str());
}

// Whether the library's current file has this one's name.
inline bool File::is_current() const {
  char name[TEVPF_FILE_NAME_SIZE];
  return TEV8R1_PF_inq_current_file(name) == PF_NORMAL && file_->name == name;
}

inline void File::adopt_current() {
  file_->handle = tevpf_current_file();
  std::int32_t is_writable = 1;
  detail::check(TEV8R1_PF_inq_file_access(&is_writable));
  is_read_only_ = is_writable == 0;
}

// Opening would create a file that is not there, and empty one that may be written but not read.
inline File File::open(const std::filesystem::path& path, Damage damage) {
  File file(name_of(path));
  using std::filesystem::file_type;
  std::error_code error;
  const file_type type = std::filesystem::status(path, error).type();
  if (type != file_type::regular) {
    const char* const problem = type == file_type::not_found ? "' does not exist"
                                : type == file_type::none    ? "' cannot be read"
                                                             : "' is not a regular file";
    throw Error(PF_OPENFAIL, file.name(), {}, "'" + file.name() + problem);
  }
  if (!std::ifstream(path, std::ios::binary)) {
    throw Error(PF_OPENFAIL, file.name(), {}, "'" + file.name() + "' cannot be read");
  }
  file.load(file.open_file(), damage);
  return file;
}

// Takes over what opening has left open, before anything can throw.
inline void File::load(TEVPF_STATUS status, Damage damage) {
  switch (status) {
    case PF_NORMAL:
      return adopt_current();
    case PF_NEWFILE:  // somebody has just taken the file away; closing removes the new one
      adopt_current();
      throw Error(PF_OPENFAIL, name(), {});
    case PF_BADFORMAT:
    case PF_BADTYPE:
    case PF_DUPLICATE:
      adopt_current();
      damage_.emplace(what_stopped_loading(status));
      if (damage == Damage::refused) throw Error(*damage_);
      return;
    case PF_NOMEM:  // it may be open with what was loaded
      if (is_current()) adopt_current();
      break;
    default:
      break;
  }
  detail::raise(status);
}

inline Error File::what_stopped_loading(TEVPF_STATUS status) const {
  std::string item = tevpf_error_item();
  std::string value = tevpf_error_value();
  if (status == PF_BADFORMAT) value = owner_of(item);
  return {status, std::move(item), std::move(value)};
}

// The list or table to which a part that lies behind an element's body belongs: the last one that was
// loaded. Empty when the part is an element itself.
inline std::string File::owner_of(std::string_view part) const {
  constexpr std::string_view index = " index";
  std::string list;
  std::string table;
  for (Element& element : elements()) {
    (element.kind == Kind::list ? list : table) = std::move(element.name);
  }
  if (part == "list index") return list;
  if (part == "table data") return table;
  if (table.empty() || !part.ends_with(index)) return {};
  part.remove_suffix(index.size());
  return this->table(table).has_column(part) ? table : std::string();
}

inline File File::create(const std::filesystem::path& path) {
  File file(name_of(path));
  const auto refuse = [&] {
    throw Error(PF_OPENFAIL, file.name(), {}, "'" + file.name() + "' exists already");
  };
  if (exists(path)) refuse();
  const TEVPF_STATUS status = file.open_file();
  if (status != PF_NEWFILE && status != PF_NORMAL) detail::raise(status);
  file.adopt_current();
  if (status == PF_NORMAL) refuse();  // somebody else has made it just now
  file.is_new_ = true;
  return file;
}

inline File File::open_or_create(const std::filesystem::path& path) {
  return exists(path) ? open(path) : create(path);
}

inline void File::save() {
  file_->select();
  if (damage_) throw Error(*damage_);
  detail::check(TEV8R1_PF_save(nullptr));
}

inline void File::save_copy(const std::filesystem::path& path) const {
  file_->select();
  detail::check(TEV8R1_PF_save(detail::name_of(path).c_str()));
}

// ---- Implementation: elements -------------------------------------------------------------------

inline std::vector<Element> File::elements() const {
  file_->select();
  return detail::elements();
}

inline List File::list(std::string_view name) const {
  const List result(file_, detail::lookup_element(name, "list"));
  static_cast<void>(result.size());  // PF_NOELEM
  return result;
}

inline Table File::table(std::string_view name) const {
  return {file_, detail::lookup_element(name, "table")};
}

inline std::optional<List> File::find_list(std::string_view name) const {
  try {
    return list(name);
  } catch (const Error& error) {
    if (error.status() != PF_NOELEM) throw;
    return std::nullopt;
  }
}

inline std::optional<Table> File::find_table(std::string_view name) const {
  try {
    return table(name);
  } catch (const Error& error) {
    if (error.status() != PF_NOELEM) throw;
    return std::nullopt;
  }
}

inline void File::create_element(const detail::Name& name, std::string_view description,
                                 Kind kind) {
  const std::string text = detail::element_description(description);
  file_->select();
  detail::check(TEV8R1_PF_create_elem(name.c_str(), text.c_str(), static_cast<std::int32_t>(kind)));
}

inline List File::create_list(std::string_view name, std::string_view description) {
  create_element(detail::new_name(name), description, Kind::list);
  return list(name);
}

inline Table File::create_table(std::string_view name, std::string_view description) {
  create_element(detail::new_name(name), description, Kind::table);
  return table(name);
}

inline List File::copy_list(std::string_view name, std::string_view new_name) {
  const detail::Name source = detail::lookup_element(name, "list");
  const detail::Name target = detail::new_name(new_name);
  file_->select();
  detail::check(TEV8R1_PF_copy_list(source.c_str(), target.c_str()));
  return list(new_name);
}

inline Table File::copy_table(std::string_view name, std::string_view new_name) {
  const detail::Name source = detail::lookup_element(name, "table");
  const detail::Name target = detail::new_name(new_name);
  file_->select();
  detail::check(TEV8R1_PF_copy_table(source.c_str(), target.c_str()));
  return table(new_name);
}

inline void File::remove_list(std::string_view name) {
  const detail::Name list = detail::lookup_element(name, "list");
  file_->select();
  detail::check(TEV8R1_PF_delete_list(list.c_str()));
}

inline void File::remove_table(std::string_view name) {
  const detail::Name table = detail::lookup_element(name, "table");
  file_->select();
  detail::check(TEV8R1_PF_delete_table(table.c_str()));
  ++detail::layout_changes;
  ++detail::row_changes;
}

inline void File::dump(const std::filesystem::path& path) const {
  file_->select();
  detail::check(TEV8R1_PF_dump_file(detail::name_of(path).c_str()));
}

}  // namespace v1
}  // namespace tevpf
