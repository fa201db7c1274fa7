#include "gltf/file/long_text.h"

#include <algorithm>
#include <iterator>

namespace gltf
{

namespace
{

constexpr std::size_t kPiece = 1 << 16;

}

LongText& LongText::operator+=(std::string_view part)
{
  if (pieces_.empty() || part.size() > pieces_.back().capacity() - pieces_.back().size())
    pieces_.emplace_back().reserve(std::max(kPiece, part.size()));
  pieces_.back() += part;
  size_ += part.size();
  return *this;
}

void LongText::Take(LongText& other)
{
  pieces_.insert(pieces_.end(), std::make_move_iterator(other.pieces_.begin()),
                 std::make_move_iterator(other.pieces_.end()));
  size_ += other.size_;
  other = LongText();
}

std::string LongText::Joined() const
{
  std::string whole;
  whole.reserve(size_);
  for (const std::string& piece : pieces_)
    whole += piece;
  return whole;
}

} // namespace gltf
