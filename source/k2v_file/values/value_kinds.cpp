#include "k2v_file/values/value_kinds.h"

#include <iterator>
#include <new>

#include "k2v_file/stream/chunk_visitor.h"
#include "torvane/links/alias.h"
#include "torvane/memory/assertion.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

constexpr LLong kRawBlockSize = 16;

// Copies: of texts the length tells whether there was memory.
template <class T>
Bool CopyPayload(T& to, const T& from, ULong, TransArray*)
{
  to = from;
  return true;
}

Bool CopyPayload(String& to, const String& from, ULong, TransArray*)
{
  to = from;
  return to.GetLength() == from.GetLength();
}

Bool CopyPayload(Filename& to, const Filename& from, ULong, TransArray*)
{
  to = from;
  return to.GetString().GetLength() == from.GetString().GetLength();
}

Bool CopyPayload(BaseContainer& to, const BaseContainer& from, ULong flags, TransArray* translation)
{
  return from.CopyTo(to, flags, translation);
}

Bool CopyPayload(GeAliasLink& to, const GeAliasLink& from, ULong, TransArray* translation)
{
  return from.CopyLinkTo(&to, translation);
}

Bool CopyPayload(UnknownRecord& to, const UnknownRecord& from, ULong, TransArray*)
{
  to.type = from.type;
  to.level = from.level;
  to.data = from.size > 0 ? GeAllocNC(from.size) : nullptr;
  if (from.size > 0 && !to.data)
    return false;
  GeCopyMem(to.data, from.data, from.size);
  to.size = from.size;
  return true;
}

// A text never counts as equal, so that setting one is always a change.
template <class T>
Bool ArePayloadsEqual(const T& a, const T& b)
{
  return a == b;
}
Bool ArePayloadsEqual(const String&, const String&) { return false; }
Bool ArePayloadsEqual(const UnknownRecord&, const UnknownRecord&) { return false; }
Bool ArePayloadsEqual(const Filename& a, const Filename& b) { return a.IsEqual(b); }
Bool ArePayloadsEqual(const BaseContainer& a, const BaseContainer& b) { return a.IsEqual(b); }

// What no file holds as a value.
Bool ReadValue(HyperFile&, void*&) { return true; }
Bool ReadValue(HyperFile&, UnknownRecord&) { return true; }
Bool WriteValue(HyperFile&, void*) { return true; }
Bool WriteValue(HyperFile&, const UnknownRecord&) { return true; }

} // namespace

// A number in the payload itself.
template <class T, auto member>
struct GeData::Kind::Inline
{
  static Bool Make(Payload& payload, Long)
  {
    payload.*member = T{};
    return true;
  }
  static Bool Copy(Payload& to, const Payload& from, ULong, TransArray*)
  {
    to.*member = from.*member;
    return true;
  }
  static Bool IsEqual(const Payload& a, const Payload& b) { return a.*member == b.*member; }
  static Bool Read(HyperFile& file, Payload& payload) { return ReadValue(file, payload.*member); }
  static Bool Write(HyperFile& file, const Payload& payload) { return WriteValue(file, payload.*member); }
  static constexpr Kind Row(Long type, StoredAs storedAs = StoredAs::kValue)
  {
    return {type, storedAs, true, Make, nullptr, Copy, IsEqual, Read, Write};
  }
};

// An object behind a pointer.
template <class T, auto member>
struct GeData::Kind::Owned
{
  static Bool Make(Payload& payload, Long)
  {
    payload.*member = NewObj<T>();
    return payload.*member != nullptr;
  }
  static void Free(Payload& payload) { DeleteObj(payload.*member); }
  static Bool Copy(Payload& to, const Payload& from, ULong flags, TransArray* translation)
  {
    return CopyPayload(*(to.*member), *(from.*member), flags, translation);
  }
  static Bool IsEqual(const Payload& a, const Payload& b) { return ArePayloadsEqual(*(a.*member), *(b.*member)); }
  static Bool Read(HyperFile& file, Payload& payload) { return ReadValue(file, *(payload.*member)); }
  static Bool Write(HyperFile& file, const Payload& payload) { return WriteValue(file, *(payload.*member)); }
  static constexpr Kind Row(Long type, Bool isCopiedInPlace, StoredAs storedAs = StoredAs::kValue)
  {
    return {type, storedAs, isCopiedInPlace, Make, Free, Copy, IsEqual, Read, Write};
  }
};

GeAliasLink& GeData::Kind::LinkOf(Payload& payload)
{
  static_assert(sizeof(GeAliasLink) == sizeof payload.link);
  return *std::launder(reinterpret_cast<GeAliasLink*>(payload.link));
}

struct GeData::Kind::Link
{
  static const GeAliasLink& In(const Payload& payload) { return LinkOf(const_cast<Payload&>(payload)); }
  static Bool Make(Payload& payload, Long)
  {
    ::new (static_cast<void*>(payload.link)) GeAliasLink;
    return true;
  }
  static void Free(Payload& payload) { LinkOf(payload).~GeAliasLink(); }
  static Bool Copy(Payload& to, const Payload& from, ULong flags, TransArray* translation)
  {
    return CopyPayload(LinkOf(to), In(from), flags, translation);
  }
  static Bool IsEqual(const Payload& a, const Payload& b) { return In(a).IsEqual(In(b)); }
  static Bool Read(HyperFile& file, Payload& payload) { return ReadValue(file, LinkOf(payload)); }
  static Bool Write(HyperFile& file, const Payload& payload) { return WriteValue(file, In(payload)); }
};

