#include "host/reader/projects/keyframe_builder.h"

#include <algorithm>
#include <cmath>

#include "host/reader/projects/layouts.h"
#include "host/reader/projects/roving.h"

namespace host::projects
{

namespace
{

// The handle of a linear side beside a Bezier one.
constexpr double kLinearInfluence = 1.0 / 6;

bool IsBezierOut(const KeyRecord& key) { return key.wayOut == keyframe::kBezier; }
bool IsBezierIn(const KeyRecord& key) { return key.wayIn == keyframe::kBezier; }

double Influence(double stored) { return std::isfinite(stored) ? std::clamp(stored, 0.0, 1.0) : kLinearInfluence; }
double Speed(double stored) { return std::isfinite(stored) ? stored : 0; }

// One component's way from a keyframe to another, or that along a path.
struct Way
{
  const KeyRecord& from;
  const KeyRecord& to;
  std::size_t component; // of the eases
  double distance;       // D: the whole way in units of the property
  double seconds;        // T
};

// The handles' heights are in units of the property, and where there is a way, in shares of it.
Easing EaseOf(const Way& way)
{
  const std::size_t c = way.component;
  const double out = IsBezierOut(way.from) ? Influence(way.from.influenceOut[c]) : kLinearInfluence;
  const double in = IsBezierIn(way.to) ? Influence(way.to.influenceIn[c]) : kLinearInfluence;
  const double rise = IsBezierOut(way.from) ? Speed(way.from.speedOut[c]) * out * way.seconds : way.distance * out;
  const double fall = IsBezierIn(way.to) ? Speed(way.to.speedIn[c]) * in * way.seconds : way.distance * in;
  if (way.distance != 0) {
    const Easing share{out, rise / way.distance, 1 - in, 1 - fall / way.distance};
    if (std::isfinite(share.y1) && std::isfinite(share.y2))
      return share;
  }
  if (!std::isfinite(rise) || !std::isfinite(fall) || (rise == 0 && fall == 0))
    return {out, out, 1 - in, 1 - in};
  return {out, rise, 1 - in, -fall, true};
}

Value ToValue(const Components& components, std::size_t dimensions)
{
  Value value{};
  std::copy_n(components.begin(), std::min(dimensions, value.size()), value.begin());
  return value;
}

// Everything about a keyframe the other way round: what led in leads out.
std::vector<Keyframe> Reverse(std::vector<Keyframe> keys)
{
  std::vector<Keyframe> reversed(keys.size());
  for (std::size_t i = 0; i < keys.size(); ++i) {
    const std::size_t last = keys.size() - 1 - i;
    reversed[i].time = keys[last].time;
    reversed[i].value = keys[last].value;
    if (last == 0)
      break;
    Keyframe& before = keys[last - 1];
    reversed[i].hold = before.hold == Hold::kNone ? Hold::kNone : Hold::kNextValue;
    for (const Easing& e : before.easing)
      reversed[i].easing.push_back(e.isBump ? Easing{1 - e.x2, e.y2, 1 - e.x1, e.y1, true}
                                            : Easing{1 - e.x2, 1 - e.y2, 1 - e.x1, 1 - e.y1});
    if (before.path)
      reversed[i].path = std::make_unique<BezierPath>(
          std::vector<Value>(before.path->Points().rbegin(), before.path->Points().rend()));
  }
  return reversed;
}

class KeyframeBuilder
{
 public:
  KeyframeBuilder(const PropertyRecord& record, std::size_t dimensions, const LayerClock& clock, KeyframeDoubts& doubts)
      : record_(record), dimensions_(dimensions), clock_(clock), doubts_(doubts)
  {}

  std::vector<Keyframe> Build(std::size_t& leftOut);

 private:
  void AddInterval(const KeyRecord& from, const KeyRecord& to);
  void AddRun(std::size_t first, std::size_t last);
  Keyframe MakeKey(const KeyRecord& key) const;
  double Seconds(const KeyRecord& from, const KeyRecord& to) const;
  std::unique_ptr<BezierPath> PathBetween(const KeyRecord& from, const KeyRecord& to) const;
  void NoteOvershoot(const Easing& easing);

