// Opening and closing, the header, errors, progress, and values of a fixed size.
#include "torvane/stream/hyper_file.h"

#include <cstring>

#include "k2v_file/memory/stack_room.h"
#include "k2v_file/stream/file_magic.h"
#include "torvane/links/alias.h"
#include "torvane/memory/assertion.h"

namespace _torvane_
{

namespace
{

// Numbers in a row, each in 4 or 8 bytes, cleaned. `source` and `destination` hold them as Reals of memory.
template <LLong Count>
void PackReals(UChar* place, const void* source, Bool asFloats)
{
  Real numbers[Count];
  std::memcpy(numbers, source, sizeof numbers);
  if (asFloats) {
    for (LLong i = 0; i < Count; ++i)
      bytes::PutBig(place + i * 4, bytes::CleanBits(static_cast<SReal>(numbers[i])));
  } else {
    for (LLong i = 0; i < Count; ++i)
      bytes::PutBig(place + i * 8, bytes::CleanBits(numbers[i]));
  }
}

template <LLong Count>
void UnpackReals(const UChar* place, void* destination, Bool asFloats)
{
  Real numbers[Count];
  if (asFloats) {
    for (LLong i = 0; i < Count; ++i)
      numbers[i] = static_cast<Real>(bytes::CleanReal(bytes::GetBig<ULong>(place + i * 4)));
  } else {
    for (LLong i = 0; i < Count; ++i)
      numbers[i] = bytes::CleanReal(bytes::GetBig<ULLong>(place + i * 8));
  }
  std::memcpy(destination, numbers, sizeof numbers);
}

static_assert(sizeof(Vector) == 3 * sizeof(Real) && sizeof(Matrix) == 12 * sizeof(Real));

} // namespace

HyperFile::HyperFile(BaseDocument* document) : document_(document) {}

HyperFile::~HyperFile()
{
  IgnoreLinks();
  GeFree(chunks_);
  file_.Close();
}

void HyperFile::EndTranslation()
{
  if (translator_)
    translator_->FinishTranslation(false);
}

void HyperFile::IgnoreLinks()
{
  EndTranslation();
  DeleteObj(translator_);
}

Bool HyperFile::Open(ULong ident, const Filename& name, Long mode, Bool errorDialog)
{
  error_ = FILEERROR_NONE;
  problem_ = FileProblem();
  memory_ = AllocationWatch();
  ticks_ = 0;
  readTicks_ = 0;
  length_ = 0;
  chunkDepth_ = 0;
  loopDepth_ = 0;
  mode_ = mode;
  if (mode != kHyperFileRead && mode != kHyperFileWrite)
    return Fail(FILEERROR_INVALID, 0);
  IgnoreLinks();
  translator_ = NewObj<TransArray>();
  if (!translator_)
    return Fail(FILEERROR_MEMORY, 0);
  Bool writing = mode == kHyperFileWrite;
  if (!file_.Open(name, writing ? kFileWrite : kFileRead, errorDialog, kByteOrderBig))
    return FailFromFile(0);
  if (writing ? WriteHeader(ident) : ReadHeader(ident))
    return true;
  LLong position = file_.GetPosition();
  file_.Close();
  return Fail(FILEERROR_WRONG_VALUE, position);
}

Bool HyperFile::WriteHeader(ULong ident)
{
  singlePrecision_ = ident == kBugsIdent;
  if (singlePrecision_)
    return file_.WriteULong(kMagicBugs) && file_.WriteULong(0);
  return file_.WriteULong(kMagicCurrent) && file_.WriteULong(ident) && file_.WriteLong(kVersionCurrent) &&
         file_.WriteUChar(0);
}

Bool HyperFile::ReadHeader(ULong ident)
{
  length_ = file_.GetLength();
  readTicks_ = length_ / 500;
  ULong magicNumber = 0;
  ULong foundIdent = 0;
  if (length_ <= 0 || !file_.ReadULong(magicNumber) || !file_.ReadULong(foundIdent))
    return false;
  const FileMagic* magic = FindFileMagic(magicNumber);
  if (!magic || foundIdent != ident)
    return false;
  singlePrecision_ = magic->singlePrecision;
  if (!magic->fullHeader)
    return true;
  UChar precision = 0;
  if (!file_.ReadLong(version_) || !file_.ReadUChar(precision))
    return false;
  singlePrecision_ = precision != 0;
  return true;
}

Bool HyperFile::Close()
{
  EndTranslation();
  LLong position = file_.GetPosition();
  HasMemory();
  if (!file_.Close() && error_ == FILEERROR_NONE)
    FailFromFile(position);
  return error_ == FILEERROR_NONE;
}

// What goes wrong after a failed allocation went wrong by it.
Bool HyperFile::Fail(Long error, LLong position, Long line)
{
  if (memory_.Failed())
    error = FILEERROR_MEMORY;
  if (problem_.code == FILEERROR_NONE) {
    problem_.code = error;
    problem_.position = position;
    problem_.systemError = file_.GetSystemError();
    NotePath();
  }
  error_ = error;
  ReportAssertion("k2v_file", line, GetFileErrorText(error));
  return false;
}

// Keeps the chunks around the failure; of a deep nest the outermost and the innermost ones.
void HyperFile::NotePath()
{
  constexpr Long kKept = FileProblem::kChunks;
  const Long known = chunkDepth_ < chunkRoom_ ? chunkDepth_ : chunkRoom_;
  problem_.depth = known > 0 ? known : 0;
  const Long left = known > kKept ? known - kKept : 0; // out in the middle
  for (Long i = 0; i < kKept && i < known; ++i)
    problem_.chunks[i] = chunks_[i < kKept / 2 ? i : i + left].id;
}

Bool HyperFile::FailFromFile(LLong position, Long line)
{
  Long error = file_.GetError();
  return error != FILEERROR_NONE && Fail(error, position, line);
}

void HyperFile::SetError(Long error, Long line)
{
  if (error != FILEERROR_NONE)
    Fail(error, file_.GetPosition(), line);
}

void HyperFile::SetReadProgress(ReadProgressHook hook, void* userData)
{
  readHook_ = hook;
  readHookData_ = userData;
}

void HyperFile::SetWriteProgress(WriteProgressHook hook, void* userData)
{
  writeHook_ = hook;
  writeHookData_ = userData;
}

void HyperFile::CallWriteHook()
{
  if (writeHook_)
    writeHook_(static_cast<Long>(static_cast<ULong>(file_.GetPosition())), writeHookData_);
  ticks_ = 0;
}

void HyperFile::CallReadHook()
{
  if (readHook_ && length_ > 0) {
    Real percent = 100.0 * static_cast<Real>(file_.GetPosition()) / static_cast<Real>(length_);
    readHook_(static_cast<Long>(percent), readHookData_);
  }
  ticks_ = 0;
}

// A tick is due when the counter has reached the threshold; the counter then goes on from 1.
LLong HyperFile::GetTicksToDue() const
{
  LLong wait = GetTickThreshold() - ticks_;
  return wait > 0 ? wait + 1 : 1;
}

LLong HyperFile::LimitToTick(LLong limit) const
{
  if (!HasHook())
    return limit;
  LLong due = GetTicksToDue();
  return due < limit ? due : limit;
}

// At least one tick is due, unless there are none at all.
void HyperFile::TickManySlow(LLong count)
{
  if (count <= 0)
    return;
  if (HasHook()) {
    ticks_ += count - 1;
    mode_ == kHyperFileWrite ? TickWrite() : TickRead();
  } else {
    LLong period = GetTickThreshold() > 0 ? GetTickThreshold() : 1;
    ticks_ = 1 + (count - GetTicksToDue()) % period;
  }
}

Bool HyperFile::EnterLoop()
{
  if (error_ != FILEERROR_NONE)
    return false;
  if (loopDepth_ >= kMaxLoopDepth || !HasStackRoom())
    return Fail(FILEERROR_TOO_DEEP, file_.GetPosition());
  ++loopDepth_;
  return true;
}

Bool HyperFile::ReadHeaderSlow(UChar& tag)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  if (!file_.ReadUChar(tag))
    return FailFromFile(start);
  chunkDepth_ += (tag == kTagChunkStart ? 1 : 0) - (tag == kTagChunkEnd ? 1 : 0);
  return true;
}

