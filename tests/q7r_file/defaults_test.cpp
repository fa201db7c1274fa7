// The parameters of new nodes, in the order of a file: i stands for a Long, r for a Real, t for a Time in seconds, v
// for a Vector, and s, f, l and c for an empty String, file name, link and container, or for what the container holds.
#include <gtest/gtest.h>

#include "support/counting_memory.h"
#include "torvane/torvane.h"

namespace
{

using namespace _torvane_;

std::string Number(Real number)
{
  char text[40];
  std::snprintf(text, sizeof text, "%.16g", number);
  return text;
}

std::string TextOf(const BaseContainer& container);

std::string TextOf(const GeData& value)
{
  switch (value.GetType()) {
  case kDataLong:
    return "i" + std::to_string(value.GetLong());
  case kDataReal:
    return "r" + Number(value.GetReal());
  case kDataTime:
    return "t" + Number(value.GetTime().Get());
  case kDataVector: {
    const Vector& v = value.GetVector();
    return "v" + Number(v.x) + (v.x == v.y && v.y == v.z ? "" : "," + Number(v.y) + "," + Number(v.z));
  }
  case kDataString:
    return value.GetString().Content() ? "?" : "s";
  case kDataFilename:
    return value.GetFilename().Content() ? "?" : "f";
  case kDataLink:
    return value.GetLink() ? "?" : "l";
  case kDataContainer:
    return "c(" + TextOf(*value.GetContainer()) + ")";
  default:
    return "?";
  }
}

std::string TextOf(const BaseContainer& container)
{
  std::string text;
  for (Long i = 0; i < container.GetCount(); ++i)
    text += (i ? " " : "") + std::to_string(container.GetIndexId(i)) + ":" + TextOf(*container.GetIndexData(i));
  return text;
}

// The clock of a tag that a file is to fill stands still.
BaseList2D* NewTagToRead()
{
  BaseTag* tag = MakeTag(kTagCompositing);
  tag->PrepareToRead();
  return tag;
}

struct Defaults
{
  const char* name;
  BaseList2D* (*make)();
  const char* text;
};

const Defaults kDefaults[] = {
    {"camera", [] { return static_cast<BaseList2D*>(AllocObject(kObjectCamera)); },
     "500:r36 1000:r1 1001:i0 1006:r36 1007:i1 1009:i0 1010:r2000 1111:i0 1114:i0 1112:r0 1115:r0 1113:r1000 "
     "1116:r1000 1118:r0 1119:r0 1321:r0 1322:r0 1122:r0 1123:i0 1128:r10000 1129:i0 1130:l 1201:r8 "
     "1211:r0.03333333333333333 1212:r3.141592653589793 1213:r0 1214:r0.7 1220:i0 1231:r200 1241:r0 1300:i0 "
     "1301:i6 1302:r0 1303:r0 1306:r0 1305:l 1311:r6500 1312:r0 1331:r0 1333:r0 1341:r0 4200:i0 4201:r6.5 "
     "4202:i0 4204:r800 4205:r1000 4206:r1200 4207:i1"},
    {"spline", [] { return static_cast<BaseList2D*>(AllocObject(kObjectSpline)); },
     "1000:i0 1001:i3 1002:i0 1003:i8 1004:r0.08726646259971647 1005:r5"},
    {"plugin material", [] { return static_cast<BaseList2D*>(MakeMaterial(77)); },
     "500:i0 501:i0 1100:i1 1101:i1 1102:r1 1103:r0.65 1104:i0 1105:r1 1106:i0 1107:i0 1108:i1 1109:i1 "
     "1110:r10 1111:r100 1112:r1 1113:r1 1114:r1 1115:r1 1116:r1 1117:i0 1118:i0 1119:i128"},
    {"material", [] { return static_cast<BaseList2D*>(MakeMaterial(kMaterialStandard)); },
     "500:i0 501:i0 1100:i1 1101:i1 1102:r1 1103:r0.65 1104:i0 1105:r1 1106:i0 1107:i0 1108:i1 1109:i1 "
     "1110:r10 1111:r100 1112:r1 1113:r1 1114:r1 1115:r1 1116:r1 1117:i0 1118:i0 1119:i128 2100:v0.8 2101:r1 "
     "2102:r1 2103:i0 2300:v1 2301:r1 2302:r1 2303:i0 2400:v1 2401:r1 2402:r1 2403:i0 2500:v1 2501:r1 2502:r1 "
     "2503:i0 2600:v1 2601:r1 2602:r1 2603:i3 2700:v1 2701:r1 2900:v1 3100:v1 3101:r1 3102:r1 3103:i0 3200:v1 "
     "3201:r1 2200:r1 2201:r1 2202:i0 1000:i1 1001:i0 1002:i0 1003:i1 1004:i0 1005:r1 1006:r1 1007:r1 "
     "1008:r1000 1009:r0.2 1010:i1 1011:v0.1 1012:i1 1013:i1 1014:i0 1016:r0.5 1017:r0.2 1018:i0 1019:r1 "
     "1020:r5 1021:r10 1022:r0 1023:r1 1024:i1 1025:r1 1026:r5 1027:i0 1028:i1 1121:r0.5 1122:i5 1123:i128 "
     "1131:r0.5 1132:i5 1133:i128 1134:i0 1135:r0.5 1136:r0 1137:r0 1138:r1 1139:r0 2050:i1 2051:i1 2052:i1 "
     "2053:i1 2055:i1 2057:i1 2058:i1 2059:i1 2060:i1 2063:i1 2404:r1 2405:v1 2406:r100 2407:i1 2408:v0 "
     "2411:i0 2511:i0 3202:i0 3203:i4 3205:i1 3206:i1 3207:i0 3208:i0 3209:i1 3210:i1 3211:i1 3212:i0 3300:r1 "
     "3302:i0 3303:i0 3304:i0 3305:i0 3306:i0 8000:l 8001:l 8002:l 8003:l 8004:l 8005:l 8006:l 8007:l 8008:l "
     "8009:l 8012:l 8020:r0 8021:r0 8022:i0"},
    {"render settings", [] { return static_cast<BaseList2D*>(NewObj<RenderData>()); },
     "6014:i1 5008:r800 5009:r600 6004:r72 6006:r1.333333333333333 6002:i0 6008:r1 5001:i3 5300:i0 5002:i1 "
     "6016:i1 6017:i1 6018:i1 6019:i1 6020:i0 6021:i0 5007:i2 5010:i0 5011:r320 5012:r240 5013:r1 5014:r1 "
     "5016:i1 5017:t0 5018:t0 5019:i0 5020:r30 5021:i0 5022:i1 5024:i1 5025:i15 5026:i15 5027:r0.001 5028:r0.5 "
     "28508:r2 28509:r2 28510:i0 5029:v0 5059:v1 5060:i0 5061:r1 5062:r0 5063:i5 5030:i1 5064:i1 5032:i1 "
     "5033:i1100 5035:i0 5076:i1 5077:i0 5036:i0 5038:i0 5039:i0 5040:i0 5065:i320 5066:i240 5041:f 5042:f "
     "5043:i36 5044:r0 5045:r6.283185307179586 5046:i19 5047:r1.570796326794897 5048:r-1.570796326794897 "
     "5050:i1 5051:i1 5052:i1 5079:i0 5080:i0 5053:i0 5056:r1 10022:i72 5069:i1 5071:r0.1 5078:r0.5 5070:i0 "
     "5072:i0 5073:i2 5074:i1 5082:i0 5075:i1 5200:i1 5201:i1 5606:i0 5211:i0 5212:i0 5202:i0 5203:i1106 "
     "5205:i0 5206:f 5207:i1 5208:i2 5210:i1 5401:i1 5301:i0 5603:r1 5604:i1 5502:r128 6013:i1 6012:i1 7002:i1 "
     "7000:i64 7001:i64 7003:i0 7004:i0 7005:i0 7006:i0 7007:i0 7008:i0 6003:i0 6005:i1 5204:c() "
     "5702:c(10024:i353) 8000:i0 8018:i0 8001:i2 8023:i1 8002:i0 8003:i0 8004:i2 8007:i0 8005:i4 8006:i0 "
     "8013:i0 8014:v1,0,0 8015:v0,1,0 8009:i0 8011:i0 8010:i0 8012:i0 8017:i0 8021:i1 8022:i0"},
    {"multipass", [] { return static_cast<BaseList2D*>(NewObj<MultipassObject>()); }, "1002:i1"},
    {"draw", [] { return static_cast<BaseList2D*>(NewObj<BaseDraw>()); },
     "1019:i1 1020:i0 1021:i0 1022:i1 1023:r0.8 1024:r0.9 1025:i0 1026:r0.8 1027:i0 1028:r1 1029:i1 1031:r0.25 "
     "1032:r0.1 1038:i10 1037:r0 1044:i0 1045:i1 1046:r1 1047:r1 1048:r1 1049:i1 1050:i1 1051:r0 1064:r0.75 "
     "1052:r100 1053:i100 1054:i10 1056:i1 1058:i1 1059:i1 1060:i1 1061:i0 1062:i1 3026:i1 3028:i1 1065:i1 "
     "1066:r0.1000000014901161 1068:i0 1070:i0 1071:i0 1072:i0 2007:v1,0.67,0.1 2001:v0.2 2002:v0.8 3001:i1 "
     "3002:i1 3003:i1 3004:i1 3005:i1 3006:i1 3027:i1 3007:i1 3008:i1"},
    {"texture tag", [] { return static_cast<BaseList2D*>(MakeTag(kTagTexture)); },
     "1000:r0 1001:r0 1002:r1 1003:r1 1004:i0 1005:i0 1007:i1 1008:i0 1009:i0 1010:l 1012:v100 1017:l "
     "1018:r1.3333333333 1020:r1 1200:i1 1201:r0 1202:r0"},
    {"target tag", [] { return static_cast<BaseList2D*>(MakeTag(kTagTarget)); }, "1001:l 1002:l 1003:i1"},
    {"display tag", [] { return static_cast<BaseList2D*>(MakeTag(kTagDisplay)); },
     "1015:i1 10000:i0 10001:t0 10002:t3 10003:i12 10004:i12 10005:i3 10006:i40 10007:i40 10009:s 10010:r1 "
     "10011:i5 20000:v0.5568627450980392,0.6784313725490196,0.796078431372549 "
     "20001:v1,0.6666666666666666,0.09411764705882353 "
     "20002:v0.3333333333333333,0.8745098039215686,0.5607843137254902 "
     "20003:v0.8980392156862745,0.3568627450980392,0.3568627450980392 20004:v0.6627450980392157,0.6,1 30000:i1 "
     "30002:i0 30006:i0 30007:i0 30008:i0 30010:i0 30009:i2"},
    {"compositing tag", NewTagToRead,
     "1000:i1 1001:i1 1002:i1 1003:i1 1017:i1 1126:i1 1127:i1 1128:i1 1129:i1 1142:i1 1004:i0 1005:i0 1143:i0 "
     "1153:i0 1154:i0 1155:i0 1156:i0 1158:i0 1006:i0 1007:i2 1016:r0.1 1110:i1 1111:i2 1112:i3 1113:i4 "
     "1114:i5 1115:i6 1120:i7 1121:i8 1122:i9 1123:i10 1124:i11 1125:i12 1131:i1 1144:v0 1150:r1 1151:r1 "
     "1152:r1 1159:r1 1157:i0"},
};

} // namespace

