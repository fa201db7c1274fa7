// Exports compositions that are written down in the tests, through the standalone host.
#pragma once

#include <sstream>

#include "exporter/walk/composition.h"
#include "host/standalone_host.h"
#include "support/library.h"

namespace export_test
{

// A composition of 1000 by 500 pixels, 10 frames at 25 a second, named "Main". `more` is further keys.
inline std::string Composition(const std::string& layers, const std::string& more = "")
{
  return R"({"fr":25,"ip":0,"op":10,"w":1000,"h":500,"nm":"Main","layers":[)" + layers + "]" +
         (more.empty() ? "" : "," + more) + "}";
}

// 3D layers. `ks` is the inside of the transform, `more` further keys of the layer.
inline std::string Layer(int ty, const std::string& name, const std::string& ks, const std::string& more = "")
{
  return R"({"ddd":1,"ty":)" + std::to_string(ty) + R"(,"nm":")" + name + R"(","ks":{)" + ks + "}" +
         (more.empty() ? "" : "," + more) + "}";
}

inline std::string Solid(const std::string& name, const std::string& ks = "", const std::string& more = "")
{
  return Layer(1, name, ks, R"("sw":100,"sh":50,"sc":"#ff8000")" + (more.empty() ? "" : "," + more));
}

inline std::string Property(const std::string& value) { return R"({"k":)" + value + "}"; }

// Two keys that run straight from one value to the other over the ten frames.
inline std::string Ramp(const std::string& from, const std::string& to)
{
  return R"({"k":[{"t":0,"s":)" + from + R"(},{"t":10,"s":)" + to + "}]}";
}

inline std::string Text(const String& text)
{
  std::unique_ptr<char[]> buffer(new char[1000]);
  text.GetCString(buffer.get(), 1000, STRINGENCODING_UTF8);
  return buffer.get();
}

// "A(B(C) D)" for the objects from `first` on.
inline std::string Tree(const BaseObject* first)
{
  std::string tree;
  for (const BaseObject* object = first; object; object = object->GetNext()) {
    tree += (tree.empty() ? "" : " ") + Text(object->GetName());
    if (object->GetDown())
      tree += "(" + Tree(object->GetDown()) + ")";
  }
  return tree;
}

inline BaseObject* Find(BaseObject* first, const std::string& name)
{
  for (BaseObject* object = first; object; object = object->GetNext()) {
    if (Text(object->GetName()) == name)
      return object;
    if (BaseObject* below = Find(object->GetDown(), name))
      return below;
  }
  return nullptr;
}

// "Position X:3 Rotation Z:2" with the numbers of keys.
inline std::string Tracks(const BaseObject& object)
{
  std::string tracks;
  for (CTrack* track = object.GetFirstTrack(); track; track = track->GetNext())
    tracks += (tracks.empty() ? "" : " ") + Text(track->GetName()) + ":" +
              std::to_string(track->GetCurve(1, 1)->GetKeyCount());
  return tracks;
}

// The track of a parameter, or of a component (0 to 2) of a Vector parameter; null when there is none.
inline CTrack* FindTrack(const BaseObject& object, Long parameter, Long component = -1)
{
  if (component < 0)
    return object.FindTrack(ParameterPath(parameter));
  return object.FindTrack({ParameterLevel{parameter, 0, 0}, ParameterLevel{kVectorX + component, 0, 0}});
}

// "0:10 0.04:15" for the keys at 0 and 1/25 s; "-" without such a track. Numbers have six digits.
inline std::string Keys(const BaseObject& object, Long parameter, Long component = -1)
{
  CTrack* track = FindTrack(object, parameter, component);
  std::ostringstream keys;
  if (!track)
    return "-";
  for (Long i = 0; i < track->GetCurve(1, 0)->GetKeyCount(); ++i) {
    const CKey& key = *track->GetCurve(1, 0)->GetKey(i);
    keys << (i ? " " : "") << key.GetTime().Get() << ':' << key.GetValue() + 0.0; // no "-0"
  }
  return keys.str();
}

inline void ExpectNear(const Vector& actual, const Vector& expected, const std::string& what)
{
  EXPECT_NEAR(actual.x, expected.x, 1e-9) << what;
  EXPECT_NEAR(actual.y, expected.y, 1e-9) << what;
  EXPECT_NEAR(actual.z, expected.z, 1e-9) << what;
}

class Exported
{
 public:
  explicit Exported(const std::string& json) : host(host::LoadCompositionText(json, "test.json", "/footage"))
  {
    host.Start(EntryPointFunc);
    document.reset(BaseDocument::Alloc());
    succeeded = exporter::ExportComposition(document.get());
  }

  BaseObject* Root() const { return document->GetFirstObject(); }
  // The test ends with a crash rather than with a wrong object when there is none.
  BaseObject& Object(const std::string& name) const { return *Find(Root(), name); }
  std::string Tree() const { return export_test::Tree(Root()); }
  GeData Parameter(const std::string& object, Long id) const
  {
    GeData value;
    Object(object).GetParameterById(id, value);
    return value;
  }

  host::StandaloneHost host;
  Owned<BaseDocument> document;
  bool succeeded = false;
};

} // namespace export_test