Bool HyperFile::ExpectTag(UChar tag)
{
  LLong start = file_.GetPosition();
  UChar found = 0;
  if (!ReadValueHeader(found))
    return false;
  if (found == tag)
    return true;
  if (found == kTagChunkStart)
    --chunkDepth_; // nobody knows its id
  return Fail(FILEERROR_WRONG_VALUE, start);
}

Bool HyperFile::PutSlow(UChar tag, ULLong bits, LLong size)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  UChar raw[9] = {tag};
  for (LLong i = 0; i < size; ++i)
    raw[1 + i] = static_cast<UChar>(bits >> (8 * (size - 1 - i)));
  if (!file_.WriteBytes(raw, 1 + size))
    return FailFromFile(start);
  TickWrite();
  return true;
}

Bool HyperFile::GetSlow(UChar tag, ULLong& bits, LLong size)
{
  LLong start = file_.GetPosition();
  UChar raw[8];
  if (!ExpectTag(tag))
    return false;
  if (file_.ReadBytes(raw, size) != size)
    return FailFromFile(start);
  bits = 0;
  for (LLong i = 0; i < size; ++i)
    bits = (bits << 8) | raw[i];
  TickRead();
  return true;
}

Bool HyperFile::ReadPlainLong(Long& value)
{
  LLong start = file_.GetPosition();
  UChar raw[4];
  const UChar* place = TakeBytes(raw, sizeof raw);
  if (!place)
    return FailFromFile(start);
  value = static_cast<Long>(bytes::GetBig<ULong>(place));
  return true;
}

