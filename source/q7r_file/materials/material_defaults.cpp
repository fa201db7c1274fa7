#include "q7r_file/materials/material_defaults.h"

#include "k2v_file/values/container_defaults.h"
#include "torvane/materials/material.h"

namespace _torvane_
{

namespace
{

// What every material has.
constexpr ContainerDefault kBaseDefaults[] = {
    {500, DefaultForm::kLong, 0},     {501, DefaultForm::kBool, 0},      {1100, DefaultForm::kBool, 1},
    {1101, DefaultForm::kBool, 1},    {1102, DefaultForm::kReal, 1.0},   {1103, DefaultForm::kReal, 0.65},
    {1104, DefaultForm::kLong, 0},    {1105, DefaultForm::kReal, 1.0},   {1106, DefaultForm::kBool, 0},
    {1107, DefaultForm::kBool, 0},    {1108, DefaultForm::kBool, 1},     {1109, DefaultForm::kBool, 1},
    {1110, DefaultForm::kReal, 10.0}, {1111, DefaultForm::kReal, 100.0}, {1112, DefaultForm::kReal, 1.0},
    {1113, DefaultForm::kReal, 1.0},  {1114, DefaultForm::kReal, 1.0},   {1115, DefaultForm::kReal, 1.0},
    {1116, DefaultForm::kReal, 1.0},  {1117, DefaultForm::kBool, 0},     {1118, DefaultForm::kLong, 0},
    {1119, DefaultForm::kLong, 128},
};

// What the standard material has besides its channels.
constexpr ContainerDefault kMaterialDefaults[] = {
    {1000, DefaultForm::kBool, 1},   {1001, DefaultForm::kBool, 0},     {1002, DefaultForm::kBool, 0},
    {1003, DefaultForm::kBool, 1},   {1004, DefaultForm::kBool, 0},     {1005, DefaultForm::kReal, 1.0},
    {1006, DefaultForm::kReal, 1.0}, {1007, DefaultForm::kReal, 1.0},   {1008, DefaultForm::kReal, 1000.0},
    {1009, DefaultForm::kReal, 0.2}, {1010, DefaultForm::kBool, 1},     {1011, DefaultForm::kGrey, 0.1},
    {1012, DefaultForm::kBool, 1},   {1013, DefaultForm::kBool, 1},     {1014, DefaultForm::kBool, 0},
    {1016, DefaultForm::kReal, 0.5}, {1017, DefaultForm::kReal, 0.2},   {1018, DefaultForm::kLong, 0},
    {1019, DefaultForm::kReal, 1.0}, {1020, DefaultForm::kReal, 5.0},   {1021, DefaultForm::kReal, 10.0},
    {1022, DefaultForm::kReal, 0.0}, {1023, DefaultForm::kReal, 1.0},   {1024, DefaultForm::kBool, 1},
    {1025, DefaultForm::kReal, 1.0}, {1026, DefaultForm::kReal, 5.0},   {1027, DefaultForm::kBool, 0},
    {1028, DefaultForm::kBool, 1},   {1121, DefaultForm::kReal, 0.5},   {1122, DefaultForm::kLong, 5},
    {1123, DefaultForm::kLong, 128}, {1131, DefaultForm::kReal, 0.5},   {1132, DefaultForm::kLong, 5},
    {1133, DefaultForm::kLong, 128}, {1134, DefaultForm::kLong, 0},     {1135, DefaultForm::kReal, 0.5},
    {1136, DefaultForm::kReal, 0.0}, {1137, DefaultForm::kReal, 0.0},   {1138, DefaultForm::kReal, 1.0},
    {1139, DefaultForm::kReal, 0.0}, {2050, DefaultForm::kBool, 1},     {2051, DefaultForm::kBool, 1},
    {2052, DefaultForm::kBool, 1},   {2053, DefaultForm::kBool, 1},     {2055, DefaultForm::kBool, 1},
    {2057, DefaultForm::kBool, 1},   {2058, DefaultForm::kBool, 1},     {2059, DefaultForm::kBool, 1},
    {2060, DefaultForm::kBool, 1},   {2063, DefaultForm::kBool, 1},     {2404, DefaultForm::kReal, 1.0},
    {2405, DefaultForm::kGrey, 1.0}, {2406, DefaultForm::kReal, 100.0}, {2407, DefaultForm::kBool, 1},
    {2408, DefaultForm::kGrey, 0.0}, {2411, DefaultForm::kBool, 0},     {2511, DefaultForm::kBool, 0},
    {3202, DefaultForm::kBool, 0},   {3203, DefaultForm::kLong, 4},     {3205, DefaultForm::kBool, 1},
    {3206, DefaultForm::kBool, 1},   {3207, DefaultForm::kBool, 0},     {3208, DefaultForm::kBool, 0},
    {3209, DefaultForm::kBool, 1},   {3210, DefaultForm::kLong, 1},     {3211, DefaultForm::kBool, 1},
    {3212, DefaultForm::kBool, 0},   {3300, DefaultForm::kReal, 1.0},   {3302, DefaultForm::kBool, 0},
    {3303, DefaultForm::kBool, 0},   {3304, DefaultForm::kBool, 0},     {3305, DefaultForm::kLong, 0},
    {3306, DefaultForm::kBool, 0},   {8000, DefaultForm::kLink},        {8001, DefaultForm::kLink},
    {8002, DefaultForm::kLink},      {8003, DefaultForm::kLink},        {8004, DefaultForm::kLink},
    {8005, DefaultForm::kLink},      {8006, DefaultForm::kLink},        {8007, DefaultForm::kLink},
    {8008, DefaultForm::kLink},      {8009, DefaultForm::kLink},        {8012, DefaultForm::kLink},
    {8020, DefaultForm::kReal, 0.0}, {8021, DefaultForm::kReal, 0.0},   {8022, DefaultForm::kBool, 0},
};

constexpr ChannelParameters kChannels[] = {
    {0, kMaterialColor, 0.8, kMaterialColorBrightness, kMaterialColorMix, kMaterialColorMixMode, 0},
    {1, 2300, 1.0, 2301, 2302, 2303, 0},
    {2, 2400, 1.0, 2401, 2402, 2403, 0},
    {3, 2500, 1.0, 2501, 2502, 2503, 0},
    {4, 2600, 1.0, 2601, 2602, 2603, 3},
    {5, 2700, 1.0, 2701, 0, 0, 0},
    {7, 2900, 1.0, 0, 0, 0, 0},
    {9, 3100, 1.0, 3101, 3102, 3103, 0},
    {10, 3200, 1.0, 3201, 0, 0, 0},
    {12, 0, 0.0, 2200, 2201, 2202, 0},
};

// The parameters of a channel, up to those that it lacks.
constexpr Long kParametersOfChannel = 4;

constexpr ContainerDefault ChannelDefault(const ChannelParameters& row, Long index)
{
  switch (index) {
  case 0:
    return {row.color, DefaultForm::kGrey, row.colorDefault};
  case 1:
    return {row.brightness, DefaultForm::kReal, 1.0};
  case 2:
    return {row.mix, DefaultForm::kReal, 1.0};
  default:
    return {row.mode, DefaultForm::kLong, static_cast<Real>(row.modeDefault)};
  }
}

constexpr std::size_t CountChannelDefaults()
{
  std::size_t count = 0;
  for (const ChannelParameters& row : kChannels) {
    for (Long i = 0; i < kParametersOfChannel; ++i)
      count += ChannelDefault(row, i).id != 0 ? 1 : 0;
  }
  return count;
}

// All that the standard material has: what every material has, its channels, and the rest.
struct StandardDefaults
{
  ContainerDefault rows[std::size(kBaseDefaults) + CountChannelDefaults() + std::size(kMaterialDefaults)] = {};

  constexpr StandardDefaults()
  {
    ContainerDefault* next = rows;
    for (const ContainerDefault& row : kBaseDefaults)
      *next++ = row;
    for (const ChannelParameters& channel : kChannels) {
      for (Long i = 0; i < kParametersOfChannel; ++i) {
        *next = ChannelDefault(channel, i);
        next += next->id != 0 ? 1 : 0;
      }
    }
    for (const ContainerDefault& row : kMaterialDefaults)
      *next++ = row;
  }
  static constexpr std::size_t size() { return std::size(StandardDefaults().rows); }
  constexpr const ContainerDefault* data() const { return rows; }
};

constexpr StandardDefaults kStandardDefaults;

} // namespace

const ChannelParameters* FindChannelParameters(Long channel)
{
  for (const ChannelParameters& row : kChannels) {
    if (row.channel == channel)
      return &row;
  }
  return nullptr;
}

void SetBaseMaterialDefaults(BaseContainer& data) { data.SetDefaults(DefaultsOf<kBaseDefaults>()); }

void SetMaterialDefaults(BaseContainer& data)
{
  data.Flush();
  data.SetDefaults(DefaultsOf<kStandardDefaults>());
}

} // namespace _torvane_
