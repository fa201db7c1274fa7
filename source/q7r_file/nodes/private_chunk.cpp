#include "torvane/nodes/private_chunk.h"

#include "k2v_file/memory/stack_room.h"
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

// Holds one level of nesting open. Root lists take none: they only nest with the nodes that hold them.
class LoopScope
{
 public:
  LoopScope(HyperFile& file, const PrivateChunk& chunk)
      : file_(file), counted_(!chunk.IsRootList()), entered_(!counted_ || file.EnterLoop())
  {}
  ~LoopScope()
  {
    if (counted_ && entered_)
      file_.LeaveLoop();
  }
  LoopScope(const LoopScope&) = delete;
  LoopScope& operator=(const LoopScope&) = delete;

  Bool Entered() const { return entered_; }

 private:
  HyperFile& file_;
  Bool counted_;
  Bool entered_;
};

} // namespace

Bool PrivateChunk::ReadChunk(HyperFile&, Long, Long) { return false; }

void PrivateChunk::WriteChunks(HyperFile&) {}

Bool PrivateChunk::CopyTo(PrivateChunk&, ULong, TransArray*) { return true; }

Bool PrivateChunk::GetParameter(const ParameterPath&, GeData&) { return false; }

Bool PrivateChunk::SetParameter(const ParameterPath&, const GeData&) { return false; }

// Where a loop stands.
struct PrivateChunk::Loop
{
  Bool keepGoing;
  Bool isOfList;         // the chunks are those of a root list
  Long inside = 0;       // chunks that were entered and not yet left
  Bool finished = false; // the loop ends with `result`
  Bool result = false;

  Bool End(Bool value)
  {
    finished = true;
    result = value;
    return value;
  }
};

// An end mark: that of a chunk that the loop had entered, or that of the loop. It is inline, as what follows, since a
// scene holds little else than small chunks.
inline Bool PrivateChunk::EndLoopChunk(HyperFile& file, Loop& loop)
{
  const Bool read = file.ReadChunkEndMark();
  if (loop.inside == 0 || !read)
    return loop.End(read);
  --loop.inside;
  return true;
}

// One round of the loop.
inline Bool PrivateChunk::ReadOneChunk(HyperFile& file, Loop& loop)
{
  UChar tag = 0;
  ChunkPlace chunk;
  if (!file.ReadHeaderOrStart(tag, chunk))
    return false;
  if (tag == kTagChunkEnd)
    return EndLoopChunk(file, loop);
  if (tag != kTagChunkStart) {
    file.SetError(FILEERROR_CHUNK_STRUCTURE);
    return loop.End(false);
  }
  const auto [id, level] = chunk;
  if (loop.isOfList && EntersChunk(id)) {
    ++loop.inside;
    return true;
  }
  const LLong body = file.GetPosition();
  const Bool keepGoing = loop.keepGoing || loop.inside > 0;
  const Bool taken = ReadChunk(file, id, level);
  if (!taken && !file.HasMemory()) // not a chunk of somebody else: one that could not be built
    return loop.End(false);
  if (!taken && !(keepGoing && file.GetPosition() == body && KeepChunk(file, id, level))) {
    const Bool skipped = file.SkipToEndChunk();
    if (!keepGoing)
      return loop.End(skipped);
    if (!skipped)
      return false;
  }
  if (EndsPartialLoad(file, id, level))
    return loop.End(true);
  return file.HasMemory() || loop.End(false);
}

Bool PrivateChunk::ReadChunkLoop(HyperFile& file, Bool keepGoing, Bool)
{
  if (file.GetError() != FILEERROR_NONE)
    return false;
  LoopScope scope(file, *this);
  if (!scope.Entered())
    return false;
  Loop loop{keepGoing, IsRootList()};
  do {
    ReadOneChunk(file, loop);
    if (loop.finished)
      return loop.result;
  } while (file.GetError() == FILEERROR_NONE && file.GetPosition() < file.GetLength());
  // A loop that merely met the end of the file leaves the error clear.
  if (file.GetError() != FILEERROR_NONE)
    file.SetError(FILEERROR_PREMATURE_END);
  return false;
}

// Reads the start of a chunk; an end mark passes.
Bool PrivateChunk::ReadLoopHeader(HyperFile& file)
{
  UChar tag = 0;
  if (!file.ReadValueHeader(tag))
    return false;
  Long id = 0;
  Long level = 0;
  if (tag == kTagChunkStart)
    return file.ReadChunkStart(id, level);
  if (tag == kTagChunkEnd)
    return true;
  file.SetError(FILEERROR_WRONG_VALUE);
  return false;
}

Bool PrivateChunk::ReadChunks(HyperFile& file, Bool consumeHeader)
{
  return (!consumeHeader || ReadLoopHeader(file)) && ReadChunkLoop(file, true);
}

void PrivateChunk::WriteAsChunk(HyperFile& file, Long id)
{
  LoopScope scope(file, *this);
  if (!scope.Entered())
    return;
  file.WriteChunkStart(id, 0);
  WriteChunks(file);
  file.WriteChunkEnd();
}

Bool PrivateChunk::CopyWithTranslation(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  if (!HasStackRoom())
    return false;
  AllocationWatch watch;
  if (translation || (flags & kCopyNoTranslation))
    return CopyTo(destination, flags, translation) && !watch.Failed();
  AliasTranslator translator;
  if (!translator.MakeTranslator() || !CopyTo(destination, flags, translator.GetArray()))
    return false;
  translator.Finish(true);
  return !watch.Failed();
}

Bool PrivateChunk::GetParameterById(Long id, GeData& value)
{
  const AllocationWatch watch;
  return GetParameter(ParameterPath(id), value) && !watch.Failed();
}

Bool PrivateChunk::SetParameterById(Long id, const GeData& value)
{
  const AllocationWatch watch;
  return SetParameter(ParameterPath(id), value) && !watch.Failed();
}

const NodeKind& NodeData::GetOwnerKind() const { return BaseList2D::kNodeKind; }

Bool NodeData::ReadData(HyperFile&, Long, Long) { return false; }

} // namespace _torvane_