template <LLong Count>
Bool HyperFile::PutReals(UChar tag, const void* values, Bool asFloats)
{
  if (error_ != FILEERROR_NONE)
    return false;
  LLong start = file_.GetPosition();
  LLong size = 1 + Count * (asFloats ? 4 : 8);
  UChar raw[1 + Count * 8];
  UChar* place = TakeRoom(raw, size);
  place[0] = tag;
  PackReals<Count>(place + 1, values, asFloats);
  if (!FinishRoom(place, raw, size))
    return FailFromFile(start);
  TickWrite();
  return true;
}

template <LLong Count>
Bool HyperFile::GetReals(UChar tag, void* values, Bool asFloats)
{
  const LLong size = Count * (asFloats ? 4 : 8);
  const UChar* place = error_ == FILEERROR_NONE ? file_.ReadWindow(1 + size) : nullptr;
  if (place && place[0] == tag) {
    ++place;
    file_.CommitRead(1 + size);
    UnpackReals<Count>(place, values, asFloats);
    TickRead();
    return true;
  }
  const LLong start = file_.GetPosition();
  UChar raw[Count * 8];
  if (!ExpectTag(tag))
    return false;
  place = TakeBytes(raw, size);
  if (!place)
    return FailFromFile(start);
  UnpackReals<Count>(place, values, asFloats);
  TickRead();
  return true;
}

Bool HyperFile::WriteTime(const BaseTime& value)
{
  Real numbers[2] = {value.GetNumerator(), value.GetDenominator()};
  return PutReals<2>(kTagTime, numbers, singlePrecision_);
}
Bool HyperFile::WriteVector(const Vector& value) { return PutReals<3>(kTagVector, &value, singlePrecision_); }
Bool HyperFile::WriteLVector(const Vector& value) { return PutReals<3>(kTagLVector, &value, false); }
Bool HyperFile::WriteSVector(const Vector& value) { return PutReals<3>(kTagSVector, &value, true); }
Bool HyperFile::WriteMatrix(const Matrix& value) { return PutReals<12>(kTagMatrix, &value, singlePrecision_); }
Bool HyperFile::WriteLMatrix(const Matrix& value) { return PutReals<12>(kTagLMatrix, &value, false); }
Bool HyperFile::WriteSMatrix(const Matrix& value) { return PutReals<12>(kTagSMatrix, &value, true); }

Bool HyperFile::ReadTime(BaseTime& value)
{
  Real numbers[2];
  if (!GetReals<2>(kTagTime, numbers, singlePrecision_))
    return false;
  value = BaseTime::Raw(numbers[0], numbers[1]);
  return true;
}
Bool HyperFile::ReadVector(Vector& value) { return GetReals<3>(kTagVector, &value, singlePrecision_); }
Bool HyperFile::ReadLVector(Vector& value) { return GetReals<3>(kTagLVector, &value, false); }
Bool HyperFile::ReadSVector(Vector& value) { return GetReals<3>(kTagSVector, &value, true); }
Bool HyperFile::ReadMatrix(Matrix& value) { return GetReals<12>(kTagMatrix, &value, singlePrecision_); }
Bool HyperFile::ReadLMatrix(Matrix& value) { return GetReals<12>(kTagLMatrix, &value, false); }
Bool HyperFile::ReadSMatrix(Matrix& value) { return GetReals<12>(kTagSMatrix, &value, true); }

} // namespace _torvane_
