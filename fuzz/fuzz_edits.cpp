// A random sequence of edits on a document, through the public operations. Each byte of the input chooses an operation
// or an argument of one. Every few steps the document's invariants are checked, it is saved, read back and copied, and
// what comes back must hold the same number of everything. Some allocations fail: the operation may fail, the document
// stays whole.
#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <vector>

#include "support/counting_memory.h"
#include "support/document_invariants.h"
#include "torvane/torvane.h"

using namespace _torvane_;

namespace
{

void Require(bool holds)
{
  if (!holds)
    __builtin_trap();
}

void RequireInvariants(BaseDocument& document)
{
  const char* broken = DocumentInvariants::FindBroken(document);
  if (broken)
    std::fprintf(stderr, "%s\n", broken);
  Require(!broken);
}

// The input, byte by byte; zeros behind its end.
class Choices
{
 public:
  Choices(const std::uint8_t* data, std::size_t size) : next_(data), end_(data + size) {}
  bool AtEnd() const { return next_ == end_; }
  int Byte() { return AtEnd() ? 0 : *next_++; }
  template <class T>
  T Of(const std::vector<T>& list)
  {
    return list.empty() ? T{} : list[static_cast<std::size_t>(Byte()) % list.size()];
  }
  template <class T, std::size_t N>
  T Of(const T (&list)[N])
  {
    return list[static_cast<std::size_t>(Byte()) % N];
  }

 private:
  const std::uint8_t* next_;
  const std::uint8_t* end_;
};

constexpr std::size_t kMostObjects = 200;
constexpr LLong kMostMerged = 1 << 18; // bytes: every merge of a document into itself doubles it
constexpr Long kMostKeys = 40;

constexpr Long kObjectTypes[] = {kObjectNull,  kObjectPolygon, kObjectSpline, kObjectLight, kObjectCamera,
                                 kObjectPlane, kObjectPoint,   kObjectJoint,  kObjectSky,   1234567};
constexpr Long kTagTypes[] = {kTagPoint,   kTagPolygon,      kTagDisplay,          kTagTexture, kTagTangent,
                              kTagUVW,     kTagCompositing,  kTagPointSelection,   kTagTarget,  kTagVertexMap,
                              kTagPlugin,  kTagOldVertexMap, kTagEdgeSelection,    kTagNormal,  kTagWeight,
                              kTagSegment, kTagProtection,   kTagPolygonSelection, 7654321};
constexpr Long kParameters[] = {903, 904,  905,  901,  902,  906,  907, 908,   917,   918,  919,  925,  926,
                                928, 1000, 1001, 1002, 1006, 1008, 500, 90000, 90001, 2100, 8000, 77777};

class Editor
{
 public:
  explicit Editor(Choices choices) : choices_(choices), document_(CreateDocument()) { Require(document_ != nullptr); }
  ~Editor()
  {
    for (BaseObject* object : loose_)
      DeleteObj(object);
    BaseDocument::Free(document_);
  }

  void Run();

 private:
  using Operation = void (Editor::*)();
  static const Operation kOperations[];

  void Step();
  void Check();
  std::vector<BaseObject*> Objects() const;
  std::vector<BaseMaterial*> Materials() const;
  std::vector<LayerObject*> Layers() const;
  std::vector<BaseTag*> Tags();
  std::vector<CTrack*> Tracks();
  BaseList2D* AnyNode();
  GeData AnyValue();
  void Insert(BaseObject* object);

  void MakeObject();
  void MoveObject();
  void TakeObjectOff();
  void PutObjectBack();
  void DeleteObject();
  void CloneObject();
  void AddTag();
  void MoveTag();
  void DeleteTag();
  void EditTag();
  void AddMaterial();
  void CloneMaterial();
  void DeleteMaterial();
  void AddShader();
  void AddLayer();
  void DeleteLayer();
  void AssignLayer();
  void AddTrack();
  void AddKey();
  void EditKey();
  void DeleteKey();
  void DeleteTrack();
  void SetParameter();
  void Rename();
  void AddIdentifier();
  void AddDynamic();
  void Reload();
  void CopyDocument();
  void MergeItself();

