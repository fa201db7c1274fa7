// The files that the host can open, whatever their format: composition files (JSON), and After Effects projects, binary
// and XML. The first bytes tell which it is.
#pragma once

#include "host/file_bytes.h"
#include "host/model/composition.h"

#include <memory>

namespace host
{

// What a file tells of a composition before it is read.
struct CompositionSummary
{
  std::string name;
  std::string id; // of the project's item or of the asset; empty for a composition file's top level
  A_long width = 0;
  A_long height = 0;
  double frameRate = 0;
  double frames = 0;
  double seconds = 0;
  std::size_t layers = 0;
  // The layers that become objects of a scene, those of nested compositions counted as often as they are used.
  std::uint64_t exported = 0;
  bool isActive = false; // it was in front when the project was saved, or is the file's top level
};

class ProjectFile
{
 public:
  virtual ~ProjectFile() = default;

  // In the order of the file. Throws CompositionError, as all of these do.
  virtual std::vector<CompositionSummary> Compositions() = 0;
  // Reads a composition, by its place among Compositions(), and what it nests: it becomes the project's root. Once for
  // each file.
  virtual Project Read(std::size_t composition) = 0;
};

// Messages name the file by its path, as it is given here.
std::unique_ptr<ProjectFile> OpenProjectFile(const std::filesystem::path& file);
// The same for bytes of no file. `name` stands in messages, and names a composition without a name of its own; footage
// is looked for relative to `folder`.
std::unique_ptr<ProjectFile> OpenProjectFile(FileBytes bytes, const std::string& name,
                                             const std::filesystem::path& folder);

struct ReadOptions
{
  std::filesystem::path images;  // where moved footage is looked for; empty: nowhere
  std::filesystem::path samples; // a file with values of properties; empty: none
};

// Reads a composition, takes samples and moved footage in, and warns of expressions that stay unheard. `name` stands
// in the warnings.
Project ReadProject(ProjectFile& file, std::size_t composition, const std::string& name, const ReadOptions& options);

} // namespace host
