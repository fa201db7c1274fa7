// Holds JSON against a JSON Schema. It knows the words that docs/json-schema.json uses and refuses any other, so that
// none is there without effect.
#pragma once

#include <algorithm>
#include <map>
#include <regex>
#include <string>

#include <nlohmann/json.hpp>

class JsonSchema
{
 public:
  using Json = nlohmann::json;

  explicit JsonSchema(Json schema) : root_(std::move(schema)) {}

  // What doesn't fit and where, or nothing. `definition` names the one of "$defs" to go by; empty: the whole schema.
  std::string Fault(const Json& value, const std::string& definition = {}) const
  {
    return Check(value, definition.empty() ? root_ : root_.at("$defs").at(definition), "");
  }

 private:
  using Checker = std::string (JsonSchema::*)(const Json& value, const Json& schema, const std::string& place) const;

  std::string Check(const Json& value, const Json& schema, const std::string& place) const
  {
    static const std::pair<const char*, Checker> kCheckers[] = {
        {"$ref", &JsonSchema::CheckReference},
        {"type", &JsonSchema::CheckType},
        {"const", &JsonSchema::CheckConst},
        {"enum", &JsonSchema::CheckEnum},
        {"pattern", &JsonSchema::CheckText},
        {"required", &JsonSchema::CheckRequired},
        {"minimum", &JsonSchema::CheckBounds},
        {"maximum", &JsonSchema::CheckBounds},
        {"minItems", &JsonSchema::CheckItems},
        {"maxItems", &JsonSchema::CheckItems},
        {"items", &JsonSchema::CheckItems},
        {"properties", &JsonSchema::CheckMembers},
        {"patternProperties", &JsonSchema::CheckMembers},
        {"additionalProperties", &JsonSchema::CheckMembers},
        {"anyOf", &JsonSchema::CheckChoice},
        {"oneOf", &JsonSchema::CheckChoice},
        {"allOf", &JsonSchema::CheckAll},
        {"$schema", nullptr},
        {"$defs", nullptr},
        {"title", nullptr},
    };
    for (const auto& [word, condition] : schema.items()) {
      const auto* checker = std::find_if(std::begin(kCheckers), std::end(kCheckers),
                                         [&word = word](const auto& row) { return row.first == word; });
      if (checker == std::end(kCheckers))
        return "the schema says \"" + word + "\", which isn't known here";
      const std::string fault = checker->second ? (this->*checker->second)(value, schema, place) : std::string();
      if (!fault.empty())
        return fault;
    }
    return {};
  }

  static std::string Say(const std::string& place, const std::string& what)
  {
    return (place.empty() ? "the whole" : place) + " " + what;
  }

  static const std::regex& Compiled(const std::string& pattern)
  {
    static std::map<std::string, std::regex> all; // to compile one takes longer than to use it
    return all.try_emplace(pattern, pattern).first->second;
  }

  std::string CheckReference(const Json& value, const Json& schema, const std::string& place) const
  {
    const std::string path = schema["$ref"].get<std::string>().substr(1);
    return Check(value, root_.at(Json::json_pointer(path)), place);
  }

  static bool IsOfType(const Json& value, const std::string& type)
  {
    return (type == "object" && value.is_object()) || (type == "array" && value.is_array()) ||
           (type == "string" && value.is_string()) || (type == "boolean" && value.is_boolean()) ||
           (type == "null" && value.is_null()) || (type == "number" && value.is_number()) ||
           (type == "integer" && value.is_number_integer());
  }

  std::string CheckType(const Json& value, const Json& schema, const std::string& place) const
  {
    const Json types = schema["type"].is_array() ? schema["type"] : Json::array({schema["type"]});
    const bool fits = std::any_of(types.begin(), types.end(), [&](const Json& type) { return IsOfType(value, type); });
    return fits ? "" : Say(place, "is no " + schema["type"].dump() + " but " + value.dump().substr(0, 80));
  }

  std::string CheckConst(const Json& value, const Json& schema, const std::string& place) const
  {
    return value == schema["const"] ? "" : Say(place, "isn't " + schema["const"].dump());
  }

  std::string CheckEnum(const Json& value, const Json& schema, const std::string& place) const
  {
    const Json& all = schema["enum"];
    return std::find(all.begin(), all.end(), value) != all.end() ? "" : Say(place, "is none of " + all.dump());
  }

  std::string CheckText(const Json& value, const Json& schema, const std::string& place) const
  {
    const std::string pattern = schema["pattern"];
    const bool fits = !value.is_string() || std::regex_search(value.get<std::string>(), Compiled(pattern));
    return fits ? "" : Say(place, "doesn't fit " + pattern);
  }

  std::string CheckRequired(const Json& value, const Json& schema, const std::string& place) const
  {
    for (const Json& name : schema["required"]) {
      if (value.is_object() && !value.contains(name.get<std::string>()))
        return Say(place, "lacks " + name.dump());
    }
    return {};
  }

  std::string CheckBounds(const Json& value, const Json& schema, const std::string& place) const
  {
    const bool fits =
        !value.is_number() || (value >= schema.value("minimum", value) && value <= schema.value("maximum", value));
    return fits ? "" : Say(place, "is out of bounds: " + value.dump());
  }

  std::string CheckItems(const Json& value, const Json& schema, const std::string& place) const
  {
    if (!value.is_array())
      return {};
    if (value.size() < schema.value("minItems", std::size_t{0}) ||
        value.size() > schema.value("maxItems", value.size()))
      return Say(place, "has " + std::to_string(value.size()) + " items");
    for (std::size_t i = 0; schema.contains("items") && i < value.size(); ++i) {
      const std::string fault = Check(value[i], schema["items"], place + "/" + std::to_string(i));
      if (!fault.empty())
        return fault;
    }
    return {};
  }

  // A member that no word speaks of is refused even where additionalProperties isn't there.
  std::string CheckMembers(const Json& value, const Json& schema, const std::string& place) const
  {
    if (!value.is_object())
      return {};
    const Json patterns = schema.value("patternProperties", Json::object());
    for (const auto& [name, member] : value.items()) {
      const Json* found = nullptr;
      if (schema.contains("properties") && schema["properties"].contains(name))
        found = &schema["properties"][name];
      for (const auto& [pattern, rule] : patterns.items()) {
        if (!found && std::regex_search(name, Compiled(pattern)))
          found = &patterns.at(pattern);
      }
      if (!found)
        return Say(place, "has \"" + name + "\", of which the schema doesn't know");
      const std::string fault = Check(member, *found, place + "/" + name);
      if (!fault.empty())
        return fault;
    }
    return {};
  }

  std::string CheckChoice(const Json& value, const Json& schema, const std::string& place) const
  {
    const bool isOne = schema.contains("oneOf");
    std::size_t fits = 0;
    std::string faults;
    for (const Json& choice : schema[isOne ? "oneOf" : "anyOf"]) {
      const std::string fault = Check(value, choice, place);
      fits += fault.empty() ? 1 : 0;
      faults += fault.empty() ? "" : "\n  " + fault;
    }
    return fits == 1 || (fits > 1 && !isOne) ? "" : Say(place, "fits " + std::to_string(fits) + " choices:" + faults);
  }

  std::string CheckAll(const Json& value, const Json& schema, const std::string& place) const
  {
    for (const Json& part : schema["allOf"]) {
      const std::string fault = Check(value, part, place);
      if (!fault.empty())
        return fault;
    }
    return {};
  }

  const Json root_;
};
