#include "torvane/values/ge_data.h"

#include <limits>

#include "torvane/links/alias.h"
#include "torvane/memory/assertion.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

constexpr const char* kModule = "k2v_file";
constexpr LLong kRawBlockSize = 16;

constexpr Vector kNoVector;
constexpr Matrix kNoMatrix;
constexpr BaseTime kNoTime;

// Old ids stand for current ones.
Long GetCurrentType(Long type)
{
  switch (type) {
  case kDataColorAlias:
    return kDataVector;
  case kDataStringAlias1:
  case kDataStringAlias2:
    return kDataString;
  case kDataBoolAlias:
    return kDataLong;
  default:
    return type;
  }
}

Long Truncate(Real value)
{
  constexpr Real kLowest = std::numeric_limits<Long>::min();
  constexpr Real kHighest = std::numeric_limits<Long>::max();
  if (value != value)
    return 0;
  if (value <= kLowest)
    return std::numeric_limits<Long>::min();
  return value >= kHighest ? std::numeric_limits<Long>::max() : static_cast<Long>(value);
}

} // namespace

// ---------------------------------------------------------------------------------------------------------------
// Making and freeing

template <class T, class... Args>
Bool GeData::Own(Long type, T* Payload::*member, Args&&... args)
{
  T* object = NewObj<T>(std::forward<Args>(args)...);
  if (!object)
    return false;
  payload_.*member = object;
  type_ = type;
  return true;
}

// Frees what was built in vain.
Bool GeData::Keep(Bool done)
{
  if (!done)
    Free();
  return done;
}

GeData::GeData(const Vector& value) { Own(kDataVector, &Payload::vector, value); }

GeData::GeData(const Matrix& value) { Own(kDataMatrix, &Payload::matrix, value); }

GeData::GeData(const BaseTime& value) { Own(kDataTime, &Payload::time, value); }

GeData::GeData(const String& value)
{
  Keep(Own(kDataString, &Payload::string, value) && payload_.string->GetLength() == value.GetLength());
}

GeData::GeData(const Filename& value)
{
  Keep(Own(kDataFilename, &Payload::filename, value) &&
       payload_.filename->GetString().GetLength() == value.GetString().GetLength());
}

GeData::GeData(const BaseContainer& value)
{
  Keep(Own(kDataContainer, &Payload::container) && value.CopyTo(*payload_.container, 0, nullptr));
}

GeData::GeData(const GeAliasLink& value)
{
  Keep(Own(kDataLink, &Payload::link) && value.CopyLinkTo(payload_.link, nullptr));
}

GeData::GeData(Long type, const CustomData& source)
{
  Keep(source.GetTypeId() == type && MakeCustom(type) && source.CopyTo(*payload_.custom, nullptr));
}

GeData& GeData::operator=(GeData&& other) noexcept
{
  Take(other);
  return *this;
}

// Moves the other value here. It may lie inside of this one.
void GeData::Take(GeData& other)
{
  if (this == &other)
    return;
  Long type = std::exchange(other.type_, kDataNil);
  Payload payload = other.payload_;
  Free();
  type_ = type;
  payload_ = payload;
}

void GeData::FreePayload()
{
  switch (type_) {
  case kDataTime:
    return DeleteObj(payload_.time);
  case kDataVector:
    return DeleteObj(payload_.vector);
  case kDataMatrix:
    return DeleteObj(payload_.matrix);
  case kDataString:
    return DeleteObj(payload_.string);
  case kDataFilename:
    return DeleteObj(payload_.filename);
  case kDataContainer:
    return DeleteObj(payload_.container);
  case kDataLink:
    return DeleteObj(payload_.link);
  case kDataRawBlock:
    return GeFree(payload_.block);
  case kDataUnknown:
    return DeleteObj(payload_.unknown);
  default:
    if (type_ >= kDataFirstCustom)
      DeleteObj(payload_.custom);
  }
}

