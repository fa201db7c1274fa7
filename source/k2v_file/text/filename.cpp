#include "torvane/text/filename.h"

#include <utility>

#include "torvane/memory/memory.h"

namespace _torvane_
{

namespace
{

constexpr char kPresetSign[] = "preset://";
constexpr char kConnectionSign[] = "?ipc";
constexpr char kStreamSign[] = "?_is";
constexpr Long kSignLength = 4;
constexpr Long kPointerStart = 6; // behind the sign and "0x"
constexpr Long kPointerDigits = 16;
constexpr Long kShortSuffix = 7; // with its dot

void DropBlanksAtEnd(String& text)
{
  Long end = text.GetLength();
  while (end > 0 && text[end - 1] == u' ')
    --end;
  text.Delete(end, text.GetLength() - end);
}

void AppendChar(String& text, UniChar c) { text.InsertChar(text.GetLength(), c); }

} // namespace

void MemoryDescription::Clear() noexcept
{
  if (flags & kMemoryOwnsBlock)
    GeFree(data);
  data = nullptr;
  size = 0;
  writer.Clear();
}

Bool MemoryDescription::GetBlock(Long n, const void*& block, LLong& blockSize) const noexcept
{
  if (!data)
    return writer.GetBlock(n, block, blockSize);
  if (n != 0)
    return writer.GetBlock(n - 1, block, blockSize);
  block = data;
  blockSize = size;
  return true;
}

Bool MemoryDescription::Join() noexcept
{
  LLong total = size + writer.GetSize();
  if (total <= 0)
    return false;
  if (writer.GetBlockCount() == 0)
    return true;
  UChar* joined = static_cast<UChar*>(GeAllocNC(total));
  if (!joined)
    return false;
  LLong filled = 0;
  const void* block = nullptr;
  LLong blockSize = 0;
  for (Long n = 0; GetBlock(n, block, blockSize); ++n) {
    GeCopyMem(joined + filled, block, blockSize);
    filled += blockSize;
  }
  Clear();
  flags |= kMemoryOwnsBlock;
  data = joined;
  size = total;
  return true;
}

Filename::Filename(const Filename& other) noexcept : text_(other.text_) { ShareMemory(other); }

Filename::Filename(Filename&& other) noexcept : text_(std::move(other.text_)) { ShareMemory(other); }

Filename& Filename::operator=(const Filename& other) noexcept
{
  if (&other != this) {
    text_ = other.text_;
    ShareMemory(other);
  }
  return *this;
}

Filename& Filename::operator=(Filename&& other) noexcept
{
  if (&other != this) {
    text_ = std::move(other.text_);
    ShareMemory(other);
  }
  return *this;
}

// The description held inline never owns its block, so that its copies may name the same one.
void Filename::ShareMemory(const Filename& other) noexcept
{
  if (other.memory_ == &other.inline_) {
    SetMemoryRead(other.inline_.data, other.inline_.size);
  } else {
    ClearMemory();
    memory_ = other.memory_;
  }
}

void Filename::SetString(const String& text) noexcept
{
  text_ = text;
  if (text_.Content() && text_[text_.GetLength() - 1] == GetSeparator())
    text_.Delete(text_.GetLength() - 1, 1);
  DropBlanksAtEnd(text_);
}

UniChar Filename::GetSeparator() const noexcept { return IsPreset() ? UniChar{u'/'} : kPathSeparator; }

Bool Filename::IsPreset() const noexcept
{
  constexpr Long kLength = sizeof kPresetSign - 1;
  return !IsMemory() && text_.SubStr(0, kLength) == String(kPresetSign);
}

Filename Filename::Concat(const Filename& other) const noexcept
{
  Filename result;
  result.text_ = text_;
  result.Append(other);
  return result;
}

void Filename::Append(const Filename& other) noexcept
{
  String file = other.GetFileString();
  if (!text_.Content()) {
    text_ = std::move(file);
    return;
  }
  DropBlanksAtEnd(file);
  AppendChar(text_, GetSeparator());
  text_.Append(file);
}

Filename Filename::GetDirectory() const noexcept
{
  Filename directory;
  Long separator = -1;
  if (text_.FindLast(GetSeparator(), separator))
    directory.text_ = text_.SubStr(0, separator);
  return directory;
}

String Filename::GetFileString() const noexcept
{
  Long separator = -1;
  text_.FindLast(GetSeparator(), separator);
  return text_.SubStr(separator + 1, text_.GetLength());
}

// The last dot, if it stands behind the last separator and within the last `limit` characters, else -1.
Long Filename::FindSuffix(Long limit) const noexcept
{
  Long dot = -1;
  Long separator = -1;
  text_.FindLast(u'.', dot);
  text_.FindLast(GetSeparator(), separator);
  return dot > separator && dot >= text_.GetLength() - limit ? dot : -1;
}

void Filename::ClearSuffix() noexcept
{
  Long dot = FindSuffix(kShortSuffix);
  if (dot >= 0)
    text_.Delete(dot, text_.GetLength() - dot);
}

void Filename::ClearSuffixComplete() noexcept
{
  Long dot = FindSuffix(text_.GetLength());
  if (dot >= 0)
    text_.Delete(dot, text_.GetLength() - dot);
}

Bool Filename::CheckSuffix(const String& suffix) const noexcept
{
  Long dot = FindSuffix(suffix.GetLength() + 1);
  return dot >= 0 && text_.SubStr(dot + 1, text_.GetLength()).ToLower() == suffix.ToLower();
}

void Filename::SetSuffix(const String& suffix) noexcept
{
  ClearSuffix();
  AppendChar(text_, u'.');
  text_.Append(suffix);
}

void Filename::SetMemoryRead(const void* data, LLong size) noexcept
{
  inline_.flags = kMemoryMayRead;
  inline_.data = data;
  inline_.size = data && size > 0 ? size : 0;
  memory_ = &inline_;
}

void Filename::SetMemoryWrite(MemoryDescription* description) noexcept
{
  ClearMemory();
  if (!description)
    return;
  if (!(description->flags & kMemoryOwnsBlock))
    description->Clear(); // it must not come to own the foreign block
  description->flags = kMemoryMayWrite | kMemoryOwnsBlock;
  memory_ = description;
}

Bool Filename::GetMemoryContinuous(const void*& data, LLong& size) const noexcept
{
  return memory_ && memory_->Join() && memory_->GetBlock(0, data, size);
}

void Filename::ClearMemory() noexcept
{
  memory_ = nullptr;
  inline_.data = nullptr;
  inline_.size = 0;
  inline_.flags = kMemoryOwnsBlock;
}

void Filename::SetPointer(const char* sign, const void* pointer) noexcept
{
  constexpr char kDigits[] = "0123456789ABCDEF";
  char text[kPointerStart + kPointerDigits + 1] = {};
  for (Long i = 0; i < kSignLength; ++i)
    text[i] = sign[i];
  text[kSignLength] = '0';
  text[kSignLength + 1] = 'x';
  ULLong address = reinterpret_cast<std::uintptr_t>(pointer);
  for (Long i = 0; i < kPointerDigits; ++i)
    text[kPointerStart + i] = kDigits[address >> (60 - 4 * i) & 15];
  text_ = String(text);
}

void* Filename::GetPointer(const char* sign) const noexcept
{
  if (!(text_.SubStr(0, kSignLength) == String(sign)))
    return nullptr;
  constexpr UniChar kA = u'A';
  ULLong address = 0;
  Long end = kPointerStart + kPointerDigits < text_.GetLength() ? kPointerStart + kPointerDigits : text_.GetLength();
  String digits = text_.ToUpper();
  for (Long i = kPointerStart; i < end; ++i) {
    UniChar c = digits[i];
    Bool letter = c >= kA && c <= u'F';
    if (!letter && !(c >= u'0' && c <= u'9'))
      break;
    address = address << 4 | static_cast<ULLong>(letter ? c - kA + 10 : c - u'0');
  }
  return reinterpret_cast<void*>(static_cast<std::uintptr_t>(address));
}

void Filename::SetIpConnection(const NetworkConnection* connection) noexcept
{
  SetPointer(kConnectionSign, connection);
}

NetworkConnection* Filename::GetIpConnection() const noexcept
{
  return static_cast<NetworkConnection*>(GetPointer(kConnectionSign));
}

void Filename::SetStream(const FileStream* stream) noexcept { SetPointer(kStreamSign, stream); }

FileStream* Filename::GetStream() const noexcept { return static_cast<FileStream*>(GetPointer(kStreamSign)); }

} // namespace _torvane_
