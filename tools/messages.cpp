#include "messages.h"

#include <algorithm>
#include <string_view>

#include "core/base/error_context.h"
#include "text.h"

namespace tool {
namespace {

using tevpf::err_item;
using tevpf::err_value;

struct Message {
  TEVPF_STATUS status;
  ExitStatus exit;
  const char* text;  // {1} and {2}: the two texts
};

constexpr Message kMessages[] = {
    {PF_NORMAL, kDone, "nothing is wrong"},
    {PF_NEWFILE, kDone, "the file is new and empty"},
    {PF_NOMORE, kRefused, "there is nothing more to read"},
    {PF_NOTEXACT, kRefused, "only a greater value was found"},
    {PF_INITDONE, kDone, "the library was initialised before"},
    {PF_NOTFOUND, kRefused, "no row holds '{1}'"},
    {PF_FILEOPEN, kRefused, "the file is open already"},
    {PF_BADSEARCH, kRefused, "column '{1}' has no index"},
    {PF_BADPOS, kRefused, "position {1} lies outside its {2} entries"},
    {PF_DUPLICATE, kRefused, "{1} is already in {2}; choose another one"},
    {PF_CMPFAIL, kRefused, "its values cannot be compared"},
    {PF_NOFILE, kRefused, "no file is open"},
    {PF_BADTYPE, kUnreadable, "{1} has type {2}, which does not exist"},
    {PF_NOMEM, kRefused, "memory ran out"},
    {PF_NOCURROW, kRefused, "the table has no current row"},
    {PF_NOCOLUMN, kRefused, "there is no column '{1}'"},
    {PF_NOELEM, kRefused, "there is no {1} '{2}'"},
    {PF_NOPARAM, kRefused, "there is no parameter '{1}'"},
    {PF_NOTUNIQUE, kRefused, "two rows hold the same value"},
    {PF_OPENFAIL, kCannotWrite,
     "'{1}' cannot be opened or written; check its folder and free space"},
    {PF_RANGE, kRefused, "{1} lies outside the range of its type or its bounds"},
    {PF_BADFORMAT, kUnreadable, "the file ends inside {1}, or contradicts itself there"},
    {PF_BADCOLCHG, kRefused, "a text column with rows keeps its width"},
    {PF_BADARG, kRefused, "'{1}' is not a number of type {2}"},
    {PF_BADWIDTH, kRefused, "width {1} of column '{2}' is not possible"},
    {PF_BADPREC, kRefused, "precision {1} of '{2}' is below 1"},
    {PF_NOPRIV, kCannotWrite, "'{1}' may not be written; change its permissions or work on a copy"},
    {PF_BADNAME, kRefused, "a name may not start with a blank"},
    {PF_BADFILE, kUnreadable, "it is not a parameter file, or not even its first element is whole"},
    {PF_BADUNIQUE, kRefused, "a table with rows takes no further unique column"},
    {PF_BADRANGE, kRefused, "its maximum is below its minimum"},
    {PF_TYPECHG, kRefused, "a column with rows keeps its type"},
    {PF_SEARCHSET, kRefused, "rows cannot move while a search column is set"},
};

const Message* find(TEVPF_STATUS status) {
  const auto* message = std::find_if(std::begin(kMessages), std::end(kMessages),
                                     [=](const Message& m) { return m.status == status; });
  return message == std::end(kMessages) ? nullptr : message;
}

std::string filled(std::string_view pattern, std::string_view first, std::string_view second) {
  std::string result;
  for (std::size_t i = 0; i < pattern.size(); ++i) {
    if (pattern[i] != '{') {
      result += pattern[i];
      continue;
    }
    result += visible(pattern[i + 1] == '1' ? first : second);
    i += 2;
  }
  return result;
}

// The first text of a damaged file names an element, or the part behind its body that was being
// read.
std::string place(std::string_view item, const std::string& last_list,
                  const std::string& last_table) {
  static constexpr std::string_view kIndex = " index";
  if (item == "table data") return "the rows of table " + in_quotes(last_table);
  if (item == "list index") return "the name index of list " + in_quotes(last_list);
  if (item.ends_with(kIndex)) {
    return "the index of column " + in_quotes(item.substr(0, item.size() - kIndex.size())) +
           " of table " + in_quotes(last_table);
  }
  return item.empty() ? "the head of an element" : "element " + in_quotes(item);
}

}  // namespace

std::string reason(TEVPF_STATUS status) {
  const Message* message = find(status);
  if (message == nullptr) return "the library answered with status " + std::to_string(status);
  return filled(message->text, err_item, err_value);
}

Failure library_failure(TEVPF_STATUS status, const std::string& file, const std::string& doing) {
  const Message* message = find(status);
  return {message == nullptr ? kRefused : message->exit,
          visible(file) + ": cannot " + doing + ": " + reason(status)};
}

void require(TEVPF_STATUS status, const std::string& file, const char* doing) {
  if (status != PF_NORMAL) throw library_failure(status, file, doing);
}

std::string damage(TEVPF_STATUS status, const std::string& last_list,
                   const std::string& last_table) {
  static constexpr std::string_view kElement = "element";  // the name follows without a blank
  const std::string_view item = err_item;
  if (status == PF_BADFORMAT) {
    return "it ends inside " + place(item, last_list, last_table) + ", or contradicts itself there";
  }
  if (status == PF_DUPLICATE) return visible(item) + " is in it twice";
  if (status == PF_BADTYPE && item.starts_with(kElement)) {
    return "element " + in_quotes(item.substr(kElement.size())) + " is of kind " +
           visible(err_value) + ", neither list nor table";
  }
  return reason(status);
}

}  // namespace tool
