// tevpf diff: how two files differ. The exit status says whether they do.
#include <algorithm>
#include <filesystem>

#include "commands.h"
#include "comparison.h"
#include "json.h"
#include "output.h"
#include "platform.h"
#include "text.h"

namespace tool {
namespace {

std::string line_of(const Difference& d) {
  const char* const sign = !d.before ? "+ " : !d.after ? "- " : "~ ";
  std::string line = sign + d.place;
  if (!d.what.empty()) line += ": " + d.what;
  if (d.before && d.after) return line + ": " + *d.before + " -> " + *d.after + "\n";
  const std::string& text = d.before ? *d.before : *d.after;
  return line + (text.empty() ? "" : ": " + text) + "\n";
}

std::string json_of(const Difference& d) {
  JsonObject json;
  json.add_text("change", !d.before ? "added" : !d.after ? "removed" : "changed");
  json.add_text("place", d.place);
  if (!d.what.empty()) json.add_text("what", d.what);
  if (d.before && !d.before->empty()) json.add_text("before", *d.before);
  if (d.after && !d.after->empty()) json.add_text("after", *d.after);
  return json.text();
}

}  // namespace

ExitStatus run_diff(const Arguments& arguments) {
  const tevpf::File before = open_to_read(arguments.file);
  std::error_code ignored;
  if (std::filesystem::equivalent(path_of(arguments.file), path_of(arguments.other), ignored)) {
    if (arguments.json) print("[]\n");
    return finish_reading(before);
  }
  const tevpf::File after = open_to_read(arguments.other);
  Output output({}, path_of(before.name()));
  bool is_same = true;
  const char* separator = "[\n";
  compare(before, after, [&](const Difference& difference) {
    is_same = false;
    output.write(arguments.json ? separator + json_of(difference) : line_of(difference));
    separator = ",\n";
  });
  if (arguments.json) output.write(is_same ? "[]\n" : "\n]\n");
  output.finish();
  const ExitStatus status = std::max(finish_reading(before), finish_reading(after));
  return status != kDone ? status : is_same ? kDone : kRefused;
}

}  // namespace tool
