#include "shared_file.h"

#include <algorithm>
#include <chrono>
#include <new>
#include <system_error>

#include "list_relation.h"
#include "refusal.h"
#include "table_relation.h"

namespace fs = std::filesystem;

namespace sql {
namespace {

// Told whenever a reader or a writer has ended.
std::condition_variable& freed() {
  static std::condition_variable condition;
  return condition;
}

std::map<std::string, std::weak_ptr<SharedFile>>& open_files() {
  static std::map<std::string, std::weak_ptr<SharedFile>> files;
  return files;
}

// What stands for a file, however its path was written and wherever the process goes.
std::string key_of(const std::string& path) {
  std::error_code error;
  const fs::path whole = fs::weakly_canonical(path, error);
  return error ? path : whole.string();
}

std::chrono::milliseconds busy_timeout(Connection connection) {
  sqlite3_stmt* statement = nullptr;
  int milliseconds = 0;
  if (sqlite3_prepare_v2(connection, "PRAGMA busy_timeout", -1, &statement, nullptr) == SQLITE_OK &&
      sqlite3_step(statement) == SQLITE_ROW) {
    milliseconds = sqlite3_column_int(statement, 0);
  }
  sqlite3_finalize(statement);
  return std::chrono::milliseconds(milliseconds);
}

[[noreturn]] void refuse(const tevpf::Error& error) { throw Refusal(code_of(error), error.what()); }

}  // namespace

std::mutex& library_mutex() {
  static std::mutex mutex;
  return mutex;
}

// ---- Opening ------------------------------------------------------------------------------------

std::shared_ptr<SharedFile> SharedFile::open(const std::string& path) {
  const std::string key = key_of(path);
  std::weak_ptr<SharedFile>& known = open_files()[key];
  if (auto file = known.lock()) return file;
  const std::shared_ptr<SharedFile> file(new SharedFile(path, key));
  known = file;
  return file;
}

SharedFile::SharedFile(std::string path, std::string key)
    : name_(std::move(path)), key_(std::move(key)) {
  read_again();
}

SharedFile::~SharedFile() {
  if (!key_.empty()) open_files().erase(key_);
}

SharedFile::Stamp SharedFile::stamp() const {
  std::error_code ignored;
  return {fs::file_size(key_, ignored), fs::last_write_time(key_, ignored)};
}

void SharedFile::read_again() {
  journal_.clear();
  relations_.clear();
  ++generation_;
  file_ = nullptr;
  own_file_.reset();
  stamp_ = stamp();
  try {
    own_file_.emplace(tevpf::File::open(key_));
  } catch (const tevpf::Error& error) {
    refuse(error);
  }
  file_ = &*own_file_;
}

// Another program may have saved the file; nobody here stands in the middle of it.
void SharedFile::read_again_if_changed() {
  if (key_.empty() || writer_ != nullptr || !readers_.empty()) return;
  if (file_ == nullptr || journal_.is_broken() || stamp() != stamp_) read_again();
}

const tevpf::File& SharedFile::file() {
  if (file_ == nullptr) read_again();
  return *file_;
}

std::shared_ptr<Relation> SharedFile::relation(tevpf::Kind kind, const std::string& name) {
  const tevpf::File& file = this->file();
  std::shared_ptr<Relation>& known = relations_[{kind, name}];
  if (known == nullptr) {
    try {
      if (kind == tevpf::Kind::table) {
        known = std::make_shared<TableRelation>(journal_, file.table(name));
      } else {
        known = std::make_shared<ListRelation>(journal_, file.list(name));
      }
      known->renew_ids();
    } catch (const tevpf::Error& error) {
      refuse(error);
    }
  }
  return known;
}

// ---- Readers and the writer ---------------------------------------------------------------------

template <class IsFree>
void SharedFile::wait(Connection connection, Lock& lock, IsFree is_free) {
  if (is_free()) return;
  const auto timeout = busy_timeout(connection);
  if (!freed().wait_for(lock, timeout, is_free)) {
    throw Refusal(SQLITE_BUSY, "'" + name_ + "' is in use by another connection");
  }
}

bool SharedFile::has_other_readers(Connection connection) const {
  return std::any_of(readers_.begin(), readers_.end(),
                     [=](const auto& reader) { return reader.first != connection; });
}

void SharedFile::begin_reading(Connection connection, Lock& lock) {
  wait(connection, lock, [=, this] { return writer_ == nullptr || writer_ == connection; });
  read_again_if_changed();
  ++readers_[connection];
}

void SharedFile::end_reading(Connection connection) noexcept {
  const auto reader = readers_.find(connection);
  if (--reader->second > 0) return;
  readers_.erase(reader);
  freed().notify_all();
}

void SharedFile::begin_writing(Connection connection, Lock& lock) {
  wait(connection, lock, [=, this] {
    return writer_ == connection || (writer_ == nullptr && !has_other_readers(connection));
  });
  read_again_if_changed();
  // A value out of range, once removed from a list, is not taken back.
  if (journal_.is_broken()) throw Refusal(SQLITE_ERROR, "an earlier change could not be undone");
  const tevpf::File& opened = file();
  if (opened.damage()) throw Refusal(SQLITE_READONLY, "the file is damaged and not changed");
  if (opened.is_read_only()) throw Refusal(SQLITE_READONLY, "the file may not be written");
  writer_ = connection;
  ++tables_;
}

// ---- Transactions -------------------------------------------------------------------------------

void SharedFile::save() {
  if (journal_.is_broken())
    throw Refusal(SQLITE_ERROR, "a change could not be undone: nothing was saved");
  if (journal_.empty() || is_saved_ || key_.empty()) return;
  try {
    file_->save();
  } catch (const tevpf::Error& error) {
    throw Refusal(error.status() == PF_OPENFAIL ? SQLITE_IOERR : code_of(error), error.what());
  }
  is_saved_ = true;
  stamp_ = stamp();
}

void SharedFile::end_table() noexcept {
  if (--tables_ > 0) return;
  journal_.clear();
  for (const auto& [name, relation] : relations_) relation->renew_ids();
  is_saved_ = false;
  writer_ = nullptr;
  freed().notify_all();
}

void SharedFile::commit() noexcept {
  was_changed_ = was_changed_ || !journal_.empty();
  end_table();
}

// Where another file of the transaction could not be saved, this one was, and is put back.
void SharedFile::rollback() noexcept {
  bool is_lost = journal_.is_broken();
  try {
    if (!is_lost) journal_.undo_to(0);
    if (!is_lost && is_saved_) {
      file_->save();
      stamp_ = stamp();
    }
  } catch (...) {
    is_lost = true;
  }
  is_saved_ = false;
  end_table();
  if (is_lost) journal_.set_broken();
}

}  // namespace sql
