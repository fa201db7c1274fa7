#include "torvane/values/ge_data.h"

#include <limits>

#include "k2v_file/values/value_kinds.h"
#include "torvane/links/alias.h"
#include "torvane/memory/assertion.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

constexpr const char* kModule = "k2v_file";

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
  Keep(Make(Kind::Of(kDataLink), kDataLink) && value.CopyLinkTo(LinkInPayload(), nullptr));
}

GeData::GeData(Long type, const CustomData& source)
{
  Keep(source.GetTypeId() == type && Make(Kind::Of(type), type) && source.CopyTo(*payload_.custom, nullptr));
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
  if (const auto free = Kind::Of(type_).free)
    free(payload_);
}

Bool GeData::SetType(Long type)
{
  Free();
  type = GetCurrentType(type);
  return Make(Kind::Of(type), type);
}

// Gives this nil value an empty payload; it stays nil when that fails.
Bool GeData::Make(const Kind& kind, Long type)
{
  if (!kind.make(payload_, type))
    return false;
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
  const Kind& kind = Kind::Of(type_);
  if (type_ == source.type_ && kind.isCopiedInPlace && kind.copy(payload_, source.payload_, flags, translation))
    return true;
  GeData fresh;
  Bool done = fresh.Build(source, flags, translation);
  Take(fresh);
  return done;
}

// Makes this nil value a copy of a source with a payload. False when memory is short: the value stays nil.
Bool GeData::Build(const GeData& source, ULong flags, TransArray* translation)
{
  const Kind& kind = Kind::Of(source.type_);
  if (kind.free) // else a type that doesn't exist: there is nothing else to copy
    return Make(kind, source.type_) && Keep(kind.copy(payload_, source.payload_, flags, translation));
  type_ = source.type_;
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
  return type_ == other.type_ && Kind::Of(type_).isEqual(a, b);
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

GeAliasLink* GeData::LinkInPayload() const { return &Kind::LinkOf(const_cast<Payload&>(payload_)); }

GeAliasLink* GeData::GetAliasLink() const { return type_ == kDataLink ? LinkInPayload() : nullptr; }

GeListNode* GeData::GetLink() const { return type_ == kDataLink ? LinkInPayload()->GetLink() : nullptr; }

CustomData* GeData::GetCustomDataType(Long type) const
{
  return type_ == type && type_ >= kDataFirstCustom ? payload_.custom : nullptr;
}

} // namespace _torvane_
