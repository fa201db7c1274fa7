#include "k2v_file/pictures/jpeg_errors.h"
#include "k2v_file/pictures/picture_rows.h"
#include "torvane/bytes/base_file.h"
#include "torvane/pictures/bitmap_filters.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

// Takes what the library writes to a file.
struct JpegDestination
{
  jpeg_destination_mgr manager; // first: its address is what the library hands back
  BaseFile* file;
  UChar buffer[kJpegBufferSize];
};

// All that encoding needs. Nothing in it has a destructor: the jump passes it by.
struct JpegWriting
{
  jpeg_compress_struct jpeg;
  JpegErrors errors;
  JpegDestination destination;
};

struct JpegOptions
{
  Bool grey = false;
  Bool hasQuality = false;
  Long quality = 95;
};

void StartDestination(j_compress_ptr jpeg)
{
  auto& destination = *reinterpret_cast<JpegDestination*>(jpeg->dest);
  destination.manager.next_output_byte = destination.buffer;
  destination.manager.free_in_buffer = kJpegBufferSize;
}

void WriteBuffer(j_compress_ptr jpeg, LLong count)
{
  auto& destination = *reinterpret_cast<JpegDestination*>(jpeg->dest);
  if (!destination.file->WriteBytes(destination.buffer, count))
    ERREXIT(jpeg, JERR_FILE_WRITE);
}

// The library counts on all of the buffer being written, whatever its pointers say.
boolean EmptyDestination(j_compress_ptr jpeg)
{
  WriteBuffer(jpeg, kJpegBufferSize);
  StartDestination(jpeg);
  return TRUE;
}

void EndDestination(j_compress_ptr jpeg)
{
  WriteBuffer(jpeg, kJpegBufferSize - static_cast<LLong>(jpeg->dest->free_in_buffer));
}

void SetUpDestination(JpegWriting& writing, BaseFile& file)
{
  JpegDestination& destination = writing.destination;
  destination.file = &file;
  destination.manager.init_destination = StartDestination;
  destination.manager.empty_output_buffer = EmptyDestination;
  destination.manager.term_destination = EndDestination;
  writing.jpeg.dest = &destination.manager;
}

void SetUpPicture(jpeg_compress_struct& jpeg, const Bitmap& bitmap, const JpegOptions& options)
{
  jpeg.image_width = static_cast<JDIMENSION>(bitmap.GetBw());
  jpeg.image_height = static_cast<JDIMENSION>(bitmap.GetBh());
  jpeg.input_components = options.grey ? 1 : 3;
  jpeg.in_color_space = options.grey ? JCS_GRAYSCALE : JCS_RGB;
  jpeg_set_defaults(&jpeg);
  // The quality of 95 is no default: without a setting the library's own holds.
  if (options.hasQuality)
    jpeg_set_quality(&jpeg, options.quality, TRUE);
  jpeg.dct_method = JDCT_FLOAT;
}

void EncodeRows(jpeg_compress_struct& jpeg, const Bitmap& bitmap, Bool grey)
{
  // Three bytes a pixel for grey rows as well: a colour picture's row of single bytes runs over by two.
  JSAMPARRAY row = jpeg.mem->alloc_sarray(reinterpret_cast<j_common_ptr>(&jpeg), JPOOL_IMAGE, jpeg.image_width * 3, 1);
  jpeg_start_compress(&jpeg, TRUE);
  while (jpeg.next_scanline < jpeg.image_height) {
    auto y = static_cast<Long>(jpeg.next_scanline);
    if (grey)
      bitmap.GetLine(0, y, bitmap.GetBw(), row[0], 1);
    else
      GetColorRow(bitmap, y, row[0]);
    jpeg_write_scanlines(&jpeg, row, 1);
  }
  jpeg_finish_compress(&jpeg);
}

// The jump ends here, with the compressor destroyed.
Long Encode(JpegWriting& writing, BaseFile& file, const Bitmap& bitmap, const JpegOptions& options)
{
  writing.jpeg.err = SetUpJpegErrors(writing.errors);
  if (setjmp(writing.errors.target) != 0)
    return IMAGERESULT_MEMORY;
  jpeg_create_compress(&writing.jpeg);
  SetUpDestination(writing, file);
  SetUpPicture(writing.jpeg, bitmap, options);
  EncodeRows(writing.jpeg, bitmap, options.grey);
  jpeg_destroy_compress(&writing.jpeg);
  return IMAGERESULT_OK;
}

} // namespace

Long JpgSaver::Save(const Filename& name, const Bitmap& bitmap, const BaseContainer* settings, Long flags) const
{
  if (bitmap.GetBw() < 1)
    return IMAGERESULT_NULL;
  if (bitmap.GetBw() > GetMaxResolution() || bitmap.GetBh() > GetMaxResolution())
    return IMAGERESULT_LARGE;
  JpegOptions options;
  options.grey = (flags & kImageSaveGrey) != 0;
  options.hasQuality = settings && settings->FindData(kImageJpegQuality);
  if (options.hasQuality)
    options.quality = settings->GetLong(kImageJpegQuality);
  BaseFile file;
  if (!file.Open(name, kFileWrite))
    return IMAGERESULT_FILE;
  JpegWriting writing = {};
  Long result = Encode(writing, file, bitmap, options);
  Bool closed = file.Close();
  return result == IMAGERESULT_OK && !closed ? IMAGERESULT_FILE : result;
}

} // namespace _torvane_
