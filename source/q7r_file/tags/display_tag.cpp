#include "torvane/tags/display_tag.h"

#include "k2v_file/values/container_defaults.h"
#include "q7r_file/nodes/node_tools.h"
#include "q7r_file/tags/tag_entries.h"

namespace _torvane_
{

namespace
{

// From this version on no file holds chunk kChunkOldDisplay.

constexpr ContainerDefault ColorDefault(Long id, Real red, Real green, Real blue)
{
  return {id, DefaultForm::kVector, 0, Vector(red / 255.0, green / 255.0, blue / 255.0)};
}

constexpr ContainerDefault kDisplayDefaults[] = {
    {1015, DefaultForm::kBool, 1},      {10000, DefaultForm::kBool, 0},     {10001, DefaultForm::kTime, 0},
    {10002, DefaultForm::kTime, 3},     {10003, DefaultForm::kLong, 12},    {10004, DefaultForm::kLong, 12},
    {10005, DefaultForm::kLong, 3},     {10006, DefaultForm::kLong, 40},    {10007, DefaultForm::kLong, 40},
    {10009, DefaultForm::kString},      {10010, DefaultForm::kReal, 1.0},   {10011, DefaultForm::kLong, 5},
    ColorDefault(20000, 142, 173, 203), ColorDefault(20001, 255, 170, 24),  ColorDefault(20002, 85, 223, 143),
    ColorDefault(20003, 229, 91, 91),   ColorDefault(20004, 169, 153, 255), {30000, DefaultForm::kLong, 1},
    {30002, DefaultForm::kBool, 0},     {30006, DefaultForm::kBool, 0},     {30007, DefaultForm::kBool, 0},
    {30008, DefaultForm::kBool, 0},     {30010, DefaultForm::kBool, 0},     {30009, DefaultForm::kLong, 2},
};

// Takes no chunk, so that whatever comes is passed over.
struct NothingInside
{
  static Bool ReadChunk(HyperFile&, Long, Long) { return false; }
};

} // namespace

struct DisplayTag::LongSetting
{
  Long id;
  Long initial;
};

struct DisplayTag::RealSetting
{
  Long id;
  Real initial;
};

constexpr DisplayTag::LongSetting DisplayTag::kLongSettings[kLongCount] = {
    {1001, 1}, {1002, 1}, {1007, 0}, {1008, 0}, {1009, 0}, {1010, 0}, {1012, 0}, {1014, 0}, {1015, 1},
};

constexpr DisplayTag::RealSetting DisplayTag::kRealSettings[kRealCount] = {{1004, 1.0}, {1006, 1.0}};

DisplayTag::DisplayTag() : BaseTag(kTagDisplay)
{
  for (Long i = 0; i < kLongCount; ++i)
    longs_[i] = kLongSettings[i].initial;
  for (Long i = 0; i < kRealCount; ++i)
    reals_[i] = kRealSettings[i].initial;
  data_.SetDefaults(DefaultsOf<kDisplayDefaults>());
}

Long* DisplayTag::FindLong(Long id)
{
  for (Long i = 0; i < kLongCount; ++i) {
    if (kLongSettings[i].id == id)
      return &longs_[i];
  }
  return nullptr;
}

Real* DisplayTag::FindReal(Long id)
{
  for (Long i = 0; i < kRealCount; ++i) {
    if (kRealSettings[i].id == id)
      return &reals_[i];
  }
  return nullptr;
}

Bool DisplayTag::GetParameter(const ParameterPath& path, GeData& value)
{
  if (const Long* number = FindLong(path[0].id))
    value = GeData(*number);
  else if (const Real* real = FindReal(path[0].id))
    value = GeData(*real);
  else
    return BaseTag::GetParameter(path, value);
  return true;
}

Bool DisplayTag::SetParameter(const ParameterPath& path, const GeData& value)
{
  if (Long* number = FindLong(path[0].id))
    *number = value.GetLong();
  else if (Real* real = FindReal(path[0].id))
    *real = value.GetReal();
  else
    return BaseTag::SetParameter(path, value);
  return true;
}

void DisplayTag::ReadOldSettings(EntryReader& entries, Long level)
{
  if (level < 0)
    return;
  entries.Skip<Long, Bool, Bool>();
  entries.Bool(1001);
  entries.Bool(1002);
  if (level >= 1) {
    entries.Bool(1010);
    entries.Real(1004);
  }
  for (Long id = 1007; id <= 1009; ++id) {
    if (level >= 2)
      entries.Bool(id);
    else
      data_.SetBool(id, true);
  }
  if (level >= 2) {
    entries.Skip<Bool>();
    entries.Bool(1012);
    entries.Real(1006);
    entries.Skip<Vector>();
  }
  if (level >= 3) {
    entries.Bool(1014);
    entries.Bool(1015);
  }
}

Bool DisplayTag::ReadChunk(HyperFile& file, Long id, Long level)
{
  if (BaseTag::ReadChunk(file, id, level))
    return true;
  if (id == kTagDisplay) {
    NothingInside nothing;
    return ReadInnerChunk(file, nothing);
  }
  if (id != kChunkOldDisplay || file.GetFileVersion() >= kVersionDisplay)
    return false;
  return ReadChunkBody(file, level, [&](ChunkReader& v) {
    EntryReader entries(v, data_);
    ReadOldSettings(entries, level);
  });
}

Bool DisplayTag::CopyTagData(BaseTag& destination, ULong, TransArray*)
{
  auto* target = NodeCast<DisplayTag>(&destination);
  if (!target)
    return false;
  GeCopyMem(target->longs_, longs_, sizeof longs_);
  GeCopyMem(target->reals_, reals_, sizeof reals_);
  return true;
}

} // namespace _torvane_
