// A small checker of .glb files: whether what one says of itself holds. It knows what this converter writes, not all of
// glTF.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

namespace gltf
{

// Empty for a good file, else what is wrong and where.
std::string CheckGlb(const std::vector<std::uint8_t>& file);

} // namespace gltf
