// The library's text: a counted array of UTF-16 code units, taken one by one (surrogates get no special care).
#pragma once

#include <compare>
#include <cstddef>

#include "torvane/types.h"

namespace _torvane_
{

// How text enters and leaves as bytes. The code page table is Windows-1252.
enum StringEncoding : Long
{
  STRINGENCODING_DEFAULT = 0, // the code page table, "_" for what it lacks; reading also takes "\uXXXX"
  STRINGENCODING_TABLE = 1,   // as STRINGENCODING_DEFAULT
  STRINGENCODING_ASCII = 2,   // 7 bits, "_" for all others (reading: from 127 on); reading also takes "\uXXXX"
  STRINGENCODING_ESCAPED = 3, // "\uXXXX" above 127
  STRINGENCODING_UTF8 = 4,    // one to three bytes a character
  STRINGENCODING_XML = 5,     // "&#xXXXX;" above 127
};

// A string that cannot get memory becomes empty and reports nothing: callers that care look at its length. The block
// holds no terminator; its capacity is 0 or a multiple of 16 characters. Empty strings are equal whether or not they
// hold a block. One thread at a time.
class String
{
 public:
  String() noexcept = default;
  String(const String& other) noexcept;
  String(String&& other) noexcept;
  // Bytes up to the terminator, decoded: by the code page table, unless told otherwise. What isn't plain ASCII is
  // mostly UTF-8: FromUtf8. A null pointer gives the empty string.
  String(const char* text, StringEncoding encoding = STRINGENCODING_DEFAULT) noexcept;
  // `count` characters, or -1 for all up to a terminating 0. A null pointer gives the empty string.
  explicit String(const UniChar* text, Long count = -1) noexcept;
  String(Long count, UniChar fill) noexcept;
  ~String();

  // A constant text, which isn't copied until the string changes: characters without a terminator.
  template <std::size_t size>
  [[nodiscard]] static String Constant(const UniChar (&text)[size]) noexcept
  {
    String string;
    string.block_ = const_cast<UniChar*>(text); // never written to: there is no capacity
    string.length_ = static_cast<Long>(size);
    return string;
  }

  String& operator=(const String& other) noexcept;
  String& operator=(String&& other) noexcept;

  void Assign(const String& other) noexcept { *this = other; }
  void Append(const String& other) noexcept;
  // This string followed by the other one.
  [[nodiscard]] String Concat(const String& other) const noexcept;
  String& operator+=(const String& other) noexcept
  {
    Append(other);
    return *this;
  }
  friend String operator+(const String& a, const String& b) noexcept { return a.Concat(b); }

  Long GetLength() const noexcept { return length_; }
  // In characters.
  Long GetCapacity() const noexcept { return capacity_; }
  // True if the string holds a character.
  Bool Content() const noexcept { return block_ && length_ != 0; }
  // The characters, GetLength() of them, without a terminator; null while there is no block.
  const UniChar* Data() const noexcept { return block_; }

  // Makes room for `count` characters with undefined content, makes that the length, and gives the place to write
  // them. The former text is lost. Null for a negative count or when memory is short (the string is then empty); for
  // a count of 0 a pointer that is not null and not to be written to.
  [[nodiscard]] UniChar* SetLengthNC(Long count) noexcept;

  // Cuts a block that has more than 16 characters of room to spare; an empty string gives its block back.
  void Trim() noexcept;

  // The difference of the first characters that differ; at an equal prefix the next character of the longer string,
  // negative if that is `other`; 0 for equal texts.
  Long Compare(const String& other) const noexcept;
  // As Compare, of the text from `position` on with `other`, looking at no more than `count` characters of each. A
  // position outside the text compares as the empty string.
  Long ComparePart(const String& other, Long count, Long position) const noexcept;
  // As Compare, both sides in upper case (see ToUpper).
  Long LexCompare(const String& other) const noexcept;
  // 100000 for equal texts. Otherwise 100 for each character of the common prefix without regard to case, and, for
  // each that is equal as it stands, a bonus that falls with every such match from 10 to 1.
  Long Similarity(const String& other) const noexcept;

  friend Bool operator==(const String& a, const String& b) noexcept { return a.Compare(b) == 0; }
  friend std::weak_ordering operator<=>(const String& a, const String& b) noexcept { return a.Compare(b) <=> 0; }

  // The first place of `pattern` at or after `start`. True if there is one; `position` is -1 otherwise. An empty
  // pattern and a start outside the text find nothing. The Upper forms compare in upper case.
  Bool FindFirst(const String& pattern, Long& position, Long start = 0) const noexcept;
  Bool FindFirst(UniChar pattern, Long& position, Long start = 0) const noexcept;
  Bool FindFirstUpper(const String& pattern, Long& position, Long start = 0) const noexcept;
  Bool FindFirstUpper(UniChar pattern, Long& position, Long start = 0) const noexcept;
  // The last place at or before `start`; -1 and a start where the pattern does not fit begin at the last place where
  // it does.
  Bool FindLast(const String& pattern, Long& position, Long start = -1) const noexcept;
  Bool FindLast(UniChar pattern, Long& position, Long start = -1) const noexcept;
  Bool FindLastUpper(const String& pattern, Long& position, Long start = -1) const noexcept;
  Bool FindLastUpper(UniChar pattern, Long& position, Long start = -1) const noexcept;

