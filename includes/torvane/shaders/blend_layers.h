// Blend layers: the stack of layers out of which a layer shader composes its image. A stack is the custom value of type
// kCustomBlendLayers in a shader's container. The library doesn't compose the image: it holds the stack, writes, reads,
// compares and copies it, and gives each layer's settings as parameters.
#pragma once

#include "torvane/links/alias.h"
#include "torvane/memory/private_ge_mtools.h"
#include "torvane/shaders/gradient.h"
#include "torvane/text/ge_string.h"
#include "torvane/values/custom_data.h"

namespace _torvane_
{

class BaseShader;
class BlendFolder;
class BlendLayer;

inline constexpr Long kCustomBlendLayers = 1011131;

enum BlendLayerType : Long
{
  kBlendFolder = 1,
  kBlendShader = 2,
  kBlendBC = 3,
  kBlendHSL = 4,
  kBlendPosterize = 5,
  kBlendColorize = 6,
  kBlendClamp = 7,
  kBlendClip = 8,
  kBlendDistorter = 9,
  kBlendTransform = 10,
};

// Ids of GetLayerParameter that every layer has. Those of the layer's own settings begin at 2000.
inline constexpr Long kBlendEnabled = 1000;
inline constexpr Long kBlendSelected = 1001;
inline constexpr Long kBlendMode = 1002;
inline constexpr Long kBlendFolderFirstLink = 2003; // of a folder: the link of its first child

// In the container that holds a stack, a setting has the id kBlendFirstId + 20 * layer id + sub.
inline constexpr Long kBlendFirstId = 10000;
inline constexpr Long kBlendIdsPerLayer = 20;

// Where MoveLayer puts a layer.
enum BlendPlace : Long
{
  kBlendBefore = 0,
  kBlendInside = 1, // first among the children of the target, a folder
  kBlendBehind = 2,
};

// The array that owns the layers of a stack or of a folder. A layer's parent is the array that holds it.
class CBlendLayers
{
 public:
  CBlendLayers() = default;
  ~CBlendLayers() { FlushLayers(); }
  CBlendLayers(const CBlendLayers&) = delete; // use CopyLayersTo
  CBlendLayers& operator=(const CBlendLayers&) = delete;

  Long GetCount() const { return layers_.GetCount(); }
  BlendLayer* GetLayer(Long index) const; // null out of range
  // Deletes all layers.
  void FlushLayers();

  // A new layer of a type, in no array. Null when memory is short and, with a report, for another number.
  static BlendLayer* MakeLayer(Long type);
  // Always null, with a report: a layer needs a type.
  static void* AllocObject();
  static void DeleteLayer(BlendLayer*& layer);

  // A new layer at the end of the array; null as MakeLayer.
  BlendLayer* AppendLayer(Long type);
  // Takes a layer out, after it has released what it is linked to, and leaves it to the caller. False, and nothing
  // done, when it isn't in this array.
  Bool RemoveLayer(BlendLayer* layer);
  // Takes a layer out of the array that holds it and leaves it to the caller. One that its array doesn't hold is
  // reported.
  static void RemoveLayerFromParent(BlendLayer* layer);
  // Moves a layer to another place (see BlendPlace), relative to a target layer in any array of the stack; without a
  // target to the front of this array. False, and nothing moved, when the target can't have it: for kBlendInside a
  // layer that is no folder; a target within the layer itself; memory is short. Another place does nothing: true.
  Bool MoveLayer(BlendLayer* layer, BlendLayer* target, Long place);

  // The following go through the folders too, depth first.
  void ClearSelection();
  BlendLayer* FirstSelected() const;   // null when none is selected
  BlendLayer* FindById(Long id) const; // by the layer id; null when there is none
  void ReleaseLinked();

  // Replaces the other array's layers by copies. False when memory is short: the other array then holds what was
  // copied.
  Bool CopyLayersTo(CBlendLayers& other, TransArray* translation) const;
  // The link that stands for the first layer, or null.
  GeAliasLink* GetFirstLink() const;
  // True when both have equal layers in the same order.
  Bool CompareLayers(const CBlendLayers& other) const;

  // A count, the level of the layers, and the layers.
  Bool WriteList(HyperFile& file, Long level) const;
  // Appends what it reads, or replaces the layers with `clear`. False when any value failed, or a layer's type isn't
  // known, which is reported and ends the reading.
  Bool ReadList(HyperFile& file, Bool clear);

 private:
  static Bool WriteOneLayer(HyperFile& file, BlendLayer& layer);
  BlendLayer* ReadOneLayer(HyperFile& file, Long level, Bool& read);
  Bool InsertLayer(BlendLayer* layer, Long position);
  Long FindLayer(const BlendLayer* layer) const;

