#include "table_import.h"

#include <algorithm>
#include <optional>
#include <vector>

#include "csv_header.h"
#include "deferred_indexes.h"
#include "failure.h"
#include "find.h"
#include "new_table.h"
#include "row_filler.h"
#include "text.h"

namespace tool {
namespace {

std::vector<std::string> column_names(const tevpf::Table& table) {
  std::vector<std::string> names;
  for (const tevpf::Column& column : table.columns()) names.push_back(column.name());
  return names;
}

void refuse_definitions(const tevpf::File& file, const std::string& name,
                        const ImportOptions& options) {
  const bool defines = !options.types.empty() || options.type_of_others || !options.widths.empty();
  if (!defines) return;
  throw Failure(kRefused, visible(file.name()) + ": table " + in_quotes(name) +
                              " has its columns already; --types and --width are for a new table");
}

// Many rows compared with those that are there: building the indexes anew costs less than adding
// entries one by one.
std::size_t rows_before_deferring(const tevpf::Table& table) {
  constexpr std::size_t kFew = 1000, kShare = 8;
  return std::max(kFew, table.size() / kShare);
}

class RowImport {
 public:
  RowImport(const tevpf::File& file, const tevpf::Table& table, CsvReader& reader,
            const ImportOptions& options)
      : table_(table),
        table_name_(table.name()),
        columns_(file, table),
        reader_(reader),
        options_(options),
        header_(read_header(reader, options, column_names(table))),
        filler_(table_, columns_, header_, reader, options) {}

  std::size_t add_all(Indexes indexes, Progress& progress, double share_before) {
    DeferredIndexes deferred(table_);
    const bool may_defer = indexes == Indexes::kAtOnce && deferred.has_any();
    const std::size_t defer_at = may_defer ? rows_before_deferring(table_) : 0;
    const double whole = static_cast<double>(std::max<std::uintmax_t>(reader_.source().size(), 1));
    const auto share = [&] {
      const auto read = static_cast<double>(reader_.source().bytes_read());
      return reader_.source().size() == 0 ? 0 : share_before + (1 - share_before) * read / whole;
    };
    std::size_t count = 0;
    for (CsvRecord record; header_.next(reader_, record, options_); ++count) {
      if (may_defer && count == defer_at && !deferred.take_away()) throw IndexesRefused{};
      add(record);
      progress.step(count, share);
    }
    if (may_defer && count > defer_at && !deferred.build()) throw IndexesRefused{};
    if (count > 0) filler_.tell_differences();
    return count;
  }

 private:
  // Through the C interface, which takes the bytes of a row.
  void add(const CsvRecord& record) {
    const TEVPF_STATUS status = TEV8R1_PF_add_row(table_name_.c_str(), filler_.fill(record));
    if (status == PF_NORMAL) return;
    if (status == PF_NOMEM) throw std::bad_alloc();
    filler_.refuse_row(tevpf::Error(status, tevpf_error_item(), tevpf_error_value()), record);
  }

  tevpf::Table table_;
  std::string table_name_;
  Columns columns_;
  CsvReader& reader_;
  const ImportOptions& options_;
  CsvHeader header_;
  RowFiller filler_;
};

}  // namespace

std::size_t import_rows(tevpf::File& file, const std::string& name, CsvSource& source,
                        ImportOptions& options, Indexes indexes, Progress& progress) {
  std::optional<tevpf::Table> table = file.find_table(name);
  const bool is_new = !table || table->columns().empty();
  if (is_new) {
    table = make_table_for(file, name, source, options, progress);
    source.start_over_for_the_last_time();
  } else {
    refuse_definitions(file, name, options);
  }
  CsvReader reader = open_csv(source, options);
  // Finding the columns out takes about as long as filling them.
  return RowImport(file, *table, reader, options).add_all(indexes, progress, is_new ? 0.5 : 0);
}

}  // namespace tool
