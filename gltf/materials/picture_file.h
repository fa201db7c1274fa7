// Picture files as glTF takes them: PNG and JPEG, whole ones.
#pragma once

#include <cstdint>
#include <filesystem>
#include <string>
#include <vector>

namespace gltf
{

enum class PictureState
{
  kGood,
  kMissing,
  kUnreadable, // the system refuses it
  kOther,      // neither PNG nor JPEG
  kDamaged,    // cut, or without a pixel
};

struct PictureFile
{
  PictureState state = PictureState::kMissing;
  bool isPng = false;
  bool hasAlpha = false;           // a PNG that may let through what is behind it
  std::vector<std::uint8_t> bytes; // only if asked for
};

// Where the picture lies that a scene in `folder` names: the file as it is named, from that folder if need be, also
// with the separators of Windows; else one of that name beside the scene, for scenes that came from elsewhere with
// their pictures. It may be that none exists.
std::filesystem::path LocatePicture(const std::filesystem::path& folder, const std::string& name);

// Looks at a file, whose kind is told by its first bytes. Devices and folders count as missing.
PictureFile ReadPictureFile(const std::filesystem::path& path, bool keepBytes);
// The same of bytes.
PictureFile LookAtPicture(std::vector<std::uint8_t> bytes);

} // namespace gltf
