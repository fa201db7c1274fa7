#include <algorithm>

#include "support/record_samples.h"
#include "torvane/animation/ctrack.h"
#include "torvane/document/base_document.h"
#include "torvane/layers/layer_object.h"
#include "torvane/materials/material.h"
#include "torvane/objects/base_object.h"
#include "torvane/render/render_data.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/tags/base_tag.h"
#include "torvane/views/base_draw.h"

using namespace _torvane_;

namespace
{

template <class Node>
GeListNode* New()
{
  return NewObj<Node>();
}
template <class Node, Long type>
GeListNode* NewOf()
{
  return NewObj<Node>(type);
}
template <Long type>
GeListNode* Tag()
{
  return MakeTag(type);
}
template <Long type>
GeListNode* Object()
{
  return AllocObject(type);
}
constexpr auto kBare = NewOf<BaseObject, kObjectGeneric>; // what every object is while it is read
GeListNode* Document() { return BaseDocument::Alloc(); }

using Text = std::string;

// What a node without anything of its own writes first.
const Text kNoMarker = "M=00000000000000000000000000000000";
const Text kNode =
    "[110050,7 L=0 L=0 K= C=0 S= L=0 L=1 L=0 k C=1 " + kNoMarker + " B=0 ] [110069,2 L=4 L=0 L=0 L=0 L=0 C=0 ] ";

const Text kInfo = "L5 L=0 ";
const Text kHeader0 = kInfo + "K3 C=0 Sname ";
const Text kHeader1 = kHeader0 + "L#1 K4 ";
const Text kHeader2 = kHeader1 + "L=1 L=0 ";
const Text kHeaderEnd = "k C=1 " + kNoMarker + " B=0";

const Text kPref0 = "L=0 L24@1001 T1@1002 T9@1003 T2@1004 T8@1005 B0@1008 B0@1009 B0@1010 B0@1011 ";
const Text kPref1 = kPref0 + "R0.5@1006 ";
const Text kPref2 = kPref1 + "B1@1007 ";

// The state of a document: what is known by parameters, the dropped values, containers.
const Text kStateHead = "T3@1000 L=12@1019 L=";
const Text kStateLocks = " 4( B0 B1 B0 B1 ) 16( B=0 ) F= B=0 L=0 F= L=0 ";
const Text kState0 = kStateHead + "12574" + kStateLocks + "5( K=0 ) K7 ";
const Text kState2 = kState0 + "K=0 3( V=0 ) ";
const Text kState3 = kState2 + "[0,0 " + kNode + "] ";
const Text kState4 = kState3 + "B=0 L=0 L=0 R=0.5 R=0.5 B=0 B=0 ";
const Text kState6 = kState4 + "L=0 B=0 ";
const Text kViewFlags = "L5 11( B1 ) ";

const Text kTransformHead = "V1 V2 V3 ";
const Text kTransformModes = "L1@901 L0@902 L1 ";
const Text kTransformDisplay = "B1@909 V4 L5@907 V6@912 L7@913 Y8 B=0 B=0 ";
const Text kOldDisplay = "B1 B=1 V4 L5 V6 L7 Y8 B=0 B=0 ";
const Text kFrozen = "U14 V20@917 V21@919 V22@918 V23 V24 V25 ";
const Text kMatrices = "Y=0 Y=0 "; // of old files: they tell nothing but mirrored axes

const Text kCurve = "[110415,0 " + kNode + "] ";
const Text kKeyBody = "T1@901 T2@911 T3@912 R4 R5@913 R6@914 L2@924 L=15 L9";

const Text kOldPoints = "V1@1011 V2@1012 V3@1013 ";
const Text kOldSettings = "R4@1000 R5@1001 R6@1002 R7@1003 B0@1007 B1@1008 B1@1009 L8@1004 L9@1005 ";

const Text kOldDisplay0 = "L=1 B=1 B=1 B1%1001 B0%1002 ";
const Text kOldDisplay1 = "B1%1010 R4%1004 ";
const Text kOldDisplay2 = "B0%1007 B1%1008 B0%1009 B=0 B1%1012 R5%1006 V=0 ";

const Text kPairs3 =
    "B1@1010 L5@1110 B1@1011 L6@1111 B1@1012 L7@1112 B1@1013 L8@1113 B1@1014 L9@1114 B1@1015 L10@1115 ";
const Text kPairs5 =
    "B1@1136 L5@1120 B1@1137 L6@1121 B1@1138 L7@1122 B1@1139 L8@1123 B1@1140 L9@1124 B1@1141 L10@1125 ";
const Text kFlags0 = "B0@1000 B0@1001 B0@1002 B0@1003 B1@1004 ";
const Text kFlags1 = kFlags0 + "B1@1005 L8@1006 L9@1007 ";
const Text kFlags3 = kFlags1 + "B=1 R=0 R0.5@1016 " + kPairs3;

const Text kOldSurface = "B0 B1 5( R2 ) B0 V2 3( B1 ) R8 R2 L2 5( R2 ) B0 R2 R2 ";
const Text kOldSurfaceOn = "6( B0 B1 ) B0 " + kOldSurface;
const Text kOldSwitches = "6( B0 [5899,0 ] B1 [5899,0 ] ) 2( B0 [5899,0 ] )";
const Text kPictures = "3( X8100000000 ) ";

const Text kNoList = "U1 U2 U3 U=0 L4 ";
const Text kWeights = "L5 L6 L#1 A3:3,4,0 " + kNoList + "L#2 A2:100,200 ";
const Text kJoint = "k Y20 R3 " + kWeights + "L7 U11 U12 U13 U=1 L14 L#1 A3:15 L#1 U16 k L17 ";

const Text kLightTail = " B=0";
const Text kLightName = "L=5102 L=0 Slight ";
const Text kLightFirst = "R12@80002 R13@80003 R14@80000 R15@80001 ";
const Text kLightSwitches = "L16@80014 L17@80015 B1@80007 B1@80008 B1@80009 B1@80010 ";
const Text kKnots = "R1 R2 V3 L4 R5 R6 V7 L8 ";
const Text kLightGroups = "R21@80004 R22@80005 R23@80006 B1@80011 B1@80012 R24@50016 R25@50001 R26@50002 R=0 R27@50003 "
                          "L28@50005 L29@50006 L30@50007 B1@50008 B1@50009 B1@50010 B1@50011 B1@50012 V31@50013 "
                          "L32@60000 L33@60001 R34@60002 R=1 R35@60004 R36@60005 R37@60006 V38@60007 B1@60008 "
                          "B1@70000 B1@70001 B1@70002 B1@70003 R39@70004 R40@70005 R41@70006 V=1 V=1 R=10@70009 ";
const Text kLightOldVector = "V42@70028 ";
const Text kLightMain =
    "B=1 B=1 B1@70023 B=0 R=10 R=10 R=90 R=100 R43@70019 R44@70020 R45@70021 V46@90000 R47@90001 L48@90002 "
    "L49@90003 L50@90004 L51@90005 B0@90006 B0@90008 B0@90007 B1@90009 R52@90010 R53@90011 R54@90012 R55@90013 "
    "L56@90014 B1@90015 B1@90016 B1@90017 B0@90018 B1@90019 B1@90020 R57@90021 R=58@90022 R=58 R59@90024 R60@90025 "
    "V=0 B1@90027 B1@90028 R61@90029 R62@90030 R63@90031 R=64@90032 ";
const Text kLightLevels[] = {
    "", "B0@70022 R=64 ", "V65@60009 R66@60003 B1@50015 ",
    "B1@91000 B1@91003 B=0 R67@91001 R68@91004 R69@91007 R70@91008 L71@91002 L72@91005 L73@91006 ", "B1@90033 "};
const Text kNewLightLevels[] = {"", "B1 R=64 ", "V=0 R0 B0 ", "B0 B0 B=0 R0 R0 R0 R0 L0 L0 L0 ", "B0 "};
const Text kLightExtra =
    "R74 R75 V76 L77 5( B1 B0 B1 L78 L79 R80 R81 R82 R83 R84 V85 L86 ) 5( R87 R88 V89 L90 ) R91@50000 R92@70027 ";
const Text kOldKnot = "R=8 R=8 V=8 L=8 ";
const Text kOldKnots =
    kOldKnot + kKnots + "5( B=1 B=0 B=1 L=8 L=8 L=8 R=8 R=8 R=8 R=8 R=8 V=8 L=8 ) 5( " + kOldKnot + ") ";
const Text kIESHead = "L2 L1 ";
const Text kIESTexts = "Smaker Scatalogue Sluminaire SlampNumber Slamp L4 V1 ";

// The groups that came with each level, behind `level` with what a new light has in them, up to `last`.
Text LightLevels(int level, int last)
{
  Text text;
  for (int i = 1; i <= last && i <= 4; ++i)
    text += i <= level ? kLightLevels[i] : kNewLightLevels[i];
  return text;
}

Text Light(int level, int last, const Text& count = "L#2 ", const Text& knots = kKnots)
{
  return kLightName + kLightFirst + count + kLightSwitches + knots + kLightGroups + kLightOldVector + kLightMain +
         LightLevels(level, last) + kLightExtra +
         (last < 5    ? ""
          : level < 5 ? "L0 "
                      : "L93@1002 ");
}
Text Light(int level) { return Light(level, level); }
Text NewLight(int level) { return Light(level, 6) + kLightTail; }

// Files before 7500 tell a strength and a colour as one vector.
Text OldLight(int level)
{
  return kLightName + kLightFirst + "L#2 " + kLightSwitches + kOldKnots + kLightGroups + "V42 " + kLightMain +
         LightLevels(level, level);
}

const Text kTwoReals = "R0.25 R0.5 ";
const Text kStackHead = "L=1 L=0 K= ";

// A node header whose container holds one custom value.
Text Custom(int type, int level, const Text& body)
{
  return "L=0 L=0 [132,1 L=-1 L=7 L=" + std::to_string(type) + " [0," + std::to_string(level) + " " + body +
         "] ] C=0 S= L=0 L=1 L=0 " + kHeaderEnd;
}

Text BlendLayer(int type, const Text& own, bool enabled = true)
{
  return "L=" + std::to_string(type) + " B1 Slayer L" + std::to_string(type) + " L5 " + own + (enabled ? "B0 " : "");
}

const Text kGradient = "[132,1 L=-1 L=1 L=1000481 [0,1 [132,1 L=-1 L=1000 L=15 L5 ] B=0 ] ] ";

// One layer of each type.
Text BlendStack(int level)
{
  const bool on = level >= 2;
  return "L#10 L=" + std::to_string(level) + " " + BlendLayer(1, "L4 R0.5 B0 L#0 L=3 ", on) +
         BlendLayer(2, "L4 R0.5 k ", on) + BlendLayer(3, "R0.25 R0.5 R2 ", on) +
         BlendLayer(4, "R10 R0.5 R0.25 B1 ", on) + BlendLayer(5, "R0.5 L7 ", on) +
         BlendLayer(6, "L3 " + kGradient + (level >= 1 ? "B1 B1 " : "B1 "), on) + BlendLayer(7, kTwoReals, on) +
         BlendLayer(8, kTwoReals, on) + BlendLayer(9, "L1 R0.5 L2 B1 R6 R7 R8 ", on) +
         BlendLayer(10, "R0.5 B1 B1 V2 V5 ", on) + "L2 ";
}

} // namespace

