// The typed value stream on which every file of the library stands: a header, then values, each opened by a one-byte
// tag; chunks (an id, a level, values, an end tag) give it structure. All numbers are big-endian, all text UTF-16
// big-endian. docs/format.md tells the bytes.
#pragma once

#include "torvane/bytes/base_file.h"
#include "torvane/bytes/file_errors.h"
#include "torvane/math/vector.h"
#include "torvane/memory/memory.h"
#include "torvane/stream/file_versions.h"
#include "torvane/text/ge_string.h"
#include "torvane/time/base_time.h"

namespace _torvane_
{

class BaseContainer;
class BaseDocument;
class Bitmap;
class ContainerIndex;
class GeData;
class PreparedRecord;
struct RecordPart;
class TransArray;
struct ValueForm;

// Four characters as a 32-bit number, the first in the high byte.
constexpr ULong FourCharacters(const char (&text)[5])
{
  ULong value = 0;
  for (int i = 0; i < 4; ++i)
    value = (value << 8) | static_cast<UChar>(text[i]);
  return value;
}

inline constexpr ULong kSceneIdent = FourCharacters("Q7R6");        // scene files
inline constexpr ULong kPaintTextureIdent = FourCharacters("Vlek"); // paint texture files
inline constexpr ULong kBugsIdent = FourCharacters("bugs");         // asks a writer for the short header

// True for one of the six numbers that a file may begin with.
Bool IsFileMagic(ULong magic);

// True when `name` holds a scene file: its first number is one of the six magics and its second the scene ident.
// `flags` without bit 1 gives false. The file is closed in any case.
Bool IdentifyFile(const Filename& name, ULong flags);

// What opens each value.
enum ValueTag : UChar
{
  kTagChunkStart = 1,
  kTagChunkEnd = 2,
  kTagChar = 11,
  kTagUChar = 12,
  kTagWord = 13,
  kTagUWord = 14,
  kTagLong = 15,
  kTagULong = 16,
  kTagLLong = 17,
  kTagULLong = 18,
  kTagReal = 19,
  kTagLReal = 20,
  kTagBool = 21,
  kTagTime = 22,
  kTagVector = 23,
  kTagLVector = 24,
  kTagMatrix = 25,
  kTagLMatrix = 26,
  kTagSVector = 27,
  kTagSMatrix = 28,
  kTagSReal = 29,
  kTagMemory = 128,
  kTagImage = 129,
  kTagString = 130,
  kTagFilename = 131,
  kTagLegacyContainer = 132,
  kTagLegacyPointArray = 133,
  kTagLegacyPolygonArray = 134,
  kTagLegacyWordArray = 135,
  kTagLegacyArray = 136,
  kTagLegacyFloatArray = 137,
  kTagReserved = 138,
  kTagLargeMemory = 139,
  kTagArray = 140,
};

// The element types of an Array value.
enum ArrayType : Long
{
  kArrayByte = 1,
  kArrayWord = 2,
  kArrayLong = 3,
  kArrayLLong = 4,
  kArraySReal = 5,
  kArrayLReal = 6,
  kArrayReal = 7, // turned into kArrayLReal at once, in memory and on disk
};

enum HyperFileMode : Long
{
  kHyperFileRead = 1,
  kHyperFileWrite = 2,
};

// A chunk as its start tells it.
struct ChunkPlace
{
  Long id = 0;
  Long level = 0;
};

// A polygon of a legacy polygon array: four point numbers.
struct LegacyPolygon
{
  Long a, b, c, d;
};

// Receives a percentage, 0 to 100, while a file is read.
using ReadProgressHook = void (*)(Long percent, void* userData);
// Receives the byte position, cut to 32 bits, while a file is written.
using WriteProgressHook = void (*)(Long position, void* userData);

// All operations give true on success, and false at once without touching the file while the sticky error is set.
// A HyperFile belongs to one thread at a time.
class HyperFile : public GeMemory
{
 public:
  // `document` may be null; it is not owned.
  explicit HyperFile(BaseDocument* document = nullptr);
  // Ends the translation of links (unresolved ones become empty) and closes the file.
  ~HyperFile();
  HyperFile(const HyperFile&) = delete;
  HyperFile& operator=(const HyperFile&) = delete;

  // Opens for reading or writing and reads or writes the header. `ident` is what the header holds or must hold; a
  // writer that asks for kBugsIdent gets the short single-precision header. The error-dialog flag has no effect.
  Bool Open(ULong ident, const Filename& name, Long mode, Bool errorDialog = false);
  Bool Close();

