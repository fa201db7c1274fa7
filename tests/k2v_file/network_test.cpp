#include <chrono>
#include <numeric>
#include <thread>

#include "support/library.h"

namespace
{

constexpr LLong kBlock = 256000;
constexpr LLong kUnseenEnd = 2147483647;

Bytes CountedBytes(LLong size)
{
  Bytes bytes(static_cast<std::size_t>(size));
  for (std::size_t i = 0; i < bytes.size(); ++i)
    bytes[i] = static_cast<UChar>(i * 7 + i / 251);
  return bytes;
}

// Lengths travel in the machine's order.
void AddLength(Bytes& bytes, ULong length)
{
  UChar raw[4];
  std::memcpy(raw, &length, sizeof raw);
  bytes.insert(bytes.end(), raw, raw + 4);
}

void AddBlock(Bytes& bytes, const Bytes& block)
{
  AddLength(bytes, static_cast<ULong>(block.size()));
  bytes.insert(bytes.end(), block.begin(), block.end());
}

// Two connected ends on this machine.
class NetworkTest : public testing::Test
{
 protected:
  void SetUp() override
  {
    NetworkListener listener;
    ASSERT_TRUE(listener.Listen());
    ASSERT_NE(listener.GetPort(), 0);
    ASSERT_TRUE(near.Connect("127.0.0.1", listener.GetPort()) && listener.Accept(far));
    for (NetworkConnection* end : {&near, &far})
      end->SetTimeout(5000);
    nearName.SetIpConnection(&near);
  }

  // Sends bytes from the far end on a thread of its own, then closes it.
  std::thread SendFromFar(Bytes bytes)
  {
    return std::thread([this, sent = std::move(bytes)] {
      far.Send(sent.data(), static_cast<LLong>(sent.size()));
      far.Close();
    });
  }

