// The whole of an object that says no more than its name, its type and its transform, and has no tag or one texture tag
// that only tells its material, prepared once, see prepared_record.h. What its parts tell is told by their own records.
#pragma once

#include "q7r_file/nodes/node_record.h"
#include "q7r_file/objects/transform_record.h"
#include "q7r_file/tags/texture_tag_record.h"
#include "torvane/stream/prepared_record.h"

namespace _torvane_
{

class ObjectRecord
{
  // Objects differ in front of the name, where the check sum of the last write may stand, and behind the second name,
  // where the tag may be.
  struct Form
  {
    PreparedRecord record;
    RecordPart start;  // as far as the name
    RecordPart middle; // from there as far as the name is told again
    RecordPart end;    // from there
    LLong header = 0;  // where the body of the node header is, from the begin of the start
    LLong type = 0;    // where the type is, from that of the middle
    LLong tag = 0;     // where the body of the tag is, from that of the end
    LLong transform = 0;
  };

 public:
  // The one of this process; null when memory is short.
  static const ObjectRecord* Get();
  // For Get alone.
  Bool Learn();

  // Such an object in a file's buffer: its type, and where the bodies of its parts are. They stay there while it is
  // read.
  struct Found
  {
    Long type = 0;
    const UChar* headerStart = nullptr;
    const UChar* headerRest = nullptr;
    const UChar* tag = nullptr; // null: the object has none
    const UChar* transform = nullptr;
    Bool hasSum = false; // the check sum of no geometry
    const Form* head = nullptr;
    const Form* end = nullptr;
  };
  // Looks whether one comes next whose chunk was opened. Nothing is read.
  Bool Find(HyperFile& file, Found& found) const;
  // Passes over what Find found, and reads the name on the way. False, with the file's error, when memory is short.
  static Bool Pass(HyperFile& file, const Found& found, String& name);

  const NodeRecord& GetNode() const { return node_; }
  const TextureTagRecord& GetTag() const { return tag_; }
  const TransformRecord& GetTransform() const { return transform_; }

 private:
  Bool LearnForm(Form& form, Bool withSum, Bool withTag);
  Bool FindParts(Form& form, Bool withTag) const;
  const Form* FindForm(const HyperFile& file, RecordPart Form::*part, LLong ahead, const UChar*& place) const;
  Bool FindEnd(const HyperFile& file, LLong ahead, Found& found) const;

  NodeRecord node_;
  TextureTagRecord tag_;
  TransformRecord transform_;
  Form withTag_;    // and without a sum
  Form withSum_;    // and without a tag
  LLong ticks_ = 0; // of an object with all that it may have
};

} // namespace _torvane_
