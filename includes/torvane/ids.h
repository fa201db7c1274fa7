// The numbers that name types and chunks in a scene file. Levels stand beside the chunk that they belong to. Numbers
// of one family alone (light parameters, material channels, ...) stand in that family's header.
#pragma once

#include "torvane/types.h"

namespace _torvane_
{

// Node types.
inline constexpr Long kTypeDocument = 110059;
inline constexpr Long kTypeVideoPost = 110066;
inline constexpr Long kTypeRenderData = 110304;
inline constexpr Long kTypeBaseDraw = 110305;
inline constexpr Long kTypeViewPanel = 110306;
inline constexpr Long kTypeLayer = 100004801;
inline constexpr Long kTypeMultipass = 300001048;

// Object types.
inline constexpr Long kObjectPolygon = 5100;
inline constexpr Long kObjectSpline = 5101;
inline constexpr Long kObjectLight = 5102;
inline constexpr Long kObjectCamera = 5103;
inline constexpr Long kObjectPointBased = 5108;
inline constexpr Long kObjectOldSpline = 5137;
inline constexpr Long kObjectNull = 5140;
inline constexpr Long kObjectGeneric = 5154; // the label of most objects in a file
inline constexpr Long kObjectPoint = 5156;   // the label of point objects
inline constexpr Long kObjectPlane = 5168;
inline constexpr Long kObjectPolygonLabel = 1001091; // the label of polygon objects in a file
inline constexpr Long kObjectSky = 1011146;
inline constexpr Long kObjectCloudGroup = 1011194;
inline constexpr Long kObjectCloud = 1011196;
inline constexpr Long kObjectJoint = 1019362;
inline constexpr Long kObjectSkin = 1019363;

// Tag types.
inline constexpr Long kTagPoint = 5600;
inline constexpr Long kTagPolygon = 5604;
inline constexpr Long kTagSmoothing = 5612;
inline constexpr Long kTagDisplay = 5613;
inline constexpr Long kTagTexture = 5616;
inline constexpr Long kTagTangent = 5617;
inline constexpr Long kTagProtection = 5629;
inline constexpr Long kTagCompositing = 5637;
inline constexpr Long kTagUVW = 5671;
inline constexpr Long kTagSegment = 5672;
inline constexpr Long kTagPolygonSelection = 5673;
inline constexpr Long kTagPointSelection = 5674;
inline constexpr Long kTagTarget = 5676;
inline constexpr Long kTagVertexMap = 5682;
inline constexpr Long kTagPlugin = 5691; // the label of tags whose real type is a plug-in's
inline constexpr Long kTagEdgeSelection = 5701;
inline constexpr Long kTagOldVertexMap = 5708;
inline constexpr Long kTagNormal = 5711;
inline constexpr Long kTagWeight = 1019365;

// Materials and shaders: types, and their labels in a root list.
inline constexpr Long kMaterialStandard = 5703;
inline constexpr Long kMaterialPlugin = 5705;
inline constexpr Long kShaderLabel = 5707;

// Labels of animation nodes.
inline constexpr Long kLabelTrack = 5350;
inline constexpr Long kLabelKey = 5352;

// Chunks of the document.
inline constexpr Long kChunkFileInfo = 110024;
inline constexpr Long kLevelFileInfo = 2;
inline constexpr Long kChunkDocumentPref = 110015;
inline constexpr Long kLevelDocumentPref = 4;
inline constexpr Long kChunkDocumentState = 110059;
inline constexpr Long kLevelDocumentState = 12;
inline constexpr Long kChunkRenderDataRoot = 110106;
inline constexpr Long kChunkObjectRoot = 110107;
inline constexpr Long kChunkViewPanelRoot = 110123;
inline constexpr Long kChunkLayerRoot = 110134;
inline constexpr Long kChunkMaterialRoot = 110308;
inline constexpr Long kChunkOldDocument = 110125; // known and dropped

// Chunks of every node.
inline constexpr Long kChunkNodeHeader = 110050;
inline constexpr Long kLevelNodeHeader = 7;
inline constexpr Long kChunkUniqueIds = 110068;
inline constexpr Long kLevelUniqueIds = 1;
inline constexpr Long kChunkNodeBits = 110069;
inline constexpr Long kLevelNodeBits = 2;
inline constexpr Long kChunkShaders = 110131;
inline constexpr Long kChunkTracks = 110417;
inline constexpr Long kChunkList = 110100;       // a root list; also the chunk around a node's children
inline constexpr Long kChunkNestedList = 110063; // an old nested object list
inline constexpr Long kChunkNodeData = 110064;   // what is particular to a node's type

// Chunks of objects.
inline constexpr Long kChunkTransform = 110052;
inline constexpr Long kLevelTransform = 9;
inline constexpr Long kChunkTags = 110108;

inline constexpr Long kChunkContainer = 132;
inline constexpr Long kLevelContainer = 1;
inline constexpr Long kChunkParameterPath = 1;
inline constexpr Long kLevelParameterPath = 2;

// True for the chunks that stand among a node's own and belong to this library, whichever class they are for.
constexpr Bool IsLibraryChunk(Long id) { return (id >= 110000 && id < 111000) || (id >= 300001047 && id <= 300001060); }

inline constexpr Long kChunkLayer = 110313;
inline constexpr Long kLevelLayer = 1;

// Keys of node containers.
inline constexpr Long kKeyModelCheckSum = 1020800; // of an object: the check sum of its geometry at the last write
inline constexpr Long kKeyLayerId = 1027565;       // of an exported object: the host's number of its layer

// Flags of CopyTo and MakeClone.
inline constexpr ULong kCopyNoTranslation = 1; // no private translation array: the caller translates
inline constexpr ULong kCopyNoChildren = 4;    // MakeClone leaves the children behind
inline constexpr ULong kCopyNoTracks = 8;
inline constexpr ULong kCopyNoInfo = 16;
inline constexpr ULong kCopyNoMaterialExtra = 32;
inline constexpr ULong kCopyNoBranches = 128; // no shaders, and root lists copy nothing
inline constexpr ULong kCopyNoGoal = 256;     // the goal isn't registered in the translation array
inline constexpr ULong kCopyNoNgons = 2048;

// The application id of a node's own marker among its unique ids; also the default writer id.
inline constexpr Long kMarkerAppId = 200000219;

} // namespace _torvane_
