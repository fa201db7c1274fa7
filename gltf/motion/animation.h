// The one animation of a file: channels of nodes, and of values that are addressed by pointers.
#pragma once

#include <string>

#include "gltf/file/output.h"
#include "gltf/motion/sampling.h"

namespace gltf
{

// Adds a channel for "translation", "rotation" or "scale" of a node; nothing for no keys.
void AddNodeChannel(Output& output, std::size_t node, const char* path, const Samples& samples);

// Adds a channel for the value that a JSON pointer names; nothing for no keys. Without `allowed` it is told instead.
void AddPointerChannel(Output& output, const std::string& pointer, const Samples& samples, bool allowed);

} // namespace gltf
