#include "support/library.h"

namespace
{

using PortPtr = std::unique_ptr<DrawPort>;

PortPtr NewPort(Long depth, Long width, Long height)
{
  PortPtr port(DrawPortCreate(depth));
  EXPECT_EQ(IMAGERESULT_OK, port->Init(width, height));
  return port;
}

// A leaf without a bit count.
class BitlessPort : public DrawPort_GREY8
{
 public:
  BitlessPort() { bits_ = 0; }
};

} // namespace

TEST(DrawPorts, FillRowsUpToFourBytes)
{
  const std::tuple<Long, Long, Long, Long, LLong, Long, Long> cases[] = {
      {kDepthColor, 3, 2, 24, 12, 3, 2}, {kDepthColor, 4, 1, 24, 12, 4, 1}, {kDepthGrey, 5, 3, 8, 8, 5, 3},
      {kDepthGrey, 8, 1, 8, 8, 8, 1},    {kDepthColor, 0, -7, 24, 4, 1, 1}, {kDepthGrey, 1, 0, 8, 4, 1, 1}};
  for (const auto& [depth, width, height, bits, rowSize, gotWidth, gotHeight] : cases) {
    const PortPtr port = NewPort(depth, width, height);
    EXPECT_EQ(std::tuple(port->GetBits(), port->GetDepth(), port->GetRowSize(), port->GetWidth(), port->GetHeight()),
              std::tuple(bits, depth, rowSize, gotWidth, gotHeight));
    const Bytes pixels(port->GetPixels(), port->GetPixels() + rowSize * gotHeight);
    EXPECT_EQ(Bytes(pixels.size(), 0), pixels);
  }
  for (Long depth : {0, 1, 3, 5, 24})
    EXPECT_EQ(nullptr, DrawPortCreate(depth));
}

TEST(DrawPorts, TakeAndGivePixelsAtAStep)
{
  const PortPtr color = NewPort(kDepthColor, 3, 2);
  const Bytes spread = {1, 2, 3, 99, 4, 5, 6, 99};
  EXPECT_EQ(2, color->SetLine(1, 1, 2, spread.data(), 4));
  EXPECT_EQ("00 00 00 00 00 00 00 00 00 00 00 00 00 00 00 01 02 03 04 05 06 00 00 00", ToHex(color->GetPixels(), 24));
  Bytes row(9, 7);
  EXPECT_EQ(3, color->GetLine(0, 1, 3, row.data(), 3));
  EXPECT_EQ("00 00 00 01 02 03 04 05 06", ToHex(row));
  // Of single bytes each keeps the red; two run over.
  Bytes reds(5, 7);
  color->GetLine(0, 1, 3, reds.data(), 1);
  EXPECT_EQ("00 01 04 05 06", ToHex(reds));

  const PortPtr grey = NewPort(kDepthGrey, 5, 2);
  EXPECT_EQ(3, grey->SetLine(2, 1, 3, spread.data(), 2));
  EXPECT_EQ("00 00 00 00 00 00 00 00 00 00 01 03 04 00 00 00", ToHex(grey->GetPixels(), 16));
  Bytes wide(9, 7);
  EXPECT_EQ(3, grey->GetLine(2, 1, 3, wide.data(), 3));
  EXPECT_EQ("01 07 07 03 07 07 04 07 07", ToHex(wide));
}

TEST(DrawPorts, CopyOnlyBetweenEqualShapes)
{
  const PortPtr source = NewPort(kDepthGrey, 5, 2);
  const Bytes row = {1, 2, 3, 4, 5};
  source->SetLine(0, 1, 5, row.data(), 1);
  const PortPtr twin = NewPort(kDepthGrey, 5, 2);
  EXPECT_TRUE(source->CopyTo(*twin));
  EXPECT_EQ(ToHex(source->GetPixels(), 16), ToHex(twin->GetPixels(), 16));
  EXPECT_TRUE(source->CopyTo(*source));

  const PortPtr others[] = {NewPort(kDepthColor, 5, 2), NewPort(kDepthGrey, 6, 2), NewPort(kDepthGrey, 5, 3),
                            PortPtr(DrawPortCreate(kDepthGrey))};
  for (const PortPtr& other : others)
    EXPECT_FALSE(source->CopyTo(*other) || other->CopyTo(*source));
  twin->FreeStore();
  EXPECT_FALSE(source->CopyTo(*twin));
  EXPECT_EQ(0, twin->GetWidth());
}

TEST(DrawPorts, KeepTheirPixelsWhenMemoryIsShort)
{
  const PortPtr port = NewPort(kDepthGrey, 4, 1);
  const Bytes row = {9, 8, 7, 6};
  port->SetLine(0, 0, 4, row.data(), 1);
  counting_memory::FailAfter(0);
  EXPECT_EQ(IMAGERESULT_MEMORY, port->Init(2, 2));
  counting_memory::FailNever();
  EXPECT_EQ(4, port->GetWidth());
  EXPECT_EQ("09 08 07 06", ToHex(port->GetPixels(), 4));
  EXPECT_EQ(IMAGERESULT_OK, port->Init(1, 2));
  EXPECT_EQ("00 00 00 00 00 00 00 00", ToHex(port->GetPixels(), 8));
}

TEST(DrawPorts, ReportAMissingBitCountAndTakeSixteen)
{
  BitlessPort port;
  EXPECT_EQ(IMAGERESULT_OK, port.Init(3, 1));
  EXPECT_EQ(1, CountReports());
  EXPECT_TRUE(port.GetBits() == 16 && port.GetRowSize() == 8);
}
