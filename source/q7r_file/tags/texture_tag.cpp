#include "torvane/tags/texture_tag.h"

#include <cmath>

#include "k2v_file/values/container_defaults.h"
#include "q7r_file/tags/tag_entries.h"
#include "q7r_file/tags/texture_tag_record.h"
#include "torvane/materials/base_material.h"
#include "torvane/math/ge_math.h"

namespace _torvane_
{

namespace
{

// In the order in which a file holds them.
constexpr ContainerDefault kTextureDefaults[] = {
    {kTextureOffsetX, DefaultForm::kReal, 0.0},
    {kTextureOffsetY, DefaultForm::kReal, 0.0},
    {kTextureLengthX, DefaultForm::kReal, 1.0},
    {kTextureLengthY, DefaultForm::kReal, 1.0},
    {kTextureProjection, DefaultForm::kLong, 0.0},
    {1005, DefaultForm::kLong, 0.0},
    {1007, DefaultForm::kBool, 1.0},
    {1008, DefaultForm::kBool, 0.0},
    {1009, DefaultForm::kBool, 0.0},
    {kTextureMaterial, DefaultForm::kLink, 0.0},
    {kTextureSize, DefaultForm::kGrey, 100.0},
    {kTextureSecondLink, DefaultForm::kLink, 0.0},
    {kTextureFilmAspect, DefaultForm::kReal, 1.3333333333},
    {kTexturePixelAspect, DefaultForm::kReal, 1.0},
    {1200, DefaultForm::kBool, 1.0},
    {1201, DefaultForm::kReal, 0.0},
    {1202, DefaultForm::kReal, 0.0},
};

constexpr UniChar kNewName[] = {'T', 'e', 'x', 't', 'u', 'r', 'e'};

// An aspect: the number that is looked for, and the one that is stored. They are not always the same.
struct Aspect
{
  Real searched;
  Real given;
};

constexpr Long kAspectCount = 7;

struct AspectList
{
  Long preset; // the parameter that names a position in the list
  Long entry;  // where the aspect is stored
  Aspect rows[kAspectCount];
};

constexpr AspectList kAspectLists[] = {
    {kTextureFilmAspectPreset,
     kTextureFilmAspect,
     {{1.0, 1.0},
      {1.3333333333333333, 1.3333333333333333},
      {1.7777777777777777, 1.7777777777777777},
      {1.5, 1.5},
      {1.5555555555555556, 1.5555555555555556},
      {1.85185, 1.85185},
      {2.3888888, 2.38888888}}},
    {kTexturePixelAspectPreset,
     kTexturePixelAspect,
     {{1.0, 1.0},
      {0.9, 0.9},
      {1.0666666666666, 1.066666666666},
      {1.2, 1.2},
      {1.3333333333333, 1.3333333333333},
      {1.42222222222222, 1.422222222222},
      {2.0, 2.0}}},
};

constexpr Real kAspectTolerance = 0.001;
constexpr Real kLeastLength = 1e-7; // shorter ones have no tiles

const AspectList* FindAspectList(Long preset)
{
  for (const AspectList& list : kAspectLists)
    if (list.preset == preset)
      return &list;
  return nullptr;
}

Long FindAspect(const AspectList& list, Real aspect)
{
  for (Long i = 0; i < kAspectCount; ++i)
    if (std::abs(list.rows[i].searched - aspect) < kAspectTolerance)
      return i + 1;
  return 0;
}

// The length that belongs to a number of tiles; 0 for a parameter of another kind.
Long LengthOfTiles(Long id)
{
  return id == kTextureTilesX ? kTextureLengthX : id == kTextureTilesY ? kTextureLengthY : 0;
}

Bool IsPlace(Long id) { return id == kTexturePosition || id == kTextureSize || id == kTextureRotation; }

Real QuotientOrOne(Real a, Real b) { return b != 0.0 ? a / b : 1.0; }

} // namespace

TextureTag::TextureTag() : BaseTag(kTagTexture) { data_.SetDefaults(DefaultsOf<kTextureDefaults>()); }

TextureTag::~TextureTag() { DeleteObj(textureMatrix_); }

Bool TextureTag::CopyTo(PrivateChunk& destination, ULong flags, TransArray* translation)
{
  auto* target = NodeCast<TextureTag>(&destination);
  if (!target)
    return false;
  target->matrixValid_ = false;
  return BaseTag::CopyTo(destination, flags, translation);
}

Bool TextureTag::CopyTextureCache(TextureTag& destination, ULong, TransArray*)
{
  destination.matrixValid_ = matrixValid_ && destination.NeedMatrix();
  if (destination.matrixValid_)
    *destination.textureMatrix_ = *textureMatrix_;
  return true;
}

BaseList2D* TextureTag::GetMaterial(const BaseDocument* document) const
{
  return data_.GetLink(kTextureMaterial, document);
}

void TextureTag::SetMaterial(BaseMaterial* material) { data_.SetLink(kTextureMaterial, material); }

// ---------------------------------------------------------------------------------------------------------------

Real TextureTag::GetTiles(Long id) const
{
  const Real length = data_.GetReal(LengthOfTiles(id));
  return std::abs(length) > kLeastLength ? 1.0 / length : 0.0;
}

Bool TextureTag::GetParameter(const ParameterPath& path, GeData& value)
{
  const Long id = path[0].id;
  if (LengthOfTiles(id) != 0) {
    value = GeData(GetTiles(id));
    return true;
  }
  const AspectList* list = FindAspectList(id);
  if (!list)
    return BaseTag::GetParameter(path, value);
  value = GeData(FindAspect(*list, data_.GetReal(list->entry)));
  return true;
}

Bool TextureTag::SetParameter(const ParameterPath& path, const GeData& value)
{
  const AllocationWatch watch;
  const Long id = path[0].id;
  if (const Long length = LengthOfTiles(id); length != 0) {
    const Real tiles = value.GetReal();
    if (tiles == 0.0)
      return true;
    data_.SetReal(length, 1.0 / tiles);
  } else if (IsPlace(id)) {
    matrixValid_ = false;
  } else {
    SetPreset(id, value);
  }
  return BaseTag::SetParameter(path, value) && !watch.Failed();
}

void TextureTag::SetPreset(Long id, const GeData& value)
{
  const AspectList* list = FindAspectList(id);
  const Long position = list ? value.GetLong() : 0;
  if (position < 1 || position > kAspectCount)
    return;
  const Real aspect = list->rows[position - 1].given;
  if (aspect != data_.GetReal(list->entry))
    SetParameterById(list->entry, GeData(aspect));
}

// ---------------------------------------------------------------------------------------------------------------

void TextureTag::SetPlace(Long id, const Vector& value)
{
  data_.SetVector(id, value);
  matrixValid_ = false;
}

// Made if there is none; null when memory is short.
Matrix* TextureTag::NeedMatrix()
{
  if (!textureMatrix_)
    textureMatrix_ = NewObj<Matrix>();
  return textureMatrix_;
}

const Matrix& TextureTag::TextureMatrix()
{
  static constexpr Matrix kNone;
  if (!NeedMatrix())
    return kNone;
  if (matrixValid_)
    return *textureMatrix_;
  const Vector rotation = Rotation();
  const Vector size = Size();
  Matrix& matrix = *textureMatrix_;
  matrix = AnglesToMatrix(rotation, kRotationOrderScene);
  matrix.v1 *= size.x;
  matrix.v2 *= size.y;
  matrix.v3 *= size.z;
  matrix.off = Position();
  matrixValid_ = true;
  return matrix;
}

void TextureTag::SetTextureMatrix(const Matrix& matrix)
{
  const Vector size(Length(matrix.v1), Length(matrix.v2), Length(matrix.v3));
  Vector rotation;
  SetPosition(matrix.off);
  SetSize(size);
  if (size != Vector()) {
    const Matrix axes({}, Normalize(matrix.v1), Normalize(matrix.v2), Normalize(matrix.v3));
    rotation = ClosestAngles(Rotation(), MatrixToAngles(axes, kRotationOrderScene), kRotationOrderScene);
  }
  SetRotation(rotation);
}

// ---------------------------------------------------------------------------------------------------------------

Bool TextureTag::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseTag::ReadChunk(file, id, level)) {
    if (id == kChunkNodeHeader && !name_.Content())
      name_ = String::Constant(kNewName);
    return true;
  }
  return id == kChunkOldTexture && (level < 0 || ReadOldChunk(file, level)) && file.SkipToEndChunk();
}

