// The entries of a tag's container: values of old chunks.
#pragma once

#include "k2v_file/stream/chunk_visitor.h"

namespace _torvane_
{

// Reads values of a chunk into entries of a container. An entry whose value doesn't come stays as it is.
class EntryReader
{
 public:
  EntryReader(ChunkReader& reader, BaseContainer& data) : reader_(reader), data_(data) {}

  void Bool(_torvane_::Long id)
  {
    bool value = false;
    if (reader_.Bool(value))
      data_.SetBool(id, value);
  }
  void Long(_torvane_::Long id)
  {
    _torvane_::Long value = 0;
    if (reader_.Long(value))
      data_.SetLong(id, value);
  }
  void Real(_torvane_::Long id)
  {
    _torvane_::Real value = 0.0;
    if (reader_.Real(value))
      data_.SetReal(id, value);
  }
  // Values that no entry takes.
  template <class... T>
  void Skip()
  {
    static_cast<void>(reader_.template Skip<T...>());
  }

 private:
  ChunkReader& reader_;
  BaseContainer& data_;
};

} // namespace _torvane_
