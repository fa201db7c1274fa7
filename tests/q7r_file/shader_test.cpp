// Shaders: their chunks, their children, types that the library doesn't know, and copies.
#include <gtest/gtest.h>

#include "q7r_file/node_bytes.h"
#include "support/assertion_counter.h"
#include "support/counting_memory.h"
#include "support/text.h"
#include "torvane/shaders/base_shader.h"
#include "torvane/values/ge_data.h"

namespace
{

using namespace _torvane_;

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

// The chunks of a shader of today behind its node chunks.
ByteWriter TypeChunk(Long type, Long level)
{
  return ByteWriter().Start(110064, level).Long(type).Long(0).String(u"S").End();
}

// A member of a list of children, which holds `chunks`.
Bytes Member(const Bytes& chunks) { return ByteWriter().Start(5707, 0).Append(chunks).End().bytes; }

} // namespace

TEST(Shader, WritesItsChunksByteForByte)
{
  BaseShader shader;
  shader.SetName("S");
  shader.SetBitmapFilename(Filename("b"));
  SetCountingMarker(shader);
  const std::string node =
      "01 0001ADE2 00000007  0F 00000000  0F 00000000  01 00000084 00000001 0F FFFFFFFF"
      "0F 000003E8 0F 00000083 83 00000002 0062  02  0C 00  82 00000002 0053  0F 00000000  0F 00000001 0F 00000000"
      "80 0000000E 616C69617332 0000000000000000  0C 01 80 00000010 000102030405060708090A0B0C0D0E0F  15 00  02"
      "01 0001ADF5 00000002  0F 00000004  0F 00000000 0F 00000000 0F 00000000 0F 00000000  0C 00  02";
  const std::string own = "01 0001ADF0 00000000 0F 000016C9 0F 00000000 82 00000002 0053 02";
  EXPECT_EQ(ToHex(BytesOf(shader)), ToHex(FromHex(node + own)));

  BaseShader* child = AddChild(shader, kUnknownType);
  SetCountingMarker(*child);
  const std::string children = "01 0001AE14 00000000  01 0000164B 00000000";
  const Bytes behind = BytesOf(*child);
  EXPECT_EQ(ToHex(BytesOf(shader)), ToHex(FromHex(node + own + children)) + " " + ToHex(behind) + " 02 02");
}

TEST(Shader, KeepsAFilenameOnlyAsABitmap)
{
  BaseShader bitmap;
  EXPECT_FALSE(bitmap.HasBitmapFilename());
  bitmap.SetBitmapFilename(Filename("a.png"));
  EXPECT_TRUE(bitmap.HasBitmapFilename());
  EXPECT_EQ(bitmap.GetDataInstance().GetData(1000).GetType(), 131);
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
  ByteWriter inner;
  inner.Append(TypeChunk(3, 0).bytes).Start(110100, 0).Append(Member(TypeChunk(4, 0).bytes)).End();
  ByteWriter w;
  w.Start(110100, 0).Append(Member(TypeChunk(2, 0).bytes)).Start(99, 1).Long(1).End().Append(Member(inner.bytes)).End();
  w.Append(TypeChunk(kUnknownType, 0).bytes);
  ASSERT_TRUE(ReadInto(shader, w.bytes));
  EXPECT_EQ(TypesBelow(shader), "(1 2 3(4))");
  EXPECT_EQ(shader.GetType(), kUnknownType); // what follows the children is in step

  // Written and read again, and with the list in a chunk of its own.
  BaseShader again;
  ASSERT_TRUE(ReadInto(again, BytesOf(shader)));
  EXPECT_EQ(TypesBelow(again), "(1 2 3(4))");
  BaseShader nested;
  ASSERT_TRUE(ReadInto(nested, ByteWriter().Start(110100, 0).Append(w.bytes).End().bytes));
  EXPECT_EQ(TypesBelow(nested), "(2 3(4))");
}

TEST(Shader, TakesNoChildrenFromADamagedList)
{
  const counting_memory::BalanceCheck balance;
  AssertionCounter silent;
  ByteWriter w;
  w.Start(110100, 0).Append(Member(TypeChunk(2, 0).bytes)).Start(5707, 0).Long(1).End().End();
  BaseShader shader;
  EXPECT_FALSE(ReadInto(shader, w.bytes));
  EXPECT_EQ(shader.GetDown(), nullptr);
}

TEST(Shader, ClonesItsChildrenUnlessToldOtherwise)
{
  const counting_memory::BalanceCheck balance;
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
