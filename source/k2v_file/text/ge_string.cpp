#include "torvane/text/ge_string.h"

#include <atomic>
#include <cstring>
#include <utility>

#include "ge_string_case.h"
#include "torvane/memory/memory.h"

namespace _torvane_
{

namespace
{

constexpr LLong kBlockStep = 16;
constexpr LLong kMaxLength = 0x7FFFFFFF / kBlockStep * kBlockStep;

std::atomic<Bool> gShutdown{false};

constexpr LLong RoundUp(LLong count) { return (count + kBlockStep - 1) / kBlockStep * kBlockStep; }

constexpr LLong BytesOf(LLong count) { return count * static_cast<LLong>(sizeof(UniChar)); }

Long TextLength(const UniChar* text)
{
  LLong length = 0;
  while (length < kMaxLength && text[length] != 0)
    ++length;
  return static_cast<Long>(length);
}

// The one comparison of texts; Fold is applied to characters that differ and to the one that decides an equal prefix.
template <UniChar (*Fold)(UniChar)>
Long CompareText(const UniChar* a, Long countA, const UniChar* b, Long countB)
{
  Long common = countA < countB ? countA : countB;
  for (Long i = 0; i < common; ++i) {
    if (a[i] == b[i])
      continue;
    Long difference = static_cast<Long>(Fold(a[i])) - static_cast<Long>(Fold(b[i]));
    if (difference != 0)
      return difference;
  }
  if (countA == countB)
    return 0;
  return countA > countB ? static_cast<Long>(Fold(a[common])) : -static_cast<Long>(Fold(b[common]));
}

} // namespace

String::String(const String& other) noexcept { *this = other; }

String::String(String&& other) noexcept
    : capacity_(std::exchange(other.capacity_, 0)),
      length_(std::exchange(other.length_, 0)),
      block_(std::exchange(other.block_, nullptr))
{}

String::String(const char* text, StringEncoding encoding) noexcept { SetCString(text, -1, encoding); }

String String::FromUtf8(const char* text, Long length) noexcept
{
  String string;
  string.SetCString(text, length, STRINGENCODING_UTF8);
  return string;
}

String::String(const UniChar* text, Long count) noexcept { SetUcBlock(text, count); }

String::String(Long count, UniChar fill) noexcept { FillChars(count, fill); }

String::~String() { Release(); }

String& String::operator=(const String& other) noexcept
{
  if (&other != this)
    SetUcBlock(other.block_, other.length_);
  return *this;
}

String& String::operator=(String&& other) noexcept
{
  std::swap(capacity_, other.capacity_);
  std::swap(length_, other.length_);
  std::swap(block_, other.block_);
  return *this;
}

void String::Release() noexcept
{
  if (capacity_ > 0 && !gShutdown.load(std::memory_order_relaxed))
    GeFree(block_);
  block_ = nullptr;
  capacity_ = length_ = 0;
}

void String::SetShutdown(Bool shutdown) noexcept { gShutdown.store(shutdown, std::memory_order_relaxed); }

// Makes the capacity at least `count`. On failure the string is empty and has no block.
Bool String::Reserve(LLong count, Bool keepText) noexcept
{
  if (count <= capacity_)
    return true;
  LLong capacity = RoundUp(count);
  UniChar* block = capacity <= kMaxLength ? static_cast<UniChar*>(GeAllocNC(BytesOf(capacity))) : nullptr;
  if (block && keepText)
    GeCopyMem(block, block_, BytesOf(length_));
  Long length = block && keepText ? length_ : 0;
  Release();
  block_ = block;
  capacity_ = block ? static_cast<Long>(capacity) : 0;
  length_ = length;
  return block != nullptr;
}

UniChar* String::SetLengthNC(Long count) noexcept
{
  static UniChar noCharacters = 0;
  if (count < 0 || !Reserve(count, false)) {
    length_ = 0;
    return nullptr;
  }
  length_ = count;
  return count > 0 ? block_ : &noCharacters;
}

void String::Trim() noexcept
{
  if (length_ == 0) {
    Release();
    return;
  }
  if (capacity_ - length_ <= kBlockStep)
    return;
  LLong capacity = RoundUp(length_);
  UniChar* block = static_cast<UniChar*>(GeAllocNC(BytesOf(capacity)));
  if (!block)
    return;
  GeCopyMem(block, block_, BytesOf(length_));
  Long length = length_;
  Release();
  block_ = block;
  capacity_ = static_cast<Long>(capacity);
  length_ = length;
}

Long String::Compare(const String& other) const noexcept
{
  return CompareText<SameChar>(block_, length_, other.block_, other.length_);
}

Long String::ComparePart(const String& other, Long count, Long position) const noexcept
{
  Long limit = count > 0 ? count : 0;
  Long rest = position >= 0 && position < length_ ? length_ - position : 0;
  const UniChar* from = rest > 0 ? block_ + position : nullptr;
  return CompareText<SameChar>(from, rest < limit ? rest : limit, other.block_,
                               other.length_ < limit ? other.length_ : limit);
}

Long String::LexCompare(const String& other) const noexcept
{
  return CompareText<UpperChar>(block_, length_, other.block_, other.length_);
}

Long String::Similarity(const String& other) const noexcept
{
  if (*this == other)
    return 100000;
  Long common = length_ < other.length_ ? length_ : other.length_;
  Long similarity = 0;
  Long bonus = 10;
  for (Long i = 0; i < common && UpperChar(block_[i]) == UpperChar(other.block_[i]); ++i) {
    similarity += 100;
    if (block_[i] == other.block_[i]) {
      similarity += bonus;
      bonus = bonus > 1 ? bonus - 1 : 1;
    }
  }
  return similarity;
}

void String::Append(const String& other) noexcept
{
  Long count = other.length_;
  Long old = length_;
  if (count == 0 || !Reserve(LLong{old} + count, true))
    return;
  // A string appended to itself has its text in the new block by now.
  GeCopyMem(block_ + old, other.block_, BytesOf(count));
  length_ = old + count;
}

String String::Concat(const String& other) const noexcept
{
  String result;
  if (result.Reserve(LLong{length_} + other.length_, false)) {
    result.Append(*this);
    result.Append(other);
  }
  return result;
}

void String::Delete(Long position, Long count) noexcept
{
  if (position < 0 || count <= 0 || position >= length_ || !Reserve(length_, true))
    return;
  Long rest = length_ - position;
  Long removed = count < rest ? count : rest;
  if (removed < rest)
    std::memmove(block_ + position, block_ + position + removed, static_cast<std::size_t>(BytesOf(rest - removed)));
  else
    block_[position] = 0;
  length_ -= removed;
}

// Moves the text from `position` on up by `count` characters, which are then to be filled.
Bool String::OpenGap(Long position, Long count) noexcept
{
  if (!Reserve(LLong{length_} + count, true))
    return false;
  std::memmove(block_ + position + count, block_ + position, static_cast<std::size_t>(BytesOf(length_ - position)));
  length_ += count;
  return true;
}

void String::InsertChar(Long position, UniChar character) noexcept
{
  if (position < 0 || position > length_ || !OpenGap(position, 1))
    return;
  block_[position] = character;
}

void String::Insert(Long position, const String& source, Long first, Long last) noexcept
{
  if (position < 0 || position > length_)
    return;
  if (&source == this) {
    Insert(position, String(source), first, last);
    return;
  }
  Long from = first < 0 ? 0 : first;
  Long to = last < 0 || last >= source.length_ ? source.length_ - 1 : last;
  Long count = to - from + 1;
  if (count <= 0 || !OpenGap(position, count))
    return;
  GeCopyMem(block_ + position, source.block_ + from, BytesOf(count));
}

String String::SubStr(Long position, Long count) const noexcept
{
  String result;
  if (position >= 0 && position < length_ && count > 0)
    result.SetUcBlock(block_ + position, count < length_ - position ? count : length_ - position);
  return result;
}

String String::ToUpper() const noexcept
{
  String result = *this;
  for (Long i = 0; i < result.length_; ++i)
    result.block_[i] = UpperChar(result.block_[i]);
  return result;
}

String String::ToLower() const noexcept
{
  String result = *this;
  for (Long i = 0; i < result.length_; ++i)
    result.block_[i] = LowerChar(result.block_[i]);
  return result;
}

void String::GetUcBlock(UniChar* buffer, Long count) const noexcept
{
  GeCopyMem(buffer, block_, BytesOf(count < length_ ? count : length_));
}

void String::GetUcBlockNull(UniChar* buffer, Long count) const noexcept
{
  if (!buffer || count <= 0)
    return;
  GetUcBlock(buffer, count);
  buffer[length_ < count ? length_ : count - 1] = 0;
}

void String::SetUcBlock(const UniChar* text, Long count) noexcept
{
  Long length = !text ? 0 : count < 0 ? TextLength(text) : count;
  if (UniChar* place = SetLengthNC(length))
    GeCopyMem(place, text, BytesOf(length));
}

void String::FillChars(Long count, UniChar character) noexcept
{
  UniChar* place = SetLengthNC(count > 0 ? count : 0);
  for (Long i = 0; place && i < length_; ++i)
    place[i] = character;
}

} // namespace _torvane_
