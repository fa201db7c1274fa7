// Composes After Effects projects value by value, in both forms, without the reader's own tables.
#pragma once

#include <bit>
#include <cstdint>
#include <string>
#include <vector>

namespace project_bytes
{

// Big-endian values at their places.
class Data
{
 public:
  explicit Data(std::size_t size = 0) : bytes_(size, '\0') {}
  Data& Put(std::size_t at, std::uint64_t value, std::size_t width)
  {
    if (bytes_.size() < at + width)
      bytes_.resize(at + width, '\0');
    for (std::size_t i = 0; i < width; ++i)
      bytes_[at + i] = static_cast<char>(value >> (8 * (width - 1 - i)));
    return *this;
  }
  Data& U8(std::size_t at, unsigned value) { return Put(at, value, 1); }
  Data& U16(std::size_t at, unsigned value) { return Put(at, value, 2); }
  Data& U32(std::size_t at, std::int64_t value) { return Put(at, static_cast<std::uint64_t>(value), 4); }
  Data& Ratio(std::size_t at, std::int64_t above, std::int64_t below) { return U32(at, above).U32(at + 4, below); }
  Data& F32(std::size_t at, float value) { return Put(at, std::bit_cast<std::uint32_t>(value), 4); }
  Data& F64(std::size_t at, double value) { return Put(at, std::bit_cast<std::uint64_t>(value), 8); }
  Data& Reals(std::size_t at, const std::vector<double>& values)
  {
    for (std::size_t i = 0; i < values.size(); ++i)
      F64(at + 8 * i, values[i]);
    return *this;
  }
  Data& Text(std::size_t at, const std::string& text)
  {
    for (std::size_t i = 0; i < text.size(); ++i)
      U8(at + i, static_cast<unsigned char>(text[i]));
    return *this;
  }
  operator std::string() const { return bytes_; } // NOLINT(google-explicit-constructor)

