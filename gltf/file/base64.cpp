#include "gltf/file/base64.h"

#include <utility>

namespace gltf
{

void Base64::PutGroup()
{
  constexpr const char* kLetters = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
  for (const unsigned shift : {18U, 12U, 6U, 0U})
    text_ += kLetters[bits_ >> shift & 63];
  bits_ = 0;
  waiting_ = 0;
}

void Base64::Append(const std::uint8_t* data, std::size_t size)
{
  text_.reserve(text_.size() + LengthOf(size + waiting_));
  for (const std::uint8_t* end = data + size; data != end; ++data) {
    bits_ |= std::uint32_t{*data} << (16 - 8 * waiting_);
    if (++waiting_ == 3)
      PutGroup();
  }
}

std::string Base64::Take() { return std::exchange(text_, {}); }

std::string Base64::Finish()
{
  if (const unsigned missing = waiting_ == 0 ? 0 : 3 - waiting_) {
    PutGroup();
    text_.replace(text_.size() - missing, missing, missing, '=');
  }
  return Take();
}

} // namespace gltf
