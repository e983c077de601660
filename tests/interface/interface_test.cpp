// Whole stories through the C++ interface, with the C interface beside it where both meet.
#include "support/temp_file.h"  // first: its names in the library's own namespace are not ours

#include <tevpf.hpp>

#include <algorithm>
#include <functional>
#include <random>
#include <ranges>

namespace {

using tevpf::Column;
using tevpf::Error;
using tevpf::File;
using tevpf::List;
using tevpf::Parameter;
using tevpf::Row;
using tevpf::Table;
using tevpf::Type;
using tevpf::v1::Bounds;

static_assert(std::ranges::input_range<List> && std::ranges::input_range<Table>);
static_assert(std::ranges::view<tevpf::RowRange> && std::ranges::input_range<tevpf::RowRange>);
static_assert(std::ranges::view<tevpf::FieldRange<double, std::string_view>>);

class InterfaceTest : public LibraryTest {
 protected:
  // The whole content as text.
  std::string dump(const File& file) const {
    file.dump(dir_ / "dump.txt");
    return read_text(dir_ / "dump.txt");
  }

  static void add_elements(Table table) {
    table.add_column(Column("number", Type::int16).unique().bounds(1, 200));
    table.add_column(Column("symbol", Type::string).width(3).indexed());
    table.add_column(Column("mass", Type::float64).bounds(0, 300).precision(6).units("u"));
    table.add_column(Column("melting", Type::float32).indexed());
    table.append({26, "Fe", 55.845, 1538.0});
    table.append({2, "He", 4.0026, -272.2});
    table.append({80, "Hg", 200.59, -38.83});
  }

  static std::vector<std::byte> bytes_of(const Table& table, std::string_view order = {}) {
    std::vector<std::byte> rows(table.size() * table.row_size());
    const std::size_t count = table.read_rows(table.row_layout(), 0, rows, order);
    EXPECT_EQ(count, table.size());
    return rows;
  }

