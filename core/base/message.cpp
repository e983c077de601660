// Readable messages for statuses. All sentences are in one table. If a status has several, the
// first whose condition holds for the two texts is used. The conditions also reject texts of an
// earlier failure, which remain when a refusal writes no texts of its own.
#include "include/tevpf_message.h"

#include <algorithm>
#include <iterator>
#include <string_view>

#include "core/base/error_context.h"
#include "core/base/status.h"

namespace tevpf {
namespace {

struct StatusName {
  TEVPF_STATUS status;
  const char* name;
};

// In the order of their message numbers, starting at 1; 13 and 25 are unused.
constexpr StatusName kNames[] = {
    {PF_NORMAL, "PF_NORMAL"},
    {PF_NEWFILE, "PF_NEWFILE"},
    {PF_NOMORE, "PF_NOMORE"},
    {PF_NOTEXACT, "PF_NOTEXACT"},
    {PF_INITDONE, "PF_INITDONE"},
    {PF_NOTFOUND, "PF_NOTFOUND"},
    {PF_FILEOPEN, "PF_FILEOPEN"},
    {PF_BADSEARCH, "PF_BADSEARCH"},
    {PF_BADPOS, "PF_BADPOS"},
    {PF_DUPLICATE, "PF_DUPLICATE"},
    {PF_CMPFAIL, "PF_CMPFAIL"},
    {PF_NOFILE, "PF_NOFILE"},
    {0, nullptr},
    {PF_BADTYPE, "PF_BADTYPE"},
    {PF_NOMEM, "PF_NOMEM"},
    {PF_NOCURROW, "PF_NOCURROW"},
    {PF_NOCOLUMN, "PF_NOCOLUMN"},
    {PF_NOELEM, "PF_NOELEM"},
    {PF_NOPARAM, "PF_NOPARAM"},
    {PF_NOTUNIQUE, "PF_NOTUNIQUE"},
    {PF_OPENFAIL, "PF_OPENFAIL"},
    {PF_RANGE, "PF_RANGE"},
    {PF_BADFORMAT, "PF_BADFORMAT"},
    {PF_BADCOLCHG, "PF_BADCOLCHG"},
    {0, nullptr},
    {PF_BADARG, "PF_BADARG"},
    {PF_BADWIDTH, "PF_BADWIDTH"},
    {PF_BADPREC, "PF_BADPREC"},
    {PF_NOPRIV, "PF_NOPRIV"},
    {PF_BADNAME, "PF_BADNAME"},
    {PF_BADFILE, "PF_BADFILE"},
    {PF_BADUNIQUE, "PF_BADUNIQUE"},
    {PF_BADRANGE, "PF_BADRANGE"},
    {PF_TYPECHG, "PF_TYPECHG"},
    {PF_SEARCHSET, "PF_SEARCHSET"},
};

struct Texts {
  std::string_view item, value;
};

using Condition = bool (*)(const Texts&) noexcept;

bool is_number(std::string_view text) noexcept {
  if (text.starts_with('-')) text.remove_prefix(1);
  return !text.empty() && text.find_first_not_of("0123456789") == std::string_view::npos;
}

bool always(const Texts&) noexcept { return true; }
bool has_item(const Texts& texts) noexcept { return !texts.item.empty(); }
bool has_both(const Texts& texts) noexcept { return !texts.item.empty() && !texts.value.empty(); }
bool are_numbers(const Texts& texts) noexcept {
  return is_number(texts.item) && is_number(texts.value);
}
bool is_number_of(const Texts& texts) noexcept {
  return is_number(texts.item) && !texts.value.empty();
}
bool is_kind(const Texts& texts) noexcept { return texts.item == "list" || texts.item == "table"; }
bool has_type_word(const Texts& texts) noexcept {
  return texts.value == "integer" || texts.value == "short" || texts.value == "real" ||
         texts.value == "double";
}
bool has_wrong_type(const Texts& texts) noexcept {
  return has_both(texts) && !is_number(texts.value);
}
bool is_element(const Texts& texts) noexcept {
  return texts.item.starts_with("element") && is_number(texts.value);
}
bool has_type_code(const Texts& texts) noexcept {
  return is_number(texts.value) && !texts.item.starts_with("function");
}
bool has_code(const Texts& texts) noexcept { return is_number(texts.value); }
bool is_rows(const Texts& texts) noexcept { return texts.item == "table data"; }
bool is_rows_of(const Texts& texts) noexcept { return is_rows(texts) && has_both(texts); }
bool is_name_index(const Texts& texts) noexcept { return texts.item == "list index"; }
bool is_name_index_of(const Texts& texts) noexcept {
  return is_name_index(texts) && has_both(texts);
}

// {1} and {2} stand for the two texts; [1] and [2] for texts such as "column melting", whose name
// is quoted.
struct Sentence {
  TEVPF_STATUS status;
  Condition holds;
  const char* text;
};

constexpr Sentence kSentences[] = {
    {PF_NORMAL, always, "the operation succeeded"},
    {PF_NEWFILE, always, "the file is new and empty"},
    {PF_NOMORE, always, "there is nothing more to read"},
    {PF_NOTEXACT, always, "only a greater value was found"},
    {PF_INITDONE, always, "the library was initialised before"},
    {PF_NOTFOUND, has_item, "no row holds '{1}'"},
    {PF_NOTFOUND, always, "no row holds this value"},
    {PF_FILEOPEN, always, "a file of this name is already open"},
    {PF_BADSEARCH, has_item, "column '{1}' has no index"},
    {PF_BADSEARCH, always, "the column has no index"},
    {PF_BADPOS, are_numbers, "position {1} is out of range; the number of entries is {2}"},
    {PF_BADPOS, always, "the position is out of range"},
    {PF_DUPLICATE, has_both, "[1] is already in [2]"},
    {PF_DUPLICATE, always, "it is already there"},
    {PF_CMPFAIL, always, "the values cannot be compared"},
    {PF_NOFILE, always, "no file is open, or none of this name"},
    {PF_BADTYPE, has_wrong_type, "[1] is of type {2}"},
    {PF_BADTYPE, is_element, "[1] is of kind {2}, neither list nor table"},
    {PF_BADTYPE, has_type_code, "there is no {1} type {2}"},
    {PF_BADTYPE, has_code, "there is no type {2}"},
    {PF_BADTYPE, always, "there is no such type"},
    {PF_NOMEM, always, "memory ran out"},
    {PF_NOCURROW, always, "the table has no current row"},
    {PF_NOCOLUMN, always, "there is no column '{1}'"},
    {PF_NOELEM, is_kind, "there is no {1} '{2}'"},
    {PF_NOELEM, always, "there is no such list or table"},
    {PF_NOPARAM, always, "there is no parameter '{1}'"},
    {PF_NOTUNIQUE, always, "two rows hold the same value"},
    {PF_OPENFAIL, has_item, "'{1}' cannot be opened or written"},
    {PF_OPENFAIL, always, "the file cannot be opened or written"},
    {PF_RANGE, has_both, "'{2}': {1} is out of range"},
    {PF_RANGE, has_item, "{1} is out of range"},
    {PF_RANGE, always, "the value is out of range"},
    {PF_BADFORMAT, is_rows_of, "the file ends inside the rows of table '{2}', or is damaged there"},
    {PF_BADFORMAT, is_name_index_of,
     "the file ends inside the name index of list '{2}', or is damaged there"},
    {PF_BADFORMAT, has_both, "the file ends inside '{1}' of table '{2}', or is damaged there"},
    {PF_BADFORMAT, is_rows, "the file ends inside the rows of a table, or is damaged there"},
    {PF_BADFORMAT, is_name_index,
     "the file ends inside the name index of a list, or is damaged there"},
    {PF_BADFORMAT, has_item, "the file ends inside '{1}', or is damaged there"},
    {PF_BADFORMAT, always, "the file ends inside an element, or is damaged there"},
    {PF_BADCOLCHG, always, "the width of a string column cannot change while the table has rows"},
    {PF_BADARG, has_type_word, "'{1}' is not a number of type {2}"},
    {PF_BADARG, always, "an argument is invalid"},
    {PF_BADWIDTH, is_number_of, "'{2}': width {1} is out of range"},
    {PF_BADWIDTH, always, "the width is out of range"},
    {PF_BADPREC, is_number_of, "'{2}': precision {1} is below 1"},
    {PF_BADPREC, always, "the precision is below 1"},
    {PF_NOPRIV, has_item, "'{1}' may not be written"},
    {PF_NOPRIV, always, "the file may not be written"},
    {PF_BADNAME, always, "a name may not start with a blank"},
    {PF_BADFILE, has_item, "'{1}' is not a parameter file"},
    {PF_BADFILE, always, "the file is not a parameter file"},
    {PF_BADUNIQUE, always, "a unique column cannot be added to a table that has rows"},
    {PF_BADRANGE, always, "the maximum is below the minimum"},
    {PF_TYPECHG, always, "the type of a column cannot change while the table has rows"},
    {PF_SEARCHSET, always, "rows cannot move while a search column is set"},
};

// Writes a text into a caller's buffer: counts all characters, keeps those that fit.
class Output {
 public:
  Output(char* buffer, std::size_t size) noexcept : buffer_(buffer), size_(size) {}