Bool GeData::SetType(Long type)
{
  Free();
  type = GetCurrentType(type);
  switch (type) {
  case kDataTime:
    return Own(type, &Payload::time);
  case kDataVector:
    return Own(type, &Payload::vector);
  case kDataMatrix:
    return Own(type, &Payload::matrix);
  case kDataString:
    return Own(type, &Payload::string);
  case kDataFilename:
    return Own(type, &Payload::filename);
  case kDataContainer:
    return Own(type, &Payload::container);
  case kDataLink:
    return Own(type, &Payload::link);
  case kDataRawBlock:
    return BuildBlock(nullptr);
  case kDataUnknown:
    return Own(type, &Payload::unknown);
  default:
    if (type >= kDataFirstCustom)
      return MakeCustom(type);
  }
  type_ = type;
  if (OwnsPayload())
    ReportAssertion(kModule, __LINE__, "a value got a type that doesn't exist");
  if (type == kDataReal)
    payload_.real = 0.0;
  else if (type == kDataPointer)
    payload_.pointer = nullptr;
  else if (type == kDataLong)
    payload_.integer = 0;
  else
    payload_.wide = 0;
  return true;
}

Bool GeData::BuildBlock(const void* block)
{
  void* copy = GeAlloc(kRawBlockSize);
  if (!copy)
    return false;
  GeCopyMem(copy, block, kRawBlockSize);
  payload_.block = copy;
  type_ = kDataRawBlock;
  return true;
}

Bool GeData::MakeCustom(Long type)
{
  const CustomDataType* row = FindCustomDataType(type);
  CustomData* custom = row ? row->make(*row) : nullptr;
  if (!custom)
    return false;
  payload_.custom = custom;
  type_ = type;
  return true;
}

// ---------------------------------------------------------------------------------------------------------------
// Copying and comparing

Bool GeData::CopyFrom(const GeData& source, ULong flags, TransArray* translation)
{
  if (source.type_ == kDataLink && !translation)
    ReportAssertion(kModule, __LINE__, "a link was copied without a translation");
  return Assign(source, flags, translation);
}

// Copies without a report. The source may lie inside of this value, so it is copied before anything is freed.
Bool GeData::Assign(const GeData& source, ULong flags, TransArray* translation)
{
  if (this == &source)
    return true;
  if (!source.OwnsPayload()) {
    Long type = source.type_;
    Payload payload = source.payload_;
    Free();
    type_ = type;
    payload_ = payload;
    return true;
  }
  if (type_ == source.type_ && AssignInPlace(source))
    return true;
  GeData fresh;
  Bool done = fresh.Build(source, flags, translation);
  Take(fresh);
  return done;
}

// True if the value was stored in the object that is there.
Bool GeData::AssignInPlace(const GeData& source)
{
  switch (type_) {
  case kDataTime:
    *payload_.time = *source.payload_.time;
    return true;
  case kDataVector:
    *payload_.vector = *source.payload_.vector;
    return true;
  case kDataMatrix:
    *payload_.matrix = *source.payload_.matrix;
    return true;
  case kDataString:
    *payload_.string = *source.payload_.string;
    return payload_.string->GetLength() == source.payload_.string->GetLength();
  case kDataFilename:
    *payload_.filename = *source.payload_.filename;
    return payload_.filename->GetString().GetLength() == source.payload_.filename->GetString().GetLength();
  default:
    return false;
  }
}

// Makes this nil value a copy of a source with a payload. False when memory is short: the value stays nil.
Bool GeData::Build(const GeData& source, ULong flags, TransArray* translation)
{
  const Payload& from = source.payload_;
  switch (source.type_) {
  case kDataTime:
    return Own(kDataTime, &Payload::time, *from.time);
  case kDataVector:
    return Own(kDataVector, &Payload::vector, *from.vector);
  case kDataMatrix:
    return Own(kDataMatrix, &Payload::matrix, *from.matrix);
  case kDataString:
    return Keep(Own(kDataString, &Payload::string) && AssignInPlace(source));
  case kDataFilename:
    return Keep(Own(kDataFilename, &Payload::filename) && AssignInPlace(source));
  case kDataContainer:
    return Keep(Own(kDataContainer, &Payload::container) &&
                from.container->CopyTo(*payload_.container, flags, translation));
  case kDataLink:
    return Keep(Own(kDataLink, &Payload::link) && from.link->CopyLinkTo(payload_.link, translation));
  case kDataRawBlock:
    return BuildBlock(from.block);
  case kDataUnknown:
    return BuildUnknown(*from.unknown);
  default:
    if (source.type_ >= kDataFirstCustom)
      return Keep(MakeCustom(source.type_) && from.custom->CopyTo(*payload_.custom, translation));
  }
  type_ = source.type_; // a type that doesn't exist: there is nothing else to copy
  return true;
}

