// The layout of a scene file at the level of the document's own chunks.
#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/document/document_info.h"
#include "torvane/document/base_document.h"
#include "torvane/materials/base_material.h"
#include "torvane/pictures/bitmap_filters.h"

namespace _torvane_
{

namespace
{

constexpr Long kDefaultMode = 11;
constexpr Long kOldModeSwitch = 50016; // set when an old file's mode 2 becomes the default mode

// Modes that stay as a file holds them.
constexpr Long kKnownModes[] = {0, 1, 3, 4, 5, 6, 7, 9, 11, 12, 13, 14};

// Tools by their old ids.
struct OldTool
{
  Long oldId;
  Long id;
};

constexpr OldTool kOldTools[] = {
    {12110, 200000089}, {12111, 200000090}, {12152, 200000088}, {12256, 200000086},
    {12572, 200000084}, {12573, 200000085}, {12574, 200000083},
};

constexpr Long kOldToolConstant = 12574; // written in the place of the old tool; the real one follows at level 8

Long CurrentMode(Long mode, BaseContainer& data)
{
  if (mode == 2)
    data.SetBool(kOldModeSwitch, true);
  for (Long known : kKnownModes) {
    if (mode == known)
      return mode;
  }
  return kDefaultMode;
}

Long CurrentTool(Long tool)
{
  for (const OldTool& row : kOldTools) {
    if (row.oldId == tool)
      return row.id;
  }
  return tool;
}

} // namespace

template <>
struct ChunkFields<BaseDocument>
{
  // The picture is read or written by the caller, behind the flag that announces it.
  template <class Visitor>
  static Bool VisitFileInfo(BaseDocument& document, Visitor& v, Bool& hasPreview)
  {
    Long version = kVersionCurrent;
    v.Long(version);
    if constexpr (Visitor::kReading) {
      if (v.Good())
        v.File().SetFileVersion(version);
    }
    if (v.Level() >= 1) {
      if constexpr (Visitor::kReading)
        v.Bool(document.legacyFlag_);
      else
        v.ConstantBool(false);
    }
    if (v.Level() >= 2)
      v.Bool(hasPreview);
    return v.Good();
  }

  template <class Visitor>
  static Bool VisitState(BaseDocument& document, Visitor& v)
  {
    v.Time(document.time_);
    v.Long(document.mode_);
    Long oldTool = kOldToolConstant;
    v.Long(oldTool);
    if constexpr (Visitor::kReading) {
      document.mode_ = CurrentMode(document.mode_, document.data_);
      document.tool_ = CurrentTool(oldTool);
    }
    for (auto& row : document.axisLocks_) {
      for (Bool& lock : row)
        v.Bool(lock);
    }
    for (Long i = 0; i < 16; ++i)
      v.ConstantBool(false);
    v.EmptyFilename();
    v.ConstantBool(false);
    v.ConstantLong(0);
    v.EmptyFilename();
    v.ConstantLong(0);
    VisitOldSettings(document, v);
    if (v.Level() >= 1 || v.VersionBelow(kVersionNodeHeader))
      v.EmptyContainer();
    for (Long i = 0; v.Level() >= 2 && i < 3; ++i)
      v.ConstantVector(Vector());
    if (v.Level() >= 3)
      VisitEmptyNode(v);
    return VisitNewerState(document, v);
  }

  // The first four groups of settings are no longer written, but still read.
  template <class Visitor>
  static Bool VisitOldSettings(BaseDocument& document, Visitor& v)
  {
    for (Long i = 0; i < 4; ++i) {
      if constexpr (Visitor::kReading)
        v.Container(document.settings_[i]);
      else
        v.EmptyContainer();
    }
    v.EmptyContainer();
    return v.Container(document.settings_[4]);
  }

  // A whole node that nothing uses.
  template <class Visitor>
  static Bool VisitEmptyNode(Visitor& v)
  {
    BaseList2D node;
    if constexpr (Visitor::kReading)
      return v.Note(v.Good() && node.ReadChunks(v.File(), true));
    else
      node.WriteAsChunk(v.File(), 0);
    return v.Good();
  }

