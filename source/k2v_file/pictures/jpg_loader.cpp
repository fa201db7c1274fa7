#include "k2v_file/pictures/jpeg_errors.h"
#include "k2v_file/pictures/picture_rows.h"
#include "torvane/bytes/base_file.h"
#include "torvane/pictures/bitmap_filters.h"

namespace _torvane_
{

namespace
{

constexpr UChar kMarkerStart = 0xFF;
constexpr UChar kStartOfImage = 0xD8;
constexpr UChar kEndOfImageMarker = 0xD9;

// More passes over a picture than any encoder makes: a small file of thousands would keep a reader busy for hours.
constexpr int kMaxScans = 200;

// Feeds the library from a file.
struct JpegSource
{
  jpeg_source_mgr manager; // first: its address is what the library hands back
  BaseFile* file;
  Bool started;
  UChar buffer[kJpegBufferSize];
};

// All that decoding needs. Nothing in it has a destructor: the jump passes it by.
struct JpegReading
{
  jpeg_decompress_struct jpeg;
  JpegErrors errors;
  JpegSource source;
  jpeg_progress_mgr progress;
};

void StartSource(j_decompress_ptr jpeg) { reinterpret_cast<JpegSource*>(jpeg->src)->started = false; }

void EndSource(j_decompress_ptr) {}

boolean FillSource(j_decompress_ptr jpeg)
{
  auto& source = *reinterpret_cast<JpegSource*>(jpeg->src);
  LLong count = source.file->ReadBytes(source.buffer, kJpegBufferSize, true);
  if (count < 1) {
    if (!source.started)
      ERREXIT(jpeg, JERR_INPUT_EMPTY);
    // A file that is cut gives the picture as far as it goes.
    WARNMS(jpeg, JWRN_JPEG_EOF);
    source.buffer[0] = kMarkerStart;
    source.buffer[1] = kEndOfImageMarker;
    count = 2;
  }
  source.started = true;
  source.manager.next_input_byte = source.buffer;
  source.manager.bytes_in_buffer = static_cast<std::size_t>(count);
  return TRUE;
}

void SkipSource(j_decompress_ptr jpeg, long count)
{
  jpeg_source_mgr& manager = *jpeg->src;
  if (count < 1)
    return;
  auto left = static_cast<std::size_t>(count);
  while (left > manager.bytes_in_buffer) {
    left -= manager.bytes_in_buffer;
    FillSource(jpeg);
  }
  manager.next_input_byte += left;
  manager.bytes_in_buffer -= left;
}

void SetUpSource(JpegReading& reading, BaseFile& file)
{
  JpegSource& source = reading.source;
  source.file = &file;
  source.started = false;
  source.manager.next_input_byte = nullptr;
  source.manager.bytes_in_buffer = 0;
  source.manager.init_source = StartSource;
  source.manager.fill_input_buffer = FillSource;
  source.manager.skip_input_data = SkipSource;
  source.manager.resync_to_restart = jpeg_resync_to_restart;
  source.manager.term_source = EndSource;
  reading.jpeg.src = &source.manager;
}

void CheckProgress(j_common_ptr jpeg)
{
  if (reinterpret_cast<j_decompress_ptr>(jpeg)->input_scan_number > kMaxScans)
    ERREXIT(jpeg, JERR_BAD_STATE);
}

Long DecodeRows(jpeg_decompress_struct& jpeg, Bitmap& bitmap)
{
  auto width = static_cast<Long>(jpeg.output_width);
  Long components = jpeg.output_components;
  JSAMPARRAY row = jpeg.mem->alloc_sarray(reinterpret_cast<j_common_ptr>(&jpeg), JPOOL_IMAGE,
                                          jpeg.output_width * static_cast<JDIMENSION>(components), 1);
  if (!row)
    return IMAGERESULT_MEMORY;
  jpeg_start_decompress(&jpeg);
  while (jpeg.output_scanline < jpeg.output_height) {
    auto y = static_cast<Long>(jpeg.output_scanline);
    jpeg_read_scanlines(&jpeg, row, 1);
    bitmap.SetLine(0, y, width, row[0], components);
  }
  jpeg_finish_decompress(&jpeg);
  return IMAGERESULT_OK;
}

Long DecodeOpened(jpeg_decompress_struct& jpeg, Bitmap& bitmap, LLong fileSize)
{
  jpeg_read_header(&jpeg, TRUE);
  jpeg_calc_output_dimensions(&jpeg);
  if (jpeg.output_components != 1 && jpeg.output_components != 3)
    return IMAGERESULT_FORMAT;
  LLong pixelBytes = LLong{jpeg.output_width} * jpeg.output_height * jpeg.output_components;
  if (!IsPictureInProportion(pixelBytes, fileSize) ||
      bitmap.Init(static_cast<Long>(jpeg.output_width), static_cast<Long>(jpeg.output_height),
                  jpeg.output_components == 1 ? kDepthGrey : kDepthColor) != IMAGERESULT_OK)
    return IMAGERESULT_MEMORY;
  return DecodeRows(jpeg, bitmap);
}

// The jump ends here, with the decompressor destroyed.
Long Decode(JpegReading& reading, BaseFile& file, Bitmap& bitmap, LLong fileSize)
{
  reading.jpeg.err = SetUpJpegErrors(reading.errors);
  if (setjmp(reading.errors.target) != 0)
    return IMAGERESULT_MEMORY;
  jpeg_create_decompress(&reading.jpeg);
  SetUpSource(reading, file);
  reading.progress.progress_monitor = CheckProgress;
  reading.jpeg.progress = &reading.progress;
  Long result = DecodeOpened(reading.jpeg, bitmap, fileSize);
  jpeg_destroy_decompress(&reading.jpeg);
  return result;
}

} // namespace

// Looks at up to three segments behind the first marker: what is found must be markers, one behind the other.
Bool JpgLoader::Identify(const Filename&, const void* data, LLong count) const
{
  constexpr int kSegments = 3;
  const auto* first = static_cast<const UChar*>(data);
  if (count < 2 || first[0] != kMarkerStart || first[1] != kStartOfImage)
    return false;
  LLong place = 2;
  for (int i = 0; i < kSegments && count - place >= 4; ++i) {
    if (first[place] != kMarkerStart)
      return false;
    if (first[place + 1] == kEndOfImageMarker)
      return true;
    place += 2 + bytes::GetBig<UWord>(first + place + 2);
  }
  return true;
}

Long JpgLoader::Load(const Filename& name, Bitmap& bitmap, Long) const
{
  BaseFile file;
  if (!file.Open(name, kFileRead))
    return IMAGERESULT_OPEN;
  LLong fileSize = file.GetLength();
  JpegReading reading = {};
  return Decode(reading, file, bitmap, fileSize);
}

} // namespace _torvane_
