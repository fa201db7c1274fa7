// Shaders: their chunks, their children, types that the library doesn't know, and copies.
#include "support/library.h"

namespace
{

constexpr Long kUnknownType = 1012345;

BaseShader* AddChild(BaseShader& parent, Long type)
{
  BaseShader* child = MakeShader(type);
  child->InsertUnderLast(&parent);
  return child;
}

// "(1 2(3))": the types below a shader.
std::string TypesBelow(const BaseShader& parent)
{
  std::string text = "(";
  for (BaseShader* child = parent.GetDown(); child; child = child->GetNext()) {
    EXPECT_EQ(child->GetUp(), &parent);
    text += std::to_string(child->GetType()) + (child->GetDown() ? TypesBelow(*child) : "") + " ";
  }
  text.back() = ')';
  return text;
}

} // namespace

TEST(Shader, KeepsAFilenameOnlyAsABitmap)
{
  BaseShader bitmap;
  EXPECT_FALSE(bitmap.HasBitmapFilename());
  bitmap.SetBitmapFilename(Filename("a.png"));
  EXPECT_TRUE(bitmap.HasBitmapFilename() && bitmap.GetDataInstance().GetData(1000).GetType() == 131);
  BaseShader other(1012161);
  other.SetBitmapFilename(Filename("a.png"));
  EXPECT_EQ(other.GetDataInstance().GetCount(), 0);
  other.GetDataInstance().SetFilename(1000, Filename("a.png"));
  EXPECT_FALSE(other.HasBitmapFilename());
}

TEST(Shader, ReadsChildrenBehindThoseThatItHas)
{
  BaseShader shader;
  AddChild(shader, 1);
  const std::string members = "[110100,0 [5707,0 [110064,0 L2 L0 SS ] ] [99,1 L1 ] [5707,0 [110064,0 L3 L0 SS ] "
                              "[110100,0 [5707,0 [110064,0 L4 L0 SS ] ] ] ] ] [110064,0 L1012345 L0 SS ]";
  ASSERT_TRUE(ReadInto(shader, Record(members)));
  EXPECT_EQ(TypesBelow(shader), "(1 2 3(4))");
  EXPECT_EQ(shader.GetType(), kUnknownType); // what follows the children is in step

  // Written and read again, and with the list in a chunk of its own.
  BaseShader again;
  ASSERT_TRUE(ReadInto(again, BytesOf(shader)));
  EXPECT_EQ(TypesBelow(again), "(1 2 3(4))");
  BaseShader nested;
  ASSERT_TRUE(ReadInto(nested, Record("[110100,0 " + members + " ]")));
  EXPECT_EQ(TypesBelow(nested), "(2 3(4))");
}

TEST(Shader, TakesNoChildrenFromADamagedList)
{
  BaseShader shader;
  EXPECT_FALSE(ReadInto(shader, Record("[110100,0 [5707,0 [110064,0 L2 L0 SS ] ] [5707,0 L1 ] ]")));
  EXPECT_EQ(shader.GetDown(), nullptr);
}

TEST(Shader, ClonesItsChildrenUnlessToldOtherwise)
{
  BaseShader shader(kUnknownType);
  BaseShader* first = AddChild(shader, 1);
  BaseShader* second = AddChild(shader, 2);
  AddChild(*second, 3);
  first->GetDataInstance().SetLink(5, second); // within what is copied
  second->GetDataInstance().SetLink(5, &shader);
  auto* clone = static_cast<BaseShader*>(shader.MakeClone(0, nullptr));
  ASSERT_NE(clone, nullptr);
  EXPECT_EQ(clone->GetType(), kUnknownType);
  EXPECT_EQ(TypesBelow(*clone), "(1 2(3))");
  BaseShader* child = clone->GetDown();
  EXPECT_EQ(child->GetDataInstance().GetLink(5), child->GetNext());
  EXPECT_EQ(child->GetNext()->GetDataInstance().GetLink(5), clone);
  auto* bare = static_cast<BaseShader*>(shader.MakeClone(kCopyNoChildren, nullptr));
  EXPECT_EQ(bare->GetDown(), nullptr);
  DeleteObj(clone);
  DeleteObj(bare);
}
