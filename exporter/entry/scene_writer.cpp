#include "exporter/entry/scene_writer.h"

#include <exception>
#include <filesystem>
#include <string>

#include "exporter/walk/composition.h"
#include "torvane/document/base_document.h"
#include "torvane/memory/owned.h"
#include "torvane/stream/hyper_file.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

thread_local FileProblem lastProblem; // a host that isn't After Effects may export several at a time

// The document, built from the active composition, in the open file. False when memory ran out: the file is then of no
// use.
bool BuildAndWrite(BaseDocument& document, HyperFile& file)
{
  const AllocationWatch watch;
  document.BuildScene(1);
  if (watch.Failed())
    return false;
  document.WriteChunks(file);
  return !watch.Failed();
}

void RemoveFile(const Filename& name)
{
  const String& path = name.GetString();
  try {
    std::error_code ignored;
    const std::u16string characters(path.Data(), path.Data() + path.GetLength());
    std::filesystem::remove(std::filesystem::path(characters), ignored);
  } catch (const std::exception&) {
    return; // a path without another form, or no memory for it: an empty file stays
  }
}

} // namespace

const FileProblem& GetSceneFileProblem() { return lastProblem; }

bool WriteSceneFile(const char* path)
{
  lastProblem = FileProblem();
  if (!path)
    return false;
  const AllocationWatch watch;
  const Filename name(path);
  const bool hasPath = String(path, STRINGENCODING_UTF8).Content();
  if (watch.Failed() || !hasPath)
    return !watch.Failed();
  // Both go when the host refuses a suite half-way: the file first, since it still refers to nodes of the document.
  const Owned<BaseDocument> document(BaseDocument::Alloc());
  HyperFile file;
  if (!document)
    return false;
  if (!file.Open(kSceneIdent, name, kHyperFileWrite, false)) {
    lastProblem = file.GetProblem();
    file.Close();
    return false;
  }
  const bool whole = BuildAndWrite(*document, file);
  file.Close();
  lastProblem = file.GetProblem();
  if (!whole)
    RemoveFile(name);
  return whole;
}

} // namespace exporter

namespace _torvane_
{

Bool BaseDocument::BuildScene(Long)
{
  exporter::ExportComposition(this);
  return true;
}

} // namespace _torvane_