  template <class Visitor>
  static Bool VisitNewerState(BaseDocument& document, Visitor& v)
  {
    if (v.Level() >= 4) {
      v.ConstantBool(false);
      v.ConstantLong(0);
      v.ConstantLong(0);
      v.ConstantReal(0.5);
      v.ConstantReal(0.5);
      v.ConstantBool(false);
      v.ConstantBool(false);
    }
    if (v.Level() >= 5)
      v.ConstantLong(0);
    if (v.Level() >= 6)
      v.ConstantBool(false);
    if (v.Level() >= 7)
      v.Container(document.settings_[5]);
    if (v.Level() >= 8)
      v.Long(document.tool_);
    if (v.Level() >= 9) {
      v.Long(document.viewNumber_);
      for (Long i = 0; i < BaseDocument::kViewFlagCount - 1; ++i)
        v.Bool(document.viewFlags_[i]);
    }
    // One level alone held a number here.
    if (v.Level() == 10)
      v.template Skip<Long>();
    if (v.Level() >= 12)
      v.Bool(document.viewFlags_[BaseDocument::kViewFlagCount - 1]);
    return v.Good();
  }
};

void BaseDocument::WriteFileInfo(HyperFile& file)
{
  WriteChunk(file, kChunkFileInfo, kLevelFileInfo, [this](ChunkWriter& v) {
    Bool hasPreview = preview_.GetBw() >= 1;
    ChunkFields<BaseDocument>::VisitFileInfo(*this, v, hasPreview);
    return !hasPreview || v.Note(v.Good() && v.File().WriteImage(&preview_, kImageFormatJpeg, nullptr, 0));
  });
}

// A picture that can't be decoded fails the whole load. Only the first of a file counts: decoding thousands of them
// could take hours.
Bool BaseDocument::ReadPreview(HyperFile& file)
{
  if (storedPreview_.GetEncodedSize() > 0) {
    Bitmap dropped;
    return file.ReadImage(dropped);
  }
  if (!file.ReadImage(storedPreview_))
    return false;
  Filename source;
  source.SetMemoryRead(storedPreview_.GetEncoded(), storedPreview_.GetEncodedSize());
  if (JpgLoader().Load(source, preview_, kFirstFrame) == IMAGERESULT_OK)
    return true;
  file.SetError(FILEERROR_WRONG_VALUE);
  return false;
}

Bool BaseDocument::ReadFileInfo(HyperFile& file, Long level)
{
  ChunkReader v(file, level);
  Bool hasPreview = false;
  if (!ChunkFields<BaseDocument>::VisitFileInfo(*this, v, hasPreview))
    return false;
  if (hasPreview && !ReadPreview(file))
    return false;
  // Whoever only wants the picture need not read another byte.
  return (loadFlags_ & LoadPreviewOnly) || file.SkipToEndChunk();
}

void BaseDocument::WriteChunks(HyperFile& file)
{
  StampInfo(data_, kInfoWriterName, kInfoWriterId, kInfoSaveDate);
  if (!file.EnterLoop()) // a reader's loop for the document itself
    return;
  file.WriteChunkStart(kChunkDocumentState, 0);
  WriteFileInfo(file);
  BaseList2D::WriteChunks(file);
  const struct
  {
    RootList2D* root;
    Long id;
  } roots[] = {{materials_, kChunkMaterialRoot},
               {objects_, kChunkObjectRoot},
               {layers_, kChunkLayerRoot},
               {renderData_, kChunkRenderDataRoot},
               {viewPanels_, kChunkViewPanelRoot}};
  for (const auto& [root, id] : roots) {
    if (root && root->HasContent())
      root->WriteAsChunk(file, id);
  }
  pref_.WriteChunks(file);
  WriteChunk(file, kChunkDocumentState, kLevelDocumentState,
             [this](ChunkWriter& v) { return ChunkFields<BaseDocument>::VisitState(*this, v); });
  file.WriteChunkEnd();
  file.LeaveLoop();
}

Bool BaseDocument::ReadRoot(HyperFile& file, RootList2D* root, Bool wanted)
{
  if (!wanted)
    return file.SkipToEndChunk();
  return root && root->ReadChunkLoop(file, false);
}

Bool BaseDocument::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseList2D::ReadChunk(file, id, level))
    return true;
  switch (id) {
  case kChunkFileInfo:
    return ReadFileInfo(file, level);
  case kChunkOldDocument:
    return file.SkipToEndChunk();
  case kChunkRenderDataRoot:
    return ReadRoot(file, renderData_, true);
  case kChunkViewPanelRoot:
    return ReadRoot(file, viewPanels_, true);
  case kChunkLayerRoot:
    return ReadRoot(file, layers_, true);
  case kChunkObjectRoot:
    return ReadRoot(file, objects_, (loadFlags_ & LoadObjects) != 0);
  case kChunkMaterialRoot:
    return ReadRoot(file, materials_, (loadFlags_ & LoadMaterials) != 0);
  case kChunkDocumentPref:
    return pref_.ReadChunk(file, id, level);
  case kChunkDocumentState:
    return ReadChunkBody(file, level,
                         [this](ChunkReader& v) { return ChunkFields<BaseDocument>::VisitState(*this, v); });
  default:
    return false;
  }
}

