// What of a scene glTF can't hold: told once a kind, with a count.
#pragma once

#include <cstddef>
#include <map>
#include <string>
#include <utility>
#include <vector>

namespace gltf
{

// In the order in which they are told.
enum class Loss
{
  kObject, // a generator, a deformer or of an unknown type
  kPlaneAxis,
  kProjection,
  kMeasuredLight,
  kNegativeBrightness,
  kTextureProjection,
  kTextureSelection,
  kMixing,
  kChannel, // detail: the channel's number
  kForeignMaterial,
  kForeignShader,
  kSequence,
  kMovie,
  kPictureFormat,
  kNoCoordinates,
  kMoreCoordinates,
  kSmoothing,
  kSelection,
  kBrokenPolygon,
  kBrokenTag,
  kSplineType,
  kTimeTrack,
  kFocusTrack,
  kShadowTrack,
  kVisibilityTrack,
  kMaterialTrack,
  kOtherTrack,
  kPointer,
  kNegativeTime,
  kCoarse,
  kNumber,
};

class Account
{
 public:
  void Tell(Loss loss, std::size_t count = 1, int detail = 0);
  // A picture that is named by the scene and can't be used; `why` goes on behind its name. Makes a problem.
  void TellPicture(const std::string& path, const std::string& why);

  // One line for each kind, and for each picture.
  std::vector<std::string> Lines() const;
  std::size_t CountOf(Loss loss, int detail = 0) const;
  // A picture is missing, damaged or can't be read.
  bool HasProblems() const { return !pictures_.empty(); }

 private:
  std::map<std::pair<Loss, int>, std::size_t> counts_;
  std::vector<std::string> pictures_; // each told once
};

} // namespace gltf
