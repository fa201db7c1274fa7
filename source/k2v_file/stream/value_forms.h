// The form of each tagged value: the one place that knows what stands behind a tag, and how many bytes. Skipping, the
// walker, the conversion of kept bytes and the sizes of records all go by this table.
#pragma once

#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

// What a body consists of.
enum class ValuePart : UChar
{
  kNone,
  kSigned,
  kUnsigned,
  kReal,   // a double, in single-precision files a float
  kFloat,  // a float everywhere
  kDouble, // a double everywhere
  kText,   // UTF-16 behind a length in bytes
  kBlock,  // bytes behind a length
};

struct ValueForm
{
  UChar tag;
  const char* name;
  ValuePart part;
  UChar count; // of parts; 0 for a body that begins with a length
  UChar size;  // bytes of a part, of a Real in double precision; bytes of the length
};

inline constexpr ValueForm kValueForms[] = {
    {kTagChunkStart, "chunk", ValuePart::kSigned, 2, 4},
    {kTagChunkEnd, "end", ValuePart::kNone, 1, 0},
    {kTagChar, "Char", ValuePart::kSigned, 1, 1},
    {kTagUChar, "UChar", ValuePart::kUnsigned, 1, 1},
    {kTagWord, "Word", ValuePart::kSigned, 1, 2},
    {kTagUWord, "UWord", ValuePart::kUnsigned, 1, 2},
    {kTagLong, "Long", ValuePart::kSigned, 1, 4},
    {kTagULong, "ULong", ValuePart::kUnsigned, 1, 4},
    {kTagLLong, "LLong", ValuePart::kSigned, 1, 8},
    {kTagULLong, "ULLong", ValuePart::kUnsigned, 1, 8},
    {kTagReal, "Real", ValuePart::kReal, 1, 8},
    {kTagLReal, "LReal", ValuePart::kDouble, 1, 8},
    {kTagBool, "Bool", ValuePart::kUnsigned, 1, 1},
    {kTagTime, "Time", ValuePart::kReal, 2, 8},
    {kTagVector, "Vector", ValuePart::kReal, 3, 8},
    {kTagLVector, "LVector", ValuePart::kDouble, 3, 8},
    {kTagMatrix, "Matrix", ValuePart::kReal, 12, 8},
    {kTagLMatrix, "LMatrix", ValuePart::kDouble, 12, 8},
    {kTagSVector, "SVector", ValuePart::kFloat, 3, 4},
    {kTagSMatrix, "SMatrix", ValuePart::kFloat, 12, 4},
    {kTagSReal, "SReal", ValuePart::kFloat, 1, 4},
    {kTagMemory, "Memory", ValuePart::kBlock, 0, 4},
    {kTagImage, "Image", ValuePart::kBlock, 0, 4},
    {kTagString, "String", ValuePart::kText, 0, 4},
    {kTagFilename, "Filename", ValuePart::kText, 0, 4},
    {kTagLegacyContainer, "old container", ValuePart::kBlock, 0, 4},
    {kTagLegacyPointArray, "old points", ValuePart::kBlock, 0, 4},
    {kTagLegacyPolygonArray, "old polygons", ValuePart::kBlock, 0, 4},
    {kTagLegacyWordArray, "old words", ValuePart::kBlock, 0, 4},
    {kTagLegacyArray, "old array", ValuePart::kBlock, 0, 4},
    {kTagLegacyFloatArray, "old floats", ValuePart::kBlock, 0, 4},
    {kTagReserved, "reserved", ValuePart::kBlock, 0, 4},
    {kTagLargeMemory, "Memory", ValuePart::kBlock, 0, 8},
    {kTagArray, "Array", ValuePart::kBlock, 0, 4},
};

inline constexpr LLong kTagSize = 1;
inline constexpr LLong kLargestValueParts = 12;

namespace detail
{

// The rows by tag.
struct ValueFormIndex
{
  const ValueForm* rows[256];

  constexpr ValueFormIndex() : rows()
  {
    for (const ValueForm& form : kValueForms)
      rows[form.tag] = &form;
  }
};

inline constexpr ValueFormIndex kValueFormIndex;

} // namespace detail

