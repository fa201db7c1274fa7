// Text that may grow long: in pieces, for one that grows as a whole is there twice, now and then. Past the first MiB
// the pieces lie in a temporary file, as far as there is room for one, so that a large scene and its text don't add up.
#pragma once

#include <cstddef>
#include <cstdio>
#include <functional>
#include <memory>
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
  // Hands on the whole text, in its order. Throws std::runtime_error when the temporary file can't be read.
  void ForEachPiece(const std::function<void(std::string_view)>& take) const;
  std::string Joined() const;

 private:
  // Nameless: the system removes it when it is closed, however the program ends.
  using Store = std::shared_ptr<std::FILE>;

  struct Piece
  {
    std::string text; // empty when it is stored
    Store store;      // null when it isn't
    long place;       // in the store
    std::size_t size;
  };

  void StoreLast();

  std::vector<Piece> pieces_;
  std::size_t size_ = 0;
  Store store_;
  long stored_ = 0; // bytes in the store
  bool isStorable_ = true;
};

} // namespace gltf
