// The classes that stand behind the library's nodes in this program. Each is its base with at most one field more.
#pragma once

#include "torvane/layers/layer_object.h"
#include "torvane/materials/material.h"
#include "torvane/nodes/root_list.h"
#include "torvane/objects/base_object.h"
#include "torvane/objects/camera_object_data.h"
#include "torvane/objects/light_object_data.h"
#include "torvane/objects/point_object_data.h"
#include "torvane/render/render_data.h"

namespace exporter
{

using _torvane_::BaseList2D;
using _torvane_::BaseObject;
using _torvane_::Bool;
using _torvane_::Long;

class AlienLayer : public _torvane_::LayerObject
{
 public:
  Bool Execute() override { return true; }
};

// A material of a type that only its own program interprets.
class AlienBaseMaterial : public _torvane_::BaseMaterial
{
 public:
  AlienBaseMaterial() : BaseMaterial(-1, -1) { SetType(_torvane_::kMaterialPlugin); }

  Long GetMaterialNumber() const { return materialNumber_; }

 private:
  Long materialNumber_ = 0; // never drawn
};

// Gets the next number of the process when it runs.
class AlienMaterial : public _torvane_::Material
{
 public:
  Bool Execute() override;

  Long GetMaterialNumber() const { return materialNumber_; }

 private:
  Long materialNumber_ = 0;
};

class AlienRenderData : public _torvane_::RenderData
{};

class AlienLightObjectData : public _torvane_::LightObjectData
{
 public:
  Bool Execute() override { return GetNode() != nullptr; }
};

class AlienCameraObjectData : public _torvane_::CameraObjectData
{
 public:
  Bool Execute() override { return GetNode() != nullptr; }
};

class AlienPolygonObjectData : public _torvane_::PolygonObjectData
{
 public:
  // True for an object whose points and polygons can be used: it has both, or points alone, or neither.
  Bool Execute() override;
};

// Planes: all that the exporter knows of them is in their container.
class AlienPrimitiveObjectData : public _torvane_::NodeData
{
 public:
  explicit AlienPrimitiveObjectData(Long type) : type_(type) {}
  const _torvane_::NodeKind& GetOwnerKind() const override { return BaseObject::kNodeKind; }
  Long GetPrimitiveType() const { return type_; }
  Bool Execute() override { return true; }

 private:
  Long type_;
};

class AlienRootObject : public _torvane_::RootObject
{};

class AlienRootMaterial : public _torvane_::RootMaterial
{
 public:
  BaseList2D* AllocMember(Long type) override;
};

class AlienRootLayer : public _torvane_::RootLayer
{
 public:
  BaseList2D* AllocMember() override;
};

class AlienRootRenderData : public _torvane_::RootRenderData
{
 public:
  BaseList2D* AllocMember() override;
};

} // namespace exporter
