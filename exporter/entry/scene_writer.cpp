#include "exporter/entry/scene_writer.h"

#include <memory>

#include "exporter/walk/composition.h"
#include "torvane/document/base_document.h"
#include "torvane/stream/hyper_file.h"

namespace exporter
{

using namespace _torvane_;

namespace
{

struct FreeDocument
{
  void operator()(BaseDocument* document) const { BaseDocument::Free(document); }
};

FileProblem lastProblem;

} // namespace

const FileProblem& GetSceneFileProblem() { return lastProblem; }

bool WriteSceneFile(const char* path)
{
  lastProblem = FileProblem();
  if (!path)
    return false;
  if (!String(path, STRINGENCODING_UTF8).Content())
    return true;
  // Both go when the host refuses a suite half-way: the file first, since it still refers to nodes of the document.
  std::unique_ptr<BaseDocument, FreeDocument> document(BaseDocument::Alloc());
  HyperFile file;
  if (!document)
    return false;
  bool opened = file.Open(kSceneIdent, Filename(path), kHyperFileWrite, false);
  if (opened) {
    document->BuildScene(1);
    document->WriteChunks(file);
  }
  file.Close();
  lastProblem = file.GetProblem();
  return opened;
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
