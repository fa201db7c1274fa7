// What stands behind each tag type: one table. A type that it doesn't list is a plain tag of that type.
#include "q7r_file/types/tag_makers.h"
#include "torvane/tags/base_tag.h"

namespace _torvane_
{

namespace
{

template <BaseTag* (*Make)()>
BaseTag* MakeOf(Long)
{
  return Make();
}

BaseTag* MakePluginTag(Long type) { return NewObj<BaseTag>(kTagPlugin, type); }
// The label of plug-in tags: the file tells the type later.
BaseTag* MakeUntypedPluginTag(Long) { return NewObj<BaseTag>(kTagPlugin, -1); }

struct TagClass
{
  Long type;
  BaseTag* (*make)(Long type);
  NodeData* (*makeData)() = nullptr; // of a plug-in tag whose behaviour the library has
};

constexpr TagClass kTagClasses[] = {
    {kTagPoint, MakeOf<MakePointTag>},
    {kTagPolygon, MakeOf<MakePolygonTag>},
    {kTagDisplay, MakeOf<MakeDisplayTag>},
    {kTagTexture, MakeOf<MakeTextureTag>},
    {kTagTangent, MakeOf<MakeTangentTag>},
    {kTagCompositing, MakeOf<MakeCompositingTag>},
    {kTagUVW, MakeOf<MakeUVWTag>},
    {kTagSegment, MakeOf<MakeSegmentTag>},
    {kTagPolygonSelection, MakeSelectionTag},
    {kTagPointSelection, MakeSelectionTag},
    {kTagEdgeSelection, MakeSelectionTag},
    {kTagVertexMap, MakeOf<MakeVertexMapTag>},
    {kTagNormal, MakeOf<MakeNormalTag>},
    {kTagPlugin, MakeUntypedPluginTag},
    {5678, MakePluginTag},
    {5698, MakePluginTag},
    {5699, MakePluginTag},
    {5700, MakePluginTag},
    {1001001, MakePluginTag},
    {1007579, MakePluginTag},
    {1009891, MakePluginTag},
    {1011012, MakePluginTag},
    {1016641, MakePluginTag},
    {kTagWeight, MakePluginTag, MakeWeightTagData},
    {1019597, MakePluginTag},
    {465000402, MakePluginTag},
    {465000404, MakePluginTag},
};

const TagClass* FindTagClass(Long type)
{
  for (const TagClass& row : kTagClasses)
    if (row.type == type)
      return &row;
  return nullptr;
}

} // namespace

BaseTag* MakeTag(Long type)
{
  AllocationWatch watch;
  const TagClass* row = FindTagClass(type);
  BaseTag* tag = row ? row->make(type) : NewObj<BaseTag>(type);
  if (!tag || !row || !row->makeData)
    return tag;
  NodeData* data = row->makeData();
  tag->SetNodeData(data);
  if (!data || !data->Init())
    DeleteObj(tag);
  return watch.Whole(tag);
}

BaseTag* MakeTagToRead(Long type) { return type == kTagCompositing ? MakeCompositingTagToRead() : MakeTag(type); }

NodeData* AllocTagDataOfType(Long pluginId, Bool& known)
{
  const TagClass* row = FindTagClass(pluginId);
  known = row && row->makeData;
  return known ? row->makeData() : nullptr;
}

} // namespace _torvane_
