#include "torvane/tags/value_tags.h"

#include "k2v_file/stream/chunk_visitor.h"
#include "k2v_file/stream/value_forms.h"

namespace _torvane_
{

namespace
{

// An array of floats may stand for one of doubles.
constexpr ColumnLayout kPointLayout = {kArrayReal, 3, sizeof(Real), sizeof(Vector), 1, 3 * sizeof(SReal)};
constexpr ColumnLayout kPolygonLayout = {kArrayLong, 4, sizeof(Long), sizeof(PolygonCorners), 1, 4 * sizeof(Long)};
constexpr ColumnLayout kVertexMapLayout = {kArraySReal, 1, 0, sizeof(SReal), 1, sizeof(SReal)};
constexpr ColumnLayout kNormalLayout = {kArrayWord, 1, 0, sizeof(Word), 12, 12 * sizeof(Word)};

Word PackNormalComponent(Real component)
{
  const Real scaled = component * kNormalScale;
  if (!(scaled > INT16_MIN)) // a NaN too
    return scaled == scaled ? INT16_MIN : 0;
  return scaled < INT16_MAX ? static_cast<Word>(scaled) : INT16_MAX;
}

} // namespace

BaseArrayTag::~BaseArrayTag() { FreeEntries(); }

const void* BaseArrayTag::GetEntryBytes(LLong& size) const
{
  size = count_ * entrySize_;
  return block_;
}

Bool BaseArrayTag::ResizeTagArray(Long count)
{
  if (count < 0)
    return false;
  const LLong size = count * entrySize_;
  void* block = count > count_ ? GeAlloc(size) : GeAllocNC(size);
  if (!block && count > 0)
    return false;
  GeCopyMem(block, block_, (count < count_ ? count : count_) * entrySize_);
  AdoptEntries(block, count);
  return true;
}

void BaseArrayTag::AdoptEntries(void* block, LLong count)
{
  GeFree(block_);
  block_ = block;
  count_ = static_cast<Long>(count);
  if (count == 0)
    GeFree(block_);
}

Bool BaseArrayTag::MakeEntries(HyperFile& file, LLong count, LLong leastSize, void*& block) const
{
  block = nullptr;
  if (!file.HasRoomFor(count, leastSize))
    return false;
  block = GeAlloc(count * entrySize_);
  if (!block && count > 0)
    file.SetError(FILEERROR_MEMORY);
  return block || count == 0;
}

Bool BaseArrayTag::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseTag::ReadChunk(file, id, level))
    return true;
  return id == GetType() && (level < 0 || ReadEntries(file, level)) && file.SkipToEndChunk();
}

void BaseArrayTag::WriteChunks(HyperFile& file)
{
  BaseTag::WriteChunks(file);
  WriteChunk(file, GetType(), GetEntriesLevel(), [&](ChunkWriter&) { WriteEntries(file); });
}

Bool BaseArrayTag::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<BaseArrayTag>(&destination);
  if (!target)
    return false;
  return target == this || (BaseTag::CopyTo(*target, flags, translation) && CopyEntries(*target));
}

Bool BaseArrayTag::CopyEntries(BaseArrayTag& target)
{
  if (!target.ResizeTagArray(count_))
    return false;
  GeCopyMem(target.block_, block_, count_ * entrySize_);
  return true;
}

Bool BaseArrayTag::CopyEntriesAfresh(BaseArrayTag& target)
{
  target.FreeEntries();
  return !block_ || BaseArrayTag::CopyEntries(target);
}

Bool BaseArrayTag::CopyEntriesOntoEmpty(BaseArrayTag& target)
{
  if (!block_ && !target.block_)
    return true;
  const Long count = count_;
  if (target.block_)
    FreeEntries();
  target.FreeEntries();
  if (!target.ResizeTagArray(count))
    return false;
  GeCopyMem(target.block_, block_, count_ * entrySize_);
  return block_ != nullptr;
}

// ---------------------------------------------------------------------------------------------------------------

namespace
{

template <class Visitor>
Bool VisitColumns(Visitor& v, const ColumnLayout& layout, void* block, LLong count)
{
  const auto& [type, columns, step, stride, perEntry, least] = layout;
  const LLong elements = count * perEntry;
  if constexpr (Visitor::kReading)
    v.Note(v.File().ReadColumns(block, type, stride, elements, columns, step));
  else
    v.Note(v.Good() && v.File().WriteColumns(block, type, stride, elements, columns, step));
  return v.Good();
}

} // namespace

Bool ColumnTag::ReadEntries(HyperFile& file, Long level)
{
  ChunkReader reader(file, level);
  if (reader.VersionBelow(kVersionColumns))
    return ReadOldEntries(file);
  Long count = 0;
  void* block = nullptr;
  if (!reader.Long(count) || count <= 0)
    return reader.Good();
  if (!MakeEntries(file, count, layout_.leastEntrySize, block))
    return false;
  if (VisitColumns(reader, layout_, block, count))
    AdoptEntries(block, count);
  else
    GeFree(block);
  return reader.Good();
}

void ColumnTag::WriteEntries(HyperFile& file)
{
  ChunkWriter writer(file, GetEntriesLevel());
  if (writer.Long(count_) && count_ > 0)
    VisitColumns(writer, layout_, block_, count_);
}

