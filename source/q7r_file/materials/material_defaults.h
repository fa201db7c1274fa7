// The parameters that a new material has.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

class BaseContainer;

// The parameters of one channel; 0 for one that the channel lacks.
struct ChannelParameters
{
  Long channel;
  Long color;
  Real colorDefault;
  Long brightness; // 1.0
  Long mix;        // 1.0
  Long mode;
  Long modeDefault;
};

// Null for a channel without parameters and for a number that no channel has.
const ChannelParameters* FindChannelParameters(Long channel);

// The entries of every material, and of the standard material, in place of what a container has.
void SetBaseMaterialDefaults(BaseContainer& data);
void SetMaterialDefaults(BaseContainer& data);

} // namespace _torvane_
