#include "compare/node_record.h"

#include <algorithm>
#include <cmath>

#include "listing/json_text.h"
#include "output/number_text.h"

namespace q7r
{

namespace
{

std::string RowsText(const RowsValue& rows)
{
  constexpr long long kMost = 12; // more are counted
  if (rows.Form().perRow > 1 || rows.Count() > kMost)
    return std::to_string(rows.Count()) + (rows.Count() == 1 ? " entry" : " entries");
  std::string text;
  for (long long i = 0; i < rows.Count(); ++i) {
    double number = 0;
    rows.Get(i, &number);
    text += (i == 0 ? "" : ", ") + NumberText(number);
  }
  return "(" + text + ")";
}

double Seconds(const TimeValue& time) { return time.denominator != 0.0 ? time.numerator / time.denominator : 0.0; }

// A number of either kind, for those that mean one thing by both.
const double* AsNumber(const Value& value, double& place)
{
  if (const auto* integer = std::get_if<long long>(&value))
    place = static_cast<double>(*integer);
  else if (const auto* real = std::get_if<double>(&value))
    place = *real;
  else
    return nullptr;
  return &place;
}

template <class... Cases>
struct Overloaded : Cases...
{
  using Cases::operator()...;
};
template <class... Cases>
Overloaded(Cases...) -> Overloaded<Cases...>;

} // namespace

RowsValue::RowsValue(const NumberRows& rows) : rows_(rows)
{
  if (rows.lasts)
    return;
  kept_.resize(static_cast<std::size_t>(rows.count * rows.perRow));
  for (long long i = 0; i < rows.count; ++i)
    rows.get(rows.entries, i, kept_.data() + i * rows.perRow);
}

void RowsValue::Get(long long index, double* row) const
{
  if (rows_.lasts)
    rows_.get(rows_.entries, index, row);
  else
    std::copy_n(kept_.data() + index * rows_.perRow, rows_.perRow, row);
}

void TellValue(ValueSink& sink, const Value& value)
{
  std::visit(Overloaded{[&](std::monostate) { sink.Null(); }, [&](bool truth) { sink.Bool(truth); },
                        [&](long long number) { sink.Integer(number); },
                        [&](unsigned long long number) { sink.Unsigned(number); },
                        [&](double number) { sink.Real(number); }, [&](const std::string& text) { sink.Text(text); },
                        [&](const TimeValue& time) { sink.Time(time.numerator, time.denominator); },
                        [&](const LinkValue& link) { sink.Link(link.target, link.name); },
                        [&](const RowsValue& rows) {
                          NumberRows all = rows.Form();
                          all.entries = &rows;
                          all.get = [](const void* entries, long long index, double* row) {
                            static_cast<const RowsValue*>(entries)->Get(index, row);
                          };
                          sink.Rows(all);
                        }},
             value);
}

std::string ValueText(const Value& value)
{
  return std::visit(Overloaded{[](std::monostate) -> std::string { return "none"; },
                               [](bool truth) -> std::string { return truth ? "true" : "false"; },
                               [](long long number) { return std::to_string(number); },
                               [](unsigned long long number) { return std::to_string(number); },
                               [](double number) { return NumberText(number); },
                               [](const std::string& text) { return JsonText(text); },
                               [](const TimeValue& time) { return NumberText(Seconds(time)) + " s"; },
                               [](const LinkValue& link) { return link.target ? "-> " + JsonText(link.name) : "none"; },
                               [](const RowsValue& rows) { return RowsText(rows); }},
                    value);
}

bool Comparison::AreEqual(double a, double b) const
{
  return a == b || (std::isnan(a) && std::isnan(b)) || std::fabs(a - b) <= tolerance;
}

bool Comparison::AreEqual(const RowsValue& a, const RowsValue& b) const
{
  if (a.Count() != b.Count() || a.Form().perRow != b.Form().perRow)
    return false;
  double rowA[NumberRows::kMostInRow];
  double rowB[NumberRows::kMostInRow];
  for (long long i = 0; i < a.Count(); ++i) {
    a.Get(i, rowA);
    b.Get(i, rowB);
    if (!std::equal(rowA, rowA + a.Form().perRow, rowB, [this](double x, double y) { return AreEqual(x, y); }))
      return false;
  }
  return true;
}

bool Comparison::AreEqual(const Value& a, const Value& b) const
{
  double numberA = 0;
  double numberB = 0;
  if (AsNumber(a, numberA) && AsNumber(b, numberB))
    return AreEqual(numberA, numberB);
  if (a.index() != b.index())
    return false;
  return std::visit(
      Overloaded{[&](const TimeValue& time) { return AreEqual(Seconds(time), Seconds(std::get<TimeValue>(b))); },
                 [&](const LinkValue& link) {
                   const void* other = std::get<LinkValue>(b).target;
                   const auto partner = partners.find(link.target);
                   return link.target ? partner != partners.end() && partner->second == other : !other;
                 },
                 [&](const RowsValue& rows) { return AreEqual(rows, std::get<RowsValue>(b)); },
                 [&](const auto& other) { return other == std::get<std::decay_t<decltype(other)>>(b); }},
      a);
}

std::string NodeRecord::NextKey()
{
  if (levels_.empty())
    return std::move(name_);
  Level& level = levels_.back();
  const std::string name = level.next < 0 ? std::move(name_) : std::to_string(level.next++);
  return level.path.empty() ? name : level.path + "/" + name;
}

const std::vector<NodeRecord::Entry>& NodeRecord::Sorted()
{
  std::stable_sort(entries_.begin(), entries_.end(), [](const Entry& a, const Entry& b) { return a.key < b.key; });
  return entries_;
}

} // namespace q7r
