#include "torvane/pictures/paint_texture.h"

#include "torvane/memory/owned.h"

#include "k2v_file/pictures/pixel_block.h"

namespace _torvane_
{

namespace
{

constexpr auto kChunkTexture = static_cast<Long>(FourCharacters("BdTx"));
constexpr auto kChunkPixels = static_cast<Long>(FourCharacters("BdVx"));
constexpr auto kChunkLayerHead = static_cast<Long>(FourCharacters("BdLy"));
constexpr Long kChunkFrame = 502;
constexpr Long kChunkAlphaLayer = 501;
constexpr Long kChunkAlpha = 599;

constexpr Long kLevelTexture = 1;
constexpr Long kLevelImagePixels = 2;
constexpr Long kLevelLayerHead = 0;
constexpr Long kLevelLayerPixels = 1;

// How far a file may be unpacked.
constexpr LLong kAlwaysGranted = LLong{1} << 24;
constexpr LLong kMostPerByte = 64;

// How the grey of a pixel comes about, by layer type: the mean of some of its bytes.
struct GreyRule
{
  Long type;
  Long components; // bytes a pixel
  Long first;      // of those that count
  Long count;
};

constexpr GreyRule kGreyRules[] = {
    {kPaintLayerGrey, 1, 0, 1},
    {kPaintLayerGreyAlpha, 2, 1, 1},
    {kPaintLayerColor, 3, 0, 3},
    {kPaintLayerColorAlpha, 4, 1, 3},
};

const GreyRule* FindGreyRule(Long type)
{
  for (const GreyRule& rule : kGreyRules) {
    if (rule.type == type)
      return &rule;
  }
  return nullptr;
}

void TurnGrey(const GreyRule& rule, const UChar* pixel, Long count, UChar* grey)
{
  for (Long i = 0; i < count; ++i, pixel += rule.components) {
    Long sum = 0;
    for (Long k = 0; k < rule.count; ++k)
      sum += pixel[rule.first + k];
    grey[i] = static_cast<UChar>(sum / rule.count);
  }
}

void SpreadPlane(const UChar* plane, UChar* place, Long width, Long step)
{
  for (Long i = 0; i < width; ++i, place += step)
    *place = plane[i];
}

} // namespace

Bool WritePlane(HyperFile& file, PlaneBuffers& buffers, Long width, Long component, Long components)
{
  const UChar* place = buffers.Row() + component;
  for (Long i = 0; i < width; ++i, place += components)
    buffers.Plane()[i] = *place;
  LLong packed = PackRuns(buffers.Plane(), width, buffers.Packed(), buffers.PackedLimit());
  if (packed > 0 && packed < width)
    return file.WriteUChar(kPlanePacked) && file.WriteMemory(buffers.Packed(), packed);
  return file.WriteUChar(kPlanePlain) && file.WriteMemory(buffers.Plane(), width);
}

Bool ReadPlane(HyperFile& file, PlaneBuffers& buffers, Long width, Long component, Long components)
{
  UChar form = 0;
  void* data = nullptr;
  LLong size = 0;
  if (!file.ReadUChar(form) || !file.ReadMemory(data, size))
    return false;
  const auto* bytes = static_cast<const UChar*>(data);
  UChar* place = buffers.Row() + component;
  Bool whole = size >= width;
  if (form == kPlanePacked)
    whole = UnpackRuns(bytes, size, place, width, components);
  else if (form == kPlanePlain && whole)
    SpreadPlane(bytes, place, width, components);
  if (!whole && (form == kPlanePlain || form == kPlanePacked)) {
    for (Long i = 0; i < width; ++i)
      place[LLong{i} * components] = 0;
  }
  GeFree(data);
  return true;
}

template <>
struct ChunkFields<K2VPaintLayer>
{
  template <class Visitor>
  static Bool VisitHead(K2VPaintLayer& layer, Visitor& v, Long& type)
  {
    v.Long(type);
    if constexpr (Visitor::kReading) {
      LLong size = 0;
      v.Note(v.Good() && v.File().ReadMemoryInto(layer.color_, K2VPaintLayer::kColorSize, size));
    } else {
      const UChar black[3] = {};
      v.Memory(black, type == kPaintLayerGrey ? 1 : 3);
    }
    v.ConstantLong(0);
    v.ConstantReal(1.0);
    v.ConstantBool(false);
    v.ConstantLong(0);
    v.ConstantLong(0);
    v.ConstantString("Alpha");
    v.ConstantLong(0);
    v.ConstantLong(0);
    v.ConstantBool(false);
    return v.Good();
  }
};

Bool K2VPaintLayer::ReadHead(HyperFile& file, Long level, K2VImageFilter& filter)
{
  return ReadChunkBody(file, level, [&](ChunkReader& v) {
    return ChunkFields<K2VPaintLayer>::VisitHead(*this, v, type_) &&
           CreateLayer(file, filter.width_, filter.height_, type_);
  });
}

Bool K2VPaintLayer::ReadPixels(HyperFile& file, Long level, K2VImageFilter& filter)
{
  return ReadChunkBody(file, level, [&](ChunkReader& v) {
    PixelBlock block;
    return block.VisitRectangle(v) && v.Long(block.components) && ReadRows(file, block, filter);
  });
}

Bool K2VPaintLayer::ReadRows(HyperFile& file, const PixelBlock& block, K2VImageFilter& filter)
{
  if (block.width < 1 || block.height < 1 || block.components < 1)
    return true;
  LLong rowSize = LLong{block.width} * block.components;
  if (!filter.AllowsRow(rowSize) || !filter.SpendRowBytes(rowSize)) // the buffer
    return false;
  PlaneBuffers buffers(block.width, block.components, false);
  if (!buffers.IsComplete()) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  for (Long row = 0; row < block.height; ++row) {
    if (!filter.SpendRowBytes(rowSize))
      return false;
    for (Long component = 0; component < block.components; ++component) {
      if (!ReadPlane(file, buffers, block.width, component, block.components))
        return false;
    }
    auto y = static_cast<Long>(LLong{block.y} + row);
    SetLayerLine(file, block.x, y, block.width, buffers.Row(), block.components);
  }
  return true;
}

Bool K2VPaintLayer::ReadChunk(HyperFile& file, Long id, Long level)
{
  K2VImageFilter* filter = K2VImageFilter::Of(file);
  if (!filter)
    return false;
  if (id == kChunkLayerHead && level >= kLevelLayerHead)
    return ReadHead(file, level, *filter);
  return id == kChunkPixels && level >= kLevelLayerPixels && ReadPixels(file, level, *filter);
}

void K2VPaintLayer::WriteChunks(HyperFile& file)
{
  K2VImageFilter* filter = K2VImageFilter::Of(file);
  if (!filter)
    return;
  Long type = GetLayerType(file);
  Long width = filter->client_->GetImageWidth();
  Long height = filter->client_->GetImageHeight();
  WriteChunk(file, kChunkLayerHead, kLevelLayerHead,
             [&](ChunkWriter& v) { return ChunkFields<K2VPaintLayer>::VisitHead(*this, v, type); });
  file.WriteChunkStart(kChunkPixels, kLevelLayerPixels);
  if (WritePixelBlock(file, width, height, type, [&](Long y, UChar* row) { GetLayerLine(file, 0, y, width, row); }))
    file.WriteChunkEnd();
}

Bool K2VAlpha::ReadChunk(HyperFile& file, Long id, Long)
{
  if (!K2VImageFilter::Of(file))
    return false;
  if (id == kChunkList) {
    if (lists_ >= kMaxLists)
      return file.Fail(FILEERROR_TOO_DEEP, file.GetPosition());
    index_ = 0;
    ++lists_;
    const Bool list = ReadChunks(file, false);
    --lists_;
    return list;
  }
  if (id != kChunkAlphaLayer)
    return false;
  Bool read = layer_.ReadChunks(file, false);
  ++index_;
  return read;
}

void K2VAlpha::WriteChunks(HyperFile& file)
{
  K2VImageFilter* filter = K2VImageFilter::Of(file);
  if (!filter)
    return;
  file.WriteChunkStart(kChunkList, 0);
  Long count = filter->client_->GetAlphaCount();
  for (index_ = 0; index_ < count && file.GetError() == FILEERROR_NONE; ++index_)
    layer_.WriteAsChunk(file, kChunkAlphaLayer);
  file.WriteChunkEnd();
}

Bool K2VAlpha::CreateLayer(HyperFile& file, Long width, Long height, Long type)
{
  K2VImageFilter* filter = K2VImageFilter::Of(file);
  if (!filter)
    return false;
  type_ = type;
  return filter->client_->CreateAlpha(index_, width, height);
}

Bool K2VAlpha::SetLayerLine(HyperFile& file, Long x, Long y, Long count, const UChar* buffer, Long components)
{
  K2VImageFilter* filter = K2VImageFilter::Of(file);
  if (!filter)
    return false;
  const GreyRule* rule = FindGreyRule(type_);
  if (!rule || components < rule->components || count < 1)
    return true;
  if (rule->components == 1) {
    filter->client_->SetAlphaLine(index_, x, y, count, buffer);
    return true;
  }
  const Owned<UChar> grey(static_cast<UChar*>(GeAllocNC(count)));
  if (!grey) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  TurnGrey(*rule, buffer, count, grey.get());
  filter->client_->SetAlphaLine(index_, x, y, count, grey.get());
  return true;
}

Long K2VAlpha::GetLayerType(HyperFile&) { return kPaintLayerGrey; }

Bool K2VAlpha::GetLayerLine(HyperFile& file, Long x, Long y, Long count, UChar* buffer)
{
  K2VImageFilter* filter = K2VImageFilter::Of(file);
  if (!filter)
    return false;
  filter->client_->GetAlphaLine(index_, x, y, count, buffer);
  return true;
}

Bool K2VTexture::ReadSize(HyperFile& file, Long level, K2VImageFilter& filter)
{
  return ReadChunkBody(file, level, [&](ChunkReader& v) {
    v.Long(filter.width_);
    v.Long(filter.height_);
    if (v.Level() >= 1)
      v.Long(filter.depth_);
    if (!v.Good())
      return false;
    if (filter.client_->CreateImage(filter.width_, filter.height_, filter.depth_))
      return true;
    file.SetError(FILEERROR_MEMORY);
    return false;
  });
}

Bool K2VTexture::ReadChunk(HyperFile& file, Long id, Long level)
{
  K2VImageFilter* filter = K2VImageFilter::Of(file);
  if (!filter)
    return false;
  switch (id) {
  case kChunkTexture:
    return ReadSize(file, level, *filter);
  case kChunkPixels:
    // Passed over; pixels of an older form are refused.
    if (level >= kLevelImagePixels)
      return file.SkipToEndChunk();
    file.SetError(FILEERROR_MEMORY);
    return false;
  case kChunkAlpha:
    return alpha_.ReadChunks(file, false);
  default:
    return false;
  }
}

void K2VTexture::WriteChunks(HyperFile& file)
{
  K2VImageFilter* filter = K2VImageFilter::Of(file);
  if (!filter)
    return;
  K2VClient& client = *filter->client_;
  Long width = client.GetImageWidth();
  Long height = client.GetImageHeight();
  Long depth = client.GetImageDepth(file, 0, 0) & ~1;
  WriteChunk(file, kChunkTexture, kLevelTexture, [&](ChunkWriter& v) {
    v.Long(width);
    v.Long(height);
    return v.Long(depth);
  });
  file.WriteChunkStart(kChunkPixels, kLevelImagePixels);
  if (!WritePixelBlock(file, width, height, depth, [&](Long y, UChar* row) { client.GetImageLine(0, y, width, row); }))
    return;
  file.WriteChunkEnd();
  if (client.GetAlphaCount() != 0)
    alpha_.WriteAsChunk(file, kChunkAlpha);
}

Bool K2VImageFilter::Open(const Filename& name, K2VClient& client, Long mode)
{
  client_ = &client;
  width_ = 0;
  height_ = 0;
  depth_ = 0;
  file_.SetExtraData(this);
  return file_.Open(kPaintTextureIdent, name, mode);
}

// A run of 128 bytes takes two, so that a good file unpacks to 64 times its size at the most, and so does a row of it.
// Damaged planes may read as zeros of any size: of all rows together twice as much is taken, or a small file could ask
// for any amount of memory and time.
Bool K2VImageFilter::AllowsRow(LLong count)
{
  if (count <= kAlwaysGranted + file_.GetLength() * kMostPerByte)
    return true;
  file_.SetError(FILEERROR_WRONG_VALUE);
  return false;
}

Bool K2VImageFilter::SpendRowBytes(LLong count)
{
  if (count > rowBytesLeft_) {
    file_.SetError(FILEERROR_WRONG_VALUE);
    return false;
  }
  rowBytesLeft_ -= count;
  return true;
}

// The loop over the whole file ends with the file and not with an end mark, so its own result says nothing.
Bool K2VImageFilter::Load(const Filename& name, K2VClient& client)
{
  if (Open(name, client, kHyperFileRead)) {
    rowBytesLeft_ = kAlwaysGranted + file_.GetLength() * 2 * kMostPerByte;
    ReadChunks(file_, false);
  }
  file_.Close();
  return file_.GetError() == FILEERROR_NONE;
}

Bool K2VImageFilter::Save(const Filename& name, K2VClient& client)
{
  if (Open(name, client, kHyperFileWrite))
    WriteChunks(file_);
  file_.Close();
  return file_.GetError() == FILEERROR_NONE;
}

Bool K2VImageFilter::ReadChunk(HyperFile& file, Long id, Long)
{
  return id == kChunkFrame && texture_.ReadChunks(file, false);
}

void K2VImageFilter::WriteChunks(HyperFile& file) { texture_.WriteAsChunk(file, kChunkFrame); }

} // namespace _torvane_