 private:
  std::string bytes_;
};

// A chunk, or a list when it has a kind.
struct Node
{
  std::string id, data, kind = {};
  std::vector<Node> children = {};
};

inline Node Chunk(const std::string& id, const std::string& data) { return {id, data}; }
inline Node Utf8(const std::string& text) { return {"Utf8", text}; }
inline Node List(const std::string& kind, std::vector<Node> children)
{
  return {"LIST", "", kind, std::move(children)};
}
inline Node MatchName(const std::string& name) { return Chunk("tdmn", Data(40).Text(0, name)); }

inline std::string Binary(const Node& node)
{
  std::string data = node.kind + node.data;
  for (const Node& child : node.children)
    data += Binary(child);
  return node.id + std::string(Data().U32(0, static_cast<std::int64_t>(data.size()))) + data +
         std::string(data.size() % 2, '\0');
}

inline std::string BinaryFile(const std::vector<Node>& root)
{
  std::string chunks = "Egg!";
  for (const Node& node : root)
    chunks += Binary(node);
  return "RIFX" + std::string(Data().U32(0, static_cast<std::int64_t>(chunks.size()))) + chunks + "<x:xmpmeta/>";
}

inline std::string Escaped(const std::string& text)
{
  std::string escaped;
  for (const char c : text)
    escaped += c == '&' ? "&amp;" : c == '<' ? "&lt;" : c == '"' ? "&quot;" : std::string(1, c);
  return escaped;
}

// `fullpath` and `target_is_folder` of an `alas` are attributes here.
inline std::string Attributes(const std::string& alias)
{
  const std::size_t start = alias.find(":\"") + 2;
  const bool isFolder = alias.find("true") != std::string::npos;
  std::string path;
  for (std::size_t i = start; alias[i] != '"'; ++i)
    path += alias[i] == '\\' ? alias[++i] : alias[i];
  return " fullpath=\"" + Escaped(path) + "\" target_is_folder=\"" + (isFolder ? "1" : "0") + "\"";
}

inline std::string Xml(const Node& node)
{
  if (node.id == "Utf8")
    return "<string>" + Escaped(node.data) + "</string>\n";
  if (node.id == "alas")
    return "<fileReference" + Attributes(node.data) + "/>\n";
  if (node.id == "LIST") {
    const std::string name = node.kind.substr(0, node.kind.find(' '));
    std::string text = "<" + name + ">\n";
    for (const Node& child : node.children)
      text += Xml(child);
    return text + "</" + name + ">\n";
  }
  std::string text = "<" + node.id + " bdata=\"";
  for (const char c : node.data)
    for (const int digit : {(c >> 4) & 15, c & 15})
      text += "0123456789abcdef"[digit];
  return text + "\"/>\n";
}

inline std::string XmlFile(const std::vector<Node>& root)
{
  std::string text = "<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<AfterEffectsProject majorVersion=\"1\">\n";
  for (const Node& node : root)
    text += Xml(node);
  return text + "<ProjectXMPMetadata>junk</ProjectXMPMetadata></AfterEffectsProject>\n";
}

// --- Items

struct Comp
{
  unsigned id = 1;
  std::string name = "Main";
  std::vector<Node> layers = {};
  std::int64_t ticksPerFrame = 1024, ticksPerSecond = 25600;
  unsigned rate = 25, rateFraction = 0;
  unsigned width = 1920, height = 1080;
  std::int64_t pixelAspect[2] = {1, 1};
  std::int64_t duration[2] = {10, 1};
  std::int64_t areaStart[2] = {0, 1}, areaEnd[2] = {0xFFFFFFFF, 600};
};

inline Node Item(unsigned kind, unsigned id, const std::string& name, std::vector<Node> more)
{
  more.insert(more.begin(), {Chunk("idta", Data(84).U16(0, kind).U32(16, id)), Utf8(name)});
  return List("Item", std::move(more));
}

inline Node Folder(const std::string& name, std::vector<Node> items)
{
  return Item(1, 900, name, {List("Sfdr", std::move(items))});
}

inline Node MakeItem(const Comp& c)
{
  Data data(204);
  data.U32(4, c.ticksPerFrame).U32(8, c.ticksPerSecond).Ratio(28, c.areaStart[0], c.areaStart[1]);
  data.Ratio(36, c.areaEnd[0], c.areaEnd[1]).Ratio(44, c.duration[0], c.duration[1]);
  data.U16(140, c.width).U16(142, c.height).Ratio(144, c.pixelAspect[0], c.pixelAspect[1]);
  std::vector<Node> more = {Chunk("cdta", data.U16(156, c.rate).U16(158, c.rateFraction))};
  more.insert(more.end(), c.layers.begin(), c.layers.end());
  return Item(4, c.id, c.name, std::move(more));
}

inline Data Settings(unsigned width, unsigned height) { return Data(222).U16(32, width).U16(36, height); }

inline Node Solid(unsigned id, const std::string& name, unsigned width, unsigned height, const float (&rgb)[3])
{
  const Data options =
      Data(282).Text(0, "Soli").F32(10, 1).F32(14, rgb[0]).F32(18, rgb[1]).F32(22, rgb[2]).Text(26, name);
  return Item(7, id, "", {List("Pin ", {Chunk("sspc", Settings(width, height)), Chunk("opti", options)})});
}

// A file, or a folder with the nodes that stand before `opti`.
inline Node Footage(unsigned id, const std::string& path, bool isFolder, const Data& settings,
                    std::vector<Node> before = {}, const std::string& name = "")
{
  std::string escaped;
  for (const char c : path)
    escaped += c == '\\' ? "\\\\" : std::string(1, c);
  std::vector<Node> source = {Chunk("sspc", settings)};
  source.push_back(List("Als2", {Chunk("alas", "{\"fullpath\":\"" + escaped +
                                                   "\",\"target_is_folder\":" + (isFolder ? "true" : "false") + "}")}));
  source.insert(source.end(), before.begin(), before.end());
  source.push_back(Chunk("opti", Data(60).Text(0, "png!")));
  return Item(7, id, name, {List("Pin ", std::move(source))});
}

// --- Layers

struct Layer
{
  unsigned id = 10;
  std::string name = "";
  unsigned kind = 0;
  unsigned source = 0, parent = 0;
  unsigned switches = 0x04, moreSwitches = 0x01;
  unsigned lightKind = 0;
  std::int64_t stretch[2] = {1, 1};
  std::int64_t start[2] = {0, 1}, in[2] = {0, 1}, out[2] = {10, 1};
  std::vector<Node> transform = {}, camera = {}, light = {};
  std::vector<Node> more = {}; // beside the groups
  unsigned cameraKind = 0, filmSizeUnits = 1;
};

inline Node Group(std::vector<Node> members)
{
  members.insert(members.begin(), Chunk("tdsb", Data().U32(0, 1)));
  members.push_back(MatchName("ADBE Group End"));
  return List("tdgp", std::move(members));
}

inline Node MakeLayer(const Layer& l)
{
  std::vector<Node> members = {MatchName("ADBE Marker"), List("mrst", {})};
  members.insert(members.end(), l.more.begin(), l.more.end());
  const std::pair<const char*, const std::vector<Node>*> groups[] = {{"ADBE Transform Group", &l.transform},
                                                                     {"ADBE Camera Options Group", &l.camera},
                                                                     {"ADBE Light Options Group", &l.light}};
  for (const auto& [name, group] : groups)
    if (!group->empty()) {
      members.push_back(MatchName(name));
      members.push_back(Group(*group));
    }
  Data data(160);
  data.U32(0, l.id).U32(8, l.stretch[0]).Ratio(12, l.start[0], l.start[1]).Ratio(20, l.in[0], l.in[1]);
  data.Ratio(28, l.out[0], l.out[1]).U8(38, l.switches).U8(39, l.moreSwitches).U32(40, l.source);
  data.U32(108, l.stretch[1]).U8(131, l.kind).U32(132, l.parent).U32(136, l.lightKind).U32(140, l.cameraKind);
  data.U32(148, l.filmSizeUnits).F64(152, 102.047244094488);
  return List("Layr", {Chunk("ldta", data), Utf8(l.name), Group(std::move(members))});
}

// --- Properties

struct Property
{
  unsigned components = 1;
  unsigned form = 0; // 0x0E path, 0x06 with tangents
  std::vector<double> value = {};
  std::vector<Node> after = {}; // an expression
  std::vector<std::string> keys = {};
  unsigned switches = 1;
  unsigned expressionOff = 0;
  std::int64_t ticksPerSecond = 25600;
};

// The `tdbs` alone.
inline Node Body(const Property& p)
{
  Data head(124);
  head.U16(0, 0xDB99).U16(2, p.components).U8(5, p.form).U32(12, p.ticksPerSecond).U8(119, p.expressionOff);
  std::vector<Node> nodes = {Chunk("tdsb", Data().U32(0, p.switches)), Chunk("tdb4", head)};
  if (p.keys.empty()) {
    nodes.push_back(Chunk("cdat", Data().Reals(0, p.value)));
  } else {
    std::string items;
    for (const std::string& key : p.keys)
      items += key;
    const auto size = static_cast<std::int64_t>(p.keys[0].size());
    nodes.push_back(
        List("list", {Chunk("lhd3", Data(52).U32(8, static_cast<std::int64_t>(p.keys.size())).U32(16, size)),
                      Chunk("ldat", items)}));
  }
  nodes.insert(nodes.end(), p.after.begin(), p.after.end());
  return List("tdbs", std::move(nodes));
}

inline void Add(std::vector<Node>& group, const std::string& matchName, Node property)
{
  group.push_back(MatchName(matchName));
  group.push_back(std::move(property));
}

enum Way : unsigned
{
  kLinear = 1,
  kBezier = 2,
  kHold = 3,
};

struct Ease
{
  double speedIn = 0, influenceIn = 0, speedOut = 0, influenceOut = 0;
};

// One entry of `eases` for each component.
inline std::string PlainKey(std::int64_t ticks, Way in, Way out, const std::vector<double>& value,
                            const std::vector<Ease>& eases)
{
  const std::size_t n = value.size();
  Data data(8 + 40 * n);
  data.U32(0, ticks).U8(4, in).U8(5, out).Reals(8, value);
  for (std::size_t c = 0; c < n; ++c)
    data.F64(8 + 8 * (n + c), eases[c].speedIn)
        .F64(8 + 8 * (2 * n + c), eases[c].influenceIn)
        .F64(8 + 8 * (3 * n + c), eases[c].speedOut)
        .F64(8 + 8 * (4 * n + c), eases[c].influenceOut);
  return data;
}

inline std::string WideKey(std::int64_t ticks, Way in, Way out, const std::vector<double>& value, const Ease& ease,
                           const std::vector<double>& tangentIn = {}, const std::vector<double>& tangentOut = {},
                           bool isRoving = false)
{
  const std::size_t n = value.size();
  Data data(56 + 24 * n);
  data.U32(0, ticks).U8(4, in).U8(5, out).U8(7, isRoving ? 0x20 : 0);
  data.Reals(24, {ease.speedIn, ease.influenceIn, ease.speedOut, ease.influenceOut}).Reals(56, value);
  return data.Reals(56 + 8 * n, tangentIn).Reals(56 + 16 * n, tangentOut);
}

inline std::vector<Node> Root(std::vector<Node> items, unsigned active = 0)
{
  return {Chunk("head", Data(20).U32(4, 0x0B3186AB)), List("Fold", std::move(items)),
          Chunk("fcid", Data().U32(0, active))};
}

} // namespace project_bytes
