// A shader: a node that works out colours for a material.
#pragma once

#include "torvane/base_list.h"

namespace _torvane_
{

class BaseShader : public BaseList4D
{
 public:
  explicit BaseShader(Long type = kShaderLabel) : BaseList4D(type) {}
};

} // namespace _torvane_
