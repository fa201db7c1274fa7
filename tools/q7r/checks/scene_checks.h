// What is odd about a scene that can be read: nothing that keeps it from being used, but hardly what somebody wanted.
#pragma once

#include <filesystem>
#include <string>
#include <unordered_set>
#include <vector>

#include "torvane/document/base_document.h"
#include "torvane/stream/stream_walker.h"

namespace q7r
{

struct SceneWarning
{
  const char* kind; // "empty", "picture", "link", "range", "name"
  std::string path; // of the node, or empty
  std::string message;
};

// Looks for links whose targets the file doesn't hold, value by value.
class LinkCheck
{
 public:
  void See(const _torvane_::StreamValue& value);
  // To be called behind the last value.
  void AddWarnings(std::vector<SceneWarning>& warnings) const;

 private:
  struct Link
  {
    _torvane_::LLong offset;
    unsigned long long number;
  };

  std::unordered_set<unsigned long long> goals_;
  std::vector<Link> links_;
};

// Pictures that aren't where the scene, which lies in `folder`, says; a scene without objects; tags that point at
// nothing; parameters beyond their ranges; names that come more than once in a list of objects or layers.
void AddSceneWarnings(_torvane_::BaseDocument& document, const std::filesystem::path& folder,
                      std::vector<SceneWarning>& warnings);

} // namespace q7r
