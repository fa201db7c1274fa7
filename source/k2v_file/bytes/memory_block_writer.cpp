#include "torvane/bytes/memory_block_writer.h"

#include <cstring>

#include "torvane/memory/memory.h"

namespace _torvane_
{

namespace
{

constexpr Long kTableStep = 1000;
constexpr LLong kMinBlock = 50000;
constexpr LLong kMaxBlock = 2000000;

} // namespace

void MemoryBlockWriter::Clear() noexcept
{
  for (Long i = 0; i < count_; ++i)
    GeFree(table_[i].data);
  GeFree(table_);
  tableCapacity_ = count_ = 0;
  lastFill_ = size_ = 0;
}

Bool MemoryBlockWriter::AddBlock() noexcept
{
  if (count_ == tableCapacity_) {
    LLong capacity = LLong{tableCapacity_} + kTableStep;
    void* table = GeRealloc(table_, capacity * static_cast<LLong>(sizeof(Block)));
    if (!table)
      return false;
    table_ = static_cast<Block*>(table);
    tableCapacity_ = static_cast<Long>(capacity);
  }
  LLong doubled = count_ > 0 ? table_[count_ - 1].capacity * 2 : 0;
  LLong capacity = doubled < kMinBlock ? kMinBlock : doubled > kMaxBlock ? kMaxBlock : doubled;
  UChar* data = static_cast<UChar*>(GeAllocNC(capacity));
  if (!data)
    return false;
  table_[count_++] = {data, capacity};
  lastFill_ = 0;
  return true;
}

Bool MemoryBlockWriter::Write(const void* data, LLong size) noexcept
{
  if (size < 0)
    return false;
  const UChar* from = static_cast<const UChar*>(data);
  while (size > 0) {
    if ((count_ == 0 || lastFill_ == table_[count_ - 1].capacity) && !AddBlock())
      return false;
    const Block& block = table_[count_ - 1];
    LLong room = block.capacity - lastFill_;
    LLong part = size < room ? size : room;
    GeCopyFewBytes(block.data + lastFill_, from, part);
    lastFill_ += part;
    size_ += part;
    from += part;
    size -= part;
  }
  return true;
}

Bool MemoryBlockWriter::GetBlock(Long n, const void*& data, LLong& size) const noexcept
{
  if (n < 0 || n >= count_)
    return false;
  data = table_[n].data;
  size = n == count_ - 1 ? lastFill_ : table_[n].capacity;
  return true;
}

} // namespace _torvane_