// Nil, and types that don't exist, which keep their number alone.
struct GeData::Kind::Nothing
{
  static Bool Make(Payload& payload, Long type)
  {
    if (type != kDataNil)
      ReportAssertion("k2v_file", __LINE__, "a value got a type that doesn't exist");
    payload.wide = 0;
    return true;
  }
  static Bool Copy(Payload& to, const Payload&, ULong, TransArray*)
  {
    to.wide = 0;
    return true;
  }
  static Bool AreEqual(const Payload&, const Payload&) { return true; }
  static Bool AreNotEqual(const Payload&, const Payload&) { return false; }
  static Bool Read(HyperFile&, Payload&) { return true; }
  static Bool Write(HyperFile&, const Payload&) { return true; }
};

// Sixteen bytes of a plug-in.
struct GeData::Kind::Block
{
  static Bool Make(Payload& payload, Long)
  {
    payload.block = GeAlloc(kRawBlockSize);
    return payload.block != nullptr;
  }
  static void Free(Payload& payload) { GeFree(payload.block); }
  static Bool Copy(Payload& to, const Payload& from, ULong, TransArray*)
  {
    GeCopyMem(to.block, from.block, kRawBlockSize);
    return true;
  }
};

struct GeData::Kind::Custom
{
  static Bool Make(Payload& payload, Long type)
  {
    const CustomDataType* row = FindCustomDataType(type);
    payload.custom = row ? row->make(*row) : nullptr;
    return payload.custom != nullptr;
  }
  static void Free(Payload& payload) { DeleteObj(payload.custom); }
  static Bool Copy(Payload& to, const Payload& from, ULong, TransArray* translation)
  {
    return from.custom->CopyTo(*to.custom, translation);
  }
  static Bool IsEqual(const Payload& a, const Payload& b) { return a.custom->IsEqual(*b.custom); }
  static Bool Write(HyperFile& file, const Payload& payload)
  {
    if (!file.WriteChunkStart(0, payload.custom->GetChunkLevel()))
      return false;
    payload.custom->Write(file);
    return file.WriteChunkEnd();
  }
};

// Containers, links and custom values get a new object with each copy: what they hold may lead back to the old one.
constexpr GeData::Kind GeData::Kind::kRows[] = {
    {-1, StoredAs::kNever, true, Nothing::Make, nullptr, Nothing::Copy, Nothing::AreNotEqual, Nothing::Read,
     Nothing::Write}, // what doesn't exist
    {kDataNil, StoredAs::kValue, true, Nothing::Make, nullptr, Nothing::Copy, Nothing::AreEqual, Nothing::Read,
     Nothing::Write},
    Inline<void*, &Payload::pointer>::Row(kDataPointer, StoredAs::kTypeAlone),
    Inline<Long, &Payload::integer>::Row(kDataLong),
    Inline<Real, &Payload::real>::Row(kDataReal),
    Inline<LLong, &Payload::wide>::Row(kDataLLong),
    Owned<BaseTime, &Payload::time>::Row(kDataTime, true),
    Owned<Vector, &Payload::vector>::Row(kDataVector, true),
    Owned<Matrix, &Payload::matrix>::Row(kDataMatrix, true),
    Owned<String, &Payload::string>::Row(kDataString, true),
    Owned<Filename, &Payload::filename>::Row(kDataFilename, true),
    Owned<BaseContainer, &Payload::container>::Row(kDataContainer, false),
    {kDataLink, StoredAs::kValue, false, Link::Make, Link::Free, Link::Copy, Link::IsEqual, Link::Read, Link::Write},
    {kDataRawBlock, StoredAs::kNever, false, Block::Make, Block::Free, Block::Copy, Nothing::AreNotEqual, Nothing::Read,
     Nothing::Write},
    Owned<UnknownRecord, &Payload::unknown>::Row(kDataUnknown, false, StoredAs::kNever),
    {kDataFirstCustom, StoredAs::kValue, false, Custom::Make, Custom::Free, Custom::Copy, Custom::IsEqual,
     Nothing::Read, Custom::Write},
};

const GeData::Kind& GeData::Kind::Of(Long type)
{
  // The place of the row by the type: types below the first custom one are small numbers.
  struct Places
  {
    UChar row[kDataUnknown + 1] = {};
  };
  static constexpr Places kPlaces = [] {
    Places places;
    for (std::size_t i = 0; i < std::size(kRows); ++i) {
      if (kRows[i].type >= 0 && kRows[i].type <= kDataUnknown)
        places.row[kRows[i].type] = static_cast<UChar>(i);
    }
    return places;
  }();
  if (type >= kDataFirstCustom)
    return kRows[std::size(kRows) - 1];
  return kRows[type >= 0 && type <= kDataUnknown ? kPlaces.row[type] : 0];
}

} // namespace _torvane_
