// Numbers as text.
#include "torvane/text/ge_string.h"

#include <cstdio>

#include "torvane/memory/memory.h"

namespace _torvane_
{

namespace
{

constexpr Long kMaxPlaces = 10000;

Long Limit(Long places) { return places < kMaxPlaces ? places : kMaxPlaces; }

// The text of a C format, however long it is. Empty without memory.
template <class... Args>
String Print(const char* format, Args... args)
{
  char small[64];
  String text;
  int size = std::snprintf(small, sizeof small, format, args...);
  if (size < static_cast<int>(sizeof small)) {
    text.SetCString(small, -1, STRINGENCODING_ASCII);
  } else if (char* large = static_cast<char*>(GeAllocNC(LLong{size} + 1))) {
    std::snprintf(large, static_cast<std::size_t>(size) + 1, format, args...);
    text.SetCString(large, size, STRINGENCODING_ASCII);
    GeFree(large);
  }
  return text;
}

Long LeadingBlanks(const String& text)
{
  Long blanks = 0;
  while (text[blanks] == u' ')
    ++blanks;
  return blanks;
}

// Blanks in front become the fill character; the sign behind them goes to the first place.
void FillBlanks(String& text, UniChar fill)
{
  Long blanks = LeadingBlanks(text);
  for (Long i = 0; i < blanks; ++i)
    text[i] = fill;
  if (blanks > 0 && text[blanks] == u'-') {
    text[blanks] = fill;
    text[0] = u'-';
  }
}

Bool HasDigit(const String& text, Long end)
{
  for (Long i = 0; i < end; ++i) {
    if (text[i] >= u'0' && text[i] <= u'9')
      return true;
  }
  return false;
}

// Takes zeros and the point away at the end, or before the exponent, zeros before the point included. Where no digit
// would remain, one zero does.
void StripZeros(String& text, Bool exponent)
{
  Long position = -1;
  if (!text.FindFirst(u'.', position))
    return;
  Long end = text.GetLength();
  if (exponent && text.FindFirst(u'E', position))
    end = position;
  Long begin = end;
  while (begin > 0 && (text[begin - 1] == u'0' || text[begin - 1] == u'.'))
    --begin;
  text.Delete(begin, end - begin);
  if (!HasDigit(text, begin))
    text.InsertChar(begin, u'0');
}

} // namespace

String String::FromLong(Long value) noexcept { return Print("%d", static_cast<int>(value)); }

String String::FromLLong(LLong value) noexcept { return Print("%lli", static_cast<long long>(value)); }

String String::FromReal(Real value, Long before, Long behind, Bool exponent, UniChar fill) noexcept
{
  Bool strip = before == -2 || behind < 0;
  Long places = behind < 0 ? 3 : Limit(behind);
  Long front = (before < 0 ? 0 : Limit(before)) + (exponent ? 4 : 0) - (places == 0 ? 1 : 0);
  String text =
      Print(exponent ? "%*.*E" : "%*.*f", static_cast<int>(front + places + 1), static_cast<int>(places), value);
  if (front > 0)
    FillBlanks(text, fill);
  else
    text.Delete(0, LeadingBlanks(text));
  if (strip)
    StripZeros(text, exponent);
  return text == String("-0") ? String("0") : text;
}

} // namespace _torvane_
