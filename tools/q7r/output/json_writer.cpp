#include "output/json_writer.h"

#include <algorithm>
#include <charconv>
#include <cmath>
#include <cstring>
#include <utility>

namespace q7r
{

namespace
{

// Deeper ones stand there too: with all of its depth the text would grow with the square of the nesting.
constexpr std::size_t kMostIndent = 40;
constexpr std::size_t kLongestNumber = 32;

// How many bytes the UTF-8 character at the head of a text takes; 0 when they are none.
std::size_t CharacterSize(std::string_view text)
{
  const auto byte = [&](std::size_t i) { return i < text.size() ? static_cast<unsigned char>(text[i]) : 0U; };
  const unsigned lead = byte(0);
  const std::size_t size = lead < 0x80 ? 1 : lead < 0xC2 ? 0 : lead < 0xE0 ? 2 : lead < 0xF0 ? 3 : lead < 0xF5 ? 4 : 0;
  for (std::size_t i = 1; i < size; ++i) {
    if ((byte(i) & 0xC0) != 0x80)
      return 0;
  }
  // Longer than it need be, a surrogate, beyond the last code.
  if ((lead == 0xE0 && byte(1) < 0xA0) || (lead == 0xED && byte(1) > 0x9F) || (lead == 0xF0 && byte(1) < 0x90) ||
      (lead == 0xF4 && byte(1) > 0x8F))
    return 0;
  return size;
}

bool IsPlain(char c)
{
  const auto byte = static_cast<unsigned char>(c);
  return byte >= 0x20 && byte < 0x7F && c != '"' && c != '\\';
}

} // namespace

JsonWriter::JsonWriter(Output output) : output_(output), buffer_(new char[kBufferSize]) {}

void JsonWriter::Flush()
{
  const std::size_t size = std::exchange(used_, 0);
  if (size > 0)
    output_({buffer_.get(), size});
}

char* JsonWriter::Reserve(std::size_t size)
{
  if (kBufferSize - used_ < size)
    Flush();
  return buffer_.get() + used_;
}

void JsonWriter::Put(char c)
{
  *Reserve(1) = c;
  ++used_;
}

void JsonWriter::Put(std::string_view text)
{
  while (!text.empty()) {
    if (used_ == kBufferSize)
      Flush();
    const std::size_t part = std::min(text.size(), kBufferSize - used_);
    std::memcpy(buffer_.get() + used_, text.data(), part);
    used_ += part;
    text.remove_prefix(part);
  }
}

void JsonWriter::NewLine()
{
  const std::size_t indent = std::min(levels_.size(), kMostIndent);
  char* place = Reserve(indent + 1);
  *place = '\n';
  std::memset(place + 1, ' ', indent);
  used_ += indent + 1;
}

// What stands in front of a value or a key.
void JsonWriter::Separate()
{
  if (std::exchange(isNamed_, false) || levels_.empty())
    return;
  Level& level = levels_.back();
  if (!level.isEmpty)
    Put(',');
  if (level.layout == Layout::kLines)
    NewLine();
  else if (!level.isEmpty)
    Put(' ');
  level.isEmpty = false;
}

void JsonWriter::Begin(char bracket, Layout layout)
{
  Separate();
  Put(bracket);
  if (!levels_.empty() && levels_.back().layout == Layout::kLine)
    layout = Layout::kLine;
  levels_.push_back({layout, true});
}

void JsonWriter::End(char bracket)
{
  const Level level = levels_.back();
  levels_.pop_back();
  if (!level.isEmpty && level.layout == Layout::kLines)
    NewLine();
  Put(bracket);
}

void JsonWriter::PutEscaped(std::string_view utf8)
{
  while (!utf8.empty()) {
    const auto plain = std::find_if_not(utf8.begin(), utf8.end(), IsPlain);
    Put(utf8.substr(0, static_cast<std::size_t>(plain - utf8.begin())));
    utf8.remove_prefix(static_cast<std::size_t>(plain - utf8.begin()));
    if (utf8.empty())
      break;
    const char c = utf8.front();
    const std::size_t size = CharacterSize(utf8);
    constexpr std::string_view kEscaped = "\b\t\n\f\r\"\\";
    constexpr std::string_view kLetters = "btnfr\"\\";
    const std::size_t letter = kEscaped.find(c);
    if (letter != std::string_view::npos) {
      Put('\\');
      Put(kLetters[letter]);
    } else if (size == 0) {
      Put("\xEF\xBF\xBD");
    } else if (size == 1) {
      constexpr char kHex[] = "0123456789abcdef";
      Put("\\u00");
      Put(kHex[c >> 4]);
      Put(kHex[c & 15]);
    } else {
      Put(utf8.substr(0, size));
    }
    utf8.remove_prefix(std::max<std::size_t>(size, 1));
  }
}

void JsonWriter::Key(std::string_view name)
{
  BeginText();
  AppendText(name);
  Put("\": ");
  isNamed_ = true;
}

void JsonWriter::Null()
{
  Separate();
  Put("null");
}

void JsonWriter::Bool(bool value)
{
  Separate();
  Put(value ? "true" : "false");
}

void JsonWriter::Integer(long long value)
{
  Separate();
  char* place = Reserve(kLongestNumber);
  used_ += static_cast<std::size_t>(std::to_chars(place, place + kLongestNumber, value).ptr - place);
}

void JsonWriter::Unsigned(unsigned long long value)
{
  Separate();
  char* place = Reserve(kLongestNumber);
  used_ += static_cast<std::size_t>(std::to_chars(place, place + kLongestNumber, value).ptr - place);
}

// A Real always shows that it is one: 1.0, not 1.
void JsonWriter::PutNumber(double value, bool whole)
{
  if (!std::isfinite(value))
    return Put("null");
  char* const place = Reserve(kLongestNumber);
  if (whole) {
    used_ += static_cast<std::size_t>(std::to_chars(place, place + kLongestNumber, static_cast<long long>(value)).ptr -
                                      place);
    return;
  }
  // Without an exponent where that isn't longer than people like it.
  const double size = std::fabs(value);
  const bool isCommon = value == 0.0 || (size >= 1e-5 && size < 1e15);
  const auto format = isCommon ? std::chars_format::fixed : std::chars_format::scientific;
  char* end = std::to_chars(place, place + kLongestNumber, value, format).ptr;
  const auto isOfReal = [](char c) { return c == '.' || c == 'e'; };
  if (std::find_if(place, end, isOfReal) == end) {
    *end++ = '.';
    *end++ = '0';
  }
  used_ += static_cast<std::size_t>(end - place);
}

void JsonWriter::Real(double value)
{
  Separate();
  PutNumber(value, false);
}

void JsonWriter::Text(std::string_view utf8)
{
  BeginText();
  AppendText(utf8);
  EndText();
}

void JsonWriter::BeginText()
{
  Separate();
  Put('"');
}

void JsonWriter::Time(double numerator, double denominator)
{
  BeginArray(Layout::kLine);
  Real(numerator);
  Real(denominator);
  EndArray();
}

void JsonWriter::Link(const void* target, std::string_view name)
{
  if (target)
    Text(name);
  else
    Null();
}

void JsonWriter::PutRow(const NumberRows& rows, const double* row)
{
  if (rows.perRow == 1)
    return PutNumber(row[0], rows.whole);
  Put('[');
  for (int i = 0; i < rows.perRow; ++i) {
    const bool isFirstOfGroup = rows.perGroup > 0 && i % rows.perGroup == 0;
    if (isFirstOfGroup && i > 0)
      Put("]");
    if (i > 0)
      Put(", ");
    if (isFirstOfGroup)
      Put('[');
    PutNumber(row[i], rows.whole);
  }
  Put(rows.perGroup > 0 ? "]]" : "]");
}

void JsonWriter::Rows(const NumberRows& rows)
{
  BeginArray(Layout::kLine);
  double row[NumberRows::kMostInRow];
  for (long long i = 0; i < rows.count; ++i) {
    rows.get(rows.entries, i, row);
    Separate();
    PutRow(rows, row);
  }
  EndArray();
}

void JsonWriter::Finish()
{
  Put('\n');
  Flush();
}

} // namespace q7r
