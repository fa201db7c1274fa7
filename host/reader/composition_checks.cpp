#include "host/reader/composition_checks.h"

#include "host/text.h"

#include <algorithm>
#include <unordered_map>

namespace host
{

void CheckParents(const JsonDocument& document, const LayerList& list)
{
  // Each layer is visited once: a walk ends at a layer of an earlier walk, and loops when it meets its own.
  std::unordered_map<const Layer*, std::size_t> walkOf;
  const std::vector<Layer*>& layers = list.composition->layers;
  for (std::size_t walk = 0; walk < layers.size(); ++walk) {
    const Layer* layer = layers[walk];
    while (layer && walkOf.try_emplace(layer, walk).second)
      layer = layer->parent;
    if (layer && walkOf[layer] == walk)
      document.RefuseMember(*list.layers[walk], "parent", "the chain of parents loops");
  }
}

namespace
{

class NestingCheck
{
 public:
  NestingCheck(const JsonDocument& document, const std::vector<LayerList>& lists)
      : document_(document), lists_(lists), states_(lists.size())
  {
    for (std::size_t i = 0; i < lists.size(); ++i)
      indexOf_[lists[i].composition] = i;
  }

  void Run()
  {
    for (std::size_t i = 0; i < lists_.size(); ++i)
      if (!states_[i].isEntered)
        Walk(i);
  }

 private:
  struct State
  {
    bool isEntered = false;
    bool isLeft = false;
    std::size_t nextLayer = 0;
    std::size_t nesting = 1;
    std::size_t unfolded = 0;
  };

  // Depth first, without recursion.
  void Walk(std::size_t start)
  {
    std::vector<std::size_t> stack;
    const auto enter = [&](std::size_t index) {
      states_[index].isEntered = true;
      stack.push_back(index);
    };
    enter(start);
    while (!stack.empty()) {
      const std::size_t index = stack.back();
      const std::size_t inner = Advance(index);
      if (inner != kNone) {
        enter(inner);
        continue;
      }
      states_[index].isLeft = true;
      stack.pop_back();
    }
  }

  // Counts the layers of a composition up to one whose composition has not been walked yet, which is given back.
  std::size_t Advance(std::size_t index)
  {
    State& state = states_[index];
    const std::vector<Layer*>& layers = lists_[index].composition->layers;
    for (; state.nextLayer < layers.size(); ++state.nextLayer) {
      const Item* source = layers[state.nextLayer]->source;
      if (!source || !source->composition) {
        Count(index, 1, 1);
        continue;
      }
      const std::size_t inner = indexOf_.at(source->composition);
      if (!states_[inner].isEntered)
        return inner;
      if (!states_[inner].isLeft)
        document_.RefuseMember(*lists_[index].layers[state.nextLayer], "refId",
                               "composition " + Quoted(source->name) + " contains itself");
      Count(index, 1 + states_[inner].unfolded, 1 + states_[inner].nesting);
    }
    return kNone;
  }

  void Count(std::size_t index, std::size_t layers, std::size_t nesting)
  {
    State& state = states_[index];
    state.unfolded += layers; // neither is above the limit, so the sum can't overflow
    state.nesting = std::max(state.nesting, nesting);
    if (state.unfolded > kMaxUnfoldedLayers)
      document_.Refuse(*lists_[index].json, "unfolds to more than " + std::to_string(kMaxUnfoldedLayers) + " layers");
    if (state.nesting > kMaxNesting)
      document_.Refuse(*lists_[index].json, "compositions nested deeper than " + std::to_string(kMaxNesting));
  }

  static constexpr std::size_t kNone = static_cast<std::size_t>(-1);

  const JsonDocument& document_;
  const std::vector<LayerList>& lists_;
  std::vector<State> states_;
  std::unordered_map<const Composition*, std::size_t> indexOf_;
};

} // namespace

void CheckNesting(const JsonDocument& document, const std::vector<LayerList>& lists)
{
  NestingCheck(document, lists).Run();
}

} // namespace host
