#include "k2v_file/stream/raw_values.h"

#include "torvane/values/parameter_path.h"

namespace _torvane_
{

namespace
{

constexpr LLong kFloatSize = 4;
constexpr LLong kDoubleSize = 8;
constexpr LLong kLengthSize = 4;
constexpr LLong kGrowth = 2; // a float that becomes a double is what grows most

// A legacy container has an id and a type in front of each value.
constexpr LLong kEntryIdSize = 4;
constexpr LLong kEntryHeadSize = kEntryIdSize + 1;

// Works through a block from front to back. `target` has room for kGrowth times its size.
class Converter
{
 public:
  Converter(const UChar* source, LLong size, UChar* target, const FileForm& file)
      : source_(source), target_(target), size_(size), file_(file)
  {}

  // Gives the size of what was written.
  LLong Run()
  {
    while (position_ < size_) {
      if (!ConvertValue(size_))
        Copy(size_ - position_);
    }
    return written_;
  }

 private:
  void Copy(LLong count)
  {
    GeCopyMem(target_ + written_, source_ + position_, count);
    position_ += count;
    written_ += count;
  }

  // Floats up to `end`, which stand at a distance of whole floats.
  void Widen(LLong end)
  {
    for (; position_ < end; position_ += kFloatSize, written_ += kDoubleSize) {
      const Real number = bytes::CleanReal(bytes::GetBig<ULong>(source_ + position_));
      bytes::PutBig(target_ + written_, bytes::CleanBits(number));
    }
  }

  void PutLength(LLong place, LLong length) { bytes::PutBig(target_ + place, static_cast<ULong>(length)); }

  // False for what is no value that ends before `end`: nothing is converted then.
  Bool ConvertValue(LLong end)
  {
    const ValueForm* form = FindSkippedForm(source_[position_]);
    const UChar* body = source_ + position_ + kTagSize;
    const LLong left = end - position_ - kTagSize;
    if (!form || GetValueHeadSize(*form, file_) > left)
      return false;
    const LLong size = GetValueBodySize(*form, file_, body);
    if (size > left)
      return false;
    if (form->tag == kTagLegacyContainer && file_.singlePrecision && ConvertContainers(position_ + kTagSize + size))
      return true;
    ConvertBody(*form, size);
    return true;
  }

  void ConvertBody(const ValueForm& form, LLong size)
  {
    const LLong end = position_ + kTagSize + size;
    Copy(kTagSize);
    if (form.part == ValuePart::kReal && file_.singlePrecision)
      return Widen(end);
    if (IsOldArray(form, file_, source_ + position_)) {
      PutLength(written_, size - kLengthSize);
      target_[written_ + kLengthSize] = source_[position_];
      position_ += 1 + kLengthSize;
      written_ += 1 + kLengthSize;
      return Copy(end - position_);
    }
    if (form.tag != kTagLegacyPointArray && form.tag != kTagLegacyArray)
      return Copy(size);
    const LLong place = written_;
    Copy(kLengthSize);
    if (form.tag == kTagLegacyPointArray && file_.singlePrecision)
      Widen(position_ + (end - position_) / kFloatSize * kFloatSize);
    Copy(end - position_);
    PutLength(place, written_ - place - kLengthSize);
  }

  // A legacy container up to `end`, with all that are nested in it. Each open one keeps the place of the one around it
  // where its length will stand. False, and nothing is converted, if it isn't of the known form.
  Bool ConvertContainers(LLong end)
  {
    const LLong position = position_;
    const LLong written = written_;
    open_ = written_;
    depth_ = 0;
    Bool known = OpenContainer(end);
    while (known && depth_ > 0)
      known = ConvertEntry(end);
    if (known && position_ == end)
      return true;
    position_ = position;
    written_ = written;
    return false;
  }

  // Goes into a container whose tag is next, inside of the one that was opened at `open_`.
  Bool OpenContainer(LLong end)
  {
    constexpr LLong kHead = StoredSize(kTagLegacyContainer, kTagLong);
    if (end - position_ < kHead || source_[position_] != kTagLegacyContainer ||
        source_[position_ + kTagSize + kLengthSize] != kTagLong)
      return false;
    const LLong place = written_;
    Copy(kHead);
    PutLength(place + kTagSize, place - open_);
    open_ = place;
    ++depth_;
    return true;
  }

  void CloseContainer()
  {
    const LLong outer = open_ - static_cast<LLong>(bytes::GetBig<ULong>(target_ + open_ + kTagSize));
    PutLength(open_ + kTagSize, written_ - open_ - kTagSize - kLengthSize);
    open_ = outer;
    --depth_;
  }

  Bool ConvertEntry(LLong end)
  {
    if (end - position_ < kEntryHeadSize)
      return false;
    const UChar type = source_[position_ + kEntryIdSize];
    Copy(kEntryHeadSize);
    if (IsTaggedLegacyEntry(type))
      return position_ < end && source_[position_] == type && ConvertValue(end);
    switch (type) {
    case kLegacyEnd:
      CloseContainer();
      return true;
    case kDataContainer:
      return OpenContainer(end);
    default: // without a value
      return true;
    }
  }

  const UChar* source_;
  UChar* target_;
  LLong size_;
  FileForm file_;
  LLong position_ = 0;
  LLong written_ = 0;
  LLong open_ = 0;
  LLong depth_ = 0;
};

} // namespace

Bool ModernizeValues(void*& block, LLong& size, const FileForm& file)
{
  if (size <= 0 || (!file.singlePrecision && file.version >= kVersionColumns))
    return true;
  void* fresh = size > INT64_MAX / kGrowth ? nullptr : GeAllocNC(size * kGrowth);
  if (!fresh)
    return false;
  const LLong freshSize = Converter(static_cast<const UChar*>(block), size, static_cast<UChar*>(fresh), file).Run();
  if (void* fitting = GeRealloc(fresh, freshSize))
    fresh = fitting;
  GeFree(block);
  block = fresh;
  size = freshSize;
  return true;
}

Bool ModernizeValues(void*& block, LLong& size, HyperFile& file)
{
  if (ModernizeValues(block, size, FormOf(file)))
    return true;
  file.SetError(FILEERROR_MEMORY);
  return false;
}

} // namespace _torvane_