  Choices choices_;
  BaseDocument* document_;
  std::vector<BaseObject*> loose_; // taken off the document
};

const Editor::Operation Editor::kOperations[] = {
    &Editor::MakeObject,     &Editor::MoveObject,  &Editor::TakeObjectOff, &Editor::PutObjectBack,
    &Editor::DeleteObject,   &Editor::CloneObject, &Editor::AddTag,        &Editor::MoveTag,
    &Editor::DeleteTag,      &Editor::EditTag,     &Editor::AddMaterial,   &Editor::CloneMaterial,
    &Editor::DeleteMaterial, &Editor::AddShader,   &Editor::AddLayer,      &Editor::DeleteLayer,
    &Editor::AssignLayer,    &Editor::AddTrack,    &Editor::AddKey,        &Editor::EditKey,
    &Editor::DeleteKey,      &Editor::DeleteTrack, &Editor::SetParameter,  &Editor::Rename,
    &Editor::AddIdentifier,  &Editor::AddDynamic,  &Editor::Reload,        &Editor::CopyDocument,
    &Editor::MergeItself,
};

// ---- What is there

void Collect(BaseObject* object, std::vector<BaseObject*>& list)
{
  for (; object; object = object->GetNext()) {
    list.push_back(object);
    Collect(object->GetDown(), list);
  }
}

std::vector<BaseObject*> Editor::Objects() const
{
  std::vector<BaseObject*> list;
  Collect(document_->GetFirstObject(), list);
  return list;
}

std::vector<BaseMaterial*> Editor::Materials() const
{
  std::vector<BaseMaterial*> list;
  for (BaseMaterial* material = document_->GetFirstMaterial(); material; material = material->GetNext())
    list.push_back(material);
  return list;
}

std::vector<LayerObject*> Editor::Layers() const
{
  std::vector<LayerObject*> list;
  for (LayerObject* layer = document_->GetFirstLayer(); layer; layer = layer->GetNext())
    list.push_back(layer);
  return list;
}

std::vector<BaseTag*> Editor::Tags()
{
  std::vector<BaseTag*> list;
  if (BaseObject* object = choices_.Of(Objects())) {
    for (BaseTag* tag = object->GetFirstTag(); tag; tag = tag->GetNext())
      list.push_back(tag);
  }
  return list;
}

std::vector<CTrack*> Editor::Tracks()
{
  std::vector<CTrack*> list;
  if (BaseList2D* node = AnyNode()) {
    for (CTrack* track = node->GetFirstTrack(); track; track = track->GetNext())
      list.push_back(track);
  }
  return list;
}

BaseList2D* Editor::AnyNode()
{
  switch (choices_.Byte() % 4) {
  case 0:
    return choices_.Of(Materials());
  case 1:
    return choices_.Of(Tags());
  default:
    return choices_.Of(Objects());
  }
}

GeData Editor::AnyValue()
{
  const int byte = choices_.Byte();
  switch (byte % 6) {
  case 0:
    return GeData(static_cast<Real>(byte) * 0.25);
  case 1:
    return GeData(static_cast<Long>(byte));
  case 2:
    return GeData(Vector(byte, 1.0, -byte));
  case 3:
    return GeData(String("text"));
  case 4: {
    BaseContainer container;
    container.SetLong(byte, byte);
    return GeData(container);
  }
  default: {
    GeAliasLink link;
    link.SetLink(AnyNode());
    return GeData(link);
  }
  }
}

// ---- Objects

void Editor::Insert(BaseObject* object)
{
  BaseObject* other = choices_.Of(Objects());
  switch (other ? choices_.Byte() % 4 : 0) {
  case 1:
    object->InsertUnder(other);
    break;
  case 2:
    object->InsertUnderLast(other);
    break;
  case 3:
    object->InsertAfter(other);
    break;
  default:
    document_->InsertObject(object);
  }
  if (!object->GetListHead())
    loose_.push_back(object); // no memory for a list of children
}

void Editor::MakeObject()
{
  if (Objects().size() + loose_.size() >= kMostObjects)
    return;
  if (BaseObject* object = AllocObject(choices_.Of(kObjectTypes)))
    Insert(object);
}

void Editor::MoveObject()
{
  if (BaseObject* object = choices_.Of(Objects())) {
    object->RemoveFromList();
    Insert(object);
  }
}

void Editor::TakeObjectOff()
{
  if (BaseObject* object = choices_.Of(Objects())) {
    object->RemoveFromList();
    loose_.push_back(object);
  }
}

void Editor::PutObjectBack()
{
  if (loose_.empty())
    return;
  BaseObject* object = loose_.back();
  loose_.pop_back();
  Insert(object);
}

void Editor::DeleteObject()
{
  if (BaseObject* object = choices_.Of(Objects())) {
    object->RemoveFromList();
    DeleteObj(object);
  }
}

void Editor::CloneObject()
{
  BaseObject* object = choices_.Of(Objects());
  if (!object || Objects().size() + loose_.size() >= kMostObjects / 2)
    return;
  if (GeListNode* clone = object->MakeClone(choices_.Byte() % 2 ? kCopyNoChildren : 0, nullptr))
    Insert(NodeCast<BaseObject>(clone));
}

// ---- Tags

void Editor::AddTag()
{
  if (BaseObject* object = choices_.Of(Objects()); object && object->GetTagRoot().GetCount() < 20)
    object->MakeTag(choices_.Of(kTagTypes));
}

void Editor::MoveTag()
{
  BaseTag* tag = choices_.Of(Tags());
  BaseObject* target = choices_.Of(Objects());
  if (!tag || !target)
    return;
  tag->RemoveFromList();
  Require(tag->GetObject() == nullptr);
  target->InsertTag(tag);
}

void Editor::DeleteTag()
{
  if (BaseTag* tag = choices_.Of(Tags())) {
    tag->RemoveFromList();
    DeleteObj(tag);
  }
}

void Editor::EditTag()
{
  BaseTag* tag = choices_.Of(Tags());
  if (!tag)
    return;
  if (tag->GetType() == kTagPointSelection) {
    BaseSelect& select = NodeCast<SelectionTag>(tag)->GetSelect();
    const Long first = choices_.Byte();
    choices_.Byte() % 2 ? select.SelectToggleRange(first, first + 9) : select.SelectAdd(first);
  } else if (BaseTag* other = choices_.Of(Tags())) {
    if (other != tag)
      tag->CopyTo(*other, 0, nullptr); // onto a tag of another class: refused
  }
}

// ---- Materials, shaders, layers

void Editor::AddMaterial()
{
  if (Materials().size() < 20) {
    if (BaseMaterial* material = MakeMaterial(choices_.Byte() % 4 ? kMaterialStandard : kMaterialPlugin))
      document_->InsertMaterial(material, choices_.Of(Materials()));
  }
}

void Editor::CloneMaterial()
{
  BaseMaterial* material = choices_.Of(Materials());
  if (material && Materials().size() < 20) {
    if (GeListNode* clone = material->MakeClone(0, nullptr))
      document_->InsertMaterial(NodeCast<BaseMaterial>(clone));
  }
}

void Editor::DeleteMaterial()
{
  if (BaseMaterial* material = choices_.Of(Materials())) {
    material->RemoveFromList();
    DeleteObj(material);
  }
}

void Editor::AddShader()
{
  BaseList2D* node = choices_.Byte() % 2 ? static_cast<BaseList2D*>(choices_.Of(Materials())) : AnyNode();
  if (!node)
    return;
  if (node->GetShaders() && choices_.Byte() % 2) {
    BaseShader* old = node->GetShaders();
    old->RemoveFromList();
    DeleteObj(old);
  } else if (BaseShader* shader = MakeShader(choices_.Byte() % 2 ? kShaderBitmap : 5707)) {
    if (!node->InsertShaderLast(shader))
      DeleteObj(shader);
  }
}

void Editor::AddLayer()
{
  if (Layers().size() < 20) {
    if (LayerObject* layer = AllocLayer())
      document_->InsertLayer(layer);
  }
}

void Editor::DeleteLayer()
{
  if (LayerObject* layer = choices_.Of(Layers())) {
    layer->RemoveFromList();
    DeleteObj(layer);
  }
}

void Editor::AssignLayer()
{
  if (BaseList2D* node = AnyNode())
    node->SetLayer(choices_.Of(Layers()));
}

// ---- Animation

void Editor::AddTrack()
{
  BaseList2D* node = AnyNode();
  if (!node || (node->GetTrackRoot() && node->GetTrackRoot()->GetCount() > 5))
    return;
  const ParameterPath path({choices_.Of(kParameters), 23, 0}, {1000, 19, 0});
  if (CTrack* track = CTrack::Alloc(node, path, String("Track"))) {
    if (!node->InsertTrackLast(track))
      DeleteObj(track);
  }
}

CCurve* FirstCurve(CTrack* track) { return track ? track->GetCurve(1, 0) : nullptr; }

void Editor::AddKey()
{
  CCurve* curve = FirstCurve(choices_.Of(Tracks()));
  if (!curve || curve->GetKeyCount() >= kMostKeys)
    return;
  if (CKey* key = curve->AddKey(BaseTime(choices_.Byte(), 30.0)))
    key->SetValue(curve, choices_.Byte());
}

void Editor::EditKey()
{
  CCurve* curve = FirstCurve(choices_.Of(Tracks()));
  if (!curve || curve->GetKeyCount() == 0)
    return;
  CKey* key = curve->GetKey(choices_.Byte() % curve->GetKeyCount());
  if (choices_.Byte() % 2)
    key->SetParameterById(kKeyTime, GeData(BaseTime(choices_.Byte(), 25.0)));
  else
    key->SetParameterById(choices_.Byte() % 2 ? kKeyTime : kKeyInterpolation, AnyValue());
  curve->GetValue(0.5);
}

void Editor::DeleteKey()
{
  CCurve* curve = FirstCurve(choices_.Of(Tracks()));
  if (curve && curve->GetKeyCount() > 0)
    curve->DelKey(choices_.Byte() % curve->GetKeyCount());
}

void Editor::DeleteTrack()
{
  if (CTrack* track = choices_.Of(Tracks())) {
    track->RemoveFromList();
    DeleteObj(track);
  }
}

// ---- Values

void Editor::SetParameter()
{
  if (BaseList2D* node = AnyNode()) {
    const Long id = choices_.Of(kParameters);
    node->SetParameterById(id, AnyValue());
    GeData value;
    node->GetParameterById(id, value);
  }
}

void Editor::Rename()
{
  if (BaseList2D* node = AnyNode())
    node->SetName(String("name").Concat(String(static_cast<Long>(choices_.Byte() % 30), u'x')));
}

void Editor::AddIdentifier()
{
  const UChar bytes[16] = {1, 2, 3};
  if (BaseList2D* node = AnyNode())
    node->AddUniqueID(choices_.Byte(), bytes, choices_.Byte() % 17);
}

void Editor::AddDynamic()
{
  BaseList2D* node = AnyNode();
  if (!node)
    return;
  const ParameterPath path = node->AddDynamicParameter(MakeDynamicSettings(19, String("Own")));
  if (choices_.Byte() % 3 == 0)
    node->RemoveDynamicParameter(path);
}

// ---- The whole document

struct Sizes
{
  std::size_t objects = 0, tags = 0, tracks = 0, keys = 0, materials = 0, layers = 0;
  bool operator==(const Sizes&) const = default;
};

void Count(BaseList2D& node, Sizes& sizes)
{
  for (CTrack* track = node.GetFirstTrack(); track; track = track->GetNext()) {
    ++sizes.tracks;
    const CCurve& curve = *FirstCurve(track);
    for (Long i = 1; i < curve.GetKeyCount(); ++i)
      Require(curve.GetKey(i - 1)->GetTime() <= curve.GetKey(i)->GetTime());
    sizes.keys += static_cast<std::size_t>(curve.GetKeyCount());
  }
}

Sizes SizesOf(BaseDocument& document)
{
  Sizes sizes;
  std::vector<BaseObject*> objects;
  Collect(document.GetFirstObject(), objects);
  sizes.objects = objects.size();
  for (BaseObject* object : objects) {
    Count(*object, sizes);
    for (BaseTag* tag = object->GetFirstTag(); tag; tag = tag->GetNext()) {
      ++sizes.tags;
      Count(*tag, sizes);
    }
  }
  for (BaseMaterial* material = document.GetFirstMaterial(); material; material = material->GetNext()) {
    ++sizes.materials;
    Count(*material, sizes);
  }
  for (LayerObject* layer = document.GetFirstLayer(); layer; layer = layer->GetNext())
    ++sizes.layers;
  return sizes;
}

// The document as it comes back from a file; null when memory ran short.
BaseDocument* SavedAndLoaded(BaseDocument& document)
{
  MemoryDescription description;
  Filename name;
  name.SetMemoryWrite(&description);
  FileProblem problem;
  const void* data = nullptr;
  LLong size = 0;
  if (!SaveDocument(&document, name, 0, &problem) || !name.GetMemoryContinuous(data, size))
    return nullptr;
  Filename again;
  again.SetMemoryRead(data, size);
  return LoadDocument(again, LoadObjects | LoadMaterials, &problem);
}

BaseDocument* Copied(BaseDocument& document)
{
  BaseDocument* copy = BaseDocument::Alloc();
  if (copy && !document.CopyWithTranslation(*copy, 0, nullptr))
    BaseDocument::Free(copy);
  return copy;
}

void Editor::Reload()
{
  BaseDocument* again = SavedAndLoaded(*document_);
  if (!again)
    return;
  Require(SizesOf(*again) == SizesOf(*document_));
  BaseDocument::Free(document_);
  document_ = again;
}

void Editor::CopyDocument()
{
  BaseDocument* copy = Copied(*document_);
  if (!copy)
    return;
  Require(SizesOf(*copy) == SizesOf(*document_));
  BaseDocument::Free(document_);
  document_ = copy;
}

void Editor::MergeItself()
{
  if (Objects().size() > kMostObjects / 4 || Materials().size() > 8)
    return;
  MemoryDescription description;
  Filename name;
  name.SetMemoryWrite(&description);
  const void* data = nullptr;
  LLong size = 0;
  if (!SaveDocument(document_, name, 0) || !name.GetMemoryContinuous(data, size) || size > kMostMerged)
    return;
  Filename again;
  again.SetMemoryRead(data, size);
  MergeDocument(document_, again, LoadObjects | LoadMaterials);
}

// With enough memory nothing may fail, and nothing may be lost.
void Editor::Check()
{
  RequireInvariants(*document_);
  BaseDocument* again = SavedAndLoaded(*document_);
  Require(again != nullptr && SizesOf(*again) == SizesOf(*document_));
  RequireInvariants(*again);
  BaseDocument::Free(again);
  BaseDocument* copy = Copied(*document_);
  Require(copy != nullptr && SizesOf(*copy) == SizesOf(*document_));
  RequireInvariants(*copy);
  BaseDocument::Free(copy);
}

void Editor::Step()
{
  const int byte = choices_.Byte();
  const bool isShort = byte >= 224; // an eighth of the operations runs out of memory
  if (isShort)
    counting_memory::FailAfter(choices_.Byte());
  (this->*kOperations[static_cast<std::size_t>(byte) % std::size(kOperations)])();
  counting_memory::FailNever();
}

void Editor::Run()
{
  constexpr int kStepsBetweenChecks = 8;
  constexpr int kMostSteps = 2000;
  for (int step = 1; !choices_.AtEnd() && step <= kMostSteps; ++step) {
    Step();
    if (step % kStepsBetweenChecks == 0)
      Check();
  }
  Check();
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size)
{
  SetAssertionLog(nullptr);
  const LLong before = counting_memory::Get().blocks;
  Editor(Choices(data, size)).Run();
  Require(counting_memory::Get().blocks == before);
  return 0;
}