// Null for a byte that no value begins with.
constexpr const ValueForm* FindValueForm(UChar tag) { return detail::kValueFormIndex.rows[tag]; }

// How a file lays out its values.
struct FileForm
{
  Long version;
  Bool singlePrecision;
};

inline FileForm FormOf(const HyperFile& file) { return {file.GetFileVersion(), file.IsSinglePrecision()}; }

// The form of what is written now.
inline constexpr FileForm kCurrentForm{kVersionCurrent, false};

// The type that closes a legacy container, where an entry's would stand.
inline constexpr UChar kLegacyEnd = 3;

inline constexpr LLong kLargestValueHead = 8;

// The bytes behind the tag that tell how long the body is: 0 for a body of a fixed size.
constexpr LLong GetValueHeadSize(const ValueForm& form, const FileForm& file)
{
  if (form.count != 0)
    return 0;
  return form.tag == kTagArray && file.version < kVersionArrayOrder ? 1 + form.size : form.size;
}

// True for an Array of the older order. Its first byte is the element type; the length of a newer one begins with 0.
constexpr Bool IsOldArray(const ValueForm& form, const FileForm& file, const UChar* head)
{
  return form.tag == kTagArray && file.version < kVersionArrayOrder && head[0] >= kArrayByte && head[0] <= kArrayReal;
}

// All bytes behind the tag. `head` holds GetValueHeadSize bytes of them and isn't looked at when there are none.
// Negative for a length that no file can have.
constexpr LLong GetValueBodySize(const ValueForm& form, const FileForm& file, const UChar* head)
{
  if (form.count != 0)
    return form.count * (form.part == ValuePart::kReal && file.singlePrecision ? form.size / 2 : form.size);
  if (!head)
    return -1;
  if (form.size == sizeof(LLong)) {
    const auto length = static_cast<LLong>(bytes::GetBig<ULLong>(head));
    return length < 0 || length > INT64_MAX - form.size ? -1 : form.size + length;
  }
  if (IsOldArray(form, file, head))
    return 1 + form.size + static_cast<LLong>(bytes::GetBig<ULong>(head + 1));
  LLong length = bytes::GetBig<ULong>(head);
  // Some old arrays are counted by the size of a single-precision element although they hold others.
  if (file.version < kVersionColumns && !file.singlePrecision) {
    if (form.tag == kTagLegacyPointArray)
      length *= 2;
    else if (form.tag == kTagLegacyArray)
      length = length / 44 * 84;
  }
  return form.size + length;
}

// True for an entry of an old container whose value stands behind its type as anywhere else, with its tag, which is the
// type's number.
constexpr Bool IsTaggedLegacyEntry(UChar type)
{
  for (const UChar each : {kTagLong, kTagReal, kTagTime, kTagVector, kTagMatrix, kTagString, kTagFilename}) {
    if (each == type)
      return true;
  }
  return false;
}

// The form that skipping goes by. It takes the length of a large memory block for one of 32 bits, so that such a block
// can't be passed over.
constexpr const ValueForm* FindSkippedForm(UChar tag)
{
  return FindValueForm(tag == kTagLargeMemory ? static_cast<UChar>(kTagMemory) : tag);
}

// The bytes of values of these tags in a row, tags included, with nothing in those that have a length.
template <class... Tags>
constexpr LLong SizeOfValues(const FileForm& file, Tags... tags)
{
  constexpr UChar kEmpty[kLargestValueHead] = {};
  return ((kTagSize + GetValueBodySize(*FindValueForm(tags), file, kEmpty)) + ... + LLong{0});
}

// The bytes as they are written now.
template <class... Tags>
constexpr LLong StoredSize(Tags... tags)
{
  return SizeOfValues(kCurrentForm, tags...);
}

// The least bytes in a file of either precision.
template <class... Tags>
constexpr LLong LeastStoredSize(Tags... tags)
{
  return SizeOfValues(FileForm{kVersionCurrent, true}, tags...);
}

} // namespace _torvane_
