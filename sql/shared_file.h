// A parameter file that the connections of this process share. One of them at a time changes it, and
// only while no other one reads: as SQLite has it for its own files.
#pragma once

#include <condition_variable>
#include <cstddef>
#include <cstdint>
#include <filesystem>
#include <map>
#include <memory>
#include <mutex>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "relation.h"
#include "tevpf.hpp"

namespace sql {

// The library is for one thread at a time.
std::mutex& library_mutex();
using Lock = std::unique_lock<std::mutex>;

using Connection = sqlite3*;

// Everything here is called with the library locked.
class SharedFile {
 public:
  // The file at a path: opened, or what another connection has opened. It is saved when a transaction
  // is committed, and read again when it has changed on the disk.
  static std::shared_ptr<SharedFile> open(const std::string& path);

  // A file that its owner opens, saves and closes; it stays open longer than this object.
  explicit SharedFile(tevpf::File& file) : file_(&file) {}
  SharedFile(const SharedFile&) = delete;
  SharedFile& operator=(const SharedFile&) = delete;
  ~SharedFile();

  const tevpf::File& file();
  const std::string& name() const noexcept {
    return name_;
  }  // for messages; empty: the owner knows
  std::shared_ptr<Relation> relation(tevpf::Kind kind, const std::string& name);
  // Changes when relations that were handed out are not good any more.
  std::uint64_t generation() const noexcept { return generation_; }
  // By transactions that were committed, and all others were undone.
  bool was_changed() const noexcept { return was_changed_ && !journal_.is_broken(); }

  // Wait as long as the connection's busy timeout says; throw Refusal (SQLITE_BUSY).
  void begin_reading(Connection connection, Lock& lock);
  void end_reading(Connection connection) noexcept;
  void begin_writing(Connection connection, Lock& lock);  // once for each of its tables
  // Changes of its transaction, so far.
  std::size_t changes_of(Connection connection) const noexcept {
    return writer_ == connection ? journal_.size() : 0;
  }

  // ---- Of the connection that writes ----
  Journal& journal() noexcept { return journal_; }
  void save();             // ahead of commits; throws Refusal
  void commit() noexcept;  // once for each table: the last one ends the transaction
  void rollback() noexcept;

 private:
  struct Stamp {
    std::uintmax_t size = 0;
    std::filesystem::file_time_type written;
    bool operator==(const Stamp&) const = default;
  };

  SharedFile(std::string path, std::string key);
  Stamp stamp() const;
  template <class IsFree>
  void wait(Connection connection, Lock& lock, IsFree is_free);
  bool has_other_readers(Connection connection) const;
  void read_again_if_changed();
  void read_again();
  void end_table() noexcept;

  std::string name_, key_;               // of one that this class opens
  std::optional<tevpf::File> own_file_;  // likewise; none when it could not be read again
  tevpf::File* file_ = nullptr;
  Stamp stamp_;
  std::map<std::pair<tevpf::Kind, std::string>, std::shared_ptr<Relation>> relations_;
  std::uint64_t generation_ = 0;

  std::map<Connection, int> readers_;  // with their open cursors
  Connection writer_ = nullptr;
  int tables_ = 0;  // that take part in its transaction
  Journal journal_;
  bool is_saved_ = false;  // the transaction's changes are on the disk
  bool was_changed_ = false;
};

}  // namespace sql