  GeTempDynArray<BlendLayer*> layers_;
};

inline constexpr Long kBlendListLevel = 3; // of the layers that are written

struct BlendField;
struct BlendFields;

class BlendLayer : public GeMemory
{
 public:
  BlendLayer(Long type, const char* layerName, Bool mark) : layerType_(type), layerMark_(mark ? 1 : 0), name_(layerName)
  {}
  virtual ~BlendLayer() = default;
  BlendLayer(const BlendLayer&) = delete; // use CopyLayerTo
  BlendLayer& operator=(const BlendLayer&) = delete;

  virtual void GetLayerName(String& name) { name = name_; }
  // Makes `destination` equal to this layer, its place apart. False for a layer of another type and when memory is
  // short.
  virtual Bool CopyLayerTo(BlendLayer& destination, TransArray* translation) const;
  // The layer's own settings. Reading goes on after a value that can't be used; false when there was one.
  virtual Bool ReadLayer(HyperFile& file, Long level);
  virtual Bool WriteLayer(HyperFile& file) const;
  virtual Bool LayersDiffer(const BlendLayer& other) const;
  // True for layers of one type and name, whose children are so too. `mode` has no effect.
  virtual Bool LayersEqualIgnoringFlags(const BlendLayer& other, Long mode) const;
  // A setting by its id. False for an id that the layer lacks.
  virtual Bool GetLayerParameter(Long id, GeData& value) const;
  // Takes any number.
  virtual Bool SetLayerParameter(Long id, const GeData& value);
  // A setting by its sub number, with what stands below it in the path: a component of a Vector, a part of a gradient.
  // Sets kParameterAnswered in the flags when the layer has that sub; one that it lacks is passed over. Always true.
  virtual Bool GetLayerValue(Long sub, const ParameterPath& path, GeData& value, ULong& flags) const;
  // Brings a number into its range.
  virtual Bool SetLayerValue(Long sub, const ParameterPath& path, const GeData& value, ULong& flags);
  // Called when the layer leaves its array for good.
  virtual void ReleaseLinked() {}

  // This layer if it is a folder, else null.
  virtual BlendFolder* AsFolder() { return nullptr; }
  // The link that stands for the layer: that of a shader layer, or of the first layer in a folder; else null.
  virtual GeAliasLink* GetLink() { return nullptr; }

  Long GetLayerType() const { return layerType_; }
  CBlendLayers* GetParent() const { return parent_; }
  const String& GetName() const { return name_; }
  void SetName(const String& name) { name_ = name; }
  Bool IsOpen() const { return isOpen_ != 0; }
  void SetOpen(Bool open) { isOpen_ = open ? 1 : 0; }
  Bool IsSelected() const { return selected_; }
  void SetSelected(Bool selected) { selected_ = selected; }
  Bool IsEnabled() const { return enabled_; }
  void SetEnabled(Bool enabled) { enabled_ = enabled; }
  // Unique in a stack; whoever builds one gives it.
  Long GetLayerId() const { return layerId_; }
  void SetLayerId(Long id) { layerId_ = id; }
  Long GetBlendMode() const { return blendMode_; }
  void SetBlendMode(Long mode) { blendMode_ = mode; }
  Long GetLayerMark() const { return layerMark_; }

 protected:
  // The class's own settings, in file order. Pointers lead into this layer.
  virtual BlendFields Fields() = 0;
  // The settings that every layer has, and then those; without a value behind the last.
  BlendField FieldAt(Long index) const;
  // The one with a parameter's id; without a value for an id that the layer lacks.
  BlendField FindField(Long id) const;

 private:
  friend class CBlendLayers;

  static constexpr Long kCommonFields = 5;

  BlendFields CommonFields() const; // a file holds them around the class's own
  BlendFields FieldsOf() const;     // what Fields gives, for reading

  CBlendLayers* parent_ = nullptr; // not owned
  Long layerType_;
  Long isOpen_ = 1;
  Bool selected_ = false;
  Bool enabled_ = true;
  Long layerId_ = 0;
  Long blendMode_ = 0;
  Long layerMark_;

 protected:
  String name_;
};

// A layer that holds layers.
class BlendFolder : public BlendLayer
{
 public:
  BlendFolder() : BlendLayer(kBlendFolder, "Folder", true) {}

  Bool LayersEqualIgnoringFlags(const BlendLayer& other, Long mode) const override;
  void ReleaseLinked() override { children_.ReleaseLinked(); }
  BlendFolder* AsFolder() override { return this; }
  GeAliasLink* GetLink() override { return children_.GetFirstLink(); }

  CBlendLayers& GetChildren() { return children_; }
  const CBlendLayers& GetChildren() const { return children_; }

 protected:
  BlendFields Fields() override;

 private:
  Long mode_ = 1;
  Real opacity_ = 1.0;
  Bool isOpen2_ = true;
  CBlendLayers children_;
};

// A layer whose image comes from a shader.
class BlendShader : public BlendLayer
{
 public:
  BlendShader() : BlendLayer(kBlendShader, "BlendShader", true) {}

