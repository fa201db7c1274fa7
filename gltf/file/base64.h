// Bytes as text of 64 letters.
#pragma once

#include <cstddef>
#include <cstdint>
#include <string>

namespace gltf
{

// Takes bytes in parts of any size; the text grows with them.
class Base64
{
 public:
  void Append(const std::uint8_t* data, std::size_t size);
  // The text so far, in whole groups of four; the next one begins empty.
  std::string Take();
  // What is left, filled up with "=".
  std::string Finish();

  static std::size_t LengthOf(std::size_t bytes) { return (bytes + 2) / 3 * 4; }

 private:
  void PutGroup();

  std::string text_;
  std::uint32_t bits_ = 0; // of the bytes that wait
  unsigned waiting_ = 0;   // 0 to 2
};

} // namespace gltf
