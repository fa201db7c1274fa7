// Properties as a project has them: groups by match name, values and keyframes in stored units.
#pragma once

#include "host/reader/projects/chunk.h"

#include <array>
#include <string_view>

namespace host::projects
{

// What a group of properties holds. Of members with one match name the first counts.
class PropertyGroup
{
 public:
  PropertyGroup() = default;
  explicit PropertyGroup(const Chunk& group); // a list `tdgp`

  // The list that belongs to the name: a group, a property, an orientation. Null where there is none.
  const Chunk* Find(std::string_view matchName) const;
  // The group of that name; an empty one where there is none.
  PropertyGroup Group(std::string_view matchName) const;

 private:
  std::vector<std::pair<std::string_view, Chunk>> members_;
};

inline constexpr std::size_t kMaxComponents = 4;
using Components = std::array<double, kMaxComponents>;

// A keyframe as it is stored. Plain ones have an ease for each component; those with tangents have one, in place 0.
struct KeyRecord
{
  std::int32_t ticks = 0; // layer time
  std::uint8_t wayIn = 1;
  std::uint8_t wayOut = 1;
  bool isRoving = false;
  Components value{};
  Components speedIn{}, influenceIn{}, speedOut{}, influenceOut{};
  Components tangentIn{}, tangentOut{};
};

// How the values of a property are stored.
enum class ValueForm
{
  kNumbers,     // big-endian in `cdat` and in keyframes
  kOrientation, // little-endian in `cdat`, in a list of their own beside keyframes
};

struct PropertyRecord
{
  std::size_t components = 1;
  bool isSpatial = false; // moves along a path
  bool hasTangents = false;
  std::uint32_t ticksPerSecond = 1;
  std::uint32_t switches = 0; // tdsb
  Components value{};         // where there are no keyframes
  bool hasValue = false;
  std::vector<KeyRecord> keys; // in the order of time
  std::string expression;      // empty when it is off
};

// Reads a list `tdbs` or, for an orientation, `otst`. Values of which are no numbers refuse the file, and so does what
// is too short or goes back in time.
PropertyRecord ReadPropertyRecord(const Chunk& property);

} // namespace host::projects
