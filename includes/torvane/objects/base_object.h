// The scene object: a node in the tree with a transform, tags, and a NodeData for what is particular to its type.
#pragma once

#include "torvane/math/ge_math.h"
#include "torvane/math/vector.h"
#include "torvane/nodes/base_list.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/stream/raw_chunk_body.h"

namespace _torvane_
{

class BaseTag;
class TransformRecord;

// Parameters of every object.
inline constexpr Long kObjectEditorMode = 901;
inline constexpr Long kObjectRenderMode = 902;
inline constexpr Long kObjectRelPos = 903;
inline constexpr Long kObjectRelRot = 904;
inline constexpr Long kObjectRelScale = 905;
inline constexpr Long kObjectEnabled = 906;
inline constexpr Long kObjectColorMode = 907;
inline constexpr Long kObjectDisplayColor = 908;
inline constexpr Long kObjectDisplayFlag = 909;
inline constexpr Long kObjectGlobalPos = 910;
inline constexpr Long kObjectGlobalRot = 911;
inline constexpr Long kObjectStoredVector = 912;
inline constexpr Long kObjectStoredMode = 913;
inline constexpr Long kObjectFrozenPos = 917;
inline constexpr Long kObjectFrozenRot = 918;
inline constexpr Long kObjectFrozenScale = 919;
inline constexpr Long kObjectAbsPos = 925;
inline constexpr Long kObjectAbsRot = 926;
inline constexpr Long kObjectAbsScale = 927;
inline constexpr Long kObjectRotationOrder = 928;

// The check sum of an object without geometry.
inline constexpr Long kSumOfNothing = 0;

// Editor and render modes.
inline constexpr Long kObjectModeOn = 0;
inline constexpr Long kObjectModeOff = 1;
inline constexpr Long kObjectModeUndefined = 2;

// Bits of GetFrozenFlags.
inline constexpr ULong kFrozenPos = 2;
inline constexpr ULong kFrozenRot = 4;
inline constexpr ULong kFrozenScale = 8;

// Where an object stands in its parent, what of that is frozen, and whether it shows: a copy takes it over in one
// piece.
class ObjectPlacement
{
 protected:
  static constexpr Long kNotTurned = -1;

