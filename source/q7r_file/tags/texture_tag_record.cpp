#include "q7r_file/tags/texture_tag_record.h"

#include <cstring>
#include <utility>

#include "k2v_file/stream/learned_once.h"
#include "k2v_file/stream/write_in_memory.h"
#include "torvane/tags/texture_tag.h"

namespace _torvane_
{

namespace
{

constexpr UChar kByteMark = 0xA0; // plus the place in the marker

// A tag as a file holds most of them, with a marker like no other.
class MarkedTag : public TextureTag
{
 public:
  MarkedTag()
  {
    name_ = String();
    for (UChar& byte : marker_.bytes)
      byte = static_cast<UChar>(kByteMark + (&byte - marker_.bytes));
    markerDrawn_ = true;
  }
};

} // namespace

const TextureTagRecord* TextureTagRecord::Get() { return GetLearned<TextureTagRecord>(); }

Bool TextureTagRecord::Learn()
{
  MarkedTag sample;
  MarkedTag copy;
  if (!record_.Learn(sample, copy, kTagTexture))
    return false;
  const NodeMarker& marker = sample.GetMarker();
  marker_ = record_.TakeField(marker.bytes, sizeof marker.bytes) - PreparedRecord::kHeadSize;
  // The entry of a link ends with its id.
  const auto writeEntry = [&sample](HyperFile& file) {
    file.WriteLong(kTextureMaterial);
    std::as_const(sample).GetDataInstance().GetData(kTextureMaterial).Write(file);
  };
  return marker_ >= 0 && WriteInMemory(writeEntry, [this](const UChar* file, LLong fileSize, LLong header) {
           const LLong size = fileSize - header;
           material_ = record_.TakeField(file + header, size, size - static_cast<LLong>(sizeof(GeAliasID))) -
                       PreparedRecord::kHeadSize;
           return material_ >= 0;
         });
}

void TextureTagRecord::Get(const UChar* place, NodeMarker& marker, GeAliasID& material) const
{
  std::memcpy(marker.bytes, place + marker_, sizeof marker.bytes);
  std::memcpy(&material, place + material_, sizeof material); // in memory order, as links are written
}

} // namespace _torvane_
