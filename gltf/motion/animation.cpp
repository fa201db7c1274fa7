#include "gltf/motion/animation.h"

namespace gltf
{

namespace
{

void AddChannel(Output& output, const Json& target, const Samples& samples)
{
  Json sampler = {{"input", output.AddTimes(samples.times)},
                  {"output", output.AddFloats(samples.values, samples.width, ViewTarget::kNone, false)}};
  if (samples.steps)
    sampler["interpolation"] = "STEP"; // the default is LINEAR
  output.animationChannels.Add({{"sampler", output.animationSamplers.Add(sampler)}, {"target", target}});
}

} // namespace

void AddNodeChannel(Output& output, std::size_t node, const char* path, const Samples& samples)
{
  if (!samples.IsEmpty())
    AddChannel(output, {{"node", node}, {"path", path}}, samples);
}

void AddPointerChannel(Output& output, const std::string& pointer, const Samples& samples, bool allowed)
{
  if (samples.IsEmpty())
    return;
  if (!allowed) {
    output.account.Tell(Loss::kPointer);
    return;
  }
  output.UseExtension("KHR_animation_pointer");
  AddChannel(output, {{"path", "pointer"}, {"extensions", {{"KHR_animation_pointer", {{"pointer", pointer}}}}}},
             samples);
}

} // namespace gltf
