// The two visitors of a record. The values of a class's chunk are told once, in file order, in a function template that
// takes either of them:
//
//   template <>
//   struct ChunkFields<LayerSet>
//   {
//     template <class Visitor>
//     static Bool VisitBody(LayerSet& set, Visitor& v)
//     {
//       v.Long(set.mode_);
//       v.ConstantReal(1.0); // an old factor: written so, dropped on reading
//       if (v.Level() >= 1)
//         v.Container(set.settings_);
//       if (v.VersionBelow(7500))
//         v.template Skip<Real, Vector>(); // only old files hold them
//       return v.Good();
//     }
//   };
//
//   WriteChunk(file, kChunkLayerSet, 1, [&](auto& v) { return ChunkFields<LayerSet>::VisitBody(*this, v); });
//   ReadChunkBody(file, level, [&](auto& v) { return ChunkFields<LayerSet>::VisitBody(*this, v); });
//
// Every operation gives Good(): true until the first failure, after which nothing is read or written any more; what was
// not reached keeps its value. The operations have the names of the values; so the value types are written with their
// namespace here.
#pragma once

#include <type_traits>

#include "torvane/links/alias.h"
#include "torvane/math/vector.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/text/filename.h"
#include "torvane/text/ge_string.h"
#include "torvane/time/base_time.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

// The value of each type as a HyperFile holds it.
inline Bool WriteValue(HyperFile& file, Char value) { return file.WriteChar(value); }
inline Bool WriteValue(HyperFile& file, UChar value) { return file.WriteUChar(value); }
inline Bool WriteValue(HyperFile& file, Word value) { return file.WriteWord(value); }
inline Bool WriteValue(HyperFile& file, UWord value) { return file.WriteUWord(value); }
inline Bool WriteValue(HyperFile& file, Long value) { return file.WriteLong(value); }
inline Bool WriteValue(HyperFile& file, ULong value) { return file.WriteULong(value); }
inline Bool WriteValue(HyperFile& file, LLong value) { return file.WriteLLong(value); }
inline Bool WriteValue(HyperFile& file, Bool value) { return file.WriteBool(value); }
inline Bool WriteValue(HyperFile& file, Real value) { return file.WriteReal(value); }
inline Bool WriteValue(HyperFile& file, SReal value) { return file.WriteSReal(value); }
inline Bool WriteValue(HyperFile& file, const BaseTime& value) { return file.WriteTime(value); }
inline Bool WriteValue(HyperFile& file, const Vector& value) { return file.WriteVector(value); }
inline Bool WriteValue(HyperFile& file, const Matrix& value) { return file.WriteMatrix(value); }
inline Bool WriteValue(HyperFile& file, const String& value) { return file.WriteString(value); }
inline Bool WriteValue(HyperFile& file, const Filename& value) { return file.WriteFilename(value); }
inline Bool WriteValue(HyperFile& file, const BaseContainer& value) { return file.WriteContainer(value); }
inline Bool WriteValue(HyperFile& file, const GeAliasLink& value) { return value.WriteLink(file); }

inline Bool ReadValue(HyperFile& file, Char& value) { return file.ReadChar(value); }
inline Bool ReadValue(HyperFile& file, UChar& value) { return file.ReadUChar(value); }
inline Bool ReadValue(HyperFile& file, Word& value) { return file.ReadWord(value); }
inline Bool ReadValue(HyperFile& file, UWord& value) { return file.ReadUWord(value); }
inline Bool ReadValue(HyperFile& file, Long& value) { return file.ReadLong(value); }
inline Bool ReadValue(HyperFile& file, ULong& value) { return file.ReadULong(value); }
inline Bool ReadValue(HyperFile& file, LLong& value) { return file.ReadLLong(value); }
inline Bool ReadValue(HyperFile& file, Bool& value) { return file.ReadBool(value); }
inline Bool ReadValue(HyperFile& file, Real& value) { return file.ReadReal(value); }
inline Bool ReadValue(HyperFile& file, SReal& value) { return file.ReadSReal(value); }
inline Bool ReadValue(HyperFile& file, BaseTime& value) { return file.ReadTime(value); }
inline Bool ReadValue(HyperFile& file, Vector& value) { return file.ReadVector(value); }
inline Bool ReadValue(HyperFile& file, Matrix& value) { return file.ReadMatrix(value); }
inline Bool ReadValue(HyperFile& file, String& value) { return file.ReadString(value); }
inline Bool ReadValue(HyperFile& file, Filename& value) { return file.ReadFilename(value); }
inline Bool ReadValue(HyperFile& file, BaseContainer& value) { return file.ReadContainer(value, true); }
inline Bool ReadValue(HyperFile& file, GeAliasLink& value) { return value.ReadLink(file); }

class ChunkWriter
{
 public:
  static constexpr bool kReading = false;

  ChunkWriter(HyperFile& file, _torvane_::Long level) : file_(file), level_(level) {}

