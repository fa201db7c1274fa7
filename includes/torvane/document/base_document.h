// The document: the root lists of a scene and its settings; saving, loading, merging, copying.
#pragma once

#include "torvane/bytes/file_errors.h"
#include "torvane/layers/layer_object.h"
#include "torvane/nodes/base_list.h"
#include "torvane/objects/base_object.h"
#include "torvane/pictures/bitmap.h"
#include "torvane/render/render_data.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/text/filename.h"
#include "torvane/time/base_time.h"

namespace _torvane_
{

// What LoadDocument reads. A new document has the first two set.
inline constexpr Long LoadObjects = 1;
inline constexpr Long LoadMaterials = 2;
inline constexpr Long LoadRequireCurrent = 512; // refuse files below version 12600
inline constexpr Long LoadPreviewOnly = 1024;   // stop behind the file information
inline constexpr Long LoadPrefsOnly = 2048;     // stop behind the document preferences

// Parameters of a document.
inline constexpr Long kDocumentTime = 1000;
inline constexpr Long kDocumentFps = 1001;
inline constexpr Long kDocumentMinTime = 1002;
inline constexpr Long kDocumentMaxTime = 1003;
inline constexpr Long kDocumentLoopMin = 1004;
inline constexpr Long kDocumentLoopMax = 1005;
inline constexpr Long kDocumentPrefReal = 1006;
inline constexpr Long kDocumentPrefLastBool = 1007;
inline constexpr Long kDocumentPrefFirstBool = 1008; // to 1011
inline constexpr Long kDocumentPath = 1012;
inline constexpr Long kDocumentFile = 1013;
inline constexpr Long kDocumentFirstAxisLock = 1014; // to 1017
inline constexpr Long kDocumentMode = 1019;
inline constexpr Long kDocumentTool = 1020;
inline constexpr Long kDocumentInverseSwitch = 1022;
inline constexpr Long kDocumentCreatorText = 2002;
inline constexpr Long kDocumentWriterText = 2005;
inline constexpr Long kDocumentCreationText = 2021;
inline constexpr Long kDocumentSaveText = 2023;
inline constexpr Long kDocumentColor = 2112; // read only; which one it is tells the entry 2113

// Entries of the document container that tell who made and wrote the file, and when (a Julian day whose bits stand in
// an LLong).
inline constexpr Long kInfoCreatorName = 2000;
inline constexpr Long kInfoCreatorId = 2001;
inline constexpr Long kInfoWriterName = 2003;
inline constexpr Long kInfoWriterId = 2004;
inline constexpr Long kInfoCreationDate = 2020;
inline constexpr Long kInfoSaveDate = 2022;

class BaseMaterial;
class NodeSink;
class ViewPanel;

// What the preferences hold: a copy takes it over in one piece.
class DocumentPrefValues
{
 protected:
  Long fps_ = 30;
  BaseTime minTime_;
  BaseTime maxTime_;
  BaseTime loopMin_;
  BaseTime loopMax_;
  Bool bools_[4] = {true, true, true, true};
  Real real_ = 1.0;
  Bool lastBool_ = false;
};

// Frame rate and time range of a document.
class DocumentPref : public GeListNode, protected DocumentPrefValues
{
 public:
  static constexpr NodeKindOf<DocumentPref> kNodeKind{"document preferences", &GeListNode::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  DocumentPref();

  Long GetDiskType() const override { return kChunkDocumentPref; }
  // Writes the one chunk of preferences, without the node bits of the base class.
  void WriteChunks(HyperFile& file) override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;

  Long GetFps() const { return fps_; }
  void SetFps(Long fps); // clamped to 1 to 1000
  const BaseTime& GetMinTime() const { return minTime_; }
  const BaseTime& GetMaxTime() const { return maxTime_; }
  const BaseTime& GetLoopMin() const { return loopMin_; }
  const BaseTime& GetLoopMax() const { return loopMax_; }
  // A minimum below -600 seconds is raised to that; a maximum below the minimum is raised to it; the loop marks are
  // brought into the range.
  void SetMinTime(const BaseTime& time);
  // Raised to the minimum when below it; the loop marks are brought into the range.
  void SetMaxTime(const BaseTime& time);
  void SetLoopMin(const BaseTime& time); // brought into the range
  void SetLoopMax(const BaseTime& time);

  Bool GetBool(Long index) const { return bools_[index]; } // 0 to 3
  void SetBool(Long index, Bool value) { bools_[index] = value; }
  Real GetReal() const { return real_; }
  void SetReal(Real value) { real_ = value; }
  Bool GetLastBool() const { return lastBool_; }
  void SetLastBool(Bool value) { lastBool_ = value; }

 private:
  friend struct ChunkFields<DocumentPref>;

  void BringIntoRange(BaseTime& time) const;
};

class BaseDocument : public BaseList2D
{
 public:
  static constexpr NodeKindOf<BaseDocument> kNodeKind{"document", &BaseList2D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // With its root lists, one set of render settings and every default. The roots come from the client's hooks; see
  // IsComplete.
  BaseDocument();
  ~BaseDocument() override;

  // A new document; null when memory is short.
  static BaseDocument* Alloc();
  // Deletes a document and sets the pointer to null.
  static void Free(BaseDocument*& document) { DeleteObj(document); }

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  // Writes the whole content of a scene file behind the header, and stamps the document with writer and date first.
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;

  // Fills the document with a scene. The client defines it.
  virtual Bool BuildScene(Long flag);

  // False when a root list could not be made.
  Bool IsComplete() const;

  RootObject* GetObjectRoot() const { return objects_; }
  RootMaterial* GetMaterialRoot() const { return materials_; }
  RootLayer* GetLayerRoot() const { return layers_; }
  RootRenderData* GetRenderDataRoot() const { return renderData_; }
  RootViewPanel* GetViewPanelRoot() const { return viewPanels_; }

  BaseObject* GetFirstObject() const;
  BaseMaterial* GetFirstMaterial() const;
  LayerObject* GetFirstLayer() const;
  RenderData* GetFirstRenderData() const;
  // The first set whose info has bit 2, else the first, else null.
  RenderData* GetActiveRenderData() const;

  // Insert at the top of the list, or behind `after`. The document owns what is inserted.
  void InsertObject(BaseObject* object, BaseObject* after = nullptr);
  void InsertMaterial(BaseMaterial* material, BaseMaterial* after = nullptr);
  void InsertLayer(LayerObject* layer, LayerObject* after = nullptr);
  void InsertRenderData(RenderData* renderData, RenderData* after = nullptr);

  // Points the first view's scene camera at `camera`; makes the view if there is none. False unless it is a camera
  // object.
  Bool SetSceneCamera(BaseObject* camera);

  DocumentPref& GetPref() { return pref_; }
  const DocumentPref& GetPref() const { return pref_; }
  // The preview picture; its pixels are what a file is given, as JPEG.
  Bitmap& GetPreview() { return preview_; }
  // The preview of a loaded document as its file held it: encoded, and not touched by changes of the preview.
  const Bitmap& GetStoredPreview() const { return storedPreview_; }
  Long GetLoadFlags() const { return loadFlags_; }
  void SetLoadFlags(Long flags) { loadFlags_ = flags; }
  // Who gets the objects and materials that are read, in the place of the document's lists; null: the lists.
  NodeSink* GetNodeSink() const { return nodeSink_; }
  void SetNodeSink(NodeSink* sink) { nodeSink_ = sink; }
  const BaseTime& GetTime() const { return time_; }
  Long GetMode() const { return mode_; }
  Long GetActiveTool() const { return tool_; }
  // The version of the file that the document came from; the current one for a new document.
  Long GetLoadedVersion() const { return loadedVersion_; }
  void SetLoadedVersion(Long version) { loadedVersion_ = version; }
  void SetDirectory(const Filename& directory) { directory_ = directory; }
  void SetFileName(const Filename& name) { fileName_ = name; }
  BaseContainer& GetSettings(Long index) { return settings_[index]; } // 0 to 5

 protected:
  GeListNode* MakeEmpty() const override { return Alloc(); }

 private:
  friend struct ChunkFields<BaseDocument>;

  struct Parameter; // a row of the table of parameters

  Bool ReadPreview(HyperFile& file);
  Bool ReadFileInfo(HyperFile& file, Long level);
  void WriteFileInfo(HyperFile& file);
  Bool ReadRoot(HyperFile& file, RootList2D* root, Bool wanted);
  void SetContainerDefaults();
  Bool GetOwnParameter(Long id, GeData& value) const;
  Bool GetBackColor(const ParameterPath& path, GeData& value) const;
  Bool CopyContent(BaseDocument& destination, ULong flags, TransArray* translation);
  Bool CopyRoots(BaseDocument& destination, ULong flags, TransArray* translation);
  Long AxisLockRow() const;

  static constexpr Long kAxisRows = 4;
  static constexpr Long kSettingsCount = 6;
  static constexpr Long kViewFlagCount = 12;

  RootObject* objects_ = nullptr; // the roots are owned
  RootMaterial* materials_ = nullptr;
  RootLayer* layers_ = nullptr;
  RootRenderData* renderData_ = nullptr;
  RootViewPanel* viewPanels_ = nullptr;
  Bool legacyFlag_ = false;
  Bitmap preview_;
  Bitmap storedPreview_;
  Long loadFlags_ = LoadObjects | LoadMaterials;
  NodeSink* nodeSink_ = nullptr; // not owned; while a file is read
  BaseTime time_;
  Long mode_ = 11;
  Long secondMode_ = 11;
  Long tool_ = 200000088;
  Long secondTool_ = 200000083;
  Long spare_ = 0;
  Bool axisLocks_[kAxisRows][4];
  Filename directory_;
  Filename fileName_;
  DocumentPref pref_;
  BaseContainer settings_[kSettingsCount];
  Long viewNumber_ = 1;
  Bool viewFlags_[kViewFlagCount] = {false, false, true, false, true, false, false, false, false, false, false, false};
  Long loadedVersion_ = kVersionCurrent;
};

// A new document with its creation information; null when memory is short. The caller owns it.
BaseDocument* CreateDocument();

// Reads a scene file. Null on failure: there is no partial document. `problem` then tells why and where. With a `sink`
// the document is without objects and materials, which go to the sink one by one, and without links: memory is then
// taken for one object at a time.
BaseDocument* LoadDocument(const Filename& name, Long loadFlags, FileProblem* problem = nullptr,
                           NodeSink* sink = nullptr);

// Writes a scene file under its final name. True if the file was opened; a write that fails later leaves a file that is
// cut short, which `problem` tells (its code is 0 after a whole write). The flags have no effect.
Bool SaveDocument(BaseDocument* document, const Filename& name, Long flags, FileProblem* problem = nullptr);

// Loads a file and moves its nodes to the top of the lists of `target`, in their order: materials and objects as the
// flags ask, render settings and layers always. False for a null target or a failed load.
Bool MergeDocument(BaseDocument* target, const Filename& name, Long loadFlags, FileProblem* problem = nullptr);

} // namespace _torvane_