  Long GetError() const { return error_; }
  // Overwrites the sticky error and reports to the assertion log, with the caller's line; only Open clears it.
  void SetError(Long error, Long line = __builtin_LINE());
  // The one place that every failure of a stream passes: a breakpoint here finds the first. `position` is where the
  // value in hand begins. Gives false.
  Bool Fail(Long error, LLong position, Long line = __builtin_LINE());
  // False once a part of what was read or written since Open could not be held in memory, which then is the error of
  // the file, or after any other error. Loops over chunks ask it behind each chunk, so that nothing is left out of a
  // file without an error.
  Bool HasMemory()
  {
    if (error_ == FILEERROR_NONE && memory_.Failed())
      Fail(FILEERROR_MEMORY, file_.GetPosition());
    return error_ == FILEERROR_NONE;
  }
  // Why and where the stream failed first. Code 0 while all is well.
  const FileProblem& GetProblem() const { return problem_; }

  Long GetMode() const { return mode_; }
  Long GetFileVersion() const { return version_; }
  void SetFileVersion(Long version) { version_ = version; }
  Bool IsBefore7500() const { return version_ < kVersionNodeHeader; }
  Bool IsBefore11600() const { return version_ < kVersionTransform; }
  Bool IsSinglePrecision() const { return singlePrecision_; }
  BaseDocument* GetDocument() const { return document_; }
  LLong GetPosition() const { return file_.GetPosition(); }
  LLong GetLength() const { return length_; } // taken at open; 0 when writing
  Long GetChunkDepth() const { return chunkDepth_; }
  // A chunk around the place of reading, 0 for the outermost one; zeros outside of the depth.
  ChunkPlace GetChunk(Long index) const
  {
    return index >= 0 && index < chunkDepth_ && index < chunkRoom_ ? chunks_[index] : ChunkPlace();
  }
  void SetExtraData(void* data) { extraData_ = data; }
  void* GetExtraData() const { return extraData_; }
  // Carries the links of this file; null before Open and after IgnoreLinks.
  TransArray* GetTranslator() const { return translator_; }
  // Links that are read from now on stay empty.
  void IgnoreLinks();
  // The byte stream below, for readers that walk values by their tags.
  BaseFile& GetFile() { return file_; }

  void SetReadProgress(ReadProgressHook hook, void* userData);
  void SetWriteProgress(WriteProgressHook hook, void* userData);
  // Reading tells its progress at every value, and not some 500 times.
  void TellEveryValue() { readTicks_ = 0; }

  Bool WriteChunkStart(Long id, Long level);
  Bool WriteChunkEnd();

  // One operation per tag, and its reader. A reader fails with FILEERROR_WRONG_VALUE on another tag.
  Bool WriteChar(Char value) { return Put(kTagChar, static_cast<UChar>(value)); }
  Bool WriteUChar(UChar value) { return Put(kTagUChar, value); }
  Bool WriteWord(Word value) { return Put(kTagWord, static_cast<UWord>(value)); }
  Bool WriteUWord(UWord value) { return Put(kTagUWord, value); }
  Bool WriteLong(Long value) { return Put(kTagLong, static_cast<ULong>(value)); }
  Bool WriteULong(ULong value) { return Put(kTagULong, value); }
  Bool WriteLLong(LLong value) { return Put(kTagLLong, static_cast<ULLong>(value)); }
  Bool WriteReal(Real value);
  Bool WriteLReal(Real value) { return Put(kTagLReal, bytes::CleanBits(value)); }
  Bool WriteSReal(SReal value) { return Put(kTagSReal, bytes::CleanBits(value)); }
  Bool WriteBool(Bool value) { return Put(kTagBool, static_cast<UChar>(value ? 1 : 0)); }
  Bool WriteTime(const BaseTime& value);
  Bool WriteVector(const Vector& value);
  Bool WriteLVector(const Vector& value);
  Bool WriteSVector(const Vector& value); // three floats
  Bool WriteMatrix(const Matrix& value);
  Bool WriteLMatrix(const Matrix& value);
  Bool WriteSMatrix(const Matrix& value); // twelve floats
  Bool WriteString(const String& value);
  Bool WriteFilename(const Filename& value);
  Bool WriteMemory(const void* data, LLong size);

