// Finding a text or a character in a String.
#include "torvane/text/ge_string.h"

#include "ge_string_case.h"

namespace _torvane_
{

namespace
{

struct Text
{
  const UniChar* characters;
  Long length;
};

Text TextOf(const String& string) { return {string.Data(), string.GetLength()}; }

template <UniChar (*Fold)(UniChar)>
Bool MatchesAt(Text text, Text pattern, Long position)
{
  for (Long i = 0; i < pattern.length; ++i) {
    if (Fold(text.characters[position + i]) != Fold(pattern.characters[i]))
      return false;
  }
  return true;
}

template <UniChar (*Fold)(UniChar)>
Bool FindForward(Text text, Text pattern, Long& position, Long start)
{
  position = -1;
  if (pattern.length == 0 || start < 0)
    return false;
  for (Long i = start; i <= text.length - pattern.length; ++i) {
    if (MatchesAt<Fold>(text, pattern, i)) {
      position = i;
      return true;
    }
  }
  return false;
}

template <UniChar (*Fold)(UniChar)>
Bool FindBackward(Text text, Text pattern, Long& position, Long start)
{
  position = -1;
  if (pattern.length == 0)
    return false;
  Long lastPlace = text.length - pattern.length;
  for (Long i = start == -1 || start > lastPlace ? lastPlace : start; i >= 0; --i) {
    if (MatchesAt<Fold>(text, pattern, i)) {
      position = i;
      return true;
    }
  }
  return false;
}

} // namespace

Bool String::FindFirst(const String& pattern, Long& position, Long start) const noexcept
{
  return FindForward<SameChar>(TextOf(*this), TextOf(pattern), position, start);
}

Bool String::FindFirst(UniChar pattern, Long& position, Long start) const noexcept
{
  return FindForward<SameChar>(TextOf(*this), {&pattern, 1}, position, start);
}

Bool String::FindFirstUpper(const String& pattern, Long& position, Long start) const noexcept
{
  return FindForward<UpperChar>(TextOf(*this), TextOf(pattern), position, start);
}

Bool String::FindFirstUpper(UniChar pattern, Long& position, Long start) const noexcept
{
  return FindForward<UpperChar>(TextOf(*this), {&pattern, 1}, position, start);
}

Bool String::FindLast(const String& pattern, Long& position, Long start) const noexcept
{
  return FindBackward<SameChar>(TextOf(*this), TextOf(pattern), position, start);
}

Bool String::FindLast(UniChar pattern, Long& position, Long start) const noexcept
{
  return FindBackward<SameChar>(TextOf(*this), {&pattern, 1}, position, start);
}

Bool String::FindLastUpper(const String& pattern, Long& position, Long start) const noexcept
{
  return FindBackward<UpperChar>(TextOf(*this), TextOf(pattern), position, start);
}

Bool String::FindLastUpper(UniChar pattern, Long& position, Long start) const noexcept
{
  return FindBackward<UpperChar>(TextOf(*this), {&pattern, 1}, position, start);
}

} // namespace _torvane_
