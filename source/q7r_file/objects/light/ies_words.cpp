#include "q7r_file/objects/light/ies_words.h"

#include <cmath>

#include "torvane/bytes/base_file.h"

namespace _torvane_
{

namespace
{

constexpr Long kMaxExponent = 9999;

Bool IsBlank(char c) { return c == ' ' || c == '\t'; }
Bool EndsWord(char c) { return c == '\0' || IsBlank(c) || c == ',' || c == '='; }
Bool IsDigit(char c) { return c >= '0' && c <= '9'; }

// The digits from `text` on are added to `value`; gives how many there are.
Long TakeDigits(const char*& text, Real& value)
{
  Long count = 0;
  for (; IsDigit(*text); ++text, ++count)
    value = value * 10.0 + (*text - '0');
  return count;
}

// [-] digits [. digits] [e [+-] digits], with a digit before or behind the point. All of `text` must be the number, and
// it must be finite.
Bool ParseNumber(const char* text, Real& value)
{
  const Bool negative = *text == '-';
  if (negative)
    ++text;
  Real mantissa = 0.0;
  Long digits = TakeDigits(text, mantissa);
  if (*text == '.') {
    ++text;
    const Long places = TakeDigits(text, mantissa);
    mantissa /= std::pow(10.0, places);
    digits += places;
  }
  if (digits == 0)
    return false;
  if (*text == 'e' || *text == 'E') {
    ++text;
    const Bool down = *text == '-';
    if (*text == '+' || *text == '-')
      ++text;
    Real exponent = 0.0;
    if (TakeDigits(text, exponent) == 0)
      return false;
    exponent = exponent > kMaxExponent ? kMaxExponent : exponent;
    if (mantissa != 0.0)
      mantissa *= std::pow(10.0, down ? -exponent : exponent);
  }
  if (*text != '\0' || !std::isfinite(mantissa))
    return false;
  value = negative ? -mantissa : mantissa;
  return true;
}

} // namespace

Bool IESWords::NextByte(char& byte)
{
  if (bufferPosition_ == bufferCount_) {
    bufferCount_ = file_.ReadBytes(buffer_, kBufferSize, true);
    bufferPosition_ = 0;
    if (bufferCount_ <= 0) {
      bufferCount_ = 0;
      return false;
    }
  }
  byte = buffer_[bufferPosition_++];
  return true;
}

Bool IESWords::NextLine()
{
  Long length = 0;
  char byte = 0;
  while (length < kMaxLine && NextByte(byte)) {
    if (byte == '\n' && length > 0)
      break;
    if (byte != '\n' && byte != '\r')
      line_[length++] = byte;
  }
  line_[length] = '\0';
  linePosition_ = 0;
  return length > 0;
}

Bool IESWords::TakeWord()
{
  while (IsBlank(line_[linePosition_]))
    ++linePosition_;
  if (line_[linePosition_] == '\0')
    return false;
  Long length = 0;
  for (; !EndsWord(line_[linePosition_]); ++linePosition_) {
    if (length < kMaxWord)
      word_[length++] = line_[linePosition_];
  }
  word_[length] = '\0';
  if (line_[linePosition_] != '\0')
    ++linePosition_;
  return true;
}

String IESWords::TakeText()
{
  while (IsBlank(line_[linePosition_]))
    ++linePosition_;
  return String(line_ + linePosition_);
}

Bool IESWords::TakeNumber(Real& value)
{
  while (!TakeWord()) {
    if (!NextLine())
      return false;
  }
  return ParseNumber(word_, value);
}

Bool IESWords::TakeInteger(Long& value)
{
  constexpr Real kLargest = 2147483647.0;
  Real number = 0.0;
  if (!TakeNumber(number))
    return false;
  value = static_cast<Long>(number > kLargest ? kLargest : number < -kLargest ? -kLargest : number);
  return true;
}

Bool IESWords::TakeNumbers(std::initializer_list<Real*> values)
{
  for (Real* value : values) {
    if (!TakeNumber(*value))
      return false;
  }
  return true;
}

Bool IESWords::DropNumbers(Long count)
{
  Real dropped = 0.0;
  for (Long i = 0; i < count; ++i) {
    if (!TakeNumber(dropped))
      return false;
  }
  return true;
}

Bool IESWords::TakeTable(GeTempDynArray<Real>& table, Long count)
{
  Real value = 0.0;
  for (Long i = 0; i < count; ++i) {
    if (!TakeNumber(value) || !table.Append(value))
      return false;
  }
  return true;
}

} // namespace _torvane_
