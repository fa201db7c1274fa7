// The parameters of new nodes against the table of them, and what becomes of them when they change.
#include "support/library.h"
#include "support/text_table.h"

namespace
{

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

  // What the table says of it.
  std::string Text() const
  {
    for (const std::string& line : TextTable("q7r_file/defaults.txt")) {
      if (line.rfind(name + std::string(" | "), 0) == 0)
        return line.substr(std::string(name).size() + 3);
    }
    return "none";
  }
};

const Defaults kDefaults[] = {
    {"camera", [] { return static_cast<BaseList2D*>(AllocObject(kObjectCamera)); }},
    {"spline", [] { return static_cast<BaseList2D*>(AllocObject(kObjectSpline)); }},
    {"plugin material", [] { return static_cast<BaseList2D*>(MakeMaterial(77)); }},
    {"material", [] { return static_cast<BaseList2D*>(MakeMaterial(kMaterialStandard)); }},
    {"render settings", [] { return static_cast<BaseList2D*>(NewObj<RenderData>()); }},
    {"multipass", [] { return static_cast<BaseList2D*>(NewObj<MultipassObject>()); }},
    {"draw", [] { return static_cast<BaseList2D*>(NewObj<BaseDraw>()); }},
    {"texture tag", [] { return static_cast<BaseList2D*>(MakeTag(kTagTexture)); }},
    {"target tag", [] { return static_cast<BaseList2D*>(MakeTag(kTagTarget)); }},
    {"display tag", [] { return static_cast<BaseList2D*>(MakeTag(kTagDisplay)); }},
    {"compositing tag", NewTagToRead},
};

} // namespace

TEST(Defaults, AreThese)
{
  for (const Defaults& row : kDefaults) {
    BaseList2D* node = row.make();
    EXPECT_EQ(TextOf(node->GetDataInstance()), row.Text()) << row.name;
    DeleteObj(node);
  }
}

// A node that changes must not change its fellows, nor what comes later; nor may a copy.
TEST(Defaults, AreSharedUntilTheyChange)
{
  for (const Defaults& row : kDefaults) {
    SCOPED_TRACE(row.name);
    const std::string text = row.Text();
    BaseList2D* node = row.make();
    BaseList2D* fellow = row.make();
    BaseContainer& data = node->GetDataInstance();
    const BaseContainer& reader = data;
    const Long count = data.GetCount();
    const LLong blocks = counting_memory::Get().blocks;
    const BaseContainer copy = data;
    EXPECT_TRUE(copy.IsEqual(data) || text.find(":s") != std::string::npos); // texts are never equal
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
      EXPECT_NE(TextOf(changed), text);
    }
    const UWord dirty = data.GetDirty();
    EXPECT_TRUE(data.InsertDataAfter(-5, GeData(1.5), reader.GetIndexData(0)) && data.GetIndexId(1) == -1);
    EXPECT_TRUE(data.RemoveData(reader.GetIndexId(0)) && data.SetData(999999, GeData(true)));
    EXPECT_EQ(data.GetCount(), count + 1);
    EXPECT_EQ(static_cast<UWord>(data.GetDirty() - dirty), 3);
    EXPECT_EQ(TextOf(fellow->GetDataInstance()), text);
    EXPECT_EQ(TextOf(copy), text);
    counting_memory::FailAfter(0);
    EXPECT_FALSE(fellow->GetDataInstance().SetData(999999, GeData(true)));
    EXPECT_EQ(fellow->GetDataInstance().GetIndexData(0), nullptr);
    counting_memory::FailNever();
    EXPECT_EQ(TextOf(fellow->GetDataInstance()), text);
    DeleteObj(node);
    DeleteObj(fellow);
    BaseList2D* later = row.make();
    EXPECT_EQ(TextOf(later->GetDataInstance()), text);
    DeleteObj(later);
  }
}
