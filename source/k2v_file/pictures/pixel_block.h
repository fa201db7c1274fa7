// The pixel block of paint textures: a rectangle, then row by row each component as a plane of its own, plain or
// packed.
#pragma once

#include "k2v_file/pictures/run_coding.h"
#include "k2v_file/stream/chunk_visitor.h"

namespace _torvane_
{

struct PixelBlock
{
  Long x = 0;
  Long y = 0;
  Long width = 0;
  Long height = 0;
  Long components = 0;

  // The rectangle, and then the components.
  template <class Visitor>
  Bool VisitRectangle(Visitor& v)
  {
    v.Long(x);
    v.Long(y);
    v.Long(width);
    v.Long(height);
    return v.Good();
  }
};

// How a plane stands in the file.
enum PlaneForm : UChar
{
  kPlanePlain = 0,
  kPlanePacked = 1,
};

// Memory for one row and, for writing, one of its planes and that plane packed.
class PlaneBuffers
{
 public:
  PlaneBuffers(Long width, Long components, Bool toWrite)
      : width_(width),
        rowSize_(LLong{width} * components),
        memory_(static_cast<UChar*>(GeAlloc(rowSize_ + (toWrite ? 3 * LLong{width} : 0))))
  {}
  ~PlaneBuffers() { GeFree(memory_); }
  PlaneBuffers(const PlaneBuffers&) = delete;
  PlaneBuffers& operator=(const PlaneBuffers&) = delete;

  Bool IsComplete() const { return memory_ != nullptr; }
  UChar* Row() { return memory_; }
  UChar* Plane() { return memory_ + rowSize_; }
  UChar* Packed() { return Plane() + width_; }
  LLong PackedLimit() const { return 2 * LLong{width_}; }

 private:
  LLong width_;
  LLong rowSize_;
  UChar* memory_;
};

// Writes the plane of one component of the row that the buffers hold.
Bool WritePlane(HyperFile& file, PlaneBuffers& buffers, Long width, Long component, Long components);

// Reads one plane into the row. A damaged plane becomes zeros; one of an unknown form leaves the row as it is.
Bool ReadPlane(HyperFile& file, PlaneBuffers& buffers, Long width, Long component, Long components);

// Writes a block at (0, 0), whose rows `getRow` fetches (file row, buffer). False when it could not be written in
// full: with a depth that is neither grey nor colour it stops in front of the components.
template <class GetRow>
Bool WritePixelBlock(HyperFile& file, Long width, Long height, Long depth, GetRow&& getRow)
{
  PixelBlock block{0, 0, width, height, depth == 2 ? 1 : 3};
  ChunkWriter writer(file, 0);
  block.VisitRectangle(writer);
  if ((depth != 2 && depth != 4) || !writer.Long(block.components))
    return false;
  if (width < 1 || height < 1)
    return true;
  PlaneBuffers buffers(width, block.components, true);
  if (!buffers.IsComplete()) {
    file.SetError(FILEERROR_MEMORY);
    return false;
  }
  for (Long y = 0; y < height; ++y) {
    getRow(y, buffers.Row());
    for (Long component = 0; component < block.components; ++component) {
      if (!WritePlane(file, buffers, width, component, block.components))
        return false;
    }
  }
  return true;
}

} // namespace _torvane_
