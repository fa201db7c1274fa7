// Every call to the system that a verb makes fails in turn: then the verb has done its work, or it says why not and has
// changed nothing. A signal in its place leaves nothing behind either.

#include "support/run_q7r.h"

#ifdef TEST_FAILING_CALLS

namespace
{

constexpr const char* kComposition = R"({"fr":25,"ip":0,"op":5,"w":100,"h":50,"nm":"Main","layers":[
  {"ddd":1,"ty":1,"nm":"Wall","sw":100,"sh":50,"sc":"#ff8000","ks":{"p":{"k":[10,20,30]}}}]})";
constexpr const char* kPhotometric = "IESNA91\nTILT=NONE\n1 1000 1 2 1 1 2 0 0 0\n1 1 1\n0 180\n0\n80 80\n";
constexpr const char* kCause = "Input/output error";

struct Verb
{
  std::string arguments; // the files of the folder in braces
  std::string output;    // what it writes, beside standard output
};
// How a test is named.
void PrintTo(const Verb& verb, std::ostream* out) { *out << verb.arguments; }

class Faults : public testing::TestWithParam<Verb>
{
 protected:
  Faults()
  {
    std::filesystem::create_directories(folder_.Path() / "caf\u2013\xF0\x9F\x98\x80");
    std::filesystem::create_directories(folder_.Path() / "tmp");
    const std::string text = kComposition;
    WriteWholeFile(folder_ / "c.json", Bytes(text.begin(), text.end()));
    const std::string light = kPhotometric;
    WriteWholeFile(folder_ / "l.ies", Bytes(light.begin(), light.end()));
    WriteWholeFile(folder_ / "p.bmp", Picture());
    for (const char* arguments : {"export {c.json} {s.q7r}", "preview {s.q7r} --set {p.bmp} -o {scene.q7r}"})
      EXPECT_EQ(RunQ7r(Filled(arguments)).status, 0) << arguments;
  }

  static Bytes Picture()
  {
    Bytes bytes(54 + 2 * 8, 0x55);
    const Bytes head = {'B', 'M', 70, 0, 0, 0, 0, 0, 0, 0, 54, 0, 0, 0,  40,
                        0,   0,   0,  2, 0, 0, 0, 2, 0, 0, 0,  1, 0, 24, 0};
    std::copy(head.begin(), head.end(), bytes.begin());
    std::fill(bytes.begin() + static_cast<long>(head.size()), bytes.begin() + 54, std::uint8_t{0});
    return bytes;
  }

  std::string Filled(std::string arguments) const
  {
    for (std::size_t open = 0; (open = arguments.find('{')) != std::string::npos;) {
      const std::size_t close = arguments.find('}');
      const std::string name = arguments.substr(open + 1, close - open - 1);
      arguments.replace(open, close - open + 1, Quoted(folder_ / name));
    }
    return arguments;
  }

  // Runs the verb with its `call`th call failing; 0 for none.
  RunResult Run(int call, int signal = 0) const
  {
    return RunQ7r(Filled(GetParam().arguments),
                  "TMPDIR=" + Quoted(folder_ / "tmp") + " FAILING_REPORT=" + Quoted(folder_ / "calls") +
                      " FAILING_CALL=" + std::to_string(call) + " FAILING_SIGNAL=" + std::to_string(signal) +
                      " LD_PRELOAD=" + Quoted(TEST_FAILING_CALLS));
  }

  void PutOld() const
  {
    if (!GetParam().output.empty())
      WriteWholeFile(folder_ / GetParam().output, kOld);
  }

  std::set<std::string> Names() const
  {
    std::set<std::string> names;
    for (const auto& entry : std::filesystem::recursive_directory_iterator(folder_.Path()))
      names.insert(entry.path().string());
    names.erase(folder_ / "calls");
    return names;
  }

