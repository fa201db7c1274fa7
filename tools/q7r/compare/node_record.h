// What is told of one node, kept to be compared with what is told of another.
#pragma once

#include <string>
#include <unordered_map>
#include <variant>
#include <vector>

#include "output/value_sink.h"

namespace q7r
{

struct LinkValue
{
  const void* target;
  std::string name;
};

struct TimeValue
{
  double numerator;
  double denominator;
};

// An array of numbers: where the scene holds it, or kept here.
class RowsValue
{
 public:
  explicit RowsValue(const NumberRows& rows);

  long long Count() const { return rows_.count; }
  const NumberRows& Form() const { return rows_; }
  void Get(long long index, double* row) const;

 private:
  NumberRows rows_;
  std::vector<double> kept_;
};

using Value = std::variant<std::monostate, bool, long long, unsigned long long, double, std::string, TimeValue,
                           LinkValue, RowsValue>;

void TellValue(ValueSink& sink, const Value& value);
// For people: "3.5", "\"text\"", "(1, 2, 3)", "1.5 s", "-> name", "none".
std::string ValueText(const Value& value);

// Which values count as equal.
struct Comparison
{
  double tolerance = 0.0;                                // of numbers
  std::unordered_map<const void*, const void*> partners; // the node of the second scene that one of the first is
  bool AreEqual(double a, double b) const;
  bool AreEqual(const Value& a, const Value& b) const;
  bool AreEqual(const RowsValue& a, const RowsValue& b) const;
};

// The values of one node with the names above them, joined by "/": "data/500". Elements of arrays are named by their
// places.
class NodeRecord final : public ValueSink
{
 public:
  struct Entry
  {
    std::string key;
    Value value;
  };

  void BeginObject(Layout = Layout::kLines) override { Begin(-1); }
  void EndObject() override { levels_.pop_back(); }
  void BeginArray(Layout = Layout::kLines) override { Begin(0); }
  void EndArray() override { levels_.pop_back(); }
  void Key(std::string_view name) override { name_ = name; }
  void Null() override { Add({}); }
  void Bool(bool value) override { Add(value); }
  void Integer(long long value) override { Add(value); }
  void Unsigned(unsigned long long value) override { Add(value); }
  void Real(double value) override { Add(value); }
  void Text(std::string_view utf8) override { Add(std::string(utf8)); }
  void Rows(const NumberRows& rows) override { Add(RowsValue(rows)); }
  void Time(double numerator, double denominator) override { Add(TimeValue{numerator, denominator}); }
  void Link(const void* target, std::string_view name) override { Add(LinkValue{target, std::string(name)}); }

  // By key; entries of one key in the order in which they came.
  const std::vector<Entry>& Sorted();

 private:
  struct Level
  {
    std::string path;
    long long next; // of an array: the place of the next element; -1 for an object
  };

  std::string NextKey();
  void Begin(long long first) { levels_.push_back({NextKey(), first}); }
  void Add(Value value) { entries_.push_back({NextKey(), std::move(value)}); }

  std::string name_;
  std::vector<Level> levels_;
  std::vector<Entry> entries_;
};

} // namespace q7r
