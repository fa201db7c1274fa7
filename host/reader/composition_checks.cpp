#include "host/reader/composition_checks.h"

#include <algorithm>
#include <unordered_map>

#include "host/text.h"

namespace host
{

void CheckParents(const Composition& composition, const RefuseLayer& refuse)
{
  // Each layer is visited once: a walk ends at a layer of an earlier walk, and loops when it meets its own.
  std::unordered_map<const Layer*, std::size_t> walkOf;
  const std::vector<Layer*>& layers = composition.layers;
  for (std::size_t walk = 0; walk < layers.size(); ++walk) {
    const Layer* layer = layers[walk];
    while (layer && walkOf.try_emplace(layer, walk).second)
      layer = layer->parent;
    if (layer && walkOf[layer] == walk)
      refuse(composition, walk, "parent", "the chain of parents loops");
  }
}

namespace
{

class NestingCheck
{
 public:
  NestingCheck(const Project& project, const RefuseLayer& refuse)
      : compositions_(project.compositions), refuse_(refuse), states_(compositions_.size())
  {
    for (std::size_t i = 0; i < compositions_.size(); ++i)
      indexOf_[&compositions_[i]] = i;
  }

  void Run()
  {
    for (std::size_t i = 0; i < compositions_.size(); ++i)
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
    const std::vector<Layer*>& layers = compositions_[index].layers;
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
        refuse_(compositions_[index], state.nextLayer, "source",
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
      refuse_(compositions_[index], kNoLayer, "",
              "unfolds to more than " + std::to_string(kMaxUnfoldedLayers) + " layers");
    if (state.nesting > kMaxNesting)
      refuse_(compositions_[index], kNoLayer, "", "compositions nested deeper than " + std::to_string(kMaxNesting));
  }

  static constexpr std::size_t kNone = static_cast<std::size_t>(-1);

  const std::deque<Composition>& compositions_;
  const RefuseLayer& refuse_;
  std::vector<State> states_;
  std::unordered_map<const Composition*, std::size_t> indexOf_;
};

} // namespace

void CheckNesting(const Project& project, const RefuseLayer& refuse) { NestingCheck(project, refuse).Run(); }

} // namespace host
