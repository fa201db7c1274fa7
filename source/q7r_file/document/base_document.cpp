#include "torvane/document/base_document.h"

#include "q7r_file/document/document_info.h"
#include "q7r_file/nodes/node_tools.h"
#include "torvane/hooks.h"
#include "torvane/materials/base_material.h"
#include "torvane/values/custom_data.h"

namespace _torvane_
{

namespace
{

enum class Form
{
  kBool,
  kLong,
  kReal,
  kVector,
  kUnitScale, // one unit of kind 3
};

struct Default
{
  Long id;
  Form form;
  Real number;
};

constexpr Vector kDefaultBackColor(0.35, 0.38, 0.41);
constexpr Vector kPlainBackColor(0.8, 0.8, 0.8);
constexpr Long kBackColorMode = 2113; // 0 plain, 1 default

constexpr Default kContainerDefaults[] = {
    {10001, Form::kLong, 0},  {2101, Form::kLong, 0},   {2102, Form::kBool, 1},  {2117, Form::kUnitScale, 0},
    {2113, Form::kLong, 1},   {2112, Form::kVector, 0}, {2114, Form::kLong, 1},  {2115, Form::kReal, 1.0},
    {2116, Form::kReal, 1e5}, {50006, Form::kLong, 0},  {50008, Form::kBool, 0}, {465001520, Form::kLong, 0},
};

constexpr Default kSettingsDefaults[] = {
    {10014, Form::kBool, 1},  {10015, Form::kBool, 1},   {10016, Form::kBool, 1}, {10018, Form::kBool, 1},
    {10019, Form::kBool, 0},  {10020, Form::kBool, 0},   {10051, Form::kLong, 0}, {10052, Form::kBool, 1},
    {10046, Form::kBool, 1},  {10034, Form::kLong, 1},   {10035, Form::kBool, 1}, {10036, Form::kBool, 1},
    {10037, Form::kLong, -1}, {10039, Form::kReal, 0.0},
};

GeData ValueOf(const Default& row)
{
  switch (row.form) {
  case Form::kBool:
    return GeData(row.number != 0.0);
  case Form::kLong:
    return GeData(static_cast<Long>(row.number));
  case Form::kReal:
    return GeData(row.number);
  case Form::kVector:
    return GeData(kDefaultBackColor);
  case Form::kUnitScale:
    break;
  }
  GeData scale;
  scale.SetType(kCustomUnitScale); // a new one has scale 1 and unit 3
  return scale;
}

constexpr Long kFirstDocumentBit = 18;
constexpr Long kLastDocumentBit = 21;

// The tools that have a row of axis locks of their own, in order; the last row serves all others.
constexpr Long kToolOfRow[] = {200000088, 200000089, 200000090};

constexpr ULong kActiveRenderData = 2; // info bit

} // namespace

BaseDocument::BaseDocument()
    : BaseList2D(kTypeDocument),
      objects_(AllocRootObject()),
      materials_(AllocRootMaterial()),
      layers_(AllocRootLayer()),
      renderData_(AllocRootRenderData()),
      viewPanels_(NewObj<RootViewPanel>())
{
  for (RootList2D* root :
       {static_cast<RootList2D*>(objects_), static_cast<RootList2D*>(materials_), static_cast<RootList2D*>(layers_),
        static_cast<RootList2D*>(renderData_), static_cast<RootList2D*>(viewPanels_)}) {
    if (root)
      root->SetDocument(this);
  }
  if (renderData_)
    renderData_->InsertFirst(renderData_->AllocMember());
  for (auto& row : axisLocks_) {
    for (Long axis = 0; axis < 4; ++axis)
      row[axis] = axis < 3;
  }
  SetContainerDefaults();
  for (Long bit = kFirstDocumentBit; bit <= kLastDocumentBit; ++bit)
    GeListNode::ChangeNBit(bit, 1);
}

BaseDocument::~BaseDocument()
{
  DeleteObj(viewPanels_);
  DeleteObj(objects_);
  DeleteObj(materials_);
  DeleteObj(layers_);
  DeleteObj(renderData_);
}

void BaseDocument::SetContainerDefaults()
{
  for (const Default& row : kContainerDefaults)
    data_.InsertData(row.id, ValueOf(row));
  for (const Default& row : kSettingsDefaults)
    settings_[0].InsertData(row.id, ValueOf(row));
}

BaseDocument* BaseDocument::Alloc()
{
  auto* document = NewObj<BaseDocument>();
  if (document && !document->IsComplete())
    DeleteObj(document);
  return document;
}

Bool BaseDocument::IsComplete() const { return objects_ && materials_ && layers_ && renderData_ && viewPanels_; }

BaseObject* BaseDocument::GetFirstObject() const
{
  return objects_ ? NodeCast<BaseObject>(objects_->GetFirst()) : nullptr;
}

BaseMaterial* BaseDocument::GetFirstMaterial() const
{
  return materials_ ? NodeCast<BaseMaterial>(materials_->GetFirst()) : nullptr;
}

LayerObject* BaseDocument::GetFirstLayer() const
{
  return layers_ ? NodeCast<LayerObject>(layers_->GetFirst()) : nullptr;
}

RenderData* BaseDocument::GetFirstRenderData() const
{
  return renderData_ ? NodeCast<RenderData>(renderData_->GetFirst()) : nullptr;
}

RenderData* BaseDocument::GetActiveRenderData() const
{
  for (RenderData* data = GetFirstRenderData(); data; data = data->GetNext()) {
    if (data->GetBit(kActiveRenderData))
      return data;
  }
  return GetFirstRenderData();
}

void BaseDocument::InsertObject(BaseObject* object, BaseObject* after) { objects_->InsertAfter(object, after); }

void BaseDocument::InsertMaterial(BaseMaterial* material, BaseMaterial* after)
{
  materials_->InsertAfter(material, after);
}

void BaseDocument::InsertLayer(LayerObject* layer, LayerObject* after) { layers_->InsertAfter(layer, after); }

void BaseDocument::InsertRenderData(RenderData* renderData, RenderData* after)
{
  renderData_->InsertAfter(renderData, after);
}

Long BaseDocument::AxisLockRow() const
{
  Long row = 0;
  while (row < kAxisRows - 1 && kToolOfRow[row] != tool_)
    ++row;
  return row;
}

// ---------------------------------------------------------------------------------------------------------------
// Parameters

namespace
{

void Take(const GeData& value, Long& place) { place = value.GetLong(); }
void Take(const GeData& value, BaseTime& place) { place = value.GetTime(); }
void Take(const GeData& value, Filename& place) { place = value.GetFilename(); }

void Call(DocumentPref& pref, void (DocumentPref::*set)(Long), const GeData& value) { (pref.*set)(value.GetLong()); }
void Call(DocumentPref& pref, void (DocumentPref::*set)(Bool), const GeData& value) { (pref.*set)(value.GetBool()); }
void Call(DocumentPref& pref, void (DocumentPref::*set)(Real), const GeData& value) { (pref.*set)(value.GetReal()); }
void Call(DocumentPref& pref, void (DocumentPref::*set)(const BaseTime&), const GeData& value)
{
  (pref.*set)(value.GetTime());
}

} // namespace

// A parameter that is a value of the document or of its preferences.
struct BaseDocument::Parameter
{
  Long id;
  GeData (*get)(const BaseDocument& document);
  void (*set)(BaseDocument& document, const GeData& value);

