// Nodes and their bytes.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

#include "support/byte_writer.h"
#include "support/memory_file.h"
#include "torvane/tags/base_tag.h"

using Bytes = std::vector<std::uint8_t>;

// A scene file of those values.
inline Bytes WithHeader(const Bytes& values, std::int32_t version = 13000, std::uint8_t precision = 0)
{
  return ByteWriter().Header("Q7R6", version, precision).Append(values).bytes;
}

// Gives the node the marker 00 01 ... 0F.
inline void SetCountingMarker(_torvane_::BaseList2D& node)
{
  std::uint8_t marker[16];
  for (std::uint8_t i = 0; i < 16; ++i)
    marker[i] = i;
  node.AddUniqueID(_torvane_::kMarkerAppId, marker, 16);
}

inline Bytes BytesOf(_torvane_::PrivateChunk& node)
{
  return WriteToMemory([&](_torvane_::HyperFile& file) { node.WriteChunks(file); });
}

// The chunks that `tag` writes behind those of a plain tag.
inline Bytes OwnChunks(_torvane_::BaseTag& tag)
{
  _torvane_::BaseTag plain(_torvane_::kTagProtection);
  plain.SetName(tag.GetName());
  plain.GetDataInstance() = tag.GetDataInstance();
  const Bytes all = BytesOf(tag);
  return {all.begin() + static_cast<std::ptrdiff_t>(BytesOf(plain).size()), all.end()};
}

// Reads `chunks`, and the end mark that belongs behind them, into the node. True if the whole was read.
inline bool ReadInto(_torvane_::PrivateChunk& node, const Bytes& chunks, std::int32_t version = 13000)
{
  const Bytes whole = ByteWriter().Append(WithHeader(chunks, version)).End().bytes;
  MemoryReadFile memory(whole);
  return memory.opened && node.ReadChunkLoop(memory.file, true) &&
         memory.file.GetPosition() == static_cast<_torvane_::LLong>(whole.size());
}

// The error after an attempt to read `chunks`; 0 if all was read.
inline _torvane_::Long ReadError(_torvane_::PrivateChunk& node, const Bytes& chunks, std::int32_t version = 13000)
{
  MemoryReadFile memory(ByteWriter().Append(WithHeader(chunks, version)).End().bytes);
  const bool read = node.ReadChunkLoop(memory.file, true);
  EXPECT_EQ(read, memory.file.GetError() == 0);
  return memory.file.GetProblem().code;
}

// A parameter that the node must have.
inline _torvane_::GeData ParameterOf(_torvane_::GeListNode& node, _torvane_::Long id)
{
  _torvane_::GeData value;
  EXPECT_TRUE(node.GetParameterById(id, value)) << id;
  return value;
}