Bool TextureTag::ReadOldChunk(HyperFile& file, Long level)
{
  ChunkReader v(file, level);
  EntryReader entries(v, data_);
  const Bool old = v.VersionBelow(kVersionTransform);
  for (Long id : {kTexturePosition, kTextureSize, kTextureRotation}) {
    Vector part;
    if (v.Vector(part))
      SetPlace(id, part);
  }
  if (old)
    v.Skip<Matrix, Matrix>();
  for (Long id : {kTextureOffsetX, kTextureOffsetY, kTextureLengthX, kTextureLengthY})
    entries.Real(id);
  for (Long id : {1007, 1008, 1009})
    entries.Bool(id);
  entries.Long(kTextureProjection);
  entries.Long(1005);
  if (old)
    v.Skip<Long, Long>();
  String name;
  if (level >= 1 && v.String(name))
    data_.SetString(kTextureOldName, name);
  if (level >= 2 && old)
    v.Skip<Bool>();
  if (level >= 3)
    v.Note(v.Good() && ReadLinkEntry(file, kTextureMaterial));
  if (level >= 4)
    v.Note(v.Good() && ReadLinkEntry(file, kTextureSecondLink));
  if (level >= 5)
    ReadOldAspects(v);
  if (level >= 6)
    entries.Bool(1200);
  return v.Good();
}

