// Photometric text files: lines of keywords and texts, then, behind the word "TILT", a run of numbers that takes no
// notice of lines.
#include <cmath>
#include <cstring>
#include <iterator>

#include "q7r_file/objects/light/ies_words.h"
#include "torvane/bytes/base_file.h"
#include "torvane/objects/ies_light.h"

namespace _torvane_
{

namespace
{

constexpr LLong kHeadSize = 1024;
constexpr Real kFoot = 0.3048;
constexpr Long kUnitFeet = 1;

enum class Keyword : UChar
{
  kNone,
  kVersion1991,
  kVersion1995,
  kTilt,
  kTiltNone,
  kTiltInclude,
  kManufacturer,
  kLuminaireCatalogue,
  kLuminaire,
  kLampCatalogue,
  kLamp,
};

struct KeywordText
{
  const char* text;
  Keyword keyword;
};

constexpr KeywordText kKeywords[] = {
    {"IESNA91", Keyword::kVersion1991},
    {"IESNA:LM-63-1995", Keyword::kVersion1995},
    {"TILT", Keyword::kTilt},
    {"NONE", Keyword::kTiltNone},
    {"INCLUDE", Keyword::kTiltInclude},
    {"[MANUFAC]", Keyword::kManufacturer},
    {"[LUMCAT]", Keyword::kLuminaireCatalogue},
    {"[LUMINAIRE]", Keyword::kLuminaire},
    {"[LAMPCAT]", Keyword::kLampCatalogue},
    {"[LAMP]", Keyword::kLamp},
};

Keyword FindKeyword(const char* word)
{
  for (const KeywordText& row : kKeywords) {
    if (std::strcmp(row.text, word) == 0)
      return row.keyword;
  }
  return Keyword::kNone;
}

// Which of the three dimensions a component of the size is, and with which sign.
enum class SizeTerm : UChar
{
  kZero,
  kX,
  kL,
  kH,
  kMinusX,
  kMinusL,
  kMinusH,
};

// How a file tells the shape of the luminous opening: by the signs of its width x, length l and height h.
struct ShapeRow
{
  int x, l, h;
  Long shape;
  SizeTerm size[3];
};

constexpr ShapeRow kShapes[] = {
    {1, 1, 0, 1, {SizeTerm::kX, SizeTerm::kL, SizeTerm::kZero}},
    {1, 0, 1, 1, {SizeTerm::kX, SizeTerm::kH, SizeTerm::kZero}},
    {0, 1, 1, 1, {SizeTerm::kH, SizeTerm::kL, SizeTerm::kZero}},
    {1, 1, 1, 4, {SizeTerm::kX, SizeTerm::kL, SizeTerm::kH}},
    {-1, 0, 0, 0, {SizeTerm::kMinusX, SizeTerm::kMinusX, SizeTerm::kMinusX}},
    {-1, 0, -1, 2, {SizeTerm::kMinusX, SizeTerm::kMinusX, SizeTerm::kMinusX}},
    {-1, 0, 1, 3, {SizeTerm::kMinusX, SizeTerm::kMinusX, SizeTerm::kH}},
    {0, 1, -1, 8, {SizeTerm::kL, SizeTerm::kMinusH, SizeTerm::kMinusH}},
    {1, 0, -1, 8, {SizeTerm::kX, SizeTerm::kMinusH, SizeTerm::kMinusH}},
    {-1, 1, 1, 0, {SizeTerm::kMinusX, SizeTerm::kL, SizeTerm::kZero}},
    {1, -1, 1, 0, {SizeTerm::kX, SizeTerm::kMinusL, SizeTerm::kZero}},
    {-1, 1, -1, 2, {SizeTerm::kMinusX, SizeTerm::kL, SizeTerm::kMinusH}},
    {1, -1, -1, 2, {SizeTerm::kX, SizeTerm::kMinusL, SizeTerm::kMinusH}},
};

int Sign(Real value) { return value > 0.0 ? 1 : value < 0.0 ? -1 : 0; }

// Any other opening has no shape and no size.
void SetShape(IESLight& light, Real x, Real l, Real h)
{
  const Real terms[] = {0.0, x, l, h, -x, -l, -h};
  light.shape = -1;
  light.size = Vector();
  for (const ShapeRow& row : kShapes) {
    if (row.x != Sign(x) || row.l != Sign(l) || row.h != Sign(h))
      continue;
    auto term = [&](int component) { return terms[static_cast<int>(row.size[component])]; };
    light.shape = row.shape;
    light.size = Vector(term(0), term(1), term(2));
  }
}

class IESParser
{
 public:
  IESParser(BaseFile& file, IESLight& light, IESFactors factors)
      : file_(file), words_(file), light_(light), factors_(factors)
  {}

  // Reads all of the file, or up to the end of the numbers.
  Bool Parse();

 private:
  Bool ParseTilt();
  Bool ParseIncludedTilt();
  Bool ParseNumbers();
  Bool ParseTables(Long verticalCount, Long horizontalCount);
  Bool Multiply(Real factor);

