// A document with something of everything that the library can make.
#pragma once

#include <algorithm>
#include <string_view>

#include "support/byte_writer.h"
#include "support/scene_bytes.h"
#include "torvane/animation/ctrack.h"
#include "torvane/materials/material.h"
#include "torvane/objects/light_object_data.h"
#include "torvane/objects/point_object_data.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/shaders/blend_layers.h"
#include "torvane/shaders/gradient.h"
#include "torvane/tags/selection_tag.h"
#include "torvane/tags/value_tags.h"
#include "torvane/tags/weight_tag_data.h"
#include "torvane/values/custom_data.h"
#include "torvane/views/base_draw.h"

namespace full_scene
{

using namespace _torvane_;

// Long enough for a block of its own wherever short texts need none.
inline constexpr const char* kText = "a text that is too long to lie within anything";

// One value of each kind, custom ones and nested containers included, and a link to `target` with a name.
inline void FillContainer(BaseContainer& container, BaseList2D* target)
{
  Long id = 700000;
  const auto add = [&](GeData value) { container.SetData(id++, value); };
  for (Long custom : {1000482, 1000997, 1009060, 1009290, 1009398, 1011153, 1018397, 1019655, 1019660, 100004811,
                      180000104, 450000019}) {
    GeData value;
    if (value.SetType(custom))
      add(value);
  }
  for (Long custom : {kCustomGradient, kCustomThreeNumbers, kCustomBlendLayers, kCustomJointTree, kCustomUnitScale}) {
    GeData value;
    if (!value.SetType(custom))
      continue;
    if (custom == kCustomGradient)
      static_cast<GradientData&>(*value.GetCustom()).NeedAlpha();
    if (custom == kCustomBlendLayers) {
      CBlendLayers& layers = static_cast<iBlendDataType&>(*value.GetCustom()).GetLayers();
      for (Long type = kBlendFolder; type <= kBlendTransform; ++type) {
        if (BlendLayer* layer = layers.AppendLayer(type)) {
          layer->SetName(kText);
          if (layer->AsFolder())
            layer->AsFolder()->GetChildren().AppendLayer(kBlendBC);
          else if (layer->GetLink() && target)
            layer->GetLink()->SetLink(target);
        }
      }
    }
    add(value);
  }
  GeAliasLink link;
  link.SetLink(target);
  link.SetName(kText);
  BaseContainer inner(7);
  inner.SetString(1, kText);
  inner.SetData(2, GeData(link));
  add(Long{1});
  add(2.0);
  add(Vector(1, 2, 3));
  add(Matrix());
  add(BaseTime(1, 25));
  add(String(kText));
  add(Filename("folder/a picture of a long name.jpg"));
  add(inner);
  add(link);
}

// What every node can have.
inline void FillNode(BaseList2D& node, BaseList2D* target)
{
  node.SetName(kText);
  node.AddUniqueID(1027999, kText, 20);
  BaseContainer settings;
  settings.SetString(1, kText);
  node.AddDynamicParameter(settings);
  CTrack* track = CTrack::Alloc(&node, {{903, 23, 0}, {1000, 19, 0}}, kText);
  for (Long frame = 0; frame < 3; ++frame)
    track->GetCurve(1, 1)->AddKey(BaseTime(frame, 25))->SetValue(nullptr, frame * 0.5);
  track->GetCurve(2, 1)->AddKey(BaseTime(0, 1));
  track->GetCurve(9, 1);
  node.InsertTrackLast(track);
  track = CTrack::Alloc(&node, ParameterPath(ParameterLevel{1, kDataString, 0}), kText);
  CCurve* curve = track->GetCurve(1, 1);
  curve->AddKey(BaseTime(0, 1))->SetGeData(curve, GeData(String(kText)));
  node.InsertTrackLast(track);
  FillContainer(node.GetDataInstance(), target);
}

inline BaseObject* AddObject(BaseDocument& document, Long type, BaseObject* parent = nullptr)
{
  BaseObject* object = AllocObject(type);
  object->SetName(kText);
  if (parent)
    object->InsertUnderLast(parent);
  else
    document.InsertObject(object);
  return object;
}

inline void AddTags(BaseObject& object)
{
  for (Long type : {kTagPoint, kTagPolygon, kTagTangent, kTagUVW, kTagSegment, kTagVertexMap, kTagNormal})
    static_cast<BaseArrayTag*>(object.MakeTag(type))->ResizeTagArray(3);
  for (Long type : {kTagPolygonSelection, kTagPointSelection, kTagEdgeSelection})
    static_cast<SelectionTag*>(object.MakeTag(type))->GetSelect().SelectAdd(3);
  for (Long type : {kTagDisplay, kTagTexture, kTagProtection, kTagCompositing, kTagTarget, kTagPlugin, Long{5698}})
    object.MakeTag(type)->SetName(kText);
}

inline void AddMaterial(BaseDocument& document)
{
  Material* material = AllocMaterial();
  material->SetName(kText);
  document.InsertMaterial(material);
  SetMaterialBitmap(material, kMaterialColorShader, Filename("folder/a picture of a long name.jpg"));
  BaseShader* shader = MakeShader(5833);
  material->InsertShaderLast(shader);
  shader->SetName(kText);
  MakeShader(kShaderBitmap)->InsertUnderLast(shader);
  FillNode(*material, shader);
  document.InsertMaterial(MakeMaterial(1234567));
}

inline DocumentPtr MakeFullScene()
{
  DocumentPtr document = NewDocument();
  BaseObject* polygons = AddObject(*document, kObjectPolygon);
  FillNode(*polygons, polygons);
  AddTags(*polygons);
  AddTags(*AddObject(*document, kObjectSpline, polygons));
  auto& data = static_cast<PolygonObjectData&>(*polygons->GetObjectData());
  const ULong edges[] = {1, 2, 3};
  data.GetPointSelection().SelectAdd(2);
  data.ResizeNgons(2);
  data.GetNgons()->SetEdges(1, edges, 3);
  for (Long type : {kObjectLight, kObjectCamera, kObjectNull, kObjectPlane, kObjectPointBased, kObjectSky,
                    kObjectGeneric, kObjectJoint})
    AddObject(*document, type, polygons);
  // An object of another program, whose data are kept as bytes.
  const std::vector<std::uint8_t> unknown =
      ByteWriter().Header().Start(110064, 3).Long(1234567).String(u"").String(u"what it holds").End().End().bytes;
  MemoryReadFile file(unknown);
  AddObject(*document, kObjectGeneric, polygons)->ReadChunkLoop(file.file, true);
  IESLight* distribution = NewObj<IESLight>();
  distribution->manufacturer = kText;
  for (Real angle : {0.0, 180.0}) {
    distribution->verticalAngles.Append(angle);
    distribution->candela.Append(2);
  }
  distribution->horizontalAngles.Append(0);
  for (BaseObject* object = polygons->GetDown(); object; object = object->GetNext()) {
    if (object->GetType() == kObjectLight)
      SetIESLight(object, distribution, document.get());
    if (object->GetType() == kObjectJoint) {
      auto* weights = static_cast<WeightTagData*>(polygons->MakeTag(kTagWeight)->GetNodeData());
      weights->InsertJointRecord(object);
      weights->GetJoint(0)->NeedSecond()->SetLink(object);
      weights->GetJoint(0)->AddEntry()->link.SetLink(object);
      weights->GetJoint(0)->weights.WritePointWeight(2, 0.5);
    }
  }
  DeleteObj(distribution);
  LayerObject* layer = AllocLayer();
  layer->SetName(kText);
  document->InsertLayer(layer);
  AllocLayer()->InsertUnderLast(layer);
  polygons->SetLayer(layer);
  AddMaterial(*document);
  RenderData* render = document->GetFirstRenderData();
  BaseVideoPost* post = NewObj<BaseVideoPost>();
  post->SetName(kText);
  render->GetVideoPosts().InsertLast(post);
  render->GetMultipasses().InsertLast(NewObj<MultipassObject>());
  document->SetSceneCamera(polygons->GetDown());
  document->GetPreview().Init(4, 4, 24);
  FillNode(*document, nullptr);
  return document;
}

// The bytes of a saved document without what differs from one save to the next: markers become zeros, and so do dates;
// the ids of goals become the numbers in which they first come up.
inline std::vector<std::uint8_t> Comparable(std::vector<std::uint8_t> bytes)
{
  const auto each = [&bytes](std::string_view text, auto&& change) {
    const std::vector<std::uint8_t> start(text.begin(), text.end());
    auto place = bytes.begin();
    while ((place = std::search(place, bytes.end(), start.begin(), start.end())) != bytes.end()) {
      place += static_cast<std::ptrdiff_t>(start.size());
      change(place);
    }
  };
  using namespace std::string_view_literals;
  each("\x0C\x01\x80\0\0\0\x10"sv, [](auto place) { std::fill_n(place, 16, std::uint8_t{0}); });
  each("\x0F\0\0\0\x1A\x11"sv, [](auto place) { std::fill_n(place, 8, std::uint8_t{0}); });
  std::vector<std::vector<std::uint8_t>> ids;
  const auto number = [&ids](auto place) {
    const std::vector<std::uint8_t> id(place, place + 8);
    const auto found = std::find(ids.begin(), ids.end(), id);
    std::fill_n(place, 8, std::uint8_t{0});
    *place = static_cast<std::uint8_t>(found - ids.begin());
    if (found == ids.end())
      ids.push_back(id);
  };
  each("alias2"sv, number);
  each("agoal1"sv, number);
  return bytes;
}

inline std::vector<std::uint8_t> SavedScene(BaseDocument& document) { return Comparable(SaveToBytes(document)); }

} // namespace full_scene
