#include "host/reader/json_document.h"

#include <algorithm>
#include <cmath>
#include <cstdlib>
#include <vector>

#include "host/model/composition.h"
#include "host/text.h"

namespace host
{

namespace
{

// Builds the values in one pass without recursion, and keeps what was wrong and where.
class Builder : public nlohmann::json_sax<Json>
{
 public:
  explicit Builder(Json& root) : root_(root) {}

  std::size_t ErrorByte() const { return errorByte_; }
  bool IsTooDeep() const { return isTooDeep_; }
  bool IsOutOfRange() const { return isOutOfRange_; }

  bool null() override { return Add(nullptr); }
  bool boolean(bool value) override { return Add(value); }
  bool number_integer(number_integer_t value) override { return Add(value); }
  bool number_unsigned(number_unsigned_t value) override { return Add(value); }
  bool number_float(number_float_t value, const string_t&) override { return Add(value); }
  bool string(string_t& value) override { return Add(std::move(value)); }
  bool binary(binary_t&) override { return false; } // not in a text
  bool start_object(std::size_t) override { return Open(Json::object()); }
  bool start_array(std::size_t) override { return Open(Json::array()); }
  bool end_object() override { return Close(); }
  bool end_array() override { return Close(); }

  bool key(string_t& value) override
  {
    member_ = &(*open_.back())[std::move(value)];
    return true;
  }

  bool parse_error(std::size_t position, const std::string& token, const nlohmann::detail::exception&) override
  {
    errorByte_ = position;
    const bool isNumber = token.find_first_not_of("0123456789+-.eE") == std::string::npos;
    isOutOfRange_ = isNumber && std::isinf(std::strtod(token.c_str(), nullptr));
    return false;
  }

 private:
  Json* Place(Json&& value)
  {
    if (open_.empty()) {
      root_ = std::move(value);
      return &root_;
    }
    if (open_.back()->is_array())
      return &open_.back()->emplace_back(std::move(value));
    *member_ = std::move(value);
    return member_;
  }

  bool Add(Json value)
  {
    Place(std::move(value));
    return true;
  }

  bool Open(Json&& container)
  {
    if (open_.size() >= JsonDocument::kMaxDepth) {
      isTooDeep_ = true;
      return false;
    }
    open_.push_back(Place(std::move(container)));
    return true;
  }

  bool Close()
  {
    open_.pop_back();
    return true;
  }

  Json& root_;
  // The containers that are open; one stays where it is until it is closed, since only then its siblings come.
  std::vector<Json*> open_;
  Json* member_ = nullptr;
  std::size_t errorByte_ = 0;
  bool isTooDeep_ = false;
  bool isOutOfRange_ = false;
};

// Lines and columns count from 1.
std::string BytePlace(std::string_view text, std::size_t offset)
{
  const std::string_view before = text.substr(0, offset);
  const auto line = 1 + std::count(before.begin(), before.end(), '\n');
  const std::size_t lineStart = before.rfind('\n') + 1; // npos + 1 is 0
  return "byte " + std::to_string(offset) + " (line " + std::to_string(line) + ", column " +
         std::to_string(before.size() - lineStart + 1) + ")";
}

// Writes the pointer of `wanted` behind `pointer` if it lies in `value`. Depth is bounded by kMaxDepth.
bool FindPointer(const Json& value, const Json& wanted, std::string& pointer)
{
  if (&value == &wanted)
    return true;
  const std::size_t length = pointer.size();
  const auto tryChild = [&](const Json& child, const std::string& token) {
    pointer += '/' + token;
    if (FindPointer(child, wanted, pointer))
      return true;
    pointer.resize(length);
    return false;
  };
  if (value.is_array())
    for (std::size_t i = 0; i < value.size(); ++i)
      if (tryChild(value[i], std::to_string(i)))
        return true;
  if (value.is_object())
    for (const auto& [key, child] : value.items())
      if (tryChild(child, OneLine(key)))
        return true;
  return false;
}

} // namespace

JsonDocument::JsonDocument(std::string_view name, std::string_view text) : name_(OneLine(name))
{
  Builder builder(root_);
  if (Json::sax_parse(text, &builder))
    return;
  if (builder.IsTooDeep())
    throw CompositionError(name_, "nested deeper than " + std::to_string(kMaxDepth));
  // The parser counts what it has taken, with the byte that it can't take.
  const std::size_t offset = builder.ErrorByte() - std::min<std::size_t>(builder.ErrorByte(), 1);
  const char* reason = builder.IsOutOfRange()  ? ": number out of range"
                       : offset >= text.size() ? ": the file ends before its JSON does"
                                               : ": not JSON";
  throw CompositionError(name_, BytePlace(text, offset) + reason, static_cast<std::ptrdiff_t>(offset));
}

std::string JsonDocument::Pointer(const Json& value) const
{
  std::string pointer;
  FindPointer(root_, value, pointer);
  return pointer;
}

void JsonDocument::Refuse(const Json& at, std::string_view reason) const
{
  const std::string pointer = Pointer(at);
  throw CompositionError(name_, pointer + (pointer.empty() ? "" : ": ") + std::string(reason), -1, pointer);
}

void JsonDocument::RefuseMember(const Json& object, std::string_view key, std::string_view reason) const
{
  const std::string pointer = Pointer(object) + '/' + std::string(key);
  throw CompositionError(name_, pointer + ": " + std::string(reason), -1, pointer);
}

const Json& JsonDocument::Object(const Json& value) const
{
  if (!value.is_object())
    Refuse(value, "expected an object");
  return value;
}

const Json& JsonDocument::Array(const Json& value) const
{
  if (!value.is_array())
    Refuse(value, "expected an array");
  return value;
}

const Json* JsonDocument::Find(const Json& object, const char* key) const
{
  const auto found = Object(object).find(key);
  return found == object.end() || found->is_null() ? nullptr : &*found;
}

const Json& JsonDocument::Require(const Json& object, const char* key) const
{
  const Json* value = Find(object, key);
  if (!value)
    RefuseMember(object, key, "missing");
  return *value;
}

double JsonDocument::Number(const Json& value) const
{
  if (!value.is_number())
    Refuse(value, "expected a number");
  return value.get<double>();
}

std::int64_t JsonDocument::WholeNumber(const Json& value) const
{
  const double number = Number(value);
  if (std::abs(number) > 9007199254740992.0 || number != std::trunc(number)) // 2^53: the next ones have gaps
    Refuse(value, "expected a whole number");
  return static_cast<std::int64_t>(number);
}

bool JsonDocument::Flag(const Json& value) const
{
  if (value.is_boolean())
    return value.get<bool>();
  if (!value.is_number())
    Refuse(value, "expected true or false");
  return value.get<double>() != 0;
}

const std::string& JsonDocument::Text(const Json& value) const
{
  if (!value.is_string())
    Refuse(value, "expected a text");
  return value.get_ref<const std::string&>();
}

bool JsonDocument::FlagOr(const Json& object, const char* key, bool otherwise) const
{
  const Json* value = Find(object, key);
  return value ? Flag(*value) : otherwise;
}

std::string JsonDocument::TextOr(const Json& object, const char* key, std::string_view otherwise) const
{
  const Json* value = Find(object, key);
  std::string text = value ? Text(*value) : std::string();
  return text.empty() ? std::string(otherwise) : text;
}

} // namespace host
