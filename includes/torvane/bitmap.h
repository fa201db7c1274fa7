// A picture: the encoded bytes of an image file, kept as they were read.
#pragma once

#include "torvane/filename.h"
#include "torvane/memory.h"
#include "torvane/types.h"

namespace _torvane_
{

class BaseContainer;

// What the operations of pictures give.
inline constexpr Long IMAGERESULT_OK = 1;
inline constexpr Long IMAGERESULT_OPEN = -1;   // the file didn't open
inline constexpr Long IMAGERESULT_FORMAT = -2; // wrong format or wrong size
inline constexpr Long IMAGERESULT_MEMORY = -3; // no memory; also an unknown file format
inline constexpr Long IMAGERESULT_FILE = -4;   // a read or write failed
inline constexpr Long IMAGERESULT_NULL = -6;   // a null source
inline constexpr Long IMAGERESULT_LARGE = -7;  // larger than the file format allows

class Bitmap
{
 public:
  Bitmap() = default;
  ~Bitmap() { Free(); }
  Bitmap(const Bitmap&) = delete; // use CopyTo
  Bitmap& operator=(const Bitmap&) = delete;

  // Frees everything.
  void Free();

  // Width, height and depth id of the pixels; 0 without pixels.
  Long GetBw() const { return 0; }
  Long GetBh() const { return 0; }
  Long GetDepth() const { return 0; }

  // Copies the bytes of an image file and frees what the picture held.
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

  // Saves the pixels in a file format: 1102 BMP, 1104 JPEG.
  Long Save(const Filename& name, Long format, const BaseContainer* settings, Long flags) const;

 private:
  void* encoded_ = nullptr; // owned
  LLong encodedSize_ = 0;
};

} // namespace _torvane_
