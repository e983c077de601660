// Values and texts as JSON. What JSON cannot hold becomes null (numbers) or a replacement
// character.
#pragma once

#include <nlohmann/json.hpp>
#include <string>

#include "values.h"

namespace tool {

using Json = nlohmann::ordered_json;

inline Json value_json(const Value& value) {
  // A real by its shortest text: 0.1, not 0.10000000149011612. "nan" and "inf" are no JSON.
  if (std::holds_alternative<float>(value)) {
    const Json number = Json::parse(exact_text(value), nullptr, false);
    return number.is_discarded() ? Json(nullptr) : number;
  }
  return std::visit([](const auto& v) { return Json(v); }, value);
}

// As UTF-8, with escapes for all control characters: JSON itself leaves those from DEL on as they are.
std::string json_text(const Json& json, int indent = -1);

}  // namespace tool