Bool GeData::BuildUnknown(const UnknownRecord& source)
{
  if (!Own(kDataUnknown, &Payload::unknown))
    return false;
  UnknownRecord& copy = *payload_.unknown;
  copy.type = source.type;
  copy.level = source.level;
  copy.data = source.size > 0 ? GeAllocNC(source.size) : nullptr;
  if (source.size > 0 && !copy.data)
    return Keep(false);
  GeCopyMem(copy.data, source.data, source.size);
  copy.size = source.size;
  return true;
}

Bool GeData::IsEqual(const GeData& other) const
{
  const Payload& a = payload_;
  const Payload& b = other.payload_;
  if (type_ == kDataLong && other.type_ == kDataReal)
    return static_cast<Real>(a.integer) == b.real;
  if (type_ == kDataReal && other.type_ == kDataLong)
    return a.real == static_cast<Real>(b.integer);
  if (type_ != other.type_)
    return false;
  switch (type_) {
  case kDataNil:
    return true;
  case kDataPointer:
    return a.pointer == b.pointer;
  case kDataLong:
    return a.integer == b.integer;
  case kDataReal:
    return a.real == b.real;
  case kDataLLong:
    return a.wide == b.wide;
  case kDataTime:
    return *a.time == *b.time;
  case kDataVector:
    return *a.vector == *b.vector;
  case kDataMatrix:
    return *a.matrix == *b.matrix;
  case kDataFilename:
    return a.filename->IsEqual(*b.filename);
  case kDataContainer:
    return a.container->IsEqual(*b.container);
  case kDataLink:
    return a.link->IsEqual(*b.link);
  default: // Strings are among these
    return type_ >= kDataFirstCustom && a.custom->IsEqual(*b.custom);
  }
}

// ---------------------------------------------------------------------------------------------------------------
// Getters

void GeData::ReportWrongType() const
{
  if (GetType() != kDataNil)
    ReportAssertion(kModule, __LINE__, "a value was asked for as another type than its own");
}

template <class T>
const T& GeData::Get(Long type, T* Payload::*member, const T& neutral) const
{
  if (type_ == type)
    return *(payload_.*member);
  ReportWrongType();
  return neutral;
}

Long GeData::GetLong() const
{
  if (type_ == kDataLong)
    return payload_.integer;
  if (type_ == kDataReal)
    return Truncate(payload_.real);
  ReportWrongType();
  return 0;
}

Real GeData::GetReal() const
{
  if (type_ == kDataReal)
    return payload_.real;
  if (type_ == kDataLong)
    return payload_.integer;
  ReportWrongType();
  return 0.0;
}

LLong GeData::GetLLong() const
{
  if (type_ == kDataLLong)
    return payload_.wide;
  ReportWrongType();
  return 0;
}

void* GeData::GetPointer() const
{
  if (type_ == kDataPointer)
    return payload_.pointer;
  ReportWrongType();
  return nullptr;
}

BaseContainer* GeData::GetContainer() const
{
  if (type_ == kDataContainer)
    return payload_.container;
  ReportWrongType();
  return nullptr;
}

const Vector& GeData::GetVector() const { return Get(kDataVector, &Payload::vector, kNoVector); }

const Matrix& GeData::GetMatrix() const { return Get(kDataMatrix, &Payload::matrix, kNoMatrix); }

const BaseTime& GeData::GetTime() const { return Get(kDataTime, &Payload::time, kNoTime); }

const String& GeData::GetString() const
{
  static const String kNoText;
  return Get(kDataString, &Payload::string, kNoText);
}

const Filename& GeData::GetFilename() const
{
  static const Filename kNoName;
  return Get(kDataFilename, &Payload::filename, kNoName);
}

GeAliasLink* GeData::GetAliasLink() const { return type_ == kDataLink ? payload_.link : nullptr; }

GeListNode* GeData::GetLink() const { return type_ == kDataLink ? payload_.link->GetLink() : nullptr; }

CustomData* GeData::GetCustomDataType(Long type) const
{
  return type_ == type && type_ >= kDataFirstCustom ? payload_.custom : nullptr;
}

} // namespace _torvane_
