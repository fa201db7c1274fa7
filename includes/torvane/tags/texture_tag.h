// The texture tag: binds a material to an object, with a projection, offsets and tiling. All settings are entries of
// the tag's container.
#pragma once

#include "torvane/math/vector.h"
#include "torvane/tags/base_tag.h"

namespace _torvane_
{

class BaseDocument;
class BaseMaterial;
class ChunkReader;

// Entries of a texture tag's container that have a known meaning; 1005, 1007 to 1009 and 1200 to 1202 stand by number
// among the defaults in texture_tag.cpp.
inline constexpr Long kTextureOffsetX = 1000;     // Real
inline constexpr Long kTextureOffsetY = 1001;     // Real
inline constexpr Long kTextureLengthX = 1002;     // Real
inline constexpr Long kTextureLengthY = 1003;     // Real
inline constexpr Long kTextureProjection = 1004;  // Long
inline constexpr Long kTextureOldName = 1006;     // String, from old files alone
inline constexpr Long kTextureMaterial = 1010;    // link
inline constexpr Long kTexturePosition = 1011;    // Vector, of the projection
inline constexpr Long kTextureSize = 1012;        // Vector
inline constexpr Long kTextureRotation = 1013;    // Vector, radians, in the scene's own rotation order
inline constexpr Long kTextureSecondLink = 1017;  // link
inline constexpr Long kTextureFilmAspect = 1018;  // Real
inline constexpr Long kTexturePixelAspect = 1020; // Real

inline constexpr Long kTextureProjectionUVW = 6; // of kTextureProjection: by the UVW tag of the object

// Computed parameters. Setting one also leaves the value as an entry of its own, but for 0 tiles, which change nothing.
inline constexpr Long kTextureTilesX = 1014; // Real: 1 / length; 0 for a length of next to nothing
inline constexpr Long kTextureTilesY = 1015;
// Long: a position in a list of aspects, 1 for the first, or 0 for an aspect that the list lacks; setting one stores
// the aspect.
inline constexpr Long kTextureFilmAspectPreset = 10000;
inline constexpr Long kTexturePixelAspectPreset = 10001;

// The layout of old files; the present one has no chunk of the tag's own.
inline constexpr Long kChunkOldTexture = 110010;

class TextureTagRecord;

class TextureTag : public BaseTag
{
 public:
  static constexpr NodeKindOf<TextureTag> kNodeKind{"texture tag", &BaseTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  TextureTag();
  ~TextureTag() override;

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  Bool ReadInOnePiece(HyperFile& file) override;
  // Becomes what a record of such a tag at `place` tells. False, with the file's error, when memory is short.
  Bool TakeRecord(HyperFile& file, const TextureTagRecord& record, const UChar* place);
  // The matrix of the destination is computed anew.
  Bool CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation) override;
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;
  // Hands on the matrix as it is computed now; always true. A hook for clients.
  virtual Bool CopyTextureCache(TextureTag& destination, ULong flags, TransArray* translation);

  // What the material link names, or null; with a document also null for a node of another one. That it is a material
  // is up to whoever set the link: a file may name anything there.
  BaseList2D* GetMaterial(const BaseDocument* document = nullptr) const;
  void SetMaterial(BaseMaterial* material); // null empties the link

  // The place of the projection; zero where an entry is absent.
  Vector Position() const { return data_.GetVector(kTexturePosition); }
  Vector Size() const { return data_.GetVector(kTextureSize); }
  Vector Rotation() const { return data_.GetVector(kTextureRotation); }
  void SetPosition(const Vector& position) { SetPlace(kTexturePosition, position); }
  void SetSize(const Vector& size) { SetPlace(kTextureSize, size); }
  void SetRotation(const Vector& rotation) { SetPlace(kTextureRotation, rotation); }

  // The three as a matrix, whose axes have the lengths of the size. It is computed when it is first asked for after
  // one of them was set by an operation or a parameter. Identity when memory is short.
  const Matrix& TextureMatrix();
  // Takes the three from a matrix; of the rotations that mean the same, the one nearest to the present one.
  void SetTextureMatrix(const Matrix& matrix);

 private:
  Matrix* NeedMatrix();
  void SetPlace(Long id, const Vector& value);
  Real GetTiles(Long id) const;
  void SetPreset(Long id, const GeData& value);
  Bool ReadOldChunk(HyperFile& file, Long level);
  void ReadOldAspects(ChunkReader& v);
  Bool ReadLinkEntry(HyperFile& file, Long id);

  Bool matrixValid_ = false;
  Matrix* textureMatrix_ = nullptr; // owned; null until it is first asked for
};

} // namespace _torvane_
