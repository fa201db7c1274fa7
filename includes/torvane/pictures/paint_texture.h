// Paint texture files: a base image and any number of alpha layers, each row of each channel packed on its own. The
// pixels are the client's; they pass through an interface that it implements.
#pragma once

#include "torvane/nodes/private_chunk.h"
#include "torvane/stream/chunk_fields.h"
#include "torvane/stream/hyper_file.h"
#include "torvane/types.h"

namespace _torvane_
{

class K2VImageFilter;
struct PixelBlock;

// Layer types of a pixel block: what its components are.
inline constexpr Long kPaintLayerGrey = 2;
inline constexpr Long kPaintLayerGreyAlpha = 3;  // a pair: the second counts
inline constexpr Long kPaintLayerColor = 4;      // red, green, blue
inline constexpr Long kPaintLayerColorAlpha = 5; // four, of which the last three count

// What a paint texture is read into or written from. Sizes and places that a Create or Set operation is given come from
// the file as they stand there: check them. A buffer is valid for the call.
class K2VClient : public GeMemory
{
 public:
  virtual ~K2VClient() = default;

  // Makes the base image; the depth is 2 for grey, 4 for colour. False fails the read for want of memory. The pixels
  // of a base image aren't read back.
  virtual Bool CreateImage(Long width, Long height, Long depth) = 0;
  // Makes the alpha layer of that index, from 0 on. False drops the layer's head; its rows come all the same.
  virtual Bool CreateAlpha(Long alpha, Long width, Long height) = 0;
  virtual void Reserved() {} // keeps its place in the table; not called
  // Stores `count` grey bytes.
  virtual void SetAlphaLine(Long alpha, Long x, Long y, Long count, const UChar* buffer) = 0;

  virtual Long GetImageWidth() = 0;
  virtual Long GetImageHeight() = 0;
  // 2 for grey, 4 for colour. Any other depth leaves the file without its pixels, and damaged.
  virtual Long GetImageDepth(HyperFile& file, Long, Long) = 0;
  // Fetches `count` pixels of 1 (grey) or 3 bytes (red, green, blue).
  virtual void GetImageLine(Long x, Long y, Long count, UChar* buffer) = 0;
  virtual Long GetAlphaCount() = 0;
  // Fetches `count` grey bytes.
  virtual void GetAlphaLine(Long alpha, Long x, Long y, Long count, UChar* buffer) = 0;
};

// Takes and gives the rows of a layer. All give false in a file that belongs to no K2VImageFilter.
class K2VPaintTarget : public PrivateChunk
{
 public:
  virtual Bool CreateLayer(HyperFile& file, Long width, Long height, Long type) = 0;
  // `count` pixels of `components` bytes each.
  virtual Bool SetLayerLine(HyperFile& file, Long x, Long y, Long count, const UChar* buffer, Long components) = 0;
  virtual Long GetLayerType(HyperFile& file) = 0;
  virtual Bool GetLayerLine(HyperFile& file, Long x, Long y, Long count, UChar* buffer) = 0;
};

// One layer: reads and writes its head and its pixels for a target, which it does not own.
class K2VPaintLayer : public K2VPaintTarget
{
 public:
  explicit K2VPaintLayer(K2VPaintTarget* target) : target_(target) {}

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  // All four forward to the target.
  Bool CreateLayer(HyperFile& file, Long width, Long height, Long type) override
  {
    return target_->CreateLayer(file, width, height, type);
  }
  Bool SetLayerLine(HyperFile& file, Long x, Long y, Long count, const UChar* buffer, Long components) override
  {
    return target_->SetLayerLine(file, x, y, count, buffer, components);
  }
  Long GetLayerType(HyperFile& file) override { return target_->GetLayerType(file); }
  Bool GetLayerLine(HyperFile& file, Long x, Long y, Long count, UChar* buffer) override
  {
    return target_->GetLayerLine(file, x, y, count, buffer);
  }

  // What the last head that was read told: the layer's type and, in kColorSize bytes, its colour.
  Long GetHeadType() const { return type_; }
  const UChar* GetColor() const { return color_; }

  static constexpr LLong kColorSize = 5;

 private:
  friend struct ChunkFields<K2VPaintLayer>;

  Bool ReadHead(HyperFile& file, Long level, K2VImageFilter& filter);
  Bool ReadPixels(HyperFile& file, Long level, K2VImageFilter& filter);
  Bool ReadRows(HyperFile& file, const PixelBlock& block, K2VImageFilter& filter);

  K2VPaintTarget* target_;
  Long type_ = 0;
  UChar color_[kColorSize] = {};
};

// The alpha layers, one after the other.
class K2VAlpha : public K2VPaintTarget
{
 public:
  K2VAlpha() : layer_(this) {}

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;
  Bool CreateLayer(HyperFile& file, Long width, Long height, Long type) override;
  // Turns the row into grey: the mean of three components, rounded down. A row of a type that is not listed above, or
  // with fewer components than its type has, is dropped.
  Bool SetLayerLine(HyperFile& file, Long x, Long y, Long count, const UChar* buffer, Long components) override;
  Long GetLayerType(HyperFile& file) override;
  Bool GetLayerLine(HyperFile& file, Long x, Long y, Long count, UChar* buffer) override;

 private:
  static constexpr Long kMaxLists = 16; // in one another, where files hold one

  K2VPaintLayer layer_;
  Long lists_ = 0; // that are being read
  Long index_ = 0; // of the layer in hand
  Long type_ = 0;  // of its rows
};

// The whole texture: the base image, and the alpha layers behind it.
class K2VTexture : public PrivateChunk
{
 public:
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;

 private:
  Bool ReadSize(HyperFile& file, Long level, K2VImageFilter& filter);

  K2VAlpha alpha_;
};

// Reads and writes paint texture files. One file at a time, on one thread.
class K2VImageFilter : public PrivateChunk
{
 public:
  // Reads a file into the client or writes the client's pixels to a file. True if the file has no error.
  Bool Load(const Filename& name, K2VClient& client);
  Bool Save(const Filename& name, K2VClient& client);
  // Why and where the last of them failed.
  const FileProblem& GetProblem() const { return file_.GetProblem(); }

  // Size and depth as the last Load found them.
  Long GetWidth() const { return width_; }
  Long GetHeight() const { return height_; }
  Long GetDepth() const { return depth_; }

  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  void WriteChunks(HyperFile& file) override;

 private:
  friend class K2VPaintLayer;
  friend class K2VAlpha;
  friend class K2VTexture;

  // The filter that a file belongs to, or null.
  static K2VImageFilter* Of(HyperFile& file) { return static_cast<K2VImageFilter*>(file.GetExtraData()); }
  Bool Open(const Filename& name, K2VClient& client, Long mode);
  Bool AllowsRow(LLong count);
  Bool SpendRowBytes(LLong count);

  HyperFile file_;
  K2VTexture texture_;
  K2VClient* client_ = nullptr; // not owned
  Long width_ = 0;
  Long height_ = 0;
  Long depth_ = 0;
  LLong rowBytesLeft_ = 0; // that a file of this length may yet be unpacked to
};

} // namespace _torvane_
