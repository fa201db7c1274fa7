#include "k2v_file/pictures/bmp_header.h"
#include "k2v_file/pictures/bmp_run_decoder.h"
#include "k2v_file/pictures/picture_rows.h"
#include "torvane/bytes/base_file.h"
#include "torvane/memory/owned.h"
#include "torvane/pictures/bitmap_filters.h"

namespace _torvane_
{

namespace
{

constexpr Long kColorStep = 3;

struct ReadNumber
{
  BaseFile& file;

  void operator()(UWord& value) const { file.ReadUWord(value); }
  void operator()(ULong& value) const { file.ReadULong(value); }
};

LLong Magnitude(ULong signedNumber)
{
  LLong value = static_cast<Long>(signedNumber);
  return value < 0 ? -value : value;
}

// Puts the rows of a file into a picture, from the top or from the bottom.
class RowFiller
{
 public:
  RowFiller(Bitmap& bitmap, Long width, Long height, Bool bottomUp)
      : bitmap_(bitmap), width_(width), y_(bottomUp ? height - 1 : 0), step_(bottomUp ? -1 : 1)
  {}

  void Put(const UChar* row)
  {
    bitmap_.SetLine(0, y_, width_, row, kColorStep);
    y_ += step_;
  }
  static void PutTo(void* filler, const UChar* row) { static_cast<RowFiller*>(filler)->Put(row); }

 private:
  Bitmap& bitmap_;
  Long width_;
  Long y_;
  Long step_;
};

Long LoadPlain(BaseFile& file, RowFiller& filler, UChar* row, Long width, Long height)
{
  LLong rowSize = GetPaddedRowSize(width, kBmpBits);
  for (Long i = 0; i < height && file.ReadBytes(row, rowSize) == rowSize; ++i) {
    SwapRedAndBlue(row, width);
    filler.Put(row);
  }
  return file.GetError() == FILEERROR_NONE ? IMAGERESULT_OK : IMAGERESULT_FILE;
}

// All codes are read in one piece.
Long LoadRuns(BaseFile& file, RowFiller& filler, UChar* row, Long width, Long height, const BmpHeader& header)
{
  LLong size = LLong{header.fileSize} - header.pixelOffset;
  if (size > header.imageSize)
    size = header.imageSize;
  LLong remaining = file.GetRemaining();
  if (file.GetError() != FILEERROR_NONE || (remaining >= 0 && size > remaining))
    return IMAGERESULT_FILE;
  if (size < 1)
    return IMAGERESULT_OK;
  const Owned<UChar> codes(static_cast<UChar*>(GeAllocNC(size)));
  if (!codes)
    return IMAGERESULT_MEMORY;
  if (file.ReadBytes(codes.get(), size) != size)
    return IMAGERESULT_FILE;
  BmpRunDecoder(row, width, height, header.bits, RowFiller::PutTo, &filler).Decode(codes.get(), size);
  return IMAGERESULT_OK;
}

Long LoadRows(BaseFile& file, Bitmap& bitmap, const BmpHeader& header)
{
  auto width = static_cast<Long>(Magnitude(header.width));
  auto height = static_cast<Long>(Magnitude(header.height));
  if (width < 1 || height < 1)
    return file.GetError() == FILEERROR_NONE ? IMAGERESULT_OK : IMAGERESULT_FILE;
  const Owned<UChar> row(static_cast<UChar*>(GeAllocNC(GetPaddedRowSize(width, header.bits))));
  if (!row)
    return IMAGERESULT_MEMORY;
  RowFiller filler(bitmap, width, height, static_cast<Long>(header.height) >= 1);
  return header.compression == kBmpPlain ? LoadPlain(file, filler, row.get(), width, height)
                                         : LoadRuns(file, filler, row.get(), width, height, header);
}

} // namespace

Bool BmpLoader::Identify(const Filename&, const void* data, LLong count) const
{
  constexpr LLong kInfoSizePlace = 14;
  const auto* first = static_cast<const UChar*>(data);
  return count >= kInfoSizePlace + 4 && bytes::GetLittle<UWord>(first) == kBmpSignature &&
         bytes::GetLittle<ULong>(first + kInfoSizePlace) == kBmpInfoSize;
}

// A file that is cut inside the header has zeros in the place of what it lacks.
Long BmpLoader::Load(const Filename& name, Bitmap& bitmap, Long) const
{
  BaseFile file;
  if (!file.Open(name, kFileRead, false, kByteOrderLittle))
    return IMAGERESULT_OPEN;
  LLong fileSize = file.GetLength();
  BmpHeader header;
  header.Visit(ReadNumber{file});
  if (header.signature != kBmpSignature || header.infoSize != kBmpInfoSize || header.bits != kBmpBits)
    return IMAGERESULT_FORMAT;
  LLong width = Magnitude(header.width);
  LLong height = Magnitude(header.height);
  if (width > kMaxImageSize || height > kMaxImageSize ||
      !IsPictureInProportion(GetPaddedRowSize(width, kBmpBits) * height, fileSize) ||
      bitmap.Init(static_cast<Long>(width), static_cast<Long>(height), kDepthColor) != IMAGERESULT_OK)
    return IMAGERESULT_MEMORY;
  if (header.pixelOffset != 0)
    file.Seek(header.pixelOffset);
  return header.compression > kBmpRuns4 ? IMAGERESULT_FORMAT : LoadRows(file, bitmap, header);
}

} // namespace _torvane_
