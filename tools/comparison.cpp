#include "comparison.h"

#include <algorithm>

#include "row_comparison.h"
#include "text.h"
#include "values.h"

namespace tool {
namespace {

using Report = ReportDifference;

void compare_texts(const std::string& place, const char* what, const std::string& before,
                   const std::string& after, const Report& report) {
  if (before != after) report({place, what, visible(before), visible(after)});
}

std::string bounds_or_none(const std::optional<tevpf::Bounds>& bounds) {
  const std::string text = bounds_text(bounds, {});
  return text.empty() ? "none" : text;
}

// What parameters and columns have in common.
template <class Definition>
void compare_definitions(const std::string& place, const Definition& before,
                         const Definition& after, const Report& report) {
  compare_texts(place, "type", tevpf::to_string(before.type()), tevpf::to_string(after.type()),
                report);
  compare_texts(place, "units", before.units(), after.units(), report);
  compare_texts(place, "bounds", bounds_or_none(before.bounds()), bounds_or_none(after.bounds()),
                report);
  compare_texts(place, "precision", std::to_string(before.precision()),
                std::to_string(after.precision()), report);
  compare_texts(place, "description", before.description(), after.description(), report);
}

std::string index_of(const tevpf::Column& column) {
  return column.is_unique() ? "unique" : column.is_indexed() ? "yes" : "none";
}

void compare_members(const std::string& place, const tevpf::Parameter& before,
                     const tevpf::Parameter& after, const Report& report) {
  const std::string old_value = exact_text(before.value()), new_value = exact_text(after.value());
  if (old_value != new_value) {
    const auto with_units = [](const std::string& value, const std::string& units) {
      return visible(units.empty() ? value : value + " " + units);
    };
    report({place, "value", with_units(old_value, before.units()),
            with_units(new_value, after.units())});
  }
  compare_definitions(place, before, after, report);
}

void compare_members(const std::string& place, const tevpf::Column& before,
                     const tevpf::Column& after, const Report& report) {
  compare_definitions(place, before, after, report);
  compare_texts(place, "width", std::to_string(before.width()), std::to_string(after.width()),
                report);
  compare_texts(place, "index", index_of(before), index_of(after), report);
}

std::string sketch(const tevpf::Parameter& p) {
  return visible(exact_text(p.value()) + (p.units().empty() ? "" : " " + p.units()));
}
std::string sketch(const tevpf::Column& c) { return tevpf::to_string(c.type()); }

template <class Definition>
const Definition* find(const std::vector<Definition>& all, const std::string& name) {
  const auto found =
      std::find_if(all.begin(), all.end(), [&](const Definition& d) { return d.name() == name; });
  return found == all.end() ? nullptr : &*found;
}

// Names that both have, in the order of the first.
template <class Definition>
std::string common_names(const std::vector<Definition>& all, const std::vector<Definition>& other) {
  std::string names;
  for (const Definition& d : all) {
    if (find(other, d.name()) != nullptr) names += (names.empty() ? "" : ", ") + d.name();
  }
  return names;
}

template <class Definition>
void compare_all(const std::string& owner, const char* word, const std::vector<Definition>& before,
                 const std::vector<Definition>& after, const Report& report) {
  const auto place = [&](const Definition& d) {
    return owner + ", " + word + " " + in_quotes(d.name());
  };
  for (const Definition& old : before) {
    if (const Definition* now = find(after, old.name())) {
      compare_members(place(old), old, *now, report);
    } else {
      report({place(old), "", sketch(old), std::nullopt});
    }
  }
  for (const Definition& now : after) {
    if (find(before, now.name()) == nullptr) report({place(now), "", std::nullopt, sketch(now)});
  }
  compare_texts(owner, (std::string("order of ") + word + "s").c_str(), common_names(before, after),
                common_names(after, before), report);
}

std::vector<tevpf::Parameter> parameters_of(const tevpf::List& list) {
  std::vector<tevpf::Parameter> parameters;
  for (const tevpf::Parameter& parameter : list) parameters.push_back(parameter);
  return parameters;
}

std::string size_of(const tevpf::File& file, const tevpf::Element& element) {
  return element.kind == tevpf::Kind::list ? counted(file.list(element.name).size(), "parameter")
                                           : counted(file.table(element.name).size(), "row");
}

std::string place_of(const tevpf::Element& element) {
  return (element.kind == tevpf::Kind::list ? "list " : "table ") + in_quotes(element.name);
}

const tevpf::Element* counterpart(const std::vector<tevpf::Element>& all,
                                  const tevpf::Element& element) {
  const auto found = std::find_if(all.begin(), all.end(), [&](const tevpf::Element& other) {
    return other.kind == element.kind && other.name == element.name;
  });
  return found == all.end() ? nullptr : &*found;
}

std::string order_of(const std::vector<tevpf::Element>& all,
                     const std::vector<tevpf::Element>& other) {
  std::string names;
  for (const tevpf::Element& element : all) {
    if (counterpart(other, element) != nullptr) {
      names += (names.empty() ? "" : ", ") + element.name;
    }
  }
  return names;
}

void compare_elements(const tevpf::File& before, const tevpf::File& after,
                      const tevpf::Element& old, const tevpf::Element& now, const Report& report) {
  const std::string place = place_of(old);
  compare_texts(place, "description", old.description, now.description, report);
  if (old.kind == tevpf::Kind::list) {
    return compare_all(place, "parameter", parameters_of(before.list(old.name)),
                       parameters_of(after.list(old.name)), report);
  }
  const tevpf::Table old_table = before.table(old.name), new_table = after.table(old.name);
  compare_all(place, "column", old_table.columns(), new_table.columns(), report);
  compare_rows(place, old_table, new_table, report);
}

}  // namespace

void compare(const tevpf::File& before, const tevpf::File& after, const Report& report) {
  const std::vector<tevpf::Element> old = before.elements(), now = after.elements();
  for (const tevpf::Element& element : old) {
    if (const tevpf::Element* other = counterpart(now, element)) {
      compare_elements(before, after, element, *other, report);
    } else {
      report({place_of(element), "", size_of(before, element), std::nullopt});
    }
  }
  for (const tevpf::Element& element : now) {
    if (counterpart(old, element) == nullptr) {
      report({place_of(element), "", std::nullopt, size_of(after, element)});
    }
  }
  compare_texts("file", "order of elements", order_of(old, now), order_of(now, old), report);
}

}  // namespace tool
