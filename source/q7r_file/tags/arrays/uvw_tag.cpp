// Texture coordinates: their packing, and the layouts of a tag that holds them.
#include <cstring>

#include "k2v_file/stream/chunk_visitor.h"
#include "torvane/memory/owned.h"
#include "torvane/tags/value_tags.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

namespace
{

constexpr Long kLevelUVW = 3;
constexpr Long kLevelPoints = 1;    // in old files: Vectors in place of words
constexpr Long kLevelFloats = 2;    // in files of the old layout's successor: a legacy array of floats
constexpr Long kLevelParameter = 2; // the parameter stands behind the array

constexpr Long kWordsPerQuad = 8;
constexpr Long kOldWordsPerQuad = 12;

constexpr Real kUVWLimit = 100000.0;

// A float: sign, 8 bits of exponent, 23 of mantissa. The packed form has room for 5 and 15 of them.
constexpr ULong kExponentShift = 23;
constexpr ULong kExponentBias = 112; // between the exponent fields of the two
constexpr ULong kExponentLimit = 31;
constexpr ULong kDroppedBits = 8; // of the mantissa
constexpr ULong kMantissaMask = 0x7FFF;
constexpr ULong kSignMask = 0x8000;
constexpr ULong kThreeComponents = 1; // lowest bit of word1

ULong FloatBits(Real value)
{
  const Real clamped = value > kUVWLimit ? kUVWLimit : value < -kUVWLimit ? -kUVWLimit : value;
  const SReal narrow = static_cast<SReal>(value == value ? clamped : 0.0);
  ULong bits = 0;
  std::memcpy(&bits, &narrow, sizeof bits);
  return bits;
}

Real FromFloatBits(ULong bits)
{
  SReal value = 0;
  std::memcpy(&value, &bits, sizeof value);
  return value;
}

ULong SignAndMantissa(ULong bits) { return (bits >> 16 & kSignMask) | (bits >> kDroppedBits & kMantissaMask); }

ULong PackedExponent(ULong bits)
{
  const ULong field = bits >> kExponentShift & 0xFF;
  if (field <= kExponentBias)
    return 0;
  return field - kExponentBias < kExponentLimit ? field - kExponentBias : kExponentLimit;
}

Real FromParts(ULong signAndMantissa, ULong exponent)
{
  return FromFloatBits((signAndMantissa & kSignMask) << 16 |
                       ((exponent & kExponentLimit) + kExponentBias) << kExponentShift |
                       (signAndMantissa & kMantissaMask) << kDroppedBits);
}

// The coordinates of old files: 13 bits of magnitude, two that choose the factor, a sign.
Real FromOldWord(UWord word)
{
  constexpr Real kFactors[] = {0.0002, 0.002, 0.02, 0.2};
  const Real magnitude = (word & 0x1FFF) * kFactors[word >> 13 & 3];
  return (word & 0x8000) != 0 ? -magnitude : magnitude;
}

} // namespace

PackedUVW PackUVW(const Vector& uvw)
{
  const ULong u = FloatBits(uvw.x);
  const ULong v = FloatBits(uvw.y);
  if (uvw.z == 0.0)
    return {u, v & ~kThreeComponents};
  const ULong w = FloatBits(uvw.z);
  return {SignAndMantissa(u) << 16 | SignAndMantissa(v), SignAndMantissa(w) << 16 | PackedExponent(u) << 11 |
                                                             PackedExponent(v) << 6 | PackedExponent(w) << 1 |
                                                             kThreeComponents};
}

Vector UnpackUVW(const PackedUVW& packed)
{
  if ((packed.word1 & kThreeComponents) == 0)
    return {FromFloatBits(packed.word0), FromFloatBits(packed.word1), 0.0};
  return {FromParts(packed.word0 >> 16, packed.word1 >> 11), FromParts(packed.word0, packed.word1 >> 6),
          FromParts(packed.word1 >> 16, packed.word1 >> 1)};
}

// ---------------------------------------------------------------------------------------------------------------

UVWTag::UVWTag() : ArrayTag(kTagUVW) {}

Bool UVWTag::ReadPolygonUVW(Long index, Vector (&quad)[4]) const
{
  if (index < 0 || index >= count_)
    return false;
  const PackedUVW* corner = GetArray()[index].corners;
  for (Vector& uvw : quad)
    uvw = UnpackUVW(*corner++);
  return true;
}

Bool UVWTag::WritePolygonUVW(Long index, const Vector (&quad)[4])
{
  if (index < 0 || index >= count_)
    return false;
  PackedUVW* corner = GetArray()[index].corners;
  for (const Vector& uvw : quad)
    *corner++ = PackUVW(uvw);
  return true;
}

Bool UVWTag::GetParameter(const ParameterPath& path, GeData& value)
{
  if (path[0].id != kUVWParameter)
    return BaseArrayTag::GetParameter(path, value);
  value = GeData(parameter_);
  return true;
}

