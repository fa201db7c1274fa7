#include "gltf/file/long_text.h"

#include <algorithm>
#include <iterator>
#include <limits>
#include <stdexcept>
#include <utility>

namespace gltf
{

namespace
{

constexpr std::size_t kPiece = std::size_t{1} << 16;
constexpr std::size_t kKept = std::size_t{1} << 20; // bytes that stay in memory

} // namespace

LongText& LongText::operator+=(std::string_view part)
{
  if (pieces_.empty() || pieces_.back().store || part.size() > kPiece - std::min(kPiece, pieces_.back().size)) {
    if (size_ >= kKept)
      StoreLast();
    pieces_.push_back({{}, nullptr, 0, 0});
    pieces_.back().text.reserve(std::max(kPiece, part.size()));
  }
  pieces_.back().text += part;
  pieces_.back().size += part.size();
  size_ += part.size();
  return *this;
}

// Without a place for the file, or room in it, the text stays in memory.
void LongText::StoreLast()
{
  Piece& piece = pieces_.back();
  if (piece.store || !isStorable_)
    return;
  if (!store_) {
    if (std::FILE* file = std::tmpfile())
      store_ = Store(file, [](std::FILE* open) { std::fclose(open); });
  }
  isStorable_ = store_ && piece.size <= static_cast<std::size_t>(std::numeric_limits<long>::max() - stored_) &&
                std::fseek(store_.get(), stored_, SEEK_SET) == 0 &&
                std::fwrite(piece.text.data(), 1, piece.size, store_.get()) == piece.size &&
                std::fflush(store_.get()) == 0;
  if (!isStorable_)
    return;
  std::string().swap(piece.text); // assigning an empty one keeps the block
  piece.store = store_;
  piece.place = std::exchange(stored_, stored_ + static_cast<long>(piece.size));
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
  std::string stored;
  for (const Piece& piece : pieces_) {
    if (!piece.store) {
      take(piece.text);
      continue;
    }
    stored.resize(piece.size);
    if (std::fseek(piece.store.get(), piece.place, SEEK_SET) != 0 ||
        std::fread(stored.data(), 1, piece.size, piece.store.get()) != piece.size)
      throw std::runtime_error("what was put by in a temporary file can't be read again");
    take(stored);
  }
}

std::string LongText::Joined() const
{
  std::string whole;
  whole.reserve(size_);
  ForEachPiece([&whole](std::string_view piece) { whole += piece; });
  return whole;
}

} // namespace gltf
