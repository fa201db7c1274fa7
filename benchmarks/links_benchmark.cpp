// Links and goals that are found again across a read, with ids in no order at all. As in a read, each has been made
// just before it is registered: what is measured are the registrations, not how far apart the caller's objects lie.
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

void CheckLinks(const std::vector<std::size_t>& order, const std::vector<GeAliasGoal>& goals,
                const std::vector<GeAliasLink>& links)
{
  std::vector<const GeAliasGoal*> byId(goals.size());
  const GeAliasGoal* goal = goals.data();
  for (std::size_t number : order) {
    if (number < goals.size())
      byId[number] = goal++;
  }
  const GeAliasLink* link = links.data();
  for (std::size_t number : order) {
    if (number >= goals.size() && (link++)->GetLinkGoal() != byId[number - goals.size()])
      throw std::runtime_error("a link lost its goal");
  }
}

void RegisterShuffledLinksAndGoals(benchmark::State& state)
{
  const auto count = static_cast<std::size_t>(state.range(0));
  // Below `count` the number stands for the next goal, with the number as its id, else for the next link, to the goal
  // `count` before it.
  std::vector<std::size_t> order(2 * count);
  std::iota(order.begin(), order.end(), std::size_t{0});
  std::shuffle(order.begin(), order.end(), std::mt19937_64(7));
  RunFresh(state, [&] {
    std::vector<GeAliasGoal> goals(count);
    std::vector<GeAliasLink> links(count);
    const Run run = Measure([&] {
      TransArray translation;
      GeAliasGoal* goal = goals.data();
      GeAliasLink* link = links.data();
      for (std::size_t number : order) {
        if (number < count)
          translation.RegisterGoal(number + 1, *goal++);
        else
          translation.RegisterLink(number - count + 1, *link++, nullptr);
      }
      translation.FinishTranslation(false);
    });
    CheckLinks(order, goals, links);
    return run;
  });
  SetRate(state, static_cast<double>(2 * count));
}

BENCHMARK(RegisterShuffledLinksAndGoals)->Arg(1'000'000)->Arg(2'000'000)->Apply(OneBest);

} // namespace