  NetworkConnection near, far;
  Filename nearName;
};

TEST_F(NetworkTest, BytesPassBothWaysAndEndWithTheConnection)
{
  const Bytes bytes = CountedBytes(5'000'000);
  Bytes there(bytes.size()), back(bytes.size());
  const auto size = static_cast<LLong>(bytes.size());
  std::thread other([&] {
    EXPECT_EQ(far.Receive(there.data(), size), size);
    EXPECT_EQ(far.Send(there.data(), size), size);
    far.Close();
  });
  EXPECT_EQ(near.Send(bytes.data(), size), size);
  EXPECT_EQ(near.Receive(back.data(), size), size);
  other.join();
  EXPECT_TRUE(back == bytes);
  EXPECT_EQ(near.Receive(back.data(), 1), 0);
  EXPECT_EQ(far.Send(back.data(), 1), 0) << "a closed end";
}

TEST_F(NetworkTest, NothingWaitsLongerThanItWasTold)
{
  NetworkListener listener;
  ASSERT_TRUE(listener.Listen());
  listener.SetTimeout(20);
  near.SetTimeout(20);
  UChar byte = 0;
  const Bytes flood(64'000'000);
  const auto start = std::chrono::steady_clock::now();
  EXPECT_EQ(near.Receive(&byte, 1), 0);
  EXPECT_LT(near.Send(flood.data(), static_cast<LLong>(flood.size())), static_cast<LLong>(flood.size()));
  NetworkConnection nobody;
  EXPECT_FALSE(listener.Accept(nobody));
  EXPECT_LT(std::chrono::steady_clock::now() - start, std::chrono::seconds(4));
  const UWord port = listener.GetPort();
  NetworkListener second;
  EXPECT_FALSE(second.Listen(port)) << "the port is taken";
  listener.Close();
  EXPECT_FALSE(nobody.Connect("127.0.0.1", port) || nobody.IsConnected());
}

TEST_F(NetworkTest, AWriterSendsBlocksAndEndsThemWithAZero)
{
  for (LLong size : {LLong{0}, LLong{3}, kBlock, 2 * kBlock + 88000}) {
    SCOPED_TRACE(size);
    SetUp();
    const Bytes bytes = CountedBytes(size);
    Bytes expected;
    for (LLong at = 0; at <= size; at += kBlock)
      AddBlock(expected, Bytes(bytes.begin() + at, bytes.begin() + std::min(size, at + kBlock)));
    AddLength(expected, 0);
    Bytes received(expected.size() + 1);
    std::thread other(
        [&] { received.resize(static_cast<std::size_t>(far.Receive(received.data(), std::ssize(received)))); });
    BaseFile file;
    ASSERT_TRUE(file.Open(nearName, kFileWrite));
    EXPECT_EQ(file.WriteWindow(1), nullptr);
    for (LLong at = 0; at < size; at += 100000)
      ASSERT_TRUE(file.WriteBytes(&bytes[static_cast<std::size_t>(at)], std::min<LLong>(100000, size - at)));
    EXPECT_EQ(file.GetPosition(), size);
    EXPECT_TRUE(file.Close());
    near.Close();
    other.join();
    EXPECT_TRUE(received == expected);
  }
}

TEST_F(NetworkTest, AReaderTakesBlocksOfAnySizeUpToTheZero)
{
  const Bytes bytes = CountedBytes(1'100'007);
  Bytes sent;
  LLong at = 0;
  for (LLong size : {5, 256000, 800000, 44002}) {
    AddBlock(sent, Bytes(bytes.begin() + at, bytes.begin() + at + size));
    at += size;
  }
  AddLength(sent, 0);
  std::thread other = SendFromFar(sent);
  BaseFile file;
  ASSERT_TRUE(file.Open(nearName, kFileRead));
  Bytes got(bytes.size());
  EXPECT_EQ(file.ReadBytes(got.data(), 7), 7);
  EXPECT_TRUE(file.Seek(999)) << "forward reads what it passes";
  EXPECT_TRUE(file.Seek(999));
  EXPECT_TRUE(file.GetPosition() == 999 && file.GetLength() == kUnseenEnd && file.GetRemaining() == -1);
  const LLong rest = 1'100'007 - 999;
  EXPECT_EQ(file.ReadBytes(got.data(), rest), rest);
  EXPECT_TRUE(std::equal(got.begin(), got.begin() + rest, bytes.begin() + 999));
  EXPECT_EQ(file.GetLength(), kUnseenEnd) << "the zero was not met yet";
  EXPECT_EQ(file.ReadBytes(got.data(), 1, true), 0);
  EXPECT_EQ(file.ReadBytes(got.data(), 1, true), 0);
  EXPECT_TRUE(file.GetLength() == 1'100'007 && file.GetRemaining() == 0);
  EXPECT_FALSE(file.Seek(1'100'006));
  EXPECT_EQ(file.GetError(), FILEERROR_INVALID) << "backward";
  other.join();
}

TEST_F(NetworkTest, AReadThatFailsSaysSo)
{
  Bytes lie, cutLength, cutBlock, ended;
  AddLength(lie, 0xFFFFFFFF);
  lie.resize(600'000);
  AddBlock(cutLength, {1, 2, 3, 4});
  cutLength.push_back(9);
  AddLength(cutBlock, 5);
  cutBlock.push_back(1);
  AddBlock(ended, {1, 2, 3, 4});
  AddLength(ended, 0);
  int number = 0; // seek: in place of reading
  const std::tuple<const Bytes&, Bool, LLong> kCases[] = {
      {lie, true, 0}, {cutLength, true, 0}, {cutBlock, true, 0}, {ended, false, 0}, {ended, true, 5}};
  for (const auto& [sent, allowShort, seek] : kCases) {
    SCOPED_TRACE(++number);
    SetUp();
    std::thread other = SendFromFar(sent);
    BaseFile file;
    ULLong value = 0;
    counting_memory::ResetPeak();
    const LLong before = counting_memory::Get().bytes;
    ASSERT_TRUE(file.Open(nearName, kFileRead));
    if (seek != 0)
      EXPECT_FALSE(file.Seek(seek));
    else
      EXPECT_EQ(file.ReadBytes(&value, 8, allowShort), 0);
    EXPECT_EQ(file.GetError(), FILEERROR_READ);
    EXPECT_LT(counting_memory::Get().peakBytes - before, 4'000'000) << "an announced length takes no memory";
    other.join();
  }
}

TEST_F(NetworkTest, AWriterWhoseReaderIsGoneFailsWithoutASignal)
{
  far.Close();
  const Bytes bytes(kBlock);
  BaseFile file;
  ASSERT_TRUE(file.Open(nearName, kFileWrite));
  Bool written = true;
  for (int i = 0; i < 400 && written; ++i)
    written = file.WriteBytes(bytes.data(), kBlock);
  EXPECT_FALSE(written);
  EXPECT_EQ(file.GetError(), FILEERROR_WRITE);
}

TEST_F(NetworkTest, OnlyReadingAndWritingAloneAreAllowed)
{
  BaseFile file;
  for (Long mode : {kFileReadWriteAtEnd, kFileReadWrite}) {
    EXPECT_FALSE(file.Open(nearName, mode));
    EXPECT_EQ(file.GetError(), FILEERROR_INVALID);
  }
  UChar byte = 0;
  ASSERT_TRUE(file.Open(nearName, kFileWrite));
  EXPECT_EQ(file.ReadBytes(&byte, 1), 0);
  EXPECT_EQ(CountReports(), 1);
  ASSERT_TRUE(file.Open(nearName, kFileRead));
  EXPECT_FALSE(file.WriteBytes(&byte, 1));
}

TEST_F(NetworkTest, OpeningFailsCleanlyWhereverMemoryRunsOut)
{
  Long last = FILEERROR_NONE;
  EveryFailedAllocation([&] {
    BaseFile file;
    const Bool opened = file.Open(nearName, kFileRead);
    last = opened ? last : file.GetError();
    EXPECT_EQ(file.Close(), opened);
    return opened;
  });
  EXPECT_EQ(last, FILEERROR_MEMORY) << "the block is what is allocated last";
}

} // namespace
