// q7r preview: takes a scene file's picture out, or puts one in.
#include <algorithm>
#include <cctype>
#include <filesystem>
#include <memory>

#include "output/output_file.h"
#include "standard_input.h"
#include "torvane/pictures/bitmap_filters.h"
#include "usage.h"
#include "verbs.h"
#include "work_list.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

constexpr const char* kHelp = R"(Takes the preview picture out of a scene file, or puts one in with --set.

Use it to see what is in a scene without opening it: only the start of the file is read.
The suffix of the picture's name tells its format, .jpg, .jpeg or .bmp. A JPEG comes out
byte for byte as the scene holds it. BMP (24 bits a pixel) and JPEG files can be put in.

Examples: q7r preview shot.q7r -o shot.jpg
          q7r preview scenes/*.q7r -o stills
          q7r preview shot.q7r --set still.bmp -o new.q7r)";

struct Options : WorkOptions
{
  std::string picture; // to put in; empty to take out
};

const char* PictureProblem(Long result)
{
  switch (result) {
  case IMAGERESULT_OPEN:
    return "can't be opened";
  case IMAGERESULT_FORMAT:
    return "this kind isn't read: a BMP needs 24 bits a pixel, a JPEG one or three components";
  case IMAGERESULT_LARGE:
    return "larger than the format allows";
  case IMAGERESULT_FILE:
    return "can't be read or written to its end";
  default:
    return "damaged, or too large for the memory";
  }
}

void RequireGood(const std::string& path, Long result)
{
  if (result != IMAGERESULT_OK)
    throw Failure(InputName(path), PictureProblem(result));
}

// The format that a picture's name asks for.
Long FormatOf(const std::string& path)
{
  if (IsStandard(path))
    return kImageFormatJpeg;
  std::string suffix = std::filesystem::path(path).extension().string();
  std::transform(suffix.begin(), suffix.end(), suffix.begin(), [](unsigned char c) { return std::tolower(c); });
  if (suffix == ".bmp")
    return kImageFormatBmp;
  if (suffix == ".jpg" || suffix == ".jpeg")
    return kImageFormatJpeg;
  throw Failure(path, "the name of a picture ends with .jpg, .jpeg or .bmp");
}

// The picture as a file of a format.
std::string PictureBytes(BaseDocument& document, Long format)
{
  const Bitmap& stored = document.GetStoredPreview();
  if (format == kImageFormatJpeg)
    return {static_cast<const char*>(stored.GetEncoded()), static_cast<std::size_t>(stored.GetEncodedSize())};
  MemoryDescription written;
  Filename name;
  name.SetMemoryWrite(&written);
  if (document.GetPreview().Save(name, format, nullptr, 0) != IMAGERESULT_OK || !written.Join())
    throw std::bad_alloc();
  return {static_cast<const char*>(written.data), static_cast<std::size_t>(written.size)};
}

int TakeOut(const Work& work)
{
  const Long format = FormatOf(work.output);
  FileProblem problem;
  DocumentPtr document(LoadDocument(ToFilename(work.input), LoadPreviewOnly, &problem));
  if (!document)
    throw SceneFailure(work.input, problem);
  Bitmap& preview = document->GetPreview();
  if (preview.GetBw() < 1)
    throw Failure(InputName(work.input), "holds no preview picture");
  const std::string words = std::to_string(preview.GetBw()) + " x " + std::to_string(preview.GetBh()) + " pixels";
  WriteOutput(work.output, PictureBytes(*document, format), words);
  return kDone;
}

void LoadPicture(const std::string& path, Bitmap& bitmap)
{
  const std::string bytes = ReadInput(path);
  const auto size = static_cast<LLong>(bytes.size());
  if (size < 1)
    throw Failure(InputName(path), "is empty");
  Filename name;
  name.SetMemoryRead(bytes.data(), size);
  const BmpLoader bmp;
  const JpgLoader jpeg;
  for (const BitmapLoaderData* loader :
       {static_cast<const BitmapLoaderData*>(&bmp), static_cast<const BitmapLoaderData*>(&jpeg)}) {
    if (loader->Identify(name, bytes.data(), size))
      return RequireGood(path, loader->Load(name, bitmap, kFirstFrame));
  }
  throw Failure(InputName(path), "is neither a JPEG file nor a BMP file of the common kind");
}

int PutIn(const Work& work, const std::string& picture)
{
  DocumentPtr document = LoadScene(work.input);
  Bitmap& preview = document->GetPreview();
  LoadPicture(picture, preview);
  // A scene file holds its preview as JPEG.
  Long most = JpgSaver().GetMaxResolution();
  if (preview.GetBw() > most || preview.GetBh() > most)
    RequireGood(picture, IMAGERESULT_LARGE);
  WriteScene(*document, work.output);
  return kDone;
}

int Preview(const Options& options)
{
  const bool takesOut = options.picture.empty();
  const auto prepare = [&](const Work& work) {
    if (takesOut)
      FormatOf(work.output);
    RequireWritable(work.output, options.force);
  };
  return DoWork(PlanWork(options, takesOut ? ".jpg" : nullptr), options.jobs, prepare,
                [&](const Work& work) { return takesOut ? TakeOut(work) : PutIn(work, options.picture); });
}

} // namespace

void AddPreview(CLI::App& program, int& status)
{
  auto options = std::make_shared<Options>();
  CLI::App* verb = program.add_subcommand("preview", kHelp);
  AddWorkOptions(*verb, *options, "FILE",
                 "the scene file, then the picture to write, or with --set the scene file to write. With -o, as many "
                 "scene files as you like, each picture a .jpg");
  verb->add_option("--set", options->picture, "put this picture in")->option_text("IMAGE");
  AddTalkOptions(*verb);
  verb->callback([options, &status] { status = Preview(*options); });
}

} // namespace q7r
