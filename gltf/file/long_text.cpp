#include "gltf/file/long_text.h"

#include <algorithm>
#include <iterator>

namespace gltf
{

namespace
{

constexpr std::size_t kPiece = std::size_t{1} << 16;

} // namespace

LongText& LongText::operator+=(std::string_view part)
{
  const bool isNew =
      pieces_.empty() || pieces_.back().IsPutBy() || part.size() > kPiece - std::min(kPiece, pieces_.back().Size());
  if (isNew) {
    if (size_ >= kKeptInMemory && !pieces_.empty())
      pieces_.back().PutBy(store_);
    pieces_.emplace_back().Reserve(std::max(kPiece, part.size()));
  }
  pieces_.back().Append(part);
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

void LongText::ForEachPiece(const std::function<void(std::string_view)>& take) const
{
  std::string buffer;
  for (const Stretch& piece : pieces_)
    take(piece.Get(0, piece.Size(), buffer));
}

std::string LongText::Joined() const
{
  std::string whole;
  whole.reserve(size_);
  ForEachPiece([&whole](std::string_view piece) { whole += piece; });
  return whole;
}

} // namespace gltf
