// What tags add to the chunks of every tag.
#pragma once

#include "q7r_file/node_bytes.h"
#include "support/assertion_counter.h"
#include "torvane/tags/base_tag.h"

// The bytes of a link on the goal of an id.
inline std::string Link(std::uint8_t id) { return std::string("alias2\0\0\0\0\0\0\0", 13) + static_cast<char>(id); }

// The chunks that `tag` writes behind those of a plain tag.
inline Bytes OwnChunks(_torvane_::BaseTag& tag)
{
  _torvane_::BaseTag plain(_torvane_::kTagProtection);
  plain.SetName(tag.GetName());
  plain.GetDataInstance() = tag.GetDataInstance();
  const Bytes all = BytesOf(tag);
  return {all.begin() + static_cast<std::ptrdiff_t>(BytesOf(plain).size()), all.end()};
}

// The error after an attempt to read `chunks`; 0 if all was read.
inline _torvane_::Long ReadError(_torvane_::PrivateChunk& node, const Bytes& chunks, std::int32_t version = 13000)
{
  AssertionCounter silence;
  ByteWriter whole;
  whole.Header("Q7R6", version).Append(chunks).End();
  MemoryReadFile memory(whole.bytes);
  const bool read = node.ReadChunkLoop(memory.file, true);
  EXPECT_EQ(read, memory.file.GetError() == 0);
  return memory.file.GetProblem().code;
}
