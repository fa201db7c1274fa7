// Values in objects and arrays, told one after another, so that nobody needs the whole of them.
#pragma once

#include <string_view>
#include <type_traits>

namespace q7r
{

// An array of numbers, or of rows of them, that lies somewhere in memory: told as one thing because there may be
// millions.
struct NumberRows
{
  static constexpr int kMostInRow = 12;

  const void* entries = nullptr;
  long long count = 0;
  int perRow = 1;     // 1: plain numbers
  int perGroup = 0;   // other than 0: rows of rows, such as four corners of three numbers
  bool whole = true;  // whole numbers
  bool lasts = false; // the entries stay where they are after the call
  // Fills in the numbers of one row.
  void (*get)(const void* entries, long long index, double* row) = nullptr;
};

class ValueSink
{
 public:
  // How a listing for people and programs sets it out: one member a line, or all on one line, with all that it holds.
  enum class Layout
  {
    kLines,
    kLine,
  };

  virtual ~ValueSink() = default;

  virtual void BeginObject(Layout layout = Layout::kLines) = 0;
  virtual void EndObject() = 0;
  virtual void BeginArray(Layout layout = Layout::kLines) = 0;
  virtual void EndArray() = 0;
  // The name of the value that comes next, within an object.
  virtual void Key(std::string_view name) = 0;
  virtual void Null() = 0;
  virtual void Bool(bool value) = 0;
  virtual void Integer(long long value) = 0;
  virtual void Unsigned(unsigned long long value) = 0;
  virtual void Real(double value) = 0;
  virtual void Text(std::string_view utf8) = 0;
  virtual void Rows(const NumberRows& rows) = 0;
  // In seconds, as a fraction.
  virtual void Time(double numerator, double denominator) = 0;
  // A thing elsewhere: its name for people, and what it is in memory (null: nothing, and no name).
  virtual void Link(const void* target, std::string_view name) = 0;

  // A member of an object.
  template <class Number, std::enable_if_t<std::is_arithmetic_v<Number>, int> = 0>
  void Member(std::string_view name, Number value)
  {
    Key(name);
    if constexpr (std::is_same_v<Number, bool>)
      Bool(value);
    else if constexpr (std::is_floating_point_v<Number>)
      Real(value);
    else if constexpr (std::is_signed_v<Number>)
      Integer(value);
    else
      Unsigned(value);
  }
  void Member(std::string_view name, std::string_view utf8) { Key(name), Text(utf8); }
  void Member(std::string_view name, const char* utf8) { Key(name), Text(utf8); }
};

} // namespace q7r
