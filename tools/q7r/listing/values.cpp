#include "values.h"

#include <algorithm>
#include <iterator>
#include <unordered_set>
#include <vector>

#include "scene_file.h"
#include "torvane/math/crc.h"
#include "torvane/objects/unit_factors.h"
#include "torvane/shaders/gradient.h"
#include "torvane/stream/hyper_file.h"

namespace q7r
{

using namespace _torvane_;

namespace
{

// The ids of a container that came already. They ascend nearly always: then there is nothing to remember.
class SeenIds
{
 public:
  explicit SeenIds(const BaseContainer& container) : container_(container) {}

  bool IsNew(Long id)
  {
    ++count_;
    if (isAscending_ && (count_ == 1 || id > last_)) {
      last_ = id;
      return true;
    }
    if (isAscending_)
      Remember();
    return ids_.insert(id).second;
  }

 private:
  void Remember()
  {
    isAscending_ = false;
    BaseContainer::Iterator iterator;
    Long id = 0;
    const GeData* value = nullptr;
    Long left = count_ - 1;
    for (bool more = container_.BrowseFirst(iterator, id, value); more && left > 0;
         more = container_.BrowseNext(iterator, id, value), --left)
      ids_.insert(id);
  }

  const BaseContainer& container_;
  std::unordered_set<Long> ids_;
  Long count_ = 0;
  Long last_ = 0;
  bool isAscending_ = true;
};

void TellGradient(ValueSink& sink, const GradientData& gradient)
{
  Tell(sink, "settings", gradient.GetSettings());
  if (gradient.GetAlpha())
    Tell(sink, "alpha", gradient.GetAlpha()->GetSettings());
}

void TellCustom(ValueSink& sink, const CustomData& custom)
{
  sink.BeginObject(ValueSink::Layout::kLine);
  sink.Member("custom", custom.GetTypeId());
  if (const auto* gradient = NodeCast<GradientData>(&custom)) {
    TellGradient(sink, *gradient);
  } else if (const auto* unit = NodeCast<UnitScaleData>(&custom)) {
    sink.Member("factor", unit->scale);
    sink.Member("code", unit->unit);
  } else {
    TellWritten(
        sink, custom.GetChunkLevel(),
        [](const void* what, HyperFile& file) { static_cast<const CustomData*>(what)->Write(file); }, &custom);
  }
  sink.EndObject();
}

void TellUnknown(ValueSink& sink, const UnknownRecord& record)
{
  sink.BeginObject(ValueSink::Layout::kLine);
  sink.Member("custom", record.type);
  TellBytes(sink, record.level, record.data, record.size);
  sink.EndObject();
}

// Puts 1 for the number of a link that leads somewhere.
void MaskLinks(std::vector<UChar>& bytes)
{
  constexpr std::string_view kMark = "alias2";
  constexpr std::size_t kNumberSize = 8;
  Filename name;
  name.SetMemoryRead(bytes.data(), static_cast<LLong>(bytes.size()));
  std::vector<std::size_t> places;
  StreamWalker walker;
  StreamValue value;
  for (bool good = walker.Open(name); good && walker.Next(value);) {
    if (value.tag == kTagMemory && value.size >= static_cast<LLong>(kMark.size() + kNumberSize) &&
        kMark == std::string_view(reinterpret_cast<const char*>(value.head), kMark.size()))
      places.push_back(static_cast<std::size_t>(value.offset) + 5 + kMark.size());
  }
  for (const std::size_t place : places) {
    const auto first = bytes.begin() + static_cast<std::ptrdiff_t>(place);
    const auto last = first + kNumberSize;
    const bool leads = std::any_of(first, last, [](UChar byte) { return byte != 0; });
    std::fill(first, last, static_cast<UChar>(leads ? 1 : 0));
  }
}

// What a scene file begins with.
constexpr UChar kHeader[] = {'Q', 'Q', '7', 'R', 'Q', '7', 'R', '6', 0, 0, kVersionCurrent >> 8, kVersionCurrent & 255,
                             0};

// Tells the bytes of a scene file behind its header.
void TellFile(ValueSink& sink, Long level, std::vector<UChar>& bytes)
{
  MaskLinks(bytes);
  const std::size_t header = std::min(bytes.size(), std::size(kHeader));
  const auto size = static_cast<LLong>(bytes.size() - header);
  Crc64 sum;
  sum.Update(bytes.data() + header, size);
  sink.Member("level", level);
  sink.Member("size", size);
  sink.Member("crc64", HexText(sum.GetCrc()));
}

} // namespace

std::string HexText(unsigned long long number)
{
  constexpr char kDigits[] = "0123456789abcdef";
  std::string text(16, '0');
  for (auto place = text.rbegin(); place != text.rend(); ++place, number >>= 4)
    *place = kDigits[number & 15];
  return text;
}

void TellReals(ValueSink& sink, const Real* numbers, long long count, bool lasts)
{
  NumberRows rows;
  rows.entries = numbers;
  rows.count = count;
  rows.whole = false;
  rows.lasts = lasts;
  rows.get = [](const void* all, long long index, double* row) { *row = static_cast<const Real*>(all)[index]; };
  sink.Rows(rows);
}

void Tell(ValueSink& sink, const Vector& vector)
{
  const Real numbers[] = {vector.x, vector.y, vector.z};
  TellReals(sink, numbers, 3);
}

void Tell(ValueSink& sink, const Matrix& matrix)
{
  Real numbers[12];
  Real* place = numbers;
  for (const Vector* row : {&matrix.off, &matrix.v1, &matrix.v2, &matrix.v3}) {
    for (const Real number : {row->x, row->y, row->z})
      *place++ = number;
  }
  TellReals(sink, numbers, 12);
}

void Tell(ValueSink& sink, const BaseTime& time) { sink.Time(time.GetNumerator(), time.GetDenominator()); }

void Tell(ValueSink& sink, const String& text) { sink.Text(ToUtf8(text)); }

// A file may point a link at a thing that has a goal but is no named node.
const BaseList2D* TargetOf(const GeAliasLink& link) { return NodeCast<BaseList2D>(link.GetLink()); }

std::string PathText(const BaseList2D& node)
{
  std::string path = ToUtf8(node.GetName());
  // A list head names the node above; only nodes of a hierarchy have one that leads to the root.
  for (const RootList2D* head = node.GetListHead(); head && head->GetOwner(); head = head->GetOwner()->GetListHead())
    path.insert(0, ToUtf8(head->GetOwner()->GetName()) + "/");
  return path;
}

void Tell(ValueSink& sink, const GeAliasLink& link)
{
  const BaseList2D* target = TargetOf(link);
  sink.Link(target, target ? PathText(*target) : std::string());
}

void Tell(ValueSink& sink, const GeData& value)
{
  switch (value.GetRawType()) {
  case kDataLong:
    return sink.Integer(value.GetLong());
  case kDataReal:
    return sink.Real(value.GetReal());
  case kDataLLong:
    return sink.Integer(value.GetLLong());
  case kDataTime:
    return Tell(sink, value.GetTime());
  case kDataVector:
    return Tell(sink, value.GetVector());
  case kDataMatrix:
    return Tell(sink, value.GetMatrix());
  case kDataString:
    return Tell(sink, value.GetString());
  case kDataFilename:
    return Tell(sink, value.GetFilename().GetString());
  case kDataContainer:
    return Tell(sink, *value.GetContainer());
  case kDataLink:
    return Tell(sink, *value.GetAliasLink());
  case kDataUnknown:
    return TellUnknown(sink, *value.GetUnknown());
  default:
    return value.GetCustom() ? TellCustom(sink, *value.GetCustom()) : sink.Null();
  }
}

void Tell(ValueSink& sink, const BaseContainer& container, EntryFilter skip)
{
  sink.BeginObject();
  TellEntries(sink, container, skip);
  sink.EndObject();
}

void TellEntries(ValueSink& sink, const BaseContainer& container, EntryFilter skip)
{
  SeenIds seen(container);
  BaseContainer::Iterator iterator;
  Long id = 0;
  const GeData* value = nullptr;
  for (bool more = container.BrowseFirst(iterator, id, value); more; more = container.BrowseNext(iterator, id, value)) {
    if (seen.IsNew(id) && !(skip && skip(id)))
      Tell(sink, std::to_string(id), *value);
  }
}

void TellBytes(ValueSink& sink, Long level, const void* data, LLong size)
{
  std::vector<UChar> bytes(std::begin(kHeader), std::end(kHeader));
  const auto* first = static_cast<const UChar*>(data);
  bytes.insert(bytes.end(), first, first + size);
  TellFile(sink, level, bytes);
}

void TellBytes(ValueSink& sink, const RawChunkBody& body)
{
  TellBytes(sink, body.GetLevel(), body.GetData(), body.GetSize());
}

void TellWritten(ValueSink& sink, Long level, void (*write)(const void* what, HyperFile& file), const void* what)
{
  MemoryDescription written;
  Filename name;
  name.SetMemoryWrite(&written);
  {
    HyperFile file;
    if (file.Open(kSceneIdent, name, kHyperFileWrite))
      write(what, file);
    file.Close();
  }
  if (!written.Join())
    throw std::bad_alloc();
  const auto* first = static_cast<const UChar*>(written.data);
  std::vector<UChar> bytes(first, first + written.size);
  TellFile(sink, level, bytes);
}

} // namespace q7r