  _torvane_::Long Level() const { return level_; }
  bool VersionBelow(_torvane_::Long) const { return false; }
  bool Good() const { return good_; }
  HyperFile& File() { return file_; }
  // For what the visitor has no operation for: `done` is the result of the caller's own writing.
  bool Note(bool done) { return good_ = good_ && done; }

  bool Char(_torvane_::Char value) { return Put(value); }
  bool UChar(_torvane_::UChar value) { return Put(value); }
  bool Word(_torvane_::Word value) { return Put(value); }
  bool UWord(_torvane_::UWord value) { return Put(value); }
  bool Long(_torvane_::Long value) { return Put(value); }
  bool ULong(_torvane_::ULong value) { return Put(value); }
  bool LLong(_torvane_::LLong value) { return Put(value); }
  bool Bool(bool value) { return Put(value); }
  bool Bool(_torvane_::Long value) { return Put(value != 0); } // held in 32 bits
  bool Real(_torvane_::Real value) { return Put(value); }
  bool SReal(_torvane_::SReal value) { return Put(value); }
  bool LReal(_torvane_::Real value) { return Note(good_ && file_.WriteLReal(value)); }
  bool Time(const BaseTime& value) { return Put(value); }
  bool Vector(const _torvane_::Vector& value) { return Put(value); }
  bool LVector(const _torvane_::Vector& value) { return Note(good_ && file_.WriteLVector(value)); }
  bool Matrix(const _torvane_::Matrix& value) { return Put(value); }
  bool String(const _torvane_::String& value) { return Put(value); }
  bool Filename(const _torvane_::Filename& value) { return Put(value); }
  bool Container(const BaseContainer& value) { return Put(value); }
  bool Link(const GeAliasLink& value) { return Put(value); }
  // A UChar that tells whether links point at the goal, and then its record if they do.
  bool Goal(const GeAliasGoal& goal)
  {
    bool linked = goal.HasLinks();
    return UChar(linked ? 1 : 0) && (!linked || Note(goal.WriteGoal(file_)));
  }
  bool Memory(const void* data, _torvane_::LLong size) { return Note(good_ && file_.WriteMemory(data, size)); }

  // A value of one kind in the file and of another in memory, converted as by static_cast.
  template <class T>
  bool UCharInto(const T& value)
  {
    return UChar(static_cast<_torvane_::UChar>(value));
  }
  template <class T>
  bool LongInto(const T& value)
  {
    return Long(static_cast<_torvane_::Long>(value));
  }
  template <class T>
  bool ULongInto(const T& value)
  {
    return ULong(static_cast<_torvane_::ULong>(value));
  }
  template <class T>
  bool RealInto(const T& value)
  {
    return Real(static_cast<_torvane_::Real>(value));
  }

  // Values that every file holds and nothing needs.
  bool ConstantUChar(_torvane_::UChar value) { return Put(value); }
  bool ConstantWord(_torvane_::Word value) { return Put(value); }
  bool ConstantLong(_torvane_::Long value) { return Put(value); }
  bool ConstantULong(_torvane_::ULong value) { return Put(value); }
  bool ConstantLLong(_torvane_::LLong value) { return Put(value); }
  bool ConstantBool(bool value) { return Put(value); }
  bool ConstantReal(_torvane_::Real value) { return Put(value); }
  bool ConstantSReal(_torvane_::SReal value) { return Put(value); }
  bool ConstantTime(const BaseTime& value) { return Put(value); }
  bool ConstantVector(const _torvane_::Vector& value) { return Put(value); }
  bool ConstantMatrix(const _torvane_::Matrix& value) { return Put(value); }
  bool ConstantString(const _torvane_::String& value) { return Put(value); }
  bool EmptyString() { return Put(_torvane_::String()); }
  bool EmptyFilename() { return Put(_torvane_::Filename()); }
  bool EmptyContainer() { return Put(BaseContainer(0)); }
  bool EmptyLink() { return Put(GeAliasLink()); }

  // Values that only older files hold.
  template <class... T>
  bool Skip()
  {
    return good_;
  }

 private:
  template <class T>
  bool Put(const T& value)
  {
    return good_ = good_ && WriteValue(file_, value);
  }

  HyperFile& file_;
  _torvane_::Long level_;
  bool good_ = true;
};

class ChunkReader
{
 public:
  static constexpr bool kReading = true;

  ChunkReader(HyperFile& file, _torvane_::Long level) : file_(file), level_(level) {}

  _torvane_::Long Level() const { return level_; }
  bool VersionBelow(_torvane_::Long version) const { return file_.GetFileVersion() < version; }
  bool Good() const { return good_; }
  HyperFile& File() { return file_; }
  // As above, for the caller's own reading.
  bool Note(bool done) { return good_ = good_ && done; }