  static std::string symbols(auto&& rows) {
    std::string all;
    for (const auto& row : rows) all += row.template get<std::string>("symbol") + ' ';
    return all;
  }
};

TEST_F(InterfaceTest, SeveralFilesNeedNoCurrentOne) {
  File first = File::create(dir_ / "first"), second = File::create(dir_ / "second");
  for (File* file : {&first, &second}) {
    file->create_list("same").add(Parameter("where", file->name()));
    add_elements(file->create_table("same"));
  }
  List list = first.list("same"), other_list = second.list("same");
  Table table = first.table("same"), other = second.table("same");

  // Each step of the walks through the first file, the second one and C code take their turn.
  int steps = 0;
  for (const auto& [number, symbol] :
       table.ordered_by("melting").fields<std::int16_t, std::string_view>("number", "symbol")) {
    other_list.set("where", std::to_string(++steps));
    other.remove(0);
    ASSERT_EQ(TEV8R1_PF_change_file(second.name().c_str()), PF_NORMAL);
    EXPECT_EQ(list.get<std::string>("where"), first.name());
    EXPECT_EQ(table.find("symbol", std::string(symbol))->get<std::int16_t>("number"), number);
  }
  EXPECT_EQ(steps, 3);
  EXPECT_TRUE(other.empty());
  for (const Parameter& parameter : list) EXPECT_EQ(parameter.get<std::string>(), first.name());

  first.save();
  second.save();
  const std::string before = dump(first), before_second = dump(second);
  first.close();
  EXPECT_THROW(list.size(), Error);
  EXPECT_THROW(table.rows().begin(), Error);
  EXPECT_EQ(other_list.get<std::string>("where"), "3") << "the second file is as open as before";

  first = File::open(dir_ / "first");
  EXPECT_EQ(dump(first), before);
  EXPECT_EQ(dump(second), before_second);
  EXPECT_THROW(list.size(), Error) << "a file opened again has other lists";
  EXPECT_EQ(symbols(first.table("same").ordered_by("melting")), "He Hg Fe ");
}

// Letters of three scripts, in a folder and in files, by every call that takes a path.
TEST_F(InterfaceTest, PathsMayHoldAnyLetters) {
  namespace fs = std::filesystem;
  const fs::path folder = fs::path(dir_.path()) / u8"M\u00FCller \u6E2C\u5B9A";
  const std::u8string letter = u8"\u03BC";
  const fs::path path = folder / (letter + u8".pf"), copy = folder / (letter + u8" copy");
  fs::create_directory(folder);
  {
    File file = File::open_or_create(path);
    file.create_list("L").add(Parameter("x", 1.5));
    add_elements(file.create_table("T"));
    file.save();
    EXPECT_TRUE(std::u8string(file.name().begin(), file.name().end()) == path.u8string());
  }
  File file = File::open(path);
  file.save_copy(copy);
  file.dump(folder / (letter + u8" 1"));
  file.list("L").dump(folder / (letter + u8" 2"));
  file.table("T").dump(folder / (letter + u8" 3"));
  file.table("T").print(folder / (letter + u8" 4"));
  EXPECT_EQ(File::recover(copy).list("L").get<double>("x"), 1.5);
  EXPECT_THROW(File::create(copy), Error);

  std::vector<fs::path> names;
  for (const auto& entry : fs::directory_iterator(folder)) {
    names.push_back(entry.path().filename());
    EXPECT_GT(fs::file_size(entry.path()), 0u);
  }
  std::sort(names.begin(), names.end());
  const std::vector<fs::path> expected = {letter + u8" 1", letter + u8" 2",    letter + u8" 3",
                                          letter + u8" 4", letter + u8" copy", letter + u8".pf"};
  EXPECT_EQ(names, expected);
}

TEST_F(InterfaceTest, RefusalsSayWhatIsWrongAndChangeNothing) {
  File file = File::create(dir_ / "file");
  List engine = file.create_list("Engine", "First stage");
  engine.add(Parameter("Thrust", 480.0).units("kN").bounds(0, 800).precision(5));
  engine.add(Parameter("Stages", std::int16_t{2}));
  engine.add(Parameter("Fuel", "RP-1"));
  Table table = file.create_table("elements");
  add_elements(table);
  const Row old_row = table.row(0);
  Table shape = file.create_table("shape");
  shape.add_column(Column("a", Type::int32));
  const Row stranger = shape.new_row();
  const tevpf::RowLayout strange_layout = shape.row_layout();
  table.add_column(Column("state", Type::string).width(6));
  const std::string before = dump(file);
  file.save();
  const std::string bytes = read_file(dir_ / "file");
  std::vector<std::byte> new_rows = bytes_of(table);  // with new numbers, but for the last row
  for (int i = 0; i < 2; ++i)
    new_rows[static_cast<std::size_t>(i) * table.row_size()] = std::byte(90 + i);

  const struct {
    std::function<void()> call;
    TEVPF_STATUS status;
    const char *item, *value, *sentence;
  } refusals[] = {
      {[&] { engine.set("Thrust", 900); }, PF_RANGE, "900", "Thrust",
       "'Thrust': 900 is out of range"},
      {[&] { engine.set("Stages", 40'000); }, PF_RANGE, "40000", "Stages",
       "'Stages': 40000 is out of range"},
      {[&] { engine.set("Stages", 2.5); }, PF_BADTYPE, "parameter Stages", "short",
       "parameter 'Stages' is of type short"},
      {[&] { engine.set("Fuel", 1); }, PF_BADTYPE, "parameter Fuel", "string",
       "parameter 'Fuel' is of type string"},
      {[&] { engine.set("Fuel", std::string("a\0b", 3)); }, PF_BADARG, nullptr, "Fuel",
       "'Fuel': a text cannot contain a NUL character"},
      {[&] { engine.get<float>("Thrust"); }, PF_BADTYPE, "parameter Thrust", "double",
       "parameter 'Thrust' is of type double"},
      {[&] { engine.get<double>("Thr*"); }, PF_NOPARAM, "Thr*", "", "there is no parameter 'Thr*'"},
      {[&] { engine.remove("*"); }, PF_NOPARAM, "*", "", "there is no parameter '*'"},
      {[&] { engine.rename("Fuel", "Thrust"); }, PF_DUPLICATE, "parameter Thrust", "list Engine",
       "parameter 'Thrust' is already in list 'Engine'"},
      {[&] { engine.rename("Fuel", "twenty characters ..."); }, PF_BADNAME, "twenty characters ...",
       "the name", "the name 'twenty characters ...' has 21 characters; at most 19 are possible"},
      {[&] { engine.move("Fuel", 3); }, PF_BADPOS, "3", "3",
       "position 3 is out of range; the number of entries is 3"},
      {[&] { engine.redefine(Parameter("Thrust", 9.0).bounds(1, 2)); }, PF_RANGE, "9", "Thrust",
       "'Thrust': 9 is out of range"},
      {[&] { Parameter("a", 9).bounds(2, 1); }, PF_BADRANGE, "", "",
       "the maximum is below the minimum"},
      {[&] { file.list("engine"); }, PF_NOELEM, "list", "engine", "there is no list 'engine'"},
      {[&] { file.create_table("elements"); }, PF_DUPLICATE, "table elements", "the file",
       "table 'elements' is already in the file"},
      {[&] {
         table.append({8, "O", 1600, 0, ""});
       },
       PF_RANGE, "1600", "mass", "'mass': 1600 is out of range"},
      {[&] {
         table.append({26, "X", 1, 0, ""});
       },
       PF_DUPLICATE, "value 26", "column number", "value '26' is already in column 'number'"},
      {[&] {
         table.append({8, "Oxygen", 16, 0, ""});
       },
       PF_RANGE, "Oxygen", "symbol", "'symbol': 'Oxygen' has 6 characters; at most 3 are possible"},
      {[&] {
         table.append({8, "O"});
       },
       PF_BADARG, "2", "5", "table 'elements' has 5 columns, but 2 values were given"},
      {[&] {
         table.insert(4, {8, "O", 16, 0, ""});
       },
       PF_BADPOS, "4", "3", "position 4 is out of range; the number of entries is 3"},
      {[&] { table.append(stranger); }, PF_TYPECHG, "elements", "",
       "the row was made for other columns than table 'elements' has"},
      {[&] { table.append_rows(table.row_layout(), new_rows); }, PF_DUPLICATE, "value 80",
       "column number", "row 2: value '80' is already in column 'number'"},
      {[&] { table.append_rows(strange_layout, new_rows); }, PF_TYPECHG, "elements", "",
       "the rows were made for other columns than table 'elements' has"},
      {[&] { table.append_rows(table.row_layout(), std::span(new_rows).subspan(1)); }, PF_BADARG,
       nullptr, nullptr, nullptr},
      {[&] { table.read_rows(strange_layout, 0, new_rows); }, PF_TYPECHG, "elements", "", nullptr},
      {[&] { table.read_rows(table.row_layout(), 0, new_rows, "mass"); }, PF_BADSEARCH, "mass", "",
       "column 'mass' has no index"},
      {[&] { table.replace(old_row); }, PF_TYPECHG, "elements", "",
       "the row was made for other columns than table 'elements' has"},
      {[&] { table.set(1, "number", 26); }, PF_DUPLICATE, "value 26", "column number",
       "value '26' is already in column 'number'"},
      {[&] { table.set(1, "number", 201); }, PF_RANGE, "201", "number",
       "'number': 201 is out of range"},
      {[&] { table.replace(table.new_row()); }, PF_BADPOS, "-1", "3",
       "position -1 is out of range; the number of entries is 3"},
      {[&] { table.ordered_by("mass"); }, PF_BADSEARCH, "mass", "", "column 'mass' has no index"},
      {[&] { table.rows().from(1); }, PF_BADSEARCH, "", "", "the column has no index"},
      {[&] { table.rows().fields<double>("melting"); }, PF_BADTYPE, "column melting", "real",
       "column 'melting' is of type real"},
      {[&] { table.find("colour", 1); }, PF_NOCOLUMN, "colour", "", "there is no column 'colour'"},
      {[&] { table.redefine("mass", table.definition("mass").bounds(0, 100)); }, PF_RANGE, "200.59",
       "mass", "'mass': 200.59 is out of range"},
      {[&] { table.redefine("mass", Column("mass", Type::int32)); }, PF_TYPECHG, "", "",
       "the type of a column cannot change while the table has rows"},
      {[&] { table.add_column(Column("key", Type::int32).unique()); }, PF_BADUNIQUE, "", "",
       "a unique column cannot be added to a table that has rows"},
      {[&] { File::open(dir_ / "file"); }, PF_FILEOPEN, "", "",
       "a file of this name is already open"},
      {[&] { file.save_copy(dir_ / "no/folder"); }, PF_OPENFAIL, nullptr, "", nullptr},
  };
  for (const auto& [call, status, item, value, sentence] : refusals) {
    try {
      set_error_texts();  // of an older failure: they must not show
      call();
      ADD_FAILURE() << "not refused: " << (sentence == nullptr ? "" : sentence);
    } catch (const Error& error) {
      EXPECT_STREQ(tevpf_status_name(error.status()), tevpf_status_name(status)) << error.what();
      if (item != nullptr) {
        EXPECT_EQ(error.item(), item) << error.what();
      }
      if (value != nullptr) {
        EXPECT_EQ(error.value(), value) << error.what();
      }
      if (sentence != nullptr) {
        EXPECT_STREQ(error.what(), sentence);
      }
    }
    ASSERT_EQ(dump(file), before) << (sentence == nullptr ? "" : sentence);
  }
  file.save();
  EXPECT_EQ(read_file(dir_ / "file"), bytes);
}

// A table against a vector of its rows, through every way of reading them.
TEST_F(InterfaceTest, RowsAreThoseOfAModelWhateverChanges) {
  struct Item {
    std::int32_t key;
    std::string text;
    double measure;
    bool operator==(const Item&) const = default;
  };
  File file = File::create(dir_ / "file");
  Table table = file.create_table("t");
  table.add_column(Column("key", Type::int32).indexed());
  table.add_column(Column("text", Type::string).width(20));
  table.add_column(Column("measure", Type::float64));
  std::vector<Item> model;
  std::mt19937 random(7);
  const auto below = [&](std::size_t n) { return random() % std::max<std::size_t>(n, 1); };

  for (int step = 0; step < 1500; ++step) {
    const Item item{static_cast<std::int32_t>(below(100)),
                    std::string(below(21), static_cast<char>('a' + below(26))),
                    static_cast<double>(below(9))};
    const std::size_t at = below(model.size()), to = below(model.size());
    const auto place = model.begin() + static_cast<std::ptrdiff_t>(at);
    const int choice = model.empty() ? 0 : static_cast<int>(below(step < 900 ? 7 : 12));
    if (choice == 3) {
      const std::size_t count = below(4);
      const std::vector<std::byte> rows = bytes_of(table);
      table.append_rows(table.row_layout(),
                        std::span(rows).first((std::min)(count * table.row_size(), rows.size())));
      for (std::size_t i = 0, all = model.size(); i < (std::min)(count, all); ++i) {
        model.push_back(Item(model[i]));
      }
    } else if (choice < 4) {
      table.append({item.key, item.text, item.measure});
      model.push_back(item);
    } else if (choice == 4) {
      Row row = table.row(at);
      table.replace(row.set(0, item.key).set("text", item.text).set(2, item.measure));
      *place = item;
    } else if (choice == 5) {
      table.insert(at, {item.key, item.text, item.measure});
      model.insert(place, item);
    } else if (choice == 6) {
      table.move(at, to);
      const Item moved = *place;
      model.erase(place);
      model.insert(model.begin() + static_cast<std::ptrdiff_t>(to), moved);
    } else {
      table.remove(at);
      model.erase(place);
    }
    if (step % 10 != 0) continue;

    // C code stands somewhere, in another order than ours: it goes on as if nothing had been read.
    const auto rows = static_cast<std::int32_t>(model.size());
    std::int32_t columns, row_count, row_size, width, current = -1;
    char c_row[100];
    ASSERT_EQ(TEV8R1_PF_define_table_search("t", "key"), PF_NORMAL);
    ASSERT_EQ(TEV8R1_PF_get_row_by_pos("t", rows / 2, c_row), rows == 0 ? PF_BADPOS : PF_NORMAL);

    std::vector<Item> read;
    for (auto row : table) {
      ASSERT_EQ(row.number(), read.size());
      read.push_back({row.get<std::int32_t>("key"), row.get<std::string>(1),
                      std::get<double>(row.value("measure"))});
    }
    ASSERT_EQ(read, model);
    std::vector<std::int32_t> keys;
    for (const auto& [key, text] :
         table.ordered_by("key").fields<std::int32_t, std::string_view>("key", "text")) {
      keys.push_back(key);
    }
    std::vector<std::int32_t> sorted = table.column<std::int32_t>("key");
    ASSERT_TRUE(std::equal(sorted.begin(), sorted.end(), model.begin(), model.end(),
                           [](std::int32_t key, const Item& i) { return key == i.key; }));
    std::sort(sorted.begin(), sorted.end());
    ASSERT_EQ(keys, sorted);
    std::size_t seen = 0;
    for (auto row : table.ordered_by("key").from(50)) {
      ASSERT_EQ(model.at(row.number()).key, row.get<std::int32_t>(0));
      ++seen;
    }
    ASSERT_EQ(static_cast<std::ptrdiff_t>(seen),
              std::count_if(model.begin(), model.end(), [](const Item& i) { return i.key >= 50; }));

    const std::size_t from = below(model.size() + 2);
    std::vector<std::byte> block(5 * table.row_size());
    std::vector<std::int32_t> numbers(5, -1);
    const std::size_t count = table.read_rows(table.row_layout(), from, block, "key", numbers);
    ASSERT_EQ(count, from >= model.size() ? 0 : (std::min<std::size_t>)(5, model.size() - from));
    for (std::size_t i = 0; i < count; ++i) {
      std::int32_t key;
      std::memcpy(&key, &block[i * table.row_size()], sizeof key);
      ASSERT_EQ(key, keys.at(from + i));
      ASSERT_EQ(key, model.at(static_cast<std::size_t>(numbers[i])).key);
    }

    const auto found = table.find("text", item.text);
    const auto wanted = std::find_if(model.begin(), model.end(),
                                     [&](const Item& i) { return i.text == item.text; });
    ASSERT_EQ(found.has_value(), wanted != model.end());
    ASSERT_TRUE(!found || found->number() == static_cast<std::size_t>(wanted - model.begin()));
    ASSERT_EQ(
        table.find("key", item.key).has_value(),
        std::any_of(model.begin(), model.end(), [&](const Item& i) { return i.key == item.key; }));
    ASSERT_FALSE(table.find("key", 1LL << 40).has_value());

    ASSERT_EQ(TEV8R1_PF_inq_table_info("t", &columns, &row_count, &row_size, &width, &current),
              PF_NORMAL);
    ASSERT_EQ(row_count, rows);
    ASSERT_TRUE(rows == 0 || current == rows / 2);
  }
  EXPECT_GT(model.size(), 100u);
}

TEST_F(InterfaceTest, ReadingGoesOnWhileRowsChange) {
  File file = File::create(dir_ / "file");
  Table table = file.create_table("t");
  table.add_column(Column("n", Type::int32));
  for (int i = 0; i < 1000; ++i) table.append({i});
  std::int32_t sum = 0;
  for (auto row : table) {
    sum += row.get<std::int32_t>("n");
    if (row.number() + 1 < table.size()) table.set(row.number() + 1, "n", 1);
    if (row.number() == 500) table.remove(table.size() - 1);
  }
  EXPECT_EQ(sum, 998) << "each row as it was when its turn came";
  auto rows = table.rows();
  auto it = rows.begin();
  table.add_column(Column("m", Type::int32));
  EXPECT_THROW(++it, Error);
  EXPECT_THROW(table.rows().fields<double>("n"), Error);
// libc++ has views since its version 15; those of libstdc++ need a clang of version 16.
#if defined __cpp_lib_ranges && (!defined __clang__ || __clang_major__ >= 16)
  EXPECT_EQ(std::ranges::distance(table.rows() | std::views::take(20)), 20);
#endif
}

TEST_F(InterfaceTest, DefinitionsAreReadAsTheyWereWritten) {
  const std::vector<Parameter> all = {
      Parameter("int", 7).units("rpm").bounds(-5, 9).description("an integer"),
      Parameter("short", std::int16_t{-3}).bounds(-3, -3),
      Parameter("real", 1.5f).bounds(-1e30, 1e30).precision(3),
      Parameter("double", 0.1).units("1234567").precision(17).description(std::string(300, 'd')),
      Parameter("text", std::string(1000, 'x')),
      Parameter("empty", ""),
      Parameter("star*", 1),
  };
  const std::vector<Column> columns = {
      Column("i", Type::int32).bounds(1, 5).unique().units("m").description("key"),
      Column("s", Type::int16).width(3),
      Column("r", Type::float32).precision(2).indexed(),
      Column("d", Type::float64).bounds(-0.5, 1e300).precision(12),
      Column("t", Type::string).width(40).description("text"),
  };
  {
    File file = File::create(dir_ / "$file");
    List list = file.create_list("first", "of two");
    for (const Parameter& parameter : all) list.insert(0, parameter);
    for (std::size_t i = 0; i < all.size(); ++i) list.move(all[i].name(), i);
    list.rename("int", "n");
    list.redefine(Parameter("n", 0.5));
    list.redefine(Parameter("n", 7).units("rpm").bounds(-5, 9).description("an integer"));
    list.rename("n", "int");
    list.rename_list("list");
    list.describe("all types");
    Table table = file.create_table("table");
    for (auto column = columns.rbegin(); column != columns.rend(); ++column) {
      table.add_column(Column(column->name(), Type::int32));
      table.redefine(column->name(), *column);
      table.move_column(column->name(), table.columns().front().name());
    }
    table.add_column(Column("gone", Type::float32));
    table.move_column("gone", "d");
    table.remove_column("gone");
    file.copy_table("table", "copy");
    file.remove_table("table");
    file.table("copy").rename_table("table");
    file.save();
  }
  const File file = File::open(dir_ / "$file");
  const List list = file.list("list");
  EXPECT_EQ(file.elements(), (std::vector<tevpf::Element>{{tevpf::Kind::list, "list", "all types"},
                                                          {tevpf::Kind::table, "table", ""}}));
  std::vector<Parameter> read;
  for (const Parameter& parameter : list) read.push_back(parameter);
  EXPECT_EQ(read, all);
  EXPECT_EQ(list.find("star*"), all.back());
  EXPECT_EQ(list.find_prefix("r"), all[2]);
  EXPECT_EQ(list.find_prefix("zz"), std::nullopt);
  EXPECT_EQ(list.get<std::string>("text"), std::string(1000, 'x'));
  EXPECT_EQ(file.table("table").columns(), columns);
  EXPECT_EQ(list.at("double").bounds(),
            (Bounds{std::numeric_limits<double>::lowest(), std::numeric_limits<double>::max()}));
}

TEST_F(InterfaceTest, StarsInTextsAreNoPatterns) {
  File file = File::create(dir_ / "file");
  for (const bool indexed : {false, true}) {
    Table table = file.create_table(indexed ? "indexed" : "plain");
    table.add_column(Column("symbol", Type::string).width(5).indexed(indexed));
    for (const char* text : {"Fe*", "Fe", "Fe+", "Fe!", "Ag"}) table.append({text});
    EXPECT_EQ(table.find("symbol", "Fe*")->number(), 0u);
    EXPECT_FALSE(table.find("symbol", "F*"));
    EXPECT_EQ(table.find_prefix("symbol", "F")->get<std::string>(0), indexed ? "Fe" : "Fe*");
    if (!indexed) continue;
    EXPECT_EQ(symbols(table.ordered_by("symbol").from("Fe*")), "Fe* Fe+ ");
  }
}

TEST_F(InterfaceTest, OpeningNeverCreatesAndSavingNeverLoses) {
  const std::string path = dir_ / "file";
  EXPECT_THROW(File::open(path), Error);
  EXPECT_THROW(File::open(dir_.path()), Error);
  EXPECT_TRUE(dir_.entries().empty());
  { const File dropped = File::open_or_create(path); }
  EXPECT_TRUE(dir_.entries().empty()) << "never saved";
  std::size_t row_bytes = 0;
  {
    File file = File::open_or_create(path);
    EXPECT_TRUE(file.is_new());
    file.create_list("whole").add(Parameter("a", 1));
    add_elements(file.create_table("cut"));
    row_bytes = file.table("cut").size() * file.table("cut").row_size();
    file.save();
    file.list("whole").set("a", 2);
  }
  EXPECT_THROW(File::create(path), Error);
  EXPECT_EQ(File::open_or_create(path).list("whole").get<std::int32_t>("a"), 1) << "not saved";

  for (const auto& [bytes, part] :
       {std::pair(std::size_t{3}, "the rows"), {row_bytes, "'melting index'"}}) {
    std::filesystem::resize_file(path, std::filesystem::file_size(path) - bytes);
    const std::string damaged = read_file(path);
    EXPECT_THROW(File::open(path), Error);
    File file = File::recover(path);
    EXPECT_EQ(file.damage()->what(),
              std::string("the file ends inside ") + part + " of table 'cut', or is damaged there");
    EXPECT_EQ(file.list("whole").get<std::int32_t>("a"), 1);
    EXPECT_THROW(file.save(), Error);
    file.save_copy(dir_ / "copy");
    EXPECT_EQ(read_file(path), damaged);
  }
  EXPECT_EQ(File::open(dir_ / "copy").list("whole").size(), 1u);
  write_file(path, "no parameter file");
  const File other = File::open(dir_ / "copy");
  EXPECT_THROW(File::recover(path), Error);
  EXPECT_EQ(other.list("whole").size(), 1u) << "the other file is as open as before";
}

TEST_F(InterfaceTest, TheReadingThatCCallsDoIsBounded) {
  File file = File::create(dir_ / "file");
  file.create_list("l").add(Parameter("text", "four"));
  add_elements(file.create_table("t"));
  std::size_t size = 0;
  char text[] = "####";
  EXPECT_EQ(tevpf_get_value("l", "text", PF_TYPE_STRING, text, 4, &size), PF_NORMAL);
  EXPECT_EQ(size, 5u);
  EXPECT_STREQ(text, "####");
  std::int32_t columns, rows, row_size, width, current, count = 9, position, number, numbers[2];
  ASSERT_EQ(TEV8R1_PF_inq_table_info("t", &columns, &rows, &row_size, &width, &current), PF_NORMAL);
  std::vector<char> row(static_cast<std::size_t>(row_size) * 3);
  EXPECT_EQ(tevpf_get_rows("t", nullptr, 0, &count, row_size - 1, row.data(), nullptr), PF_BADARG);
  EXPECT_EQ(tevpf_get_rows("t", "mass", 0, &count, row_size, row.data(), nullptr), PF_BADSEARCH);
  EXPECT_EQ(tevpf_get_rows("t", nullptr, -1, &count, row_size, row.data(), nullptr), PF_BADPOS);
  EXPECT_EQ(count, 9);
  EXPECT_EQ(tevpf_get_rows("t", "symbol", 1, &count, row_size, row.data(), numbers), PF_NORMAL);
  EXPECT_EQ(count, 2);
  EXPECT_EQ(numbers[0], 1);
  EXPECT_EQ(numbers[1], 2);
  numbers[0] = numbers[1] = count = 2;
  EXPECT_EQ(tevpf_get_rows("t", nullptr, 1, &count, row_size, row.data(), numbers), PF_NORMAL);
  EXPECT_EQ(numbers[0], 1);
  EXPECT_EQ(numbers[1], 2);
  count = 5;
  EXPECT_EQ(tevpf_get_rows("t", nullptr, PF_END_POS, &count, row_size, nullptr, nullptr),
            PF_NORMAL);
  EXPECT_EQ(count, 0);
  for (const std::int32_t first : {-1, 3, PF_END_POS}) {
    EXPECT_EQ(
        tevpf_find_row("t", "symbol", 1, "A", first, row_size, row.data(), &position, &number),
        first < 0 ? PF_BADPOS : PF_NOTFOUND);
  }
}

}  // namespace
