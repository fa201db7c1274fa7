// One sample of every record of a scene file, at every level and with every bound of a version, as text: the table is
// records.txt.
//
// A text holds the values of a chunk in file order. A letter tells the kind, behind it stands the value:
//   L Long  U ULong  C UChar  B Bool  R Real  T Time in whole seconds
//   V Vector n, n + 0.5, n - 0.25, and with = behind it n, n, n, or as told  Y Matrix n, n + 1, ... n + 11, or as told
//   S String  F Filename  M Memory in hexadecimal digits  k a link, empty or on the goal of that number
//   K7 a container with the Long 7 under 7; K without entries
//   A3:5,6 an Array of type 3 with these elements  X0102 bytes as they stand
//   [id,level and ] chunk start and end  3( ... ) three times
//   $Node and its like: what records.txt says of the word
// Behind the letter, = marks a value that isn't kept, # a count; behind the value stands @ and the number of the
// parameter, or % and that of the entry, that it is.
#pragma once

#include <functional>
#include <string>
#include <vector>

#include "support/byte_writer.h"
#include "torvane/nodes/private_chunk.h"

struct RecordSample
{
  std::string name;
  std::function<_torvane_::GeListNode*()> make; // a new node that takes the chunk
  _torvane_::Long chunk;
  _torvane_::Long level;
  std::string body;
  std::string now = "same"; // what is written then, at the level that is current; "-" where the sample doesn't tell
  _torvane_::Long nowLevel = -1;
  _torvane_::Long version = 13000;
  bool copied = true; // a copy holds the chunk too
};

struct RecordValue
{
  char kind;
  char mark; // '=', '#' or ' '
  std::string text;
  char origin; // '@', '%' or ' '
  _torvane_::Long id;
};

const std::vector<RecordSample>& RecordSamples();
const RecordSample& FindRecordSample(const std::string& name);

// The text with what the words of the table that begin with $ stand for.
std::string ExpandRecord(const std::string& body);
std::vector<RecordValue> ParseRecord(const std::string& body);
std::vector<std::uint8_t> RecordBytes(const std::vector<RecordValue>& values, _torvane_::Long version = 13000);
std::vector<std::uint8_t> Record(const std::string& body, _torvane_::Long version = 13000);
// The value with another content of its kind; false for a kind that has none.
bool ChangeValue(RecordValue& value);

// Markers are drawn anew for each node: all become zeros.
std::vector<std::uint8_t> WithoutMarkers(std::vector<std::uint8_t> bytes);
