// The words and numbers of a photometric text file, line by line.
#pragma once

#include <initializer_list>

#include "torvane/memory/private_ge_mtools.h"
#include "torvane/text/ge_string.h"

namespace _torvane_
{

class BaseFile;

class IESWords
{
 public:
  explicit IESWords(BaseFile& file) : file_(file) {}

  // Goes to the next line, past empty ones; false at the end of the file. What goes beyond the longest line is a line
  // of its own.
  Bool NextLine();
  // The next word of the line, with the separator behind it taken too. An empty word stands before a comma or an equals
  // sign that no word precedes. False at the end of the line.
  Bool TakeWord();
  const char* GetWord() const { return word_; }
  // What remains of the line, without the blanks before it.
  String TakeText();

  // Numbers take no notice of lines. False at the end of the file, and for a word that is no number.
  Bool TakeNumber(Real& value);
  // Loses what stands behind the point, and stays within a Long.
  Bool TakeInteger(Long& value);
  Bool TakeNumbers(std::initializer_list<Real*> values);
  Bool DropNumbers(Long count);
  // No count is trusted for memory: the table grows as its numbers come.
  Bool TakeTable(GeTempDynArray<Real>& table, Long count);

 private:
  static constexpr LLong kBufferSize = 1024;
  static constexpr Long kMaxLine = 512;
  static constexpr Long kMaxWord = 256;

  Bool NextByte(char& byte);

  BaseFile& file_;
  char buffer_[kBufferSize];
  LLong bufferCount_ = 0;
  LLong bufferPosition_ = 0;
  char line_[kMaxLine + 1];
  Long linePosition_ = 0;
  char word_[kMaxWord + 1];
};

} // namespace _torvane_
