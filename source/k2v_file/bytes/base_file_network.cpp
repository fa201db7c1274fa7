// The network target of BaseFile. Bytes travel in blocks: a 4-byte length in the machine's byte order, then the bytes;
// a length of 0 ends the stream.
#include "torvane/bytes/base_file.h"
#include "torvane/bytes/network_connection.h"

namespace _torvane_
{

namespace
{

constexpr LLong kBlockSize = 256000; // a writer sends when so many bytes have gathered
constexpr LLong kSkipStep = 1000;

Bool SendLength(NetworkConnection& connection, ULong length)
{
  return connection.Send(&length, sizeof length) == sizeof length;
}

} // namespace

Long BaseFile::OpenNetwork()
{
  if (mode_ != kFileRead && mode_ != kFileWrite)
    return FILEERROR_INVALID;
  buffer_ = static_cast<UChar*>(GeAlloc(kBlockSize));
  if (!buffer_)
    return FILEERROR_MEMORY;
  capacity_ = kBlockSize;
  target_ = Target::kNetwork;
  EmptyWindow(0);
  return FILEERROR_NONE;
}

LLong BaseFile::ReadNetwork(void* destination, LLong count, Long& problem)
{
  LLong got = 0;
  while (got < count && ReceiveBlock(problem))
    got += TakeWindow(static_cast<UChar*>(destination) + got, count - got);
  return got;
}

// Makes the next block the window; false at the end of the stream. The buffer grows with the bytes that have come, not
// with the length that was announced: that may be a lie.
Bool BaseFile::ReceiveBlock(Long& problem)
{
  if (cachedLength_ >= 0)
    return false;
  EmptyWindow(GetPosition());
  ULong length = 0;
  if (connection_->Receive(&length, sizeof length) != sizeof length) {
    problem = FILEERROR_READ;
    return false;
  }
  if (length == 0) {
    cachedLength_ = GetPosition();
    return false;
  }
  LLong received = 0;
  while (received < length) {
    if (received == capacity_ && !GrowBlock(length)) {
      problem = FILEERROR_MEMORY;
      return false;
    }
    const LLong end = length < capacity_ ? LLong{length} : capacity_;
    received += connection_->Receive(buffer_ + received, end - received);
    if (received < end) {
      problem = FILEERROR_READ;
      return false;
    }
  }
  readLeft_ = received;
  return true;
}

// Doubles the block buffer up to `limit` bytes and keeps what is in it.
Bool BaseFile::GrowBlock(LLong limit)
{
  const LLong position = GetPosition();
  const LLong larger = capacity_ * 2 < limit ? capacity_ * 2 : limit;
  auto* grown = static_cast<UChar*>(GeRealloc(buffer_, larger));
  if (!grown)
    return false;
  buffer_ = grown;
  capacity_ = larger;
  EmptyWindow(position);
  return true;
}

// Sends the block in hand, which may be empty: then it ends the stream.
Bool BaseFile::SendBlock()
{
  const LLong size = cursor_ - window_;
  EmptyWindow(GetPosition());
  return SendLength(*connection_, static_cast<ULong>(size)) && (size == 0 || connection_->Send(buffer_, size) == size);
}

Long BaseFile::WriteNetwork(const void* source, LLong count)
{
  const auto* from = static_cast<const UChar*>(source);
  while (count > 0) {
    const LLong room = capacity_ - (cursor_ - window_);
    const LLong taken = count < room ? count : room;
    FillWindow(from, taken);
    from += taken;
    count -= taken;
    if (taken == room && !SendBlock())
      return FILEERROR_WRITE;
  }
  return FILEERROR_NONE;
}

Long BaseFile::SeekNetwork(LLong position)
{
  if (position < GetPosition())
    return FILEERROR_INVALID;
  UChar dropped[kSkipStep];
  while (error_ == FILEERROR_NONE && position > GetPosition()) {
    const LLong left = position - GetPosition();
    ReadBytes(dropped, left < kSkipStep ? left : kSkipStep);
  }
  return error_;
}

// Sends the block in hand and the end of the stream. After a failed send the other side can't tell where a block
// begins, and nothing more is sent.
Long BaseFile::CloseNetwork()
{
  if (mode_ != kFileWrite || error_ == FILEERROR_WRITE)
    return FILEERROR_NONE;
  return SendBlock() && SendLength(*connection_, 0) ? FILEERROR_NONE : FILEERROR_WRITE;
}

} // namespace _torvane_