const std::vector<RecordSample>& RecordSamples()
{
  static const Text unknown = "-"; // read, but nothing of it is written in this form
  static const Text frameless = "U0 L8@928";
  static const Text newView = "L1 B0 B0 B1 B0 B1 6( B0 ) B0"; // of a new document
  static const Text newState = kState6 + "K L200000083 " + newView;
  static const Text transformNow = kTransformModes + kTransformDisplay;
  static const std::vector<RecordSample> samples = {
      // Every node.
      {"node header", New<BaseList2D>, 110050, 7, kHeader2 + "k C=1 M=000102030405060708090A0B0C0D0E0F B=0", "same", -1,
       13000, false}, // a copy has its own marker
      {"node header 2 with another list", New<BaseList2D>, 110050, 2, kHeader1 + "L=7", kHeader2 + kHeaderEnd, 7},
      {"node header 6", New<BaseList2D>, 110050, 6, kHeader2 + "k C=1 " + kNoMarker, kHeader2 + kHeaderEnd, 7},
      {"node header 5", New<BaseList2D>, 110050, 5, kHeader2 + "k", kHeader2 + kHeaderEnd, 7},
      {"node header 2", New<BaseList2D>, 110050, 2, kHeader2, kHeader2 + kHeaderEnd, 7},
      {"node header 2 with old chunks", New<BaseList2D>, 110050, 2, kHeader1 + "L=1 L#2 [1,0 L=1 ] [2,0 ]",
       kHeader2 + kHeaderEnd, 7},
      {"node header 1", New<BaseList2D>, 110050, 1, kHeader1, kHeader2 + kHeaderEnd, 7},
      {"node header 0", New<BaseList2D>, 110050, 0, kHeader0, kHeader0 + "L=0 L=1 L=0 " + kHeaderEnd, 7},
      {"node header 4 before 11600", New<BaseList2D>, 110050, 4, kHeader2 + "L=9 L#2 L=8 L=8", kHeader2 + kHeaderEnd, 7,
       11599},
      {"node header 3 before 11600", New<BaseList2D>, 110050, 3, kHeader2 + "L=9", kHeader2 + kHeaderEnd, 7, 11599},
      {"node header before 7500", New<BaseList2D>, 110050, 4, kInfo, kInfo + "K= C=0 S= L=0 L=1 L=0 " + kHeaderEnd, 7,
       7499},
      {"node bits", New<BaseList2D>, 110069, 2, "L=4 L1 L2 L3 L4 C=0"},
      {"node bits 0", New<BaseList2D>, 110069, 0, "L#5 L1 L2 L3 L4 L=9", "L=4 L1 L2 L3 L4 C=0", 2},
      {"identifiers", New<BaseList2D>, 110068, 1, "L#2 L=7 M=0102 L=8 M=03", "same", -1, 13000, false},
      {"foreign chunk", New<BaseList2D>, 1027408, 3, "L1 R2 [7,7 Stext ] A6:1,2 M0102"},
      // Animation.
      {"tracks", New<BaseList2D>, 110417, 0,
       "[110100,0 [5350,0 " + kNode + "[110418,3 4( " + kCurve +
           ") 6( B=0 ) ] [110414,2 "
           "L1 L2 k [1,2 L#1 L901 L19 L3 ] L4 L5 L6 L7 L8 ] ] ]"},
      {"track settings", New<CTrack>, 110414, 2, "L5@910 L6@911 k [1,2 L#2 L903 L23 L1 L1000 L19 L2 ] L2 L7 L8 L9 L10"},
      {"track settings 1", New<CTrack>, 110414, 1, "L5@910 L6@911", "L5 L6 k [1,2 L=0 ] L0 L-1 L-1 L-1 L-1", 2},
      {"curves", New<CTrack>, 110418, 3, "4( " + kCurve + ") 5( B=0 ) B=1 " + kCurve},
      {"curves 2", New<CTrack>, 110418, 2, "L=7 4( " + kCurve + ") [9,9 ] ", "4( " + kCurve + ") 6( B=0 )", 3},
      {"keys", New<CCurve>, 110419, 0, "[110100,0 [5352,0 " + kNode + "[110416,0 " + kKeyBody + " ] ] ]"},
      {"key", New<CKey>, 110416, 0, kKeyBody},
      // Layers.
      {"layer", New<LayerObject>, 110313, 1,
       "B0@1001 B0@1002 B0@1003 B1@1004 B0@1005 B0@1006 B0@1007 B0@1008 V2@1009 B1@1000"},
      {"layer 0", New<LayerObject>, 110313, 0, "8( B0 ) V2", "8( B0 ) V2 B0", 1},
      {"layers in a layer", New<LayerObject>, 110100, 0, "[100004801,0 " + kNode + "[110313,1 8( B0 ) V2 B1 ] ]"},
      // The document.
      {"file information", Document, 110024, 2, "L=13000 B=0 B=0"},
      {"file information 1", Document, 110024, 1, "L=13000 B=1", "L=13000 B=0 B=0", 2},
      {"file information 0", Document, 110024, 0, "L=13000", "L=13000 B=0 B=0", 2},
      {"preferences", Document, 110015, 4, kPref2 + "B=0 B=0"},
      {"preferences 3", Document, 110015, 3, kPref2 + "B=1", kPref2 + "B=0 B=0", 4},
      {"preferences 2", Document, 110015, 2, kPref2, kPref2 + "B=0 B=0", 4},
      {"preferences 1", Document, 110015, 1, kPref1, kPref1 + "B0 B=0 B=0", 4},
      {"preferences 0", Document, 110015, 0, kPref0, kPref0 + "R1 B0 B=0 B=0", 4},
      {"preferences of a time too early", Document, 110015, 0, "L=0 L24 T-1000 T9 T2 T8 4( B0 )",
       "L=0 L24 T-600 T9 T2 T8 4( B0 ) R1 B0 B=0 B=0", 4},
      {"state", Document, 110059, 12, kState6 + "K8 L200000089@1020 " + kViewFlags + "B1", "same", -1, 13000, false},
      {"state 11", Document, 110059, 11, kState6 + "K8 L200000089 " + kViewFlags,
       kState6 + "K8 L200000089 " + kViewFlags + "B0", 12, 13000, false},
      {"state 10", Document, 110059, 10, kState6 + "K8 L200000089 " + kViewFlags + "L=9",
       kState6 + "K8 L200000089 " + kViewFlags + "B0", 12, 13000, false},
      {"state 9", Document, 110059, 9, kState6 + "K8 L200000089 " + kViewFlags,
       kState6 + "K8 L200000089 " + kViewFlags + "B0", 12, 13000, false},
      {"state 8", Document, 110059, 8, kState6 + "K8 L200000089", kState6 + "K8 L200000089 " + newView, 12, 13000,
       false},
      {"state 7", Document, 110059, 7, kState6 + "K8", kState6 + "K8 L200000083 " + newView, 12, 13000, false},
      {"state 6", Document, 110059, 6, kState6, newState, 12, 13000, false},
      {"state 5", Document, 110059, 5, kState4 + "L=0", newState, 12, 13000, false},
      {"state 4", Document, 110059, 4, kState4, newState, 12, 13000, false},
      {"state 3", Document, 110059, 3, kState3, newState, 12, 13000, false},
      {"state 2", Document, 110059, 2, kState2, newState, 12, 13000, false},
      {"state 1", Document, 110059, 1, kState0 + "K=0", newState, 12, 13000, false},
      {"state 0", Document, 110059, 0, kState0, newState, 12, 13000, false},
      {"state before 7500", Document, 110059, 0, kState0 + "K=0", unknown, -1, 7499},
      // Objects.
      {"transform", kBare, 110052, 9, "V1 V2 V3 " + kTransformModes + kTransformDisplay + frameless},
      {"frozen transform", kBare, 110052, 9, kTransformHead + kTransformModes + kTransformDisplay + kFrozen + "L4@928"},
      {"transform 8", kBare, 110052, 8, kTransformHead + transformNow + "U0 L=5",
       kTransformHead + transformNow + "U0 L6", 9},
      {"transform 0", kBare, 110052, 0, kTransformHead + transformNow + "U0", kTransformHead + transformNow + "U0 L6",
       9},
      {"transform with an old list", kBare, 110052, 0,
       kTransformHead + kTransformModes + "B1 V4 L5 V6 L7 Y8 B1 [110107,0 [110100,0 [5154,0 ] ] ] B=0 U0",
       kTransformHead + transformNow + "U0 L6", 9},
      {"transform 6 before 11600", kBare, 110052, 6,
       kTransformHead + kMatrices + kTransformModes + kOldDisplay + kFrozen,
       kTransformHead + transformNow + kFrozen + "L6", 9, 11599},
      {"transform 5 of mirrored axes", kBare, 110052, 5,
       kTransformHead + "Y=0 Y0,0,0,-1,0,0,0,1,-1,0,0,1 " + kTransformModes + kOldDisplay,
       "V1 V-2,2.5,-1.75 V3 " + transformNow + "U0 L6", 9, 11599},
      {"transform 4 of mirrored axes", kBare, 110052, 4,
       kTransformHead + "Y=0 Y0,0,0,1,-1,-1,-1,-1,0,-1,-1,-1 " + kTransformModes + "B1 B=1 V4 L5 V6 L7 Y8",
       "V1 V2,-2.5,1.75 V3 " + transformNow + "U0 L6", 9, 11599},
      {"transform 3 before 11600", kBare, 110052, 3,
       kTransformHead + kMatrices + kTransformModes + "B1 B=1 V4 L5@907 V6@912 L7@913", unknown, -1, 11599},
      {"transform 2 before 11600", kBare, 110052, 2, kTransformHead + kMatrices + kTransformModes + "B1 B=1 V4 L5@907",
       unknown, -1, 11599},
      {"transform 1 before 11600", kBare, 110052, 1, kTransformHead + kMatrices + kTransformModes + "B1 B=1 V4",
       unknown, -1, 11599},
      {"transform 1 before 7500", kBare, 110052, 1, "K3 " + kTransformHead + kMatrices + "Sname " + kTransformModes,
       unknown, -1, 7499},
      {"transform 0 before 7500", kBare, 110052, 0, "K3 " + kTransformHead + kMatrices + "Sname", unknown, -1, 7499},
      {"object of a known type", kBare, 110064, 0, "L=5140 L=0 Sname"},
      {"object of an unknown type", kBare, 110064, 3, "L=1234567 L=0 Sname L1 R2 [7,7 Stext ] A3:1,2", "same", -1,
       13000, false},
      {"camera", kBare, 110064, 0, "L=5103 L=0 Sname"},
      {"sky", kBare, 110064, 2, "L=1011146 L=0 Sname L1 R2"},
      {"children", kBare, 110100, 0,
       "[5154,0 " + kNode + "[110064,0 L=5140 L=0 S= ] [110052,9 " + kTransformHead + kTransformModes +
           kTransformDisplay + "U0 L6 ] ]"},
      {"old nested objects", kBare, 110100, 0, "[110063,0 [5154,0 [110064,0 L=5140 L=0 S= ] ] ]", unknown},
      {"light", kBare, 110064, 6, Light(6) + kLightTail},
      {"light 5", kBare, 110064, 5, Light(5), NewLight(5), 6},
      {"light 4", kBare, 110064, 4, Light(4), NewLight(4), 6},
      {"light 3", kBare, 110064, 3, Light(3), NewLight(3), 6},
      {"light 2", kBare, 110064, 2, Light(2), NewLight(2), 6},
      {"light 1", kBare, 110064, 1, Light(1), NewLight(1), 6},
      {"light 0", kBare, 110064, 0, Light(0), NewLight(0), 6},
      {"light 0 with all groups", kBare, 110064, 0, Light(6), NewLight(6), 6},
      {"light 4 before 7500", kBare, 110064, 4, OldLight(4), unknown, -1, 7499},
      {"light 1 before 7500", kBare, 110064, 1, OldLight(1), unknown, -1, 7499},
      {"light 0 before 7500", kBare, 110064, 0, OldLight(0), unknown, -1, 6000},
      {"light with too many knots", kBare, 110064, 5, Light(5, 5, "L=45 ", "45( R1 R2 V3 L4 ) "),
       Light(5, 5, "L=40 ", "40( R1 R2 V3 L4 ) ") + kLightTail, 6},
      {"light with fewer than no knots", kBare, 110064, 5, Light(5, 5, "L=-5 ", ""),
       Light(5, 5, "L=0 ", "") + kLightTail, 6},
      {"light with a distribution", kBare, 110064, 6,
       Light(6) + "B=1 L=4 " + kIESHead + "R9 L=2 L=1 R=0 R180 R0 R=9 R=9 " + kIESTexts + "R0.5"},
      {"distribution 2", kBare, 110064, 6,
       Light(6) + "B=1 L=2 " + kIESHead + "X144022000000000000 L#2 L#1 4( X144022000000000000 ) X144022000000000000 " +
           kIESTexts,
       unknown},
      {"selected points", Object<kObjectPolygon>, 110117, 0, "[110011,0 L#1 L1 L2 ]"},
      {"hidden points", Object<kObjectPolygon>, 110118, 0, "[110011,0 L#1 L1 L2 ]"},
      {"selected polygons", Object<kObjectPolygon>, 110119, 0, "[110011,0 L#1 L1 L2 ]"},
      {"hidden polygons", Object<kObjectPolygon>, 110120, 0, "[110011,0 L#1 L1 L2 ]"},
      {"selected edges", Object<kObjectPolygon>, 110128, 0, "[110011,0 L#1 L1 L2 ]"},
      {"hidden edges", Object<kObjectPolygon>, 110129, 0, "[110011,0 L#1 L1 L2 ]"},
      {"phong breaks", Object<kObjectPolygon>, 110132, 0, "[110011,0 L#1 L1 L2 ]"},
      {"n-gons", Object<kObjectPolygon>, 110133, 1, "L#2 L#2 U5 U6 L#1 U7"},
      {"tags", Object<kObjectNull>, 110108, 0, "[110100,0 [5600,0 " + kNode + "[5600,0 L=0 ] ] ]"},
      {"spline's points", Object<kObjectSpline>, 110117, 0, "[110011,0 L#1 L1 L2 ]"},
      // Tags.
      {"points", Tag<kTagPoint>, 5600, 0, "L#2 A6:1,2 A6:3,4 A6:5,6"},
      {"no points", Tag<kTagPoint>, 5600, 0, "L=0"},
      {"points before 11925", Tag<kTagPoint>, 5600, 0,
       "X850000000C X3FF0000000000000 X4000000000000000 X4008000000000000", unknown, -1, 11924},
      {"polygons", Tag<kTagPolygon>, 5604, 0, "L#1 A3:1 A3:2 A3:3 A3:4"},
      {"tangents", Tag<kTagTangent>, 5617, 0, "L#2 V1 V2 V3 V4"},
      {"coordinates", Tag<kTagUVW>, 5671, 3, "L#1 A3:2,4,6,8,10,12,14,16 B1"},
      {"coordinates 1", Tag<kTagUVW>, 5671, 1, "L#1 A3:2,4,6,8,10,12,14,16", "L#1 A3:2,4,6,8,10,12,14,16 B0", 3},
      {"segments", Tag<kTagSegment>, 5672, 0, "L#2 L1 B1 L2 B0"},
      {"vertex map", Tag<kTagVertexMap>, 5682, 0, "L#2 A5:0.5,0.25"},
      {"old vertex map", NewOf<BaseTag, 5708>, 5708, 0, "L#2 A5:0.5,0.25", unknown},
      {"normals", Tag<kTagNormal>, 5711, 0, "L#1 A2:1,2,3,4,5,6,7,8,9,10,11,12"},
      {"old texture 6", Tag<kTagTexture>, 110010, 6, kOldPoints + kOldSettings + "Sname%1006 k5 k6 L3 L2 R1 R2 B0@1200",
       unknown},
      {"old texture 6 before 11600", Tag<kTagTexture>, 110010, 6,
       kOldPoints + "Y=0 Y=0 " + kOldSettings + "L=1 L=2 Sname%1006 B=1 k5 k6 L3 L2 R1 R2 B0@1200", unknown, -1, 11599},
      {"old texture 5", Tag<kTagTexture>, 110010, 5, kOldPoints + kOldSettings + "Sname%1006 k5 k6 L3 L2 R1 R2",
       unknown},
      {"old texture 4", Tag<kTagTexture>, 110010, 4, kOldPoints + kOldSettings + "Sname%1006 k5 k6", unknown},
      {"old texture 3", Tag<kTagTexture>, 110010, 3, kOldPoints + kOldSettings + "Sname%1006 k5", unknown},
      {"old texture 2 before 11600", Tag<kTagTexture>, 110010, 2,
       kOldPoints + "Y=0 Y=0 " + kOldSettings + "L=1 L=2 Sname%1006 B=1", unknown, -1, 11599},
      {"old texture 1", Tag<kTagTexture>, 110010, 1, kOldPoints + kOldSettings + "Sname%1006", unknown},
      {"old texture 0", Tag<kTagTexture>, 110010, 0, kOldPoints + kOldSettings, unknown},
      {"old compositing 5", Tag<kTagCompositing>, 5637, 5, kFlags3 + "B0@1017 " + kPairs5, unknown},
      {"old compositing 1", Tag<kTagCompositing>, 5637, 1, kFlags1, unknown},
      {"old compositing 0", Tag<kTagCompositing>, 5637, 0, kFlags0, unknown},
      {"old display 3", Tag<kTagDisplay>, 110009, 3, kOldDisplay0 + kOldDisplay1 + kOldDisplay2 + "B0%1014 B1%1015",
       unknown, -1, 11610},
      {"old display 2", Tag<kTagDisplay>, 110009, 2, kOldDisplay0 + kOldDisplay1 + kOldDisplay2, unknown, -1, 11610},
      {"old display 1", Tag<kTagDisplay>, 110009, 1, kOldDisplay0 + kOldDisplay1, unknown, -1, 6000},
      {"old display 0", Tag<kTagDisplay>, 110009, 0, kOldDisplay0, unknown, -1, 11610},
      {"display", Tag<kTagDisplay>, 5613, 0, "[1,1 L=1 ]", unknown},
      {"selection", Tag<kTagPointSelection>, 110011, 0, "L#2 L1 L2 L9 L20"},
      {"plug-in's tag", Tag<kTagPlugin>, 110064, 3, "L=1234567 L=0 Sname L1 [7,7 Stext ]"},
      {"weights", Tag<kTagPlugin>, 110064, 6, "L=1019365 L=0 Sname L#1 Y1 L=0 " + kJoint + "[1021281,1 Y50 k ]",
       unknown},
      {"weights 4", Tag<kTagPlugin>, 110064, 4, "L=1019365 L=0 Sname L#1 Y1 L=0 " + kJoint + "Y50", unknown},
      {"weights 0", Tag<kTagPlugin>, 110064, 0, "L=1019365 L=0 Sname L#1 " + kJoint, unknown},
      // Materials and shaders.
      {"channels", New<Material>, 5703, 0, "7( B1 [5899,0 ] B0 [5899,0 ] )"},
      {"channels that hold something", New<Material>, 5703, 0, "14( B1 [5899,0 [5704,0 V1 ] [1,1 L2 ] ] )",
       "14( B1 [5899,0 ] )", 0},
      {"channels before 9400", New<Material>, 5703, 0, "6( B0 [5899,0 ] B1 [5899,0 ] ) B0 [5899,0 ]", kOldSwitches, 0,
       9399},
      {"old channels 4", New<Material>, 5703, 4, kOldSurfaceOn + "B0 B1 B1 K7 B1", kOldSwitches, 0, 7499},
      {"old channels 3", New<Material>, 5703, 3, kOldSurfaceOn + "B0 B1 B1 K7", kOldSwitches, 0, 6000},
      {"old channels 2", New<Material>, 5703, 2, kOldSurfaceOn + "B0 B1 B1", kOldSwitches, 0, 7499},
      {"old channels 1", New<Material>, 5703, 1, kOldSurfaceOn + "B0 B1", kOldSwitches, 0, 6000},
      {"old channels 0", New<Material>, 5703, 0, "6( B0 B1 ) " + kOldSurface, kOldSwitches, 0, 7499},
      {"pictures with one", New<Material>, 110012, 2, "S= X810000000401020304 2( X8100000000 ) B=0"},
      {"pictures", New<Material>, 110012, 2, "S= " + kPictures + "B=0"},
      {"pictures 0", New<Material>, 110012, 0, "S= " + kPictures, "S= " + kPictures + "B=0", 2},
      {"pictures 1 before 7500", New<Material>, 110012, 1, "Sname " + kPictures + "K=0", "Sname " + kPictures + "B=0",
       2, 7499},
      {"shaders", New<Material>, 110131, 0, "[110100,0 [5707,0 " + kNode + "[110064,0 L=5833 L=0 S= ] ] ]"},
      {"plug-in's material", NewOf<BaseMaterial, kMaterialPlugin>, 110064, 5, "L=1234567 L=0 S= L1 [7,7 Stext ]",
       unknown},
      {"shader", New<BaseShader>, 110064, 5, "L=1012161 L=0 S= L1 R2"},
      {"shaders in a shader", New<BaseShader>, 110100, 0, "[5707,0 " + kNode + "[110064,0 L=5833 L=0 S= ] ]", unknown},
      // Render settings and views.
      {"extra render settings", New<RenderData>, 300001047, 0, "K7"},
      {"multipasses", New<RenderData>, 300001049, 0, "[300001048,0 " + kNode + "[300001048,0 K7 ] ]", unknown},
      {"multipass", New<MultipassObject>, 300001048, 0, "K7"},
      {"video posts", New<RenderData>, 110130, 0,
       "[110100,0 [110066,0 " + kNode + "[110064,0 L7 L=0 S= ] [300001060,0 K8 ] ] ]"},
      {"video post", New<BaseVideoPost>, 110064, 0, "L7 L=0 Sname"},
      {"video post's settings", New<BaseVideoPost>, 300001060, 0, "K7"},
      {"draw", New<BaseDraw>, 110305, 2, "S= K7 V1 V2 V3 k k"},
      {"draw 1", New<BaseDraw>, 110305, 1, "S= K7 V1 V2 V3 k", "S= K7 V1 V2 V3 k k", 2},
      {"draw 0", New<BaseDraw>, 110305, 0, "S= K7 V1 V2 V3", "S= K7 V1 V2 V3 k k", 2},
      {"draws", New<ViewPanel>, 110124, 0, "[110100,0 [110305,0 [110305,2 S= K7 V1 V2 V3 k k ] ] ]", unknown},
      {"view panel", New<ViewPanel>, 110306, 0, "K7"},
      // Custom values, within a container.
      {"three numbers", New<BaseList2D>, 110050, 7, Custom(1009369, 0, "L1 L2 B1 ")},
      {"unit scale", New<BaseList2D>, 110050, 7, Custom(200000275, 0, "R2 L5 ")},
      {"opaque value", New<BaseList2D>, 110050, 7, Custom(1011153, 7, "L1 R2 Stext ")},
      {"gradient", New<BaseList2D>, 110050, 7,
       Custom(1000481, 1, "[132,1 L=-1 L=1000 L=15 L5 ] B=1 [132,1 L=-1 L=1000 L=15 L6 ] ")},
      {"blend layers", New<BaseList2D>, 110050, 7, Custom(1011131, 2, BlendStack(3))},
      {"blend layers 1", New<BaseList2D>, 110050, 7, Custom(1011131, 2, BlendStack(1)), unknown},
      {"blend layers 0", New<BaseList2D>, 110050, 7, Custom(1011131, 2, BlendStack(0)), unknown},
  };
  return samples;
}

const RecordSample& FindRecordSample(const std::string& name)
{
  const auto& samples = RecordSamples();
  return *std::find_if(samples.begin(), samples.end(), [&](const RecordSample& sample) { return sample.name == name; });
}
