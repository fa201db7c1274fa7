// Whole scene files in memory.
#pragma once

#include <memory>

#include "support/document_invariants.h"
#include "support/memory_file.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/owned.h"

using DocumentPtr = _torvane_::Owned<_torvane_::BaseDocument>;

inline DocumentPtr NewDocument() { return DocumentPtr(_torvane_::CreateDocument()); }

inline std::vector<std::uint8_t> SaveToBytes(_torvane_::BaseDocument& document)
{
  return WriteToMemory([&](_torvane_::HyperFile& file) { document.WriteChunks(file); }, true);
}

// Loads from a heap block of just the file's size, and looks over what was loaded.
inline DocumentPtr LoadFromBytes(const std::vector<std::uint8_t>& bytes,
                                 _torvane_::Long flags = _torvane_::LoadObjects | _torvane_::LoadMaterials,
                                 _torvane_::FileProblem* problem = nullptr)
{
  std::unique_ptr<std::uint8_t[]> block(new std::uint8_t[bytes.size()]);
  std::copy(bytes.begin(), bytes.end(), block.get());
  _torvane_::Filename name;
  name.SetMemoryRead(block.get(), static_cast<_torvane_::LLong>(bytes.size()));
  DocumentPtr document(_torvane_::LoadDocument(name, flags, problem));
  if (const char* broken = document ? DocumentInvariants::FindBroken(*document) : nullptr)
    ADD_FAILURE() << broken;
  return document;
}