  Bool ReadChar(Char& value) { return Get(kTagChar, value); }
  Bool ReadUChar(UChar& value) { return Get(kTagUChar, value); }
  Bool ReadWord(Word& value) { return Get(kTagWord, value); }
  Bool ReadUWord(UWord& value) { return Get(kTagUWord, value); }
  Bool ReadLong(Long& value) { return Get(kTagLong, value); }
  Bool ReadULong(ULong& value) { return Get(kTagULong, value); }
  Bool ReadLLong(LLong& value) { return Get(kTagLLong, value); }
  Bool ReadReal(Real& value);
  Bool ReadLReal(Real& value);
  Bool ReadSReal(SReal& value) { return ReadFloat(value); }
  Bool ReadFloat(SReal& value); // tag 19 in files below version 11925, tag 29 from there on
  Bool ReadBool(Bool& value);   // any non-zero byte is true
  Bool ReadTime(BaseTime& value);
  Bool ReadVector(Vector& value);
  Bool ReadLVector(Vector& value);
  Bool ReadSVector(Vector& value);
  Bool ReadMatrix(Matrix& value);
  Bool ReadLMatrix(Matrix& value);
  Bool ReadSMatrix(Matrix& value);
  Bool ReadString(String& value);
  Bool SkipString();
  Bool ReadFilename(Filename& value);
  // A new block that the caller owns and its size; size 0 gives a null block and true.
  Bool ReadMemory(void*& data, LLong& size);
  // The first `capacity` bytes of a Memory value into a buffer; `size` is the value's whole size.
  Bool ReadMemoryInto(void* buffer, LLong capacity, LLong& size);

  // Writes the picture's encoded bytes if it keeps any, else saves it in the saver format `format` (see bitmap.h);
  // null and an empty picture write length 0. A saver that fails leaves the value without a length: the file is then
  // damaged although true is given.
  Bool WriteImage(Bitmap* image, Long format, BaseContainer* settings, Long flags);
  // Stores the encoded bytes in `image` without decoding them.
  Bool ReadImage(Bitmap& image);

  // `count` elements, `stride` bytes apart in memory, in one bulk value.
  Bool WriteArray(const void* data, Long type, LLong stride, LLong count);
  // `columns` such values, one behind the other. The first element of each lies `step` bytes behind that of the one
  // before.
  Bool WriteColumns(const void* data, Long type, LLong stride, LLong count, Long columns, LLong step);
  // Fails with FILEERROR_WRONG_VALUE unless the file holds exactly `count` elements of that type; floats and doubles
  // are converted into one another.
  Bool ReadArray(void* data, Long type, LLong stride, LLong count);
  // What WriteColumns writes.
  Bool ReadColumns(void* data, Long type, LLong stride, LLong count, Long columns, LLong step);

  // Chunk 132: the container's id and its elements; pointers are left out.
  Bool WriteContainer(const BaseContainer& container);
  // Reads the chunk form and the legacy form. With `flush` the destination is emptied first and elements are appended;
  // without it elements of the same id are replaced. Also gives false, with no error set, on a stray tag inside the
  // chunk form.
  Bool ReadContainer(BaseContainer& container, Bool flush);
  // How many places were looked at to find or to order what was read by its ids: a measure of the work.
  LLong GetLookupCount() const { return lookups_; }
  void AddLookups(LLong count) { lookups_ += count; }

  // Arrays of files below version 11925. Each gives a new block that the caller owns and its count; a count of 0
  // gives a null block and true.
  Bool ReadLegacyPointArray(Vector*& points, LLong& count);
  Bool ReadLegacyPolygonArray(LegacyPolygon*& polygons, LLong& count);
  Bool ReadLegacyWordArray(UWord*& words, LLong& count);
  Bool ReadLegacyFloatArray(SReal*& floats, LLong& count);

  // The next tag, whatever it is.
  Bool ReadValueHeader(UChar& tag);
  // The next tag, and the chunk's id and level if it opens one.
  Bool ReadHeaderOrStart(UChar& tag, ChunkPlace& chunk);
  // Reads a tag and fails with FILEERROR_WRONG_VALUE if it isn't `tag`.
  Bool ExpectTag(UChar tag);
  // A chunk's id and level, after its tag was read.
  Bool ReadChunkStart(Long& id, Long& level);
  // Skips the body of a value whose tag was read.
  Bool SkipValue(UChar tag);
  // Consumes values up to and including the end tag of the chunk that the stream stands in. At the end of the file
  // gives false without an error; on an error sets FILEERROR_PREMATURE_END.
  Bool SkipToEndChunk();
  // Called when an end tag was read where one may stand; fails with FILEERROR_WRITE in a file that is being written.
  Bool ReadChunkEndMark();