  void put(char c) noexcept {
    if (length_ + 1 < size_) buffer_[length_] = c;
    ++length_;
  }
  void put(std::string_view text) noexcept {
    for (const char c : text) put(c);
  }
  // Escapes control characters, so that any text stays on one line.
  void put_visible(std::string_view text) noexcept {
    for (const char c : text) put_visible(static_cast<unsigned char>(c));
  }
  void put_hex(std::uint32_t number, int digits) noexcept {
    while (digits-- > 0) put("0123456789abcdef"[(number >> (4 * digits)) & 0xFU]);
  }
  // Terminates the text and returns its full length, including what did not fit.
  std::size_t end() noexcept {
    if (size_ > 0) buffer_[std::min(length_, size_ - 1)] = '\0';
    return length_;
  }

 private:
  void put_visible(unsigned char c) noexcept {
    if (c >= 0x20 && c != 0x7F) return put(static_cast<char>(c));
    put('\\');
    if (c == '\n') return put('n');
    if (c == '\t') return put('t');
    if (c == '\r') return put('r');
    put('x');
    put_hex(c, 2);
  }

  char* buffer_;
  std::size_t size_;
  std::size_t length_ = 0;
};

// Writes "column melting" as column 'melting' and "elementX" as element 'X'; other texts unchanged.
void put_named(Output& out, std::string_view text) noexcept {
  static constexpr std::string_view kKinds[] = {"list",      "table", "column",
                                                "parameter", "value", "element"};
  const auto* const kind = std::find_if(std::begin(kKinds), std::end(kKinds),
                                        [&](std::string_view k) { return text.starts_with(k); });
  if (kind == std::end(kKinds)) return out.put_visible(text);
  text.remove_prefix(kind->size());
  if (text.starts_with(' ')) text.remove_prefix(1);
  out.put(*kind);
  out.put(" '");
  out.put_visible(text);
  out.put('\'');
}

void put_sentence(Output& out, std::string_view pattern, const Texts& texts) noexcept {
  for (std::size_t i = 0; i < pattern.size(); ++i) {
    const char c = pattern[i];
    if (c != '{' && c != '[') {
      out.put(c);
      continue;
    }
    const std::string_view text = pattern[i + 1] == '1' ? texts.item : texts.value;
    c == '{' ? out.put_visible(text) : put_named(out, text);
    i += 2;
  }
}

}  // namespace
}  // namespace tevpf

