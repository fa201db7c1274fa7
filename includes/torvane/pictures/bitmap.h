// A picture: pixels, or the bytes of an image file, kept as they were read. bitmap_filters.h has the file formats.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/pictures/draw_port.h"
#include "torvane/text/filename.h"
#include "torvane/types.h"

namespace _torvane_
{

class BaseContainer;

// What the operations of pictures give.
inline constexpr Long IMAGERESULT_OK = 1;
inline constexpr Long IMAGERESULT_OPEN = -1;   // the file didn't open
inline constexpr Long IMAGERESULT_FORMAT = -2; // wrong format or wrong size
inline constexpr Long IMAGERESULT_MEMORY = -3; // no memory; an unknown file format; a fault that the JPEG library found
inline constexpr Long IMAGERESULT_FILE = -4;   // a read or write failed
inline constexpr Long IMAGERESULT_NULL = -6;   // a null source
inline constexpr Long IMAGERESULT_LARGE = -7;  // larger than the file format allows

// File formats.
inline constexpr Long kImageFormatBmp = 1102;
inline constexpr Long kImageFormatJpeg = 1104;

// Settings of the savers.
inline constexpr Long kImageJpegQuality = 10021;   // Long, 1 to 100; without it the JPEG library's own default holds
inline constexpr Long kImageBmpResolution = 10022; // Long, dots per inch, default 72

// Flags of the savers.
inline constexpr Long kImageSaveGrey = 16; // JPEG: one component; of a colour picture its red

// The largest width and height of a picture.
inline constexpr Long kMaxImageSize = 128000;

// The bytes of a row of `width` pixels, filled up to a multiple of four.
constexpr LLong GetPaddedRowSize(LLong width, LLong bits) { return (width * bits + 31) / 32 * 4; }

// Has pixels or encoded bytes or neither, never both. One thread at a time.
class Bitmap
{
 public:
  Bitmap() = default;
  ~Bitmap() { Free(); }
  Bitmap(const Bitmap&) = delete; // use CopyTo
  Bitmap& operator=(const Bitmap&) = delete;

  // Frees what the picture held and makes zeroed pixels. A size below 1 is taken as 1; one above kMaxImageSize and an
  // unknown depth id are IMAGERESULT_FORMAT and leave the picture as it was.
  Long Init(Long width, Long height, Long depth);
  // Frees everything.
  void Free();

  // Width, height and depth id of the pixels; 0 without pixels.
  Long GetBw() const { return port_ ? port_->GetWidth() : 0; }
  Long GetBh() const { return port_ ? port_->GetHeight() : 0; }
  Long GetDepth() const { return port_ ? port_->GetDepth() : 0; }

  // A part of row `y`, as in DrawPort; they do nothing without pixels.
  void GetLine(Long x, Long y, Long count, void* buffer, LLong step) const;
  void SetLine(Long x, Long y, Long count, const void* buffer, LLong step);

  // Copies the bytes of an image file and frees what the picture held. IMAGERESULT_NULL for a null block,
  // IMAGERESULT_MEMORY when memory is short.
  Long SetEncoded(const void* data, LLong size);
  // As SetEncoded, but takes the block over: it was made by GeAllocNC, and the pointer becomes null.
  void AdoptEncoded(void*& data, LLong size);
  // The bytes of the image file, or null; they stay the picture's.
  const void* GetEncoded() const { return encoded_; }
  LLong GetEncodedSize() const { return encodedSize_; }

  // Makes the destination equal to this picture. False when memory is short.
  Bool CopyTo(Bitmap& destination) const;
  // A new picture that the caller owns; null when memory is short.
  Bitmap* GetClone() const;

  // Saves the pixels in a file format. `settings` may be null. IMAGERESULT_MEMORY for an unknown format,
  // IMAGERESULT_NULL without pixels.
  Long Save(const Filename& name, Long format, const BaseContainer* settings, Long flags) const;
  // Replaces the picture by the pixels of a BMP file.
  Long LoadBmp(const Filename& name);

 private:
  DrawPort* port_ = nullptr; // owned
  void* encoded_ = nullptr;  // owned
  LLong encodedSize_ = 0;
};

} // namespace _torvane_