  // The rest of the chunk as raw bytes in a new block that the caller owns, null when there are none; the chunk's end
  // tag is consumed and, unless `withoutEnd` is set, stands in the block.
  Bool ReadRawChunk(void*& data, LLong& size, Bool withoutEnd);
  // Writes such a block back; `withoutEnd` as in reading. A null block writes an end tag unless `withoutEnd` is set.
  Bool WriteRawChunk(const void* data, LLong size, Bool withoutEnd);

  // The quick way for records that are alike (prepared_record.h). BeginRecord gives a place with a copy of the record,
  // whose fields are then to be set, and EndRecord writes it; `spare` has room for the record and may be the place.
  // NextRecord gives what comes next, or `ahead` bytes later, if it is that part of a record, and PassRecord moves over
  // it. Null: the general way is to be taken. MayHoldRecords is to be asked before a record is learned: where it is
  // learned it gives false; it gives true if so many values can go by at once.
  UChar* BeginRecord(const PreparedRecord& record, UChar* spare);
  Bool EndRecord(const PreparedRecord& record, const UChar* place, const UChar* spare);
  Bool MayHoldRecords(LLong ticks = 1) const;
  const UChar* NextRecord(const PreparedRecord& record, const RecordPart& part, LLong ahead = 0) const;
  void PassRecord(const PreparedRecord& record, const RecordPart& part);
  // How many such records may stand in a row, as far as the buffer goes; the first of them has begun so far.
  LLong CountRecords(const PreparedRecord& record, LLong begun) const;
  // Values since progress was last told.
  LLong GetTicks() const { return ticks_; }

  // Opens and leaves one level of nested reading or writing (chunk loops, containers). Entering deeper than
  // kMaxLoopDepth sets FILEERROR_TOO_DEEP and gives false; so does a level for which the stack of the thread is too
  // small. Every successful Enter needs its Leave.
  static constexpr Long kMaxLoopDepth = 4000;
  Bool EnterLoop();
  void LeaveLoop() { --loopDepth_; }

  // A new block of `size` bytes read from the stream, null for size 0. A size that the file cannot hold is an error
  // before anything is allocated for it.
  Bool ReadBlock(void*& block, LLong size);
  // Asked before memory is taken for a count from the file: true if `count` is not negative and the rest of the file
  // can hold that many records of at least `bytesEach` bytes. Else fails with FILEERROR_WRONG_VALUE. Where the rest is
  // unknown (network) only the sign is looked at: then allocate as records come.
  Bool HasRoomFor(LLong count, LLong bytesEach);