BaseDocument* CreateDocument()
{
  AllocationWatch watch;
  BaseDocument* document = BaseDocument::Alloc();
  if (document)
    StampInfo(document->GetDataInstance(), kInfoCreatorName, kInfoCreatorId, kInfoCreationDate);
  return watch.Whole(document);
}

Bool SaveDocument(BaseDocument* document, const Filename& name, Long, FileProblem* problem)
{
  if (problem)
    *problem = {FILEERROR_INVALID};
  if (!document)
    return false;
  HyperFile file(document);
  Bool opened = file.Open(kSceneIdent, name, kHyperFileWrite);
  if (opened) {
    document->WriteChunks(file);
    file.Close();
  }
  if (problem)
    *problem = file.GetProblem();
  return opened;
}

namespace
{

Bool ReadDocument(BaseDocument& document, HyperFile& file, const Filename& name, Long loadFlags)
{
  document.SetDirectory(name.GetDirectory());
  document.SetFileName(name.GetFile());
  document.SetLoadFlags(loadFlags);
  if (!file.Open(kSceneIdent, name, kHyperFileRead))
    return false;
  if (document.GetNodeSink())
    file.IgnoreLinks();
  if ((loadFlags & LoadRequireCurrent) && file.GetFileVersion() < kVersionRequired)
    return file.Fail(FILEERROR_OLD_VERSION, file.GetPosition());
  if (!document.ReadChunks(file, true)) {
    // A file that just ends sets no error.
    if (file.GetError() == FILEERROR_NONE)
      file.SetError(FILEERROR_PREMATURE_END);
    return false;
  }
  document.SetLoadedVersion(file.GetFileVersion());
  return true;
}

} // namespace

BaseDocument* LoadDocument(const Filename& name, Long loadFlags, FileProblem* problem, NodeSink* sink)
{
  if (problem)
    *problem = {FILEERROR_MEMORY};
  AllocationWatch watch;
  BaseDocument* document = BaseDocument::Alloc();
  if (!document)
    return nullptr;
  HyperFile file(document);
  document->SetNodeSink(sink);
  Bool read = ReadDocument(*document, file, name, loadFlags);
  document->SetNodeSink(nullptr);
  if (problem)
    *problem = file.GetProblem();
  file.Close();
  // What failed outside of the file, in names and links, makes the load fail as well.
  if (watch.Failed() && problem)
    problem->code = FILEERROR_MEMORY;
  if (!read || watch.Failed())
    DeleteObj(document);
  return document;
}

namespace
{

// Moves every member of `from` to `to`: the first to its top, each further one behind the one before.
void MoveMembers(RootList2D& from, RootList2D& to)
{
  BaseList2D* last = nullptr;
  while (BaseList2D* member = from.GetFirst()) {
    member->RemoveFromList();
    to.InsertAfter(member, last);
    last = member;
  }
}

} // namespace

Bool MergeDocument(BaseDocument* target, const Filename& name, Long loadFlags, FileProblem* problem)
{
  if (problem)
    *problem = {FILEERROR_INVALID};
  if (!target)
    return false;
  BaseDocument* document = LoadDocument(name, loadFlags, problem);
  if (!document)
    return false;
  if (loadFlags & LoadMaterials)
    MoveMembers(*document->GetMaterialRoot(), *target->GetMaterialRoot());
  if (loadFlags & LoadObjects)
    MoveMembers(*document->GetObjectRoot(), *target->GetObjectRoot());
  MoveMembers(*document->GetRenderDataRoot(), *target->GetRenderDataRoot());
  MoveMembers(*document->GetLayerRoot(), *target->GetLayerRoot());
  DeleteObj(document);
  return true;
}

} // namespace _torvane_
