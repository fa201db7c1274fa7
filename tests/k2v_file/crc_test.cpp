#include <gtest/gtest.h>

#include "torvane/crc.h"

using namespace _torvane_;

namespace
{

constexpr char kDigits[] = "123456789";

// The published check values of both sums over the nine digits, in any partition.
template <class Crc, class Value>
void ExpectSum(Value expected)
{
  for (LLong split = 0; split <= 9; ++split) {
    Crc crc;
    crc.Update(kDigits, split);
    crc.GetCrc();
    crc.Update(kDigits + split, 9 - split);
    crc.Update(kDigits, 0);
    EXPECT_EQ(crc.GetCrc(), expected);
  }
  Crc crc;
  crc.Update("other", 5);
  crc.Reset();
  for (const char* digit = kDigits; *digit; ++digit)
    crc.UpdateByte(static_cast<UChar>(*digit));
  EXPECT_EQ(crc.GetCrc(), expected);
}

TEST(Crc, MatchesItsCheckValue)
{
  ExpectSum<Crc32>(ULong{0xCBF43926});
  ExpectSum<Crc64>(ULLong{0x62EC59E3F1A4F00A});
  EXPECT_EQ(Crc32().GetCrc(), 0u);
  EXPECT_EQ(Crc64().GetCrc(), 0u);
}

} // namespace
