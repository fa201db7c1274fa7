// Pages: what is in them, and the verb that makes them. What they show is looked at in a browser, by tests/browser.
#include <regex>

#include "gltf/page/page.h"
#include "support/run_q7r.h"
#include "tests/gltf/converted_scene.h"

namespace
{

using Page = gltf_test::GltfScene;

std::string PageOf(const gltf::Model& model, const std::string& title)
{
  std::string page;
  gltf::WritePage(model, title,
                  [&page](const std::uint8_t* data, std::size_t size) { page.append(data, data + size); });
  return page;
}

std::size_t CountOf(const std::string& text, const std::string& part)
{
  std::size_t count = 0;
  for (std::size_t at = text.find(part); at != std::string::npos; at = text.find(part, at + 1))
    ++count;
  return count;
}

std::string Between(const std::string& text, const std::string& from, const std::string& to)
{
  const std::size_t begin = text.find(from) + from.size();
  return text.substr(begin, text.find(to, begin) - begin);
}

std::vector<std::uint8_t> FromBase64(const std::string& text)
{
  const std::string letters = "ABCDEFGHIJKLMNOPQRSTUVWXYZabcdefghijklmnopqrstuvwxyz0123456789+/";
  std::vector<std::uint8_t> bytes;
  std::uint32_t bits = 0;
  for (std::size_t i = 0; i < text.size() && text[i] != '='; ++i) {
    bits = bits << 6 | static_cast<std::uint32_t>(letters.find(text[i]));
    if (i % 4 > 0)
      bytes.push_back(static_cast<std::uint8_t>(bits >> (6 - 2 * (i % 4))));
  }
  EXPECT_EQ(text.size() % 4, 0U);
  return bytes;
}

TEST_F(Page, HoldsTheSceneAndNothingThatIsElsewhere)
{
  for (const char* name : {"W", "Wa", "Wal", "Wall </script><!-- \xC3\xBC"}) { // each remainder of three bytes
    AddPlane(name, 10, 10);
    const gltf::Model model = gltf::Convert(*document, options);
    const std::string page = PageOf(model, "R&D </title><script> @SCENE@ \xC3\xBC");
    EXPECT_EQ(Between(page, "<title>", "</title>"), "R&amp;D &lt;/title&gt;&lt;script&gt; @SCENE@ \xC3\xBC");
    EXPECT_EQ(FromBase64(Between(page, "type=\"application/octet-stream\">", "<")), gltf::ToGlb(model));
    EXPECT_EQ(CountOf(page, "<script"), 3U); // those of the template
    EXPECT_EQ(CountOf(page, "</script"), 3U);
    EXPECT_EQ(CountOf(page, "<!--"), 1U);
    EXPECT_NE(page.find("Permission is hereby granted"), std::string::npos);
    EXPECT_FALSE(std::regex_search(page.substr(0, page.find("var three")), std::regex("@[A-Z]+@<|src=|href=|url\\(")));
  }
}

TEST_F(Page, IsRefusedAboveItsLimitBeforeAnythingIsWritten)
{
  const gltf::Model model = gltf::Convert(*document, options);
  const std::size_t size = PageOf(model, "a").size();
  std::size_t written = 0;
  const gltf::Sink count = [&written](const std::uint8_t*, std::size_t part) { written += part; };
  EXPECT_THROW(gltf::WritePage(model, "ab", count, size), gltf::TooLarge);
  EXPECT_EQ(written, 0U);
  EXPECT_NO_THROW(gltf::WritePage(model, "a", count, size + 64)); // the template counts with its placeholders
  EXPECT_EQ(written, size);
}

class ViewVerb : public testing::Test
{
 protected:
  ViewVerb()
  {
    std::ofstream(folder_ / "in.json") << R"({"fr":25,"ip":0,"op":10,"w":100,"h":50,"nm":"Main","layers":[
      {"ddd":1,"ty":1,"nm":"Wall","sw":100,"sh":50,"sc":"#ff8000","ks":{"p":{"k":[10,20,30]}}}]})";
    EXPECT_EQ(RunQ7r("export " + Quoted(folder_ / "in.json") + " " + Quoted(folder_ / "in.q7r")).status, 0);
  }
  RunResult View(const std::string& output, const std::string& more = "") const
  {
    return RunQ7r("view " + Quoted(folder_ / "in.q7r") + " -o " + Quoted(folder_ / output) + " " + more);
  }

  TempFolder folder_;
};

