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
  marker_ = record_.TakeField(marker.bytes, sizeof marker.bytes);
  // The entry of a link ends with its id.
  const auto writeEntry = [&sample](HyperFile& file) {
    file.WriteLong(kTextureMaterial);
    std::as_const(sample).GetDataInstance().GetData(kTextureMaterial).Write(file);
  };
  return marker_ >= 0 && WriteInMemory(writeEntry, [this](const UChar* file, LLong fileSize, LLong header) {
           const LLong size = fileSize - header;
           material_ = record_.TakeField(file + header, size, size - static_cast<LLong>(sizeof(GeAliasID)));
           return material_ >= 0;
         });
}

Bool TextureTagRecord::Take(HyperFile& file, NodeMarker& marker, GeAliasID& material) const
{
  const RecordPart body = record_.GetRest(PreparedRecord::kHeadSize);
  const UChar* place = file.NextRecord(record_, body);
  if (!place)
    return false;
  std::memcpy(marker.bytes, place + marker_ - body.from, sizeof marker.bytes);
  std::memcpy(&material, place + material_ - body.from, sizeof material); // in memory order, as links are written
  file.PassRecord(record_, body);
  return true;
}

} // namespace _torvane_
