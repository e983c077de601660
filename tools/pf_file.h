// FILE, opened with the library: never created or emptied by reading, and on the disk either as it
// was or whole.
#pragma once

#include <cstdint>
#include <optional>
#include <string>
#include <vector>

#include "temp_file.h"
#include "tevpf.h"

namespace tool {

enum class Kind { kAny, kList, kTable };

struct Element {
  Kind kind;  // kList or kTable
  std::string name, description;
};

const char* kind_word(Kind kind);

class PfFile {
 public:
  // To look at: a damaged file is opened as far as it can be read, and `damage` says what is wrong.
  static PfFile open_to_read(const std::string& path);
  // To change: a damaged file is refused, because saving it would drop what could not be read.
  static PfFile open_to_change(const std::string& path);
  // A new one, under its name only when it is saved; refuses an existing file.
  static PfFile create(const std::string& path);
  static PfFile open_or_create(const std::string& path);

  PfFile(const PfFile&) = delete;
  PfFile& operator=(const PfFile&) = delete;
  ~PfFile();  // changes that were not saved are dropped

  const std::string& path() const { return path_; }
  const std::string& damage() const { return damage_; }  // empty: none
  std::uintmax_t size() const;                           // on the disk

  std::vector<Element> elements() const;  // lists first, each kind in directory order
  bool has(Kind kind, const std::string& name) const;
  // The element of that name, or a Failure that says what to do: none, or both kinds.
  Element find(const std::string& name, Kind kind) const;

  // Writes it to the disk as the library does, interrupts waiting meanwhile; closes.
  void save();

 private:
  enum class Use { kRead, kChange, kCreate };
  explicit PfFile(std::string path);  // not open yet
  PfFile(std::string path, Use use);
  TEVPF_STATUS open(const std::string& path);
  void load();
  void create_beside();
  std::string find_damage(TEVPF_STATUS status) const;
  void refuse_changes() const;  // throws when it may not be written, or is damaged
  void close();

  std::string path_, damage_;
  std::optional<TempName> temp_;  // of a new file until it is saved
  bool open_ = false;
};

// Refuses a name that the library would cut or refuse; `what`: "the new name".
void check_new_name(const std::string& name, const std::string& what);

}  // namespace tool
