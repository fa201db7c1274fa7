// A composition, a host that plays it, and its suites at hand.
#pragma once

#include "host/standalone_host.h"

#include <gtest/gtest.h>

#include <cstring>
#include <string>
#include <tuple>
#include <type_traits>
#include <utility>

namespace stage
{

inline const std::filesystem::path kFolder = std::filesystem::temp_directory_path() / "project";

// A composition of 100 x 80 at 25 frames a second, frames 0 to 50, with these layers and other members.
inline std::string Text(const std::string& layers, const std::string& more = "")
{
  return R"({"w": 100, "h": 80, "fr": 25, "ip": 0, "op": 50, "layers": [)" + layers + "]" +
         (more.empty() ? "" : ", " + more) + "}";
}

inline host::Project Load(const std::string& layers, const std::string& more = "")
{
  return host::LoadCompositionText(Text(layers, more), "orbit.json", kFolder);
}

// A suite of the host that is current; null when it is refused.
template <class Suite>
const Suite* Acquire(host::StandaloneHost& host, const char* name, std::int32_t version)
{
  const void* table = nullptr;
  host.Basic()->AcquireSuite(name, version, &table);
  return static_cast<const Suite*>(table);
}

// What a question answers in its last argument.
template <class... Parameters, class... Arguments>
auto Answer(A_Err (*ask)(Parameters...), Arguments... arguments)
{
  std::remove_pointer_t<std::tuple_element_t<sizeof...(Parameters) - 1, std::tuple<Parameters...>>> answer;
  // NOLINTNEXTLINE(bugprone-sizeof-expression): the answer's own bytes, be it a pointer or not
  std::memset(&answer, 0x5A, sizeof answer);
  EXPECT_EQ(0, ask(arguments..., &answer));
  return answer;
}

inline std::pair<A_long, A_u_long> Fraction(A_Time time) { return {time.value, time.scale}; }

inline void ExpectNear(const host::Value& expected, const host::Value& actual, double tolerance = 1e-9)
{
  for (std::size_t c = 0; c < 3; ++c)
    EXPECT_NEAR(expected[c], actual[c], tolerance) << "component " << c;
}

struct Stage
{
  explicit Stage(const std::string& layerList, const std::string& more = "") : host(Load(layerList, more)) {}
  explicit Stage(host::Project project) : host(std::move(project)) {}

  host::StandaloneHost host;
  const AEGP_CommandSuite1* commands = Acquire<AEGP_CommandSuite1>(host, "AEGP Command Suite", 1);
  const AEGP_RegisterSuite6* hooks = Acquire<AEGP_RegisterSuite6>(host, "AEGP Register Suite", 6);
  const AEGP_UtilitySuite11* utility = Acquire<AEGP_UtilitySuite11>(host, "AEGP Utility Suite", 11);
  const AEGP_MemorySuite1* memory = Acquire<AEGP_MemorySuite1>(host, "AEGP Memory Suite", 1);
  const AEGP_ItemSuite13* items = Acquire<AEGP_ItemSuite13>(host, "AEGP Item Suite", 13);
  const AEGP_CompSuite15* comps = Acquire<AEGP_CompSuite15>(host, "AEGP Comp Suite", 15);
  const AEGP_LayerSuite13* layers = Acquire<AEGP_LayerSuite13>(host, "AEGP Layer Suite", 13);
  const AEGP_StreamSuite9* streams = Acquire<AEGP_StreamSuite9>(host, "AEGP Stream Suite", 9);
  const AEGP_KeyframeSuite4* keyframes = Acquire<AEGP_KeyframeSuite4>(host, "AEGP Keyframe Suite", 4);
  const AEGP_FootageSuite11* footage = Acquire<AEGP_FootageSuite11>(host, "AEGP Footage Suite", 11);
  const AEGP_CameraSuite2* cameras = Acquire<AEGP_CameraSuite2>(host, "AEGP Camera Suite", 2);
  const AEGP_LightSuite2* lights = Acquire<AEGP_LightSuite2>(host, "AEGP Light Suite", 2);

  AEGP_ItemH ActiveItem() const { return Answer(items->AEGP_GetActiveItem); }
  AEGP_CompH ActiveComp() const { return Answer(comps->AEGP_GetCompFromItem, ActiveItem()); }
  AEGP_LayerH Layer(A_long index) const { return Answer(layers->AEGP_GetCompLayerByIndex, ActiveComp(), index); }
  AEGP_ItemH Source(A_long index) const { return Answer(layers->AEGP_GetLayerSourceItem, Layer(index)); }

  AEGP_StreamRefH Stream(A_long index, AEGP_LayerStream which) const
  {
    AEGP_StreamRefH stream = nullptr;
    streams->AEGP_GetNewLayerStream(0, Layer(index), which, &stream);
    return stream;
  }

  // The text in a handle of UTF-16 (char16_t) or UTF-8 (char), which is given back.
  template <class Char>
  std::basic_string<Char> TakeText(AEGP_MemHandle handle) const
  {
    const void* data = Answer(memory->AEGP_LockMemHandle, handle);
    std::basic_string<Char> text = data ? static_cast<const Char*>(data) : std::basic_string<Char>();
    EXPECT_EQ(0, memory->AEGP_UnlockMemHandle(handle));
    EXPECT_EQ(0, memory->AEGP_FreeMemHandle(handle));
    return text;
  }

  std::u16string ItemName(AEGP_ItemH item) const
  {
    return TakeText<char16_t>(Answer(items->AEGP_GetItemName, 0, item));
  }

  // The three components of a stream's value, those that it doesn't have 0.
  host::Value ValueAt(A_long index, AEGP_LayerStream which, A_Time time, A_Boolean preExpression = 0) const
  {
    const AEGP_StreamRefH stream = Stream(index, which);
    AEGP_StreamValue2 value{};
    EXPECT_EQ(0, streams->AEGP_GetNewStreamValue(0, stream, AEGP_LTimeMode_CompTime, &time, preExpression, &value));
    const AEGP_StreamType type = Answer(streams->AEGP_GetStreamType, stream);
    host::Value result{value.val.three_d.x, value.val.three_d.y, value.val.three_d.z};
    if (type == AEGP_StreamType_OneD)
      result = {value.val.one_d};
    if (type == AEGP_StreamType_COLOR)
      result = {value.val.color.redF, value.val.color.greenF, value.val.color.blueF};
    EXPECT_EQ(0, streams->AEGP_DisposeStreamValue(&value));
    EXPECT_EQ(0, streams->AEGP_DisposeStream(stream));
    return result;
  }
};

} // namespace stage
