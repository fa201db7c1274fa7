// The JSON part of a file. Its arrays grow as text: a value of a large scene lives only until it is added.
#pragma once

#include <cstddef>
#include <string>

#include <nlohmann/json.hpp>

#include "gltf/file/long_text.h"
#include "gltf/scene/frames.h"

namespace gltf
{

using Json = nlohmann::ordered_json;

// Without indent; bytes that are no UTF-8 become U+FFFD.
std::string Dump(const Json& value);

// A number as a file may hold it: in the range of single precision, 0 for what is none, and never -0.
Real Finite(Real number);
Json ToJson(const Vector& vector);
Json ToJson(const Quaternion& q);

// The elements of one array of the file.
class Section
{
 public:
  // The element's index.
  std::size_t Add(const Json& element);
  std::size_t Count() const { return count_; }
  LongText& Text() { return text_; } // joined by commas

 private:
  LongText text_;
  std::size_t count_ = 0;
};

} // namespace gltf
