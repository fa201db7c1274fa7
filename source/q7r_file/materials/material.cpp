#include "torvane/materials/material.h"

#include <utility>

#include "k2v_file/stream/chunk_visitor.h"
#include "q7r_file/materials/material_defaults.h"
#include "torvane/shaders/base_shader.h"

namespace _torvane_
{

namespace
{

constexpr Long kChunkChannels = 5703;
constexpr Long kChunkOldChannelEntry = 5706; // known and empty
constexpr Long kChunkOldChannelList = 5707;  // known and empty

constexpr Long kChannelAtStart[] = {0, 8};

// The place of a channel in memory and in a file; -1 for a number that no channel has.
Long PlaceOf(Long channel)
{
  if (channel == kFirstChannel)
    return kMaterialChannelCount - 1;
  return channel >= 0 && channel <= kLastChannel ? channel : -1;
}

} // namespace

// ---------------------------------------------------------------------------------------------------------------
// Channels

Bool BaseChannel::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (id == kChunkOldChannelEntry || id == kChunkOldChannelList)
    return true;
  if (id != kChunkOldChannel)
    return false;
  return ReadChunkBody(file, level, [](ChunkReader& v) {
    v.Skip<Vector, Real, String, Real, Long, Long, Vector, Real, Real>();
    if (!v.VersionBelow(kVersionNodeHeader)) {
      v.Skip<Bool, Bool>();
      if (v.Level() >= 1)
        v.Skip<Filename>();
    }
  });
}

void BaseChannel::WriteChunks(HyperFile& file)
{
  file.WriteChunkStart(kNodeChannel, 0);
  file.WriteChunkEnd();
}

// ---------------------------------------------------------------------------------------------------------------
// The material

Material::Material() : BaseMaterial(kMaterialStandard), channelState_{}
{
  for (Long channel : kChannelAtStart)
    channelState_[channel] = 1;
  SetMaterialDefaults(data_);
}

struct Material::Channels
{
  BaseChannel places[kMaterialChannelCount];
};

struct Material::KeptInChannels
{
  KeptChunks places[kMaterialChannelCount];
};

Material::~Material()
{
  DeleteObj(channels_);
  DeleteObj(kept_);
}

Bool Material::IsInstanceOf(Long type) const { return type == kMaterialStandard || BaseMaterial::IsInstanceOf(type); }

// A channel's own chunk, which this node reads: nothing in it belongs to the channel.
Bool Material::ReadChannel(HyperFile& file, Long place)
{
  const Long outer = std::exchange(readPlace_, place);
  const Bool read = ReadChunks(file, true);
  readPlace_ = outer;
  return read;
}

void Material::WriteChannel(HyperFile& file, Long place) const
{
  file.WriteChunkStart(kNodeChannel, 0);
  if (kept_)
    kept_->places[place].Write(file);
  file.WriteChunkEnd();
}

Bool Material::KeepChunk(HyperFile& file, Long id, Long level)
{
  if (readPlace_ < 0)
    return BaseMaterial::KeepChunk(file, id, level);
  if (!kept_)
    kept_ = NewObj<KeptInChannels>();
  return kept_ && kept_->places[readPlace_].Read(file, id, level);
}

template <>
struct ChunkFields<Material>
{
  // Each switch is followed by the channel's chunk.
  template <class Visitor>
  static Bool VisitChannels(Material& material, Visitor& v)
  {
    for (Long i = 0; i < kMaterialChannelCount && v.Good(); ++i) {
      if (i == kMaterialChannelCount - 1 && v.VersionBelow(kVersionLastChannel))
        break;
      v.Bool(material.channelState_[i]);
      if constexpr (Visitor::kReading)
        v.Note(v.Good() && material.ReadChannel(v.File(), i));
      else
        material.WriteChannel(v.File(), i);
    }
    return v.Good();
  }
};

// Files below version 7500 hold the parameters of the surface here. Only the switches are taken from them: the
// parameters keep their defaults, as do those that later versions stored with another meaning.
Bool Material::ReadOldChannels(HyperFile& file, Long level)
{
  return ReadChunkBody(file, level, [this](ChunkReader& v) {
    const Long switches = v.Level() > 0 ? 13 : 12;
    for (Long i = 0; i < switches; ++i)
      v.Bool(channelState_[i]);
    v.Skip<Bool, Bool, Real, Real, Real, Real, Real, Bool, Vector, Bool, Bool, Bool>(); // 1003 to 1014
    v.Skip<Real, Real, Long, Real, Real, Real, Real, Real, Bool, Real, Real>();         // 1016 to 1026
    if (v.Level() >= 1)
      v.Skip<Bool, Bool>(); // 1000, 1001
    if (v.Level() >= 2)
      v.Skip<Bool>(); // 1002
    if (v.Level() >= 3)
      v.Skip<BaseContainer>();
    if (v.Level() >= 4)
      v.Skip<Bool>(); // 1027
  });
}

