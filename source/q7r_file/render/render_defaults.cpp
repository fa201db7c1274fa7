#include "q7r_file/render/render_defaults.h"

#include "torvane/math/ge_math.h"

namespace _torvane_
{

namespace
{

enum class Form
{
  kBool,
  kLong,
  kReal,
  kTime,
  kVector,
  kFilename,
  kContainer, // an empty one
  kFlags,     // a container that holds the number under 10024
};

struct Default
{
  Long id;
  Form form;
  Real number;
  Vector vector;
};

constexpr Default kRenderDefaults[] = {
    {6014, Form::kBool, 1, {}},
    {5008, Form::kReal, 800.0, {}},
    {5009, Form::kReal, 600.0, {}},
    {6004, Form::kReal, 72.0, {}},
    {6006, Form::kReal, 1.3333333333333333, {}},
    {6002, Form::kBool, 0, {}},
    {6008, Form::kReal, 1.0, {}},
    {5001, Form::kLong, 3, {}},
    {5300, Form::kLong, 0, {}},
    {5002, Form::kLong, 1, {}},
    {6016, Form::kBool, 1, {}},
    {6017, Form::kBool, 1, {}},
    {6018, Form::kBool, 1, {}},
    {6019, Form::kBool, 1, {}},
    {6020, Form::kBool, 0, {}},
    {6021, Form::kBool, 0, {}},
    {5007, Form::kLong, 2, {}},
    {5010, Form::kLong, 0, {}},
    {5011, Form::kReal, 320.0, {}},
    {5012, Form::kReal, 240.0, {}},
    {5013, Form::kReal, 1.0, {}},
    {5014, Form::kReal, 1.0, {}},
    {5016, Form::kLong, 1, {}},
    {5017, Form::kTime, 0, {}},
    {5018, Form::kTime, 0, {}},
    {5019, Form::kLong, 0, {}},
    {5020, Form::kReal, 30.0, {}},
    {5021, Form::kBool, 0, {}},
    {5022, Form::kBool, 1, {}},
    {5024, Form::kBool, 1, {}},
    {5025, Form::kLong, 15, {}},
    {5026, Form::kLong, 15, {}},
    {5027, Form::kReal, 0.001, {}},
    {5028, Form::kReal, 0.5, {}},
    {28508, Form::kReal, 2.0, {}},
    {28509, Form::kReal, 2.0, {}},
    {28510, Form::kBool, 0, {}},
    {5029, Form::kVector, 0, {0, 0, 0}},
    {5059, Form::kVector, 0, {1, 1, 1}},
    {5060, Form::kBool, 0, {}},
    {5061, Form::kReal, 1.0, {}},
    {5062, Form::kReal, 0.0, {}},
    {5063, Form::kLong, 5, {}},
    {5030, Form::kBool, 1, {}},
    {5064, Form::kBool, 1, {}},
    {5032, Form::kBool, 1, {}},
    {5033, Form::kLong, 1100, {}},
    {5035, Form::kLong, 0, {}},
    {5076, Form::kBool, 1, {}},
    {5077, Form::kLong, 0, {}},
    {5036, Form::kBool, 0, {}},
    {5038, Form::kBool, 0, {}},
    {5039, Form::kBool, 0, {}},
    {5040, Form::kLong, 0, {}},
    {5065, Form::kLong, 320, {}},
    {5066, Form::kLong, 240, {}},
    {5041, Form::kFilename, 0, {}},
    {5042, Form::kFilename, 0, {}},
    {5043, Form::kLong, 36, {}},
    {5044, Form::kReal, 0.0, {}},
    {5045, Form::kReal, DegreesToRadians(360.0), {}},
    {5046, Form::kLong, 19, {}},
    {5047, Form::kReal, DegreesToRadians(90.0), {}},
    {5048, Form::kReal, DegreesToRadians(-90.0), {}},
    {5050, Form::kBool, 1, {}},
    {5051, Form::kBool, 1, {}},
    {5052, Form::kBool, 1, {}},
    {5079, Form::kBool, 0, {}},
    {5080, Form::kBool, 0, {}},
    {5053, Form::kLong, 0, {}},
    {5056, Form::kReal, 1.0, {}},
    {10022, Form::kLong, 72, {}},
    {5069, Form::kBool, 1, {}},
    {5071, Form::kReal, 0.1, {}},
    {5078, Form::kReal, 0.5, {}},
    {5070, Form::kLong, 0, {}},
    {5072, Form::kLong, 0, {}},
    {5073, Form::kLong, 2, {}},
    {5074, Form::kBool, 1, {}},
    {5082, Form::kBool, 0, {}},
    {5075, Form::kBool, 1, {}},
    {5200, Form::kBool, 1, {}},
    {5201, Form::kBool, 1, {}},
    {5606, Form::kBool, 0, {}},
    {5211, Form::kBool, 0, {}},
    {5212, Form::kBool, 0, {}},
    {5202, Form::kBool, 0, {}},
    {5203, Form::kLong, 1106, {}},
    {5205, Form::kLong, 0, {}},
    {5206, Form::kFilename, 0, {}},
    {5207, Form::kLong, 1, {}},
    {5208, Form::kLong, 2, {}},
    {5210, Form::kLong, 1, {}},
    {5401, Form::kBool, 1, {}},
    {5301, Form::kBool, 0, {}},
    {5603, Form::kReal, 1.0, {}},
    {5604, Form::kBool, 1, {}},
    {5502, Form::kReal, 128.0, {}},
    {6013, Form::kBool, 1, {}},
    {6012, Form::kBool, 1, {}},
    {7002, Form::kBool, 1, {}},
    {7000, Form::kLong, 64, {}},
    {7001, Form::kLong, 64, {}},
    {7003, Form::kLong, 0, {}},
    {7004, Form::kBool, 0, {}},
    {7005, Form::kLong, 0, {}},
    {7006, Form::kLong, 0, {}},
    {7007, Form::kLong, 0, {}},
    {7008, Form::kLong, 0, {}},
    {6003, Form::kLong, 0, {}},
    {6005, Form::kLong, 1, {}},
    {5204, Form::kContainer, 0, {}},
    {5702, Form::kFlags, 1 | 32 | 64 | 256, {}},
    {8000, Form::kBool, 0, {}},
    {8018, Form::kBool, 0, {}},
    {8001, Form::kLong, 2, {}},
    {8023, Form::kLong, 1, {}},
    {8002, Form::kLong, 0, {}},
    {8003, Form::kLong, 0, {}},
    {8004, Form::kLong, 2, {}},
    {8007, Form::kLong, 0, {}},
    {8005, Form::kLong, 4, {}},
    {8006, Form::kLong, 0, {}},
    {8013, Form::kBool, 0, {}},
    {8014, Form::kVector, 0, {1, 0, 0}},
    {8015, Form::kVector, 0, {0, 1, 0}},
    {8009, Form::kBool, 0, {}},
    {8011, Form::kBool, 0, {}},
    {8010, Form::kBool, 0, {}},
    {8012, Form::kBool, 0, {}},
    {8017, Form::kLong, 0, {}},
    {8021, Form::kLong, 1, {}},
    {8022, Form::kLong, 0, {}},
};

GeData ValueOf(const Default& row)
{
  switch (row.form) {
  case Form::kBool:
    return GeData(row.number != 0.0);
  case Form::kLong:
    return GeData(static_cast<Long>(row.number));
  case Form::kReal:
    return GeData(row.number);
  case Form::kTime:
    return GeData(BaseTime());
  case Form::kVector:
    return GeData(row.vector);
  case Form::kFilename:
    return GeData(Filename());
  case Form::kContainer:
    return GeData(BaseContainer());
  case Form::kFlags:
    break;
  }
  BaseContainer flags;
  flags.SetLong(10024, static_cast<Long>(row.number));
  return GeData(flags);
}

} // namespace

void SetRenderDefaults(BaseContainer& container)
{
  for (const Default& row : kRenderDefaults)
    container.InsertData(row.id, ValueOf(row));
}

} // namespace _torvane_
