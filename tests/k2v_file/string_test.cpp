#include "support/library.h"

namespace
{

String Repeat(Long count) { return String(count, u'x'); }

TEST(String, KeepsCapacityAtMultiplesOf16AndReusesTheBlock)
{
  String text;
  EXPECT_TRUE(text.GetCapacity() == 0 && text.Data() == nullptr);
  const std::tuple<std::function<void()>, Long, Long> steps[] = {
      {[&] { text.FillChars(1, u'a'); }, 1, 16},
      {[&] { text.FillChars(16, u'b'); }, 16, 16},
      {[&] { text.InsertChar(16, u'c'); }, 17, 32},
      {[&] { text.Append(Repeat(15)); }, 32, 32},
      {[&] { text.Delete(16, 9), text.Trim(); }, 23, 32},
      {[&] { text.Delete(16, 7), text.Trim(); }, 16, 32},
      {[&] { text.Delete(15, 1), text.Trim(); }, 15, 16},
      {[&] { text.FillChars(40, u'd'); }, 40, 48},
      {[&] { text.Delete(3, 100); }, 3, 48},
      {[&] { text.Trim(); }, 3, 16},
      {[&] { text.FillChars(0, u'a'); }, 0, 16},
      {[&] { text.Trim(); }, 0, 0},
  };
  for (const auto& [act, length, capacity] : steps) {
    act();
    EXPECT_TRUE(text.GetLength() == length && text.GetCapacity() == capacity) << length << " of " << capacity;
  }
}

TEST(String, CopiesAndMovesItsCharacters)
{
  String first("first"), copy = first, moved = std::move(copy);
  first[0] = u'F';
  EXPECT_EQ(Utf8(moved), "first");
  EXPECT_EQ(Utf8(first), "First");
  const String& self = first;
  first = self;
  first.Append(first);
  EXPECT_EQ(Utf8(first), "FirstFirst");
  first = String();
  EXPECT_FALSE(first.Content());
  EXPECT_EQ(first, String()); // one of them holds a block
  const UniChar terminated[] = {u'a', u'b', 0, u'c'};
  EXPECT_EQ(Utf8(String(terminated) + String(terminated + 3, 1)), "abc");
  EXPECT_EQ(Units(String(terminated, 4)), std::u16string(u"ab\0c", 4));
}

TEST(String, ComparesByTheFirstDifferenceThenByTheNextCharacter)
{
  const std::tuple<std::u16string, std::u16string, Long, Long, Long> rows[] = {
      {u"", u"", 0, 0, 100000},
      {u"", u"a", -97, -65, 0},
      {u"b", u"", 98, 66, 0},
      {u"ab", u"a", 98, 66, 110},
      {u"abc", u"abd", -1, -1, 219}, // 110 + 109
      {u"aBc", u"abx", -32, 'C' - 'X', 210},
      {u"a", u"A", 32, 0, 100},
      {u"\u00E4\u00F6\u00FC", u"\u00C4\u00D6\u00DC", 32, 0, 300},
      {u"\u00E9", u"\u00C9", 32, 32, 0},                   // no case beyond the three umlauts
      {u"abcdefghijklx", u"abcdefghijkl", 'x', 'X', 1257}, // the bonus falls from 10 to 1 and stays there
  };
  for (const auto& [first, second, compare, lexCompare, similarity] : rows) {
    const String a = FromUnits(first), b = FromUnits(second);
    EXPECT_EQ(a.Compare(b), compare) << Utf8(a) << " " << Utf8(b);
    EXPECT_EQ(b.Compare(a), -compare);
    EXPECT_EQ(a.LexCompare(b), lexCompare) << Utf8(a) << " " << Utf8(b);
    EXPECT_EQ(a.Similarity(b), similarity) << Utf8(a) << " " << Utf8(b);
    EXPECT_EQ(a < b, compare < 0);
    EXPECT_EQ(a >= b, compare >= 0);
  }
  EXPECT_EQ(String("xxabc").ComparePart("abd", 2, 2), 0);
  EXPECT_EQ(String("xxabc").ComparePart("abd", 3, 2), 'c' - 'd');
  EXPECT_EQ(String("xxabc").ComparePart("abc", 9, 5), -'a');
}

TEST(String, FindsTheFirstAndTheLastPlace)
{
  const String text("abcAbcab");
  const std::tuple<const char*, Long, Long, Long, Long, Long> rows[] = {
      {"ab", 0, 0, 0, 0, 0},      {"ab", 1, 6, 3, 0, 0},   {"ab", 7, -1, -1, 6, 6}, // no longer fits: from the end
      {"abc", 1, -1, 3, 0, 0},    {"AB", 0, -1, 0, -1, 0}, {"", 0, -1, -1, -1, -1},
      {"ab", -2, -1, -1, -1, -1}, {"b", 8, -1, -1, 7, 7},  {"abcabcabc", 0, -1, -1, -1, -1},
      {"bc", 5, -1, -1, 4, 4},    {"C", 3, -1, 5, -1, 2},
  };
  for (const auto& [pattern, start, first, firstUpper, last, lastUpper] : rows) {
    using Find = Bool (String::*)(const String&, Long&, Long) const;
    const std::pair<Find, Long> finds[] = {{&String::FindFirst, first},
                                           {&String::FindFirstUpper, firstUpper},
                                           {&String::FindLast, last},
                                           {&String::FindLastUpper, lastUpper}};
    for (const auto& [find, expected] : finds) {
      Long at = 0;
      EXPECT_EQ((text.*find)(pattern, at, start), expected >= 0);
      EXPECT_EQ(at, expected) << pattern << " from " << start;
    }
  }
  Long at = 0;
  EXPECT_TRUE(text.FindLast("ab", at) && at == 6);
  EXPECT_TRUE(text.FindLast(u'A', at) && at == 3);
  EXPECT_TRUE(text.FindLastUpper(u'a', at) && at == 6);
  EXPECT_TRUE(text.FindFirstUpper(u'c', at, 3) && at == 5);
}

TEST(String, EditsWithinItsBounds)
{
  const std::tuple<std::function<void(String&)>, const char*> rows[] = {
      {[](String& s) { s.Delete(1, 2); }, "adef"},
      {[](String& s) { s.Delete(4, 9); }, "abcd"},
      {[](String& s) { s.Delete(-1, 2); }, "abcdef"},
      {[](String& s) { s.Delete(6, 1); }, "abcdef"},
      {[](String& s) { s.Delete(0, 0); }, "abcdef"},
      {[](String& s) { s.InsertChar(0, u'x'); }, "xabcdef"},
      {[](String& s) { s.InsertChar(7, u'x'); }, "abcdef"},
      {[](String& s) { s.Insert(2, "XYZ"); }, "abXYZcdef"},
      {[](String& s) { s.Insert(6, "XYZ", 1); }, "abcdefYZ"},
      {[](String& s) { s.Insert(0, "XYZ", 0, 1); }, "XYabcdef"},
      {[](String& s) { s.Insert(0, "XYZ", 2, 99); }, "Zabcdef"},
      {[](String& s) { s.Insert(0, "XYZ", 2, 1); }, "abcdef"},
      {[](String& s) { s.Insert(7, "XYZ"); }, "abcdef"},
      {[](String& s) { s.Insert(3, s); }, "abcabcdefdef"},
      {[](String& s) { s = s.SubStr(4, 9); }, "ef"},
      {[](String& s) { s = s.SubStr(-1, 3); }, ""},
      {[](String& s) { s = s.SubStr(6, 1); }, ""},
      {[](String& s) { s[2] = s[0]; }, "abadef"},
      {[](String& s) { s[6] = u'x'; }, "abcdef"},
      {[](String& s) { s[-1] = u'x'; }, "abcdef"},
      {[](String& s) { s = s.ToUpper(); }, "ABCDEF"},
  };
  for (const auto& [act, result] : rows) {
    String text("abcdef");
    act(text);
    EXPECT_EQ(Utf8(text), result);
  }
  const String text("ab");
  EXPECT_EQ(text[2], 0);
  EXPECT_EQ(text[-5], 0);
  EXPECT_EQ(Units(FromUnits(u"A\u00C4\u00C9\u0391[").ToLower()), u"a\u00E4\u00C9\u0391[");
}

TEST(String, PutsTheTerminatorAtTheLastPlaceOfAFullBuffer)
{
  UniChar buffer[4] = {9, 9, 9, 9};
  String("abc").GetUcBlock(buffer, 2);
  EXPECT_EQ(std::u16string(buffer, buffer + 4), u"ab\t\t");
  String("xyz").GetUcBlockNull(buffer, 3);
  EXPECT_EQ(std::u16string(buffer, buffer + 4), std::u16string(u"xy\0\t", 4));
  String("q").GetUcBlockNull(buffer, 4);
  EXPECT_EQ(std::u16string(buffer, buffer + 2), std::u16string(u"q\0", 2));
}

TEST(StringEncoding, WritesEachCharacterInTheFormOfItsEncoding)
{
  const String text = FromUnits(u"A\u00E9\u20AC\u4E2D");
  const std::tuple<StringEncoding, std::string> rows[] = {
      {STRINGENCODING_DEFAULT, "A\xE9\x80_"},
      {STRINGENCODING_TABLE, "A\xE9\x80_"},
      {STRINGENCODING_ASCII, "A___"},
      {STRINGENCODING_ESCAPED, "A\\u00E9\\u20AC\\u4E2D"},
      {STRINGENCODING_UTF8, "A\xC3\xA9\xE2\x82\xAC\xE4\xB8\xAD"},
      {STRINGENCODING_XML, "A&#x00E9;&#x20AC;&#x4E2D;"},
  };
  for (const auto& [encoding, bytes] : rows) {
    EXPECT_EQ(text.GetCStringLen(encoding), static_cast<Long>(bytes.size()));
    char* copy = text.GetCStringCopy(encoding);
    ASSERT_NE(copy, nullptr);
    EXPECT_EQ(std::string(copy), bytes);
    GeFree(copy);
  }
  EXPECT_EQ(String().GetCStringCopy(), nullptr);
  // Characters without a place in the table: 0, an unused byte of it, and 255, which it leaves out.
  char buffer[4];
  FromUnits(std::u16string(u"\0\u0081\u00FF", 3)).GetCString(buffer, 4);
  EXPECT_STREQ(buffer, "___");
}

TEST(StringEncoding, NeverWritesPastATinyBuffer)
{
  const std::tuple<StringEncoding, std::u16string, Long, std::string> rows[] = {
      {STRINGENCODING_UTF8, u"\u00E9", 2, ""},         {STRINGENCODING_UTF8, u"\u00E9", 3, "\xC3\xA9"},
      {STRINGENCODING_UTF8, u"\u00E9x", 2, "x"},       {STRINGENCODING_UTF8, u"\u4E2Dab", 3, "ab"},
      {STRINGENCODING_UTF8, u"\u07FF", 3, "\xDF\xBF"}, {STRINGENCODING_UTF8, u"\u0800", 4, "\xE0\xA0\x80"},
      {STRINGENCODING_ESCAPED, u"\u00E9b", 3, "_b"},   {STRINGENCODING_ESCAPED, u"\u00E9b", 7, "\\u00E9"},
      {STRINGENCODING_XML, u"\u00E9", 8, "_"},         {STRINGENCODING_XML, u"\u00E9", 9, "&#x00E9;"},
      {STRINGENCODING_DEFAULT, u"abcd", 3, "ab"},      {STRINGENCODING_DEFAULT, u"abcd", 1, ""},
  };
  for (const auto& [encoding, text, size, bytes] : rows) {
    std::vector<char> buffer(static_cast<std::size_t>(size)); // exact, so that an overrun is seen
    Long written = FromUnits(text).GetCString(buffer.data(), size, encoding);
    EXPECT_EQ(std::string(buffer.data()), bytes);
    EXPECT_EQ(written, static_cast<Long>(bytes.size()));
  }
  char untouched = 'u';
  EXPECT_EQ(String("a").GetCString(&untouched, 0), 0);
  EXPECT_EQ(untouched, 'u');
}

TEST(StringEncoding, ReadsBytesAsTheEncodingTells)
{
  using namespace std::string_literals;
  const std::tuple<StringEncoding, std::string, std::u16string> rows[] = {
      {STRINGENCODING_DEFAULT, "a\\", u"a\\"},
      {STRINGENCODING_DEFAULT, "\\u12", u"\\u12"},
      {STRINGENCODING_DEFAULT, "\\u00G9", u"\\u00G9"},
      {STRINGENCODING_DEFAULT, "\\u00e9x", u"\u00E9x"},
      {STRINGENCODING_DEFAULT, "\\u0000", u"_"},
      {STRINGENCODING_TABLE, "\x80\xE9\x9F", u"\u20AC\u00E9\u0178"},
      {STRINGENCODING_DEFAULT, "\201A", u"\u0001A"}, // no pair begins with it
      {STRINGENCODING_DEFAULT, "A\x81", u"A_"},
      {STRINGENCODING_DEFAULT, "\377A", u"\u0001A"},
      {STRINGENCODING_DEFAULT, "\0A"s, u"A"}, // a pair with the value of A
      {STRINGENCODING_ESCAPED, "\\u20AC\xE9", u"\u20AC\u00E9"},
      {STRINGENCODING_ESCAPED, "&#x00E9;", u"&#x00E9;"},
      {STRINGENCODING_ASCII, "~\x7F\xE9\\u00E9", u"~__\u00E9"},
      {STRINGENCODING_XML, "&#x00E9;&#x20AC\\u4E2D", u"\u00E9&#x20AC\u4E2D"},
      {STRINGENCODING_XML, "&#x00E9", u"&#x00E9"},
      {STRINGENCODING_UTF8, "A\xC3\xA9\xE4\xB8\xAD\\u00E9", u"A\u00E9\u4E2D\\u00E9"},
      {STRINGENCODING_UTF8, "\xE2\x80\x93\xE2\x80\x94", u"\n\u2014"},
      {STRINGENCODING_UTF8, "\xF0\x9F\x98\x80x", u"_x"},
      {STRINGENCODING_UTF8, "\xF8....x\xFC.....x\xFE......x", u"_x_x_x"},
      {STRINGENCODING_UTF8, "\xE2\x80", u"\u00E2\u0080"}, // cut short
      {STRINGENCODING_UTF8, "\xF0\x9F", u"\u00F0\u009F"},
      {STRINGENCODING_UTF8, "\xC3\x28", u"\u00E8"}, // the second byte is only masked
      {STRINGENCODING_UTF8, "\300\200a\0b"s, u"_a_b"},
  };
  for (const auto& [encoding, bytes, units] : rows) {
    String text;
    text.SetCString(bytes.data(), static_cast<Long>(bytes.size()), encoding);
    EXPECT_EQ(Units(text), units) << bytes << " in " << encoding;
  }
}

TEST(String, FormatsNumbers)
{
  EXPECT_EQ(Utf8(String::FromLong(-2147483647 - 1)), "-2147483648");
  EXPECT_EQ(Utf8(String::FromLLong(-9223372036854775807 - 1)), "-9223372036854775808");
  const std::tuple<Real, Long, Long, Bool, UniChar, const char*> rows[] = {
      {2.5, -1, -1, false, ' ', "2.5"},    {100.0, -1, -1, false, ' ', "1"}, // zeros before the point go too
      {0.25, -1, -1, false, ' ', "0.25"},  {-0.0, -1, -1, false, ' ', "0"},
      {0.0, -1, -1, false, ' ', "0"},      {-0.0, -1, 0, false, ' ', "0"},
      {-7.25, -1, 1, false, ' ', "-7.2"},  {2.5, -2, 2, false, ' ', "2.5"},
      {2.5, 4, 2, false, '0', "0002.50"},  {-2.5, 4, 2, false, '0', "-002.50"},
      {-2.5, 4, 1, false, '*', "-**2.5"},  {7.0, 3, 0, false, ' ', "  7"},
      {2.5, -1, 2, true, ' ', "2.50E+00"}, {1000.0, -2, 2, true, ' ', "1E+03"},
      {0.0, -2, 2, true, ' ', "0E+00"},    {1e40, -1, 1, false, ' ', "10000000000000000303786028427003666890752.0"},
  };
  for (const auto& [value, before, behind, exponent, fill, text] : rows)
    EXPECT_EQ(Utf8(String::FromReal(value, before, behind, exponent, fill)), text);
  EXPECT_EQ(String::FromReal(1.0, 2000000000, 2000000000).GetLength(), 20001);
}

TEST(String, StaysEmptyWhenMemoryRunsOut)
{
  const String source(40, u's');
  const std::vector<std::function<void(String&)>> acts = {
      [&](String& s) { s = source; },
      [&](String& s) { s.Append(source); },
      [&](String& s) { s = s.Concat(source); },
      [&](String& s) { s.InsertChar(0, u'x'); },
      [&](String& s) { s.Insert(3, source); },
      [&](String& s) { s.FillChars(100, u'x'); },
      [&](String& s) { s = source.ToUpper(); },
      [&](String& s) { EXPECT_EQ(s.SetLengthNC(17), nullptr); },
      [&](String& s) { s = String::FromReal(1.0, 100, 0); },
      [&](String& s) { s.SetCString("seventeen letters", 17); },
  };
  for (const auto& act : acts) {
    String text(16, u't');
    counting_memory::FailAfter(0);
    act(text);
    counting_memory::FailNever();
    EXPECT_EQ(text.GetLength(), 0);
    EXPECT_EQ(text, String());
  }
  String text("cut");
  EXPECT_EQ(text.SetLengthNC(0x7FFFFFFF), nullptr); // more than any block may have
  EXPECT_EQ(text.SetLengthNC(-1), nullptr);
  EXPECT_NE(text.SetLengthNC(0), nullptr);
}

TEST(String, KeepsItsBlockAfterShutdown)
{
  const void* kept = nullptr;
  {
    const String text("static");
    kept = text.Data();
    String::SetShutdown(true);
  }
  String::SetShutdown(false);
  void* block = const_cast<void*>(kept);
  MemFree(&block); // still there to be freed
}

} // namespace
