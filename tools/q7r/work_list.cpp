#include "work_list.h"

#include <algorithm>
#include <atomic>
#include <filesystem>
#include <map>
#include <mutex>
#include <system_error>
#include <thread>

#include "output/output_file.h"
#include "progress_bar.h"
#include "report.h"
#include "standard_input.h"
#include "torvane/memory/memory.h"

namespace q7r
{

namespace
{

namespace fs = std::filesystem;

// A folder, or what is to be one: a new name without a suffix. So the one file that a pattern of the shell gave goes
// where several would have gone.
bool IsFolder(const std::string& path)
{
  std::error_code ignored;
  const fs::file_status status = fs::status(path, ignored);
  if (fs::exists(status) || IsDevice(path))
    return fs::is_directory(status);
  return path.ends_with('/') || !fs::path(path).has_extension();
}

std::string PlaceIn(const std::string& folder, const std::string& file, const char* suffix)
{
  if (IsStandard(file))
    throw Failure(InputName(file), "has no name to keep in " + folder);
  fs::path name = fs::path(file).filename();
  if (suffix)
    name.replace_extension(suffix);
  return (fs::path(folder) / name).string();
}

std::vector<Work> PlanFolder(const WorkOptions& options, const char* suffix)
{
  std::error_code error;
  fs::create_directories(options.output, error);
  if (error)
    throw Failure(options.output, error.message());
  std::vector<Work> list;
  std::map<std::string, std::string> taken;
  for (const std::string& file : options.files) {
    const std::string output = PlaceIn(options.output, file, suffix);
    const auto [place, isNew] = taken.emplace(output, file);
    if (!isNew)
      throw Failure(file, "would be written to " + output + ", as " + place->second + " would");
    list.push_back({file, output});
  }
  return list;
}

int DoOne(const Work& piece, const std::function<int(const Work&)>& work)
{
  try {
    const _torvane_::AllocationWatch watch;
    const int status = work(piece);
    if (watch.Failed())
      throw Failure(piece.input, "not enough memory");
    return status;
  } catch (const std::exception&) {
    return TellFailure();
  }
}

// What can be worked on; tells why the others can't.
std::vector<Work> Prepared(const std::vector<Work>& all, const std::function<void(const Work&)>& prepare, int& status)
{
  std::vector<Work> list;
  for (const Work& piece : all) {
    try {
      prepare(piece);
      list.push_back(piece);
    } catch (const std::exception&) {
      status = TellFailure();
    }
  }
  return list;
}

// What the threads share.
class Workshop
{
 public:
  Workshop(const std::vector<Work>& list, const std::function<int(const Work&)>& work)
      : list_(list), work_(work), bar_(std::to_string(list.size()) + " files")
  {}

  // Until nothing is left to do.
  void Run()
  {
    for (std::size_t i = next_++; i < list_.size(); i = next_++) {
      ToldTogether words;
      const int status = DoOne(list_[i], work_);
      const std::lock_guard lock(mutex_);
      bar_.Clear();
      words.Flush();
      worst_ = std::max(worst_, status);
      bar_.Show(static_cast<double>(++done_) / static_cast<double>(list_.size()));
    }
  }
  int Worst() const { return worst_; }

 private:
  const std::vector<Work>& list_;
  const std::function<int(const Work&)>& work_;
  std::atomic<std::size_t> next_ = 0;
  std::mutex mutex_; // of what follows
  ProgressBar bar_;
  std::size_t done_ = 0;
  int worst_ = kDone;
};

} // namespace

void AddWorkOptions(CLI::App& verb, WorkOptions& options, const std::string& name, const std::string& what)
{
  verb.add_option(name, options.files, what)->required();
  verb.add_option("-o,--output", options.output, "the file to write, or, for one or many, the folder to write into");
  verb.add_option("--jobs", options.jobs, "how many files are worked on at a time; without it, one for each core")
      ->check(CLI::Range(1U, 1024U));
  verb.add_flag("--force", options.force, "replace existing files without asking");
}

std::vector<Work> PlanWork(const WorkOptions& options, const char* suffix)
{
  const std::vector<std::string>& files = options.files;
  if (options.output.empty()) {
    if (files.size() == 1)
      throw Failure(files.front() + ": where to? Name the file to write behind it, or a folder with -o");
    if (files.size() > 2)
      throw Failure("many files need a folder to be written into: -o FOLDER");
    return {{files.front(), files.back()}};
  }
  if (files.size() == 1 && !IsFolder(options.output))
    return {{files.front(), options.output}};
  if (!IsFolder(options.output))
    throw Failure(options.output, "is no folder, which many files need; a new one whose name has a dot ends with /");
  return PlanFolder(options, suffix);
}

int DoWork(const std::vector<Work>& all, unsigned jobs, const std::function<void(const Work&)>& prepare,
           const std::function<int(const Work&)>& work)
{
  if (all.size() == 1) {
    prepare(all.front());
    return work(all.front());
  }
  int refused = kDone;
  const std::vector<Work> list = Prepared(all, prepare, refused);
  Workshop shop(list, work);
  const std::size_t wanted = jobs > 0 ? jobs : std::max(1U, std::thread::hardware_concurrency());
  std::vector<std::thread> others;
  try {
    for (std::size_t i = 1; i < std::min(wanted, list.size()); ++i)
      others.emplace_back([&shop] { shop.Run(); });
  } catch (const std::system_error&) {
    // The system gives no more threads: those that are there do the work.
  }
  shop.Run();
  for (std::thread& other : others)
    other.join();
  return std::max(refused, shop.Worst());
}

} // namespace q7r