 private:
  template <class Bits>
  Bool Put(UChar tag, Bits bits);
  template <class Value>
  Bool Get(UChar tag, Value& value);
  template <class Value>
  Bool GetBits(UChar tag, Value& bits);
  Bool PutSlow(UChar tag, ULLong bits, LLong size);
  Bool GetSlow(UChar tag, ULLong& bits, LLong size);
  template <LLong Count>
  Bool PutReals(UChar tag, const void* values, Bool asFloats);
  template <LLong Count>
  Bool GetReals(UChar tag, void* values, Bool asFloats);
  Bool PutText(UChar tag, const String& text);
  Bool GetText(UChar tag, String& text);
  // Room for `count` bytes: in the file's buffer, or else `spare`. FinishRoom hands them to the file.
  UChar* TakeRoom(UChar* spare, LLong count)
  {
    UChar* place = file_.WriteWindow(count);
    return place ? place : spare;
  }
  Bool FinishRoom(const UChar* place, const UChar* spare, LLong count)
  {
    if (place == spare)
      return file_.WriteBytes(spare, count);
    file_.CommitWrite(count);
    return true;
  }
  // The next `count` bytes: in the file's buffer, or else read to `spare`. Null on failure.
  const UChar* TakeBytes(UChar* spare, LLong count)
  {
    const UChar* place = file_.ReadWindow(count);
    if (!place)
      return file_.ReadBytes(spare, count) == count ? spare : nullptr;
    file_.CommitRead(count);
    return place;
  }
  // A tag, and the 32-bit length behind it.
  Bool PutBlockHead(UChar tag, ULong length);
  Bool GetBlockHead(UChar tag, LLong& length);
  Bool ReadPlainLong(Long& value);
  Bool SaveImage(Bitmap& image, Long format, BaseContainer* settings, Long flags);
  Bool ReadHeaderSlow(UChar& tag);
  // As Fail, with the error of the byte file; false without a failure if that has none.
  Bool FailFromFile(LLong position, Long line = __builtin_LINE());
  void TickWrite()
  {
    if (ticks_ == kWriteTicks)
      CallWriteHook();
    ++ticks_;
  }
  void TickRead()
  {
    if (ticks_ >= readTicks_)
      CallReadHook();
    ++ticks_;
  }
  void CallWriteHook();
  void CallReadHook();
  // The ticks of `count` values at once. None but the last of them may be due for a hook that is set.
  void TickMany(LLong count)
  {
    if (ticks_ + count <= GetTickThreshold())
      ticks_ += count;
    else
      TickManySlow(count);
  }
  void TickManySlow(LLong count);
  // How many of the coming `limit` values may go by before TickMany must be called.
  LLong LimitToTick(LLong limit) const;
  LLong GetTicksToDue() const;
  LLong GetTickThreshold() const { return mode_ == kHyperFileWrite ? kWriteTicks : readTicks_; }
  Bool TakesRecords(LLong ticks) const;
  Bool HasHook() const { return mode_ == kHyperFileWrite ? writeHook_ != nullptr : readHook_ != nullptr; }
  Bool WriteHeader(ULong ident);
  Bool ReadHeader(ULong ident);
  void EndTranslation();
  Bool ReadElements(void* data, Long type, Long storedType, LLong stride, LLong count);
  Bool PutColumns(const UChar* first, Long type, LLong stride, LLong count, Long columns, LLong step);
  Bool MayTakeColumns(LLong size);
  Bool TakeColumns(UChar* first, Long type, LLong stride, LLong count, Long columns, LLong step);
  struct LegacyArrayForm
  {
    Long type;            // of the elements in memory, an ArrayType
    Long storedType;      // in the file
    Long elements = 1;    // of an entry
    LLong entrySize = 0;  // of an entry in the length that the file tells; 0: that of the stored elements
    Long narrowType = -1; // the stored type where a flag behind the length is set; -1: there is no flag
  };
  Bool ReadLegacyArray(UChar tag, LegacyArrayForm form, void*& block, LLong& count);
  template <class Entry>
  Bool ReadLegacyEntries(UChar tag, const LegacyArrayForm& form, Entry*& entries, LLong& count);
  Bool ReadLegacyElements(LLong start, Long type, Long storedType, LLong count, void*& block);
  Bool GetMemoryLength(LLong& length);
  Bool ReadChunkHead(Long& id, Long& level);
  Bool GrowChunks();
  void NotePath();
  Bool ReadBodySize(const ValueForm& form, LLong& left);
  void WriteElements(const BaseContainer& container);
  Bool WriteShared(const BaseContainer& container);
  Bool MayHoldShared(const BaseContainer& container) const;
  Bool ReadShared(BaseContainer& container);
  Bool ReadContainer(ContainerIndex& target, Bool flush);
  Bool ReadContainerChunk(ContainerIndex& target, Bool flush, Long expected);
  Bool ReadContainerLegacy(ContainerIndex& target, Bool flush);
  GeData* PlaceElement(ContainerIndex& target, Bool flush, Long id);
  Bool ReadLegacyEntry(ContainerIndex& target, Bool flush, Long id, UChar type);
  Bool ReadLegacyNested(ContainerIndex& target, Bool flush, Long id);
  Bool Drop(LLong count, LLong position);

  static constexpr LLong kWriteTicks = 50000;

