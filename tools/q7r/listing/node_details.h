// What particular classes of nodes add to a listing. One place for each family; arrays and selections have a file of
// their own.
#pragma once

#include <string>

#include "output/value_sink.h"
#include "torvane/document/base_document.h"
#include "torvane/views/base_draw.h"

namespace q7r
{

// A few words about a node, such as "8 points"; empty where there is nothing to tell.
std::string SummaryOf(_torvane_::BaseList2D& node);
std::string ObjectWords(_torvane_::BaseObject& object);
std::string MaterialWords(_torvane_::BaseList2D& material);
// A draw's own camera. One that has none yet stays without, as a file may hold many such: it has the camera of `plain`,
// a new draw.
_torvane_::BaseObject& EditorCameraOf(_torvane_::BaseDraw& draw, _torvane_::BaseDraw& plain);
std::string DrawWords(_torvane_::BaseDraw& draw);

// The parameters of an object's own data, by id ("params"); an empty object where there are none.
void TellObjectParams(ValueSink& sink, _torvane_::BaseObject& object);
// The knots of a light ("knots"), and the values that it keeps for other programs ("extra"), where it has any.
void TellLightLists(ValueSink& sink, _torvane_::BaseObject& object);
// The measured distribution of a light ("ies"); nothing without one.
void TellObjectIES(ValueSink& sink, _torvane_::BaseObject& object);

// What a node of an unknown type keeps ("raw"); nothing where it keeps nothing.
void TellRaw(ValueSink& sink, _torvane_::Long level, const void* data, _torvane_::LLong size);

// "name" in quotes.
std::string QuotedName(const _torvane_::BaseList2D& node);
// "  (1, 2, 3)" without the spaces.
std::string NumbersText(const double* numbers, double factor = 1.0);
std::string ColorText(const _torvane_::Vector& color);

} // namespace q7r
