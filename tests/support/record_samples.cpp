#include "support/record_samples.h"

#include <algorithm>
#include <cctype>
#include <sstream>

using namespace _torvane_;

namespace
{

// "2( L1 ) S" becomes "L1 L1 S".
std::string Unfold(const std::string& body)
{
  const std::size_t open = body.find("( ");
  if (open == std::string::npos)
    return body;
  std::size_t start = open;
  while (start > 0 && std::isdigit(static_cast<unsigned char>(body[start - 1])))
    --start;
  const std::size_t close = body.find(" )", open);
  std::string text = body.substr(0, start);
  for (int i = std::stoi(body.substr(start)); i > 0; --i)
    text += body.substr(open + 2, close - open - 2) + " ";
  return Unfold(text + body.substr(close + 2));
}

std::vector<double> Numbers(const std::string& list)
{
  std::vector<double> numbers;
  std::istringstream text(list);
  for (std::string number; std::getline(text, number, ',');)
    numbers.push_back(std::stod(number));
  return numbers;
}

void PutArray(ByteWriter& w, const std::string& text, Long version)
{
  const int type = text[0] - '0';
  const std::vector<double> numbers = Numbers(text.substr(2));
  static constexpr std::uint32_t kSizes[] = {0, 1, 2, 4, 8, 4, 8};
  const auto bytes = static_cast<std::uint32_t>(numbers.size()) * kSizes[type];
  if (version < 11904)
    w.OldArrayHead(static_cast<std::uint8_t>(type), bytes);
  else
    w.ArrayHead(static_cast<std::uint8_t>(type), bytes);
  for (double number : numbers) {
    switch (type) {
    case 2:
      w.I16(static_cast<std::int16_t>(number));
      break;
    case 3:
      w.I32(static_cast<std::int32_t>(number));
      break;
    case 5:
      w.F32(static_cast<float>(number));
      break;
    default:
      w.F64(number);
      break;
    }
  }
}

void PutContainer(ByteWriter& w, const std::string& text)
{
  w.Start(132, 1).Long(text == "0" ? 0 : -1);
  if (!text.empty() && text != "0")
    w.Long(std::stoi(text)).Long(15).Long(std::stoi(text));
  w.End();
}

void PutMatrix(ByteWriter& w, const std::string& text)
{
  const std::vector<double> told = Numbers(text);
  double numbers[12];
  for (std::size_t i = 0; i < 12; ++i)
    numbers[i] = told.size() == 12 ? told[i] : told[0] + static_cast<double>(i);
  w.Matrix(numbers);
}

void PutVector(ByteWriter& w, const RecordValue& value)
{
  const std::vector<double> told = Numbers(value.text);
  if (told.size() == 3)
    w.Vector(told[0], told[1], told[2]);
  else if (value.mark == '=')
    w.Vector(told[0], told[0], told[0]);
  else
    w.Vector(told[0], told[0] + 0.5, told[0] - 0.25);
}

void PutValue(ByteWriter& w, const RecordValue& value, Long version)
{
  const std::string& text = value.text;
  const auto number = [&] { return text.empty() ? 0.0 : std::stod(text); };
  const auto integer = [&] { return static_cast<std::int32_t>(number()); };
  const std::u16string units(text.begin(), text.end());
  switch (value.kind) {
  case 'L':
    w.Long(integer());
    break;
  case 'U':
    w.ULong(static_cast<std::uint32_t>(static_cast<std::int64_t>(number())));
    break;
  case 'C':
    w.UChar(static_cast<std::uint8_t>(number()));
    break;
  case 'B':
    w.Bool(number() != 0);
    break;
  case 'R':
    w.Real(number());
    break;
  case 'T':
    w.Time(number(), 1);
    break;
  case 'V':
    PutVector(w, value);
    break;
  case 'Y':
    PutMatrix(w, text);
    break;
  case 'S':
    w.String(units);
    break;
  case 'F':
    w.Filename(units);
    break;
  case 'M':
    w.Memory(FromHex(text));
    break;
  case 'k':
    w.Memory(std::string("alias2\0\0\0\0\0\0\0", 13) + static_cast<char>(number()));
    break;
  case 'K':
    PutContainer(w, text);
    break;
  case 'A':
    PutArray(w, text, version);
    break;
  case 'X':
    w.Append(FromHex(text));
    break;
  case '[':
    w.Start(integer(), std::stoi(text.substr(text.find(',') + 1)));
    break;
  default:
    w.End();
    break;
  }
}

} // namespace

std::vector<RecordValue> ParseRecord(const std::string& body)
{
  std::vector<RecordValue> values;
  std::istringstream words(Unfold(body));
  for (std::string word; words >> word;) {
    const bool marked = word.size() > 1 && std::string("=#").find(word[1]) != std::string::npos;
    const std::size_t end = std::min(word.find_first_of("@%"), word.size());
    const std::size_t start = marked ? 2 : 1;
    RecordValue value{word[0], marked ? word[1] : ' ', word.substr(start, end - start), ' ', 0};
    if (end < word.size()) {
      value.origin = word[end];
      value.id = std::stoi(word.substr(end + 1));
    }
    values.push_back(value);
  }
  return values;
}

std::vector<std::uint8_t> RecordBytes(const std::vector<RecordValue>& values, Long version)
{
  ByteWriter w;
  for (const RecordValue& value : values)
    PutValue(w, value, version);
  return w.bytes;
}

std::vector<std::uint8_t> Record(const std::string& body, Long version)
{
  return RecordBytes(ParseRecord(body.find('$') == std::string::npos ? body : ExpandRecord(body)), version);
}

bool ChangeValue(RecordValue& value)
{
  if (value.mark == '=' || value.mark == '#')
    return false;
  switch (value.kind) {
  case 'B':
    value.text = value.text[0] == '0' ? "1" : "0";
    return true;
  case 'L':
  case 'U':
  case 'K':
    value.text = std::to_string(value.text.empty() ? 1 : std::stoi(value.text) + 1);
    return true;
  case 'R':
  case 'T':
  case 'V':
  case 'Y':
    value.text = std::to_string(std::stod(value.text) + 1);
    return true;
  case 'S':
  case 'F':
    value.text += "x";
    return true;
  case 'A':
    value.text = value.text.substr(0, value.text.rfind(value.text.find(',') < value.text.size() ? ',' : ':') + 1) + "9";
    return true;
  default:
    return false;
  }
}

std::vector<std::uint8_t> WithoutMarkers(std::vector<std::uint8_t> bytes)
{
  static constexpr std::uint8_t kStart[] = {0x0C, 1, 0x80, 0, 0, 0, 16};
  for (auto place = bytes.begin();;) {
    place = std::search(place, bytes.end(), std::begin(kStart), std::end(kStart));
    if (place == bytes.end())
      return bytes;
    place += sizeof kStart;
    std::fill_n(place, 16, std::uint8_t{0});
  }
}
