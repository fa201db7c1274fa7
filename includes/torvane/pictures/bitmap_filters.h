// The image file formats: loaders and savers of BMP (24 bits a pixel) and JPEG. All give the codes of bitmap.h. They
// keep nothing between two calls.
#pragma once

#include "torvane/memory/memory.h"
#include "torvane/pictures/bitmap.h"
#include "torvane/text/filename.h"
#include "torvane/types.h"

namespace _torvane_
{

class BaseContainer;

inline constexpr Long kFirstFrame = -1; // of a file that holds one picture

class BitmapLoaderData : public GeMemory
{
 public:
  virtual ~BitmapLoaderData() = default;

  // True if the first `count` bytes of a file are those of this format.
  virtual Bool Identify(const Filename& name, const void* data, LLong count) const = 0;
  // Replaces the picture by the pixels of the file. A failure keeps what was read so far. A file whose header asks for
  // far more memory than its size explains is refused with IMAGERESULT_MEMORY.
  virtual Long Load(const Filename& name, Bitmap& bitmap, Long frame) const = 0;
  virtual Long GetFormatId() const = 0;
};

class BmpLoader : public BitmapLoaderData
{
 public:
  Bool Identify(const Filename& name, const void* data, LLong count) const override;
  // IMAGERESULT_FORMAT unless the file has 24 bits a pixel and a header of the common kind.
  Long Load(const Filename& name, Bitmap& bitmap, Long frame) const override;
  Long GetFormatId() const override { return kImageFormatBmp; }
};

class JpgLoader : public BitmapLoaderData
{
 public:
  Bool Identify(const Filename& name, const void* data, LLong count) const override;
  // One component gives a grey picture, three a colour one; any other count is IMAGERESULT_FORMAT. What the JPEG
  // library finds damaged beyond reading is IMAGERESULT_MEMORY; smaller damage is passed over.
  Long Load(const Filename& name, Bitmap& bitmap, Long frame) const override;
  Long GetFormatId() const override { return kImageFormatJpeg; }
};

class BitmapSaverData : public GeMemory
{
 public:
  virtual ~BitmapSaverData() = default;

  // Writes the pixels; `settings` may be null. Gives IMAGERESULT_NULL without pixels and IMAGERESULT_LARGE above
  // GetMaxResolution, in both cases before the file is touched, and IMAGERESULT_FILE when it can't be opened.
  virtual Long Save(const Filename& name, const Bitmap& bitmap, const BaseContainer* settings, Long flags) const = 0;
  // The largest width and height.
  virtual Long GetMaxResolution() const = 0;
};

// Grey pictures are written as colour.
class BmpSaver : public BitmapSaverData
{
 public:
  Long Save(const Filename& name, const Bitmap& bitmap, const BaseContainer* settings, Long flags) const override;
  Long GetMaxResolution() const override { return 32000; }
};

// Grey pictures are written as colour unless kImageSaveGrey is set.
class JpgSaver : public BitmapSaverData
{
 public:
  Long Save(const Filename& name, const Bitmap& bitmap, const BaseContainer* settings, Long flags) const override;
  Long GetMaxResolution() const override { return 65000; }
};

} // namespace _torvane_
