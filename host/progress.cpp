#include "host/progress.h"

#include <algorithm>
#include <unordered_map>

#include "host/model/layer_streams.h"
#include "host/model/timing.h"

namespace host
{

namespace
{

// The layers that become objects, in all uses of all compositions.
std::uint64_t CountLayers(const Composition& composition, std::unordered_map<const Composition*, std::uint64_t>& known)
{
  if (const auto found = known.find(&composition); found != known.end())
    return found->second;
  std::uint64_t count = 0;
  for (const Layer* layer : composition.layers) {
    if (!IsExported(*layer))
      continue;
    ++count;
    if (layer->source && layer->source->composition)
      count += CountLayers(*layer->source->composition, known);
  }
  known[&composition] = count;
  return count;
}

} // namespace

void Progress::Start(const Composition& composition)
{
  std::unordered_map<const Composition*, std::uint64_t> known;
  layers_ = listener_ ? CountLayers(composition, known) : 0;
  begun_ = 0;
  singleFrame_ = FrameAt(composition.workAreaStart, composition.frameDuration);
  frames_ = std::max(1.0, FrameAt(composition.workAreaDuration, composition.frameDuration));
  share_ = 0;
}

void Progress::Tell(double frame)
{
  if (!listener_ || begun_ == 0 || layers_ == 0)
    return;
  const double before = static_cast<double>(begun_) - 1;
  const double share = (before + std::clamp(frame / frames_, 0.0, 1.0)) / static_cast<double>(layers_);
  share_ = std::clamp(share, share_, 1.0);
  listener_(share_);
}

} // namespace host
