// The walk over a composition: every 3D layer becomes an object, nested compositions are walked in their turn, and a
// second pass builds the hierarchy.
#pragma once

#include "exporter/walk/export_context.h"

namespace exporter
{

enum class LayerPass
{
  kCreate = 0,
  kLink = 1,
};

// Fills an empty document from the host's active composition and shows a message, once, when a layer failed: whatever
// could be made is in the document then. False for a failure and, without a message, for a null document, when no
// composition is active, and when the root object can't be made.
bool ExportComposition(_torvane_::BaseDocument* document);

// One pass over the layers of a composition of `width` by `height` pixels. In the link pass objects go under
// `parentObject`, and those of a nested composition into a scene layer named like it. `enclosingLayer` is the layer
// that holds the composition; null at top level. True if all layers succeeded; false for a null composition and, in
// the link pass, for a null parent.
bool ExportLayerList(ExportContext& context, AEGP_CompH composition, _torvane_::BaseObject* parentObject, A_long width,
                     A_long height, LayerPass pass, AEGP_LayerH enclosingLayer);

// Puts the object of `context.layer`, and the target that it looks at, last under the object of the layer's parent or
// else under `parentObject`, and assigns both to `sceneLayer` if there is one. A layer without an object is passed
// over. False when the host fails.
bool LinkLayerObject(ExportContext& context, _torvane_::BaseObject* parentObject, _torvane_::LayerObject* sceneLayer);

} // namespace exporter
