#include "torvane/tags/compositing_tag.h"

#include "k2v_file/values/container_defaults.h"
#include "q7r_basetime/clock.h"
#include "q7r_file/tags/tag_entries.h"

namespace _torvane_
{

namespace
{

constexpr ContainerDefault kCompositingDefaults[] = {
    {1000, DefaultForm::kBool, 1},           {1001, DefaultForm::kBool, 1},   {1002, DefaultForm::kBool, 1},
    {1003, DefaultForm::kBool, 1},           {1017, DefaultForm::kBool, 1},   {1126, DefaultForm::kBool, 1},
    {1127, DefaultForm::kBool, 1},           {1128, DefaultForm::kBool, 1},   {1129, DefaultForm::kBool, 1},
    {1142, DefaultForm::kBool, 1},           {1004, DefaultForm::kBool, 0},   {1005, DefaultForm::kBool, 0},
    {1143, DefaultForm::kBool, 0},           {1153, DefaultForm::kBool, 0},   {1154, DefaultForm::kBool, 0},
    {1155, DefaultForm::kBool, 0},           {1156, DefaultForm::kBool, 0},   {1158, DefaultForm::kBool, 0},
    {1006, DefaultForm::kLong, 0},           {1007, DefaultForm::kLong, 2},   {1016, DefaultForm::kReal, 0.1},
    {1110, DefaultForm::kLong, 1},           {1111, DefaultForm::kLong, 2},   {1112, DefaultForm::kLong, 3},
    {1113, DefaultForm::kLong, 4},           {1114, DefaultForm::kLong, 5},   {1115, DefaultForm::kLong, 6},
    {1120, DefaultForm::kLong, 7},           {1121, DefaultForm::kLong, 8},   {1122, DefaultForm::kLong, 9},
    {1123, DefaultForm::kLong, 10},          {1124, DefaultForm::kLong, 11},  {1125, DefaultForm::kLong, 12},
    {1131, DefaultForm::kLong, 1},           {1144, DefaultForm::kGrey},      {1150, DefaultForm::kReal, 1.0},
    {1151, DefaultForm::kReal, 1.0},         {1152, DefaultForm::kReal, 1.0}, {1159, DefaultForm::kReal, 1.0},
    {kCompositingClock, DefaultForm::kLong},
};

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

CompositingTag::CompositingTag() : BaseTag(kTagCompositing)
{
  data_.SetDefaults(DefaultsOf<kCompositingDefaults>());
  StartClock();
}

// Back to the defaults that all new tags share: what is read comes over them.
void CompositingTag::PrepareToRead()
{
  data_.Flush();
  data_.SetDefaults(DefaultsOf<kCompositingDefaults>());
}

void CompositingTag::StartClock() { data_.SetLong(kCompositingClock, ReadMilliseconds()); }

Bool CompositingTag::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseTag::ReadChunk(file, id, level))
    return true;
  if (id != kTagCompositing)
    return false;
  StartClock();
  return ReadChunkBody(file, level, [&](ChunkReader& v) {
    EntryReader entries(v, data_);
    ReadOldValues(entries, level);
  });
}

} // namespace _torvane_
