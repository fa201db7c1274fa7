// Check sums that are built up piece by piece: they tell whether a node's data has changed.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/types.h"

namespace _torvane_
{

// CRC-32 of IEEE 802.3: the polynomial 0xEDB88320, reflected.
class Crc32 : public GeMemory
{
 public:
  Crc32() noexcept = default;
  virtual ~Crc32() = default;

  virtual void Reset() noexcept { value_ = kStart; }
  // A size of 0 or less changes nothing.
  virtual void Update(const void* data, LLong size) noexcept;
  virtual void UpdateByte(UChar byte) noexcept;
  // The sum so far; more data may follow.
  virtual ULong GetCrc() const noexcept { return ~value_; }

 private:
  static constexpr ULong kStart = 0xFFFFFFFFu;
  ULong value_ = kStart;
};

// CRC-64 with the polynomial 0x42F0E1EBA9EA3693 of ECMA-182, not reflected, from all ones and complemented.
class Crc64 : public GeMemory
{
 public:
  Crc64() noexcept = default;
  virtual ~Crc64() = default;

  virtual void Reset() noexcept { value_ = kStart; }
  virtual void Update(const void* data, LLong size) noexcept;
  virtual void UpdateByte(UChar byte) noexcept;
  virtual ULLong GetCrc() const noexcept { return ~value_; }

 private:
  static constexpr ULLong kStart = 0xFFFFFFFFFFFFFFFFu;
  ULLong value_ = kStart;
};

} // namespace _torvane_
