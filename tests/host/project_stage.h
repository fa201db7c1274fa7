// Projects composed in tests, read and played.
#pragma once

#include "host/reader/projects/project_reader.h"
#include "project_bytes.h"
#include "stage.h"

#include <cmath>

namespace project_tests
{

using namespace project_bytes;
using host::Value;
using stage::Answer;
using stage::ExpectNear;
using stage::Fraction;
using stage::Stage;

inline std::unique_ptr<host::ProjectFile> Open(const std::string& bytes)
{
  const bool isXml = host::projects::IsXmlProject(bytes);
  return host::projects::OpenProject("shot.aep", host::FileBytes(std::vector<char>(bytes.begin(), bytes.end())), isXml);
}

inline host::Project Read(const std::vector<Node>& root, std::size_t composition = 0)
{
  return host::ReadProject(*Open(BinaryFile(root)), composition, "shot.aep", {});
}

inline host::Project Read(const Comp& comp, std::vector<Node> items = {})
{
  items.insert(items.begin(), MakeItem(comp));
  return Read(Root(std::move(items)));
}

inline Comp WithLayers(std::vector<Node> layers)
{
  Comp comp;
  comp.layers = std::move(layers);
  return comp;
}

inline const float kGrey[3] = {0.5F, 0.25F, 0.1F};
inline const Node kSolid = Solid(50, "Wall", 400, 200, kGrey);

// A 3D solid with one property of its transform group, or two.
inline Comp WithProperty(const char* name, Node property, Layer layer = {})
{
  layer.source = 50;
  Add(layer.transform, name, std::move(property));
  return WithLayers({MakeLayer(layer)});
}

// At 25 frames a second.
inline Value At(const Stage& stage, AEGP_LayerStream stream, double frame, A_long layer = 0)
{
  return stage.ValueAt(layer, stream, {static_cast<A_long>(std::lround(frame * 1000)), 25000});
}

inline Value ValueOf(const Comp& comp, AEGP_LayerStream stream, double frame = 0)
{
  return At(Stage(Read(comp, {kSolid})), stream, frame);
}

} // namespace project_tests
