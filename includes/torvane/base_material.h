// A material: the surface of an object.
#pragma once

#include "torvane/base_list.h"

namespace _torvane_
{

class BaseMaterial : public BaseList2D
{
 public:
  explicit BaseMaterial(Long type) : BaseList2D(type) {}
};

} // namespace _torvane_
