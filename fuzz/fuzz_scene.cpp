// Any bytes as a scene file: loading ends, gives a document or a reason, and what was loaded can be written, read again
// and copied.
#include <cstddef>
#include <cstdint>

#include "support/document_invariants.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/assertion.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/text/filename.h"

using namespace _torvane_;

namespace
{

void Require(bool holds)
{
  if (!holds)
    __builtin_trap();
}

BaseDocument* Load(const void* data, LLong size, FileProblem& problem)
{
  Filename name;
  name.SetMemoryRead(data, size);
  return LoadDocument(name, LoadObjects | LoadMaterials, &problem);
}

void WriteAndReadAgain(BaseDocument& document)
{
  MemoryDescription description;
  Filename name;
  name.SetMemoryWrite(&description);
  FileProblem problem;
  Require(SaveDocument(&document, name, 0, &problem));
  if (problem.code == FILEERROR_TOO_DEEP) // old files say less of each node: they may nest deeper
    return;
  Require(problem.code == FILEERROR_NONE);
  const void* data = nullptr;
  LLong size = 0;
  Require(name.GetMemoryContinuous(data, size));
  BaseDocument* again = Load(data, size, problem);
  Require(again && !DocumentInvariants::FindBroken(*again));
  BaseDocument::Free(again);
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
  SetAssertionLog(nullptr);
  FileProblem problem;
  BaseDocument* document = Load(data, static_cast<LLong>(size), problem);
  Require(document || problem.code != FILEERROR_NONE);
  if (!document)
    return 0;
  Require(!DocumentInvariants::FindBroken(*document));
  WriteAndReadAgain(*document);
  BaseDocument* copy = BaseDocument::Alloc();
  // An object of a type that has no class can't be copied; what fails leaves nothing behind.
  Require(copy && (document->CopyWithTranslation(*copy, 0, nullptr) || !copy->GetFirstObject()));
  Require(!DocumentInvariants::FindBroken(*copy));
  BaseDocument::Free(copy);
  BaseDocument::Free(document);
  return 0;
}
