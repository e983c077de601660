#include "definition_options.h"

#include <array>
#include <utility>

#include "text.h"

namespace tool {
namespace {

struct TypeName {
  const char* word;
  Type type;
};
constexpr TypeName kTypeNames[] = {
    {"integer", Type::int32},   {"short", Type::int16},     {"real", Type::float32},
    {"double", Type::float64},  {"string", Type::string},   {"int", Type::int32},
    {"int32", Type::int32},     {"int16", Type::int16},     {"float", Type::float32},
    {"float32", Type::float32}, {"float64", Type::float64}, {"text", Type::string},
};

// The bounds that a type itself sets.
std::optional<tevpf::Bounds> widest_bounds(Type type) { return tevpf::Column("x", type).bounds(); }

Value bound(Type type, const std::string& text, const Value& widest, const Subject& subject) {
  if (text == "none") return widest;
  Value value;
  const Parsed parsed = parse_value(type, text, value);
  if (parsed != Parsed::kValue) {
    subject.refuse("as a bound, " + refused_value(text, parsed, type, {}) +
                   "; give a number, or none");
  }
  if (is_nan(value)) subject.refuse("a bound is a number, or none");
  return value;
}

template <class Definition>
void apply_bounds(Definition& definition, const DefinitionOptions& options,
                  const Subject& subject) {
  if (!options.min && !options.max) return;
  const Type type = definition.type();
  if (type == Type::string) subject.refuse("--min and --max are for numbers, and it is a string");
  const tevpf::Bounds widest = *widest_bounds(type);
  tevpf::Bounds bounds = *definition.bounds();
  if (options.min) bounds.min = bound(type, *options.min, widest.min, subject);
  if (options.max) bounds.max = bound(type, *options.max, widest.max, subject);
  if (bounds.max < bounds.min) {
    subject.refuse("the largest value, " + exact_text(bounds.max) + ", is below the smallest, " +
                   exact_text(bounds.min));
  }
  definition.bounds(bounds.min, bounds.max);
}

template <class Definition>
void apply_options(Definition& definition, const DefinitionOptions& options,
                   const Subject& subject) {
  if (options.units) {
    if (options.units->size() >= TEVPF_UNITS_SIZE) {
      subject.refuse("the unit " + in_quotes(*options.units) + " has " +
                     counted(options.units->size(), "byte") + "; units have at most " +
                     std::to_string(TEVPF_UNITS_SIZE - 1));
    }
    definition.units(*options.units);
  }
  if (options.description) definition.description(*options.description);
  if (options.precision) {
    if (!is_floating(definition.type())) {
      subject.refuse(std::string("--precision is for reals and doubles, and it is ") +
                     with_article(definition.type()));
    }
    definition.precision(*options.precision);
  }
  apply_bounds(definition, options, subject);
}

// What a definition of another type keeps of the one before.
template <class Definition>
void keep_texts(Definition& definition, const Definition& before) {
  definition.units(before.units()).description(before.description());
}

}  // namespace

Type required_type(const std::string& word) {
  for (const TypeName& name : kTypeNames) {
    if (word == name.word) return name.type;
  }
  throw Failure(kUsage, "--type: there is no type " + in_quotes(word) +
                            "; choose integer, short, real, double or string");
}

tevpf::Parameter define_parameter(const std::string& name, const tevpf::Parameter* before,
                                  const std::optional<std::string>& value,
                                  const DefinitionOptions& options, const Subject& subject) {
  const std::string text = value ? *value : exact_text(before->value());
  const Type type = options.type        ? required_type(*options.type)
                    : before != nullptr ? before->type()
                                        : guess_type(text);
  const bool keeps_type = before != nullptr && before->type() == type;
  const auto start = [&] {
    if (keeps_type) return *before;
    tevpf::Parameter made(name, zero_of(type));
    if (before != nullptr) keep_texts(made, *before);
    if (is_floating(type)) made.precision(precision_of(text));
    return made;
  };
  tevpf::Parameter result = start();
  apply_options(result, options, subject);
  if (value || !keeps_type || options.min || options.max) {
    result.value(value_within(result, text, subject));
  }
  return result;
}

tevpf::Column define_column(const std::string& name, const tevpf::Column* before,
                            const DefinitionOptions& options, const Subject& subject) {
  if (!options.type && before == nullptr) {
    subject.refuse("a new column needs --type: integer, short, real, double or string");
  }
  const Type type = options.type ? required_type(*options.type) : before->type();
  const bool keeps_type = before != nullptr && before->type() == type;
  if (type == Type::string && !keeps_type && !options.width) {
    subject.refuse("a string column needs --width, the bytes of its longest text");
  }
  tevpf::Column result = keeps_type ? *before : tevpf::Column(name, type);
  if (before != nullptr && !keeps_type) {
    keep_texts(result, *before);
    result.indexed(before->is_indexed()).unique(before->is_unique());
  }
  apply_options(result, options, subject);
  if (options.width) result.width(*options.width);
  if (options.index) {
    if (!*options.index && options.unique.value_or(false)) {
      subject.refuse("a unique column has an index; leave out --no-index");
    }
    result.indexed(*options.index);
  }
  if (options.unique) {
    *options.unique ? result.unique() : result.unique(false);
  }
  return result;
}

}  // namespace tool
