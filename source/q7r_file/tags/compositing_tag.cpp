#include "torvane/tags/compositing_tag.h"

#include <chrono>

#include "q7r_file/tags/tag_entries.h"
#include "q7r_file/types/tag_makers.h"

namespace _torvane_
{

namespace
{

constexpr EntryDefault kCompositingDefaults[] = {
    {1000, 1003, EntryForm::kBool, 1},    {1017, 1017, EntryForm::kBool, 1},   {1126, 1129, EntryForm::kBool, 1},
    {1142, 1142, EntryForm::kBool, 1},    {1004, 1005, EntryForm::kBool, 0},   {1143, 1143, EntryForm::kBool, 0},
    {1153, 1156, EntryForm::kBool, 0},    {1158, 1158, EntryForm::kBool, 0},   {1006, 1006, EntryForm::kLong, 0},
    {1007, 1007, EntryForm::kLong, 2},    {1016, 1016, EntryForm::kReal, 0.1}, {1110, 1115, EntryForm::kLong, 1, 1},
    {1120, 1125, EntryForm::kLong, 7, 1}, {1131, 1131, EntryForm::kLong, 1},   {1144, 1144, EntryForm::kVector, 0},
    {1150, 1152, EntryForm::kReal, 1.0},  {1159, 1159, EntryForm::kReal, 1.0},
};

// A running number of milliseconds, cut to 32 bits.
Long ReadMilliseconds()
{
  using namespace std::chrono;
  const auto now = duration_cast<milliseconds>(steady_clock::now().time_since_epoch()).count();
  return static_cast<Long>(static_cast<ULong>(now));
}

// Six times a switch and a number that belong together.
void ReadPairs(EntryReader& entries, Long switchId, Long numberId)
{
  for (Long i = 0; i < 6; ++i) {
    entries.Bool(switchId + i);
    entries.Long(numberId + i);
  }
}

void ReadOldValues(EntryReader& entries, Long level)
{
  if (level < 0)
    return;
  for (Long id = 1000; id <= 1004; ++id)
    entries.Bool(id);
  if (level >= 1) {
    entries.Bool(1005);
    entries.Long(1006);
    entries.Long(1007);
  }
  if (level >= 2)
    entries.Skip<Bool, Real>();
  if (level >= 3) {
    entries.Real(1016);
    ReadPairs(entries, 1010, 1110);
  }
  if (level >= 4)
    entries.Bool(1017);
  if (level >= 5)
    ReadPairs(entries, 1136, 1120);
}

} // namespace

BaseTag* MakeCompositingTag() { return NewObj<CompositingTag>(); }

CompositingTag::CompositingTag() : BaseTag(kTagCompositing)
{
  SetEntryDefaults(data_, kCompositingDefaults);
  data_.SetLong(kCompositingClock, ReadMilliseconds());
}

Bool CompositingTag::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseTag::ReadChunk(file, id, level))
    return true;
  if (id != kTagCompositing)
    return false;
  return ReadChunkBody(file, level, [&](ChunkReader& v) {
    EntryReader entries(v, data_);
    ReadOldValues(entries, level);
  });
}

} // namespace _torvane_
