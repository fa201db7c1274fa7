// Exports side by side: each thread has a host and a document of its own.
#include <fstream>
#include <sstream>
#include <thread>

#include <gtest/gtest.h>

#include "exporter/host_api/aegp_entry.h"
#include "exporter/walk/composition.h"
#include "host/standalone_host.h"
#include "support/full_scene.h"

namespace
{

using namespace _torvane_;

std::string ExampleText(const std::string& name)
{
  std::ifstream file(TEST_SOURCE_DIR "/examples/" + name);
  std::ostringstream text;
  text << file.rdbuf();
  return text.str();
}

// The scene of a composition, written, read again and written.
std::vector<std::uint8_t> ExportTwice(const std::string& composition)
{
  const host::StandaloneHost host(host::LoadCompositionText(composition, "example.json", TEST_SOURCE_DIR "/examples"));
  const DocumentPtr document(BaseDocument::Alloc());
  if (!exporter::ExportComposition(document.get()))
    return {};
  const DocumentPtr again = LoadFromBytes(SaveToBytes(*document));
  return again ? full_scene::SavedScene(*again) : std::vector<std::uint8_t>();
}

TEST(ExportThreads, ExportsSideBySideGiveWhatOneAloneGives)
{
  const std::string compositions[] = {ExampleText("every-light.json"), ExampleText("nested-town.json")};
  std::vector<std::uint8_t> alone[2];
  std::vector<std::uint8_t> beside[2];
  host::StandaloneHost first(host::LoadCompositionText(compositions[0], "example.json", TEST_SOURCE_DIR "/examples"));
  first.Start(EntryPointFunc);
  std::thread threads[2];
  for (std::size_t i = 0; i < 2; ++i)
    threads[i] = std::thread([&, i] { beside[i] = ExportTwice(compositions[i]); });
  for (std::thread& thread : threads)
    thread.join();
  for (std::size_t i = 0; i < 2; ++i) {
    alone[i] = ExportTwice(compositions[i]);
    EXPECT_FALSE(alone[i].empty());
    EXPECT_TRUE(alone[i] == beside[i]) << i;
  }
}

} // namespace
