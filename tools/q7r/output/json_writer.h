// Writes JSON as it is told, in a buffer of fixed size. Text that isn't UTF-8 gets U+FFFD for each byte that is wrong;
// numbers keep all digits and read back the same; what no JSON holds (NaN, the infinities) is null.
#pragma once

#include <cstdint>
#include <memory>
#include <string>
#include <vector>

#include "output/value_sink.h"

namespace q7r
{

class JsonWriter final : public ValueSink
{
 public:
  // Where the text goes, piece by piece. May throw.
  using Output = void (*)(std::string_view piece);

  explicit JsonWriter(Output output);

  void BeginObject(Layout layout = Layout::kLines) override { Begin('{', layout); }
  void EndObject() override { End('}'); }
  void BeginArray(Layout layout = Layout::kLines) override { Begin('[', layout); }
  void EndArray() override { End(']'); }
  void Key(std::string_view name) override;
  void Null() override;
  void Bool(bool value) override;
  void Integer(long long value) override;
  void Unsigned(unsigned long long value) override;
  void Real(double value) override;
  void Text(std::string_view utf8) override;
  void Rows(const NumberRows& rows) override;
  void Time(double numerator, double denominator) override;
  void Link(const void* target, std::string_view name) override;

  // A text that comes in pieces, none of which cuts a character in two.
  void BeginText();
  void AppendText(std::string_view utf8) { PutEscaped(utf8); }
  void EndText() { Put('"'); }

  // Ends the line and hands over what is pending. To be called behind each whole value; without it a part is lost.
  void Finish();
  void Flush();
  // Ends the line alone: more objects follow, one a line, and Flush behind the last.
  void NextLine() { Put('\n'); }

 private:
  struct Level
  {
    Layout layout;
    bool isEmpty;
  };

  void Begin(char bracket, Layout layout);
  void End(char bracket);
  void Separate();
  void NewLine();
  void Put(char c);
  void Put(std::string_view text);
  void PutEscaped(std::string_view utf8);
  void PutNumber(double value, bool whole);
  void PutRow(const NumberRows& rows, const double* row);
  char* Reserve(std::size_t size); // room at the end of the buffer

  static constexpr std::size_t kBufferSize = 1 << 16;

  Output output_;
  std::unique_ptr<char[]> buffer_;
  std::size_t used_ = 0;
  bool isNamed_ = false; // a key was told, its value is due
  std::vector<Level> levels_;
};

} // namespace q7r