using namespace tevpf;

const char* tevpf_status_name(TEVPF_STATUS status) noexcept {
  const std::uint32_t number = (status >> 3U) & 0xFFFU;
  const bool is_named =
      number >= 1 && number <= std::size(kNames) && kNames[number - 1].status == status;
  return is_named && kNames[number - 1].name != nullptr ? kNames[number - 1].name
                                                        : "unknown status";
}

std::size_t tevpf_message(TEVPF_STATUS status, char* buffer, std::size_t size) noexcept {
  return tevpf_message_of(status, err_item, err_value, buffer, size);
}

std::size_t tevpf_message_of(TEVPF_STATUS status, const char* item, const char* value, char* buffer,
                             std::size_t size) noexcept {
  Output out(buffer, size);
  const Texts texts{item, value};
  const auto* const sentence =
      std::find_if(std::begin(kSentences), std::end(kSentences),
                   [&](const Sentence& s) { return s.status == status && s.holds(texts); });
  if (sentence != std::end(kSentences)) {
    put_sentence(out, sentence->text, texts);
  } else {
    out.put("unknown status 0x");
    out.put_hex(status, 8);
  }
  return out.end();
}

const char* tevpf_error_item() noexcept { return err_item; }

const char* tevpf_error_value() noexcept { return err_value; }

void tevpf_clear_error() noexcept { clear_error_context(); }