  // Removes up to `count` characters from `position` on. A position outside the text and a count below 1 do nothing.
  void Delete(Long position, Long count) noexcept;
  // Positions run from 0 to the length; any other does nothing. A full block grows by 16 characters.
  void InsertChar(Long position, UniChar character) noexcept;
  // Inserts the characters `first` to `last`, both included, of `source`; -1 stands for its first and its last
  // character. Positions as for InsertChar.
  void Insert(Long position, const String& source, Long first = -1, Long last = -1) noexcept;
  // Up to `count` characters from `position` on; empty for a position outside the text and a count below 1.
  [[nodiscard]] String SubStr(Long position, Long count) const noexcept;

  // Only a to z and the characters 228, 246 and 252 have an upper case here; only A to Z and 196, 214 and 220 a lower.
  [[nodiscard]] String ToUpper() const noexcept;
  [[nodiscard]] String ToLower() const noexcept;

  // The bytes of the encoded text, without a terminator.
  Long GetCStringLen(StringEncoding encoding = STRINGENCODING_DEFAULT) const noexcept;
  // Writes at most size - 1 bytes and a terminator; gives the bytes written without it. A form of several bytes that
  // no longer fits becomes "_" (escaped and XML) or is dropped (UTF-8). A size below 1 writes nothing and gives 0.
  Long GetCString(char* buffer, Long size, StringEncoding encoding = STRINGENCODING_DEFAULT) const noexcept;
  // The encoded text in a block of its own, terminated, which the caller frees with GeFree. Null for the empty string
  // and when memory is short.
  [[nodiscard]] char* GetCStringCopy(StringEncoding encoding = STRINGENCODING_DEFAULT) const noexcept;
  // Decodes `length` bytes, or -1 for all up to the terminator. Characters of value 0 become "_".
  void SetCString(const char* text, Long length = -1, StringEncoding encoding = STRINGENCODING_DEFAULT) noexcept;

  // Copies up to `count` characters.
  void GetUcBlock(UniChar* buffer, Long count) const noexcept;
  // As GetUcBlock with a terminating 0, which takes the last place of the buffer when the text fills it.
  void GetUcBlockNull(UniChar* buffer, Long count) const noexcept;
  // `count` characters, or -1 for all up to a terminating 0.
  void SetUcBlock(const UniChar* text, Long count = -1) noexcept;

  void FillChars(Long count, UniChar character) noexcept;

  // One character of a string. Outside the text it reads 0 and takes no writes.
  class CharRef
  {
   public:
    CharRef(String& string, Long index) noexcept
        : string_(string), index_(index >= 0 && index < string.length_ ? index : -1)
    {}
    operator UniChar() const noexcept { return index_ < 0 ? UniChar{0} : string_.block_[index_]; }
    CharRef(const CharRef&) noexcept = default;
    CharRef& operator=(const CharRef& other) noexcept { return *this = static_cast<UniChar>(other); }
    CharRef& operator=(UniChar character) noexcept
    {
      if (index_ >= 0 && string_.Reserve(string_.length_, true))
        string_.block_[index_] = character;
      return *this;
    }

   private:
    String& string_;
    Long index_;
  };
  CharRef operator[](Long index) noexcept { return {*this, index}; }
  UniChar operator[](Long index) const noexcept { return index >= 0 && index < length_ ? block_[index] : UniChar{0}; }

  // The text of UTF-8 bytes: `length` of them, or -1 for all up to the terminator.
  [[nodiscard]] static String FromUtf8(const char* text, Long length = -1) noexcept;
  // As GetCStringCopy, in UTF-8.
  [[nodiscard]] char* GetUtf8Copy() const noexcept { return GetCStringCopy(STRINGENCODING_UTF8); }

  [[nodiscard]] static String FromLong(Long value) noexcept;
  [[nodiscard]] static String FromLLong(LLong value) noexcept;
  // A number with `before` places in front of the point, padded with `fill`, and `behind` after it (at most 10000
  // each). A `before` of -1 pads nothing; -2 also strips zeros at the end, and so does a `behind` below 0, which means
  // 3 places. Stripping walks on past the point: 2.500 becomes "2.5", 100.000 becomes "1"; of a zero, "0" remains.
  [[nodiscard]] static String FromReal(Real value, Long before = -1, Long behind = -1, Bool exponent = false,
                                       UniChar fill = u' ') noexcept;

  // From this call on strings no longer give their blocks back: for programs whose memory hooks end before their
  // static strings do. False takes it back.
  static void SetShutdown(Bool shutdown) noexcept;

 private:
  Bool Reserve(LLong count, Bool keepText) noexcept;
  Bool OpenGap(Long position, Long count) noexcept;
  void Release() noexcept;

  Long capacity_ = 0; // 0 with a block: that of a constant
  Long length_ = 0;
  UniChar* block_ = nullptr;
};

} // namespace _torvane_