// As quotients.
void TextureTag::ReadOldAspects(ChunkReader& v)
{
  Long width = 0;
  Long height = 0;
  Real pixelWidth = 0.0;
  Real pixelHeight = 0.0;
  if (!v.Long(width) || !v.Long(height) || !v.Real(pixelWidth) || !v.Real(pixelHeight))
    return;
  data_.SetReal(kTextureFilmAspect, QuotientOrOne(width, height));
  data_.SetReal(kTexturePixelAspect, QuotientOrOne(pixelWidth, pixelHeight));
}

// A tag that only tells its material, as nearly all do.
Bool TextureTag::ReadInOnePiece(HyperFile& file)
{
  const TextureTagRecord* record = file.MayHoldRecords() ? TextureTagRecord::Get() : nullptr;
  const UChar* place = record ? file.NextRecord(record->GetRecord(), record->GetBody()) : nullptr;
  if (!place)
    return false;
  file.PassRecord(record->GetRecord(), record->GetBody());
  return TakeRecord(file, *record, place);
}

Bool TextureTag::TakeRecord(HyperFile& file, const TextureTagRecord& record, const UChar* place)
{
  GeAliasID material = 0;
  record.Get(place, marker_, material);
  markerDrawn_ = true;
  name_ = String::Constant(kNewName);
  if (material == 0)
    return true;
  GeData* entry = data_.ReplaceShared(kTextureMaterial);
  if (!entry || !entry->SetType(kDataLink)) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  return entry->GetAliasLink()->TakeTargetId(file, material);
}

// Into the link of that entry; a file may have put something else there, or nothing.
Bool TextureTag::ReadLinkEntry(HyperFile& file, Long id)
{
  GeData* entry = data_.FindData(id);
  if (!entry || !entry->GetAliasLink()) {
    data_.SetLink(id, nullptr);
    entry = data_.FindData(id);
  }
  GeAliasLink* link = entry ? entry->GetAliasLink() : nullptr;
  if (!link) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  return link->ReadLink(file);
}

} // namespace _torvane_
