// What a file that cannot be used is refused with, and what it is warned of.
#include "stage.h"

#include "host/reader/json_document.h"
#include "host/text.h"
#include "support/text_table.h"

namespace
{

using stage::Load;

// The line that the text is refused with; empty when it loads.
std::string Refusal(const std::string& text)
{
  try {
    host::LoadCompositionText(text, "orbit.json", stage::kFolder);
  } catch (const host::CompositionError& error) {
    return error.what();
  }
  return "";
}

// A usable file in which the value at a pointer is replaced; "-" takes it away.
std::string Changed(const std::string& pointer, const std::string& value)
{
  host::Json json = host::Json::parse(R"({"w": 100, "h": 80, "fr": 25, "ip": 0, "op": 50, "nm": "Orbit",
    "ae": {"workArea": [0, 10], "pixelAspect": [1, 1]},
    "assets": [{"id": "c", "layers": [{"ty": 3, "nm": "Inner"}], "w": 10, "h": 10},
               {"id": "i", "u": "images/", "p": "x.png", "w": 1, "h": 1, "ae": {"files": 2}}],
    "layers": [
      {"ty": 1, "ind": 1, "nm": "Wall", "sw": 5, "sh": 5, "sc": "#fff", "ks": {
        "p": {"k": [{"t": 0, "s": [0], "o": {"x": 0, "y": 0}, "i": {"x": [1], "y": 1}, "to": [0], "ti": [0], "h": 0},
                    {"t": 5, "s": [1], "e": [1]}], "samples": [1, [2]]}, "s": {"k": [100, 100], "x": "a"}}},
      {"ty": 13, "ind": 2, "parent": 1, "hd": false, "ae": {"locked": false, "autoOrient": true},
       "camera": {"type": "perspective", "filmSize": 1, "filmSizeUnits": "vertical", "focusDistance": {"k": 1}},
       "pe": {"k": 1}},
      {"ty": 14, "ind": 3, "light": {"type": "spot", "intensity": {"k": 1}}},
      {"ty": 0, "ind": 4, "refId": "c", "w": 10, "h": 10}]})");
  const host::Json::json_pointer place(pointer);
  if (value == "-")
    json[place.parent_pointer()].erase(place.back());
  else
    json[place] = host::Json::parse(value);
  return json.dump();
}

TEST(CompositionErrors, NameTheFileAndThePlace)
{
  const std::vector<std::string> faults = TextTable("host/faults.txt");
  EXPECT_GT(faults.size(), 90U);
  for (const std::string& line : faults) {
    const std::size_t first = line.find(" | ");
    const std::size_t second = line.find(" | ", first + 3);
    const std::string pointer = line.substr(0, first);
    const std::string message = second < line.size() ? "orbit.json: " + pointer + ": " + line.substr(second + 3) : "";
    EXPECT_EQ(message, Refusal(Changed(pointer, line.substr(first + 3, second - first - 3)))) << line;
  }
}

TEST(CompositionErrors, NameThePlaceWithinWhatIsRead)
{
  const std::tuple<std::string, std::string> cases[] = {
      {Changed("/layers/0/ks/p", R"({"s": true, "x": 5})"), "/layers/0/ks/p/x: expected an object"},
      {Changed("/layers/0/ks/p", R"({"s": true, "z": {"k": [{"t": 0}]}})"), "/layers/0/ks/p/z/k/0/s: missing"},
      {Changed("/layers/1/pe", "{}"), "/layers/1/pe/k: missing"},
      {Changed("/layers/0/parent", "2"), "/layers/0/parent: the chain of parents loops"},
      {"[]", "expected an object"},
      {"", "byte 0 (line 1, column 1): the file ends before its JSON does"},
      {"{\n  \"w\": 1,\n  oops", "byte 14 (line 3, column 3): not JSON"},
      {"{\"w\": 1} x", "byte 9 (line 1, column 10): not JSON"},
      {"{\"w\": 1e999}", "byte 10 (line 1, column 11): number out of range"},
      {"{\"w\": \"\xFF\"}", "byte 7 (line 1, column 8): not JSON"},
      {std::string(100000, '['), "nested deeper than 1000"},
  };
  for (const auto& [text, message] : cases)
    EXPECT_EQ("orbit.json: " + message, Refusal(text));
}

