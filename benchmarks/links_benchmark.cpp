// Links and goals that are found again across a read, registered in no order at all.
#include <algorithm>
#include <memory>
#include <numeric>
#include <random>
#include <vector>

#include "measure.h"
#include "torvane/links/alias.h"

namespace
{

using namespace _torvane_;
using namespace benchmarks;

void RegisterShuffledLinksAndGoals(benchmark::State& state)
{
  const auto count = static_cast<std::size_t>(state.range(0));
  // Below `count` the number stands for a goal, else for the link to the goal `count` before it.
  std::vector<std::size_t> order(2 * count);
  std::iota(order.begin(), order.end(), std::size_t{0});
  std::shuffle(order.begin(), order.end(), std::mt19937_64(7));
  RunFresh(state, [&] {
    std::vector<GeAliasGoal> goals(count);
    std::vector<GeAliasLink> links(count);
    const Run run = Measure([&] {
      TransArray translation;
      for (std::size_t number : order) {
        const GeAliasID id = number % count + 1;
        if (number < count)
          translation.RegisterGoal(id, goals[number]);
        else
          translation.RegisterLink(id, links[number - count], nullptr);
      }
      translation.FinishTranslation(false);
    });
    for (std::size_t i = 0; i < count; ++i) {
      if (links[i].GetLinkGoal() != &goals[i])
        throw std::runtime_error("a link lost its goal");
    }
    return run;
  });
  SetRate(state, static_cast<double>(2 * count));
}

BENCHMARK(RegisterShuffledLinksAndGoals)->Arg(1'000'000)->Arg(2'000'000)->Apply(OneBest);

} // namespace
