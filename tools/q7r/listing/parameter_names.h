// What parameters are called, what their numbers stand for, and between which bounds they mean something: one table
// for all that lists, compares and checks them. A parameter whose meaning nobody told isn't there.
#pragma once

#include <cstddef>
#include <limits>

#include "output/value_sink.h"
#include "torvane/nodes/base_list.h"
#include "torvane/values/ge_data.h"

namespace q7r
{

// What a number stands for. The last of a list has no words.
struct NumberWords
{
  _torvane_::Long number;
  const char* words;
};

struct ParameterRow
{
  _torvane_::Long id;
  const char* name;
  double least = -std::numeric_limits<double>::infinity(); // of a number, or of each part of a Vector
  double most = std::numeric_limits<double>::infinity();
  const NumberWords* words = nullptr;
};

struct ParameterRows
{
  const ParameterRow* rows = nullptr;
  std::size_t count = 0;

  const ParameterRow* begin() const { return rows; }
  const ParameterRow* end() const { return rows + count; }
};

// The parameters with a name that nodes of this one's type have.
ParameterRows NamedParametersOf(const _torvane_::BaseList2D& node);
// One of them by its id, or null.
const ParameterRow* FindParameter(const _torvane_::BaseList2D& node, _torvane_::Long id);

// What a number stands for; null for a number that nobody named.
const char* WordsOf(const ParameterRow& row, _torvane_::Long number);
const char* ProjectionWords(_torvane_::Long projection);
const char* LightTypeWords(_torvane_::Long type);
const char* IESShapeWords(_torvane_::Long shape);

// The value of a parameter of a node; false for one that the node doesn't hold.
bool GetHeldParameter(_torvane_::BaseList2D& node, _torvane_::Long id, _torvane_::GeData& value);

// "named": {"focalLength": 35.0, "projection": 0, "projectionWords": "perspective"}; nothing for a node without names.
void TellNamed(ValueSink& sink, _torvane_::BaseList2D& node);

} // namespace q7r
