// The parameters of every scene object.
#include "torvane/objects/base_object.h"

#include <cstring>

#include "q7r_file/nodes/node_tools.h"
#include "torvane/values/ge_data.h"

namespace _torvane_
{

struct BaseObject::LongParameter
{
  Long id;
  Long (*get)(const BaseObject&);
  void (*set)(BaseObject&, Long);
};

struct BaseObject::VectorParameter
{
  Long id;
  Vector (*get)(BaseObject&);
  void (*set)(BaseObject&, const Vector&);
};

namespace
{

template <class Row, std::size_t Count>
const Row* FindRow(const Row (&rows)[Count], Long id)
{
  for (const Row& row : rows)
    if (row.id == id)
      return &row;
  return nullptr;
}

// The second level of a path to a vector: 0 for all of it, or a component. Any other does nothing.
Bool NamesVectorPart(Long id) { return id == 0 || (id >= kVectorX && id <= kVectorZ); }

Real Clamp01(Real value) { return value < 0.0 ? 0.0 : value > 1.0 ? 1.0 : value; }

} // namespace

constinit const BaseObject::DisplayPart BaseObject::kPlainDisplay{};

// False when memory is short: the part stays as it was.
Bool BaseObject::SetDisplay(const DisplayPart& part)
{
  // Bit by bit, since -0 is kept apart from 0; gaps between the members can only make equal parts seem different.
  const Bool isPlain = std::memcmp(&part, &kPlainDisplay, sizeof part) == 0; // NOLINT(bugprone-*)
  if (!display_ && isPlain)
    return true;
  if (!display_)
    display_ = NewObj<DisplayPart>();
  if (display_)
    *display_ = part;
  return display_ != nullptr;
}

template <class Change>
void BaseObject::ChangeDisplay(Change&& change)
{
  DisplayPart part = Display();
  change(part);
  SetDisplay(part);
}

// The colour as it is stored; from then on its components lie between 0 and 1.
Vector BaseObject::TakeDisplayColor()
{
  Vector color = Display().color;
  ChangeDisplay([](DisplayPart& part) {
    part.color = {Clamp01(part.color.x), Clamp01(part.color.y), Clamp01(part.color.z)};
  });
  return color;
}

constinit const BaseObject::LongParameter BaseObject::kLongParameters[] = {
    {kObjectEditorMode, [](const BaseObject& o) { return o.editorMode_; },
     [](BaseObject& o, Long value) { o.editorMode_ = value; }},
    {kObjectRenderMode, [](const BaseObject& o) { return o.renderMode_; },
     [](BaseObject& o, Long value) { o.renderMode_ = value; }},
    {kObjectEnabled, [](const BaseObject& o) -> Long { return o.disabled_ == 0; },
     [](BaseObject& o, Long value) { o.disabled_ = value == 0; }},
    {kObjectColorMode, [](const BaseObject& o) { return o.Display().colorMode; },
     [](BaseObject& o, Long value) { o.ChangeDisplay([=](DisplayPart& part) { part.colorMode = value; }); }},
    {kObjectDisplayFlag, [](const BaseObject& o) -> Long { return o.Display().flag; },
     [](BaseObject& o, Long value) { o.ChangeDisplay([=](DisplayPart& part) { part.flag = value != 0 ? 1 : 0; }); }},
    {kObjectStoredMode, [](const BaseObject& o) { return o.Display().storedMode; },
     [](BaseObject& o, Long value) { o.ChangeDisplay([=](DisplayPart& part) { part.storedMode = value; }); }},
    {kObjectRotationOrder, [](const BaseObject& o) { return o.rotationOrder_; },
     [](BaseObject& o, Long value) { o.SetRotationOrder(value); }},
};

constinit const BaseObject::VectorParameter BaseObject::kVectorParameters[] = {
    {kObjectRelPos, [](BaseObject& o) { return o.relPos_; },
     [](BaseObject& o, const Vector& value) { o.SetRelPos(value); }},
    {kObjectRelRot, [](BaseObject& o) { return o.relRot_; },
     [](BaseObject& o, const Vector& value) { o.SetRelRot(value); }},
    {kObjectRelScale, [](BaseObject& o) { return o.relScale_; },
     [](BaseObject& o, const Vector& value) { o.SetRelScale(value); }},
    {kObjectDisplayColor, [](BaseObject& o) { return o.TakeDisplayColor(); },
     [](BaseObject& o, const Vector& value) { o.ChangeDisplay([&](DisplayPart& part) { part.color = value; }); }},
    {kObjectGlobalPos, [](BaseObject& o) { return o.GetGlobalMatrix().off; },
     [](BaseObject& o, const Vector& value) { o.SetGlobalPos(value); }},
    {kObjectGlobalRot, [](BaseObject& o) { return o.GetGlobalAngles(); },
     [](BaseObject& o, const Vector& value) { o.SetGlobalAngles(value); }},
    {kObjectStoredVector, [](BaseObject& o) { return o.Display().storedVector; },
     [](BaseObject& o, const Vector& value) {
       o.ChangeDisplay([&](DisplayPart& part) { part.storedVector = value; });
     }},
    {kObjectFrozenPos, [](BaseObject& o) { return o.GetFrozenPos(); },
     [](BaseObject& o, const Vector& value) { o.SetFrozenPos(value); }},
    {kObjectFrozenRot, [](BaseObject& o) { return o.GetFrozenRot(); },
     [](BaseObject& o, const Vector& value) { o.SetFrozenRot(value); }},
    {kObjectFrozenScale, [](BaseObject& o) { return o.GetFrozenScale(); },
     [](BaseObject& o, const Vector& value) { o.SetFrozenScale(value); }},
    {kObjectAbsPos, [](BaseObject& o) { return o.GetAbsPos(); },
     [](BaseObject& o, const Vector& value) { o.SetAbsPos(value); }},
    {kObjectAbsRot, [](BaseObject& o) { return o.GetAbsRot(); },
     [](BaseObject& o, const Vector& value) { o.SetAbsRot(value); }},
    {kObjectAbsScale, [](BaseObject& o) { return o.GetAbsScale(); },
     [](BaseObject& o, const Vector& value) { o.SetAbsScale(value); }},
};

Bool BaseObject::GetParameter(const ParameterPath& path, GeData& value)
{
  const AllocationWatch watch;
  if (objectData_ && objectData_->GetParameter(path, value))
    return !watch.Failed();
  if (const LongParameter* row = FindRow(kLongParameters, path[0].id)) {
    value = GeData(row->get(*this));
    return true;
  }
  const VectorParameter* row = FindRow(kVectorParameters, path[0].id);
  if (!row)
    return BaseList2D::GetParameter(path, value);
  return !NamesVectorPart(path[1].id) || (GetVectorParameter(row->get(*this), path, value) && !watch.Failed());
}

Bool BaseObject::SetParameter(const ParameterPath& path, const GeData& value)
{
  const AllocationWatch watch;
  const Bool taken = objectData_ && objectData_->SetParameter(path, value);
  if (taken || watch.Failed())
    return !watch.Failed();
  if (const LongParameter* row = FindRow(kLongParameters, path[0].id)) {
    row->set(*this, value.GetLong());
    return !watch.Failed();
  }
  const VectorParameter* row = FindRow(kVectorParameters, path[0].id);
  if (!row)
    return BaseList2D::SetParameter(path, value);
  if (!NamesVectorPart(path[1].id))
    return true;
  Vector whole = row->get(*this);
  SetVectorParameter(whole, path, value);
  row->set(*this, whole);
  return !watch.Failed();
}

} // namespace _torvane_