  bool Char(_torvane_::Char& value) { return Get(value); }
  bool UChar(_torvane_::UChar& value) { return Get(value); }
  bool Word(_torvane_::Word& value) { return Get(value); }
  bool UWord(_torvane_::UWord& value) { return Get(value); }
  bool Long(_torvane_::Long& value) { return Get(value); }
  bool ULong(_torvane_::ULong& value) { return Get(value); }
  bool LLong(_torvane_::LLong& value) { return Get(value); }
  bool Bool(bool& value) { return Get(value); }
  bool Bool(_torvane_::Long& value) { return Into<bool>(value); }
  bool Real(_torvane_::Real& value) { return Get(value); }
  bool SReal(_torvane_::SReal& value) { return Get(value); }
  bool LReal(_torvane_::Real& value) { return Note(good_ && file_.ReadLReal(value)); }
  bool Time(BaseTime& value) { return Get(value); }
  bool Vector(_torvane_::Vector& value) { return Get(value); }
  bool LVector(_torvane_::Vector& value) { return Note(good_ && file_.ReadLVector(value)); }
  bool Matrix(_torvane_::Matrix& value) { return Get(value); }
  bool String(_torvane_::String& value) { return Get(value); }
  bool Filename(_torvane_::Filename& value) { return Get(value); }
  bool Container(BaseContainer& value) { return Get(value); } // emptied first
  bool Link(GeAliasLink& value) { return Get(value); }
  bool Goal(GeAliasGoal& goal)
  {
    _torvane_::UChar linked = 0;
    return UChar(linked) && (linked == 0 || Note(goal.ReadGoal(file_)));
  }
  // Replaces a block made by GeAlloc (or null) by a new one.
  bool Memory(void*& data, _torvane_::LLong& size)
  {
    void* block = nullptr;
    _torvane_::LLong count = 0;
    if (!Note(good_ && file_.ReadMemory(block, count)))
      return false;
    GeFree(data);
    data = block;
    size = count;
    return true;
  }

  template <class T>
  bool UCharInto(T& value)
  {
    return Into<_torvane_::UChar>(value);
  }
  template <class T>
  bool LongInto(T& value)
  {
    return Into<_torvane_::Long>(value);
  }
  template <class T>
  bool ULongInto(T& value)
  {
    return Into<_torvane_::ULong>(value);
  }
  template <class T>
  bool RealInto(T& value)
  {
    return Into<_torvane_::Real>(value);
  }

  bool ConstantUChar(_torvane_::UChar) { return Skip<_torvane_::UChar>(); }
  bool ConstantWord(_torvane_::Word) { return Skip<_torvane_::Word>(); }
  bool ConstantLong(_torvane_::Long) { return Skip<_torvane_::Long>(); }
  bool ConstantULong(_torvane_::ULong) { return Skip<_torvane_::ULong>(); }
  bool ConstantLLong(_torvane_::LLong) { return Skip<_torvane_::LLong>(); }
  bool ConstantBool(bool) { return Skip<bool>(); }
  bool ConstantReal(_torvane_::Real) { return Skip<_torvane_::Real>(); }
  bool ConstantSReal(_torvane_::SReal) { return Skip<_torvane_::SReal>(); }
  bool ConstantTime(const BaseTime&) { return Skip<BaseTime>(); }
  bool ConstantVector(const _torvane_::Vector&) { return Skip<_torvane_::Vector>(); }
  bool ConstantMatrix(const _torvane_::Matrix&) { return Skip<_torvane_::Matrix>(); }
  bool ConstantString(const _torvane_::String&) { return Skip<_torvane_::String>(); }
  bool EmptyString() { return Skip<_torvane_::String>(); }
  bool EmptyFilename() { return Skip<_torvane_::Filename>(); }
  bool EmptyContainer() { return Skip<BaseContainer>(); }
  bool EmptyLink() { return Skip<GeAliasLink>(); }

  // Reads values of those types and drops them.
  template <class... T>
  bool Skip()
  {
    return (Drop<T>() && ...);
  }

 private:
  template <class T>
  bool Get(T& value)
  {
    return good_ = good_ && ReadValue(file_, value);
  }
  template <class Stored, class T>
  bool Into(T& value)
  {
    Stored stored{};
    if (!Get(stored))
      return false;
    value = static_cast<T>(stored);
    return true;
  }
  template <class T>
  bool Drop()
  {
    T value{};
    return Get(value);
  }

  HyperFile& file_;
  _torvane_::Long level_;
  bool good_ = true;
};

// Writes a whole chunk around the values of `visit`, which is called with a ChunkWriter. False after a failure.
template <class Visit>
Bool WriteChunk(HyperFile& file, Long id, Long level, Visit&& visit)
{
  ChunkWriter writer(file, level);
  if (!file.WriteChunkStart(id, level))
    return false;
  static_cast<void>(visit(writer));
  return file.WriteChunkEnd() && writer.Good();
}

// Reads the body of a chunk whose start was read, with a ChunkReader, and passes over whatever a newer writer put
// behind it, the end tag included. `visit` gives a Bool, or nothing: then the reader's Good() is its result.
template <class Visit>
Bool ReadChunkBody(HyperFile& file, Long level, Visit&& visit)
{
  ChunkReader reader(file, level);
  Bool read = true;
  if constexpr (std::is_void_v<decltype(visit(reader))>)
    visit(reader);
  else
    read = visit(reader);
  return read && reader.Good() && file.SkipToEndChunk();
}

} // namespace _torvane_
