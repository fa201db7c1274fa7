// Draw ports: the pixel stores behind pictures. Rows lie in one block, from the top down, each filled up to a multiple
// of four bytes.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/types.h"

namespace _torvane_
{

class Bitmap;

// Depth ids.
inline constexpr Long kDepthGrey = 2;  // 8 bits a pixel
inline constexpr Long kDepthColor = 4; // 24 bits a pixel: red, green, blue

class DrawPort : public GeMemory
{
 public:
  DrawPort(Long bits, Long depth) : bits_(bits), depth_(depth) {}
  virtual ~DrawPort() = default;
  DrawPort(const DrawPort&) = delete; // use CopyTo
  DrawPort& operator=(const DrawPort&) = delete;

  // Copies all pixels. False unless both ports have pixels of the same size, row size and depth.
  virtual Bool CopyTo(DrawPort& destination) const = 0;
  // Frees the pixels; the size becomes 0.
  virtual void FreeStore() {}
  // Makes `width` x `height` zeroed pixels in place of the old ones; a size below 1 is taken as 1. Gives
  // IMAGERESULT_OK, or IMAGERESULT_MEMORY and leaves the port as it was.
  virtual Long Init(Long width, Long height) = 0;
  // Copies `count` pixels of row `y`, from `x` on, to or from a buffer in which they stand `step` bytes apart: three
  // bytes a pixel (red, green, blue) in a colour port, one in a grey port. Gives `count`. Nothing is checked: the
  // pixels must exist. A step of 1 on a colour port leaves the red bytes alone in the buffer, and writes two bytes
  // behind the last of them.
  virtual Long GetLine(Long x, Long y, Long count, void* buffer, LLong step) const = 0;
  virtual Long SetLine(Long x, Long y, Long count, const void* buffer, LLong step) = 0;

  Long GetWidth() const { return width_; }
  Long GetHeight() const { return height_; }
  Long GetBits() const { return bits_; } // a pixel
  Long GetDepth() const { return depth_; }
  LLong GetRowSize() const { return rowSize_; } // in bytes
  const UChar* GetPixels() const { return pixels_; }
  // The picture that the port belongs to, or null.
  Bitmap* GetOwner() const { return owner_; }
  void SetOwner(Bitmap* owner) { owner_ = owner; }

 protected:
  // Those of any port, to be written to.
  static UChar* PixelsOf(DrawPort& port) { return port.pixels_; }

  Long width_ = 0;
  Long height_ = 0;
  Long bits_;
  Long depth_;
  LLong rowSize_ = 0;
  UChar* pixels_ = nullptr; // owned
  Bitmap* owner_ = nullptr; // not owned
};

// A port with a block of its own.
class IndependentDrawPort : public DrawPort
{
 public:
  using DrawPort::DrawPort;
  ~IndependentDrawPort() override { GeFree(pixels_); }

  Bool CopyTo(DrawPort& destination) const override;
  void FreeStore() override;
  // Without a bit count (below 1), which is reported, pixels have 16 bits.
  Long Init(Long width, Long height) override;
};

class DrawPort_RGB24 : public IndependentDrawPort
{
 public:
  DrawPort_RGB24() : IndependentDrawPort(24, kDepthColor) {}

  Long GetLine(Long x, Long y, Long count, void* buffer, LLong step) const override;
  Long SetLine(Long x, Long y, Long count, const void* buffer, LLong step) override;
};

class DrawPort_GREY8 : public IndependentDrawPort
{
 public:
  DrawPort_GREY8() : IndependentDrawPort(8, kDepthGrey) {}

  Long GetLine(Long x, Long y, Long count, void* buffer, LLong step) const override;
  Long SetLine(Long x, Long y, Long count, const void* buffer, LLong step) override;
};

// A new port without pixels that the caller owns (delete it with DeleteObj); null for an unknown depth id and when
// memory is short.
DrawPort* DrawPortCreate(Long depth);

} // namespace _torvane_