Bool Material::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseMaterial::ReadChunk(file, id, level)) {
    if (id == kChunkNodeHeader && !name_.Content())
      name_ = "Mat";
    return true;
  }
  if (id != kChunkChannels)
    return false;
  if (file.IsBefore7500())
    return ReadOldChannels(file, level);
  return ReadChunkBody(file, level, [this](ChunkReader& v) { return ChunkFields<Material>::VisitChannels(*this, v); });
}

void Material::WriteChunks(HyperFile& file)
{
  BaseMaterial::WriteChunks(file);
  WriteChunk(file, kChunkChannels, 0,
             [this](ChunkWriter& v) { return ChunkFields<Material>::VisitChannels(*this, v); });
}

Bool Material::CopyKeptInChannels(Material& destination) const
{
  if (!kept_) {
    DeleteObj(destination.kept_);
    return true;
  }
  if (!destination.kept_)
    destination.kept_ = NewObj<KeptInChannels>();
  for (Long i = 0; i < kMaterialChannelCount; ++i) {
    if (!destination.kept_ || !kept_->places[i].CopyTo(destination.kept_->places[i]))
      return false;
  }
  return true;
}

Bool Material::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<Material>(&destination);
  if (!target)
    return false;
  for (Long i = 0; i < kMaterialChannelCount; ++i)
    target->channelState_[i] = channelState_[i];
  return CopyKeptInChannels(*target) && BaseMaterial::CopyTo(destination, flags, translation);
}

Long Material::ChannelIsOn(Long channel) const
{
  const Long place = PlaceOf(channel);
  return place < 0 ? 0 : channelState_[place];
}

void Material::SwitchChannel(Long channel, Long value)
{
  const Long place = PlaceOf(channel);
  if (place >= 0)
    channelState_[place] = value;
}

BaseChannel* Material::ChannelAt(Long channel)
{
  if (!channels_)
    channels_ = NewObj<Channels>();
  const Long place = PlaceOf(channel);
  return channels_ ? &channels_->places[place < 0 ? 0 : place] : nullptr;
}

void Material::ChannelParameterIds(Long channel, Long& colorId, Long& brightnessId, Long& mixId, Long& modeId)
{
  const ChannelParameters* row = FindChannelParameters(channel);
  colorId = row ? row->color : 0;
  brightnessId = row ? row->brightness : 0;
  mixId = row ? row->mix : 0;
  modeId = row ? row->mode : 0;
}

// ---------------------------------------------------------------------------------------------------------------
// Shader slots

BaseShader* Material::ChannelShaderOf(Long id) const { return NodeCast<BaseShader>(data_.GetLink(id)); }

BaseShader* Material::BindChannelBitmap(Long id, const Filename& filename)
{
  if (BaseShader* present = ChannelShaderOf(id))
    return present;
  BaseShader* shader = MakeShader(kShaderBitmap);
  if (!shader)
    return nullptr;
  shader->SetBitmapFilename(filename);
  data_.SetLink(id, shader);
  if (shader->BitmapFilename() != filename || ChannelShaderOf(id) != shader || !InsertShaderLast(shader))
    DeleteObj(shader); // memory is short
  return shader;
}

BaseShader* Material::BindChannelShader(Long id, Long shaderType)
{
  BaseShader* shader = MakeShader(shaderType);
  if (!shader)
    return nullptr;
  GeAliasLink link;
  link.SetLink(shader);
  if (!SetParameterById(id, GeData(link)) || ChannelShaderOf(id) != shader || !InsertShaderLast(shader))
    DeleteObj(shader);
  return shader;
}

Material* AllocMaterial() { return NewObj<Material>(); }

BaseShader* SetMaterialBitmap(BaseMaterial* material, Long id, const Filename& filename)
{
  Material* standard = NodeCast<Material>(material);
  return standard ? standard->BindChannelBitmap(id, filename) : nullptr;
}

} // namespace _torvane_
