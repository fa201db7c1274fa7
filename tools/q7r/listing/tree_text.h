// A scene as lines for people: what a SceneTeller tells, but for what only programs want.
#pragma once

#include <string>
#include <vector>

#include "output/value_sink.h"

namespace q7r
{

class TreeText final : public ValueSink
{
 public:
  using Output = void (*)(std::string_view line);

  explicit TreeText(Output output) : output_(output) {}

  void BeginObject(Layout layout = Layout::kLines) override;
  void EndObject() override;
  void BeginArray(Layout layout = Layout::kLines) override;
  void EndArray() override { levels_.pop_back(); }
  void Key(std::string_view name) override { key_ = name; }
  void Null() override {}
  void Bool(bool) override {}
  void Integer(long long value) override;
  void Unsigned(unsigned long long) override {}
  void Real(double) override {}
  void Text(std::string_view utf8) override;
  void Rows(const NumberRows& rows) override;
  void Time(double, double) override {}
  void Link(const void* target, std::string_view name) override;

 private:
  // How the members of a list are shown.
  struct ListForm
  {
    const char* list;
    const char* heading; // of a list of the whole scene
    const char* prefix;
    const char* gap; // in front of the words about a member
  };
  static const ListForm kLists[];
  enum class Kind
  {
    kNode,
    kList,
    kOther,
  };
  struct Level
  {
    Kind kind;
    const ListForm* form; // of a list, and of a node the list that it stands in
  };

  bool IsInNode() const { return !levels_.empty() && levels_.back().kind == Kind::kNode; }
  void BeginNode(const ListForm& form);
  const ListForm* FormOfKey() const;
  void PrintNode();
  void Print(std::string_view line) const;

  Output output_;
  std::string key_;
  std::vector<Level> levels_;
  std::size_t depth_ = 0;  // of nodes
  bool isPending_ = false; // a node that isn't printed yet; its parts:
  std::string type_;
  std::string name_;
  std::string details_;
  std::string summary_;
};

} // namespace q7r
