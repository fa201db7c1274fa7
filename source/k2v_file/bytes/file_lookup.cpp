#include "k2v_file/bytes/disk_file.h"
#include "torvane/bytes/base_file.h"

namespace _torvane_
{

namespace
{

#ifdef _WIN32
// "C:" alone means the current directory of the drive; its root is what tells whether there is such a drive.
Bool IsDrive(const String& path) { return path.GetLength() == 2 && path[1] == u':'; }

PathKind LookUpDrive(const String& path)
{
  const PathKind kind = LookUpPath(path.Concat(String(1, kPathSeparator)));
  return kind == PathKind::kNothing ? kind : PathKind::kDirectory;
}
#endif

} // namespace

Bool GeFExist(const Filename& name, Bool directory)
{
  const String& path = name.GetString();
#ifdef _WIN32
  if (directory && IsDrive(path))
    return LookUpDrive(path) == PathKind::kDirectory;
#endif
  return LookUpPath(path) == (directory ? PathKind::kDirectory : PathKind::kFile);
}

} // namespace _torvane_