  Vector relPos_;
  Vector relRot_;
  Vector relScale_ = Vector(1.0, 1.0, 1.0);
  Long rotationOrder_ = kRotationOrderScene;
  Long turnedIn_ = kNotTurned; // the order in which `relRot_` turns the object; kNotTurned: it doesn't
  Long editorMode_ = kObjectModeUndefined;
  Long renderMode_ = kObjectModeUndefined;
  Long disabled_ = 0;
  ULong frozenFlags_ = 0;
};

class BaseObject : public BaseList4D, protected ObjectPlacement
{
 public:
  static constexpr NodeKindOf<BaseObject> kNodeKind{"object", &BaseList4D::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // Its child list comes from the client's hook, with the first child.
  explicit BaseObject(Long type);
  ~BaseObject() override;

  Bool IsInstanceOf(Long type) const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  Bool ReadInOnePiece(HyperFile& file) override;
  void WriteChunks(HyperFile& file) override;
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;
  Long GetDiskType() const override;
  GeListNode* MakeClone(ULong flags, TransArray* translation) override;
  void SetDocument(BaseDocument* document) override;
  // The object data's Execute; false without object data. For clients: the library itself never calls it.
  virtual Bool Execute();

  BaseObject* GetUp() const { return NodeCast<BaseObject>(BaseList4D::GetUp()); }
  BaseObject* GetDown() const { return NodeCast<BaseObject>(BaseList4D::GetDown()); }
  BaseObject* GetDownLast() const { return NodeCast<BaseObject>(BaseList4D::GetDownLast()); }
  BaseObject* GetNext() const { return NodeCast<BaseObject>(BaseList4D::GetNext()); }
  BaseObject* GetPrev() const { return NodeCast<BaseObject>(BaseList4D::GetPrev()); }

  RootTag& GetTagRoot() { return tags_; }
  BaseTag* GetFirstTag() const;
  // The first tag of a type; a plug-in tag is found by its plug-in type. Null if there is none.
  BaseTag* GetTag(Long type) const;
  void InsertTag(BaseTag* tag, BaseTag* after = nullptr); // first when `after` is null
  // A new tag, inserted first; null when memory is short.
  BaseTag* MakeTag(Long type);

  NodeData* GetObjectData() const { return objectData_; }
  // Replaces the object data and sets its node; the object owns it.
  void SetObjectData(NodeData* data);

  // The payload of an object whose type the client doesn't know.
  const void* GetRawData() const { return raw_.GetData(); }
  LLong GetRawSize() const { return raw_.GetSize(); }
  Long GetRawLevel() const { return raw_.GetLevel(); }

  // Relative: what a user and the animation work with. Absolute: in the parent's system, frozen part included. Angles
  // in radians, in the object's rotation order.
  const Vector& GetRelPos() const { return relPos_; }
  const Vector& GetRelRot() const { return relRot_; }
  const Vector& GetRelScale() const { return relScale_; }
  const Vector& GetFrozenPos() const { return Frozen().pos; }
  const Vector& GetFrozenRot() const { return Frozen().rot; }
  const Vector& GetFrozenScale() const { return Frozen().scale; }
  const Vector& GetAbsPos() const { return frozen_ ? frozen_->absPos : relPos_; }
  const Vector& GetAbsRot() const { return frozen_ ? frozen_->absRot : relRot_; }
  const Vector& GetAbsScale() const { return frozen_ ? frozen_->absScale : relScale_; }
  ULong GetFrozenFlags() const { return frozenFlags_; }
  Long GetRotationOrder() const { return rotationOrder_; }

  // Maps the object's space to that of its parent: the absolute values.
  Matrix GetLocalMatrix() const;
  Matrix GetGlobalMatrix() const;   // the object's space to the world
  Matrix GetUpGlobalMatrix() const; // the parent's space to the world; identity without a parent
  // As the local and the global matrix, with axes of length 1.
  Matrix GetNormalizedLocalMatrix() const;
  Matrix GetNormalizedGlobalMatrix() const;
  // The object's space to that of its frozen transform: the relative values, with and without their scale.
  Matrix GetRelativeMatrix() const;
  Matrix GetRelativeNormalizedMatrix() const;
  // The frozen transform's space to that of the parent, without scale; identity when nothing is frozen.
  Matrix GetFrozenTransformMatrix() const;
  // A matrix that a file holds and the library hands on without a meaning of its own.
  const Matrix& GetStoredMatrix() const { return Display().storedMatrix; }

  // Every setter of the transform does nothing on an object with a Protection Tag (5629). The matrices are taken apart
  // into position, rotation and scale; each maps what the getter of its name maps.
  // Without memory for its first value the frozen part stays as it was: SetParameter tells that by false, these by an
  // AllocationWatch around them.
  void SetRelPos(const Vector& value);
  void SetRelRot(const Vector& value);
  void SetRelScale(const Vector& value);
  void SetAbsPos(const Vector& value);
  void SetAbsRot(const Vector& value);
  void SetAbsScale(const Vector& value);
  void SetFrozenPos(const Vector& value);
  void SetFrozenRot(const Vector& value);
  void SetFrozenScale(const Vector& value);
  void SetRotationOrder(Long order);
  void SetRelativeMatrix(const Matrix& matrix);
  void SetLocalMatrix(const Matrix& matrix);
  void SetGlobalMatrix(const Matrix& matrix);

  Long GetEditorMode() const { return editorMode_; }
  void SetEditorMode(Long mode) { editorMode_ = mode; }
  Long GetRenderMode() const { return renderMode_; }
  void SetRenderMode(Long mode) { renderMode_ = mode; }
  Long GetDisabled() const { return disabled_; }
  void SetDisabled(Long disabled) { disabled_ = disabled; }

 protected:
  // The frozen part of the transform, and the absolute values, which differ from the relative ones only with it.
  struct FrozenPart
  {
    Vector pos;
    Vector scale = Vector(1.0, 1.0, 1.0);
    Vector rot;
    Vector absPos;
    Vector absRot;
    Vector absScale = Vector(1.0, 1.0, 1.0);
    Matrix matrix;
    Matrix inverse;
  };

  // How the editor shows the object, and values that are kept and handed on.
  struct DisplayPart
  {
    Vector color = Vector(1.0, 1.0, 1.0);
    Vector storedVector;
    Matrix storedMatrix;
    Long colorMode = 0;
    Long storedMode = 0;
    Long flag = 0;
    Long unused = 0; // no padding: parts are compared byte by byte
  };

  // Read from old files only; owned.
  struct LegacyLists
  {
    ~LegacyLists();

    RootObject* lists[2] = {};
  };

  RawChunkBody raw_;               // of the chunk kChunkNodeData, when there is no object data
  FrozenPart* frozen_ = nullptr;   // owned; made with the first frozen value
  DisplayPart* display_ = nullptr; // owned; made with the first value that isn't the default
  RootTag tags_;
  LegacyLists* legacyLists_ = nullptr; // owned; made when an old file has one
  NodeData* objectData_ = nullptr;     // owned

  // Of this object's type too; the object data are copied later.
  BaseObject* MakeEmpty() const override;
  RootList2D* AllocChildRoot() const override;

 private:
  friend struct ChunkFields<BaseObject>;

  struct LongParameter;
  struct VectorParameter;
  static const LongParameter kLongParameters[];
  static const VectorParameter kVectorParameters[];

  Bool IsProtected() const { return GetTag(kTagProtection) != nullptr; }
  Bool HasFrozenTransform() const { return (frozenFlags_ & (kFrozenPos | kFrozenRot | kFrozenScale)) != 0; }
  Matrix GetRelRotation() const;
  Matrix GetRotation() const;
  static const FrozenPart kNoFrozenPart;
  static const DisplayPart kPlainDisplay;

  const FrozenPart& Frozen() const { return frozen_ ? *frozen_ : kNoFrozenPart; }
  const DisplayPart& Display() const { return display_ ? *display_ : kPlainDisplay; }
  FrozenPart* NeedFrozen();
  Bool SetDisplay(const DisplayPart& part);
  template <class Change>
  void ChangeDisplay(Change&& change);
  Vector DerivedAbsPos() const;
  Vector DerivedAbsRot() const;
  Vector DerivedAbsScale() const;
  void TakeRelAsAbs();
  void SetFrozenFlag(ULong flag, Bool set) { frozenFlags_ = set ? frozenFlags_ | flag : frozenFlags_ & ~flag; }
  Vector GetGlobalAngles() const;
  void SetGlobalPos(const Vector& value);
  void SetGlobalAngles(const Vector& value);
  Vector TakeDisplayColor();
  void WriteTransform(HyperFile& file);
  Bool ReadPlainTransform(HyperFile& file, Long level);
  void TakePlainTransform(const TransformRecord& record, const UChar* place);
  void TurnIn(Long order);
  Bool ReadTransform(HyperFile& file, Long level);
  Bool ReadObjectData(HyperFile& file, Long id, Long level);
  void StoreModelCheckSum();
  void SetModelCheckSum(Long sum);
  enum class DataForm;
  DataForm GetDataForm() const;
  void WriteObjectData(HyperFile& file);
  Bool CopyObjectData(BaseObject& destination, ULong flags, TransArray* translation) const;
  Bool CopyTransform(BaseObject& destination) const;
  Bool CloneChildren(BaseObject& destination, ULong flags, TransArray* translation) const;
};

// A new object of a type with its object data; null for a type that can't be made and when memory is short. The caller
// owns it.
BaseObject* AllocObject(Long type);

// A new object data for a type by the same table, without asking for a class; null where none is due. `known` tells
// whether the type stands in the table.
NodeData* AllocObjectDataOfType(Long type, Bool& known);

} // namespace _torvane_
