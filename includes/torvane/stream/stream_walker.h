// Walks the values of a file one by one, whatever chunks they stand in and whether anybody knows these or not.
#pragma once

#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

// One value of the stream. Which members hold something follows from the tag.
struct StreamValue
{
  static constexpr Long kMostReals = 12;
  static constexpr Long kHeadBytes = 16;

  LLong offset = 0; // of the tag byte
  UChar tag = 0;
  Long realCount = 0;
  Real reals[kMostReals] = {}; // floats of all kinds, vectors, matrices, times
  LLong integer = 0;           // whole numbers; the element type of an Array
  String text;                 // String and Filename
  LLong size = 0;              // bytes of a text, Memory, Image and the legacy forms; elements of an Array
  Long headCount = 0;
  UChar head[kHeadBytes] = {}; // the first bytes of Memory, Image, the legacy forms and Array, its elements
  ChunkPlace chunk;            // of a chunk start
};

// Reads a file from its first value to its last.
class StreamWalker
{
 public:
  // False if the file is none with that ident.
  Bool Open(const Filename& name, ULong ident = kSceneIdent);

  // The next value; false behind the last one, and where one can't be read.
  Bool Next(StreamValue& value);

  // From now on Next hands every byte of Memory, Image, Array and the legacy forms to `take`, in pieces, where it would
  // pass over them else; null ends that. An Array's bytes are those of its elements.
  using BlockReader = void (*)(void* context, const UChar* bytes, LLong size);
  void ReadBlocksInto(BlockReader take, void* context)
  {
    takeBlock_ = take;
    blockContext_ = context;
  }

  // What went wrong, where and why; code 0 while all is well. A file that ends inside a chunk is a problem too.
  const FileProblem& GetProblem() const { return file_.GetProblem(); }
  // The place and the reason for people, more exact than GetProblemText: "byte 90, in chunk 110059/110024: a text is
  // longer than the file".
  String GetProblemText() const;

  // The chunks that enclose the value that Next gave last: how many, and each of them, 0 for the outermost one. A chunk
  // start isn't among its own.
  Long GetDepth() const { return depth_; }
  ChunkPlace GetChunk(Long index) const { return index < depth_ ? file_.GetChunk(index) : ChunkPlace(); }
  // "110059/110107/5100", outermost first; "-" outside of all chunks.
  String GetPathText() const;

  Long GetFileVersion() const { return file_.GetFileVersion(); }
  Bool IsSinglePrecision() const { return file_.IsSinglePrecision(); }
  LLong GetLength() const { return file_.GetLength(); }

 private:
  Bool Fail(const StreamValue& value, Long error, const String& reason, Long line = __builtin_LINE());
  Bool ReadBody(StreamValue& value, const ValueForm& form);
  Bool FailCut(const StreamValue& value, Long line = __builtin_LINE());
  Bool ReadNumbers(StreamValue& value, const ValueForm& form);
  Bool ReadText(StreamValue& value, LLong size);
  Bool ReadBlock(StreamValue& value, const UChar* start, LLong startSize, LLong size);

  Bool PassBlock(LLong size);

  HyperFile file_;
  BlockReader takeBlock_ = nullptr;
  void* blockContext_ = nullptr;
  Long depth_ = 0;
  String reason_;
};

// The name of a value tag: "Long", "Vector", "old points"; null for one that no file should hold.
const char* GetValueTagName(UChar tag);

} // namespace _torvane_
