// Small scene files that have everything in them, for fuzzing to begin with.
#pragma once

#include <cstdint>
#include <string>
#include <vector>

struct CorpusFile
{
  std::string name;
  std::vector<std::uint8_t> bytes;
};

// A file for each sample of a record, with the record where it belongs; one for each place in which something unknown
// can stand; and a document with something of everything.
std::vector<CorpusFile> SceneCorpus();
