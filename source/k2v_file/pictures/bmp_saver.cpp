#include "k2v_file/pictures/bmp_header.h"
#include "k2v_file/pictures/picture_rows.h"
#include "torvane/bytes/base_file.h"
#include "torvane/memory/owned.h"
#include "torvane/pictures/bitmap_filters.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

constexpr Long kDefaultResolution = 72; // dots per inch

struct WriteNumber
{
  BaseFile& file;

  void operator()(UWord value) const { file.WriteUWord(value); }
  void operator()(ULong value) const { file.WriteULong(value); }
};

BmpHeader MakeHeader(const Bitmap& bitmap, LLong rowSize, Long dotsPerInch)
{
  auto imageSize = static_cast<ULong>(rowSize * bitmap.GetBh());
  // 11808 dots a metre are 300 an inch.
  auto dotsPerMetre = static_cast<ULong>(LLong{dotsPerInch} * 11808 / 300);
  BmpHeader header;
  header.signature = kBmpSignature;
  header.fileSize = imageSize + kBmpHeaderSize;
  header.pixelOffset = kBmpHeaderSize;
  header.infoSize = kBmpInfoSize;
  header.width = static_cast<ULong>(bitmap.GetBw());
  header.height = static_cast<ULong>(bitmap.GetBh());
  header.planes = 1;
  header.bits = kBmpBits;
  header.imageSize = imageSize;
  header.resolution[0] = dotsPerMetre;
  header.resolution[1] = dotsPerMetre;
  return header;
}

} // namespace

Long BmpSaver::Save(const Filename& name, const Bitmap& bitmap, const BaseContainer* settings, Long) const
{
  if (bitmap.GetBw() < 1)
    return IMAGERESULT_NULL;
  if (bitmap.GetBw() > GetMaxResolution() || bitmap.GetBh() > GetMaxResolution())
    return IMAGERESULT_LARGE;
  Long dotsPerInch = settings ? settings->GetLong(kImageBmpResolution, kDefaultResolution) : kDefaultResolution;
  BaseFile file;
  if (!file.Open(name, kFileWrite, false, kByteOrderLittle))
    return IMAGERESULT_FILE;
  LLong rowSize = GetPaddedRowSize(bitmap.GetBw(), kBmpBits);
  MakeHeader(bitmap, rowSize, dotsPerInch).Visit(WriteNumber{file});
  // Zeroed, so that the bytes that fill the row up are.
  const Owned<UChar> row(static_cast<UChar*>(GeAlloc(rowSize)));
  if (!row)
    return IMAGERESULT_MEMORY;
  for (Long y = bitmap.GetBh() - 1; y >= 0 && file.GetError() == FILEERROR_NONE; --y) {
    GetColorRow(bitmap, y, row.get());
    SwapRedAndBlue(row.get(), bitmap.GetBw());
    file.WriteBytes(row.get(), rowSize);
  }
  return file.Close() ? IMAGERESULT_OK : IMAGERESULT_FILE;
}

} // namespace _torvane_
