// Text that may grow long: in pieces, for one that grows as a whole is there twice, now and then.
#pragma once

#include <cstddef>
#include <string>
#include <string_view>
#include <vector>

namespace gltf
{

class LongText
{
 public:
  LongText& operator+=(std::string_view part);
  // Takes over the text of another, which is empty then.
  void Take(LongText& other);

  std::size_t Size() const { return size_; }
  // The pieces are the whole text, in its order.
  const std::vector<std::string>& Pieces() const { return pieces_; }
  std::string Joined() const;

 private:
  std::vector<std::string> pieces_;
  std::size_t size_ = 0;
};

} // namespace gltf
