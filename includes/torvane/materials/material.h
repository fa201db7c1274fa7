// The standard material: fourteen channels, each with a switch, some parameters and a shader slot.
#pragma once

#include "torvane/materials/base_material.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/text/filename.h"

namespace _torvane_
{

class BaseShader;

// Channel numbers run from -1 to 12. Number -1 has the last place in memory and in a file.
inline constexpr Long kMaterialChannelCount = 14;
inline constexpr Long kFirstChannel = -1;
inline constexpr Long kLastChannel = 12;

// Parameters of the colour channel, 0.
inline constexpr Long kColorChannel = 0;
inline constexpr Long kMaterialColor = 2100;
inline constexpr Long kMaterialColorBrightness = 2101;
inline constexpr Long kMaterialColorMix = 2102; // Real: how much of the shader
inline constexpr Long kMaterialColorMixMode = 2103;
inline constexpr Long kMaterialColorShader = 8000;

inline constexpr Long kNodeChannel = 5899;     // the node type of a channel, and its chunk
inline constexpr Long kChunkOldChannel = 5704; // a channel of old files

// A channel of a material. All that describes it lives in the material's container: this node has an empty container
// and no data in a file.
class BaseChannel : public PrivateChunk
{
 public:
  // Takes the chunks of old files; their values are dropped.
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  Long GetType() const override { return kNodeChannel; }
  void WriteChunks(HyperFile& file) override;

  BaseContainer& GetDataInstance() { return data_; }

 private:
  BaseContainer data_;
};

class Material : public BaseMaterial
{
 public:
  static constexpr NodeKindOf<Material> kNodeKind{"standard material", &BaseMaterial::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // With every default; the channels 0 and 8 are on.
  Material();
  ~Material() override;

  Bool IsInstanceOf(Long type) const override;
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  // What stands in the chunk of a channel is written back there.
  Bool KeepChunk(HyperFile& file, Long id, Long level) override;
  // Channel objects are not copied.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;

  // The switch of a channel; 0 for a number that no channel has.
  Long ChannelIsOn(Long channel) const;
  // Other channel numbers are ignored.
  void SwitchChannel(Long channel, Long value);
  // Channel 0 for a number that no channel has. The channels are made when one is first asked for: null when memory is
  // short. The material owns them.
  BaseChannel* ChannelAt(Long channel);
  // The ids of a channel's parameters; 0 where the channel lacks one.
  static void ChannelParameterIds(Long channel, Long& colorId, Long& brightnessId, Long& mixId, Long& modeId);
  // The shader that the link parameter `id` names, or null.
  BaseShader* ChannelShaderOf(Long id) const;
  // The shader that the link parameter `id` names, its file left as it is; without one, a new bitmap shader on that
  // file, last in the shader list, to which the parameter then points. Null when memory is short. The material owns
  // the shader.
  BaseShader* BindChannelBitmap(Long id, const Filename& filename);
  // The same with a shader of any type, which is always new.
  BaseShader* BindChannelShader(Long id, Long shaderType);

 private:
  friend struct ChunkFields<Material>;

  Bool ReadChannel(HyperFile& file, Long place);
  void WriteChannel(HyperFile& file, Long place) const;
  Bool CopyKeptInChannels(Material& destination) const;
  Bool ReadOldChannels(HyperFile& file, Long level);

  Long channelState_[kMaterialChannelCount]; // 0 or 1, by place
  struct Channels;
  Channels* channels_ = nullptr; // owned
  struct KeptInChannels;
  KeptInChannels* kept_ = nullptr; // owned; made with the first chunk that is kept
  Long readPlace_ = -1;            // of the channel whose chunk is being read
};

// A new standard material that the caller owns; null when memory is short.
Material* AllocMaterial();

// BindChannelBitmap on a material of whatever class: null for one without channels.
BaseShader* SetMaterialBitmap(BaseMaterial* material, Long id, const Filename& filename);

} // namespace _torvane_