// ---------------------------------------------------------------------------------------------------------------

PointTag::PointTag() : ArrayTag(kTagPoint, kPointLayout) {}

Bool PointTag::ReadOldEntries(HyperFile& file)
{
  Vector* points = nullptr;
  LLong count = 0;
  if (!file.ReadLegacyPointArray(points, count))
    return false;
  AdoptEntries(points, count);
  return true;
}

PolygonTag::PolygonTag() : ArrayTag(kTagPolygon, kPolygonLayout) {}

Bool PolygonTag::ResizeTagArray(Long count) { return count < 1 || ColumnTag::ResizeTagArray(count); }

Bool PolygonTag::ReadOldEntries(HyperFile& file)
{
  FreeEntries();
  LegacyPolygon* polygons = nullptr;
  LLong count = 0;
  if (!file.ReadLegacyPolygonArray(polygons, count))
    return false;
  AdoptEntries(polygons, count);
  return true;
}

VertexMapTag::VertexMapTag(Long type) : ArrayTag(type, kVertexMapLayout) {}

Bool VertexMapTag::ReadOldEntries(HyperFile& file)
{
  if (GetType() == kTagOldVertexMap)
    return true;
  String name;
  SReal* weights = nullptr;
  LLong count = 0;
  if (!file.ReadString(name))
    return false;
  if (file.GetFileVersion() < kVersionNodeHeader)
    name_ = name;
  if (!file.ReadLegacyFloatArray(weights, count))
    return false;
  AdoptEntries(weights, count);
  return true;
}

NormalTag::NormalTag() : ArrayTag(kTagNormal, kNormalLayout) {}

Bool NormalTag::ReadOldEntries(HyperFile& file)
{
  UWord* words = nullptr;
  LLong count = 0;
  if (!file.ReadLegacyWordArray(words, count))
    return false;
  AdoptEntries(words, count / kNormalLayout.elementsPerEntry);
  return true;
}

Bool NormalTag::ReadPolygonNormals(Long index, Vector (&quad)[4]) const
{
  if (index < 0 || index >= count_)
    return false;
  const Word* component = GetArray()[index].components;
  for (Vector& normal : quad) {
    normal = {component[0] / kNormalScale, component[1] / kNormalScale, component[2] / kNormalScale};
    component += 3;
  }
  return true;
}

Bool NormalTag::WritePolygonNormals(Long index, const Vector (&quad)[4])
{
  if (index < 0 || index >= count_)
    return false;
  Word* component = GetArray()[index].components;
  for (const Vector& normal : quad) {
    for (Real part : {normal.x, normal.y, normal.z})
      *component++ = PackNormalComponent(part);
  }
  return true;
}

// ---------------------------------------------------------------------------------------------------------------

namespace
{

constexpr LLong LeastSize(const SplineSegment*) { return LeastStoredSize(kTagLong, kTagBool); }
constexpr LLong LeastSize(const TangentPair*) { return LeastStoredSize(kTagVector, kTagVector); }

template <class Visitor>
void VisitEntry(Visitor& v, SplineSegment& segment)
{
  v.Long(segment.points);
  v.Bool(segment.closed);
}

template <class Visitor>
void VisitEntry(Visitor& v, TangentPair& pair)
{
  v.Vector(pair.left);
  v.Vector(pair.right);
}

template <class Visitor, class Entry>
Bool VisitRows(Visitor& v, Entry* entries, Long count)
{
  for (Long i = 0; v.Good() && i < count; ++i)
    VisitEntry(v, entries[i]);
  return v.Good();
}

} // namespace

template <class Entry>
Bool RowTag<Entry>::ReadEntries(HyperFile& file, Long level)
{
  Long count = 0;
  void* block = nullptr;
  if (!file.ReadLong(count) || !this->MakeEntries(file, count, LeastSize(this->GetArray()), block))
    return false;
  this->AdoptEntries(block, count);
  ChunkReader reader(file, level);
  return VisitRows(reader, this->GetArray(), count);
}

template <class Entry>
void RowTag<Entry>::WriteEntries(HyperFile& file)
{
  ChunkWriter writer(file, this->GetEntriesLevel());
  writer.Long(this->count_);
  VisitRows(writer, this->GetArray(), this->count_);
}

template class RowTag<SplineSegment>;
template class RowTag<TangentPair>;

SegmentTag::SegmentTag() : RowTag(kTagSegment) {}

// What can't be read leaves a tag without segments.
Bool SegmentTag::ReadEntries(HyperFile& file, Long level)
{
  FreeEntries();
  return RowTag::ReadEntries(file, level);
}

Bool SegmentTag::ResizeTagArray(Long count)
{
  if (count < 1 && count_ < 1)
    return false;
  return count == -1 || BaseArrayTag::ResizeTagArray(count);
}

TangentTag::TangentTag() : RowTag(kTagTangent) {}

Bool TangentTag::ReplaceTagArray(Long count)
{
  if (count < 0)
    return false;
  void* block = GeAlloc(count * entrySize_);
  if (!block && count > 0)
    return false;
  AdoptEntries(block, count);
  return true;
}

} // namespace _torvane_
