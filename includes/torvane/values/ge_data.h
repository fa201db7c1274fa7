// The variant value: a type id and a payload. Nearly every setting of every node is one.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/memory/memory.h"
#include "torvane/text/filename.h"
#include "torvane/text/ge_string.h"
#include "torvane/time/base_time.h"
#include "torvane/types.h"
#include "torvane/values/custom_data.h"
#include "torvane/values/parameter_path.h"

namespace _torvane_
{

class BaseContainer;
class GeAliasLink;
class GeListNode;
class HyperFile;
class TransArray;

// A custom value of a type that the reader didn't know, kept byte for byte (Reals of single-precision files: see
// RawChunkBody).
struct UnknownRecord
{
  Long type = 0;
  Long level = 0; // -1: the value was dropped and writes back as an empty chunk
  LLong size = 0;
  void* data = nullptr; // owned; with the chunk's end tag

  UnknownRecord() = default;
  ~UnknownRecord() { GeFree(data); }
  UnknownRecord(const UnknownRecord&) = delete;
  UnknownRecord& operator=(const UnknownRecord&) = delete;
};

// Owns its payload. A payload that can't be allocated leaves type 0 (nil). Getters never fail: on another type they
// report to the assertion log (a nil value doesn't) and give a neutral value.
class GeData
{
 public:
  GeData() = default;
  GeData(Long value) : type_(kDataLong) { payload_.integer = value; }         // NOLINT: values convert
  GeData(Bool value) : type_(kDataLong) { payload_.integer = value ? 1 : 0; } // NOLINT
  GeData(Real value) : type_(kDataReal) { payload_.real = value; }            // NOLINT
  GeData(SReal value) : GeData(static_cast<Real>(value)) {}                   // NOLINT
  GeData(LLong value) : type_(kDataLLong) { payload_.wide = value; }          // NOLINT
  GeData(void* pointer) : type_(kDataPointer) { payload_.pointer = pointer; } // NOLINT
  // A pointer to characters is no text, and would become a truth value: GeData(String("...")).
  GeData(const void*) = delete;
  template <class T>
  GeData(T*) = delete;
  GeData(const Vector& value);        // NOLINT
  GeData(const Matrix& value);        // NOLINT
  GeData(const BaseTime& value);      // NOLINT
  GeData(const String& value);        // NOLINT
  GeData(const Filename& value);      // NOLINT
  GeData(const BaseContainer& value); // NOLINT
  GeData(const GeAliasLink& value);   // NOLINT: a link on the same target
  // A custom value copied from `source`, which is of that type.
  GeData(Long type, const CustomData& source);
  // A copy of a link points at the same target.
  GeData(const GeData& other) { Assign(other, 0, nullptr); }
  GeData(GeData&& other) noexcept : type_(other.type_), payload_(other.payload_) { other.type_ = kDataNil; }
  GeData& operator=(const GeData& other)
  {
    Assign(other, 0, nullptr);
    return *this;
  }
  GeData& operator=(GeData&& other) noexcept;
  ~GeData() { Free(); }

  // Frees the value and prepares an empty one of that type: zero, empty text, identity matrix, new custom object. Old
  // ids become current ones (3: Vector, 7 and 12: String, 400006001: Long). True if the value was prepared; an
  // unknown custom type gives false and leaves nil; any other unknown id is kept without a payload and reported.
  Bool SetType(Long type);
  // Frees the payload and leaves nil.
  void Free()
  {
    if (OwnsPayload())
      FreePayload();
    type_ = kDataNil;
  }

  // The type, with an unknown record shown as 0.
  Long GetType() const { return type_ == kDataUnknown ? kDataNil : type_; }
  // The type as it is stored.
  Long GetRawType() const { return type_; }

  // Copies a value, links through `translation`; a link without one is reported, and points at the same target.
  // (Construction and assignment do the latter without a report.) A text, a Time, a Vector and a Matrix are stored in
  // the object that holds such a value already; a container, a link and a custom value get a new one. `flags` are
  // those of PrivateChunk::CopyTo. False when memory is short: the value is nil then.
  Bool CopyFrom(const GeData& source, ULong flags, TransArray* translation);

  // Equal type and value; a Long also equals a Real of the same value. A NaN equals nothing, and neither does a String:
  // a String set into a container always counts as a change. Links are equal when they reach the same goal.
  Bool IsEqual(const GeData& other) const;

  // The type as a Long and then the value, see docs/format.md.
  Bool Read(HyperFile& file);
  Bool Write(HyperFile& file) const;
  // False for what a file can't hold so that it is read again: pointers, raw blocks, types that don't exist. Containers
  // are written without such elements.
  Bool IsStored() const;

  Long GetLong() const; // of a Real: truncated; out of range gives the nearest Long
  Bool GetBool() const { return GetLong() != 0; }
  Real GetReal() const; // of a Long: widened
  LLong GetLLong() const;
  void* GetPointer() const;
  const Vector& GetVector() const;
  const Matrix& GetMatrix() const;
  const BaseTime& GetTime() const;
  const String& GetString() const;
  const Filename& GetFilename() const;
  BaseContainer* GetContainer() const; // null for another type
  GeAliasLink* GetAliasLink() const;   // null for another type
  GeListNode* GetLink() const;         // the link's target; null for another type and for an empty link
  const UnknownRecord* GetUnknown() const { return type_ == kDataUnknown ? payload_.unknown : nullptr; }
  // The custom object if the type is the one asked for, else null.
  CustomData* GetCustomDataType(Long type) const;
  // The custom object of whatever custom type this is, or null.
  CustomData* GetCustom() const { return type_ >= kDataFirstCustom ? payload_.custom : nullptr; }

 private:
  union Payload
  {
    Long integer;
    Real real;
    LLong wide = 0;
    void* pointer;
    Vector* vector;
    Matrix* matrix;
    BaseTime* time;
    String* string;
    Filename* filename;
    BaseContainer* container;
    UChar link[sizeof(void*)]; // a GeAliasLink
    void* block;
    UnknownRecord* unknown;
    CustomData* custom;
  };

  friend class BaseContainer; // takes nested containers out and puts them in without a recursion
  friend class HyperFile;     // reads values whose type stands elsewhere

  // False for the kinds that are stored in the value itself, the most frequent ones.
  Bool OwnsPayload() const
  {
    constexpr ULong kInline =
        1U << kDataNil | 1U << kDataPointer | 1U << kDataLong | 1U << kDataReal | 1U << kDataLLong;
    return type_ < 0 || type_ > kDataLLong || ((kInline >> type_) & 1U) == 0;
  }
  struct Kind; // a row of the table of kinds
  GeAliasLink* LinkInPayload() const;

  template <class T, class... Args>
  Bool Own(Long type, T* Payload::*member, Args&&... args);
  template <class T>
  const T& Get(Long type, T* Payload::*member, const T& neutral) const;
  void FreePayload();
  Bool Keep(Bool done);
  void Take(GeData& other);
  Bool Assign(const GeData& source, ULong flags, TransArray* translation);
  Bool Build(const GeData& source, ULong flags, TransArray* translation);
  Bool Make(const Kind& kind, Long type);
  Bool ReadAs(HyperFile& file, Long type); // the value alone, of a type that files hold
  Bool ReadCustom(HyperFile& file, Long type);
  Bool ReadUnknown(HyperFile& file, Long type, Long level);
  Bool WriteUnknown(HyperFile& file) const;
  void ReportWrongType() const;

  Long type_ = kDataNil;
  Payload payload_;
};

} // namespace _torvane_