  BaseFile& file_;
  IESWords words_;
  IESLight& light_;
  IESFactors factors_;
};

Bool IESParser::ParseIncludedTilt()
{
  Long geometry = 0;
  Long count = 0;
  return words_.TakeInteger(geometry) && words_.TakeInteger(count) && words_.DropNumbers(count) &&
         words_.DropNumbers(count);
}

Bool IESParser::ParseTables(Long verticalCount, Long horizontalCount)
{
  for (Long count : {verticalCount, horizontalCount}) {
    if (count < 0 || count > kMaxIESAngles)
      return false;
  }
  return words_.TakeTable(light_.verticalAngles, verticalCount) &&
         words_.TakeTable(light_.horizontalAngles, horizontalCount) &&
         words_.TakeTable(light_.candela, verticalCount * horizontalCount);
}

// False when a product is no number any more.
Bool IESParser::Multiply(Real factor)
{
  for (Real& value : light_.candela) {
    value *= factor;
    if (!std::isfinite(value))
      return false;
  }
  return true;
}

Bool IESParser::ParseNumbers()
{
  Long lampCount = 0;
  Long verticalCount = 0;
  Long horizontalCount = 0;
  Long photometry = 0;
  Long unit = 0;
  Real lampLumens = 0.0;
  Real multiplier = 0.0;
  Real x = 0.0;
  Real l = 0.0;
  Real h = 0.0;
  Real ballast = 0.0;
  Real future = 0.0;
  Real watts = 0.0;
  if (light_.tiltMode == kIESTiltInclude && !ParseIncludedTilt())
    return false;
  if (!words_.TakeInteger(lampCount) || !words_.TakeNumbers({&lampLumens, &multiplier}) ||
      !words_.TakeInteger(verticalCount) || !words_.TakeInteger(horizontalCount) || !words_.TakeInteger(photometry) ||
      !words_.TakeInteger(unit) || !words_.TakeNumbers({&x, &l, &h}))
    return false;
  SetShape(light_, x, l, h);
  if (unit == kUnitFeet)
    light_.size *= kFoot;
  if (!words_.TakeNumbers({&ballast, &future, &watts}))
    return false;
  if (!ParseTables(verticalCount, horizontalCount) ||
      !Multiply(multiplier * ballast * (factors_ == IESFactors::kAll ? watts : 1.0)))
    return false;
  light_.Normalise();
  return true;
}

// The word behind "TILT" tells whether tilt data are included. Data in a file of their own can't be had.
Bool IESParser::ParseTilt()
{
  if (!words_.TakeWord())
    return false;
  switch (FindKeyword(words_.GetWord())) {
  case Keyword::kTiltNone:
    light_.tiltMode = kIESTiltNone;
    return ParseNumbers();
  case Keyword::kTiltInclude:
    light_.tiltMode = kIESTiltInclude;
    return ParseNumbers();
  default:
    return false;
  }
}

Bool IESParser::Parse()
{
  while (words_.NextLine()) {
    if (!words_.TakeWord())
      continue;
    switch (FindKeyword(words_.GetWord())) {
    case Keyword::kVersion1991:
      light_.fileVersion = kIESVersion1991;
      break;
    case Keyword::kVersion1995:
      light_.fileVersion = kIESVersion1995;
      break;
    case Keyword::kManufacturer:
      light_.manufacturer = words_.TakeText();
      break;
    case Keyword::kLuminaireCatalogue:
      light_.luminaireCatalogue = words_.TakeText();
      break;
    case Keyword::kLuminaire:
      light_.luminaire = words_.TakeText();
      break;
    case Keyword::kLampCatalogue:
      light_.lampCatalogue = words_.TakeText();
      break;
    case Keyword::kLamp:
      light_.lamp = words_.TakeText();
      break;
    case Keyword::kTilt:
      return ParseTilt() && file_.GetError() == FILEERROR_NONE;
    default:
      break;
    }
  }
  return file_.GetError() == FILEERROR_NONE;
}

char ToUpper(char c) { return c >= 'a' && c <= 'z' ? static_cast<char>(c - 'a' + 'A') : c; }

// Looks for a mark of photometric files. The last bytes are not looked at.
Bool HoldsMark(const char* head, LLong count)
{
  constexpr const char* kMarks[] = {"IESN", "TILT"};
  constexpr LLong kMarkSize = 4;
  constexpr LLong kLeastBehind = 8;
  for (LLong i = 0; i + kLeastBehind <= count; ++i) {
    for (const char* mark : kMarks) {
      LLong same = 0;
      while (same < kMarkSize && ToUpper(head[i + same]) == mark[same])
        ++same;
      if (same == kMarkSize)
        return true;
    }
  }
  return false;
}

struct ResultText
{
  Long result;
  const char* text;
};

constexpr ResultText kResultTexts[] = {
    {kIESLoaded, "the photometric file was read"},
    {kIESNotOpened, "the file can't be opened"},
    {kIESNotPhotometric, "this is no photometric file: neither \"IESN\" nor \"TILT\" stands in its first 1024 bytes"},
    {kIESNoMemory, "there is not enough memory to read the file"},
    {kIESUnreadable, "the file can't be read, or its numbers are not those of a photometric file: one is missing, is "
                     "malformed, or is a count above 1024"},
};

} // namespace

Long LoadIESFile(IESLight*& light, const Filename& name, IESFactors factors)
{
  const AllocationWatch watch;
  BaseFile file;
  if (!file.Open(name, kFileRead))
    return kIESNotOpened;
  IESLight* loaded = NewObj<IESLight>();
  if (!loaded)
    return kIESNoMemory;
  char head[kHeadSize];
  const LLong count = file.ReadBytes(head, kHeadSize, true);
  Long result = kIESUnreadable;
  if (file.GetError() == FILEERROR_NONE && !HoldsMark(head, count))
    result = kIESNotPhotometric;
  IESParser parser(file, *loaded, factors);
  if (result == kIESUnreadable && file.Seek(0) && parser.Parse())
    result = kIESLoaded;
  if (watch.Failed())
    result = kIESNoMemory;
  if (result == kIESLoaded) {
    DeleteObj(light);
    light = loaded;
  } else {
    DeleteObj(loaded);
  }
  return result;
}

const char* GetIESResultText(Long result)
{
  for (const ResultText& row : kResultTexts) {
    if (row.result == result)
      return row.text;
  }
  return "an unknown result";
}

} // namespace _torvane_
