#include "q7r_file/materials/material_defaults.h"

#include "torvane/links/alias.h"
#include "torvane/values/base_container.h"

namespace _torvane_
{

namespace
{

enum Kind : UChar
{
  kSwitch,
  kInteger,
  kNumber,
  kColor, // a Vector of three equal components
  kLink,  // the shader slot of a channel, empty
};

struct Default
{
  Long id;
  Kind kind;
  Real value;
};

// What every material has.
constexpr Default kBaseDefaults[] = {
    {500, kInteger, 0},    {501, kSwitch, 0},     {1100, kSwitch, 1},    {1101, kSwitch, 1},     {1102, kNumber, 1.0},
    {1103, kNumber, 0.65}, {1104, kInteger, 0},   {1105, kNumber, 1.0},  {1106, kSwitch, 0},     {1107, kSwitch, 0},
    {1108, kSwitch, 1},    {1109, kSwitch, 1},    {1110, kNumber, 10.0}, {1111, kNumber, 100.0}, {1112, kNumber, 1.0},
    {1113, kNumber, 1.0},  {1114, kNumber, 1.0},  {1115, kNumber, 1.0},  {1116, kNumber, 1.0},   {1117, kSwitch, 0},
    {1118, kInteger, 0},   {1119, kInteger, 128},
};

// What the standard material has besides its channels.
constexpr Default kMaterialDefaults[] = {
    {1000, kSwitch, 1},    {1001, kSwitch, 0},   {1002, kSwitch, 0},     {1003, kSwitch, 1},      {1004, kSwitch, 0},
    {1005, kNumber, 1.0},  {1006, kNumber, 1.0}, {1007, kNumber, 1.0},   {1008, kNumber, 1000.0}, {1009, kNumber, 0.2},
    {1010, kSwitch, 1},    {1011, kColor, 0.1},  {1012, kSwitch, 1},     {1013, kSwitch, 1},      {1014, kSwitch, 0},
    {1016, kNumber, 0.5},  {1017, kNumber, 0.2}, {1018, kInteger, 0},    {1019, kNumber, 1.0},    {1020, kNumber, 5.0},
    {1021, kNumber, 10.0}, {1022, kNumber, 0.0}, {1023, kNumber, 1.0},   {1024, kSwitch, 1},      {1025, kNumber, 1.0},
    {1026, kNumber, 5.0},  {1027, kSwitch, 0},   {1028, kSwitch, 1},     {1121, kNumber, 0.5},    {1122, kInteger, 5},
    {1123, kInteger, 128}, {1131, kNumber, 0.5}, {1132, kInteger, 5},    {1133, kInteger, 128},   {1134, kInteger, 0},
    {1135, kNumber, 0.5},  {1136, kNumber, 0.0}, {1137, kNumber, 0.0},   {1138, kNumber, 1.0},    {1139, kNumber, 0.0},
    {2050, kSwitch, 1},    {2051, kSwitch, 1},   {2052, kSwitch, 1},     {2053, kSwitch, 1},      {2055, kSwitch, 1},
    {2057, kSwitch, 1},    {2058, kSwitch, 1},   {2059, kSwitch, 1},     {2060, kSwitch, 1},      {2063, kSwitch, 1},
    {2404, kNumber, 1.0},  {2405, kColor, 1.0},  {2406, kNumber, 100.0}, {2407, kSwitch, 1},      {2408, kColor, 0.0},
    {2411, kSwitch, 0},    {2511, kSwitch, 0},   {3202, kSwitch, 0},     {3203, kInteger, 4},     {3205, kSwitch, 1},
    {3206, kSwitch, 1},    {3207, kSwitch, 0},   {3208, kSwitch, 0},     {3209, kSwitch, 1},      {3210, kInteger, 1},
    {3211, kSwitch, 1},    {3212, kSwitch, 0},   {3300, kNumber, 1.0},   {3302, kSwitch, 0},      {3303, kSwitch, 0},
    {3304, kSwitch, 0},    {3305, kInteger, 0},  {3306, kSwitch, 0},     {8000, kLink, 0},        {8001, kLink, 0},
    {8002, kLink, 0},      {8003, kLink, 0},     {8004, kLink, 0},       {8005, kLink, 0},        {8006, kLink, 0},
    {8007, kLink, 0},      {8008, kLink, 0},     {8009, kLink, 0},       {8012, kLink, 0},        {8020, kNumber, 0.0},
    {8021, kNumber, 0.0},  {8022, kSwitch, 0},
};

constexpr ChannelParameters kChannels[] = {
    {0, 2100, 0.8, 2101, 2102, 2103, 0}, {1, 2300, 1.0, 2301, 2302, 2303, 0}, {2, 2400, 1.0, 2401, 2402, 2403, 0},
    {3, 2500, 1.0, 2501, 2502, 2503, 0}, {4, 2600, 1.0, 2601, 2602, 2603, 3}, {5, 2700, 1.0, 2701, 0, 0, 0},
    {7, 2900, 1.0, 0, 0, 0, 0},          {9, 3100, 1.0, 3101, 3102, 3103, 0}, {10, 3200, 1.0, 3201, 0, 0, 0},
    {12, 0, 0.0, 2200, 2201, 2202, 0},
};

void AddDefault(BaseContainer& data, const Default& entry)
{
  switch (entry.kind) {
  case kSwitch:
  case kInteger:
    data.InsertData(entry.id, GeData(static_cast<Long>(entry.value)));
    break;
  case kNumber:
    data.InsertData(entry.id, GeData(entry.value));
    break;
  case kColor:
    data.InsertData(entry.id, GeData(Vector(entry.value, entry.value, entry.value)));
    break;
  case kLink:
    data.InsertData(entry.id, GeData(GeAliasLink()));
    break;
  }
}

// An id of 0 is a parameter that the channel lacks.
void AddIfPresent(BaseContainer& data, const Default& entry)
{
  if (entry.id != 0)
    AddDefault(data, entry);
}

} // namespace

const ChannelParameters* FindChannelParameters(Long channel)
{
  for (const ChannelParameters& row : kChannels) {
    if (row.channel == channel)
      return &row;
  }
  return nullptr;
}

void SetBaseMaterialDefaults(BaseContainer& data)
{
  for (const Default& entry : kBaseDefaults)
    AddDefault(data, entry);
}

void SetMaterialDefaults(BaseContainer& data)
{
  for (const ChannelParameters& row : kChannels) {
    AddIfPresent(data, {row.color, kColor, row.colorDefault});
    AddIfPresent(data, {row.brightness, kNumber, 1.0});
    AddIfPresent(data, {row.mix, kNumber, 1.0});
    AddIfPresent(data, {row.mode, kInteger, static_cast<Real>(row.modeDefault)});
  }
  for (const Default& entry : kMaterialDefaults)
    AddDefault(data, entry);
}

} // namespace _torvane_
