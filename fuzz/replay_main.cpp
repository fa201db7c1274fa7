// Runs a fuzz target over files and folders of files, without a fuzzer: what it ever stumbled over stays mended.
#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>
#include <vector>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size);

namespace
{

std::vector<std::filesystem::path> FilesBelow(int count, char** names)
{
  std::vector<std::filesystem::path> files;
  for (int i = 0; i < count; ++i) {
    if (!std::filesystem::is_directory(names[i])) {
      files.emplace_back(names[i]);
      continue;
    }
    for (const auto& entry : std::filesystem::recursive_directory_iterator(names[i])) {
      if (entry.is_regular_file())
        files.push_back(entry.path());
    }
  }
  std::sort(files.begin(), files.end());
  return files;
}

} // namespace

int main(int argc, char** argv)
{
  const auto files = FilesBelow(argc - 1, argv + 1);
  for (const auto& file : files) {
    std::printf("%s\n", file.string().c_str()); // the last one told is the one that broke
    std::fflush(stdout);
    std::ifstream in(file, std::ios::binary);
    const std::vector<char> text{std::istreambuf_iterator<char>(in), {}};
    // In a block of exactly its size, so that the address sanitizer sees a read beyond it.
    const std::vector<std::uint8_t> bytes(text.begin(), text.end());
    LLVMFuzzerTestOneInput(bytes.data(), bytes.size());
  }
  return files.empty() ? 1 : 0;
}