  // What the verb made is whole: a scene that can be read, or another file that is as long as it was without a fault.
  void ExpectWhole(std::size_t size) const
  {
    const std::string& output = GetParam().output;
    const Bytes bytes = output.empty() ? Bytes() : ReadWholeFile(folder_ / output);
    EXPECT_EQ(bytes.size(), size);
    if (output.ends_with("q7r")) {
      EXPECT_LT(RunQ7r("check " + Quoted(folder_ / output)).status, 2) << "1 is a warning";
    }
  }
  void ExpectOld() const
  {
    if (!GetParam().output.empty()) {
      EXPECT_EQ(ReadWholeFile(folder_ / GetParam().output), kOld);
    }
  }

  TempFolder folder_;
  const Bytes kOld = {'p', 'r', 'e', 'c', 'i', 'o', 'u', 's'};
};

TEST_P(Faults, EndInADoneWorkOrInNone)
{
  PutOld();
  const std::set<std::string> names = Names();
  const RunResult good = Run(0);
  ASSERT_EQ(good.status, 0) << good.err;
  const int calls = std::atoi(ReadOutput(folder_ / "calls").c_str());
  const std::size_t size = GetParam().output.empty() ? 0 : ReadWholeFile(folder_ / GetParam().output).size();
  ASSERT_GT(calls, 3);
  for (int call = 1; call <= calls; ++call) {
    SCOPED_TRACE("call " + std::to_string(call) + " of " + std::to_string(calls));
    PutOld();
    const RunResult run = Run(call);
    EXPECT_EQ(Names(), names);
    if (run.status == 0) {
      EXPECT_EQ(run.out, good.out);
      ExpectWhole(size);
      continue;
    }
    EXPECT_EQ(run.status, 2) << run.err;
    EXPECT_NE((run.out + run.err).find(kCause), std::string::npos) << run.out << run.err;
    ExpectOld();
  }
}

TEST_P(Faults, EndBySignalsThatLeaveNothingBehind)
{
  PutOld();
  const std::set<std::string> names = Names();
  ASSERT_EQ(Run(0).status, 0);
  const int calls = std::atoi(ReadOutput(folder_ / "calls").c_str());
  const std::size_t size = GetParam().output.empty() ? 0 : ReadWholeFile(folder_ / GetParam().output).size();
  const int signals[] = {SIGINT, SIGTERM, SIGHUP, SIGPIPE};
  for (int call = 1; call <= calls; call += GetParam().output.empty() ? calls / 3 : 1) {
    SCOPED_TRACE("call " + std::to_string(call) + " of " + std::to_string(calls));
    PutOld();
    EXPECT_NE(Run(call, signals[call % 4]).status, 0);
    EXPECT_EQ(Names(), names);
    if (!GetParam().output.empty() && ReadWholeFile(folder_ / GetParam().output) != kOld)
      ExpectWhole(size);
  }
}

const Verb kVerbs[] = {
    {"export {c.json} {out.q7r} --force", "out.q7r"},
    {"export {c.json} {caf\u2013\xF0\x9F\x98\x80/out.q7r} --force", "caf\u2013\xF0\x9F\x98\x80/out.q7r"},
    {"resave {scene.q7r} {out.q7r} --force", "out.q7r"},
    {"merge {scene.q7r} {s.q7r} -o {out.q7r} --force", "out.q7r"},
    {"preview {scene.q7r} --set {p.bmp} -o {out.q7r} --force", "out.q7r"},
    {"preview {scene.q7r} -o {out.bmp} --force", "out.bmp"},
    {"preview {scene.q7r} -o {out.jpg} --force", "out.jpg"},
    {"convert {scene.q7r} {out.glb} --force", "out.glb"},
    {"view {scene.q7r} -o {out.html} --force", "out.html"},
    {"info {scene.q7r}", ""},
    {"tree --json {scene.q7r}", ""},
    {"dump {scene.q7r}", ""},
    {"check {scene.q7r}", ""},
    {"convert {scene.q7r} {out.glb} --force", "out.glb"},
    {"ies {l.ies}", ""},
};
INSTANTIATE_TEST_SUITE_P(Verbs, Faults, testing::ValuesIn(kVerbs));

} // namespace

#endif