TEST_F(ViewVerb, WritesThePageThatExportWrites)
{
  const RunResult run = View("page.HTML");
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_EQ(run.err, "");
  EXPECT_NE(run.out.find("page.HTML: "), std::string::npos) << run.out;
  EXPECT_EQ(RunQ7r("export " + Quoted(folder_ / "in.json") + " " + Quoted(folder_ / "x.html")).status, 0);
  EXPECT_EQ(ReadWholeFile(folder_ / "page.HTML"), ReadWholeFile(folder_ / "x.html"));
  EXPECT_NE(ReadOutput(folder_ / "x.html").find("<title>in</title>"), std::string::npos);
  const RunResult quiet = View("quiet.html", "--quiet");
  EXPECT_EQ(quiet.out + quiet.err, "");
#ifdef _WIN32
  const std::vector<std::string> outputs = {"-"};
#else
  const std::vector<std::string> outputs = {"-", "/dev/stdout"};
#endif
  for (const std::string& output : outputs) {
    const RunResult piped = RunQ7r("view " + Quoted(folder_ / "in.q7r") + " -o " + output);
    EXPECT_EQ(piped.err, "");
    EXPECT_EQ(piped.out, ReadOutput(folder_ / "x.html"));
    const RunResult glb = RunQ7r("convert " + Quoted(folder_ / "in.q7r") + " " + output);
    EXPECT_EQ(gltf::CheckGlb({glb.out.begin(), glb.out.end()}), "") << glb.err;
  }
}

TEST_F(ViewVerb, RefusesWithOneSentence)
{
  std::ofstream(folder_ / "old.html") << "precious";
  for (const char* output : {"page.glb", "page", "old.html", "missing/page.html"}) {
    const RunResult run = View(output);
    EXPECT_EQ(run.status, 2) << output;
    EXPECT_EQ(std::count(run.err.begin(), run.err.end(), '\n'), 1) << run.err;
  }
  EXPECT_EQ(ReadOutput(folder_ / "old.html"), "precious");
  const std::string scene = Quoted(folder_ / "in.q7r");
  EXPECT_EQ(RunQ7r("convert " + scene + " " + Quoted(folder_ / "page.html")).status, 2);
  EXPECT_EQ(RunQ7r("view " + Quoted(folder_ / "in.json")).status, 2);
  EXPECT_EQ(View("old.html", "--force").status, 0);
}

#ifndef _WIN32

TEST_F(ViewVerb, OpensTheBrowserOrTellsWhereThePageIs)
{
  const std::tuple<const char*, const char*, bool> cases[] = {
      {"#!/bin/sh\necho \"$1\" >\"$TMPDIR/opened\"\n", ":9", true},
      {"#!/bin/sh\nexit 3\n", ":9", false},
      {"#!/bin/sh\necho \"$1\" >\"$TMPDIR/opened\"\n", "", false},
      {nullptr, ":9", false},
  };
  for (const auto& [opener, display, isOpened] : cases) {
    const TempFolder home;
    if (opener) {
      std::ofstream(home / "xdg-open") << opener;
      std::filesystem::permissions(home / "xdg-open", std::filesystem::perms::owner_all);
    }
    const RunResult run = RunQ7r("view " + Quoted(folder_ / "in.q7r"),
                                 "TMPDIR=" + Quoted(home.Path().string()) + " PATH=" + Quoted(home.Path().string()) +
                                     " WAYLAND_DISPLAY= DISPLAY=" + Quoted(display));
    EXPECT_EQ(run.status, 0) << run.err;
    const std::string page = run.out.substr(0, run.out.find(": "));
    EXPECT_TRUE(page.ends_with("/in.html")) << run.out;
    EXPECT_TRUE(std::filesystem::exists(page)) << run.out;
    EXPECT_EQ(run.err.empty(), isOpened) << run.err;
    if (isOpened) {
      EXPECT_EQ(ReadOutput(home / "opened"), page + "\n");
    }
  }
}

#endif

} // namespace
