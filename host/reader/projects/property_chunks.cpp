#include "host/reader/projects/property_chunks.h"

#include <algorithm>
#include <cmath>

#include "host/reader/projects/layouts.h"
#include "host/reader/projects/project_items.h"

namespace host::projects
{

namespace
{

constexpr std::size_t kAngles = 3; // of an orientation, which counts as one component

void RequireFinite(const Chunk& chunk, const Components& values)
{
  for (const double value : values)
    if (!std::isfinite(value))
      chunk.Refuse("expected finite numbers");
}

// `count` numbers that follow one another.
Components ReadNumbers(const Chunk& chunk, std::size_t offset, std::size_t count)
{
  Components values{};
  for (std::size_t c = 0; c < count; ++c)
    values[c] = chunk.RealAt(offset + 8 * c);
  return values;
}

class RecordReader
{
 public:
  explicit RecordReader(const Chunk& property)
      : property_(property),
        isOrientation_(property.IsList("otst"_tag)),
        body_(isOrientation_ ? property.RequireList("tdbs"_tag) : property)
  {}

  PropertyRecord Read();

 private:
  void ReadForm();
  void ReadExpression(const Chunk& form);
  void ReadValue();
  void ReadKeys(const Chunk& table);
  KeyRecord ReadKey(const Chunk& items, std::size_t at) const;
  void ReadPlain(const Chunk& items, std::size_t at, KeyRecord& key) const;
  void ReadWide(const Chunk& items, std::size_t at, KeyRecord& key) const;
  void TakeOrientations();

