// A JSON text whose values are asked for by kind; a value of another kind refuses the file with the place.
#pragma once

#include <nlohmann/json.hpp>

#include <cstdint>
#include <string>
#include <string_view>

namespace host
{

using Json = nlohmann::json;

class JsonDocument
{
 public:
  // Arrays and objects may be nested this deep; a file that goes deeper is refused.
  static constexpr std::size_t kMaxDepth = 1000;

  // `name` is the file's in messages. Throws CompositionError when the text is not JSON.
  JsonDocument(std::string_view name, std::string_view text);

  const Json& Root() const { return root_; }
  const std::string& Name() const { return name_; }

  // All of these refuse the file by throwing CompositionError: "name: /pointer: reason". `at` is a value of this
  // document; RefuseMember names a member of an object that may be missing.
  [[noreturn]] void Refuse(const Json& at, std::string_view reason) const;
  [[noreturn]] void RefuseMember(const Json& object, std::string_view key, std::string_view reason) const;

  // A member of an object; null when it is missing or null. Refuses what is no object.
  const Json* Find(const Json& object, const char* key) const;
  // The same, refusing when it is missing.
  const Json& Require(const Json& object, const char* key) const;

  const Json& Object(const Json& value) const;
  const Json& Array(const Json& value) const;
  double Number(const Json& value) const;
  std::int64_t WholeNumber(const Json& value) const;
  // A truth value, or a number that isn't 0.
  bool Flag(const Json& value) const;
  const std::string& Text(const Json& value) const;

  // The same for a member that may be missing.
  bool FlagOr(const Json& object, const char* key, bool otherwise) const;
  std::string TextOr(const Json& object, const char* key, std::string_view otherwise) const;

 private:
  std::string Pointer(const Json& value) const;

  std::string name_;
  Json root_;
};

} // namespace host