TEST(CompositionErrors, FindLoopsOfAnyLength)
{
  const auto parents = [](int count, int last) {
    std::string layers;
    for (int i = 0; i < count; ++i)
      layers += (i ? "," : "") + std::string(R"({"ty": 3, "ind": )") + std::to_string(i) + R"(, "parent": )" +
                std::to_string(i + 1 < count ? i + 1 : last) + "}";
    return stage::Text(layers);
  };
  EXPECT_EQ("", Refusal(parents(20000, -1))); // a warning
  EXPECT_EQ("orbit.json: /layers/0/parent: the chain of parents loops", Refusal(parents(20000, 0)));
  EXPECT_EQ("orbit.json: /layers/0/parent: the chain of parents loops", Refusal(parents(3, 2)));

  const auto chain = [](int count, int last) {
    std::string assets;
    for (int i = 0; i < count; ++i)
      assets += (i ? "," : "") + std::string(R"({"id": "c)") + std::to_string(i) +
                R"(", "layers": [{"ty": 3}, {"ty": 0, "refId": "c)" + std::to_string(i + 1 < count ? i + 1 : last) +
                R"("}]})";
    return stage::Text("", R"("assets": [)" + assets + "]");
  };
  EXPECT_EQ("", Refusal(chain(900, -1)));
  EXPECT_EQ("orbit.json: /assets/0/layers/1/refId: composition \"c0\" contains itself", Refusal(chain(1, 0)));
  EXPECT_EQ("orbit.json: /assets/2/layers/1/refId: composition \"c1\" contains itself", Refusal(chain(3, 1)));
  EXPECT_EQ("orbit.json: /assets/0/layers: compositions nested deeper than 1000", Refusal(chain(1001, -1)));
}

TEST(CompositionErrors, BoundWhatUnfolds)
{
  // Each composition holds the next one twice: 2^n layers from n lines.
  const auto doubling = [](int count) {
    std::string assets;
    for (int i = 0; i < count; ++i) {
      const std::string layer = R"({"ty": 0, "refId": ")" + std::to_string(i + 1) + R"("})";
      assets += (i ? "," : "") + std::string(R"({"id": ")") + std::to_string(i) + R"(", "layers": [)" + layer + "," +
                layer + "]}";
    }
    return stage::Text("", R"("assets": [)" + assets + "]");
  };
  EXPECT_EQ("", Refusal(doubling(18)));
  EXPECT_EQ("orbit.json: /assets/41/layers: unfolds to more than 1000000 layers", Refusal(doubling(60)));
}

TEST(CompositionWarnings, NameTheLayerAndGoOn)
{
  const host::Project project = Load(
      R"({"ty": 2, "nm": "Sky", "refId": "image_9"}, {"ty": 0}, {"ty": 3, "ind": 3, "parent": 8},
         {"ty": 1, "nm": "Wall\n\"1\"", "ddd": 1, "ks": {"p": {"k": 0, "x": "wiggle"}, "rx": {"k": 0, "x": "time"},
          "ry": {"k": 0, "x": "time", "samples": [0, 1]}, "o":
{
  "k" : 0, "x" : "time"
}
}
},
         {"ty": 5, "nm": "Flat", "ks": {"p": {"s": true, "x": {"k": 0, "x": "t"}, "y": {"k": 0, "x": "t"}},
          "rx": {"k": 0, "x": "not legal here"}}})",
      R"("assets": [{"id": "image_9"}])");
  const std::vector<std::string> expected = {
      "orbit.json: layer \"Sky\": refId \"image_9\" names no asset",
      "orbit.json: layer 2: no refId names an asset",
      "orbit.json: layer 3: parent 8 names no layer",
      "orbit.json: layer \"Wall \"1\"\": the expression of position is not evaluated",
      "orbit.json: layer \"Wall \"1\"\": the expression of rotation X is not evaluated",
      "orbit.json: layer \"Flat\": the expression of position is not evaluated",
  };
  EXPECT_EQ(expected, project.warnings);
  EXPECT_EQ(nullptr, project.layers[0].source);
  EXPECT_EQ(nullptr, project.layers[2].parent);
}

TEST(HostTexts, ConvertFromUtf8)
{
  const std::tuple<const char*, std::u16string> cases[] = {
      {"a\xC3\xA9\xE2\x82\xAC", u"a\u00e9\u20ac"},
      {"\xF0\x9F\x9A\x80", u"\U0001F680"},
      {"\xF4\x8F\xBF\xBF", u"\U0010FFFF"},
      {"\x80z", u"\uFFFDz"},
      {"\xC0\xAF", u"\uFFFD\uFFFD"},                     // an overlong slash
      {"\xED\xA0\x80", u"\uFFFD\uFFFD\uFFFD"},           // a lone surrogate
      {"\xE2\x82", u"\uFFFD\uFFFD"},                     // cut short
      {"\xF4\x90\x80\x80", u"\uFFFD\uFFFD\uFFFD\uFFFD"}, // beyond Unicode
  };
  for (const auto& [utf8, utf16] : cases)
    EXPECT_EQ(utf16, host::ToUtf16(utf8)) << utf8;
  EXPECT_EQ("\"a b\"", host::Quoted("a\nb"));
  // A cut falls between characters.
  EXPECT_EQ('"' + std::string(199, 'x') + "...\"", host::Quoted(std::string(199, 'x') + "\xE2\x82\xAC and more"));
}

} // namespace