  // The shader's name, which becomes the layer's.
  void GetLayerName(String& name) override;
  // Takes the shader out of its list and deletes it, unless the shader's own settings hold the layer.
  void ReleaseLinked() override;
  GeAliasLink* GetLink() override { return &link_; }

  BaseShader* GetShader() const; // null when the link is empty or names another node

 protected:
  BlendFields Fields() override;

 private:
  Long mode_ = 1;
  Real opacity_ = 1.0;
  GeAliasLink link_;
};

// The layer "B/C/G".
class BlendEffectBC : public BlendLayer
{
 public:
  BlendEffectBC() : BlendLayer(kBlendBC, "B/C/G", false) {}

 protected:
  BlendFields Fields() override;

 private:
  Real first_ = 0.0;
  Real second_ = 0.0;
  Real third_ = 1.0;
};

// The layer "HLS". Its flag changes the ranges of the first two.
class BlendEffectHSL : public BlendLayer
{
 public:
  BlendEffectHSL() : BlendLayer(kBlendHSL, "HLS", false) {}

 protected:
  BlendFields Fields() override;

 private:
  Real first_ = 0.0;
  Real second_ = 0.0;
  Real third_ = 0.0;
  Bool flag_ = false;
};

class BlendEffectPosterize : public BlendLayer
{
 public:
  BlendEffectPosterize() : BlendLayer(kBlendPosterize, "Posterize", false) {}

 protected:
  BlendFields Fields() override;

 private:
  Real part_ = 0.1;
  Long number_ = 5;
};

// Colours by a gradient.
class BlendEffectColorize : public BlendLayer
{
 public:
  BlendEffectColorize() : BlendLayer(kBlendColorize, "Colorize", false) {}

  GradientData& GetGradient() { return gradient_; }

 protected:
  BlendFields Fields() override;

 private:
  Long number_ = 0;
  GradientData gradient_;
  Bool first_ = false;
  Bool second_ = false;
};

// Two limits: the form of the clamp and of the clip layer.
class BlendEffectLimits : public BlendLayer
{
 protected:
  BlendEffectLimits(Long type, const char* layerName) : BlendLayer(type, layerName, false) {}
  BlendFields Fields() override;

 private:
  Real first_ = 0.0;
  Real second_ = 1.0;
};

class BlendEffectClamp : public BlendEffectLimits
{
 public:
  BlendEffectClamp() : BlendEffectLimits(kBlendClamp, "Clamp") {}
};

class BlendEffectClip : public BlendEffectLimits
{
 public:
  BlendEffectClip() : BlendEffectLimits(kBlendClip, "Clip") {}
};

class BlendEffectDistorter : public BlendLayer
{
 public:
  BlendEffectDistorter() : BlendLayer(kBlendDistorter, "Distort", true) {}

 protected:
  BlendFields Fields() override;

 private:
  Long firstNumber_ = 13;
  Real first_ = 0.1;
  Long secondNumber_ = 3;
  Bool flag_ = false;
  Real second_ = 5.0;
  Real third_ = 1.0;
  Real fourth_ = 1.0;
};

class BlendEffectTransform : public BlendLayer
{
 public:
  BlendEffectTransform() : BlendLayer(kBlendTransform, "Transform", true) {}

 protected:
  BlendFields Fields() override;

 private:
  Real real_ = 0.0;
  Bool firstFlag_ = false;
  Bool secondFlag_ = false;
  Vector firstVector_{1.0, 1.0, 1.0};
  Vector secondVector_;
};

// The custom value: a stack and its version.
class iBlendDataType : public ListedCustomData // NOLINT(readability-identifier-naming): the type's own name
{
 public:
  static constexpr NodeKindOf<iBlendDataType> kNodeKind{"blend layers", &CustomData::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  explicit iBlendDataType(const CustomDataType& type) : ListedCustomData(type) {}

  Bool IsEqual(const CustomData& other) const override;
  Bool CopyTo(CustomData& destination, TransArray* translation) const override;
  Bool Read(HyperFile& file, Long level) override;
  void Write(HyperFile& file) const override;
  // A layer's setting by its id in the container that holds the stack (see kBlendFirstId), and what stands below it in
  // the path. False when no layer has the id; a sub that the layer lacks is passed over, and the flags stay.
  Bool GetValue(const ParameterPath& path, GeData& value, ULong& flags) const override;
  Bool SetValue(const ParameterPath& path, const GeData& value, ULong& flags) override;

  CBlendLayers& GetLayers() { return layers_; }
  const CBlendLayers& GetLayers() const { return layers_; }
  Long GetBlendVersion() const { return blendVersion_; }
  void SetBlendVersion(Long version) { blendVersion_ = version; }

 private:
  BlendLayer* FindLayer(const ParameterPath& path, Long& sub) const;

  CBlendLayers layers_;
  Long blendVersion_ = 2;
};

} // namespace _torvane_