Bool UVWTag::SetParameter(const ParameterPath& path, const GeData& value)
{
  if (path[0].id != kUVWParameter)
    return BaseArrayTag::SetParameter(path, value);
  parameter_ = value.GetLong();
  return true;
}

Bool UVWTag::CopyEntries(BaseArrayTag& target)
{
  auto* coordinates = NodeCast<UVWTag>(&target);
  if (!coordinates)
    return false;
  coordinates->parameter_ = parameter_;
  if (!block_ && !coordinates->block_)
    return true;
  return BaseArrayTag::CopyEntries(target) && block_ && coordinates->block_;
}

// ---------------------------------------------------------------------------------------------------------------

Long UVWTag::GetEntriesLevel() const { return kLevelUVW; }

Bool UVWTag::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (!BaseArrayTag::ReadChunk(file, id, level))
    return false;
  if (id == kChunkNodeHeader && !name_.Content())
    name_ = "UVW";
  return true;
}

template <>
struct ChunkFields<UVWTag>
{
  template <class Visitor>
  static Bool VisitEntries(UVWTag& tag, Visitor& v)
  {
    Long count = tag.count_;
    if (!v.Long(count))
      return false;
    if constexpr (Visitor::kReading) {
      void* block = nullptr;
      if (!tag.MakeEntries(v.File(), count, sizeof(PackedUVWQuad), block))
        return false;
      if (v.Note(v.File().ReadArray(block, kArrayLong, sizeof(ULong), LLong{count} * kWordsPerQuad)))
        tag.AdoptEntries(block, count);
      else
        GeFree(block);
    } else {
      v.Note(v.File().WriteArray(tag.block_, kArrayLong, sizeof(ULong), LLong{count} * kWordsPerQuad));
    }
    return v.Good() && (v.Level() < kLevelParameter || v.Bool(tag.parameter_));
  }
};

void UVWTag::WriteEntries(HyperFile& file)
{
  ChunkWriter writer(file, kLevelUVW);
  ChunkFields<UVWTag>::VisitEntries(*this, writer);
}

Bool UVWTag::ReadEntries(HyperFile& file, Long level)
{
  ChunkReader reader(file, level);
  if (file.IsBefore11600())
    return ReadOldEntries(file, level) && (level < kLevelParameter || reader.Bool(parameter_));
  if (level == kLevelFloats)
    return ReadFloatEntries(file) && reader.Bool(parameter_);
  const Bool read = ChunkFields<UVWTag>::VisitEntries(*this, reader);
  if (!read)
    file.SetError(FILEERROR_MEMORY);
  return read;
}

// `cornerAt` gives the coordinate of corner n, counted through all quads.
template <class CornerAt>
Bool UVWTag::FillEntries(HyperFile& file, LLong quads, const CornerAt& cornerAt)
{
  void* block = nullptr;
  if (!MakeEntries(file, quads, 0, block))
    return false;
  AdoptEntries(block, quads);
  for (LLong i = 0; i < quads; ++i) {
    for (LLong corner = 0; corner < 4; ++corner)
      GetArray()[i].corners[corner] = cornerAt(i * 4 + corner);
  }
  return true;
}

// Old files hold words; from the second level on Vectors follow, which then are what counts.
Bool UVWTag::ReadOldEntries(HyperFile& file, Long level)
{
  FreeEntries();
  UWord* words = nullptr;
  LLong count = 0;
  if (!file.ReadLegacyWordArray(words, count))
    return false;
  const Owned<UWord> owned(words);
  if (level >= kLevelPoints)
    return ReadPointEntries(file);
  return FillEntries(file, count / kOldWordsPerQuad, [words](LLong i) {
    const UWord* word = words + i * 3;
    return PackUVW({FromOldWord(word[0]), FromOldWord(word[1]), FromOldWord(word[2])});
  });
}

Bool UVWTag::ReadPointEntries(HyperFile& file)
{
  Vector* points = nullptr;
  LLong count = 0;
  if (!file.ReadLegacyPointArray(points, count))
    return false;
  const Owned<Vector> owned(points);
  return FillEntries(file, count / 4, [points](LLong i) { return PackUVW(points[i]); });
}

// The words of a legacy array of floats as they stand in the file: few of them are numbers, and a cleaned one would be
// another coordinate.
Bool UVWTag::ReadFloatEntries(HyperFile& file)
{
  void* head = nullptr;
  void* words = nullptr;
  if (!file.ExpectTag(kTagLegacyFloatArray) || !file.ReadBlock(head, sizeof(ULong)))
    return false;
  const LLong size = bytes::GetBig<ULong>(static_cast<UChar*>(head));
  GeFree(head);
  if (!file.ReadBlock(words, size))
    return false;
  const Owned<void> owned(words);
  return FillEntries(file, size / static_cast<LLong>(sizeof(PackedUVWQuad)), [words](LLong i) {
    const UChar* place = static_cast<UChar*>(words) + i * static_cast<LLong>(sizeof(PackedUVW));
    return PackedUVW{bytes::GetBig<ULong>(place), bytes::GetBig<ULong>(place + sizeof(ULong))};
  });
}

} // namespace _torvane_