  const PropertyRecord& record_;
  std::size_t dimensions_;
  const LayerClock& clock_;
  KeyframeDoubts& doubts_;
  std::vector<Keyframe> keys_;
  std::size_t leftOut_ = 0;
};

double KeyframeBuilder::Seconds(const KeyRecord& from, const KeyRecord& to) const
{
  return (static_cast<double>(to.ticks) - from.ticks) / record_.ticksPerSecond;
}

Keyframe KeyframeBuilder::MakeKey(const KeyRecord& key) const
{
  Keyframe made;
  made.time = clock_.FrameAt({key.ticks, record_.ticksPerSecond});
  made.value = ToValue(key.value, dimensions_);
  return made;
}

// Null where the way is straight.
std::unique_ptr<BezierPath> KeyframeBuilder::PathBetween(const KeyRecord& from, const KeyRecord& to) const
{
  const Value out = ToValue(from.tangentOut, dimensions_), in = ToValue(to.tangentIn, dimensions_);
  if (out == Value{} && in == Value{})
    return nullptr;
  const Value start = ToValue(from.value, dimensions_), end = ToValue(to.value, dimensions_);
  Value p1 = start, p2 = end;
  for (std::size_t c = 0; c < dimensions_; ++c) {
    p1[c] += out[c];
    p2[c] += in[c];
  }
  return std::make_unique<BezierPath>(start, p1, p2, end);
}

void KeyframeBuilder::NoteOvershoot(const Easing& easing)
{
  if (std::min(easing.y1, easing.y2) >= 0 && std::max(easing.y1, easing.y2) <= 1)
    return;
  constexpr double kSlack = 1e-9;
  for (int step = 1; step < 32; ++step) {
    const double y = Ease(easing, step / 32.0);
    doubts_.overshootsPath = doubts_.overshootsPath || y < -kSlack || y > 1 + kSlack;
  }
}

void KeyframeBuilder::AddInterval(const KeyRecord& from, const KeyRecord& to)
{
  Keyframe key = MakeKey(from);
  const double seconds = Seconds(from, to);
  if (from.wayOut == keyframe::kHold) {
    key.hold = Hold::kValue;
  } else if (record_.isSpatial) {
    key.path = PathBetween(from, to);
    const Value end = ToValue(to.value, dimensions_);
    const double distance =
        key.path ? key.path->Length() : std::hypot(end[0] - key.value[0], end[1] - key.value[1], end[2] - key.value[2]);
    if (distance > 0 && (IsBezierOut(from) || IsBezierIn(to))) {
      key.easing.push_back(EaseOf({from, to, 0, distance, seconds}));
      NoteOvershoot(key.easing[0]);
    }
  } else if (IsBezierOut(from) || IsBezierIn(to)) {
    const std::size_t eases = record_.hasTangents ? 1 : dimensions_;
    for (std::size_t c = 0; c < eases; ++c) {
      const double distance = record_.hasTangents ? seconds : to.value[c] - from.value[c];
      key.easing.push_back(EaseOf({from, to, c, distance, seconds}));
    }
    const auto hasSpeed = [](bool isBezier, double speed) { return isBezier && Speed(speed) != 0; };
    doubts_.hasSpeedWithoutPath =
        doubts_.hasSpeedWithoutPath || (record_.hasTangents && (hasSpeed(IsBezierOut(from), from.speedOut[0]) ||
                                                                hasSpeed(IsBezierIn(to), to.speedIn[0])));
  }
  keys_.push_back(std::move(key));
}

// A run of roving keyframes between two that stand is one ease along all its paths.
void KeyframeBuilder::AddRun(std::size_t first, std::size_t last)
{
  const KeyRecord& from = record_.keys[first];
  const KeyRecord& to = record_.keys[last];
  RovingRun run{.start = MakeKey(from), .endTime = MakeKey(to).time, .points = {}, .easing = std::nullopt};
  run.points.push_back(run.start.value);
  for (std::size_t i = first; i < last; ++i) {
    const KeyRecord& a = record_.keys[i];
    const KeyRecord& b = record_.keys[i + 1];
    const Value start = ToValue(a.value, dimensions_), end = ToValue(b.value, dimensions_);
    Value p1 = start, p2 = end;
    for (std::size_t c = 0; c < dimensions_; ++c) {
      p1[c] += a.tangentOut[c];
      p2[c] += b.tangentIn[c];
    }
    if (p1 == start && p2 == end) // straight, with even speed, so that the middle curves can be joined
      for (std::size_t c = 0; c < dimensions_; ++c) {
        p1[c] = start[c] + (end[c] - start[c]) / 3;
        p2[c] = end[c] - (end[c] - start[c]) / 3;
      }
    run.points.insert(run.points.end(), {p1, p2, end});
  }
  if (from.wayOut == keyframe::kHold) {
    run.start.hold = Hold::kValue;
    leftOut_ += last - first - 1;
    keys_.push_back(std::move(run.start));
    return;
  }
  const double distance = run.Length();
  if (distance > 0 && (IsBezierOut(from) || IsBezierIn(to))) {
    run.easing = EaseOf({from, to, 0, distance, Seconds(from, to)});
    NoteOvershoot(*run.easing);
  }
  const std::size_t made = SplitRun(std::move(run), keys_);
  leftOut_ += last - first - made;
}

std::vector<Keyframe> KeyframeBuilder::Build(std::size_t& leftOut)
{
  const std::vector<KeyRecord>& records = record_.keys;
  keys_.reserve(records.size());
  std::size_t i = 0;
  while (i + 1 < records.size()) {
    std::size_t next = i + 1;
    while (record_.isSpatial && next + 1 < records.size() && records[next].isRoving)
      ++next;
    if (next == i + 1)
      AddInterval(records[i], records[next]);
    else
      AddRun(i, next);
    i = next;
  }
  if (!records.empty())
    keys_.push_back(MakeKey(records.back()));
  leftOut = leftOut_;
  return clock_.RunsBackwards() ? Reverse(std::move(keys_)) : std::move(keys_);
}

} // namespace

std::vector<Keyframe> BuildKeyframes(const PropertyRecord& record, std::size_t dimensions, const LayerClock& clock,
                                     std::size_t& leftOut, KeyframeDoubts& doubts)
{
  return KeyframeBuilder(record, dimensions, clock, doubts).Build(leftOut);
}

} // namespace host::projects