  template <auto member>
  static constexpr Parameter Own(Long id)
  {
    return {id, [](const BaseDocument& document) { return GeData(document.*member); },
            [](BaseDocument& document, const GeData& value) { Take(value, document.*member); }};
  }
  template <auto get, auto set>
  static constexpr Parameter OfPref(Long id)
  {
    return {id, [](const BaseDocument& document) { return GeData((document.pref_.*get)()); },
            [](BaseDocument& document, const GeData& value) { Call(document.pref_, set, value); }};
  }
  static const Parameter* Find(Long id);
};

const BaseDocument::Parameter* BaseDocument::Parameter::Find(Long id)
{
  static constexpr Parameter kTable[] = {
      Own<&BaseDocument::time_>(kDocumentTime),
      Own<&BaseDocument::directory_>(kDocumentPath),
      Own<&BaseDocument::fileName_>(kDocumentFile),
      Own<&BaseDocument::mode_>(kDocumentMode),
      Own<&BaseDocument::tool_>(kDocumentTool),
      OfPref<&DocumentPref::GetFps, &DocumentPref::SetFps>(kDocumentFps),
      OfPref<&DocumentPref::GetMinTime, &DocumentPref::SetMinTime>(kDocumentMinTime),
      OfPref<&DocumentPref::GetMaxTime, &DocumentPref::SetMaxTime>(kDocumentMaxTime),
      OfPref<&DocumentPref::GetLoopMin, &DocumentPref::SetLoopMin>(kDocumentLoopMin),
      OfPref<&DocumentPref::GetLoopMax, &DocumentPref::SetLoopMax>(kDocumentLoopMax),
      OfPref<&DocumentPref::GetReal, &DocumentPref::SetReal>(kDocumentPrefReal),
      OfPref<&DocumentPref::GetLastBool, &DocumentPref::SetLastBool>(kDocumentPrefLastBool),
      {kDocumentInverseSwitch,
       [](const BaseDocument& document) { return GeData(!document.data_.GetBool(kSwitchedOff)); },
       [](BaseDocument& document, const GeData& value) { document.data_.SetBool(kSwitchedOff, !value.GetBool()); }},
  };
  for (const Parameter& row : kTable) {
    if (row.id == id)
      return &row;
  }
  return nullptr;
}

Bool BaseDocument::GetParameter(const ParameterPath& path, GeData& value)
{
  Long id = path[0].id;
  const AllocationWatch watch;
  const Bool known = (id == kDocumentColor && GetBackColor(path, value)) || GetOwnParameter(id, value) ||
                     BaseList2D::GetParameter(path, value);
  return known && !watch.Failed();
}

Bool BaseDocument::GetBackColor(const ParameterPath& path, GeData& value) const
{
  switch (data_.GetLong(kBackColorMode)) {
  case 0:
    return GetVectorParameter(kPlainBackColor, path, value);
  case 1:
    return GetVectorParameter(kDefaultBackColor, path, value);
  default:
    return false;
  }
}

Bool BaseDocument::GetOwnParameter(Long id, GeData& value) const
{
  if (id >= kDocumentPrefFirstBool && id < kDocumentPrefFirstBool + 4) {
    value = GeData(pref_.GetBool(id - kDocumentPrefFirstBool));
    return true;
  }
  if (id >= kDocumentFirstAxisLock && id < kDocumentFirstAxisLock + 4) {
    value = GeData(axisLocks_[AxisLockRow()][id - kDocumentFirstAxisLock]);
    return true;
  }
  if (const Parameter* row = Parameter::Find(id)) {
    value = row->get(*this);
    return true;
  }
  return GetInfoText(data_, id, value);
}

Bool BaseDocument::SetParameter(const ParameterPath& path, const GeData& value)
{
  const AllocationWatch watch;
  Long id = path[0].id;
  if (id >= kDocumentPrefFirstBool && id < kDocumentPrefFirstBool + 4) {
    pref_.SetBool(id - kDocumentPrefFirstBool, value.GetBool());
    return true;
  }
  if (id >= kDocumentFirstAxisLock && id < kDocumentFirstAxisLock + 4) {
    axisLocks_[AxisLockRow()][id - kDocumentFirstAxisLock] = value.GetBool();
    return true;
  }
  if (const Parameter* row = Parameter::Find(id)) {
    row->set(*this, value);
    return !watch.Failed();
  }
  return !IsInfoText(id) && BaseList2D::SetParameter(path, value);
}

// A copy that fails leaves no nodes behind.
Bool BaseDocument::CopyTo(PrivateChunk& destination, ULong flags, TransArray*)
{
  auto* target = NodeCast<BaseDocument>(&destination);
  if (!target)
    return false;
  if (target == this)
    return true;
  AllocationWatch watch;
  AliasTranslator translator;
  Bool copied = translator.MakeTranslator() && CopyContent(*target, flags, translator.GetArray()) && !watch.Failed();
  translator.Finish(copied);
  copied = copied && !watch.Failed();
  if (!copied) {
    for (RootList2D* root : std::initializer_list<RootList2D*>{target->materials_, target->objects_, target->layers_,
                                                               target->renderData_, target->viewPanels_})
      root->FreeAll();
  }
  return copied;
}

Bool BaseDocument::CopyContent(BaseDocument& target, ULong flags, TransArray* translation)
{
  if (!BaseList2D::CopyTo(target, flags, translation) || !pref_.CopyTo(target.pref_, flags, translation) ||
      !preview_.CopyTo(target.preview_))
    return false;
  target.fileName_ = fileName_;
  target.time_ = time_;
  target.mode_ = mode_;
  target.tool_ = tool_;
  for (Long i = 0; i < kSettingsCount; ++i) {
    if (!settings_[i].CopyTo(target.settings_[i], flags, translation))
      return false;
  }
  return CopyRoots(target, flags, translation);
}

Bool BaseDocument::CopyRoots(BaseDocument& target, ULong flags, TransArray* translation)
{
  return renderData_->CopyTo(*target.renderData_, flags, translation) &&
         viewPanels_->CopyTo(*target.viewPanels_, flags, translation) &&
         materials_->CopyTo(*target.materials_, flags, translation) &&
         objects_->CopyTo(*target.objects_, flags, translation) && layers_->CopyTo(*target.layers_, flags, translation);
}

} // namespace _torvane_
