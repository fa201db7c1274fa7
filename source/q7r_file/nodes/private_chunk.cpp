#include "torvane/nodes/private_chunk.h"

#include "torvane/document/base_document.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

namespace
{

// A partial load ends behind the chunk that holds what it is after.
Bool EndsPartialLoad(const HyperFile& file, Long id, Long level)
{
  const BaseDocument* document = file.GetDocument();
  if (!document)
    return false;
  Long flags = document->GetLoadFlags();
  return ((flags & LoadPrefsOnly) && id == kChunkDocumentPref) ||
         ((flags & LoadPreviewOnly) && id == kChunkFileInfo && level == kLevelFileInfo);
}

// Holds one level of nested reading open.
class LoopScope
{
 public:
  explicit LoopScope(HyperFile& file) : file_(file), entered_(file.EnterLoop()) {}
  ~LoopScope()
  {
    if (entered_)
      file_.LeaveLoop();
  }
  LoopScope(const LoopScope&) = delete;
  LoopScope& operator=(const LoopScope&) = delete;

  Bool Entered() const { return entered_; }

 private:
  HyperFile& file_;
  Bool entered_;
};

} // namespace

Bool PrivateChunk::ReadChunk(HyperFile&, Long, Long) { return false; }

void PrivateChunk::WriteChunks(HyperFile&) {}

Bool PrivateChunk::CopyTo(PrivateChunk&, ULong, TransArray*) { return true; }

Bool PrivateChunk::GetParameter(const ParameterPath&, GeData&) { return false; }

Bool PrivateChunk::SetParameter(const ParameterPath&, const GeData&) { return false; }

Bool PrivateChunk::ReadChunkLoop(HyperFile& file, Bool keepGoing, Bool)
{
  if (file.GetError() != FILEERROR_NONE)
    return false;
  LoopScope scope(file);
  if (!scope.Entered())
    return false;
  do {
    Bool finished = false;
    Bool result = ReadOneChunk(file, keepGoing, finished);
    if (finished)
      return result;
  } while (file.GetError() == FILEERROR_NONE && file.GetPosition() < file.GetLength());
  // A loop that merely met the end of the file leaves the error clear.
  if (file.GetError() != FILEERROR_NONE)
    file.SetError(FILEERROR_PREMATURE_END);
  return false;
}

// One round of the loop. `finished` tells that the loop ends with the result.
Bool PrivateChunk::ReadOneChunk(HyperFile& file, Bool keepGoing, Bool& finished)
{
  UChar tag = 0;
  if (!file.ReadValueHeader(tag))
    return false;
  if (tag == kTagChunkEnd) {
    finished = true;
    return file.ReadChunkEndMark();
  }
  if (tag != kTagChunkStart) {
    file.SetError(FILEERROR_CHUNK_STRUCTURE);
    finished = true;
    return false;
  }
  Long id = 0;
  Long level = 0;
  if (!file.ReadChunkStart(id, level))
    return false;
  const LLong body = file.GetPosition();
  const Bool taken = ReadChunk(file, id, level);
  if (!file.HasMemory()) {
    finished = true;
    return false;
  }
  if (!taken && !(keepGoing && file.GetPosition() == body && KeepChunk(file, id, level))) {
    Bool skipped = file.SkipToEndChunk();
    if (!keepGoing) {
      finished = true;
      return skipped;
    }
    if (!skipped)
      return false;
  }
  if (EndsPartialLoad(file, id, level)) {
    finished = true;
    return true;
  }
  finished = !file.HasMemory();
  return false;
}

Bool PrivateChunk::ReadChunks(HyperFile& file, Bool consumeHeader)
{
  if (consumeHeader) {
    UChar tag = 0;
    if (!file.ReadValueHeader(tag))
      return false;
    Long id = 0;
    Long level = 0;
    if (tag == kTagChunkStart) {
      if (!file.ReadChunkStart(id, level))
        return false;
    } else if (tag != kTagChunkEnd) {
      file.SetError(FILEERROR_WRONG_VALUE);
      return false;
    }
  }
  return ReadChunkLoop(file, true);
}

void PrivateChunk::WriteAsChunk(HyperFile& file, Long id)
{
  file.WriteChunkStart(id, 0);
  WriteChunks(file);
  file.WriteChunkEnd();
}

Bool PrivateChunk::CopyWithTranslation(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  AllocationWatch watch;
  if (translation || (flags & kCopyNoTranslation))
    return CopyTo(destination, flags, translation) && !watch.Failed();
  AliasTranslator translator;
  if (!translator.MakeTranslator() || !CopyTo(destination, flags, translator.GetArray()))
    return false;
  translator.Finish(true);
  return !watch.Failed();
}

Bool PrivateChunk::GetParameterById(Long id, GeData& value) { return GetParameter(ParameterPath(id), value); }

Bool PrivateChunk::SetParameterById(Long id, const GeData& value) { return SetParameter(ParameterPath(id), value); }

const NodeKind& NodeData::GetOwnerKind() const { return BaseList2D::kNodeKind; }

Bool NodeData::ReadData(HyperFile&, Long, Long) { return false; }

} // namespace _torvane_
