#ifdef _WIN32

#include "k2v_file/bytes/disk_file.h"

#ifndef NOMINMAX
#define NOMINMAX
#endif
#define WIN32_LEAN_AND_MEAN
#include <cerrno>
#include <cstring>
#include <cwchar>
#include <share.h>
#include <windows.h>

#include "torvane/bytes/base_file.h"
#include "torvane/memory/memory.h"

namespace _torvane_
{

namespace
{

static_assert(sizeof(wchar_t) == sizeof(UniChar));

constexpr Long kInlineCharacters = 1023;
constexpr Long kPlainCharacters = 247; // a longer path needs the prefix that lifts the system's limit
constexpr wchar_t kLongPrefix[] = L"\\\\?\\";
constexpr wchar_t kLongSharePrefix[] = L"\\\\?\\UNC";
constexpr DWORD kPrefixRoom = 8;

// A path as the system takes it, with a terminator. One that is too long for the plain calls is made absolute and gets
// the prefix under which it may have up to 32767 characters.
class SystemPath
{
 public:
  explicit SystemPath(const String& path);
  ~SystemPath()
  {
    GeFree(block_);
    GeFree(longBlock_);
  }
  SystemPath(const SystemPath&) = delete;
  SystemPath& operator=(const SystemPath&) = delete;

  // Null when memory is short and for a path that no file can have.
  const wchar_t* Get() const { return text_; }

 private:
  void Lengthen();

  wchar_t inline_[kInlineCharacters + 1];
  wchar_t* block_ = nullptr;
  wchar_t* longBlock_ = nullptr;
  const wchar_t* text_ = nullptr;
};

SystemPath::SystemPath(const String& path)
{
  const Long length = path.GetLength();
  wchar_t* place = inline_;
  if (length > kInlineCharacters) {
    block_ = static_cast<wchar_t*>(GeAllocNC((LLong{length} + 1) * static_cast<LLong>(sizeof(wchar_t))));
    place = block_;
  }
  if (!place)
    return;
  for (Long i = 0; i < length; ++i) {
    if (path[i] == 0)
      return;
    place[i] = static_cast<wchar_t>(path[i]);
  }
  place[length] = 0;
  text_ = place;
  // A path that begins with two backslashes and a question mark or a dot is meant as it stands.
  const Bool verbatim = std::wcsncmp(place, kLongPrefix, 4) == 0 || std::wcsncmp(place, L"\\\\.\\", 4) == 0;
  if (length > kPlainCharacters && !verbatim)
    Lengthen();
}

// The prefix turns off the system's own reading of a path, so it is made absolute and tidied first. It is put into the
// room in front: a share's path gives up the first of its two backslashes for it.
void SystemPath::Lengthen()
{
  const wchar_t* plain = text_;
  text_ = nullptr;
  const DWORD needed = ::GetFullPathNameW(plain, 0, nullptr, nullptr);
  if (needed == 0)
    return;
  const LLong room = LLong{kPrefixRoom} + needed;
  longBlock_ = static_cast<wchar_t*>(GeAllocNC(room * static_cast<LLong>(sizeof(wchar_t))));
  if (!longBlock_)
    return;
  wchar_t* full = longBlock_ + kPrefixRoom;
  const DWORD length = ::GetFullPathNameW(plain, needed, full, nullptr);
  if (length == 0 || length >= needed)
    return;
  const Bool share = full[0] == L'\\' && full[1] == L'\\';
  const wchar_t* prefix = share ? kLongSharePrefix : kLongPrefix;
  const std::size_t prefixLength = std::wcslen(prefix);
  wchar_t* start = full + (share ? 1 : 0) - prefixLength;
  std::memcpy(start, prefix, prefixLength * sizeof(wchar_t));
  text_ = start;
}

struct OpenRule
{
  const wchar_t* mode;    // of an existing file
  const wchar_t* newMode; // where there is none
  int share;
};

// One row per FileMode. The N keeps the handle from child processes.
constexpr OpenRule kOpenRules[] = {
    {L"r+bN", L"w+bN", _SH_DENYRW}, // kFileReadWriteAtEnd
    {L"rbN", L"rbN", _SH_DENYWR},   // kFileRead
    {L"wbN", L"wbN", _SH_DENYRW},   // kFileWrite
    {L"r+bN", L"w+bN", _SH_DENYNO}, // kFileReadWrite
    {L"rbN", L"rbN", _SH_DENYWR},   // kFileReadAlias
    {L"rbN", L"rbN", _SH_DENYNO},   // kFileReadShared
};

PathKind LookUp(const wchar_t* path)
{
  WIN32_FILE_ATTRIBUTE_DATA data = {};
  if (!path || !::GetFileAttributesExW(path, GetFileExInfoStandard, &data))
    return PathKind::kNothing;
  return (data.dwFileAttributes & FILE_ATTRIBUTE_DIRECTORY) != 0 ? PathKind::kDirectory : PathKind::kFile;
}

} // namespace

std::FILE* OpenDiskFile(const String& path, Long mode)
{
  const SystemPath systemPath(path);
  if (!systemPath.Get())
    return RefusePath();
  const OpenRule& rule = kOpenRules[mode];
  const Bool exists = LookUp(systemPath.Get()) != PathKind::kNothing;
  return ::_wfsopen(systemPath.Get(), exists ? rule.mode : rule.newMode, rule.share);
}

Bool SeekDiskFile(std::FILE* file, LLong position) { return ::_fseeki64(file, position, SEEK_SET) == 0; }

Bool MeasureDiskFile(std::FILE* file, LLong& length)
{
  if (::_fseeki64(file, 0, SEEK_END) != 0)
    return false;
  length = ::_ftelli64(file);
  return length >= 0;
}

PathKind LookUpPath(const String& path) { return LookUp(SystemPath(path).Get()); }

} // namespace _torvane_

#endif
