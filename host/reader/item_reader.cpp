#include "host/reader/item_reader.h"

#include "host/reader/layer_reader.h"
#include "host/text.h"

namespace host
{

namespace
{

constexpr A_long kDefaultSolidSize = 100;

// "#rgb" or "#rrggbb"
std::optional<AEGP_ColorVal> ParseColor(const std::string& text)
{
  if ((text.size() != 4 && text.size() != 7) || text[0] != '#' ||
      text.find_first_not_of("0123456789abcdefABCDEF", 1) != std::string::npos)
    return std::nullopt;
  const std::size_t digits = text.size() / 3;
  const auto part = [&](std::size_t i) {
    const int number = std::stoi(text.substr(1 + i * digits, digits), nullptr, 16);
    return number / (digits == 1 ? 15.0 : 255.0);
  };
  return AEGP_ColorVal{.alphaF = 1, .redF = part(0), .greenF = part(1), .blueF = part(2)};
}

// `ae.color`: red, green and blue from 0 to 1, for colours that have no place among the 16 million of `sc`.
AEGP_ColorVal ReadExactColor(const JsonDocument& document, const Json& json)
{
  if (!json.is_array() || json.size() != 3)
    document.Refuse(json, "expected an array of three numbers");
  return {.alphaF = 1,
          .redF = document.Number(json[0]),
          .greenF = document.Number(json[1]),
          .blueF = document.Number(json[2])};
}

std::string ResolvePath(const JsonDocument& document, const Json& json, const std::string& file,
                        const std::filesystem::path& folder)
{
  const std::filesystem::path path = folder / PathFromUtf8(document.TextOr(json, "u", "") + file);
  return PathToUtf8(path.lexically_normal().make_preferred());
}

} // namespace

void ReadFootage(const JsonDocument& document, const Json& json, const std::filesystem::path& folder, Item& item)
{
  const std::string& file = document.Text(document.Require(json, "p"));
  const bool isEmbedded = document.FlagOr(json, "e", false) && file.starts_with("data:");
  const Json* ae = document.Find(json, "ae");
  if (const Json* path = ae ? document.Find(*ae, "path") : nullptr)
    item.path = document.Text(*path);
  else
    item.path = isEmbedded ? item.id : ResolvePath(document, json, file, folder);
  // npos + 1 is 0
  item.name = document.TextOr(json, "nm", isEmbedded ? item.id : file.substr(file.find_last_of("/\\") + 1));
  // Sounds have no size.
  if (const Json* width = document.Find(json, "w"))
    item.width = ReadSize(document, *width, 0);
  if (const Json* height = document.Find(json, "h"))
    item.height = ReadSize(document, *height, 0);
  if (const Json* files = ae ? document.Find(*ae, "files") : nullptr) {
    const std::int64_t count = document.WholeNumber(*files);
    if (count < 1 || count > 0x7FFFFFFF)
      document.Refuse(*files, "expected a whole number above 0");
    item.files = static_cast<A_long>(count);
  }
}

void ReadSolid(const JsonDocument& document, const Json& layer, bool isNull, Item& item)
{
  const Json* ae = document.Find(layer, "ae");
  item.name = document.TextOr(layer, "nm", isNull ? kUnnamedNull : kUnnamedSolid);
  item.width = item.height = kDefaultSolidSize;
  if (const Json* size = isNull && ae ? document.Find(*ae, "size") : nullptr) {
    if (!size->is_array() || size->size() != 2)
      document.Refuse(*size, "expected an array of two numbers");
    item.width = ReadSize(document, (*size)[0], 0);
    item.height = ReadSize(document, (*size)[1], 0);
  }
  if (isNull)
    return;
  if (const Json* width = document.Find(layer, "sw"))
    item.width = ReadSize(document, *width);
  if (const Json* height = document.Find(layer, "sh"))
    item.height = ReadSize(document, *height);
  if (const Json* text = document.Find(layer, "sc")) {
    const std::optional<AEGP_ColorVal> color = ParseColor(document.Text(*text));
    if (!color)
      document.Refuse(*text, "expected a colour, \"#rgb\" or \"#rrggbb\"");
    item.color = *color;
  }
  if (const Json* color = ae ? document.Find(*ae, "color") : nullptr)
    item.color = ReadExactColor(document, *color);
}

} // namespace host
