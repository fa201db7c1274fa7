// A program of the library's user: it has its own hooks, classes that derive from the library's and ask for their
// types, and uses nothing but the installed package. Saves a document under the name that it is given, and looks
// whether it loads and comes back whole, whatever the hook for node data answers.
#include <cstdio>
#include <cstdlib>

#include "torvane/document/base_document.h"
#include "torvane/hooks.h"
#include "torvane/memory/memory.h"
#include "torvane/nodes/root_list.h"
#include "torvane/objects/light_object_data.h"
#include "torvane/objects/point_object.h"
#include "torvane/objects/point_object_data.h"
#include "torvane/text/ge_string.h"

#include <filesystem>
#include <string>
#include <typeinfo>

namespace
{

long gBlocks = 0;          // allocated and not yet freed
bool gSaysKnown = false;   // what the hook for node data answers beside its null
bool gGivesLights = false; // it has data for lights

class OwnLight : public _torvane_::LightObjectData
{};

void* Counted(void* block)
{
  gBlocks += block != nullptr;
  return block;
}

} // namespace

namespace _torvane_
{

void* MemAlloc(LLong size) { return Counted(std::malloc(static_cast<std::size_t>(size))); }

void* MemAllocClear(LLong size) { return Counted(std::calloc(1, static_cast<std::size_t>(size))); }

void* MemRealloc(void* block, LLong size)
{
  void* moved = std::realloc(block, static_cast<std::size_t>(size));
  gBlocks += !block && moved;
  return moved;
}

void MemFree(void** block)
{
  gBlocks -= *block != nullptr;
  std::free(*block);
  *block = nullptr;
}

void GetWriterInfo(Long& id, String& name)
{
  id = 0;
  name = "client";
}

NodeData* AllocNodeData(Long type, Bool& known)
{
  known = gSaysKnown || gGivesLights;
  return gGivesLights && type == kObjectLight ? NewObj<OwnLight>() : nullptr;
}

RootObject* AllocRootObject() { return NewObj<RootObject>(); }
RootMaterial* AllocRootMaterial() { return NewObj<RootMaterial>(); }
RootLayer* AllocRootLayer() { return NewObj<RootLayer>(); }
RootRenderData* AllocRootRenderData() { return NewObj<RootRenderData>(); }

Bool BaseDocument::BuildScene(Long) { return true; }

} // namespace _torvane_

namespace
{

using namespace _torvane_;

const char* const kName = "from a client";

bool Save(const char* path)
{
  BaseDocument* document = CreateDocument();
  BaseObject* object = AllocObject(kObjectNull);
  bool saved = document && object;
  if (saved) {
    object->SetName(kName);
    document->InsertObject(object);
    // A type that the hook knows nothing of keeps what it has.
    BaseObject* polygons = AllocObject(kObjectPolygon);
    document->InsertObject(polygons, object);
    saved = polygons && ResizePolygons(*polygons, 3, 1, 1);
    document->InsertObject(AllocObject(kObjectLight), polygons);
  }
  if (saved) {
    FileProblem problem;
    saved = SaveDocument(document, path, 0, &problem) && problem.code == FILEERROR_NONE;
  }
  BaseDocument::Free(document);
  return saved;
}

bool Load(const char* path)
{
  BaseDocument* document = LoadDocument(path, LoadObjects | LoadMaterials);
  const BaseObject* object = document ? document->GetFirstObject() : nullptr;
  const BaseObject* polygons = object ? object->GetNext() : nullptr;
  bool found = polygons && object->GetName() == kName && GetPointCount(*polygons) == 3 && GetPolygonData(*polygons) &&
               GetPolygonData(*polygons)->GetNgons();
  const NodeData* light = found && polygons->GetNext() ? polygons->GetNext()->GetObjectData() : nullptr;
  found =
      found && gGivesLights == (light && typeid(*light) == typeid(OwnLight) && dynamic_cast<const OwnLight*>(light));
  BaseDocument::Free(document);
  return found;
}

// Loads the file and saves it beside itself: neither a hook that knows nothing nor one that knows and gives nothing
// makes it smaller.
bool ComesBack(const std::string& path)
{
  const std::string again = path + ".again";
  BaseDocument* document = LoadDocument(path.c_str(), LoadObjects | LoadMaterials);
  const bool saved = document && SaveDocument(document, again.c_str(), 0);
  BaseDocument::Free(document);
  return saved && std::filesystem::file_size(again) == std::filesystem::file_size(path);
}

} // namespace

int main(int argc, char** argv)
{
  if (argc != 2)
    return EXIT_FAILURE;
  bool saved = Save(argv[1]);
  bool loaded = saved && Load(argv[1]) && ComesBack(argv[1]);
  gSaysKnown = true;
  bool kept = Load(argv[1]) && ComesBack(argv[1]);
  gSaysKnown = false;
  gGivesLights = true;
  bool derived = Load(argv[1]);
  std::printf("saved: %d, loaded: %d, kept: %d, derived: %d, blocks left: %ld\n", saved, loaded, kept, derived,
              gBlocks);
  return loaded && kept && derived && gBlocks == 0 ? EXIT_SUCCESS : EXIT_FAILURE;
}
