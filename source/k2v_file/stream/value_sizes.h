// The bytes that stand behind each tag below 128.
#pragma once

#include "torvane/stream/hyper_file.h"

namespace _torvane_
{

struct BodySize
{
  UChar tag;
  UChar wide;   // Reals in 8 bytes
  UChar narrow; // Reals in 4 bytes
};

inline constexpr BodySize kBodySizes[] = {
    {kTagChunkStart, 8, 8}, {kTagChunkEnd, 0, 0}, {kTagChar, 1, 1},      {kTagUChar, 1, 1},     {kTagWord, 2, 2},
    {kTagUWord, 2, 2},      {kTagLong, 4, 4},     {kTagULong, 4, 4},     {kTagLLong, 8, 8},     {kTagULLong, 8, 8},
    {kTagReal, 8, 4},       {kTagLReal, 8, 8},    {kTagBool, 1, 1},      {kTagTime, 16, 8},     {kTagVector, 24, 12},
    {kTagLVector, 24, 24},  {kTagMatrix, 96, 48}, {kTagLMatrix, 96, 96}, {kTagSVector, 12, 12}, {kTagSMatrix, 48, 48},
    {kTagSReal, 4, 4},
};

inline constexpr UChar kNoValue = 255; // the size of a tag that doesn't exist

// The sizes by tag, for both precisions.
struct BodySizeTable
{
  UChar size[2][128];

  constexpr BodySizeTable() : size()
  {
    for (auto& column : size) {
      for (UChar& entry : column)
        entry = kNoValue;
    }
    for (const BodySize& body : kBodySizes) {
      size[0][body.tag] = body.wide;
      size[1][body.tag] = body.narrow;
    }
  }
};

inline constexpr BodySizeTable kBodySizeTable;

} // namespace _torvane_
