#include "support/library.h"

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

// Long data are taken in slices and blocks: at every place and length they must come to what single bytes come to.
TEST(Crc, TakesLongDataAsItTakesSingleBytes)
{
  UChar data[400];
  for (ULong i = 0; i < sizeof data; ++i)
    data[i] = static_cast<UChar>(i * 151 + 7);
  for (LLong start = 0; start < 3; ++start) {
    Crc32 bytes;
    for (LLong size = 0; size < 397; bytes.UpdateByte(data[start + size++])) {
      Crc32 whole;
      whole.Update(data + start, size);
      EXPECT_EQ(whole.GetCrc(), bytes.GetCrc()) << start << ", " << size;
    }
  }
}

} // namespace
