#include "torvane/values/parameter_path.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "torvane/ids.h"
#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

namespace
{

constexpr ParameterLevel kNoLevel;

template <class Visitor, class Level>
Bool VisitLevel(Visitor& v, Level& level)
{
  v.Long(level.id);
  v.Long(level.dtype);
  if (v.Level() >= 2)
    v.Long(level.creator);
  return v.Good();
}

} // namespace

ParameterPath::ParameterPath(ParameterLevel first) : inline_{first}, count_(1) {}

ParameterPath::ParameterPath(ParameterLevel first, ParameterLevel second) : inline_{first, second}, count_(2) {}

ParameterPath::ParameterPath(ParameterLevel first, ParameterLevel second, ParameterLevel third)
    : inline_{first, second, third}, count_(3)
{}

ParameterPath::ParameterPath(const ParameterPath& other) { *this = other; }

ParameterPath::ParameterPath(ParameterPath&& other) noexcept { *this = std::move(other); }

ParameterPath& ParameterPath::operator=(const ParameterPath& other)
{
  if (this == &other)
    return *this;
  ParameterLevel* levels = LevelsForWriting(other.count_);
  count_ = levels ? other.count_ : 0;
  for (Long i = 0; i < count_; ++i)
    levels[i] = other[i];
  return *this;
}

ParameterPath& ParameterPath::operator=(ParameterPath&& other) noexcept
{
  if (this == &other)
    return *this;
  GeFree(heap_);
  for (Long i = 0; i < kInline; ++i)
    inline_[i] = other.inline_[i];
  heap_ = std::exchange(other.heap_, nullptr);
  count_ = std::exchange(other.count_, 0);
  capacity_ = std::exchange(other.capacity_, kInline);
  return *this;
}

ParameterPath::~ParameterPath() { GeFree(heap_); }

const ParameterLevel& ParameterPath::operator[](Long index) const
{
  if (index == -1) {
    Long last = count_ - 1;
    while (last > 0 && Levels()[last].id == 0)
      --last;
    index = last < 0 ? 0 : last;
  }
  return index >= 0 && index < count_ ? Levels()[index] : kNoLevel;
}

Long ParameterPath::GetLevelCount() const
{
  Long levels = 0;
  while (levels < count_ && Levels()[levels].id != 0)
    ++levels;
  return levels;
}

// Room for `count` levels; those that are stored stay. Null when memory is short.
ParameterLevel* ParameterPath::LevelsForWriting(Long count)
{
  if (count <= capacity_)
    return Levels();
  Long capacity = count <= capacity_ * 2 ? capacity_ * 2 : count;
  auto* grown = static_cast<ParameterLevel*>(
      GeAllocNC(static_cast<LLong>(capacity) * static_cast<LLong>(sizeof(ParameterLevel))));
  if (!grown)
    return nullptr;
  GeCopyMem(grown, Levels(), static_cast<LLong>(count_) * static_cast<LLong>(sizeof(ParameterLevel)));
  GeFree(heap_);
  heap_ = grown;
  capacity_ = capacity;
  return grown;
}

Bool ParameterPath::Append(const ParameterLevel& level)
{
  ParameterLevel copy = level; // it may be one of this path's own
  if (count_ >= kMaxLevels)
    return false;
  ParameterLevel* levels = LevelsForWriting(count_ + 1);
  if (!levels)
    return false;
  levels[count_++] = copy;
  return true;
}

void ParameterPath::Clear()
{
  GeFree(heap_);
  count_ = 0;
  capacity_ = kInline;
}

ParameterPath ParameterPath::WithoutFirst(Long count) const
{
  ParameterPath rest;
  for (Long i = count < 0 ? 0 : count; i < count_; ++i) {
    if (!rest.Append((*this)[i]))
      return ParameterPath();
  }
  return rest;
}

Bool ParameterPath::operator==(const ParameterPath& other) const
{
  for (Long i = 0;; ++i) {
    if (!(*this)[i].Matches(other[i]))
      return false;
    if (other[i].id == 0)
      return true;
  }
}

Bool ParameterPath::IsExactly(const ParameterPath& other) const
{
  for (Long i = 0;; ++i) {
    if (!((*this)[i] == other[i]))
      return false;
    if (other[i].id == 0)
      return true;
  }
}

Bool ParameterPath::Write(HyperFile& file) const
{
  return WriteChunk(file, kChunkParameterPath, kLevelParameterPath, [this](ChunkWriter& writer) {
    writer.Long(count_);
    for (Long i = 0; i < count_; ++i)
      VisitLevel(writer, Levels()[i]);
  });
}

Bool ParameterPath::Read(HyperFile& file)
{
  Clear();
  Long id = 0;
  Long level = 0;
  if (!file.ExpectTag(kTagChunkStart) || !file.ReadChunkStart(id, level) || id != kChunkParameterPath || level < 0)
    return false;
  return ReadChunkBody(file, level, [this](ChunkReader& reader) {
    Long count = 0;
    if (reader.Level() >= 1)
      reader.Long(count);
    // The room grows with what is read: the count is not trusted.
    for (Long i = 0; i < count && reader.Good(); ++i) {
      ParameterLevel next;
      if (VisitLevel(reader, next) && !reader.Note(Append(next)))
        reader.File().SetError(FILEERROR_MEMORY);
    }
  });
}

} // namespace _torvane_
