// Text that may grow long: in pieces, for one that grows as a whole is there twice, now and then.
#pragma once

#include <cstddef>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "gltf/file/stretch.h"

namespace gltf
{

class LongText
{
 public:
  LongText& operator+=(std::string_view part);
  // Takes over the text of another, which is empty then.
  void Take(LongText& other);

  std::size_t Size() const { return size_; }
  // Hands on the whole text, in its order. Throws as Stretch::Get.
  void ForEachPiece(const std::function<void(std::string_view)>& take) const;
  std::string Joined() const;

 private:
  std::vector<Stretch> pieces_;
  std::size_t size_ = 0;
  std::shared_ptr<TemporaryStore> store_;
};

} // namespace gltf
