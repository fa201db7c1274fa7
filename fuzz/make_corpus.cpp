// Writes the scene files that fuzzing begins with: `make_corpus FOLDER`.
#include <cstdio>
#include <filesystem>
#include <fstream>

#include "support/scene_corpus.h"
#include "torvane/memory/assertion.h"

int main(int argc, char** argv)
{
  if (argc != 2)
    return 2;
  _torvane_::SetAssertionLog(nullptr);
  std::error_code error;
  std::filesystem::create_directories(argv[1], error);
  for (const CorpusFile& made : SceneCorpus()) {
    std::ofstream file(std::filesystem::path(argv[1]) / made.name, std::ios::binary);
    file.write(reinterpret_cast<const char*>(made.bytes.data()), static_cast<std::streamsize>(made.bytes.size()));
    if (!file.flush()) {
      std::fprintf(stderr, "%s: can't be written\n", made.name.c_str());
      return 1;
    }
  }
  return 0;
}
