// How an object is shown: eleven settings of the tag itself and the entries of its container.
#pragma once

#include "torvane/tags/base_tag.h"

namespace _torvane_
{

class EntryReader;

inline constexpr Long kChunkOldDisplay = 110009;

class DisplayTag : public BaseTag
{
 public:
  static constexpr NodeKindOf<DisplayTag> kNodeKind{"display tag", &BaseTag::kNodeKind};
  const NodeKind& GetNodeKind() const override { return kNodeKind; }

  // Sets every default.
  DisplayTag();

  // Also takes chunk kChunkOldDisplay of files below version 11611, whose values become entries.
  Bool ReadChunk(HyperFile& file, Long id, Long level) override;
  // Answer 1001, 1002, 1007 to 1010, 1012, 1014 and 1015 (Long) and 1004 and 1006 (Real) from the tag's own settings,
  // which are copied but in no file; the container has the rest, and entries of its own under these numbers.
  Bool GetParameter(const ParameterPath& path, GeData& value) override;
  Bool SetParameter(const ParameterPath& path, const GeData& value) override;

 protected:
  Bool CopyTagData(BaseTag& destination, ULong flags, TransArray* translation) override;

 private:
  static constexpr Long kLongCount = 9;
  static constexpr Long kRealCount = 2;
  struct LongSetting;
  struct RealSetting;
  static const LongSetting kLongSettings[kLongCount];
  static const RealSetting kRealSettings[kRealCount];

  Long* FindLong(Long id);
  Real* FindReal(Long id);
  void ReadOldSettings(EntryReader& entries, Long level);

  Long longs_[kLongCount];
  Real reals_[kRealCount];
};

} // namespace _torvane_