  Chunk property_;
  bool isOrientation_;
  Chunk body_; // the list `tdbs`
  PropertyRecord record_;
};

PropertyRecord RecordReader::Read()
{
  ReadForm();
  const std::optional<Chunk> table = body_.FindList("list"_tag);
  if (table && table->Require("lhd3"_tag).Get(lhd3::kItems) > 0)
    ReadKeys(*table);
  else
    ReadValue();
  if (isOrientation_ && !record_.keys.empty())
    TakeOrientations();
  return std::move(record_);
}

void RecordReader::ReadForm()
{
  const Chunk form = body_.Require("tdb4"_tag);
  record_.components = form.Get(tdb4::kComponents);
  if (record_.components < 1 || record_.components > kMaxComponents)
    form.Refuse("expected 1 to 4 components, not " + std::to_string(record_.components));
  const u8 bits = form.Get(tdb4::kForm);
  record_.hasTangents = (bits & tdb4::kWide) != 0;
  record_.isSpatial = record_.hasTangents && (bits & tdb4::kSpatial) != 0 && !isOrientation_;
  record_.ticksPerSecond = form.Get(tdb4::kTicksPerSecond);
  if (record_.ticksPerSecond == 0)
    form.Refuse("expected ticks for a second above 0");
  if (const std::optional<Chunk> switches = body_.Find("tdsb"_tag))
    record_.switches = switches->Get(tdsb::kSwitches);
  ReadExpression(form);
}

void RecordReader::ReadExpression(const Chunk& form)
{
  if (form.Size() > tdb4::kExpressionOff.offset && (form.Get(tdb4::kExpressionOff) & 1) != 0)
    return;
  for (const Chunk& child : body_.Children())
    if ((child.Id() == "Utf8"_tag || child.Id() == "expr"_tag) && record_.expression.empty())
      record_.expression = ToText(child.Bytes());
}

void RecordReader::ReadValue()
{
  const std::optional<Chunk> data = body_.Find("cdat"_tag);
  if (!data)
    return;
  record_.hasValue = true;
  if (!isOrientation_)
    record_.value = ReadNumbers(*data, 0, record_.components);
  else
    for (std::size_t c = 0; c < kAngles; ++c)
      record_.value[c] = data->LittleEndianRealAt(8 * c);
  RequireFinite(*data, record_.value);
}

void RecordReader::ReadKeys(const Chunk& table)
{
  const Chunk header = table.Require("lhd3"_tag);
  const Chunk items = table.Require("ldat"_tag);
  const std::size_t count = header.Get(lhd3::kItems), size = header.Get(lhd3::kItemSize);
  const std::size_t n = record_.components;
  const std::size_t needed = record_.hasTangents ? keyframe::kWideValues + 24 * n : keyframe::kPlainValues + 40 * n;
  if (size < needed)
    header.Refuse("expected items of " + std::to_string(needed) + " bytes, not " + std::to_string(size));
  if (count > items.Size() / size)
    items.Refuse("expected " + std::to_string(count) + " items of " + std::to_string(size) + " bytes");
  record_.keys.reserve(count);
  for (std::size_t i = 0; i < count; ++i) {
    record_.keys.push_back(ReadKey(items, i * size));
    if (i > 0 && record_.keys[i].ticks < record_.keys[i - 1].ticks)
      items.Refuse("keyframe " + std::to_string(i + 1) + " lies before the one ahead of it");
  }
}

KeyRecord RecordReader::ReadKey(const Chunk& items, std::size_t at) const
{
  KeyRecord key;
  key.ticks = items.Get(Field<i32>{at + keyframe::kTime});
  key.wayIn = items.Get(Field<u8>{at + keyframe::kWayIn});
  key.wayOut = items.Get(Field<u8>{at + keyframe::kWayOut});
  key.isRoving = (items.Get(Field<u8>{at + keyframe::kSwitches}) & keyframe::kRoving) != 0;
  record_.hasTangents ? ReadWide(items, at, key) : ReadPlain(items, at, key);
  if (!isOrientation_)
    RequireFinite(items, key.value);
  // Ways that lead nowhere may hold anything.
  for (Components* tangent : {&key.tangentIn, &key.tangentOut})
    for (double& part : *tangent)
      part = std::isfinite(part) ? part : 0;
  return key;
}

void RecordReader::ReadPlain(const Chunk& items, std::size_t at, KeyRecord& key) const
{
  const std::size_t n = record_.components;
  Components* const parts[] = {&key.value, &key.speedIn, &key.influenceIn, &key.speedOut, &key.influenceOut};
  for (std::size_t i = 0; i < std::size(parts); ++i)
    *parts[i] = ReadNumbers(items, at + keyframe::kPlainValues + 8 * n * i, n);
}

// An orientation's values here mean nothing.
void RecordReader::ReadWide(const Chunk& items, std::size_t at, KeyRecord& key) const
{
  double* const ease[] = {key.speedIn.data(), key.influenceIn.data(), key.speedOut.data(), key.influenceOut.data()};
  for (std::size_t i = 0; i < std::size(ease); ++i)
    *ease[i] = items.RealAt(at + keyframe::kWideEase + 8 * i);
  const std::size_t n = record_.components;
  Components* const parts[] = {&key.value, &key.tangentIn, &key.tangentOut};
  for (std::size_t i = 0; !isOrientation_ && i < std::size(parts); ++i)
    *parts[i] = ReadNumbers(items, at + keyframe::kWideValues + 8 * n * i, n);
}

void RecordReader::TakeOrientations()
{
  const Chunk values = property_.RequireList("otky"_tag);
  std::size_t next = 0;
  for (const Chunk& value : values.Children()) {
    if (value.Id() != "otda"_tag || next == record_.keys.size())
      continue;
    Components& angles = record_.keys[next++].value;
    angles = ReadNumbers(value, 0, kAngles);
    RequireFinite(value, angles);
  }
  if (next < record_.keys.size())
    values.Refuse("expected " + std::to_string(record_.keys.size()) + " chunks otda, not " + std::to_string(next));
}

} // namespace

PropertyGroup::PropertyGroup(const Chunk& group)
{
  std::string_view name;
  for (const Chunk& child : group.Children()) {
    if (child.Id() == "tdmn"_tag) {
      name = child.TextAt(0);
    } else if (!name.empty() && child.Id() == kList) {
      members_.emplace_back(name, child);
      name = {}; // what belongs to it beside its first list is of no use here
    }
  }
}

const Chunk* PropertyGroup::Find(std::string_view matchName) const
{
  const auto found =
      std::find_if(members_.begin(), members_.end(), [&](const auto& member) { return member.first == matchName; });
  return found == members_.end() ? nullptr : &found->second;
}

PropertyGroup PropertyGroup::Group(std::string_view matchName) const
{
  const Chunk* group = Find(matchName);
  return group && group->IsList("tdgp"_tag) ? PropertyGroup(*group) : PropertyGroup();
}

PropertyRecord ReadPropertyRecord(const Chunk& property) { return RecordReader(property).Read(); }

} // namespace host::projects