  BaseFile file_;
  Long error_ = FILEERROR_NONE;
  FileProblem problem_;
  AllocationWatch memory_; // since Open
  Bool singlePrecision_ = false;
  Long mode_ = kHyperFileRead;
  LLong length_ = 0;
  LLong ticks_ = 0;
  LLong readTicks_ = 0; // length / 500
  void* extraData_ = nullptr;
  BaseDocument* document_;
  Long version_ = kVersionUnknown;
  Long chunkDepth_ = 0;
  Long chunkRoom_ = 0;
  ChunkPlace* chunks_ = nullptr; // owned: the chunks that are open, outermost first
  Long loopDepth_ = 0;
  LLong lookups_ = 0;
  ReadProgressHook readHook_ = nullptr;
  WriteProgressHook writeHook_ = nullptr;
  void* readHookData_ = nullptr;
  void* writeHookData_ = nullptr;
  TransArray* translator_ = nullptr; // owned
};

template <class Bits>
inline Bool HyperFile::Put(UChar tag, Bits bits)
{
  constexpr LLong kSize = sizeof(Bits);
  UChar* place = error_ == FILEERROR_NONE ? file_.WriteWindow(1 + kSize) : nullptr;
  if (!place)
    return PutSlow(tag, bits, kSize);
  place[0] = tag;
  bytes::PutBig(place + 1, bits);
  file_.CommitWrite(1 + kSize);
  TickWrite();
  return true;
}

inline Bool HyperFile::ReadValueHeader(UChar& tag)
{
  const UChar* place = error_ == FILEERROR_NONE ? file_.ReadWindow(1) : nullptr;
  if (!place)
    return ReadHeaderSlow(tag);
  tag = place[0];
  file_.CommitRead(1);
  chunkDepth_ += (tag == kTagChunkStart ? 1 : 0) - (tag == kTagChunkEnd ? 1 : 0);
  return true;
}

inline Bool HyperFile::ReadHeaderOrStart(UChar& tag, ChunkPlace& chunk)
{
  constexpr LLong kStart = 1 + sizeof(ChunkPlace);
  const UChar* place = error_ == FILEERROR_NONE ? file_.ReadWindow(kStart) : nullptr;
  if (!place || place[0] != kTagChunkStart || chunkDepth_ < 0 || chunkDepth_ >= chunkRoom_)
    return ReadValueHeader(tag) && (tag != kTagChunkStart || ReadChunkStart(chunk.id, chunk.level));
  tag = kTagChunkStart;
  const ChunkPlace start = {static_cast<Long>(bytes::GetBig<ULong>(place + 1)),
                            static_cast<Long>(bytes::GetBig<ULong>(place + 5))};
  chunks_[chunkDepth_++] = start;
  chunk = start;
  file_.CommitRead(kStart);
  TickRead();
  return true;
}

template <class Value>
inline Bool HyperFile::GetBits(UChar tag, Value& bits)
{
  constexpr LLong kSize = sizeof(Value);
  const UChar* place = error_ == FILEERROR_NONE ? file_.ReadWindow(1 + kSize) : nullptr;
  if (place && place[0] == tag) {
    bits = bytes::GetBig<Value>(place + 1);
    file_.CommitRead(1 + kSize);
    TickRead();
    return true;
  }
  ULLong wide = 0;
  if (!GetSlow(tag, wide, kSize))
    return false;
  bits = static_cast<Value>(wide);
  return true;
}

template <class Value>
inline Bool HyperFile::Get(UChar tag, Value& value)
{
  std::make_unsigned_t<Value> bits = 0;
  if (!GetBits(tag, bits))
    return false;
  value = static_cast<Value>(bits);
  return true;
}

inline Bool HyperFile::WriteReal(Real value)
{
  return singlePrecision_ ? Put(kTagReal, bytes::CleanBits(static_cast<SReal>(value)))
                          : Put(kTagReal, bytes::CleanBits(value));
}

inline Bool HyperFile::ReadLReal(Real& value)
{
  ULLong bits = 0;
  if (!GetBits(kTagLReal, bits))
    return false;
  value = bytes::CleanReal(bits);
  return true;
}

inline Bool HyperFile::ReadReal(Real& value)
{
  if (singlePrecision_) {
    ULong bits = 0;
    if (!GetBits(kTagReal, bits))
      return false;
    value = bytes::CleanReal(bits);
    return true;
  }
  ULLong bits = 0;
  if (!GetBits(kTagReal, bits))
    return false;
  value = bytes::CleanReal(bits);
  return true;
}

inline Bool HyperFile::ReadFloat(SReal& value)
{
  ULong bits = 0;
  if (!GetBits(static_cast<UChar>(version_ < kVersionColumns ? kTagReal : kTagSReal), bits))
    return false;
  value = bytes::CleanReal(bits);
  return true;
}

inline Bool HyperFile::ReadBool(Bool& value)
{
  UChar bits = 0;
  if (!GetBits(kTagBool, bits))
    return false;
  value = bits != 0;
  return true;
}

} // namespace _torvane_