TEST(Defaults, AreThese)
{
  for (const Defaults& row : kDefaults) {
    BaseList2D* node = row.make();
    EXPECT_EQ(TextOf(node->GetDataInstance()), row.text) << row.name;
    DeleteObj(node);
  }
}

// A node that changes must not change its fellows, nor what comes later; nor may a copy.
TEST(Defaults, AreSharedUntilTheyChange)
{
  const counting_memory::BalanceCheck balance;
  for (const Defaults& row : kDefaults) {
    SCOPED_TRACE(row.name);
    BaseList2D* node = row.make();
    BaseList2D* fellow = row.make();
    BaseContainer& data = node->GetDataInstance();
    const BaseContainer& reader = data;
    const Long count = data.GetCount();
    const LLong blocks = counting_memory::Get().blocks;
    const BaseContainer copy = data;
    EXPECT_TRUE(copy.IsEqual(data) || std::string(row.text).find(":s") != std::string::npos); // texts are never equal
    EXPECT_EQ(reader.GetData(reader.GetIndexId(0)).GetType(), data.GetData(data.GetIndexId(0)).GetType());
    EXPECT_TRUE(reader.GetIndexData(0)->GetType() == kDataLink || counting_memory::Get().blocks == blocks);
    for (Long i = 0; i < count; ++i) {
      // Every way to a value that can be changed.
      const Long id = data.GetIndexId(i);
      BaseContainer changed = data;
      if (GeAliasLink* link = changed.GetData(id).GetAliasLink())
        link->SetLink(fellow);
      else if (changed.FindData(id)->GetType() == kDataContainer)
        changed.GetContainerInstance(id)->SetLong(1, 1);
      else
        *changed.GetIndexData(i) = GeData(static_cast<Long>(4711));
      EXPECT_NE(TextOf(changed), row.text);
    }
    const UWord dirty = data.GetDirty();
    EXPECT_TRUE(data.InsertDataAfter(-5, GeData(1.5), reader.GetIndexData(0)));
    EXPECT_EQ(data.GetIndexId(1), -1);
    EXPECT_TRUE(data.RemoveData(reader.GetIndexId(0)) && data.SetData(999999, GeData(true)));
    EXPECT_EQ(data.GetCount(), count + 1);
    EXPECT_EQ(static_cast<UWord>(data.GetDirty() - dirty), 3);
    EXPECT_EQ(TextOf(fellow->GetDataInstance()), row.text);
    EXPECT_EQ(TextOf(copy), row.text);
    counting_memory::FailAfter(0);
    EXPECT_FALSE(fellow->GetDataInstance().SetData(999999, GeData(true)));
    EXPECT_EQ(fellow->GetDataInstance().GetIndexData(0), nullptr);
    counting_memory::FailNever();
    EXPECT_EQ(TextOf(fellow->GetDataInstance()), row.text);
    DeleteObj(node);
    DeleteObj(fellow);
    BaseList2D* later = row.make();
    EXPECT_EQ(TextOf(later->GetDataInstance()), row.text);
    DeleteObj(later);
  }
}
