// Nodes and their bytes, for the tests of node classes.
#pragma once

#include <vector>

#include "support/byte_writer.h"
#include "support/memory_file.h"
#include "torvane/nodes/base_list.h"

using Bytes = std::vector<std::uint8_t>;

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

// Reads `chunks`, and the end mark that belongs behind them, into the node. True if the whole was read.
inline bool ReadInto(_torvane_::PrivateChunk& node, const Bytes& chunks, std::int32_t version = 13000)
{
  ByteWriter whole;
  whole.Header("Q7R6", version).Append(chunks).End();
  MemoryReadFile memory(whole.bytes);
  return memory.opened && node.ReadChunkLoop(memory.file, true) &&
         memory.file.GetPosition() == static_cast<_torvane_::LLong>(whole.bytes.size());
}
